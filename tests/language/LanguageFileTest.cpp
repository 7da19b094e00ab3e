// The language files as they are found on disk: encodings, blank and empty
// files, which line counts, and things planted where a file belongs.
#include <gtest/gtest.h>

#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <string>

#include <wx/init.h>

#include "TempFolder.h"
#include "app/language/LanguageFile.h"
#include "app/language/LanguageSources.h"
#include "platform/os/LanguageEnvironment.h"

namespace
{

using uilanguage::DecodeLanguageFile;
using uilanguage::ServerFileCode;
using uilanguage::UserFileCode;

struct DecodeCase
{
    const char* name;
    std::string bytes;
    const char* expectedUtf8;
};

TEST(LanguageFileTest, DecodesByMarkThenUtf8ThenLatin1)
{
    const DecodeCase cases[] = {
        {"utf8 mark", std::string("\xEF\xBB\xBF") + "de_DE\n", "de_DE\n"},
        {"utf16 little-endian mark", std::string("\xFF\xFE") + std::string("f\0r\0_\0F\0R\0", 10), "fr_FR"},
        {"utf16 big-endian mark", std::string("\xFE\xFF\0j\0a\0_\0J\0P", 12), "ja_JP"},
        {"utf8 without mark", "serverlang=de # \xC3\xA9t\xC3\xA9", "serverlang=de # \xC3\xA9t\xC3\xA9"},
        {"latin-1 fallback", "serverlang=de # \xE9t\xE9", "serverlang=de # \xC3\xA9t\xC3\xA9"},
        {"empty", "", ""},
        {"mark only", "\xEF\xBB\xBF", ""},
    };
    for (const DecodeCase& c : cases)
        EXPECT_EQ(DecodeLanguageFile(c.bytes).utf8_string(), c.expectedUtf8) << c.name;
}

struct UserCodeCase
{
    const char* text;
    const char* expected;
};

TEST(LanguageFileTest, TheUserFileCodeIsItsTrimmedFirstLine)
{
    const UserCodeCase cases[] = {
        {"de_DE", "de_DE"},
        {" \t de_DE \t", "de_DE"},
        {"de_DE\r\nfr_FR\r\n", "de_DE"},
        {"de_DE\rfr_FR", "de_DE"},
        {"\nde_DE", ""},
        {"", ""},
        {"   \n", ""},
        {"de DE", "de DE"},
    };
    for (const UserCodeCase& c : cases)
        EXPECT_EQ(UserFileCode(c.text), c.expected) << c.text;
}

struct ServerCodeCase
{
    const char* text;
    bool found;
    const char* expected;
};

TEST(LanguageFileTest, TheServerFileCodeComesFromItsLastServerlangLine)
{
    const ServerCodeCase cases[] = {
        {"serverlang=fr", true, "fr"},
        {"serverlang = fr \n", true, "fr"},
        {"serverlang=fr\nserverlang=de\n", true, "de"},
        {"a=1\nserverlang=de\nx=2", true, "de"},
        {"serverlang=de\r\nother=fr\r\n", true, "de"},
        {"serverlang=a=b", true, "a=b"},
        {"serverlang=it\nserverlang", true, ""},
        {"\n\nserverlang=ko\n\n", true, "ko"},
        {"a=de", false, ""},
        {"x\na=de", false, ""},
        {" serverlang=de", false, ""},
        {"SERVERLANG=de", false, ""},
        {"", false, ""},
    };
    for (const ServerCodeCase& c : cases)
    {
        wxString code;
        EXPECT_EQ(ServerFileCode(c.text, code), c.found) << c.text;
        if (c.found)
        {
            EXPECT_EQ(code, c.expected) << c.text;
        }
    }
}

// The files at their places on this system, below a temporary home and root.
class LanguagePlacesTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        ASSERT_FALSE(folder.Path().empty());
        ::setenv("XDG_CONFIG_HOME", (folder.Path() / "config").c_str(), 1);
        ::setenv("WYX_SYSTEM_ROOT", (folder.Path() / "root").c_str(), 1);
    }
    void TearDown() override
    {
        ::unsetenv("XDG_CONFIG_HOME");
        ::unsetenv("WYX_SYSTEM_ROOT");
    }

    static constexpr const char* kUserFile = "config/Corvane Quillet/current.lang";
    static constexpr const char* kServerFile = "root/srv/kelvo/server/lcdstr/current.lang";

    wxInitializer init;
    TempFolder folder;
};

TEST_F(LanguagePlacesTest, ReadsBothFilesFromTheirPlaces)
{
    folder.Write(kUserFile, "\xEF\xBB\xBFit_IT\n");
    folder.Write(kServerFile, "serverlang=cs\n");
    const uilanguage::SystemLanguageSources sources;
    wxString text;
    ASSERT_TRUE(sources.ReadUserFile(text));
    EXPECT_EQ(text, "it_IT\n");
    ASSERT_TRUE(sources.ReadServerFile(text));
    EXPECT_EQ(text, "serverlang=cs\n");
}

TEST_F(LanguagePlacesTest, AMissingOrEmptyFileHasNoCode)
{
    const uilanguage::SystemLanguageSources sources;
    wxString text;
    EXPECT_FALSE(sources.ReadUserFile(text));
    EXPECT_FALSE(sources.ReadServerFile(text));

    folder.Write(kUserFile, "");
    ASSERT_TRUE(sources.ReadUserFile(text));
    EXPECT_EQ(UserFileCode(text), "");
}

TEST_F(LanguagePlacesTest, AFifoOrFolderInAFilesPlaceIsNotWaitedForNorRead)
{
    const std::filesystem::path user = folder.Write(kUserFile, "");
    std::filesystem::remove(user);
    ASSERT_EQ(::mkfifo(user.c_str(), 0600), 0);
    const std::filesystem::path server = folder.Write(kServerFile, "");
    std::filesystem::remove(server);
    std::filesystem::create_directory(server);

    const uilanguage::SystemLanguageSources sources;
    wxString text;
    EXPECT_FALSE(sources.ReadUserFile(text));
    EXPECT_FALSE(sources.ReadServerFile(text));
}

TEST_F(LanguagePlacesTest, ALinkIsFollowedToAFileButNotToAFifo)
{
    const std::filesystem::path target = folder.Write("elsewhere/lang", "ru_RU");
    const std::filesystem::path user = folder.Write(kUserFile, "");
    std::filesystem::remove(user);
    std::filesystem::create_symlink(target, user);
    const uilanguage::SystemLanguageSources sources;
    wxString text;
    ASSERT_TRUE(sources.ReadUserFile(text));
    EXPECT_EQ(text, "ru_RU");

    std::filesystem::remove(target);
    ASSERT_EQ(::mkfifo(target.c_str(), 0600), 0);
    EXPECT_FALSE(sources.ReadUserFile(text));
}

TEST_F(LanguagePlacesTest, TheUserFolderFollowsXdgAndTheLocaleTheEnvironment)
{
    EXPECT_EQ(wyxos::UserConfigFolder(), (folder.Path() / "config").string());
    ::setenv("XDG_CONFIG_HOME", "relative/config", 1);
    ::setenv("HOME", folder.Path().c_str(), 1);
    EXPECT_EQ(wyxos::UserConfigFolder(), (folder.Path() / ".config").string());

    ::setenv("LANG", "fr_FR.UTF-8", 1);
    ::setenv("LC_MESSAGES", "de_DE.UTF-8", 1);
    ::setenv("LC_ALL", "", 1);
    EXPECT_EQ(wyxos::UserMessagesLocaleName(), "de_DE.UTF-8");
    EXPECT_EQ(uilanguage::SystemLanguageSources().SystemLanguageId(), 0x0407u);
    ::setenv("LC_ALL", "C", 1);
    EXPECT_EQ(uilanguage::SystemLanguageSources().SystemLanguageId(), 0u);
    for (const char* variable : {"LC_ALL", "LC_MESSAGES", "LANG"})
        ::unsetenv(variable);
    EXPECT_EQ(wyxos::UserMessagesLocaleName(), "C");
}

} // namespace
