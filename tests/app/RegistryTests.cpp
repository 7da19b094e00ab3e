// The registry file, and the install path and crash reporter folder read from it.
#include <sys/stat.h>

#include <gtest/gtest.h>

#include "TempFolder.h"
#include "app/InstallPath.h"
#include "platform/os/Registry.h"

namespace
{

const char* const kCrashKey = "SOFTWARE\\Kelvo Systems\\CrashReporter";
const std::string kCrash = "[SOFTWARE\\Kelvo Systems\\CrashReporter]\n";
const std::string kTwoKeys = kCrash +
                             "InstallPath=/opt/crash\n[SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve]\n"
                             "InstallPath=/opt/kelvo\n";

TEST(RegistryFile, ParsingFindsExactlyTheValuesTheFileHolds)
{
    // The file, the key, the name, the value (null: none found).
    for (const auto& [text, key, name, expected] :
         std::vector<std::tuple<std::string, const char*, const char*, const char*>>{
             {kTwoKeys, kCrashKey, "InstallPath", "/opt/crash"},
             {kTwoKeys, "SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve", "InstallPath", "/opt/kelvo"},
             // Key and name without regard to case.
             {kTwoKeys, "software\\KELVO systems\\crashreporter", "installpath", "/opt/crash"},
             // Blanks around names, values and headers go; blanks inside the key path count.
             {"  \n\t" + kCrash + "  \n  InstallPath  =  /opt/with space  \n\n", kCrashKey, "InstallPath",
              "/opt/with space"},
             {"[SOFTWARE\\Kelvo Systems\\ CrashReporter]\nInstallPath=/x\n", kCrashKey, "InstallPath",
              nullptr},
             {"[ SOFTWARE\\Kelvo Systems\\CrashReporter ]\nInstallPath=/x\n", kCrashKey, "InstallPath", "/x"},
             {kCrash + "InstallPath=\n", kCrashKey, "InstallPath", ""},
             {kCrash + "InstallPath=/a=b\n", kCrashKey, "InstallPath", "/a=b"},
             {"; a comment\n# another\n" + kCrash + ";InstallPath=/no\n", kCrashKey, "InstallPath", nullptr},
             {"InstallPath=/orphan\n", "", "InstallPath", nullptr},
             {kCrash + "[broken\nInstallPath=/x\n", kCrashKey, "InstallPath", nullptr}})
    {
        wxString value = "untouched";
        EXPECT_EQ(wyxos::RegistryFile::Parse(wxString::FromUTF8(text))
                      .QueryValue(wxString::FromUTF8(key), wxString::FromUTF8(name), value),
                  expected != nullptr)
            << text;
        EXPECT_EQ(value, wxString::FromUTF8(expected ? expected : "untouched")) << text;
    }
}

TEST(RegistryFile, IsReadBelowTheSystemRootInItsEncodingNeverFromAFifoOrFolderAndGivesTheInstallPathIfItFits)
{
    TempFolder folder;
    ScopedEnv root("WYX_SYSTEM_ROOT", folder.Path().string());
    wxString value;
    EXPECT_FALSE(wyxos::ReadRegistryValue(kCrashKey, "InstallPath", value));
    // A FIFO whose writer never comes would block a plain open() for ever.
    std::filesystem::create_directories(folder.Path() / "etc/kelvo/registry.ini");
    EXPECT_FALSE(wyxos::ReadRegistryValue(kCrashKey, "InstallPath", value));
    std::filesystem::remove(folder.Path() / "etc/kelvo/registry.ini");
    ASSERT_EQ(::mkfifo((folder.Path() / "etc/kelvo/registry.ini").c_str(), 0600), 0);
    EXPECT_FALSE(wyxos::ReadRegistryValue(kCrashKey, "InstallPath", value));
    std::filesystem::remove(folder.Path() / "etc/kelvo/registry.ini");
    for (const auto& [text, expected] :
         {std::pair<std::string, const char*>{"\xEF\xBB\xBF" + kCrash + "InstallPath=/a\r\n", "/a"},
          {kCrash + "InstallPath=/k\xE9lvo\n", "/k\xC3\xA9lvo"}})
    {
        folder.Write("etc/kelvo/registry.ini", text);
        ASSERT_TRUE(wyxos::ReadRegistryValue(kCrashKey, "InstallPath", value)) << expected;
        EXPECT_EQ(value, wxString::FromUTF8(expected));
    }

    // The install path, if it fits the value buffer: 517 bytes hold 257 UTF-16 units and the
    // terminator; U+1F5A8 takes two units.
    const std::string longest = "/" + std::string(256, 'a'), printer = "\xF0\x9F\x96\xA8";
    const std::string key = "[SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve]\n";
    for (const auto& [text, expected] : std::vector<std::pair<std::string, std::string>>{
             {key + "InstallPath=/opt/kelvo/Corvane\n", "/opt/kelvo/Corvane"},
             {key + "InstallPath=" + longest + "\n", longest},
             {key + "InstallPath=" + longest + "b\n", ""},
             {key + "InstallPath=/" + std::string(254, 'a') + printer + "\n",
              "/" + std::string(254, 'a') + printer},
             {key + "InstallPath=/" + std::string(255, 'a') + printer + "\n", ""}})
    {
        folder.Write("etc/kelvo/registry.ini", text);
        EXPECT_EQ(ReadInstallPath(), wxString::FromUTF8(expected)) << text;
    }
}

} // namespace
