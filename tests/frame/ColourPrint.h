#pragma once

#include "platform/ui/NOwnerDrawNotebook.h"

#include <wx/colour.h>
#include <wx/dcmemory.h>

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
