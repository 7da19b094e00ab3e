#pragma once

#include "components/Utility/ProfilesKelvoListHeaderWindow.h"
#include "components/Utility/ProfilesKelvoListLineData.h"
#include "components/Utility/ProfilesKelvoListMainWindow.h"

#include <wx/bitmap.h>
#include <wx/colour.h>
#include <wx/containr.h>
#include <wx/control.h>
#include <wx/font.h>
#include <wx/itemattr.h>
#include <wx/listbase.h>
#include <wx/listctrl.h>

#include <memory>
#include <vector>

class ListAutomation;
namespace automation
{
class AutomationSource;
}

// Creation record of the list: the header's look. The background colour is
// carried for the callers; the list uses the bitmap, font and text colour.
struct headerStyle
{
    wxColour backgroundColour;
    wxBitmap bitmap;
    wxFont font;
    wxColour textColour;
};

// Image-list kind of the header's column images, beside wxIMAGE_LIST_NORMAL,
// wxIMAGE_LIST_SMALL and wxIMAGE_LIST_STATE.
constexpr int kHeaderImageList = 5;

// A report-mode list in the product's look: themed rows and selection, a flat
// header, status circles and squares, progress cells and shortened text. It
// offers the part of wxListCtrl's interface the views use and sends the usual
// wxListEvents with the control as their object.
class ProfilesKelvoProfilesListCtrl : public wxNavigationEnabled<wxControl>
{
public:
    ProfilesKelvoProfilesListCtrl();
    ProfilesKelvoProfilesListCtrl(const headerStyle* style, wxWindow* parent, wxWindowID id = wxID_ANY,
                                  const wxPoint& pos = wxDefaultPosition, const wxSize& size = wxDefaultSize,
                                  long listStyle = wxLC_REPORT,
                                  const wxValidator& validator = wxDefaultValidator,
                                  const wxString& name = wxListCtrlNameStr);
    ~ProfilesKelvoProfilesListCtrl() override;

    bool Create(const headerStyle* style, wxWindow* parent, wxWindowID id = wxID_ANY,
                const wxPoint& pos = wxDefaultPosition, const wxSize& size = wxDefaultSize,
                long listStyle = wxLC_REPORT, const wxValidator& validator = wxDefaultValidator,
                const wxString& name = wxListCtrlNameStr);

    // Columns
    long InsertColumn(long col, const wxString& heading, int format = wxLIST_FORMAT_LEFT, int width = -1);
    long InsertColumn(long col, const wxListItem& info);
    bool SetColumn(int col, const wxListItem& info);
    bool GetColumn(int col, wxListItem& info) const;
    int GetColumnCount() const;
    int GetColumnWidth(int col) const;
    bool SetColumnWidth(int col, int width);

    // Items
    long InsertItem(long index, const wxString& label, int imageIndex = kCellImageNone);
    long InsertItem(const wxListItem& info);
    // Prepared rows, inserted at `index` (past the end: appended) with one
    // layout; returns the index of the first. What InsertItem and SetItem do
    // row by row, for lists of many thousand rows.
    long InsertItems(long index, std::vector<ProfilesKelvoListLineData> lines);
    bool SetItem(long index, int col, const wxString& label, int imageId = kCellImageNone);
    bool SetItem(wxListItem& info);
    bool SetItemData(long item, long data);
    bool SetItemPtrData(long item, wxUIntPtr data);
    wxUIntPtr GetItemData(long item) const;
    bool GetItem(wxListItem& info) const;
    wxString GetItemText(long item, int col = 0) const;
    bool SetItemTextColour(long item, const wxColour& colour);
    bool SetItemBackgroundColour(long item, const wxColour& colour);
    long GetItemCount() const;
    int GetSelectedItemCount() const;
    long GetNextItem(long item, int geometry = wxLIST_NEXT_ALL, int state = wxLIST_STATE_DONTCARE) const;
    // item -1 changes every item. Selection and focus changes send their events.
    bool SetItemState(long item, long state, long stateMask);
    int GetItemState(long item, long stateMask) const;
    bool DeleteItem(long item);
    bool DeleteAllItems();
    // Virtual lists: rows beyond the new count leave the selection, and the
    // focus moves to the last row that remains.
    void SetItemCount(long count);
    void RefreshItem(long item);
    void RefreshItems(long from, long to);
    bool EnsureVisible(long item);
    long GetTopItem() const;
    int GetCountPerPage() const;
    bool GetItemRect(long item, wxRect& rect) const;
    bool GetSubItemRect(long item, long subItem, wxRect& rect) const;
    bool IsVirtual() const;

    // Look
    void SetImageList(wxImageList* images, int which);
    wxImageList* GetImageList(int which) const;
    void SetAlternateRowColour(const wxColour& colour);
    bool SetBackgroundColour(const wxColour& colour) override;
    bool SetFont(const wxFont& font) override;

    // Parts, for the views' automation answers and for tests.
    ProfilesKelvoListMainWindow* GetMainWindow() const { return m_main; }
    ProfilesKelvoListHeaderWindow* GetHeaderWindow() const { return m_header; }
    const headerStyle* GetHeaderStyle() const { return m_headerStyle.get(); }

    // What accessibility tools call the list ("Jobs in progress").
    void SetAccessibleName(const wxString& name) { m_accessibleName = name; }
    const wxString& GetAccessibleName() const { return m_accessibleName; }
    // The list as outside tools read it; null before Create.
    const automation::AutomationSource* GetAutomationSource() const;

    // Virtual-mode callbacks, asked per cell.
    virtual wxString OnGetItemText(long item, long column) const;
    virtual int OnGetItemImage(long item, long column) const;
    virtual wxItemAttr* OnGetItemAttr(long item, long column) const;

protected:
    wxSize DoGetBestClientSize() const override;

private:
    void OnSize(wxSizeEvent& event);
    void LayoutChildren();
    // Tells the tools that read the list that its rows changed.
    void RowsChanged();

    std::unique_ptr<headerStyle> m_headerStyle;
    ProfilesKelvoListMainWindow* m_main = nullptr;
    ProfilesKelvoListHeaderWindow* m_header = nullptr;
    wxString m_accessibleName;
    // Last of the members: it goes before the parts it reads.
    std::unique_ptr<ListAutomation> m_automation;

    wxDECLARE_EVENT_TABLE();
};
