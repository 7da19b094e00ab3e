#pragma once

#include <wx/datetime.h>
#include <wx/string.h>

// A journal's decimal MS-DOS date-time ("leading digits", local time) as the
// displayed "<date>, <time>" in the user's short-date and time patterns.
wxString FormatDosTime(const wxString& dosTimeText);

// The date half and the time half of a moment, in the user's patterns; the
// C library's %x / %X when a pattern cannot be read or yields nothing.
wxString FormatLocaleDate(const wxDateTime& moment);
wxString FormatLocaleTime(const wxDateTime& moment);
