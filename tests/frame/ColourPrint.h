#pragma once

#include "platform/ui/NOwnerDrawNotebook.h"

#include <wx/colour.h>
#include <wx/dcmemory.h>

#include <ostream>

// Lets test failures show colours as #RRGGBB rather than as bytes.
inline void PrintTo(const wxColour& colour, std::ostream* out)
{
    *out << (colour.IsOk() ? colour.GetAsString(wxC2S_HTML_SYNTAX).ToStdString() : std::string("(invalid)"));
}

// The notebook's tab strip as its paint handler draws it, and one pixel of an image.
inline wxImage RenderStrip(CNOwnerDrawNotebook& book)
{
    wxBitmap bitmap(book.GetTabStrip()->GetClientSize());
    {
        wxMemoryDC dc(bitmap);
        book.RenderTabStrip(dc);
    }
    return bitmap.ConvertToImage();
}
inline wxColour Pixel(const wxImage& image, int x, int y)
{
    return wxColour(image.GetRed(x, y), image.GetGreen(x, y), image.GetBlue(x, y));
}
