// The shipped catalogs as the program loads them: through wxLocale, from the
// LocalizedStrings folder the build writes beside the program.
#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include <wx/init.h>
#include <wx/intl.h>
#include <wx/translation.h>

#include "TempFolder.h"
#include "app/language/SupportedLanguages.h"

namespace
{

// gettext's msgcmp: every key of the reference has a translation in the other
// file, neither fuzzy nor empty unless the options let it be.
int Compare(const std::string& file, const std::string& reference, const std::string& options = "")
{
    return std::system(("msgcmp " + options + " '" + file + "' '" + reference + "'").c_str());
}

// Each language finds its own catalog, not a neighbour's (zh_TW is not zh_CN),
// and translates the footer with each of its keys once.
TEST(CatalogTest, EveryLanguageLoadsItsOwnCompleteCatalogThroughTheLocale)
{
    wxInitializer init;
    wxFileTranslationsLoader::AddCatalogLookupPathPrefix(WYX_CATALOG_DIR);
    for (auto language = uilanguage::SupportedLanguagesBegin();
         language != uilanguage::SupportedLanguagesEnd(); ++language)
    {
        const std::string name = language->canonicalName;
        SCOPED_TRACE(name);
        EXPECT_EQ(Compare(std::string(WYX_LOCALE_SOURCES) + "/" + name + ".po", WYX_TEMPLATE), 0);
        wxLocale locale;
        ASSERT_TRUE(locale.Init(uilanguage::LanguageOfLocaleName(name), wxLOCALE_DONT_LOAD_DEFAULT))
            << "the system lacks the locale (Debian: locales-all)";
        ASSERT_TRUE(locale.AddCatalog("wyx3"));
        const std::string completeLog = wxGetTranslation("Complete Log").utf8_string();
        EXPECT_EQ(completeLog == "Complete Log", name == "en_US") << completeLog;
        // Two neighbours that share a language; the rest need only not be English.
        if (name == "zh_CN" || name == "zh_TW")
            EXPECT_EQ(completeLog, name == "zh_CN" ? "完整日志" : "完整記錄");
        const wxString footer = wxGetTranslation("[WYX3Value1] of [WYX3Value2] items selected.");
        EXPECT_EQ(wxString(footer).Replace("[WYX3Value1]", ""), 1u) << footer;
        EXPECT_EQ(wxString(footer).Replace("[WYX3Value2]", ""), 1u) << footer;
    }
}

TEST(CatalogTest, TheTemplateHoldsExactlyTheTextsTheSourcesTranslate)
{
    TempFolder folder;
    const std::string extracted = (folder.Path() / "extracted.pot").string();
    ASSERT_EQ(std::system((std::string("'") + WYX_EXTRACT_TEMPLATE + "' '" + extracted + "'").c_str()), 0);
    EXPECT_TRUE(Compare(extracted, WYX_TEMPLATE, "--use-untranslated") == 0 &&
                Compare(WYX_TEMPLATE, extracted, "--use-untranslated") == 0)
        << "update it: cmake --build <build folder> --target wyx_update_template";
}

} // namespace
