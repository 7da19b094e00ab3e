#pragma once

#include "components/Utility/ProfilesKelvoListLineData.h"
#include "components/Utility/ProfilesKelvoListSelection.h"
#include "components/Utility/ProfilesKelvoListTextCache.h"

#include <wx/brush.h>
#include <wx/event.h>
#include <wx/imaglist.h>
#include <wx/listbase.h>
#include <wx/window.h>

#include <vector>

class ProfilesKelvoProfilesListCtrl;

// The rows of the themed report list: holds columns, items, selection, focus
// and scroll position, paints the visible rows and turns mouse and keys into
// selection changes and list events sent through the owner control.
class ProfilesKelvoListMainWindow : public wxWindow
{
public:
    ProfilesKelvoListMainWindow(ProfilesKelvoProfilesListCtrl* owner, wxWindowID id, long listStyle);

    // Columns
    long InsertColumn(long col, const ProfilesKelvoListColumn& column);
    const std::vector<ProfilesKelvoListColumn>& GetColumns() const { return m_columns; }
    ProfilesKelvoListColumn* GetColumnAt(long col);
    int GetColumnCount() const { return static_cast<int>(m_columns.size()); }
    int GetTotalColumnWidth() const;
    // Left edge of a column counted from the first column's left edge.
    int GetColumnLeft(long col) const;
    // wxLIST_AUTOSIZE fits the widest cell, wxLIST_AUTOSIZE_USEHEADER the label.
    void SetColumnWidth(long col, int width);

    // Items
    bool IsVirtual() const { return (m_listStyle & wxLC_VIRTUAL) != 0; }
    bool IsSingleSelection() const { return (m_listStyle & wxLC_SINGLE_SEL) != 0; }
    long GetItemCount() const;
    void SetItemCount(long count);
    long InsertLine(long index, ProfilesKelvoListLineData line);
    // Many rows with one layout. Rows added at the end of a laid-out list
    // repaint only where they show, and the scrollbar; nothing else moves.
    long InsertLines(long index, std::vector<ProfilesKelvoListLineData> lines);
    bool DeleteLine(long index);
    void DeleteAllLines();
    // Stored rows of a non-virtual list; null out of range or in virtual mode.
    ProfilesKelvoListLineData* GetStoredLine(long item);
    const ProfilesKelvoListLineData* GetStoredLine(long item) const;
    // A row as painted: stored, or built from the owner's callbacks column by
    // column (text, image, attribute) in virtual mode.
    ProfilesKelvoListLineData GetLine(long item) const;
    // The look of one cell: its own attribute, else the row's.
    static ProfilesKelvoListCellAttr EffectiveAttr(const ProfilesKelvoListLineData& line, size_t column);

    // Selection and focus
    bool IsSelected(long item) const { return m_selection.IsSelected(item); }
    long GetSelectedCount() const { return m_selection.Count(); }
    long GetNextSelected(long after) const { return m_selection.Next(after); }
    long GetCurrent() const { return m_current; }
    // Change selection or focus as a program call would: the list events are sent.
    void SetItemSelected(long item, bool selected);
    void SetAllSelected(bool selected);
    void SetCurrent(long item);
    void ClearCurrentIf(long item);

    // Geometry
    int GetLineHeight() const { return m_lineHeight; }
    long GetTopItem() const { return m_topItem; }
    int GetScrollX() const { return m_scrollX; }
    // Rows that fit whole in the client area (at least 1).
    long GetCountPerPage() const;
    // The last row that is at least partly visible, or -1 for an empty list.
    long GetLastVisibleItem() const;
    wxRect GetItemRect(long item) const;
    wxRect GetSubItemRect(long item, long col) const;
    long HitTestItem(const wxPoint& point) const;
    void EnsureVisible(long item);
    void ScrollToTop(long item);
    void ScrollToX(int x);

    // Layout is recomputed once for a batch of changes: when idle, or at the
    // next paint if that comes first.
    void MarkDirty();
    bool IsDirty() const { return m_dirty; }
    void LayoutIfNeeded();
    void RefreshLine(long item);
    void RefreshLines(long from, long to);

    // Look
    void SetAlternateRowColour(const wxColour& colour) { m_alternateRowColour = colour; }
    const wxColour& GetAlternateRowColour() const { return m_alternateRowColour; }
    void SetImageList(wxImageList* images, int which);
    wxImageList* GetImageList(int which) const;
    wxImageList* GetSmallImages() const { return m_smallImages; }
    // Column-resize guide of the header, in this window's x; -1 hides it.
    void SetResizeGuide(int x);
    int GetResizeGuide() const { return m_resizeGuideX; }
    bool HasListFocus() const { return m_hasFocus; }

    // Draws the rows that the update rectangle touches into any DC.
    void Render(wxDC& dc, const wxRect& update) const;
    // Virtual lists: tells the owner which rows the next paint asks for
    // (wxEVT_LIST_CACHE_HINT), once per distinct range.
    void HintVisibleRange();
    void ForgetCacheHint()
    {
        m_lastHintFrom = -1;
        m_lastHintTo = -1;
    }

    void OnInternalIdle() override;
    bool AcceptsFocus() const override { return true; }

private:
    // Layout
    int AutoColumnWidth(long col, bool useHeader) const;
    void LayOut();
    void UpdateLineHeight();
    void UpdateScrollbars();
    void ClampScrollPosition();
    void AfterCountChanged();

    // Painting (ProfilesKelvoListMainWindowPaint.cpp)
    void OnPaint(wxPaintEvent& event);
    void DrawRow(wxDC& dc, long item, const wxRect& rowRect, bool selected, bool odd) const;
    void DrawRules(wxDC& dc, long firstVisible, long lastVisible) const;
    void DrawResizeGuide(wxDC& dc) const;

    // Input (ProfilesKelvoListMainWindowInput.cpp)
    void OnMouse(wxMouseEvent& event);
    void OnKeyDown(wxKeyEvent& event);
    void OnScroll(wxScrollWinEvent& event);
    void OnSize(wxSizeEvent& event);
    void OnFocus(wxFocusEvent& event);
    void OnMouseWheel(wxMouseEvent& event);
    void ClickItem(long item, bool ctrl, bool shift);
    void MoveCurrentByKey(long target, bool ctrl, bool shift);
    bool SendListEvent(wxEventType type, long item, int column = -1) const;

    // Selection with notification: items leaving or joining the selection are
    // reported one by one, a bulk change of many rows by one event for item -1.
    void SelectNotifying(long item, bool selected);
    void SelectRangeNotifying(long first, long last);
    void DeselectOutsideNotifying(long first, long last);
    void SelectOnlyNotifying(long first, long last);
    void DeselectAllNotifying();
    void ChangeCurrentNotifying(long item);

    ProfilesKelvoProfilesListCtrl* m_owner;
    long m_listStyle;
    std::vector<ProfilesKelvoListColumn> m_columns;
    std::vector<ProfilesKelvoListLineData> m_lines;
    long m_virtualCount = 0;
    ProfilesKelvoListSelection m_selection;
    long m_current = -1;
    long m_anchor = -1;
    long m_topItem = 0;
    int m_scrollX = 0;
    int m_lineHeight = 24;
    bool m_dirty = true;
    bool m_hasFocus = false;
    int m_resizeGuideX = -1;
    int m_wheelRotation = 0;
    wxColour m_alternateRowColour;
    wxBrush m_focusedSelectionBrush;
    wxBrush m_unfocusedSelectionBrush;
    wxImageList* m_normalImages = nullptr;
    wxImageList* m_smallImages = nullptr;
    wxImageList* m_stateImages = nullptr;
    wxImageList* m_headerImages = nullptr;
    long m_lastHintFrom = -1;
    long m_lastHintTo = -1;
    mutable ProfilesKelvoListTextCache m_textCache;

    wxDECLARE_EVENT_TABLE();
};
