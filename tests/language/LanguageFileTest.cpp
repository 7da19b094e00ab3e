// The language files as they are found on disk: encodings, blank and empty
// files, which line counts, and things planted where a file belongs.
#include <gtest/gtest.h>

#include <sys/stat.h>

#include <tuple>

#include <wx/init.h>

#include "TempFolder.h"
#include "app/language/LanguageFile.h"
#include "app/language/LanguageSources.h"
#include "platform/os/LanguageEnvironment.h"

namespace
{

TEST(LanguageFileTest, DecodesFindsTheCodesAndReadsBothFilesFromTheirPlacesButNoFifoOrFolder)
{
    const std::pair<std::string, const char*> encoded[] = {
        {std::string("\xFF\xFE") + std::string("f\0r\0_\0F\0R\0", 10), "fr_FR"},
        {std::string("\xFE\xFF\0j\0a\0_\0J\0P", 12), "ja_JP"},
        {"serverlang=de # \xC3\xA9t\xC3\xA9", "serverlang=de # \xC3\xA9t\xC3\xA9"},
        {"serverlang=de # \xE9t\xE9", "serverlang=de # \xC3\xA9t\xC3\xA9"}, // Latin-1
    };
    for (const auto& [bytes, expected] : encoded)
        EXPECT_EQ(uilanguage::DecodeLanguageFile(bytes).utf8_string(), expected) << expected;

    // The user's code is the trimmed first line; the server's the value of the
    // last line that starts "serverlang" (nullptr: no such line).
    const std::tuple<const char*, const char*, const char*> lines[] = {
        {" \t de_DE \t", "de_DE", nullptr},
        {"de_DE\rfr_FR", "de_DE", nullptr},
        {"serverlang = fr \n", "serverlang = fr", "fr"},
        {"serverlang=fr\r\nserverlang=de\r\n", "serverlang=fr", "de"},
        {"serverlang=a=b", "serverlang=a=b", "a=b"},
        {" serverlang=de", "serverlang=de", nullptr},
        {"", "", nullptr},
    };
    for (const auto& [text, user, server] : lines)
    {
        wxString code;
        EXPECT_EQ(uilanguage::UserFileCode(text), user) << text;
        EXPECT_EQ(uilanguage::ServerFileCode(text, code), server != nullptr) << text;
        EXPECT_EQ(code, server ? wxString(server) : code) << text;
    }

    // The files at their places on this system, below a temporary home and root: a
    // missing one, one behind a link; a FIFO or folder in a file's
    // place is not waited for nor read. The user's folder follows XDG, else HOME,
    // and the system's language the locale's variables.
    wxInitializer init;
    TempFolder folder;
    ScopedEnv config{"XDG_CONFIG_HOME", (folder.Path() / "config").string()};
    ScopedEnv root{"WYX_SYSTEM_ROOT", (folder.Path() / "root").string()};
    const std::filesystem::path user = folder.Path() / "config/Corvane Quillet/current.lang",
                                server = folder.Path() / "root/srv/kelvo/server/lcdstr/current.lang";
    const uilanguage::SystemLanguageSources sources;
    wxString text = "left";
    EXPECT_FALSE(sources.ReadUserFile(text));

    folder.Write("root/srv/kelvo/server/lcdstr/current.lang", "serverlang=cs\n");
    ASSERT_TRUE(sources.ReadServerFile(text));
    EXPECT_EQ(text, "serverlang=cs\n");
    std::filesystem::remove(server);
    std::filesystem::create_directory(server);
    EXPECT_FALSE(sources.ReadServerFile(text));

    const std::filesystem::path target = folder.Write("elsewhere/lang", "\xEF\xBB\xBFru_RU");
    std::filesystem::create_directories(user.parent_path());
    std::filesystem::create_symlink(target, user);
    ASSERT_TRUE(sources.ReadUserFile(text));
    EXPECT_EQ(text, "ru_RU");
    std::filesystem::remove(target);
    ASSERT_EQ(::mkfifo(target.c_str(), 0600), 0);
    EXPECT_FALSE(sources.ReadUserFile(text));

    EXPECT_EQ(wyxos::UserConfigFolder(), (folder.Path() / "config").string());
    ScopedEnv relative("XDG_CONFIG_HOME", "relative/config"), home("HOME", folder.Path().string());
    EXPECT_EQ(wyxos::UserConfigFolder(), (folder.Path() / ".config").string());
    ScopedEnv lang("LANG", "fr_FR.UTF-8"), messages("LC_MESSAGES", "de_DE.UTF-8"), all("LC_ALL", "");
    EXPECT_EQ(uilanguage::SystemLanguageSources().SystemLanguageId(), 0x0407u);
    ScopedEnv c("LC_ALL", "C");
    EXPECT_EQ(uilanguage::SystemLanguageSources().SystemLanguageId(), 0u);
}

} // namespace
