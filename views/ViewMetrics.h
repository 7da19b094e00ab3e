#pragma once

#include <wx/gdicmn.h>

class ProfilesKelvoProfilesListCtrl;
class wxWindow;
struct Theme;

// Sizes are given in pixels at the original platform's default font; these
// turn them into sizes for this font and display, so the same texts fit.
namespace viewmetrics
{

// A width for `window`'s font and display.
int ScaledWidth(const wxWindow* window, int width);
// A top-level window's size, before the window exists: measured in the GUI
// font, and kept within the display's work area.
wxSize ScaledFrameSize(const wxSize& size);

// A table column: its English heading (a blank one is shown as it is, any
// other translated) and its width at the original platform's font.
struct ColumnSpec
{
    const char* heading;
    int width;
};
// Adds the columns, left-aligned, with translated headings and scaled widths.
void AddColumns(ProfilesKelvoProfilesListCtrl& list, const ColumnSpec* columns, int count);

// The colours and fonts of one of the theme service's themes.
const Theme& ThemeOf(const char* name);

} // namespace viewmetrics
