#pragma once

#include <wx/colour.h>
#include <wx/dc.h>
#include <wx/image.h>

#include <functional>
#include <string>

// Pixel helpers for the paint tests: render into a memory bitmap and compare
// the result with a picture drawn by the test at the expected coordinates.
namespace pixels
{

// A bitmap of `size` filled with `background`, then painted by `paint`.
wxImage Render(const wxSize& size, const wxColour& background, const std::function<void(wxDC&)>& paint);

wxColour At(const wxImage& image, int x, int y);

// Empty when both images are equal, else where and how they first differ.
std::string FirstDifference(const wxImage& actual, const wxImage& expected);

// True when some pixel in the column range [x0, x1) (all rows) differs from `colour`.
bool AnyPixelDiffersIn(const wxImage& image, int x0, int x1, const wxColour& colour);

} // namespace pixels
