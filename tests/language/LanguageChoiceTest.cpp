// Which language the window takes: the configured version, the two language
// files and the system's locale, from one table of cases. How a file's lines
// give a code is checked once, in LanguageFileTest.
#include <gtest/gtest.h>

#include <optional>
#include <string>

#include <wx/init.h>
#include <wx/intl.h>

#include "app/language/LanguageChoice.h"
#include "app/language/LanguageSources.h"
#include "app/language/LanguageTable.h"
#include "app/language/SupportedLanguages.h"

namespace
{

// Sources given by a test: a file that is std::nullopt is missing.
struct FakeSources : uilanguage::LanguageSources
{
    std::optional<wxString> userFile, serverFile;
    unsigned systemLanguageId = 0;
    int systemLanguage = wxLANGUAGE_UNKNOWN;

    bool ReadUserFile(wxString& text) const override { return Read(userFile, text); }
    bool ReadServerFile(wxString& text) const override { return Read(serverFile, text); }
    unsigned SystemLanguageId() const override { return systemLanguageId; }
    int SystemLanguage() const override { return systemLanguage; }
    static bool Read(const std::optional<wxString>& file, wxString& text)
    {
        text = file.value_or(text);
        return file.has_value();
    }
};

constexpr unsigned kTaiwan = 0x0404;  // Chinese, sub-language 1
constexpr unsigned kFrance = 0x040C;  // French, sub-language 1
constexpr unsigned kUnknown = 0x7F3F; // ids no row carries
const std::nullopt_t kNo = std::nullopt;
constexpr int kNone = wxLANGUAGE_UNKNOWN;

struct ChoiceCase
{
    const char* name;
    const char* version;
    std::optional<const char*> userFile, serverFile;
    unsigned systemLanguageId;
    int systemLanguage, expected;
};

const ChoiceCase kCases[] = {
    // Version 3.3: the per-user file.
    {"UserCodeIgnoresCaseAndBlanks", "3.3", "  fr_fr  \n", kNo, 0, wxLANGUAGE_GERMAN,
     wxLANGUAGE_FRENCH_FRANCE},
    {"UserFileGerman", "3.3", "de_DE", kNo, 0, wxLANGUAGE_UNKNOWN, wxLANGUAGE_GERMAN_GERMANY},
    {"UserFileBrazilian", "3.3", "pt_BR\r\n", kNo, 0, wxLANGUAGE_UNKNOWN, wxLANGUAGE_PORTUGUESE_BRAZILIAN},
    {"UserFileEnglish", "3.3", "en_US", kNo, 0, wxLANGUAGE_GERMAN, wxLANGUAGE_ENGLISH_US},
    {"UserFileTraditionalChinese", "3.3", "zh_TW", kNo, 0, wxLANGUAGE_UNKNOWN, wxLANGUAGE_CHINESE_TAIWAN},
    {"UnsupportedUserCodeTakesTheSystem", "3.3", "sv_SE", kNo, 0, wxLANGUAGE_DUTCH, wxLANGUAGE_DUTCH},
    {"EmptyUserFileTakesTheSystem", "3.3", "", kNo, 0, wxLANGUAGE_KOREAN_KOREA, wxLANGUAGE_KOREAN_KOREA},
    {"ArabicSystemGivesEnglish", "3.3", kNo, kNo, 0, wxLANGUAGE_ARABIC, wxLANGUAGE_ENGLISH_US},
    {"HebrewSystemGivesEnglish", "3.3", kNo, kNo, 0, wxLANGUAGE_HEBREW_ISRAEL, wxLANGUAGE_ENGLISH_US},
    {"UnknownSystemGivesEnglish", "3.3", kNo, kNo, 0, wxLANGUAGE_UNKNOWN, wxLANGUAGE_ENGLISH_US},
    {"LeftToRightSystemLanguage", "3.3", kNo, kNo, 0, wxLANGUAGE_GERMAN_GERMANY, wxLANGUAGE_GERMAN_GERMANY},
    {"ServerFileDoesNotCountFor33", "3.3", kNo, "serverlang=de", 0, wxLANGUAGE_UNKNOWN,
     wxLANGUAGE_ENGLISH_US},
    // Version 3.1: the server's file, then the system locale.
    {"ServerCodeIgnoresCaseAndBeatsTheLocale", "3.1", kNo, "serverlang=PT", kFrance, kNone,
     wxLANGUAGE_PORTUGUESE_BRAZILIAN},
    {"UnsupportedServerCodeLeavesItToLocale", "3.1", kNo, "serverlang=sv", kTaiwan, kNone,
     wxLANGUAGE_CHINESE_TAIWAN},
    {"EmptyServerFileLeavesItToLocale", "3.1", kNo, "", kFrance, kNone, wxLANGUAGE_FRENCH_FRANCE},
    {"NoServerFileAndCLocaleIsUnknown", "3.1", "de_DE", kNo, 0, wxLANGUAGE_GERMAN, wxLANGUAGE_UNKNOWN},
    {"LocaleWithoutARowIsUnknown", "3.1", kNo, kNo, kUnknown, wxLANGUAGE_GERMAN, wxLANGUAGE_UNKNOWN},
    // Other versions.
    {"Version30IsTheSystemDefault", "3.0", "de_DE", "serverlang=de", kFrance, wxLANGUAGE_GERMAN,
     wxLANGUAGE_DEFAULT},
    {"NoVersionIsTheSystemDefault", "", "de_DE", "serverlang=de", kFrance, wxLANGUAGE_GERMAN,
     wxLANGUAGE_DEFAULT},
    {"UnknownVersionStaysEnglish", "4.0", "de_DE", "serverlang=de", kFrance, wxLANGUAGE_GERMAN,
     wxLANGUAGE_UNKNOWN},
    {"VersionWithBlanksIsAnother", " 3.3", "de_DE", kNo, 0, wxLANGUAGE_GERMAN, wxLANGUAGE_UNKNOWN},
};

class LanguageChoiceTest : public ::testing::TestWithParam<ChoiceCase>
{
protected:
    wxInitializer init; // the language database lives in the library's initialised state
};

TEST_P(LanguageChoiceTest, ChoosesTheLanguage)
{
    const ChoiceCase& c = GetParam();
    FakeSources sources;
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

// Locale names as the environment gives them, to the Windows ids of the
// program's table, and the row those ids lead back to; every row and every
// supported language known to the library.
TEST(LanguageTableTest, MapsLocaleNamesToWindowsIdsAndBack)
{
    const struct
    {
        const char* locale;
        unsigned expectedId;
        const char* expectedRow;
    } cases[] = {
        {"de_DE.UTF-8", 0x0407, "German"},
        {"de_AT.UTF-8", 0x0C07, "German (Austrian)"},
        {"en_US.UTF-8", 0x0409, "English (U.S.)"},
        {"pt_BR", 0x0416, "Portuguese (Brazilian)"},
        {"es_ES.UTF-8", 0x040A, "Spanish"},
        {"zh_CN.GB18030", 0x0804, "Chinese (Simplified)"},
        {"zh_TW.UTF-8", 0x0404, "Chinese"}, // three rows carry 4/1; the first names the language
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
    for (const auto& c : cases)
    {
        const unsigned id = uilanguage::WindowsLanguageIdOfLocale(c.locale);
        EXPECT_EQ(id, c.expectedId) << c.locale;
        const uilanguage::WindowsLanguage* row =
            uilanguage::FindWindowsLanguage(uilanguage::PrimaryLanguageOf(id), uilanguage::SubLanguageOf(id));
        EXPECT_STREQ(row != nullptr ? row->description : nullptr, c.expectedRow) << c.locale;
    }
    wxInitializer init;
    for (auto row = uilanguage::WindowsLanguagesBegin(); row != uilanguage::WindowsLanguagesEnd(); ++row)
        EXPECT_NE(uilanguage::LanguageOfLocaleName(row->canonicalName), wxLANGUAGE_UNKNOWN)
            << row->description;
    for (auto language = uilanguage::SupportedLanguagesBegin();
         language != uilanguage::SupportedLanguagesEnd(); ++language)
        EXPECT_EQ(
            wxLocale::GetLanguageCanonicalName(uilanguage::LanguageOfLocaleName(language->canonicalName)),
            language->canonicalName);
}

} // namespace
