#pragma once

#include "platform/automation/AutomationSource.h"
#include "platform/automation/atk/AccessibleExposure.h"

#include <wx/event.h>
#include <wx/listbase.h>

class ProfilesKelvoProfilesListCtrl;
class ProfilesKelvoListHeaderWindow;

// The themed list's column header as outside tools read it.
class HeaderAutomationSource : public automation::AutomationSource
{
public:
    HeaderAutomationSource(const ProfilesKelvoProfilesListCtrl& list,
                           const ProfilesKelvoListHeaderWindow& header);

    automation::ControlKind Kind() const override { return automation::ControlKind::Header; }
    std::uintptr_t Handle() const override;
    long ItemCount() const override { return 0; }
    std::u16string ItemText(long, int) const override { return std::u16string(); }
    int ColumnCount() const override;
    bool Column(int column, automation::ColumnInfo& info) const override;
    int ScrolledLeft() const override;
    automation::Rect ClientRect() const override;
    bool ScreenRect(automation::Rect& rect) const override;
    bool IsShown() const override;

private:
    const ProfilesKelvoProfilesListCtrl& m_list;
    const ProfilesKelvoListHeaderWindow& m_header;
};

// The themed list as outside tools read it: rows, cells, columns, selection,
// focus and rectangles, straight from the control (a virtual list's cells
// from its callbacks, one at a time).
class ListAutomationSource : public automation::AutomationSource
{
public:
    explicit ListAutomationSource(const ProfilesKelvoProfilesListCtrl& list);

    automation::ControlKind Kind() const override { return automation::ControlKind::ListCtrl; }
    std::uintptr_t Handle() const override;
    std::u16string AccessibleName() const override;
    std::u16string AccessibleId() const override;
    long ItemCount() const override;
    std::u16string ItemText(long item, int column) const override;
    long Current() const override;
    long TopIndex() const override;
    long LastVisible() const override;
    unsigned ItemState(long item) const override;
    int ItemImage(long item, int column) const override;
    std::intptr_t ItemData(long item) const override;
    bool IsSingleSelection() const override;
    long SelectedCount() const override;
    bool ItemRect(long item, automation::Rect& rect) const override;
    bool CellRect(long item, int column, automation::Rect& rect) const override;
    const automation::AutomationSource* Header() const override { return &m_header; }
    std::optional<int> HeaderHeight() const override;
    bool HasFocus() const override;
    int ColumnCount() const override;
    bool Column(int column, automation::ColumnInfo& info) const override;
    automation::Rect ClientRect() const override;
    bool ScreenRect(automation::Rect& rect) const override;
    bool IsShown() const override;

private:
    const ProfilesKelvoProfilesListCtrl& m_list;
    HeaderAutomationSource m_header;
};

// Puts one themed list on the accessibility bus and tells the tools that
// listen what changes in it. Owned by the list, made when its parts exist.
class ListAutomation
{
public:
    explicit ListAutomation(ProfilesKelvoProfilesListCtrl& list);
    ~ListAutomation();
    ListAutomation(const ListAutomation&) = delete;
    ListAutomation& operator=(const ListAutomation&) = delete;

    const automation::AutomationSource& Source() const { return m_source; }
    void RowsChanged() { m_exposure.RowsChanged(); }

private:
    void OnSelection(wxListEvent& event);
    void OnCurrent(wxListEvent& event);
    void OnFocus(wxFocusEvent& event);

    ProfilesKelvoProfilesListCtrl& m_list;
    ListAutomationSource m_source;
    automation::AccessibleExposure m_exposure;
};
