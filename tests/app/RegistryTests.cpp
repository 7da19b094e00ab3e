#include <sys/stat.h>

#include <gtest/gtest.h>

#include "TempFolder.h"
#include "platform/os/Registry.h"

namespace
{

const char* const kCrashKey = "SOFTWARE\\Kelvo Systems\\CrashReporter";

struct ParseCase
{
    const char* title;
    const char* text;
    const char* key;
    const char* name;
    bool found;
    const char* value;
};

void PrintTo(const ParseCase& c, std::ostream* out)
{
    *out << c.title;
}

class RegistryParsing : public ::testing::TestWithParam<ParseCase>
{
};

TEST_P(RegistryParsing, FindsExactlyTheValuesTheFileHolds)
{
    const ParseCase& c = GetParam();
    const wyxos::RegistryFile file = wyxos::RegistryFile::Parse(wxString::FromUTF8(c.text));
    wxString value = "untouched";
    EXPECT_EQ(file.QueryValue(wxString::FromUTF8(c.key), wxString::FromUTF8(c.name), value), c.found);
    EXPECT_EQ(value, c.found ? wxString::FromUTF8(c.value) : wxString("untouched"));
}

const char* const kTwoKeys = "[SOFTWARE\\Kelvo Systems\\CrashReporter]\n"
                             "InstallPath=/opt/crash\n"
                             "[SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve]\n"
                             "InstallPath=/opt/kelvo\n";

INSTANTIATE_TEST_SUITE_P(
    Cases, RegistryParsing,
    ::testing::Values(
        ParseCase{"first of two keys", kTwoKeys, kCrashKey, "InstallPath", true, "/opt/crash"},
        ParseCase{"second of two keys", kTwoKeys, "SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve",
                  "InstallPath", true, "/opt/kelvo"},
        ParseCase{"missing section", kTwoKeys, "SOFTWARE\\Kelvo Systems\\Other", "InstallPath", false, ""},
        ParseCase{"missing value", kTwoKeys, kCrashKey, "Version", false, ""},
        ParseCase{"empty file", "", kCrashKey, "InstallPath", false, ""},
        ParseCase{"key and name without regard to case", kTwoKeys, "software\\KELVO systems\\crashreporter",
                  "installpath", true, "/opt/crash"},
        ParseCase{"CRLF line ends", "[SOFTWARE\\Kelvo Systems\\CrashReporter]\r\nInstallPath=/opt/crash\r\n",
                  kCrashKey, "InstallPath", true, "/opt/crash"},
        ParseCase{"blanks around names, values and headers",
                  "  \n\t[SOFTWARE\\Kelvo Systems\\CrashReporter]  \n  InstallPath  =  /opt/with space  \n\n",
                  kCrashKey, "InstallPath", true, "/opt/with space"},
        ParseCase{"blanks inside the key path count",
                  "[SOFTWARE\\Kelvo Systems\\ CrashReporter]\nInstallPath=/x\n", kCrashKey, "InstallPath",
                  false, ""},
        ParseCase{"empty value is a value", "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=\n",
                  kCrashKey, "InstallPath", true, ""},
        ParseCase{"'=' inside the value", "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=/a=b\n",
                  kCrashKey, "InstallPath", true, "/a=b"},
        ParseCase{"later line wins",
                  "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=/a\nInstallPath=/b\n", kCrashKey,
                  "InstallPath", true, "/b"},
        ParseCase{"a section given twice adds up",
                  "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nA=1\n[Other]\nB=2\n"
                  "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=/c\n",
                  kCrashKey, "A", true, "1"},
        ParseCase{"comments are skipped",
                  "; a comment\n# another\n[SOFTWARE\\Kelvo Systems\\CrashReporter]\n;InstallPath=/no\n",
                  kCrashKey, "InstallPath", false, ""},
        ParseCase{"values before any section belong to none", "InstallPath=/orphan\n", "", "InstallPath",
                  false, ""},
        ParseCase{"a broken header ends the section",
                  "[SOFTWARE\\Kelvo Systems\\CrashReporter]\n[broken\nInstallPath=/x\n", kCrashKey,
                  "InstallPath", false, ""},
        ParseCase{"line without '=' is skipped", "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath\n",
                  kCrashKey, "InstallPath", false, ""},
        ParseCase{"non-ASCII value",
                  "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=/opt/k\xC3\xA9lvo\n", kCrashKey,
                  "InstallPath", true, "/opt/k\xC3\xA9lvo"}));

class RegistryFileOnDisk : public ::testing::Test
{
protected:
    TempFolder folder;
};

TEST_F(RegistryFileOnDisk, MissingFileHasNoValues)
{
    wxString value;
    EXPECT_FALSE(wyxos::RegistryFile::Load(folder.Path().string() + "/absent.ini")
                     .QueryValue(kCrashKey, "InstallPath", value));
}

TEST_F(RegistryFileOnDisk, AFolderOrAFifoInPlaceOfTheFileIsRefusedWithoutWaiting)
{
    std::filesystem::create_directories(folder.Path() / "folder.ini");
    const std::string fifo = (folder.Path() / "fifo.ini").string();
    ASSERT_EQ(::mkfifo(fifo.c_str(), 0600), 0);
    wxString value;
    EXPECT_FALSE(wyxos::RegistryFile::Load((folder.Path() / "folder.ini").string())
                     .QueryValue(kCrashKey, "InstallPath", value));
    // A writer that never comes would block a plain open() for ever.
    EXPECT_FALSE(wyxos::RegistryFile::Load(fifo).QueryValue(kCrashKey, "InstallPath", value));
}

TEST_F(RegistryFileOnDisk, ByteOrderMarkAndLatin1AreRead)
{
    const auto bom =
        folder.Write("bom.ini", "\xEF\xBB\xBF[SOFTWARE\\Kelvo Systems\\CrashReporter]\r\nInstallPath=/a\r\n");
    const auto latin1 =
        folder.Write("latin1.ini", "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=/k\xE9lvo\n");
    wxString value;
    ASSERT_TRUE(wyxos::RegistryFile::Load(bom.string()).QueryValue(kCrashKey, "InstallPath", value));
    EXPECT_EQ(value, "/a");
    ASSERT_TRUE(wyxos::RegistryFile::Load(latin1.string()).QueryValue(kCrashKey, "InstallPath", value));
    EXPECT_EQ(value, wxString::FromUTF8("/k\xC3\xA9lvo"));
}

TEST_F(RegistryFileOnDisk, ValuesAreReadBelowTheSystemRoot)
{
    ScopedEnv root("WYX_SYSTEM_ROOT", folder.Path().string());
    EXPECT_EQ(wyxos::RegistryFilePath(), wxString(folder.Path().string() + "/etc/kelvo/registry.ini"));
    wxString value;
    EXPECT_FALSE(wyxos::ReadRegistryValue(kCrashKey, "InstallPath", value));
    folder.Write("etc/kelvo/registry.ini",
                 "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=/opt/crash\n");
    ASSERT_TRUE(wyxos::ReadRegistryValue(kCrashKey, "InstallPath", value));
    EXPECT_EQ(value, "/opt/crash");
}

} // namespace
