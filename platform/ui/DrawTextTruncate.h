#pragma once

#include <wx/dc.h>
#include <wx/gdicmn.h>
#include <wx/string.h>

// Draws text that may be too wide for rect, shortened at the end with an
// ellipsis measured in the DC's current font. align is a wxALIGN_ horizontal
// flag (0 = left) for the text that is finally drawn. With hasImage the cell
// already shows an image, so a rectangle too narrow for even one character
// and the ellipsis stays empty instead of showing a lone "...".
void DrawTextTruncate(wxDC& dc, const wxString& text, const wxRect& rect, int align, bool hasImage);

// The text DrawTextTruncate would draw, for callers that measure or test.
wxString TruncateTextToWidth(const wxDC& dc, const wxString& text, int width, bool hasImage);
