// The configuration file and the data directory.
#include <wx/app.h>
#include <wx/filename.h>

#include "JournalTestSupport.h"
#include "data/DataLocations.h"

namespace journaltest
{
namespace
{

// Each key's value in the store, or "-" for a key it does not know.
Lines Values(const ConfigStore& store, const Lines& keys)
{
    Lines values;
    for (const std::string& key : keys)
    {
        wxString value = "-";
        store.Lookup(JournalTest::FromUtf8(key), value);
        values.push_back(JournalTest::Utf8(value));
    }
    return values;
}

std::string InConfiguration(const std::string& entries)
{
    return "<Configuration><WyxConfiguration>" + entries + "</WyxConfiguration></Configuration>";
}

struct DocumentCase
{
    const char* name;
    std::string document;
    Lines keys, values;
};

class ConfigDocument : public JournalTest, public ::testing::WithParamInterface<DocumentCase>
{
};

TEST_P(ConfigDocument, GivesTheEntriesOfTheFirstConfigurationFound)
{
    WriteBytes(Root() + "/WyxConfig.cfg", GetParam().document);
    ConfigStore store, fromMemory;
    EXPECT_TRUE(store.LoadFile(FromUtf8(Root() + "/WyxConfig.cfg")));
    EXPECT_EQ(Values(store, GetParam().keys), GetParam().values);
    fromMemory.LoadDocument(GetParam().document.data(), GetParam().document.size());
    EXPECT_EQ(Values(fromMemory, GetParam().keys), GetParam().values);
}

// One configuration holding the entries, and one entry of key A.
std::string Cfg(const std::string& entries)
{
    return "<WyxConfiguration>" + entries + "</WyxConfiguration>";
}
std::string A(const std::string& value)
{
    return "<E k=\"A\" v=\"" + value + "\"/>";
}

INSTANTIATE_TEST_SUITE_P(
    Documents, ConfigDocument,
    ::testing::Values(
        DocumentCase{"DirectChild",
                     "<?xml version=\"1.0\" encoding=\"UTF-8\"?>" +
                         InConfiguration("<Entry key=\"APP_WYX_VERSION\" value=\"3.3\"/><Entry "
                                         "key=\"ICON_SHELL_NOTIFY\" value=\"1\"/>"),
                     {"APP_WYX_VERSION", "ICON_SHELL_NOTIFY"},
                     {"3.3", "1"}},
        DocumentCase{"NestedTwoLevelsDeep", "<R><P><S>" + Cfg(A("1")) + "</S></P></R>", {"A"}, {"1"}},
        DocumentCase{"DirectChildBeforeDeeperOne",
                     "<R><D>" + Cfg(A("deep")) + "</D>" + Cfg(A("direct")) + "</R>",
                     {"A"},
                     {"direct"}},
        DocumentCase{"FirstSubtreeDepthFirst",
                     "<R><P><Q>" + Cfg(A("first")) + "</Q></P><S>" + Cfg(A("second")) + "</S></R>",
                     {"A"},
                     {"first"}},
        DocumentCase{"OnlyTheFirstConfigurationCounts",
                     "<R>" + Cfg(A("1")) + Cfg("<E k=\"B\" v=\"2\"/>") + "</R>",
                     {"A", "B"},
                     {"1", "-"}},
        DocumentCase{"NameIsCaseSensitive",
                     "<R><wyxconfiguration>" + A("1") + "</wyxconfiguration></R>",
                     {"A"},
                     {"-"}},
        DocumentCase{"TheRootItselfIsNotSearched", Cfg(A("1")), {"A"}, {"-"}},
        DocumentCase{"AttributeCounts",
                     InConfiguration("<One k=\"A\"/><Three k=\"B\" v=\"2\" extra=\"x\"/><None/>text<Two "
                                     "x=\"C\" y=\"3\"><Child k=\"D\" v=\"4\"/></Two>"),
                     {"A", "B", "extra", "C", "D"},
                     {"-", "2", "-", "3", "-"}},
        DocumentCase{"DuplicateKeyFirstWins", InConfiguration(A("first") + A("second")), {"A"}, {"first"}},
        DocumentCase{"KeysAreCaseSensitive",
                     InConfiguration("<E k=\"Key\" v=\"1\"/>"),
                     {"Key", "key", "Key "},
                     {"1", "-", "-"}},
        DocumentCase{"NonAsciiValues",
                     "<?xml version=\"1.0\" encoding=\"UTF-8\"?>" +
                         InConfiguration(A("Caf\xC3\xA9 &amp; \xE2\x82\xAC")),
                     {"A"},
                     {"Caf\xC3\xA9 & \xE2\x82\xAC"}},
        DocumentCase{"BrokenXmlAddsNothing", "<R>" + Cfg(A("1")), {"A"}, {"-"}},
        DocumentCase{"UnparsableBytes", "\xFF\xFE not xml at all", {"APP_WYX_VERSION"}, {"-"}},
        DocumentCase{"EmptyFile", "", {"A"}, {"-"}}),
    [](const auto& info) { return std::string(info.param.name); });

TEST_F(JournalTest, AConfigValueOnceLoadedSurvivesAChangeOfTheFileAndAMissingFileChangesNothing)
{
    const std::string file = Root() + "/WyxConfig.cfg";
    ConfigStore store;
    wxString notify = "0";
    EXPECT_FALSE(store.LoadFile(FromUtf8(file)));
    EXPECT_FALSE(store.LoadFile(wxString()));
    EXPECT_FALSE(store.Lookup("ICON_SHELL_NOTIFY", notify));
    EXPECT_EQ(notify, "0");
    WriteBytes(file, InConfiguration("<Entry key=\"ICON_SHELL_NOTIFY\" value=\"0\"/>"));
    ASSERT_TRUE(store.LoadFile(FromUtf8(file)));
    WriteBytes(file,
               InConfiguration(
                   "<E key=\"ICON_SHELL_NOTIFY\" value=\"1\"/><E key=\"APP_WYX_VERSION\" value=\"4.0\"/>"));
    ASSERT_TRUE(store.LoadFile(FromUtf8(file)));
    // The changed value keeps the old one; a key added later comes in.
    EXPECT_EQ(Values(store, {"ICON_SHELL_NOTIFY", "APP_WYX_VERSION"}), (Lines{"0", "4.0"}));

    // The program's version comes from the process-wide store.
    EXPECT_EQ(GetApplicationVersion(false), "");
    ASSERT_TRUE(ConfigStore::Instance().LoadFile(FromUtf8(file)));
    EXPECT_EQ(GetApplicationVersion(false), "4.0");
}

TEST(ConfigStoreThreads, LookupsBesideALoadSeeNoHalfWrittenEntries)
{
    // Run under ThreadSanitizer: a race on the entries fails the test there.
    ConfigStore store;
    const std::string document =
        InConfiguration("<E key=\"APP_WYX_VERSION\" value=\"3.3\"/><E key=\"N\" value=\"1\"/>");
    std::thread loader([&] { store.LoadDocument(document.data(), document.size()); });
    for (int i = 0; i < 1000; ++i)
    {
        wxString value;
        if (store.Lookup("APP_WYX_VERSION", value))
            EXPECT_EQ(value, "3.3");
    }
    loader.join();
    EXPECT_EQ(Values(store, {"N"}), Lines{"1"});
}

TEST(ConfigFile, LiesBesideTheExecutable)
{
    wxAppConsole app; // the standard paths belong to an application
    const wxFileName path(GetConfigFilePath());
    EXPECT_EQ(path.GetFullName(), "WyxConfig.cfg");
    EXPECT_EQ(path.GetPath(),
              JournalTest::FromUtf8(fs::read_symlink("/proc/self/exe").parent_path().string()));
}

TEST(DataDirectory, LiesBelowTheSystemRoot)
{
    const std::string cwd = fs::current_path().string();
    for (const auto& [root, expected] : std::vector<std::pair<const char*, std::string>>{
             {nullptr, "/var/lib/Corvane/HotFolders/"},
             {"", "/var/lib/Corvane/HotFolders/"},
             {"/", "/var/lib/Corvane/HotFolders/"},
             {"/tmp/wyx root", "/tmp/wyx root/var/lib/Corvane/HotFolders/"},
             {"/tmp/wyx/", "/tmp/wyx/var/lib/Corvane/HotFolders/"},
             {"relative/root", cwd + "/relative/root/var/lib/Corvane/HotFolders/"}})
    {
        ScopedEnv variable("WYX_SYSTEM_ROOT", root ? root : "");
        if (root == nullptr)
            ::unsetenv("WYX_SYSTEM_ROOT");
        EXPECT_EQ(JournalTest::Utf8(GetDataDirectory()), expected) << (root ? root : "(unset)");
    }
}

} // namespace
} // namespace journaltest
