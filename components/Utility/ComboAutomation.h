#pragma once

#include "platform/automation/AutomationSource.h"
#include "platform/automation/atk/AccessibleExposure.h"

#include <wx/event.h>

class CustomComboBox;
class CustomComboPopup;

// The filter box's popup list as outside tools read it. Its entries live in
// the popup object from the start; its window only once it first opens.
class ComboPopupAutomationSource : public automation::AutomationSource
{
public:
    ComboPopupAutomationSource(const CustomComboBox& combo, CustomComboPopup& popup);

    automation::ControlKind Kind() const override { return automation::ControlKind::ListBox; }
    std::uintptr_t Handle() const override;
    long ItemCount() const override;
    std::u16string ItemText(long item, int column) const override;
    long Current() const override;
    long TopIndex() const override;
    long LastVisible() const override;
    int ItemHeight(long item) const override;
    automation::Rect ClientRect() const override;
    bool ScreenRect(automation::Rect& rect) const override;
    bool IsShown() const override;

private:
    bool HasWindow() const;

    const CustomComboBox& m_combo;
    CustomComboPopup& m_popup;
};

// The filter box as outside tools read it: entries, selection, whether it is
// dropped down, and its popup.
class ComboAutomationSource : public automation::AutomationSource
{
public:
    ComboAutomationSource(const CustomComboBox& combo, CustomComboPopup& popup);

    automation::ControlKind Kind() const override { return automation::ControlKind::ComboBox; }
    std::uintptr_t Handle() const override;
    std::u16string AccessibleId() const override;
    long ItemCount() const override;
    std::u16string ItemText(long item, int column) const override;
    long Current() const override;
    int ItemHeight(long item) const override;
    bool IsDroppedDown() const override;
    const automation::AutomationSource* Popup() const override { return &m_popup; }
    automation::Rect ClientRect() const override;
    bool ScreenRect(automation::Rect& rect) const override;
    bool IsShown() const override;

private:
    const CustomComboBox& m_combo;
    ComboPopupAutomationSource m_popup;
};

// Puts one filter box on the accessibility bus and tells the tools that
// listen when its selection changes and when it drops down or closes.
class ComboAutomation
{
public:
    ComboAutomation(CustomComboBox& combo, CustomComboPopup& popup);
    ~ComboAutomation();
    ComboAutomation(const ComboAutomation&) = delete;
    ComboAutomation& operator=(const ComboAutomation&) = delete;

    const automation::AutomationSource& Source() const { return m_source; }

private:
    void OnSelected(wxCommandEvent& event);

    CustomComboBox& m_combo;
    CustomComboPopup& m_popup;
    ComboAutomationSource m_source;
    automation::AccessibleExposure m_exposure;
};
