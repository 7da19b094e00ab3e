#pragma once

#include <wx/gdicmn.h>
#include <wx/image.h>

// Reads back what is on the display in the given rectangle of screen
// coordinates (the toolkit's own device contexts cannot read a window back on
// GTK 3). An invalid image when the display cannot be read.
wxImage GrabScreen(const wxRect& area);
