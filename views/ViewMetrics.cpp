#include "views/ViewMetrics.h"

#include "views/ViewRules.h"

#include <wx/dcscreen.h>
#include <wx/display.h>
#include <wx/settings.h>
#include <wx/window.h>

#include <algorithm>

namespace viewmetrics
{
namespace
{
double LetterWidth(const wxSize& sampleExtent)
{
    return sampleExtent.x / static_cast<double>(viewrules::kCharWidthSample.length());
}
} // namespace

int ScaledWidth(const wxWindow* window, int width)
{
    const double letterWidth = LetterWidth(window->GetTextExtent(viewrules::kCharWidthSample));
    return window->FromDIP(viewrules::ScaleColumnWidth(width, letterWidth));
}

wxSize ScaledFrameSize(const wxSize& size)
{
    wxScreenDC dc;
    dc.SetFont(wxSystemSettings::GetFont(wxSYS_DEFAULT_GUI_FONT));
    const double letterWidth = LetterWidth(dc.GetTextExtent(viewrules::kCharWidthSample));
    const wxRect work = wxDisplay(0u).GetClientArea();
    return wxSize(std::min(viewrules::ScaleColumnWidth(size.x, letterWidth), work.width),
                  std::min(viewrules::ScaleColumnWidth(size.y, letterWidth), work.height));
}

} // namespace viewmetrics
