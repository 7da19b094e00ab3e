// Which language the window takes: the configured version, the two language
// files and the system's locale, from one table of cases. How a file's lines
// give a code is checked once, in LanguageFileTest.
#include <gtest/gtest.h>

#include <optional>

#include <wx/init.h>
#include <wx/intl.h>

#include "app/language/LanguageChoice.h"
#include "app/language/LanguageSources.h"
#include "app/language/LanguageTable.h"

namespace
{

// One case: the version, the two files (std::nullopt: missing), the system's
// locale name and language, and the language expected.
struct Case
{
    const char* version;
    std::optional<const char*> userFile, serverFile;
    const char* systemLocale;
    int systemLanguage, expected;
};

struct FakeSources : uilanguage::LanguageSources
{
    explicit FakeSources(const Case& c) : c(c) {}
    bool ReadUserFile(wxString& text) const override { return Read(c.userFile, text); }
    bool ReadServerFile(wxString& text) const override { return Read(c.serverFile, text); }
    unsigned SystemLanguageId() const override
    {
        return uilanguage::WindowsLanguageIdOfLocale(c.systemLocale);
    }
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
    const std::nullopt_t no = std::nullopt;
    const Case cases[] = {
        // 3.3: the per-user file (case and blanks do not count), else the system's
        // language unless it is unknown or written right to left.
        {"3.3", "  fr_fr  \n", no, "", wxLANGUAGE_GERMAN, wxLANGUAGE_FRENCH_FRANCE},
        {"3.3", "sv_SE", no, "", wxLANGUAGE_DUTCH, wxLANGUAGE_DUTCH},
        {"3.3", no, no, "", wxLANGUAGE_ARABIC, wxLANGUAGE_ENGLISH_US},
        // 3.1: the server's file, then the locale's row of the program's table (by
        // its name with a codeset or modifier, or its language alone); never the user's file.
        {"3.1", no, "serverlang=PT", "fr_FR.UTF-8", wxLANGUAGE_UNKNOWN, wxLANGUAGE_PORTUGUESE_BRAZILIAN},
        {"3.1", no, "serverlang=sv", "zh_TW.UTF-8", wxLANGUAGE_UNKNOWN, wxLANGUAGE_CHINESE_TAIWAN},
        {"3.1", no, no, "sr_RS@latin", wxLANGUAGE_UNKNOWN, wxLANGUAGE_SERBIAN_LATIN_SERBIA},
        {"3.1", no, no, "fr", wxLANGUAGE_UNKNOWN, wxLANGUAGE_FRENCH_FRANCE},
        {"3.1", "de_DE", no, "POSIX", wxLANGUAGE_GERMAN, wxLANGUAGE_UNKNOWN},
        // 3.0 and none: the system's default; any other (even " 3.3") stays English.
        {"3.0", "de_DE", "serverlang=de", "fr_FR", wxLANGUAGE_GERMAN, wxLANGUAGE_DEFAULT},
        {"", "de_DE", "serverlang=de", "fr_FR", wxLANGUAGE_GERMAN, wxLANGUAGE_DEFAULT},
        {" 3.3", "de_DE", no, "", wxLANGUAGE_GERMAN, wxLANGUAGE_UNKNOWN},
    };
    wxInitializer init; // the language database lives in the library's initialised state
    for (const auto& c : cases)
    {
        const int chosen = ChooseUiLanguageFor(c.version, FakeSources(c));
        EXPECT_EQ(chosen, c.expected)
            << c.version << " " << c.userFile.value_or("-") << " " << c.serverFile.value_or("-") << ": "
            << wxLocale::GetLanguageCanonicalName(chosen);
    }
}

} // namespace
