#pragma once

#include <wx/gdicmn.h>

class wxWindow;

// Sizes are given in pixels at the original platform's default font; these
// turn them into sizes for this font and display, so the same texts fit.
namespace viewmetrics
{

// A width for `window`'s font and display.
int ScaledWidth(const wxWindow* window, int width);
// A top-level window's size, before the window exists: measured in the GUI
// font, and kept within the display's work area.
wxSize ScaledFrameSize(const wxSize& size);

} // namespace viewmetrics
