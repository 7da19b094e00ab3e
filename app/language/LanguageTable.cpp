#include "app/language/LanguageTable.h"

#include <iterator>

namespace uilanguage
{

namespace
{

// Windows primary language ids used below.
enum Primary : unsigned
{
    Arabic = 0x01,
    Bulgarian = 0x02,
    Catalan = 0x03,
    Chinese = 0x04,
    Czech = 0x05,
    Danish = 0x06,
    German = 0x07,
    Greek = 0x08,
    English = 0x09,
    Spanish = 0x0A,
    Finnish = 0x0B,
    French = 0x0C,
    Hebrew = 0x0D,
    Hungarian = 0x0E,
    Icelandic = 0x0F,
    Italian = 0x10,
    Japanese = 0x11,
    Korean = 0x12,
    Dutch = 0x13,
    Norwegian = 0x14,
    Polish = 0x15,
    Portuguese = 0x16,
    Romanian = 0x18,
    Russian = 0x19,
    SerboCroatian = 0x1A, // Croatian, Serbian and Bosnian share it
    Slovak = 0x1B,
    Albanian = 0x1C,
    Swedish = 0x1D,
    Thai = 0x1E,
    Turkish = 0x1F,
    Urdu = 0x20,
    Indonesian = 0x21,
    Ukrainian = 0x22,
    Belarusian = 0x23,
    Slovenian = 0x24,
    Estonian = 0x25,
    Latvian = 0x26,
    Lithuanian = 0x27,
    Farsi = 0x29,
    Vietnamese = 0x2A,
    Armenian = 0x2B,
    Azeri = 0x2C,
    Basque = 0x2D,
    Macedonian = 0x2F,
    Afrikaans = 0x36,
    Georgian = 0x37,
    Faeroese = 0x38,
    Hindi = 0x39,
    Maltese = 0x3A,
    Irish = 0x3C,
    Malay = 0x3E,
    Kazakh = 0x3F,
    Swahili = 0x41,
    Uzbek = 0x43,
    Tatar = 0x44,
    Bengali = 0x45,
    Punjabi = 0x46,
    Gujarati = 0x47,
    Oriya = 0x48,
    Tamil = 0x49,
    Telugu = 0x4A,
    Kannada = 0x4B,
    Malayalam = 0x4C,
    Assamese = 0x4D,
    Marathi = 0x4E,
    Sanskrit = 0x4F,
    Mongolian = 0x50,
    Welsh = 0x52,
    Khmer = 0x53,
    Lao = 0x54,
    Galician = 0x56,
    Konkani = 0x57,
    Nepali = 0x61,
};

// In the order wxWidgets listed its languages when the product was written: where
// rows share ids, the first one wins.
constexpr WindowsLanguage kTable[] = {
    {"af_ZA", Afrikaans, 1, "Afrikaans"},
    {"sq_AL", Albanian, 1, "Albanian"},
    {"ar", Arabic, 1, "Arabic"},
    {"ar_DZ", Arabic, 5, "Arabic (Algeria)"},
    {"ar_BH", Arabic, 15, "Arabic (Bahrain)"},
    {"ar_EG", Arabic, 3, "Arabic (Egypt)"},
    {"ar_IQ", Arabic, 2, "Arabic (Iraq)"},
    {"ar_JO", Arabic, 11, "Arabic (Jordan)"},
    {"ar_KW", Arabic, 13, "Arabic (Kuwait)"},
    {"ar_LB", Arabic, 12, "Arabic (Lebanon)"},
    {"ar_LY", Arabic, 4, "Arabic (Libya)"},
    {"ar_MA", Arabic, 6, "Arabic (Morocco)"},
    {"ar_OM", Arabic, 8, "Arabic (Oman)"},
    {"ar_QA", Arabic, 16, "Arabic (Qatar)"},
    {"ar_SA", Arabic, 1, "Arabic (Saudi Arabia)"},
    {"ar_SY", Arabic, 10, "Arabic (Syria)"},
    {"ar_TN", Arabic, 7, "Arabic (Tunisia)"},
    {"ar_AE", Arabic, 14, "Arabic (Uae)"},
    {"ar_YE", Arabic, 9, "Arabic (Yemen)"},
    {"hy", Armenian, 1, "Armenian"},
    {"as", Assamese, 1, "Assamese"},
    {"az", Azeri, 1, "Azeri"},
    {"eu_ES", Basque, 1, "Basque"},
    {"be_BY", Belarusian, 1, "Belarusian"},
    {"bn", Bengali, 1, "Bengali"},
    {"bs", SerboCroatian, 5, "Bosnian"},
    {"bg_BG", Bulgarian, 1, "Bulgarian"},
    {"ca_ES", Catalan, 1, "Catalan"},
    {"zh_TW", Chinese, 1, "Chinese"},
    {"zh_CN", Chinese, 2, "Chinese (Simplified)"},
    {"zh_TW", Chinese, 1, "Chinese (Traditional)"},
    {"zh_HK", Chinese, 3, "Chinese (Hongkong)"},
    {"zh_MO", Chinese, 5, "Chinese (Macau)"},
    {"zh_SG", Chinese, 4, "Chinese (Singapore)"},
    {"zh_TW", Chinese, 1, "Chinese (Taiwan)"},
    {"hr_HR", SerboCroatian, 1, "Croatian"},
    {"cs_CZ", Czech, 1, "Czech"},
    {"da_DK", Danish, 1, "Danish"},
    {"nl_NL", Dutch, 1, "Dutch"},
    {"nl_BE", Dutch, 2, "Dutch (Belgian)"},
    {"en_GB", English, 2, "English"},
    {"en_GB", English, 2, "English (U.K.)"},
    {"en_US", English, 1, "English (U.S.)"},
    {"en_AU", English, 3, "English (Australia)"},
    {"en_BZ", English, 10, "English (Belize)"},
    {"en_CA", English, 4, "English (Canada)"},
    {"en_CB", English, 9, "English (Caribbean)"},
    {"en_IN", English, 16, "English (India)"},
    {"en_IE", English, 6, "English (Eire)"},
    {"en_JM", English, 8, "English (Jamaica)"},
    {"en_MY", English, 17, "English (Malaysia)"},
    {"en_NZ", English, 5, "English (New Zealand)"},
    {"en_PH", English, 13, "English (Philippines)"},
    {"en_SG", English, 18, "English (Singapore)"},
    {"en_ZA", English, 7, "English (South Africa)"},
    {"en_TT", English, 11, "English (Trinidad & Tobago)"},
    {"en_ZW", English, 12, "English (Zimbabwe)"},
    {"et_EE", Estonian, 1, "Estonian"},
    {"fo_FO", Faeroese, 1, "Faeroese"},
    {"fa_IR", Farsi, 1, "Farsi"},
    {"fi_FI", Finnish, 1, "Finnish"},
    {"fr_FR", French, 1, "French"},
    {"fr_BE", French, 2, "French (Belgian)"},
    {"fr_CA", French, 3, "French (Canadian)"},
    {"fr_LU", French, 5, "French (Luxembourg)"},
    {"fr_MC", French, 6, "French (Monaco)"},
    {"fr_CH", French, 4, "French (Swiss)"},
    {"gl_ES", Galician, 1, "Galician"},
    {"ka_GE", Georgian, 1, "Georgian"},
    {"de_DE", German, 1, "German"},
    {"de_AT", German, 3, "German (Austrian)"},
    {"de_LI", German, 5, "German (Liechtenstein)"},
    {"de_LU", German, 4, "German (Luxembourg)"},
    {"de_CH", German, 2, "German (Swiss)"},
    {"el_GR", Greek, 1, "Greek"},
    {"gu", Gujarati, 1, "Gujarati"},
    {"he_IL", Hebrew, 1, "Hebrew"},
    {"hi_IN", Hindi, 1, "Hindi"},
    {"hu_HU", Hungarian, 1, "Hungarian"},
    {"is_IS", Icelandic, 1, "Icelandic"},
    {"id_ID", Indonesian, 1, "Indonesian"},
    {"ga_IE", Irish, 2, "Irish"},
    {"it_IT", Italian, 1, "Italian"},
    {"it_CH", Italian, 2, "Italian (Swiss)"},
    {"ja_JP", Japanese, 1, "Japanese"},
    {"kn", Kannada, 1, "Kannada"},
    {"kk", Kazakh, 1, "Kazakh"},
    {"km_KH", Khmer, 1, "Khmer"},
    {"kok", Konkani, 1, "Konkani"},
    {"ko_KR", Korean, 1, "Korean"},
    {"lo_LA", Lao, 1, "Laothian"},
    {"lv_LV", Latvian, 1, "Latvian"},
    {"lt_LT", Lithuanian, 1, "Lithuanian"},
    {"mk_MK", Macedonian, 1, "Macedonian"},
    {"ms_MY", Malay, 1, "Malay"},
    {"ms_BN", Malay, 2, "Malay (Brunei Darussalam)"},
    {"ms_MY", Malay, 1, "Malay (Malaysia)"},
    {"ml", Malayalam, 1, "Malayalam"},
    {"mt_MT", Maltese, 1, "Maltese"},
    {"mr_IN", Marathi, 1, "Marathi"},
    {"mn", Mongolian, 1, "Mongolian"},
    {"ne_NP", Nepali, 1, "Nepali"},
    {"nb_NO", Norwegian, 1, "Norwegian (Bokmal)"},
    {"nn_NO", Norwegian, 2, "Norwegian (Nynorsk)"},
    {"or", Oriya, 1, "Oriya"},
    {"pl_PL", Polish, 1, "Polish"},
    {"pt_PT", Portuguese, 2, "Portuguese"},
    {"pt_BR", Portuguese, 1, "Portuguese (Brazilian)"},
    {"pa", Punjabi, 1, "Punjabi"},
    {"ro_RO", Romanian, 1, "Romanian"},
    {"ru_RU", Russian, 1, "Russian"},
    {"sa", Sanskrit, 1, "Sanskrit"},
    {"sr_RS", SerboCroatian, 3, "Serbian (Cyrillic)"},
    {"sr_RS@latin", SerboCroatian, 2, "Serbian (Latin)"},
    {"sk_SK", Slovak, 1, "Slovak"},
    {"sl_SI", Slovenian, 1, "Slovenian"},
    {"es_ES", Spanish, 1, "Spanish"},
    {"es_AR", Spanish, 11, "Spanish (Argentina)"},
    {"es_BO", Spanish, 16, "Spanish (Bolivia)"},
    {"es_CL", Spanish, 13, "Spanish (Chile)"},
    {"es_CO", Spanish, 9, "Spanish (Colombia)"},
    {"es_CR", Spanish, 5, "Spanish (Costa Rica)"},
    {"es_DO", Spanish, 7, "Spanish (Dominican republic)"},
    {"es_EC", Spanish, 12, "Spanish (Ecuador)"},
    {"es_SV", Spanish, 17, "Spanish (El Salvador)"},
    {"es_GT", Spanish, 4, "Spanish (Guatemala)"},
    {"es_HN", Spanish, 18, "Spanish (Honduras)"},
    {"es_MX", Spanish, 2, "Spanish (Mexican)"},
    {"es_ES", Spanish, 3, "Spanish (Modern)"},
    {"es_NI", Spanish, 19, "Spanish (Nicaragua)"},
    {"es_PA", Spanish, 6, "Spanish (Panama)"},
    {"es_PY", Spanish, 15, "Spanish (Paraguay)"},
    {"es_PE", Spanish, 10, "Spanish (Peru)"},
    {"es_PR", Spanish, 20, "Spanish (Puerto Rico)"},
    {"es_UY", Spanish, 14, "Spanish (Uruguay)"},
    {"es_US", Spanish, 21, "Spanish (U.S.)"},
    {"es_VE", Spanish, 8, "Spanish (Venezuela)"},
    {"sw_KE", Swahili, 1, "Swahili"},
    {"sv_SE", Swedish, 1, "Swedish"},
    {"sv_FI", Swedish, 2, "Swedish (Finland)"},
    {"ta", Tamil, 1, "Tamil"},
    {"tt", Tatar, 1, "Tatar"},
    {"te", Telugu, 1, "Telugu"},
    {"th_TH", Thai, 1, "Thai"},
    {"tr_TR", Turkish, 1, "Turkish"},
    {"uk_UA", Ukrainian, 1, "Ukrainian"},
    {"ur", Urdu, 1, "Urdu"},
    {"ur_IN", Urdu, 2, "Urdu (India)"},
    {"ur_PK", Urdu, 1, "Urdu (Pakistan)"},
    {"uz", Uzbek, 1, "Uzbek"},
    {"vi_VN", Vietnamese, 1, "Vietnamese"},
    {"cy", Welsh, 1, "Welsh"},
};

unsigned LanguageIdOf(const WindowsLanguage& row)
{
    return row.primary | row.sub << 10;
}

const WindowsLanguage* FindByName(const wxString& name)
{
    for (const WindowsLanguage& row : kTable)
    {
        if (name.CmpNoCase(row.canonicalName) == 0)
            return &row;
    }
    return nullptr;
}

const WindowsLanguage* FindByLanguagePart(const wxString& language)
{
    for (const WindowsLanguage& row : kTable)
    {
        if (language.CmpNoCase(wxString(row.canonicalName).BeforeFirst('_').BeforeFirst('@')) == 0)
            return &row;
    }
    return nullptr;
}

} // namespace

const WindowsLanguage* WindowsLanguagesBegin()
{
    return std::begin(kTable);
}

const WindowsLanguage* WindowsLanguagesEnd()
{
    return std::end(kTable);
}

const WindowsLanguage* FindWindowsLanguage(unsigned primary, unsigned sub)
{
    for (const WindowsLanguage& row : kTable)
    {
        if (row.primary == primary && row.sub == sub)
            return &row;
    }
    return nullptr;
}

unsigned WindowsLanguageIdOfLocale(const wxString& localeName)
{
    // language[_territory][.codeset][@modifier]
    const wxString modifier =
        localeName.Find('@') == wxNOT_FOUND ? wxString() : "@" + localeName.AfterFirst('@');
    const wxString name = localeName.BeforeFirst('@').BeforeFirst('.');
    if (name.empty() || name == "C" || name == "POSIX")
        return 0;
    const WindowsLanguage* row = modifier.empty() ? nullptr : FindByName(name + modifier);
    if (row == nullptr)
        row = FindByName(name);
    if (row == nullptr && name.Find('_') == wxNOT_FOUND)
        row = FindByLanguagePart(name);
    return row != nullptr ? LanguageIdOf(*row) : 0;
}

} // namespace uilanguage
