#pragma once

#include <wx/image.h>
#include <wx/window.h>

// What the window's next paint puts on the screen, drawn through the toolkit's
// own paint path into an image right now: no event, idle handler or timer
// runs first. An invalid image when the toolkit offers no such path.
wxImage DrawNow(wxWindow* window);
