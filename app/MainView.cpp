#include "app/MainView.h"

#include "platform/themer/Themer.h"

wxBEGIN_EVENT_TABLE(MainView, CNOwnerDrawNotebook) wxEND_EVENT_TABLE()

    MainView::MainView()
    : CNOwnerDrawNotebook(false, -1, -1)
{
}

void MainView::SetupCustomInfo()
{
    const Theme& theme = Themer::GetThemeService()->GetTheme("Notebook");
    CNNotebookCustomInfo& info = CustomInfo();
    // The base colours go in first: the defaults derive the tab fills from them.
    info.baseColours[0] = theme.panelColour;
    info.baseColours[1] = theme.backgroundColour;
    DefaultCustomInfo();
    for (CNTabStateInfo& state : info.states)
        state.textColour = Themer::GetThemeService()->GetTheme("Notebook").textColour;
}

wxSize MainView::GetExtraTabPadding() const
{
    return wxSize(0, 0);
}

void MainView::DrawTabDecoration(wxDC&, const wxRect&, size_t) const {}

wxSize MainView::AdjustTabSize(const wxSize& size) const
{
    return size;
}

wxRect MainView::GetPageInsets() const
{
    return wxRect(0, 0, 0, 0);
}

wxPoint MainView::GetLabelOffset() const
{
    return wxPoint(0, 0);
}
