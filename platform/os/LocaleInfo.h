#pragma once

#include <array>

#include <wx/string.h>

namespace wyxos
{

// The letters a display pattern is written in: the date walker reads runs of
// M, d and y, the time walker runs of H, h, m, s and t; any other character is
// copied as it stands.
enum class PatternKind
{
    Date,
    Time
};

// Month and day names and the AM/PM designators of one locale. An empty text
// stands for a name that could not be fetched.
struct LocaleNames
{
    std::array<wxString, 12> months;
    std::array<wxString, 12> abbreviatedMonths;
    std::array<wxString, 7> days; // Sunday first
    std::array<wxString, 7> abbreviatedDays;
    wxString am;
    wxString pm;
};

// The short-date and time patterns of one locale in the walker's letters, and
// its names. A pattern that cannot be read is flagged, not guessed.
struct LocaleTimeInfo
{
    bool hasDatePattern = false;
    wxString datePattern;
    bool hasTimePattern = false;
    wxString timePattern;
    LocaleNames names;
};

// Converts a C library format (D_FMT, T_FMT) to the walker's letters. amPmFormat
// is what %r stands for in that locale (T_FMT_AMPM). False when a conversion has
// no exact equivalent, belongs to the other kind, or when a literal letter or
// two neighbouring conversions would be read as a different run by the walker.
bool ConvertStrftimePattern(const wxString& format, PatternKind kind, const wxString& amPmFormat,
                            wxString& pattern);

// The name of the user's LC_TIME locale as the C library resolves it from the
// environment (LC_ALL, else LC_TIME, else LANG); "C" when none is set.
wxString UserTimeLocaleName();

// Reads the patterns and names of a locale by name. False when the locale is
// not installed; info is then left as it was.
bool ReadLocaleTimeInfo(const wxString& localeName, LocaleTimeInfo& info);

// The user's locale, or "C" when the user's is not installed.
LocaleTimeInfo ReadUserLocaleTimeInfo();

} // namespace wyxos
