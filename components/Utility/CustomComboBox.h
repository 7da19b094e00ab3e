#pragma once

#include <wx/odcombo.h>

#include <functional>
#include <memory>

class ComboAutomation;
namespace automation
{
class AutomationSource;
}

// The list popup of the filter box. It draws nothing of its own: the box's
// owner-draw callbacks do the drawing for both.
class CustomComboPopup : public wxVListBoxComboPopup
{
public:
    // Called, once the event in progress is done, after the popup opens or
    // closes (the box sends no event for either); empty for none.
    void SetShownChangedHandler(std::function<void()> handler) { m_shownChanged = std::move(handler); }

    void OnPopup() override;
    void OnDismiss() override;

private:
    void TellShownChanged();

    std::function<void()> m_shownChanged;
};

// Read-only filter drop-down of the views. Long entries are shortened with
// "..." in the closed box, the tooltip shows the whole selected entry, a left
// press raises wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK before the popup opens (the
// view refills the entries then), and Enter posts a button event 5100.
class CustomComboBox : public wxOwnerDrawnComboBox
{
public:
    // Id of the button event that Enter posts to the parent.
    static constexpr int kEnterButtonId = 5100;
    static constexpr int kItemHeight = 18;

    CustomComboBox();
    ~CustomComboBox() override;

    bool Create(wxWindow* parent, wxWindowID id, const wxPoint& pos = wxDefaultPosition,
                const wxSize& size = wxDefaultSize);

    // The box as outside tools read it; null before Create.
    const automation::AutomationSource* GetAutomationSource() const;

    void SetShowTooltip(bool show) { showTooltip = show; }
    bool GetShowTooltip() const { return showTooltip; }

    // Also repaints the whole box, so the drawn text follows the state.
    bool Enable(bool enable = true) override;

    // The text as the closed box shows it in a space `width` pixels wide:
    // unchanged while narrower than `width`, else cut from the end with "..."
    // appended until it is, and empty when nothing of the text fits.
    static wxString ShortenToWidth(const wxString& text, int width,
                                   const std::function<int(const wxString&)>& measure);

    // Owner-draw callbacks, public so that a test can paint an item into a
    // memory DC.
    void OnDrawItem(wxDC& dc, const wxRect& rect, int item, int flags) const override;
    wxCoord OnMeasureItem(size_t item) const override;
    wxCoord OnMeasureItemWidth(size_t item) const override;

private:
    void OnLeftDown(wxMouseEvent& event);
    void OnMouseMove(wxMouseEvent& event);
    void OnKeyDown(wxKeyEvent& event);
    void OnSelected(wxCommandEvent& event);

    wxString SelectedText() const;

    bool showTooltip = false;
    std::unique_ptr<ComboAutomation> m_automation;

    wxDECLARE_EVENT_TABLE();
};
