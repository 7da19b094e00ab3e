// The configuration file and the data directory.
#include <cstdlib>
#include <filesystem>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>
#include <wx/app.h>
#include <wx/filename.h>

#include "JournalTestSupport.h"
#include "data/DataLocations.h"

namespace journaltest
{
namespace
{

using Entries = std::vector<std::pair<std::string, std::string>>;

class Config : public JournalTest
{
protected:
    std::string ConfigFile() const { return Root() + "/WyxConfig.cfg"; }

    // Each key's value in the store, or "<absent>".
    static std::vector<std::string> Values(const ConfigStore& store, const std::vector<std::string>& keys)
    {
        std::vector<std::string> values;
        for (const std::string& key : keys)
        {
            wxString value = "<absent>";
            store.Lookup(FromUtf8(key), value);
            values.push_back(Utf8(value));
        }
        return values;
    }
};

struct DocumentCase
{
    const char* name;
    const char* document;
    std::vector<std::string> keys;
    std::vector<std::string> values;
};

class ConfigDocument : public Config, public ::testing::WithParamInterface<DocumentCase>
{
};

TEST_P(ConfigDocument, GivesTheEntriesOfTheFirstConfigurationFound)
{
    WriteBytes(ConfigFile(), GetParam().document);
    ConfigStore store;
    EXPECT_TRUE(store.LoadFile(FromUtf8(ConfigFile())));
    EXPECT_EQ(Values(store, GetParam().keys), GetParam().values);

    ConfigStore fromMemory;
    fromMemory.LoadDocument(GetParam().document, std::string(GetParam().document).size());
    EXPECT_EQ(Values(fromMemory, GetParam().keys), GetParam().values);
}

INSTANTIATE_TEST_SUITE_P(
    Documents, ConfigDocument,
    ::testing::Values(
        DocumentCase{
            "DirectChild",
            "<?xml version=\"1.0\" encoding=\"UTF-8\"?><Configuration><WyxConfiguration>"
            "<Entry key=\"APP_WYX_VERSION\" value=\"3.3\"/><Entry key=\"ICON_SHELL_NOTIFY\" value=\"1\"/>"
            "</WyxConfiguration></Configuration>",
            {"APP_WYX_VERSION", "ICON_SHELL_NOTIFY"},
            {"3.3", "1"}},
        DocumentCase{"NestedTwoLevelsDeep",
                     "<Root><Product><Settings><WyxConfiguration><E k=\"A\" v=\"1\"/></WyxConfiguration>"
                     "</Settings></Product></Root>",
                     {"A"},
                     {"1"}},
        DocumentCase{"DirectChildBeforeDeeperOne",
                     "<Root><Deep><WyxConfiguration><E k=\"A\" v=\"deep\"/></WyxConfiguration></Deep>"
                     "<WyxConfiguration><E k=\"A\" v=\"direct\"/></WyxConfiguration></Root>",
                     {"A"},
                     {"direct"}},
        DocumentCase{"FirstSubtreeDepthFirst",
                     "<Root><P><Q><WyxConfiguration><E k=\"A\" v=\"first\"/></WyxConfiguration></Q></P>"
                     "<R><WyxConfiguration><E k=\"A\" v=\"second\"/></WyxConfiguration></R></Root>",
                     {"A"},
                     {"first"}},
        DocumentCase{"OnlyTheFirstConfigurationCounts",
                     "<Root><WyxConfiguration><E k=\"A\" v=\"1\"/></WyxConfiguration>"
                     "<WyxConfiguration><E k=\"B\" v=\"2\"/></WyxConfiguration></Root>",
                     {"A", "B"},
                     {"1", "<absent>"}},
        DocumentCase{"NameIsCaseSensitive",
                     "<Root><wyxconfiguration><E k=\"A\" v=\"1\"/></wyxconfiguration></Root>",
                     {"A"},
                     {"<absent>"}},
        DocumentCase{"TheRootItselfIsNotSearched",
                     "<WyxConfiguration><E k=\"A\" v=\"1\"/></WyxConfiguration>",
                     {"A"},
                     {"<absent>"}},
        DocumentCase{
            "AttributeCounts",
            "<Root><WyxConfiguration><One k=\"A\"/><Three k=\"B\" v=\"2\" extra=\"x\"/>"
            "<None/>text<Two x=\"C\" y=\"3\"><Child k=\"D\" v=\"4\"/></Two></WyxConfiguration></Root>",
            {"A", "B", "extra", "C", "D"},
            {"<absent>", "2", "<absent>", "3", "<absent>"}},
        DocumentCase{"DuplicateKeyFirstWins",
                     "<Root><WyxConfiguration><E k=\"A\" v=\"first\"/><E k=\"A\" v=\"second\"/>"
                     "</WyxConfiguration></Root>",
                     {"A"},
                     {"first"}},
        DocumentCase{"KeysAreCaseSensitive",
                     "<Root><WyxConfiguration><E k=\"Key\" v=\"1\"/></WyxConfiguration></Root>",
                     {"Key", "key", "Key "},
                     {"1", "<absent>", "<absent>"}},
        DocumentCase{"NonAsciiValues",
                     "<?xml version=\"1.0\" encoding=\"UTF-8\"?><Root><WyxConfiguration>"
                     "<E k=\"N\" v=\"Caf\xC3\xA9 &amp; \xE2\x82\xAC\"/></WyxConfiguration></Root>",
                     {"N"},
                     {"Caf\xC3\xA9 & \xE2\x82\xAC"}},
        DocumentCase{"BrokenXmlAddsNothing",
                     "<Root><WyxConfiguration><E k=\"A\" v=\"1\"/></WyxConfiguration>",
                     {"A"},
                     {"<absent>"}},
        DocumentCase{"EmptyFile", "", {"A"}, {"<absent>"}}),
    [](const ::testing::TestParamInfo<DocumentCase>& info) { return std::string(info.param.name); });

std::string WithEntries(const Entries& entries)
{
    std::string document = "<Configuration><WyxConfiguration>";
    for (const auto& [key, value] : entries)
        document += "<Entry key=\"" + key + "\" value=\"" + value + "\"/>";
    return document + "</WyxConfiguration></Configuration>";
}

TEST_F(Config, AValueOnceLoadedSurvivesAChangeOfTheFile)
{
    ConfigStore store;
    WriteBytes(ConfigFile(), WithEntries({{"ICON_SHELL_NOTIFY", "0"}}));
    ASSERT_TRUE(store.LoadFile(FromUtf8(ConfigFile())));

    WriteBytes(ConfigFile(), WithEntries({{"ICON_SHELL_NOTIFY", "1"}, {"APP_WYX_VERSION", "4.0"}}));
    ASSERT_TRUE(store.LoadFile(FromUtf8(ConfigFile())));
    // The changed value keeps the old one; a key added later comes in.
    EXPECT_EQ(Values(store, {"ICON_SHELL_NOTIFY", "APP_WYX_VERSION"}),
              (std::vector<std::string>{"0", "4.0"}));
}

TEST(ConfigStoreThreads, LookupsBesideALoadSeeNoHalfWrittenEntries)
{
    // Run under ThreadSanitizer: a race on the entries fails the test there.
    ConfigStore store;
    const std::string document = "<Configuration><WyxConfiguration><Entry key=\"APP_WYX_VERSION\" value=\"3.3\"/>"
                                 "<Entry key=\"ICON_SHELL_NOTIFY\" value=\"1\"/></WyxConfiguration></Configuration>";
    std::thread loader([&] { store.LoadDocument(document.data(), document.size()); });
    for (int i = 0; i < 1000; ++i)
    {
        wxString value;
        if (store.Lookup("APP_WYX_VERSION", value))
            EXPECT_EQ(value, "3.3");
    }
    loader.join();
    wxString value;
    EXPECT_TRUE(store.Lookup("ICON_SHELL_NOTIFY", value));
}

TEST_F(Config, AMissingFileLeavesTheCallersDefault)
{
    ConfigStore store;
    EXPECT_FALSE(store.LoadFile(FromUtf8(ConfigFile())));
    EXPECT_FALSE(store.LoadFile(wxString()));
    wxString notify = "0";
    EXPECT_FALSE(store.Lookup("ICON_SHELL_NOTIFY", notify));
    EXPECT_EQ(notify, "0");
}

TEST_F(Config, AnUnparsableFileStillCountsAsPresent)
{
    WriteBytes(ConfigFile(), "\xFF\xFE not xml at all");
    ConfigStore store;
    EXPECT_TRUE(store.LoadFile(FromUtf8(ConfigFile())));
    EXPECT_EQ(Values(store, {"APP_WYX_VERSION"}), std::vector<std::string>{"<absent>"});
}

TEST_F(Config, TheApplicationVersionComesFromTheProcessWideStore)
{
    WriteBytes(ConfigFile(), WithEntries({{"APP_WYX_VERSION", "9.1"}}));
    EXPECT_EQ(GetApplicationVersion(false), "");
    ASSERT_TRUE(ConfigStore::Instance().LoadFile(FromUtf8(ConfigFile())));
    EXPECT_EQ(GetApplicationVersion(false), "9.1");
    EXPECT_EQ(&ConfigStore::Instance(), &ConfigStore::Instance());
}

TEST_F(Config, TheFileLiesBesideTheExecutable)
{
    wxAppConsole app; // the standard paths belong to an application
    const wxFileName path(GetConfigFilePath());
    EXPECT_EQ(path.GetFullName(), "WyxConfig.cfg");
    EXPECT_EQ(path.GetPath(),
              FromUtf8(std::filesystem::read_symlink("/proc/self/exe").parent_path().string()));
}

// --- data directory -------------------------------------------------------------------

TEST(DataDirectory, LiesBelowTheSystemRoot)
{
    struct Case
    {
        const char* root; // nullptr: unset
        std::string expected;
    };
    const std::string cwd = std::filesystem::current_path().string();
    const Case cases[] = {
        {nullptr, "/var/lib/Corvane/HotFolders/"},
        {"", "/var/lib/Corvane/HotFolders/"},
        {"/", "/var/lib/Corvane/HotFolders/"},
        {"/tmp/wyx root", "/tmp/wyx root/var/lib/Corvane/HotFolders/"},
        {"/tmp/wyx/", "/tmp/wyx/var/lib/Corvane/HotFolders/"},
        {"relative/root", cwd + "/relative/root/var/lib/Corvane/HotFolders/"},
    };
    for (const Case& c : cases)
    {
        if (c.root == nullptr)
            ::unsetenv("WYX_SYSTEM_ROOT");
        else
            ::setenv("WYX_SYSTEM_ROOT", c.root, 1);
        EXPECT_EQ(Utf8(GetDataDirectory()), c.expected) << (c.root ? c.root : "(unset)");
    }
    ::unsetenv("WYX_SYSTEM_ROOT");
}

} // namespace
} // namespace journaltest
