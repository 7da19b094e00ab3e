#include "views/ViewMetrics.h"

#include "components/Utility/profilescustomlistctrl.h"
#include "platform/themer/Themer.h"
#include "views/ViewRules.h"

#include <wx/dcscreen.h>
#include <wx/display.h>
#include <wx/intl.h>
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

void AddColumns(ProfilesKelvoProfilesListCtrl& list, const ColumnSpec* columns, int count)
{
    for (int column = 0; column < count; ++column)
    {
        const wxString heading(columns[column].heading);
        const bool blank = heading.find_first_not_of(wxS(" ")) == wxString::npos;
        list.InsertColumn(column, blank ? heading : wxGetTranslation(heading), wxLIST_FORMAT_LEFT,
                          ScaledWidth(&list, columns[column].width));
    }
}

const Theme& ThemeOf(const char* name)
{
    return Themer::GetThemeService()->GetTheme(name);
}

} // namespace viewmetrics
