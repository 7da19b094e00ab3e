#include "platform/os/LocaleInfo.h"

#include <cstdlib>
#include <cstring>
#include <memory>

#include <langinfo.h>
#include <locale.h>

#include <wx/strconv.h>

namespace wyxos
{

namespace
{

constexpr const wchar_t* kDateLetters = L"Mdy";
constexpr const wchar_t* kTimeLetters = L"Hhmst";

struct Conversion
{
    wchar_t letter;
    PatternKind kind;
    const wchar_t* letters;
};

// Exact equivalents, plus the space-padded day and hours, whose nearest reading
// is the unpadded one.
constexpr Conversion kConversions[] = {
    {L'd', PatternKind::Date, L"dd"},   {L'e', PatternKind::Date, L"d"},    {L'm', PatternKind::Date, L"MM"},
    {L'y', PatternKind::Date, L"yy"},   {L'Y', PatternKind::Date, L"yyyy"}, {L'b', PatternKind::Date, L"MMM"},
    {L'h', PatternKind::Date, L"MMM"},  {L'B', PatternKind::Date, L"MMMM"}, {L'a', PatternKind::Date, L"ddd"},
    {L'A', PatternKind::Date, L"dddd"}, {L'H', PatternKind::Time, L"HH"},   {L'k', PatternKind::Time, L"H"},
    {L'I', PatternKind::Time, L"hh"},   {L'l', PatternKind::Time, L"h"},    {L'M', PatternKind::Time, L"mm"},
    {L'S', PatternKind::Time, L"ss"},   {L'p', PatternKind::Time, L"tt"},
};

// glibc's "%-d" and its kin: the same field without padding.
constexpr Conversion kUnpadded[] = {
    {L'd', PatternKind::Date, L"d"}, {L'm', PatternKind::Date, L"M"}, {L'H', PatternKind::Time, L"H"},
    {L'I', PatternKind::Time, L"h"}, {L'M', PatternKind::Time, L"m"}, {L'S', PatternKind::Time, L"s"},
};

const Conversion* FindConversion(const Conversion* begin, const Conversion* end, wchar_t letter)
{
    for (const Conversion* c = begin; c != end; ++c)
        if (c->letter == letter)
            return c;
    return nullptr;
}

// Replaces the composite conversions by what they stand for, so that only
// single fields remain. A composite inside %r's expansion is not expanded again.
bool ExpandComposites(const wxString& format, const wxString& amPmFormat, bool allowAmPm, wxString& expanded)
{
    for (size_t i = 0; i < format.length(); ++i)
    {
        const wchar_t c = format[i];
        if (c != L'%' || i + 1 >= format.length())
        {
            expanded += c;
            continue;
        }
        const wchar_t letter = format[++i];
        switch (letter)
        {
        case L'D':
            expanded += L"%m/%d/%y";
            break;
        case L'T':
            expanded += L"%H:%M:%S";
            break;
        case L'R':
            expanded += L"%H:%M";
            break;
        case L'F':
            expanded += L"%Y-%m-%d";
            break;
        case L'r':
            if (!allowAmPm || amPmFormat.empty())
                return false;
            if (!ExpandComposites(amPmFormat, amPmFormat, false, expanded))
                return false;
            break;
        default:
            expanded += L'%';
            expanded += letter;
            break;
        }
    }
    return true;
}

// Appends a piece to the pattern unless it would run into the letter before it
// and so be read as one longer run.
bool AppendPiece(wxString& pattern, const wchar_t* piece)
{
    if (!pattern.empty() && pattern.Last() == piece[0])
        return false;
    pattern += piece;
    return true;
}

bool IsPatternLetter(wchar_t c, PatternKind kind)
{
    const wchar_t* letters = kind == PatternKind::Date ? kDateLetters : kTimeLetters;
    return c != 0 && std::wcschr(letters, c) != nullptr;
}

wxString Decode(const char* text, const char* codeset)
{
    if (text == nullptr)
        return wxString();
    if (std::strcmp(codeset, "UTF-8") == 0 || std::strcmp(codeset, "ANSI_X3.4-1968") == 0)
        return wxString::FromUTF8(text);
    wxCSConv conv(codeset);
    if (!conv.IsOk())
        return wxString();
    return wxString(text, conv);
}

struct LocaleDeleter
{
    void operator()(locale_t locale) const { freelocale(locale); }
};
using LocaleHandle = std::unique_ptr<std::remove_pointer_t<locale_t>, LocaleDeleter>;

} // namespace

bool ConvertStrftimePattern(const wxString& format, PatternKind kind, const wxString& amPmFormat,
                            wxString& pattern)
{
    wxString expanded;
    if (!ExpandComposites(format, amPmFormat, true, expanded))
        return false;

    wxString result;
    for (size_t i = 0; i < expanded.length(); ++i)
    {
        const wchar_t c = expanded[i];
        if (c != L'%')
        {
            // A literal letter would be taken for a field, and a literal next
            // to a field letter would not be, but it never is here.
            if (IsPatternLetter(c, kind))
                return false;
            result += c;
            continue;
        }
        if (i + 1 >= expanded.length())
            return false;
        wchar_t letter = expanded[++i];
        const Conversion* conversion = nullptr;
        if (letter == L'%' || letter == L'n' || letter == L't')
        {
            result += letter == L'%' ? L'%' : letter == L'n' ? L'\n' : L'\t';
            continue;
        }
        if (letter == L'-')
        {
            if (i + 1 >= expanded.length())
                return false;
            letter = expanded[++i];
            conversion = FindConversion(std::begin(kUnpadded), std::end(kUnpadded), letter);
        }
        else
        {
            conversion = FindConversion(std::begin(kConversions), std::end(kConversions), letter);
        }
        if (conversion == nullptr || conversion->kind != kind)
            return false;
        if (!AppendPiece(result, conversion->letters))
            return false;
    }
    pattern = result;
    return true;
}

wxString UserTimeLocaleName()
{
    for (const char* variable : {"LC_ALL", "LC_TIME", "LANG"})
    {
        const char* value = std::getenv(variable);
        if (value != nullptr && *value != '\0')
            return wxString::FromUTF8(value);
    }
    return "C";
}

bool ReadLocaleTimeInfo(const wxString& localeName, LocaleTimeInfo& info)
{
    // LC_CTYPE comes from the same locale: it says how LC_TIME's texts are encoded.
    LocaleHandle locale(newlocale(LC_TIME_MASK | LC_CTYPE_MASK, localeName.utf8_str(), nullptr));
    if (!locale)
        return false;

    const char* codeset = nl_langinfo_l(CODESET, locale.get());
    auto text = [&](nl_item item) { return Decode(nl_langinfo_l(item, locale.get()), codeset); };

    LocaleTimeInfo read;
    const wxString amPmFormat = text(T_FMT_AMPM);
    const wxString dateFormat = text(D_FMT);
    const wxString timeFormat = text(T_FMT);
    read.hasDatePattern = !dateFormat.empty() &&
                          ConvertStrftimePattern(dateFormat, PatternKind::Date, amPmFormat, read.datePattern);
    read.hasTimePattern = !timeFormat.empty() &&
                          ConvertStrftimePattern(timeFormat, PatternKind::Time, amPmFormat, read.timePattern);

    static constexpr nl_item kMonths[] = {MON_1, MON_2, MON_3, MON_4,  MON_5,  MON_6,
                                          MON_7, MON_8, MON_9, MON_10, MON_11, MON_12};
    static constexpr nl_item kAbbreviatedMonths[] = {ABMON_1, ABMON_2, ABMON_3, ABMON_4,  ABMON_5,  ABMON_6,
                                                     ABMON_7, ABMON_8, ABMON_9, ABMON_10, ABMON_11, ABMON_12};
    static constexpr nl_item kDays[] = {DAY_1, DAY_2, DAY_3, DAY_4, DAY_5, DAY_6, DAY_7};
    static constexpr nl_item kAbbreviatedDays[] = {ABDAY_1, ABDAY_2, ABDAY_3, ABDAY_4,
                                                   ABDAY_5, ABDAY_6, ABDAY_7};
    for (size_t i = 0; i < 12; ++i)
    {
        read.names.months[i] = text(kMonths[i]);
        read.names.abbreviatedMonths[i] = text(kAbbreviatedMonths[i]);
    }
    for (size_t i = 0; i < 7; ++i)
    {
        read.names.days[i] = text(kDays[i]);
        read.names.abbreviatedDays[i] = text(kAbbreviatedDays[i]);
    }
    read.names.am = text(AM_STR);
    read.names.pm = text(PM_STR);

    info = read;
    return true;
}

LocaleTimeInfo ReadUserLocaleTimeInfo()
{
    LocaleTimeInfo info;
    if (!ReadLocaleTimeInfo(UserTimeLocaleName(), info))
        ReadLocaleTimeInfo("C", info);
    return info;
}

} // namespace wyxos
