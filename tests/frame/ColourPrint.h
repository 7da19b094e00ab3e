#pragma once

#include <wx/colour.h>

#include <ostream>

// Lets test failures show colours as #RRGGBB rather than as bytes.
inline void PrintTo(const wxColour& colour, std::ostream* out)
{
    *out << (colour.IsOk() ? colour.GetAsString(wxC2S_HTML_SYNTAX).ToStdString() : std::string("(invalid)"));
}
