// The configuration file and the data directory.
#include <unistd.h>

#include <wx/app.h>

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
        store.Lookup(wxString::FromUTF8(key), value);
        values.push_back(value.utf8_string());
    }
    return values;
}

std::string InConfiguration(const std::string& entries)
{
    return "<Configuration><WyxConfiguration>" + entries + "</WyxConfiguration></Configuration>";
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

TEST_F(JournalTest, AConfigurationGivesTheEntriesOfTheFirstConfigurationFound)
{
    // A document; keys; each key's value, or "-" where the store does not know it.
    for (const auto& [document, keys, values] : std::vector<std::tuple<std::string, Lines, Lines>>{
             {"<?xml version=\"1.0\" encoding=\"UTF-8\"?>" +
                  InConfiguration(
                      "<Entry key=\"APP_WYX_VERSION\" value=\"Caf\xC3\xA9 &amp; \xE2\x82\xAC\"/><Entry "
                      "key=\"ICON_SHELL_NOTIFY\" value=\"1\"/>"),
              {"APP_WYX_VERSION", "ICON_SHELL_NOTIFY"},
              {"Caf\xC3\xA9 & \xE2\x82\xAC", "1"}},
             {"<R><D>" + Cfg(A("deep")) + "</D>" + Cfg(A("direct")) + "</R>", {"A"}, {"direct"}},
             {"<R><P><Q>" + Cfg(A("first")) + "</Q></P><S>" + Cfg(A("second")) + "</S></R>",
              {"A"},
              {"first"}},
             {"<R>" + Cfg(A("1")) + Cfg("<E k=\"B\" v=\"2\"/>") + "</R>", {"A", "B"}, {"1", "-"}},
             {Cfg(A("1")), {"A"}, {"-"}},
             {InConfiguration("<One k=\"A\"/>" + A("first") + A("second") +
                              "<Three k=\"B\" v=\"2\" extra=\"x\"/><None/>text<Two x=\"C\" y=\"3\"><Child "
                              "k=\"D\" v=\"4\"/></Two><E k=\"Key\" v=\"1\"/>"),
              {"A", "B", "extra", "C", "D", "Key", "key", "Key "},
              {"first", "2", "-", "3", "-", "1", "-", "-"}},
             {"\xFF\xFE not xml at all", {"APP_WYX_VERSION"}, {"-"}}})
    {
        SCOPED_TRACE(document);
        WriteBytes(Root() + "/WyxConfig.cfg", document);
        ConfigStore store, fromMemory;
        EXPECT_TRUE(store.LoadFile(wxString::FromUTF8(Root() + "/WyxConfig.cfg")));
        EXPECT_EQ(Values(store, keys), values);
        fromMemory.LoadDocument(document.data(), document.size());
        EXPECT_EQ(Values(fromMemory, keys), values);
    }
}

TEST_F(JournalTest, AConfigValueOnceLoadedSurvivesAChangeOfTheFileAndAMissingFileChangesNothing)
{
    const std::string file = Root() + "/WyxConfig.cfg";
    ConfigStore store;
    wxString notify = "0";
    EXPECT_FALSE(store.LoadFile(wxString::FromUTF8(file)));
    EXPECT_FALSE(store.LoadFile(wxString()));
    EXPECT_FALSE(store.Lookup("ICON_SHELL_NOTIFY", notify));
    EXPECT_EQ(notify, "0");
    WriteBytes(file, InConfiguration("<Entry key=\"ICON_SHELL_NOTIFY\" value=\"0\"/>"));
    ASSERT_TRUE(store.LoadFile(wxString::FromUTF8(file)));
    WriteBytes(file,
               InConfiguration(
                   "<E key=\"ICON_SHELL_NOTIFY\" value=\"1\"/><E key=\"APP_WYX_VERSION\" value=\"4.0\"/>"));
    ASSERT_TRUE(store.LoadFile(wxString::FromUTF8(file)));
    // The changed value keeps the old one; a key added later comes in.
    EXPECT_EQ(Values(store, {"ICON_SHELL_NOTIFY", "APP_WYX_VERSION"}), (Lines{"0", "4.0"}));

    // The program's version comes from the process-wide store.
    EXPECT_EQ(GetApplicationVersion(false), "");
    ASSERT_TRUE(ConfigStore::Instance().LoadFile(wxString::FromUTF8(file)));
    EXPECT_EQ(GetApplicationVersion(false), "4.0");
}

// Beside the executable in the build; in ../share/wyxprogress next to its folder once installed.
TEST(ConfigFile, LiesBesideTheExecutableOrInTheInstalledDefaults)
{
    wxAppConsole app; // the standard paths belong to an application
    const fs::path executable = fs::read_symlink("/proc/self/exe").parent_path();
    EXPECT_EQ(GetConfigFilePath(), wxString::FromUTF8((executable / "WyxConfig.cfg").string()));

    const std::string name = "installed-" + std::to_string(::getpid());
    const fs::path share = executable.parent_path() / "share", installed = share / "wyxprogress" / name;
    EXPECT_EQ(FindProgramFile(name), wxString::FromUTF8((executable / name).string())) << "neither exists";
    fs::create_directories(installed.parent_path());
    JournalTest::WriteBytes(installed.string(), "");
    EXPECT_EQ(FindProgramFile(name), wxString::FromUTF8(installed.string()));
    fs::remove(installed);
    std::error_code kept; // left alone when anyone else uses it
    fs::remove(installed.parent_path(), kept);
    fs::remove(share, kept);
}

TEST(DataDirectory, LiesBelowTheSystemRoot)
{
    for (const auto& [root, expected] : std::vector<std::pair<const char*, std::string>>{
             {nullptr, "/var/lib/Corvane/HotFolders/"},
             {"/tmp/wyx/", "/tmp/wyx/var/lib/Corvane/HotFolders/"},
             {"relative/root", fs::current_path().string() + "/relative/root/var/lib/Corvane/HotFolders/"}})
    {
        ScopedEnv variable("WYX_SYSTEM_ROOT", root ? root : "");
        if (root == nullptr)
            ::unsetenv("WYX_SYSTEM_ROOT");
        EXPECT_EQ(GetDataDirectory().utf8_string(), expected) << (root ? root : "(unset)");
    }
}

} // namespace
} // namespace journaltest
