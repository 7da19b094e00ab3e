#include "PixelCompare.h"

#include <wx/bitmap.h>
#include <wx/dcmemory.h>

namespace pixels
{

wxImage Render(const wxSize& size, const wxColour& background, const std::function<void(wxDC&)>& paint)
{
    wxBitmap bitmap(size, 24);
    wxMemoryDC dc(bitmap);
    dc.SetBackground(wxBrush(background));
    dc.Clear();
    paint(dc);
    dc.SelectObject(wxNullBitmap); // the bitmap holds the picture once the DC lets go of it
    return bitmap.ConvertToImage();
}

wxColour At(const wxImage& image, int x, int y)
{
    return wxColour(image.GetRed(x, y), image.GetGreen(x, y), image.GetBlue(x, y));
}

std::string FirstDifference(const wxImage& actual, const wxImage& expected)
{
    if (actual.GetSize() != expected.GetSize())
        return "the sizes differ";
    for (int y = 0; y < actual.GetHeight(); ++y)
        for (int x = 0; x < actual.GetWidth(); ++x)
            if (At(actual, x, y) != At(expected, x, y))
                return wxString::Format("pixel (%d, %d) is %s, expected %s", x, y,
                                        At(actual, x, y).GetAsString(wxC2S_HTML_SYNTAX),
                                        At(expected, x, y).GetAsString(wxC2S_HTML_SYNTAX))
                    .ToStdString();
    return std::string();
}

bool AnyPixelDiffersIn(const wxImage& image, int x0, int x1, const wxColour& colour)
{
    for (int x = x0; x < x1; ++x)
        for (int y = 0; y < image.GetHeight(); ++y)
            if (At(image, x, y) != colour)
                return true;
    return false;
}

} // namespace pixels
