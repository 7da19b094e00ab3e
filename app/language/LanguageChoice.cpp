#include "app/language/LanguageChoice.h"

#include <wx/intl.h>

#include "app/language/LanguageFile.h"
#include "app/language/LanguageSources.h"
#include "app/language/LanguageTable.h"
#include "app/language/SupportedLanguages.h"

using uilanguage::LanguageOfLocaleName;

int ChooseUiLanguageFor(const wxString& version, const uilanguage::LanguageSources& sources)
{
    if (version.CmpNoCase("3.3") == 0)
        return LanguageFromUserFile(sources);
    if (version == "3.1")
    {
        int language = wxLANGUAGE_UNKNOWN;
        if (LanguageFromServerFile(sources, language))
            return language;
        return LanguageFromSystemLocale(sources);
    }
    if (version == "3.0" || version.empty())
        return wxLANGUAGE_DEFAULT;
    return wxLANGUAGE_UNKNOWN;
}

int LanguageFromUserFile(const uilanguage::LanguageSources& sources)
{
    wxString text;
    if (sources.ReadUserFile(text))
    {
        if (const uilanguage::SupportedLanguage* chosen =
                uilanguage::FindByUserCode(uilanguage::UserFileCode(text)))
        {
            const int language = LanguageOfLocaleName(chosen->canonicalName);
            if (language != wxLANGUAGE_UNKNOWN)
                return language;
        }
    }

    const int english = LanguageOfLocaleName("en_US");
    int system = sources.SystemLanguage();
    if (system == wxLANGUAGE_UNKNOWN)
        system = english;
    const wxLanguageInfo* info = wxLocale::GetLanguageInfo(system);
    if (info == nullptr || info->LayoutDirection == wxLayout_RightToLeft)
        return english;
    return info->Language;
}

bool LanguageFromServerFile(const uilanguage::LanguageSources& sources, int& language)
{
    language = wxLANGUAGE_UNKNOWN;
    wxString text;
    wxString code;
    if (!sources.ReadServerFile(text) || !uilanguage::ServerFileCode(text, code))
        return false;
    const uilanguage::SupportedLanguage* chosen = uilanguage::FindByServerCode(code);
    if (chosen == nullptr)
        return false;
    language = LanguageOfLocaleName(chosen->canonicalName);
    return true;
}

int LanguageFromSystemLocale(const uilanguage::LanguageSources& sources)
{
    const unsigned languageId = sources.SystemLanguageId();
    if (languageId == 0)
        return wxLANGUAGE_UNKNOWN;
    const uilanguage::WindowsLanguage* row = uilanguage::FindWindowsLanguage(
        uilanguage::PrimaryLanguageOf(languageId), uilanguage::SubLanguageOf(languageId));
    return row != nullptr ? LanguageOfLocaleName(row->canonicalName) : wxLANGUAGE_UNKNOWN;
}
