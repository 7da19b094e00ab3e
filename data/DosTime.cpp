#include "data/DosTime.h"

#include <cstdint>
#include <string>

namespace
{

// The walkers build into a std::wstring: appending to it is a store, where a
// wxString append goes through the library's character handling each time,
// and a status journal formats one time per line.
void AppendNumber(std::wstring& out, unsigned value, bool twoDigits)
{
    if (value < 100 && (twoDigits || value >= 10))
    {
        const wchar_t pair[2] = {static_cast<wchar_t>(L'0' + value / 10),
                                 static_cast<wchar_t>(L'0' + value % 10)};
        out.append(pair, 2);
        return;
    }
    wchar_t digits[12];
    int count = 0;
    do
    {
        digits[count++] = static_cast<wchar_t>(L'0' + value % 10);
        value /= 10;
    } while (value != 0);
    if (twoDigits && count < 2)
        digits[count++] = L'0';
    while (count > 0)
        out += digits[--count];
}

// Appends the number for a run of length 1 (bare) or 2 (two digits); longer
// runs produce nothing.
void AppendShortRun(std::wstring& out, size_t run, unsigned value)
{
    if (run <= 2)
        AppendNumber(out, value, run == 2);
}

unsigned DaysInMonth(unsigned year, unsigned month)
{
    static constexpr unsigned kDays[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
    if (month == 2 && year % 4 == 0 && (year % 100 != 0 || year % 400 == 0))
        return 29;
    return kDays[month - 1];
}

// Day of the week of a Gregorian date, 0 for Sunday.
unsigned WeekDayOf(unsigned year, unsigned month, unsigned day)
{
    static constexpr unsigned kOffsets[] = {0, 3, 2, 5, 0, 3, 5, 1, 4, 6, 2, 4};
    if (month < 3)
        year -= 1;
    return (year + year / 4 - year / 100 + year / 400 + kOffsets[month - 1] + day) % 7;
}

size_t RunLength(const std::wstring& pattern, size_t start)
{
    size_t end = start + 1;
    while (end < pattern.length() && pattern[end] == pattern[start])
        ++end;
    return end - start;
}

void AppendText(std::wstring& out, const wxString& text)
{
    out.append(text.wc_str(), text.length());
}

bool FieldsFromMoment(const wxDateTime& moment, CalendarFields& fields)
{
    if (!moment.IsValid())
        return false;
    wxDateTime::Tm tm = moment.GetTm(wxDateTime::Local);
    fields.year = static_cast<unsigned>(tm.year);
    fields.month = static_cast<unsigned>(tm.mon) + 1;
    fields.day = tm.mday;
    fields.weekDay = static_cast<unsigned>(tm.GetWeekDay());
    fields.hour = tm.hour;
    fields.minute = tm.min;
    fields.second = tm.sec;
    return true;
}

wxDateTime MomentFromFields(const CalendarFields& fields)
{
    return wxDateTime(static_cast<wxDateTime::wxDateTime_t>(fields.day),
                      static_cast<wxDateTime::Month>(fields.month - 1), static_cast<int>(fields.year),
                      static_cast<wxDateTime::wxDateTime_t>(fields.hour),
                      static_cast<wxDateTime::wxDateTime_t>(fields.minute),
                      static_cast<wxDateTime::wxDateTime_t>(fields.second));
}

} // namespace

bool DecodeDosTime(const wxString& dosTimeText, CalendarFields& fields)
{
    return DecodeDosTime(dosTimeText.wc_str(), dosTimeText.length(), fields);
}

bool DecodeDosTime(const wchar_t* dosTimeText, size_t length, CalendarFields& fields)
{
    std::uint64_t value = 0;
    const wchar_t* digit = dosTimeText;
    for (const wchar_t* const end = digit + length; digit != end; ++digit)
    {
        if (*digit < L'0' || *digit > L'9')
            break;
        value = value * 10 + static_cast<unsigned>(*digit - L'0');
        if (value > UINT32_MAX)
        {
            value = UINT32_MAX;
            break;
        }
    }
    const auto dos = static_cast<std::uint32_t>(value);
    CalendarFields decoded;
    decoded.year = (dos >> 25) + 1980;
    decoded.month = (dos >> 21) & 0x0F;
    decoded.day = (dos >> 16) & 0x1F;
    decoded.hour = (dos >> 11) & 0x1F;
    decoded.minute = (dos >> 5) & 0x3F;
    decoded.second = (dos & 0x1F) * 2;
    if (decoded.month < 1 || decoded.month > 12 || decoded.day < 1 ||
        decoded.day > DaysInMonth(decoded.year, decoded.month) || decoded.hour > 23 || decoded.minute > 59 ||
        decoded.second > 59)
        return false;
    decoded.weekDay = WeekDayOf(decoded.year, decoded.month, decoded.day);
    fields = decoded;
    return true;
}

namespace
{

// The walkers append to the caller's text, so that a whole "date, time" is
// built in one string without temporaries.
void AppendDate(std::wstring& out, const std::wstring& pattern, const CalendarFields& fields,
                const wyxos::LocaleNames& names)
{
    const size_t monthIndex = (fields.month - 1) % 12;
    const size_t dayIndex = fields.weekDay % 7;
    for (size_t i = 0; i < pattern.length();)
    {
        const wchar_t c = pattern[i];
        const size_t run = RunLength(pattern, i);
        switch (c)
        {
        case L'M':
            if (run <= 2)
                AppendShortRun(out, run, fields.month);
            else if (run == 3)
                AppendText(out, names.abbreviatedMonths[monthIndex]);
            else if (run == 4)
                AppendText(out, names.months[monthIndex]);
            break;
        case L'd':
            if (run <= 2)
                AppendShortRun(out, run, fields.day);
            else if (run == 3)
                AppendText(out, names.abbreviatedDays[dayIndex]);
            else if (run == 4)
                AppendText(out, names.days[dayIndex]);
            break;
        case L'y':
            if (run == 1)
                AppendNumber(out, fields.year % 10, false);
            else if (run == 2)
                AppendNumber(out, fields.year % 100, true);
            else if (run == 4)
                AppendNumber(out, fields.year, false);
            break;
        default:
            out.append(run, c);
            break;
        }
        i += run;
    }
}

void AppendTime(std::wstring& out, const std::wstring& pattern, const CalendarFields& fields,
                const wyxos::LocaleNames& names)
{
    const wxString& designator = fields.hour < 12 ? names.am : names.pm;
    for (size_t i = 0; i < pattern.length();)
    {
        const wchar_t c = pattern[i];
        const size_t run = RunLength(pattern, i);
        switch (c)
        {
        case L'H':
            AppendShortRun(out, run, fields.hour);
            break;
        case L'h':
            AppendShortRun(out, run, fields.hour % 12 == 0 ? 12 : fields.hour % 12);
            break;
        case L'm':
            AppendShortRun(out, run, fields.minute);
            break;
        case L's':
            AppendShortRun(out, run, fields.second);
            break;
        case L't':
            if (run == 1 && !designator.empty())
                out += designator.wc_str()[0];
            else if (run == 2)
                AppendText(out, designator);
            break;
        default:
            out.append(run, c);
            break;
        }
        i += run;
    }
}

// Appends the date in the locale's pattern, or the library's %x when the
// pattern cannot be read or yields nothing.
void AppendLocaleDate(std::wstring& out, const CalendarFields& fields, const wyxos::LocaleTimeInfo& locale)
{
    const size_t start = out.length();
    if (locale.hasDatePattern)
        AppendDate(out, locale.datePattern.ToStdWstring(), fields, locale.names);
    if (out.length() == start)
        AppendText(out, MomentFromFields(fields).Format("%x", wxDateTime::Local));
}

void AppendLocaleTime(std::wstring& out, const CalendarFields& fields, const wyxos::LocaleTimeInfo& locale)
{
    const size_t start = out.length();
    if (locale.hasTimePattern)
        AppendTime(out, locale.timePattern.ToStdWstring(), fields, locale.names);
    if (out.length() == start)
        AppendText(out, MomentFromFields(fields).Format("%X", wxDateTime::Local));
}

} // namespace

wxString WalkDatePattern(const wxString& pattern, const CalendarFields& fields,
                         const wyxos::LocaleNames& names)
{
    std::wstring out;
    AppendDate(out, pattern.ToStdWstring(), fields, names);
    return wxString(out);
}

wxString WalkTimePattern(const wxString& pattern, const CalendarFields& fields,
                         const wyxos::LocaleNames& names)
{
    std::wstring out;
    AppendTime(out, pattern.ToStdWstring(), fields, names);
    return wxString(out);
}

wxString FormatLocaleDate(const CalendarFields& fields, const wyxos::LocaleTimeInfo& locale)
{
    std::wstring out;
    AppendLocaleDate(out, fields, locale);
    return wxString(out);
}

wxString FormatLocaleTime(const CalendarFields& fields, const wyxos::LocaleTimeInfo& locale)
{
    std::wstring out;
    AppendLocaleTime(out, fields, locale);
    return wxString(out);
}

namespace
{

wxString FormatDosTime(const wchar_t* dosTimeText, size_t length, const wyxos::LocaleTimeInfo& locale)
{
    CalendarFields fields;
    if (!DecodeDosTime(dosTimeText, length, fields))
        return wxString();
    // Reused by each thread: the text is copied out once, at its final length.
    thread_local std::wstring text;
    text.clear();
    AppendLocaleDate(text, fields, locale);
    text += L", ";
    AppendLocaleTime(text, fields, locale);
    return wxString(text);
}

} // namespace

wxString FormatDosTime(const wxString& dosTimeText, const wyxos::LocaleTimeInfo& locale)
{
    return FormatDosTime(dosTimeText.wc_str(), dosTimeText.length(), locale);
}

const wyxos::LocaleTimeInfo& UserLocaleTimeInfo()
{
    static const wyxos::LocaleTimeInfo info = wyxos::ReadUserLocaleTimeInfo();
    return info;
}

wxString FormatDosTime(const wxString& dosTimeText)
{
    return FormatDosTime(dosTimeText, UserLocaleTimeInfo());
}

wxString FormatDosTime(const wchar_t* dosTimeText, size_t length)
{
    return FormatDosTime(dosTimeText, length, UserLocaleTimeInfo());
}

wxString FormatLocaleDate(const wxDateTime& moment)
{
    CalendarFields fields;
    if (!FieldsFromMoment(moment, fields))
        return wxString();
    return FormatLocaleDate(fields, UserLocaleTimeInfo());
}

wxString FormatLocaleTime(const wxDateTime& moment)
{
    CalendarFields fields;
    if (!FieldsFromMoment(moment, fields))
        return wxString();
    return FormatLocaleTime(fields, UserLocaleTimeInfo());
}
