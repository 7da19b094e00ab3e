// Which language the window takes: the configured version, the two language
// files and the system's locale, from one table of cases. How a file's lines
// give a code is checked once, in LanguageFileTest.
#include <gtest/gtest.h>

#include <optional>
#include <utility>

#include <wx/init.h>
#include <wx/intl.h>

#include "app/language/LanguageChoice.h"
#include "app/language/LanguageSources.h"
#include "app/language/LanguageTable.h"

namespace
{

// One case: the version, the two files (std::nullopt: missing), the system's
// Windows language id and language, and the language expected.
struct Case
{
    const char* version;
    std::optional<const char*> userFile, serverFile;
    unsigned systemLanguageId;
    int systemLanguage, expected;
};

struct FakeSources : uilanguage::LanguageSources
{
    explicit FakeSources(const Case& c) : c(c) {}
    bool ReadUserFile(wxString& text) const override { return Read(c.userFile, text); }
    bool ReadServerFile(wxString& text) const override { return Read(c.serverFile, text); }
    unsigned SystemLanguageId() const override { return c.systemLanguageId; }
    int SystemLanguage() const override { return c.systemLanguage; }
    static bool Read(const std::optional<const char*>& file, wxString& text)
    {
        text = file ? wxString::FromUTF8(*file) : text;
        return file.has_value();
    }
    const Case& c;
};

TEST(LanguageChoiceTest, ChoosesByVersionFromTheUserFileTheServerFileOrTheSystemsLocale)
{
    constexpr unsigned kTaiwan = 0x0404, kFrance = 0x040C; // Windows language ids
    constexpr int kNone = wxLANGUAGE_UNKNOWN;
    const std::nullopt_t no = std::nullopt;
    const Case cases[] = {
        // 3.3: the per-user file (case and blanks do not count), else the system's
        // language unless it is unknown or written right to left.
        {"3.3", "  fr_fr  \n", no, 0, wxLANGUAGE_GERMAN, wxLANGUAGE_FRENCH_FRANCE},
        {"3.3", "sv_SE", no, 0, wxLANGUAGE_DUTCH, wxLANGUAGE_DUTCH},
        {"3.3", no, no, 0, wxLANGUAGE_ARABIC, wxLANGUAGE_ENGLISH_US},
        {"3.3", no, "serverlang=de", 0, kNone, wxLANGUAGE_ENGLISH_US},
        // 3.1: the server's file, then the system locale; never the user's file.
        {"3.1", no, "serverlang=PT", kFrance, kNone, wxLANGUAGE_PORTUGUESE_BRAZILIAN},
        {"3.1", no, "serverlang=sv", kTaiwan, kNone, wxLANGUAGE_CHINESE_TAIWAN},
        {"3.1", "de_DE", no, 0, wxLANGUAGE_GERMAN, wxLANGUAGE_UNKNOWN},
        // 3.0 and none: the system's default; any other (even " 3.3") stays English.
        {"3.0", "de_DE", "serverlang=de", kFrance, wxLANGUAGE_GERMAN, wxLANGUAGE_DEFAULT},
        {"", "de_DE", "serverlang=de", kFrance, wxLANGUAGE_GERMAN, wxLANGUAGE_DEFAULT},
        {" 3.3", "de_DE", no, 0, wxLANGUAGE_GERMAN, wxLANGUAGE_UNKNOWN},
    };
    wxInitializer init; // the language database lives in the library's initialised state
    for (const auto& c : cases)
    {
        const int chosen = ChooseUiLanguageFor(c.version, FakeSources(c));
        EXPECT_EQ(chosen, c.expected)
            << c.version << " " << c.userFile.value_or("-") << " " << c.serverFile.value_or("-") << ": "
            << wxLocale::GetLanguageCanonicalName(chosen);
    }

    // Locale names as the environment gives them, to the Windows ids of the
    // program's table: codeset and modifier, a language alone, none.
    const std::pair<const char*, unsigned> locales[] = {
        {"de_AT.UTF-8", 0x0C07}, {"sr_RS@latin", 0x081A}, {"fr", 0x040C}, {"POSIX", 0}, {"xx_YY.UTF-8", 0}};
    for (const auto& [locale, expectedId] : locales)
        EXPECT_EQ(uilanguage::WindowsLanguageIdOfLocale(locale), expectedId) << locale;
}

} // namespace
