#pragma once

#include "components/Utility/profilescustomlistctrl.h"

#include <wx/bitmap.h>
#include <wx/imaglist.h>

#include <memory>

// The images both tab pages put in their lists, decoded from the program's
// embedded PNGs. The lists do not own image lists: each view keeps its own.
namespace viewimages
{

// 0 the ascending mark, 1 the descending mark; magenta is transparent.
std::unique_ptr<wxImageList> MakeSortMarks();
// The twelve busy-wheel frames in turning order.
std::unique_ptr<wxImageList> MakeBusyWheel();
// Image 0: the warning triangle of a failed job.
std::unique_ptr<wxImageList> MakeWarningImages();
// The crossed circle of "Clear All".
wxBitmap ClearAllBitmap();

// The header look of both tables: the "Default" background, the 1 x 23 strip,
// no font of its own, and the "ListControl" text colour.
headerStyle MakeHeaderStyle();

} // namespace viewimages
