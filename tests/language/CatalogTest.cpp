// The shipped catalogs as the program loads them: through wxLocale, from the
// LocalizedStrings folder the build writes beside the program.
#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <map>
#include <set>
#include <string>

#include <wx/init.h>
#include <wx/intl.h>
#include <wx/translation.h>

#include "TempFolder.h"
#include "app/language/ServiceTexts.h"
#include "app/language/SupportedLanguages.h"

namespace uilanguage
{
// Test names and messages name the language.
void PrintTo(const SupportedLanguage& language, std::ostream* out)
{
    *out << language.canonicalName;
}
} // namespace uilanguage

namespace
{

// The English keys (msgids) of a gettext template or catalog, without the
// header's empty key and without obsolete entries.
std::set<std::string> ReadMsgids(const std::string& path)
{
    std::set<std::string> ids;
    std::ifstream file(path);
    std::string current;
    bool inMsgid = false;
    for (std::string line; std::getline(file, line);)
    {
        const bool starts = line.rfind("msgid \"", 0) == 0;
        if (starts || !inMsgid || line.rfind('"', 0) != 0)
        {
            if (inMsgid && !current.empty())
                ids.insert(current);
            inMsgid = starts;
            current.clear();
        }
        // Unquote what follows the keyword, if this line carries a piece of the key.
        for (std::size_t i = starts ? 7 : 1; inMsgid && i + 1 < line.size(); ++i)
            current += line[i] != '\\' || i + 2 >= line.size() ? line[i]
                       : line[++i] == 'n'                      ? '\n'
                       : line[i] == 't'                        ? '\t'
                                                               : line[i];
    }
    if (inMsgid && !current.empty())
        ids.insert(current);
    return ids;
}

// One text per language, as an operator reads it: proves that each language
// finds its own catalog, not a neighbour's (zh_TW is not zh_CN).
const std::map<std::string, std::string> kCompleteLog = {
    {"en_US", "Complete Log"},    {"es_ES", "Registro completo"}, {"it_IT", "Registro completo"},
    {"fr_FR", "Journal complet"}, {"zh_CN", "完整日志"},          {"de_DE", "Vollständiges Protokoll"},
    {"ja_JP", "完全なログ"},      {"pt_BR", "Log completo"},      {"nl_NL", "Volledig logboek"},
    {"cs_CZ", "Úplný protokol"},  {"ru_RU", "Полный журнал"},     {"pl_PL", "Pełny dziennik"},
    {"tr_TR", "Tam Günlük"},      {"zh_TW", "完整記錄"},          {"ko_KR", "전체 로그"},
};

// Debian's wx3.2-i18n has no Korean or Brazilian catalog, and English needs none.
const std::set<std::string> kWithoutWxCatalog = {"en_US", "ko_KR", "pt_BR"};

const char* const kFooter = "[WYX3Value1] of [WYX3Value2] items selected.";

class CatalogTest : public ::testing::TestWithParam<uilanguage::SupportedLanguage>
{
protected:
    static void SetUpTestSuite() { wxFileTranslationsLoader::AddCatalogLookupPathPrefix(WYX_CATALOG_DIR); }

    wxInitializer init;
};

TEST_P(CatalogTest, LoadsThroughTheLocaleAndTranslatesEveryText)
{
    const std::string name = GetParam().canonicalName;
    const int language = uilanguage::LanguageOfLocaleName(name);
    wxLocale locale;
    ASSERT_TRUE(locale.Init(language, wxLOCALE_DONT_LOAD_DEFAULT))
        << "the system lacks the " << name << " locale (Debian: locales-all)";
    ASSERT_TRUE(locale.AddCatalog("wyx3"));
    ASSERT_EQ(kCompleteLog.count(name), 1u) << "no known text for " << name;
    EXPECT_EQ(wxGetTranslation("Complete Log").utf8_string(), kCompleteLog.at(name));

    // A fuzzy or empty translation is left out of the compiled catalog.
    for (const std::string& id : ReadMsgids(WYX_TEMPLATE))
        EXPECT_NE(wxTranslations::Get()->GetTranslatedString(wxString::FromUTF8(id), "wyx3"), nullptr)
            << name << " does not translate \"" << id << "\"";
    for (const char* status : uilanguage::kServiceStatuses)
        EXPECT_NE(wxTranslations::Get()->GetTranslatedString(status, "wyx3"), nullptr)
            << name << ": " << status;

    // Each key once: Replace counts what it replaced.
    const wxString footer = wxGetTranslation(kFooter);
    EXPECT_EQ(wxString(footer).Replace("[WYX3Value1]", ""), 1u) << footer;
    EXPECT_EQ(wxString(footer).Replace("[WYX3Value2]", ""), 1u) << footer;

    if (kWithoutWxCatalog.count(name) == 0)
    {
        EXPECT_TRUE(locale.AddCatalog("wx")) << "no wx.mo for " << name << " (Debian: wx3.2-i18n)";
    }
}

INSTANTIATE_TEST_SUITE_P(Shipped, CatalogTest,
                         ::testing::ValuesIn(uilanguage::SupportedLanguagesBegin(),
                                             uilanguage::SupportedLanguagesEnd()),
                         [](const ::testing::TestParamInfo<uilanguage::SupportedLanguage>& info)
                         { return std::string(info.param.canonicalName); });

TEST(TemplateTest, HoldsExactlyTheTextsTheSourcesTranslate)
{
    TempFolder folder;
    const std::string extracted = (folder.Path() / "extracted.pot").string();
    ASSERT_EQ(std::system((std::string("'") + WYX_EXTRACT_TEMPLATE + "' '" + extracted + "'").c_str()), 0);
    const std::set<std::string> inSources = ReadMsgids(extracted);
    const std::set<std::string> inTemplate = ReadMsgids(WYX_TEMPLATE);
    ASSERT_FALSE(inSources.empty());
    for (const std::string& id : inSources)
        EXPECT_EQ(inTemplate.count(id), 1u) << "\"" << id << "\" is missing from the template";
    for (const std::string& id : inTemplate)
        EXPECT_EQ(inSources.count(id), 1u) << "\"" << id << "\" is no longer in the sources";
    if (::testing::Test::HasFailure())
        ADD_FAILURE() << "update it: cmake --build <build folder> --target wyx_update_template";
}

TEST(TemplateTest, EveryCatalogHoldsTheTemplatesTexts)
{
    const std::set<std::string> inTemplate = ReadMsgids(WYX_TEMPLATE);
    for (auto language = uilanguage::SupportedLanguagesBegin();
         language != uilanguage::SupportedLanguagesEnd(); ++language)
    {
        const std::string po = std::string(WYX_LOCALE_SOURCES) + "/" + language->canonicalName + ".po";
        EXPECT_EQ(ReadMsgids(po), inTemplate) << po;
    }
}

} // namespace
