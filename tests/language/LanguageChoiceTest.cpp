// Which language the window takes: the configured version, the two language
// files and the system's locale, from one table of cases.
#include <gtest/gtest.h>

#include <optional>
#include <string>

#include <wx/init.h>
#include <wx/intl.h>

#include "FakeLanguageSources.h"
#include "app/language/LanguageChoice.h"
#include "app/language/LanguageTable.h"
#include "app/language/SupportedLanguages.h"

namespace
{

constexpr unsigned kTaiwanLocale = 0x0404;  // Chinese, sub-language 1
constexpr unsigned kFranceLocale = 0x040C;  // French, sub-language 1
constexpr unsigned kUnknownLocale = 0x7F3F; // ids no row carries

struct ChoiceCase
{
    const char* name;
    const char* version;
    std::optional<const char*> userFile;
    std::optional<const char*> serverFile;
    unsigned systemLanguageId;
    int systemLanguage;
    int expected;
};

std::ostream& operator<<(std::ostream& out, const ChoiceCase& c)
{
    return out << c.name;
}

const ChoiceCase kCases[] = {
    // Version 3.3: the per-user file.
    {"UserFileCodeIgnoresCaseAndBlanks", "3.3", "  fr_fr  \n", std::nullopt, 0, wxLANGUAGE_GERMAN,
     wxLANGUAGE_FRENCH_FRANCE},
    {"UserFileGerman", "3.3", "de_DE", std::nullopt, 0, wxLANGUAGE_UNKNOWN, wxLANGUAGE_GERMAN_GERMANY},
    {"UserFileBrazilianPortuguese", "3.3", "pt_BR\r\n", std::nullopt, 0, wxLANGUAGE_UNKNOWN,
     wxLANGUAGE_PORTUGUESE_BRAZILIAN},
    {"UserFileEnglish", "3.3", "en_US", std::nullopt, 0, wxLANGUAGE_GERMAN, wxLANGUAGE_ENGLISH_US},
    {"UserFileTraditionalChinese", "3.3", "zh_TW", std::nullopt, 0, wxLANGUAGE_UNKNOWN,
     wxLANGUAGE_CHINESE_TAIWAN},
    {"OnlyTheFirstLineCounts", "3.3", "\nde_DE\n", std::nullopt, 0, wxLANGUAGE_JAPANESE_JAPAN,
     wxLANGUAGE_JAPANESE_JAPAN},
    {"UnsupportedUserCodeTakesTheSystemLanguage", "3.3", "sv_SE", std::nullopt, 0, wxLANGUAGE_DUTCH,
     wxLANGUAGE_DUTCH},
    {"EmptyUserFileTakesTheSystemLanguage", "3.3", "", std::nullopt, 0, wxLANGUAGE_KOREAN_KOREA,
     wxLANGUAGE_KOREAN_KOREA},
    {"NoUserFileAndArabicSystemGivesEnglish", "3.3", std::nullopt, std::nullopt, 0, wxLANGUAGE_ARABIC,
     wxLANGUAGE_ENGLISH_US},
    {"NoUserFileAndHebrewSystemGivesEnglish", "3.3", std::nullopt, std::nullopt, 0, wxLANGUAGE_HEBREW_ISRAEL,
     wxLANGUAGE_ENGLISH_US},
    {"NoUserFileAndUnknownSystemGivesEnglish", "3.3", std::nullopt, std::nullopt, 0, wxLANGUAGE_UNKNOWN,
     wxLANGUAGE_ENGLISH_US},
    {"NoUserFileTakesALeftToRightSystemLanguage", "3.3", std::nullopt, std::nullopt, 0,
     wxLANGUAGE_GERMAN_GERMANY, wxLANGUAGE_GERMAN_GERMANY},
    {"TheServerFileDoesNotCountForVersion33", "3.3", std::nullopt, "serverlang=de", 0, wxLANGUAGE_UNKNOWN,
     wxLANGUAGE_ENGLISH_US},

    // Version 3.1: the server's file, then the system locale.
    {"LastServerlangLineWins", "3.1", std::nullopt, "a=1\nserverlang=de\nx=2", kFranceLocale,
     wxLANGUAGE_UNKNOWN, wxLANGUAGE_GERMAN_GERMANY},
    {"LaterServerlangLineReplacesEarlier", "3.1", std::nullopt, "serverlang=fr\r\nserverlang = tw \r\n", 0,
     wxLANGUAGE_UNKNOWN, wxLANGUAGE_CHINESE_TAIWAN},
    {"ServerCodeIgnoresCase", "3.1", std::nullopt, "serverlang=PT", 0, wxLANGUAGE_UNKNOWN,
     wxLANGUAGE_PORTUGUESE_BRAZILIAN},
    {"ALineWithoutServerlangDecidesNothing", "3.1", std::nullopt, "a=de", kFranceLocale, wxLANGUAGE_UNKNOWN,
     wxLANGUAGE_FRENCH_FRANCE},
    {"ServerlangIsCaseSensitive", "3.1", std::nullopt, "ServerLang=de", kFranceLocale, wxLANGUAGE_UNKNOWN,
     wxLANGUAGE_FRENCH_FRANCE},
    {"UnsupportedServerCodeLeavesItToTheLocale", "3.1", std::nullopt, "serverlang=sv", kTaiwanLocale,
     wxLANGUAGE_UNKNOWN, wxLANGUAGE_CHINESE_TAIWAN},
    {"EmptyServerFileLeavesItToTheLocale", "3.1", std::nullopt, "", kFranceLocale, wxLANGUAGE_UNKNOWN,
     wxLANGUAGE_FRENCH_FRANCE},
    {"NoServerFileAndCLocaleIsUnknown", "3.1", "de_DE", std::nullopt, 0, wxLANGUAGE_GERMAN,
     wxLANGUAGE_UNKNOWN},
    {"LocaleWithoutARowIsUnknown", "3.1", std::nullopt, std::nullopt, kUnknownLocale, wxLANGUAGE_GERMAN,
     wxLANGUAGE_UNKNOWN},

    // Other versions.
    {"Version30IsTheSystemDefault", "3.0", "de_DE", "serverlang=de", kFranceLocale, wxLANGUAGE_GERMAN,
     wxLANGUAGE_DEFAULT},
    {"NoVersionIsTheSystemDefault", "", "de_DE", "serverlang=de", kFranceLocale, wxLANGUAGE_GERMAN,
     wxLANGUAGE_DEFAULT},
    {"AnUnknownVersionLeavesTheWindowInEnglish", "4.0", "de_DE", "serverlang=de", kFranceLocale,
     wxLANGUAGE_GERMAN, wxLANGUAGE_UNKNOWN},
    {"AVersionWithBlanksIsAnotherVersion", " 3.3", "de_DE", std::nullopt, 0, wxLANGUAGE_GERMAN,
     wxLANGUAGE_UNKNOWN},
};

class LanguageChoiceTest : public ::testing::TestWithParam<ChoiceCase>
{
protected:
    // The language database lives in the library's initialised state.
    wxInitializer init;
};

TEST_P(LanguageChoiceTest, ChoosesTheLanguage)
{
    const ChoiceCase& c = GetParam();
    FakeLanguageSources sources;
    if (c.userFile)
        sources.userFile = wxString::FromUTF8(*c.userFile);
    if (c.serverFile)
        sources.serverFile = wxString::FromUTF8(*c.serverFile);
    sources.systemLanguageId = c.systemLanguageId;
    sources.systemLanguage = c.systemLanguage;

    const int chosen = ChooseUiLanguageFor(wxString::FromUTF8(c.version), sources);
    EXPECT_EQ(chosen, c.expected) << wxLocale::GetLanguageCanonicalName(chosen) << " instead of "
                                  << wxLocale::GetLanguageCanonicalName(c.expected);
}

INSTANTIATE_TEST_SUITE_P(Cases, LanguageChoiceTest, ::testing::ValuesIn(kCases),
                         [](const ::testing::TestParamInfo<ChoiceCase>& info) { return info.param.name; });

TEST(LanguageFromServerFileTest, StartsFromUnknownAndSaysWhetherItDecided)
{
    wxInitializer init;
    FakeLanguageSources sources;
    int language = wxLANGUAGE_GERMAN;
    EXPECT_FALSE(LanguageFromServerFile(sources, language));
    EXPECT_EQ(language, wxLANGUAGE_UNKNOWN);

    sources.serverFile = "serverlang=ko";
    EXPECT_TRUE(LanguageFromServerFile(sources, language));
    EXPECT_EQ(language, wxLANGUAGE_KOREAN_KOREA);
}

// Locale names as the environment gives them, to the Windows ids of the
// program's table, and the row those ids lead back to.
struct LocaleCase
{
    const char* locale;
    unsigned expectedId;
    const char* expectedRow;
};

TEST(LanguageTableTest, MapsLocaleNamesToWindowsIdsAndBack)
{
    const LocaleCase cases[] = {
        {"de_DE.UTF-8", 0x0407, "German"},
        {"de_AT.UTF-8", 0x0C07, "German (Austrian)"},
        {"en_US.UTF-8", 0x0409, "English (U.S.)"},
        {"pt_BR", 0x0416, "Portuguese (Brazilian)"},
        {"es_ES.UTF-8", 0x040A, "Spanish"},
        {"zh_CN.GB18030", 0x0804, "Chinese (Simplified)"},
        // Three rows carry 4/1; the first names the language.
        {"zh_TW.UTF-8", 0x0404, "Chinese"},
        {"sr_RS@latin", 0x081A, "Serbian (Latin)"},
        {"sr_RS.UTF-8", 0x0C1A, "Serbian (Cyrillic)"},
        {"fr", 0x040C, "French"},
        {"ar_EG.UTF-8", 0x0C01, "Arabic (Egypt)"},
        {"C", 0, nullptr},
        {"C.UTF-8", 0, nullptr},
        {"POSIX", 0, nullptr},
        {"", 0, nullptr},
        {"xx_YY.UTF-8", 0, nullptr},
    };
    for (const LocaleCase& c : cases)
    {
        const unsigned id = uilanguage::WindowsLanguageIdOfLocale(c.locale);
        EXPECT_EQ(id, c.expectedId) << c.locale;
        const uilanguage::WindowsLanguage* row =
            uilanguage::FindWindowsLanguage(uilanguage::PrimaryLanguageOf(id), uilanguage::SubLanguageOf(id));
        EXPECT_STREQ(row != nullptr ? row->description : nullptr, c.expectedRow) << c.locale;
    }
}

} // namespace

namespace
{

TEST(LanguageTableTest, EveryRowAndEverySupportedLanguageIsKnownToTheLibrary)
{
    wxInitializer init;
    for (auto row = uilanguage::WindowsLanguagesBegin(); row != uilanguage::WindowsLanguagesEnd(); ++row)
        EXPECT_NE(uilanguage::LanguageOfLocaleName(row->canonicalName), wxLANGUAGE_UNKNOWN)
            << row->description;
    for (auto language = uilanguage::SupportedLanguagesBegin();
         language != uilanguage::SupportedLanguagesEnd(); ++language)
    {
        const int id = uilanguage::LanguageOfLocaleName(language->canonicalName);
        EXPECT_EQ(wxLocale::GetLanguageCanonicalName(id), language->canonicalName);
    }
}

} // namespace
