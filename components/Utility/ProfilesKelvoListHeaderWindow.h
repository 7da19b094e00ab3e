#pragma once

#include <wx/bitmap.h>
#include <wx/colour.h>
#include <wx/cursor.h>
#include <wx/event.h>
#include <wx/font.h>
#include <wx/window.h>

class ProfilesKelvoProfilesListCtrl;
class ProfilesKelvoListMainWindow;
struct headerStyle;

// The flat column header of the themed list: labels, sort-mark images, border
// lines, column clicks and resizing by dragging a column's right border.
class ProfilesKelvoListHeaderWindow : public wxWindow
{
public:
    // Width of the strip at the header's right end whose clicks report column -2.
    static constexpr int kRightEdgeClickWidth = 20;
    static constexpr int kStyledHeight = 25;

    ProfilesKelvoListHeaderWindow(ProfilesKelvoProfilesListCtrl* owner, ProfilesKelvoListMainWindow* rows,
                                  const headerStyle* style);

    int GetPreferredHeight() const;
    // The narrowest a column may be dragged to.
    int GetMinimumColumnWidth() const;
    // Column under client x, -2 for the right-end strip, -1 for none.
    int HitTestColumn(int x) const;
    // Column whose right border is under client x, or -1.
    int HitTestBorder(int x) const;
    bool IsResizing() const { return m_resizingColumn >= 0; }

    void Render(wxDC& dc) const;
    bool AcceptsFocus() const override { return false; }

private:
    void OnPaint(wxPaintEvent& event);
    void OnMouse(wxMouseEvent& event);
    void OnCaptureLost(wxMouseCaptureLostEvent& event);

    void BeginResize(int column, const wxPoint& point);
    void ContinueResize(const wxPoint& point);
    void EndResize(const wxPoint& point);
    int ResizedWidth(int x) const;
    void SetResizeGuide(int x);
    bool SendColumnEvent(wxEventType type, int column, const wxPoint& point, int width = -1) const;

    void DrawColumn(wxDC& dc, int column, int x, int bitmapWidth) const;

    ProfilesKelvoProfilesListCtrl* m_owner;
    ProfilesKelvoListMainWindow* m_rows;
    bool m_styled;
    int m_bitmapWidth = 0;
    wxColour m_textColour;
    wxCursor m_resizeCursor;
    wxCursor m_normalCursor;
    int m_resizingColumn = -1;
    int m_resizeColumnLeft = 0;
    int m_guideX = -1;

    wxDECLARE_EVENT_TABLE();
};
