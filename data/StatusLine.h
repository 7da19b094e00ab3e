#pragma once

#include <cstdint>

#include <wx/string.h>

#include "data/JobRecord.h"

// Splits a status journal line on TAB, dropping empty pieces as the journal
// writers expect. A line of exactly nine pieces whose action tag is "ADDED" or
// "MODIFIED" (any case) fills record and gives true; any other line gives false
// and leaves record as it was. TimeText is FormatDosTime of the
// line's DosTime; the tag itself is not kept. startTime, when given, receives
// the DosTime as a number (its leading decimal digits, 0 without any), so that
// jobs can be ordered by when they started.
bool ParseStatusLine(const wxString& line, JobRecord& record, std::uint64_t* startTime = nullptr);

// The leading decimal digits of a text as a number: 0 without any, and the
// largest value rather than a wrapped one when they overflow, so an absurd
// value still sorts last.
std::uint64_t LeadingDecimal(const wchar_t* text, size_t length);
