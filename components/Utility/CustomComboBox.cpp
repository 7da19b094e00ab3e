#include "components/Utility/CustomComboBox.h"

#include "components/Utility/ComboAutomation.h"

#include "pump/bus/CustomEvents.h"

#include <wx/dc.h>

wxBEGIN_EVENT_TABLE(CustomComboBox, wxOwnerDrawnComboBox) EVT_LEFT_DOWN(CustomComboBox::OnLeftDown)
    EVT_MOTION(CustomComboBox::OnMouseMove) EVT_KEY_DOWN(CustomComboBox::OnKeyDown)
        EVT_COMBOBOX(wxID_ANY, CustomComboBox::OnSelected) wxEND_EVENT_TABLE()

            namespace
{
    const wxString kEllipsis = wxS("...");

    // Space between the item rectangle the library gives and the drawn text.
    constexpr int kItemInset = 3;
    constexpr int kExtraBottomInset = 2;
} // namespace

bool CustomComboBox::Create(wxWindow* parent, wxWindowID id, const wxPoint& pos, const wxSize& size)
{
    if (!wxOwnerDrawnComboBox::Create(parent, id, wxEmptyString, pos, size, wxCB_READONLY))
        return false;
    auto* popup = new CustomComboPopup;
    SetPopupControl(popup);
    m_automation = std::make_unique<ComboAutomation>(*this, *popup);
    return true;
}

void CustomComboPopup::OnPopup()
{
    wxVListBoxComboPopup::OnPopup();
    TellShownChanged();
}

void CustomComboPopup::OnDismiss()
{
    wxVListBoxComboPopup::OnDismiss();
    TellShownChanged();
}

void CustomComboPopup::TellShownChanged()
{
    // The box records the popup's new state only after these calls return.
    // The handler is looked up when the call runs: one removed meanwhile is not called.
    if (m_shownChanged)
        CallAfter(
            [this]
            {
                if (m_shownChanged)
                    m_shownChanged();
            });
}

CustomComboBox::CustomComboBox() = default;

CustomComboBox::~CustomComboBox() = default;

const automation::AutomationSource* CustomComboBox::GetAutomationSource() const
{
    return m_automation ? &m_automation->Source() : nullptr;
}

bool CustomComboBox::Enable(bool enable)
{
    const bool changed = wxOwnerDrawnComboBox::Enable(enable);
    Refresh();
    return changed;
}

wxString CustomComboBox::ShortenToWidth(const wxString& text, int width,
                                        const std::function<int(const wxString&)>& measure)
{
    if (text.empty() || measure(text) < width)
        return text;

    wxString kept = text;
    wxString shortened;
    do
    {
        kept.RemoveLast();
        if (kept.empty())
            return wxString();
        shortened = kept + kEllipsis;
    } while (measure(shortened) >= width);
    return shortened;
}

void CustomComboBox::OnDrawItem(wxDC& dc, const wxRect& rect, int item, int flags) const
{
    if (item < 0 || static_cast<unsigned int>(item) >= GetCount())
        return;

    wxRect area = rect;
    area.Deflate(kItemInset);
    area.height -= kExtraBottomInset;

    const wxString text = GetString(static_cast<unsigned int>(item));
    if (flags & wxODCB_PAINTING_CONTROL)
    {
        const wxString shown =
            ShortenToWidth(text, area.width, [this](const wxString& s) { return GetTextExtent(s).x; });
        dc.DrawText(shown, area.x + 1, area.y);
    }
    else
    {
        dc.DrawText(text, area.x, area.y);
    }
}

wxCoord CustomComboBox::OnMeasureItem(size_t) const
{
    return kItemHeight;
}

wxCoord CustomComboBox::OnMeasureItemWidth(size_t) const
{
    return -1;
}

void CustomComboBox::OnLeftDown(wxMouseEvent& event)
{
    // Processed at once, not queued: the view refills the entries before the
    // popup that shows them opens.
    wxCommandEvent click(wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK, 0);
    click.SetEventObject(this);
    GetEventHandler()->ProcessEvent(click);
    event.Skip();
}

void CustomComboBox::OnMouseMove(wxMouseEvent& event)
{
    // Motion events come in bursts; resetting an unchanged tip makes it flicker.
    const wxString tip = showTooltip ? SelectedText() : wxString();
    if (tip != GetToolTipText())
        SetToolTip(tip);
    event.Skip();
}

void CustomComboBox::OnKeyDown(wxKeyEvent& event)
{
    const int key = event.GetKeyCode();
    if ((key == WXK_RETURN || key == WXK_NUMPAD_ENTER) && GetParent() != nullptr)
    {
        wxCommandEvent press(wxEVT_BUTTON, kEnterButtonId);
        press.SetEventObject(this);
        wxPostEvent(GetParent()->GetEventHandler(), press);
    }
    event.Skip();
}

void CustomComboBox::OnSelected(wxCommandEvent& event)
{
    // The popup sends the selection without its text; the views read it.
    event.SetString(GetValue());
    event.Skip();
}

wxString CustomComboBox::SelectedText() const
{
    const int selection = GetSelection();
    if (selection == wxNOT_FOUND)
        return wxString();
    return GetString(static_cast<unsigned int>(selection));
}
