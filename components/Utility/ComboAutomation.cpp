#include "components/Utility/ComboAutomation.h"

#include "components/Utility/CustomComboBox.h"
#include "platform/automation/AutomationText.h"

namespace
{

std::u16string Utf16(const wxString& text)
{
    return automation::ToUtf16(text.ToStdWstring());
}

automation::Rect ToRect(const wxRect& rect)
{
    return automation::Rect{rect.x, rect.y, rect.x + rect.width, rect.y + rect.height};
}

bool ClientOnScreen(const wxWindow& window, automation::Rect& rect)
{
    if (!window.IsShownOnScreen())
        return false;
    const wxPoint origin = window.ClientToScreen(wxPoint(0, 0));
    const wxSize size = window.GetClientSize();
    rect = automation::Rect{origin.x, origin.y, origin.x + size.x, origin.y + size.y};
    return true;
}

} // namespace

// ---------------------------------------------------------------- popup

ComboPopupAutomationSource::ComboPopupAutomationSource(const CustomComboBox& combo, CustomComboPopup& popup)
    : m_combo(combo), m_popup(popup)
{
}

bool ComboPopupAutomationSource::HasWindow() const
{
    return m_popup.GetHandle() != nullptr;
}

std::uintptr_t ComboPopupAutomationSource::Handle() const
{
    return reinterpret_cast<std::uintptr_t>(m_popup.GetHandle());
}

long ComboPopupAutomationSource::ItemCount() const
{
    return static_cast<long>(m_popup.GetCount());
}

std::u16string ComboPopupAutomationSource::ItemText(long item, int column) const
{
    if (item < 0 || item >= ItemCount() || column != 0)
        return std::u16string();
    return Utf16(m_popup.GetString(static_cast<int>(item)));
}

long ComboPopupAutomationSource::Current() const
{
    return m_popup.GetSelection();
}

long ComboPopupAutomationSource::TopIndex() const
{
    return HasWindow() ? static_cast<long>(m_popup.GetVisibleRowsBegin()) : 0;
}

long ComboPopupAutomationSource::LastVisible() const
{
    if (!IsShown() || ItemCount() == 0)
        return -1;
    return std::min(ItemCount(), static_cast<long>(m_popup.GetVisibleRowsEnd())) - 1;
}

int ComboPopupAutomationSource::ItemHeight(long item) const
{
    return m_combo.OnMeasureItem(static_cast<size_t>(item));
}

automation::Rect ComboPopupAutomationSource::ClientRect() const
{
    return HasWindow() ? ToRect(m_popup.GetClientRect()) : automation::Rect();
}

bool ComboPopupAutomationSource::ScreenRect(automation::Rect& rect) const
{
    return HasWindow() && ClientOnScreen(m_popup, rect);
}

bool ComboPopupAutomationSource::IsShown() const
{
    return HasWindow() && m_combo.IsPopupShown() && m_popup.IsShownOnScreen();
}

// ---------------------------------------------------------------- box

ComboAutomationSource::ComboAutomationSource(const CustomComboBox& combo, CustomComboPopup& popup)
    : m_combo(combo), m_popup(combo, popup)
{
}

std::uintptr_t ComboAutomationSource::Handle() const
{
    return reinterpret_cast<std::uintptr_t>(m_combo.GetHandle());
}

std::u16string ComboAutomationSource::AccessibleId() const
{
    return Utf16(m_combo.GetName());
}

long ComboAutomationSource::ItemCount() const
{
    return static_cast<long>(m_combo.GetCount());
}

std::u16string ComboAutomationSource::ItemText(long item, int column) const
{
    if (item < 0 || item >= ItemCount() || column != 0)
        return std::u16string();
    return Utf16(m_combo.GetString(static_cast<unsigned>(item)));
}

long ComboAutomationSource::Current() const
{
    return m_combo.GetSelection();
}

int ComboAutomationSource::ItemHeight(long item) const
{
    return m_combo.OnMeasureItem(static_cast<size_t>(item));
}

bool ComboAutomationSource::IsDroppedDown() const
{
    return m_combo.IsPopupShown();
}

automation::Rect ComboAutomationSource::ClientRect() const
{
    return ToRect(m_combo.GetClientRect());
}

bool ComboAutomationSource::ScreenRect(automation::Rect& rect) const
{
    return ClientOnScreen(m_combo, rect);
}

bool ComboAutomationSource::IsShown() const
{
    return m_combo.IsShownOnScreen();
}

// ---------------------------------------------------------------- wiring

ComboAutomation::ComboAutomation(CustomComboBox& combo, CustomComboPopup& popup)
    : m_combo(combo), m_popup(popup), m_source(combo, popup), m_exposure(combo, m_source)
{
    m_combo.Bind(wxEVT_COMBOBOX, &ComboAutomation::OnSelected, this);
    m_popup.SetShownChangedHandler([this] { m_exposure.DroppedChanged(); });
}

ComboAutomation::~ComboAutomation()
{
    m_combo.Unbind(wxEVT_COMBOBOX, &ComboAutomation::OnSelected, this);
    m_popup.SetShownChangedHandler(nullptr);
}

void ComboAutomation::OnSelected(wxCommandEvent& event)
{
    m_exposure.SelectionChanged();
    event.Skip();
}
