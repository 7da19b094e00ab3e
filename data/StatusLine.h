#pragma once

#include <wx/string.h>

#include "data/JobRecord.h"

// Splits a status journal line on TAB, dropping empty pieces as the journal
// writers expect. A line of exactly nine pieces whose action tag is "ADDED" or
// "MODIFIED" (any case) fills record and gives true; any other line gives false
// and leaves record as it was. TimeText is FormatDosTime of the
// line's DosTime; the tag itself is not kept.
bool ParseStatusLine(const wxString& line, JobRecord& record);
