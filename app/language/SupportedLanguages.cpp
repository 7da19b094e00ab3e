#include "app/language/SupportedLanguages.h"

#include <iterator>

#include <wx/intl.h>

namespace uilanguage
{

namespace
{

constexpr SupportedLanguage kLanguages[] = {
    {"en_US", "en", "en_US"}, {"es_ES", "es", "es_ES"}, {"it_IT", "it", "it_IT"}, {"fr_FR", "fr", "fr_FR"},
    {"zh_CN", "zh", "zh_CN"}, {"de_DE", "de", "de_DE"}, {"ja_JP", "ja", "ja_JP"}, {"pt_BR", "pt", "pt_BR"},
    {"nl_NL", "nl", "nl_NL"}, {"cs_CZ", "cs", "cs_CZ"}, {"ru_RU", "ru", "ru_RU"}, {"pl_PL", "pl", "pl_PL"},
    {"tr_TR", "tr", "tr_TR"}, {"zh_TW", "tw", "zh_TW"}, {"ko_KR", "ko", "ko_KR"},
};

template <typename CodeOf> const SupportedLanguage* FindBy(const wxString& code, CodeOf codeOf)
{
    for (const SupportedLanguage& language : kLanguages)
    {
        if (code.CmpNoCase(codeOf(language)) == 0)
            return &language;
    }
    return nullptr;
}

} // namespace

const SupportedLanguage* SupportedLanguagesBegin()
{
    return std::begin(kLanguages);
}

const SupportedLanguage* SupportedLanguagesEnd()
{
    return std::end(kLanguages);
}

const SupportedLanguage* FindByUserCode(const wxString& code)
{
    return FindBy(code, [](const SupportedLanguage& language) { return language.userCode; });
}

const SupportedLanguage* FindByServerCode(const wxString& code)
{
    return FindBy(code, [](const SupportedLanguage& language) { return language.serverCode; });
}

int LanguageOfLocaleName(const wxString& canonicalName)
{
    const wxLanguageInfo* info = canonicalName.empty() ? nullptr : wxLocale::FindLanguageInfo(canonicalName);
    return info != nullptr ? info->Language : wxLANGUAGE_UNKNOWN;
}

} // namespace uilanguage
