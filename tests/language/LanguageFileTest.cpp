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

using uilanguage::UserFileCode;

TEST(LanguageFileTest, DecodesByMarkThenUtf8ThenLatin1)
{
    const std::pair<std::string, const char*> cases[] = {
        {std::string("\xEF\xBB\xBF") + "de_DE\n", "de_DE\n"},
        {std::string("\xFF\xFE") + std::string("f\0r\0_\0F\0R\0", 10), "fr_FR"},
        {std::string("\xFE\xFF\0j\0a\0_\0J\0P", 12), "ja_JP"},
        {"serverlang=de # \xC3\xA9t\xC3\xA9", "serverlang=de # \xC3\xA9t\xC3\xA9"},
        {"serverlang=de # \xE9t\xE9", "serverlang=de # \xC3\xA9t\xC3\xA9"}, // Latin-1
        {"", ""},
        {"\xEF\xBB\xBF", ""},
    };
    for (const auto& [bytes, expected] : cases)
        EXPECT_EQ(uilanguage::DecodeLanguageFile(bytes).utf8_string(), expected) << expected;
}

TEST(LanguageFileTest, TheUserCodeIsTheTrimmedFirstLineAndTheServerCodeTheLastServerlangLine)
{
    const std::pair<const char*, const char*> user[] = {{"de_DE", "de_DE"},
                                                        {" \t de_DE \t", "de_DE"},
                                                        {"de_DE\r\nfr_FR\r\n", "de_DE"},
                                                        {"de_DE\rfr_FR", "de_DE"},
                                                        {"\nde_DE", ""},
                                                        {"", ""},
                                                        {"   \n", ""},
                                                        {"de DE", "de DE"}};
    for (const auto& [text, expected] : user)
        EXPECT_EQ(UserFileCode(text), expected) << text;

    const char* const none = nullptr; // no serverlang line
    const std::pair<const char*, const char*> server[] = {{"serverlang=fr", "fr"},
                                                          {"serverlang = fr \n", "fr"},
                                                          {"serverlang=fr\nserverlang=de\n", "de"},
                                                          {"a=1\nserverlang=de\nx=2", "de"},
                                                          {"serverlang=de\r\nother=fr\r\n", "de"},
                                                          {"serverlang=a=b", "a=b"},
                                                          {"serverlang=it\nserverlang", ""},
                                                          {"\n\nserverlang=ko\n\n", "ko"},
                                                          {"a=de", none},
                                                          {"x\na=de", none},
                                                          {" serverlang=de", none},
                                                          {"SERVERLANG=de", none},
                                                          {"", none}};
    for (const auto& [text, expected] : server)
    {
        wxString code;
        EXPECT_EQ(uilanguage::ServerFileCode(text, code), expected != nullptr) << text;
        EXPECT_EQ(code, expected ? wxString(expected) : code) << text;
    }
}

// The files at their places on this system, below a temporary home and root.
class LanguagePlacesTest : public ::testing::Test
{
protected:
    wxInitializer init;
    TempFolder folder;
    ScopedEnv config{"XDG_CONFIG_HOME", (folder.Path() / "config").string()};
    ScopedEnv root{"WYX_SYSTEM_ROOT", (folder.Path() / "root").string()};
    const std::string user = "config/Corvane Quillet/current.lang";
    const std::string server = "root/srv/kelvo/server/lcdstr/current.lang";
    const uilanguage::SystemLanguageSources sources;
    wxString text;
};

TEST_F(LanguagePlacesTest, ReadsBothFilesFromTheirPlacesAndAMissingOneAsNone)
{
    EXPECT_FALSE(sources.ReadUserFile(text));
    EXPECT_FALSE(sources.ReadServerFile(text));
    folder.Write(user, "");
    ASSERT_TRUE(sources.ReadUserFile(text));
    EXPECT_EQ(UserFileCode(text), "");

    folder.Write(user, "\xEF\xBB\xBFit_IT\n");
    folder.Write(server, "serverlang=cs\n");
    ASSERT_TRUE(sources.ReadUserFile(text));
    EXPECT_EQ(text, "it_IT\n");
    ASSERT_TRUE(sources.ReadServerFile(text));
    EXPECT_EQ(text, "serverlang=cs\n");
}

TEST_F(LanguagePlacesTest, AFifoOrFolderInAFilesPlaceIsNotWaitedForNorReadButALinkToAFileIs)
{
    std::filesystem::remove(folder.Write(user, ""));
    ASSERT_EQ(::mkfifo((folder.Path() / user).c_str(), 0600), 0);
    std::filesystem::remove(folder.Write(server, ""));
    std::filesystem::create_directory(folder.Path() / server);
    EXPECT_FALSE(sources.ReadUserFile(text));
    EXPECT_FALSE(sources.ReadServerFile(text));

    const std::filesystem::path target = folder.Write("elsewhere/lang", "ru_RU");
    std::filesystem::remove(folder.Path() / user);
    std::filesystem::create_symlink(target, folder.Path() / user);
    ASSERT_TRUE(sources.ReadUserFile(text));
    EXPECT_EQ(text, "ru_RU");
    std::filesystem::remove(target);
    ASSERT_EQ(::mkfifo(target.c_str(), 0600), 0);
    EXPECT_FALSE(sources.ReadUserFile(text));
}

TEST_F(LanguagePlacesTest, TheUserFolderFollowsXdgAndTheLocaleTheEnvironment)
{
    EXPECT_EQ(wyxos::UserConfigFolder(), (folder.Path() / "config").string());
    ScopedEnv relative("XDG_CONFIG_HOME", "relative/config"), home("HOME", folder.Path().string());
    EXPECT_EQ(wyxos::UserConfigFolder(), (folder.Path() / ".config").string());

    {
        ScopedEnv lang("LANG", "fr_FR.UTF-8"), messages("LC_MESSAGES", "de_DE.UTF-8"), all("LC_ALL", "");
        EXPECT_EQ(wyxos::UserMessagesLocaleName(), "de_DE.UTF-8");
        EXPECT_EQ(uilanguage::SystemLanguageSources().SystemLanguageId(), 0x0407u);
        ScopedEnv c("LC_ALL", "C");
        EXPECT_EQ(uilanguage::SystemLanguageSources().SystemLanguageId(), 0u);
    }
    for (const char* variable : {"LC_ALL", "LC_MESSAGES", "LANG"})
        ::unsetenv(variable);
    EXPECT_EQ(wyxos::UserMessagesLocaleName(), "C");
}

} // namespace
