#pragma once

#include <wx/datetime.h>
#include <wx/string.h>

#include "platform/os/LocaleInfo.h"

// A journal's decimal MS-DOS date-time ("leading digits", local time) as the
// displayed "<date>, <time>" in the user's short-date and time patterns. A value
// that names no real moment (month 0, 31 February, 25 o'clock...) gives an
// empty text rather than a made-up date.
wxString FormatDosTime(const wxString& dosTimeText);
// The same over characters where a line parser holds them, without a copy.
wxString FormatDosTime(const wchar_t* dosTimeText, size_t length);

// The date half and the time half of a moment, in the user's patterns; the
// C library's %x / %X when a pattern cannot be read or yields nothing.
wxString FormatLocaleDate(const wxDateTime& moment);
wxString FormatLocaleTime(const wxDateTime& moment);

// The parts of a local moment the patterns show.
struct CalendarFields
{
    unsigned year = 1980;
    unsigned month = 1; // 1 to 12
    unsigned day = 1;
    unsigned weekDay = 0; // 0 is Sunday
    unsigned hour = 0;
    unsigned minute = 0;
    unsigned second = 0;
};

// Reads the leading decimal digits (none: 0; more than 32 bits: all ones) and
// splits them as an MS-DOS date-time. False when they name no real moment.
bool DecodeDosTime(const wxString& dosTimeText, CalendarFields& fields);
bool DecodeDosTime(const wchar_t* dosTimeText, size_t length, CalendarFields& fields);

// The pattern walkers: a run of one repeated letter is one item, every other
// character is copied unchanged (quotes included). Runs without a meaning and
// names that are empty produce nothing.
wxString WalkDatePattern(const wxString& pattern, const CalendarFields& fields,
                         const wyxos::LocaleNames& names);
wxString WalkTimePattern(const wxString& pattern, const CalendarFields& fields,
                         const wyxos::LocaleNames& names);

// The same operations over a given locale instead of the user's.
wxString FormatLocaleDate(const CalendarFields& fields, const wyxos::LocaleTimeInfo& locale);
wxString FormatLocaleTime(const CalendarFields& fields, const wyxos::LocaleTimeInfo& locale);
wxString FormatDosTime(const wxString& dosTimeText, const wyxos::LocaleTimeInfo& locale);

// The user's patterns and names, read once per process: they do not change
// while it runs, and reading them costs far more than formatting a line.
const wyxos::LocaleTimeInfo& UserLocaleTimeInfo();
