#pragma once

#include "components/Utility/ProfilesKelvoListTextCache.h"

#include <wx/colour.h>
#include <wx/dc.h>
#include <wx/string.h>

// The text of one cell, centred on yMiddle within [x, x + width): aligned by
// the column format, shortened with DrawTextTruncate when wider than width,
// or drawn as a progress bar (no text) for the progress format.
void DrawListCellText(wxDC& dc, const wxString& text, int format, int x, int yMiddle, int width,
                      bool hasImage, ProfilesKelvoListTextCache* cache = nullptr);

// The status circle or square of a cell whose column starts at x.
void DrawListStatusMark(wxDC& dc, int image, int x, int rowTop, const wxColour& fill);
