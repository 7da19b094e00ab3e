#pragma once

#include "platform/ui/NOwnerDrawNotebook.h"

// The main window's notebook: the product's owner-drawn notebook in the
// colours of the "Notebook" theme, otherwise as the notebook draws itself.
class MainView : public CNOwnerDrawNotebook
{
public:
    MainView();

protected:
    void SetupCustomInfo() override;
    wxSize GetExtraTabPadding() const override;
    void DrawTabDecoration(wxDC& dc, const wxRect& tabRect, size_t page) const override;
    wxSize AdjustTabSize(const wxSize& size) const override;
    wxRect GetPageInsets() const override;
    wxPoint GetLabelOffset() const override;

private:
    wxDECLARE_EVENT_TABLE();
};
