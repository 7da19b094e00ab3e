// Painting of the rows window: reads the list's state and draws, nothing else.
#include "components/Utility/ProfilesKelvoListCellPainter.h"
#include "components/Utility/ProfilesKelvoListMainWindow.h"
#include "components/Utility/profilescustomlistctrl.h"
#include "platform/themer/Themer.h"
#include "platform/ui/DrawTextTruncate.h"

#include <wx/dcbuffer.h>

#include <algorithm>

namespace
{
constexpr int kCellTextMargin = 8;
constexpr int kImageTextGap = 5;
constexpr int kStatusMarkWidth = 24;
constexpr int kStatusCircleRadius = 9;
constexpr int kStatusCircleCentre = 12;
constexpr int kStatusSquareSize = 16;
} // namespace

void DrawListCellText(wxDC& dc, const wxString& text, int format, int x, int yMiddle, int width,
                      bool hasImage, ProfilesKelvoListTextCache* cache)
{
    const wxSize extent = cache ? cache->Extent(dc, text) : dc.GetTextExtent(text);
    const int y = yMiddle - (extent.GetHeight() + 1) / 2;
    const wxRect box(x, y, width, extent.GetHeight());

    if (format == kColumnFormatProgress)
    {
        wxDCClipper clip(dc, box);
        wxRect frame(x + 1, y + 1, width - 2, extent.GetHeight() - 2);
        dc.SetPen(wxPen(*wxLIGHT_GREY, 1));
        dc.SetBrush(*wxWHITE_BRUSH);
        dc.DrawRectangle(frame);
        double percent = 0;
        if (!text.ToCDouble(&percent))
            percent = 0;
        // Out-of-range percentages would paint outside the frame.
        percent = std::clamp(percent, 0.0, 100.0);
        frame.Deflate(1);
        frame.SetWidth(static_cast<int>(frame.GetWidth() * percent / 100));
        if (frame.GetWidth() > 0 && frame.GetHeight() > 0)
        {
            dc.SetPen(*wxTRANSPARENT_PEN);
            dc.SetBrush(*wxBLUE_BRUSH);
            dc.DrawRectangle(frame);
        }
        return;
    }

    if (extent.GetWidth() > width)
    {
        DrawTextTruncate(dc, text, box, 0, hasImage);
        return;
    }

    // A text that fits needs no clipping: it stays inside the box.
    int textX = x;
    if (format == wxLIST_FORMAT_RIGHT)
        textX = x + (width - extent.GetWidth());
    else if (format == wxLIST_FORMAT_CENTRE)
        textX = x + (width - extent.GetWidth()) / 2;
    if (cache)
        cache->Draw(dc, text, textX, y);
    else
        dc.DrawText(text, textX, y);
}

void DrawListStatusMark(wxDC& dc, int image, int x, int rowTop, const wxColour& fill)
{
    dc.SetPen(*wxBLACK_PEN);
    dc.SetBrush(wxBrush(fill, wxBRUSHSTYLE_SOLID));
    if (image == kCellImageStatusCircle)
        dc.DrawCircle(x + kStatusCircleCentre, rowTop + kStatusCircleCentre, kStatusCircleRadius);
    else if (image == kCellImageStatusSquare)
        dc.DrawRectangle(x + 3, rowTop + 4, kStatusSquareSize, kStatusSquareSize);
}

void ProfilesKelvoListMainWindow::OnPaint(wxPaintEvent&)
{
    // GTK paints before wx's idle time: a change made in an event handler
    // reaches the screen before the idle layout would run. Laying out here
    // keeps that frame from showing an empty list; the change already
    // invalidated the whole window, so this paint draws all of it.
    if (m_dirty)
        LayOut();
    wxAutoBufferedPaintDC dc(this);
    HintVisibleRange();
    Render(dc, GetUpdateRegion().GetBox());
}

void ProfilesKelvoListMainWindow::HintVisibleRange()
{
    if (!IsVirtual() || m_dirty || IsFrozen() || GetItemCount() == 0)
        return;
    const long from = m_topItem;
    const long to = GetLastVisibleItem();
    if (from == m_lastHintFrom && to == m_lastHintTo)
        return;
    m_lastHintFrom = from;
    m_lastHintTo = to;
    wxListEvent event(wxEVT_LIST_CACHE_HINT, m_owner->GetId());
    event.SetEventObject(m_owner);
    event.SetCacheFrom(from);
    event.SetCacheTo(to);
    m_owner->GetEventHandler()->ProcessEvent(event);
}

void ProfilesKelvoListMainWindow::Render(wxDC& dc, const wxRect& update) const
{
    const wxSize client = GetClientSize();
    dc.SetPen(*wxTRANSPARENT_PEN);
    dc.SetBrush(*wxWHITE_BRUSH);
    dc.DrawRectangle(0, 0, client.GetWidth(), client.GetHeight());

    const long count = GetItemCount();
    if (count > 0 && !m_dirty && !IsFrozen())
    {
        const long firstVisible = m_topItem;
        const long lastVisible = GetLastVisibleItem();
        const long firstDrawn =
            std::max(firstVisible, m_topItem + std::max(0, update.GetTop()) / m_lineHeight);
        const long lastDrawn =
            std::min(lastVisible, m_topItem + std::max(0, update.GetBottom()) / m_lineHeight);

        dc.SetFont(GetFont());
        dc.SetBackgroundMode(wxBRUSHSTYLE_TRANSPARENT);
        for (long item = firstDrawn; item <= lastDrawn; ++item)
            DrawRow(dc, item, GetItemRect(item), m_selection.IsSelected(item), item % 2 == 1);
        DrawRules(dc, firstVisible, lastVisible);
    }
    DrawResizeGuide(dc);
}

void ProfilesKelvoListMainWindow::DrawRow(wxDC& dc, long item, const wxRect& rowRect, bool selected,
                                          bool odd) const
{
    const Theme& theme = Themer::GetThemeService()->GetTheme("ListControl");
    // Stored rows are drawn in place; virtual ones are built from the callbacks.
    const ProfilesKelvoListLineData* stored = GetStoredLine(item);
    const ProfilesKelvoListLineData built = stored ? ProfilesKelvoListLineData() : GetLine(item);
    const ProfilesKelvoListLineData& line = stored ? *stored : built;
    const int clientWidth = GetClientSize().GetWidth();
    const int top = rowRect.GetTop();

    // Backgrounds first, column by column, so a cell never paints over its neighbour's text.
    int x = rowRect.GetLeft();
    for (size_t col = 0; col < m_columns.size() && x < clientWidth; ++col)
    {
        const int width = m_columns[col].width;
        const wxBrush* brush = nullptr;
        wxBrush own;
        const ProfilesKelvoListCellAttr attr = EffectiveAttr(line, col);
        if (selected)
            brush = m_hasFocus ? &m_focusedSelectionBrush : &m_unfocusedSelectionBrush;
        else if (attr.backgroundColour.IsOk())
            brush = &(own = wxBrush(attr.backgroundColour, wxBRUSHSTYLE_SOLID));
        else if (odd && m_alternateRowColour.IsOk())
            brush = &(own = wxBrush(m_alternateRowColour, wxBRUSHSTYLE_SOLID));
        if (brush && x + width > 0)
        {
            dc.SetPen(*wxTRANSPARENT_PEN);
            dc.SetBrush(*brush);
            dc.DrawRectangle(x, top, width, m_lineHeight);
        }
        x += width;
    }

    // A cell's own text colour only fills its status mark; text keeps the theme's.
    dc.SetTextForeground(selected ? theme.selectedTextColour : theme.textColour);
    const int yMiddle = top + m_lineHeight / 2;
    x = rowRect.GetLeft() + 1;
    for (size_t col = 0; col < m_columns.size() && x < clientWidth; ++col)
    {
        const ProfilesKelvoListColumn& column = m_columns[col];
        const int columnLeft = x;
        x += column.width;
        if (x <= 0)
            continue;

        const ProfilesKelvoListCell& cell = line.GetCell(col);
        const ProfilesKelvoListCellAttr attr = EffectiveAttr(line, col);
        int textX = columnLeft;
        int textWidth = column.width;
        if (cell.image == kCellImageStatusCircle || cell.image == kCellImageStatusSquare)
        {
            DrawListStatusMark(dc, cell.image, columnLeft, top,
                               attr.textColour.IsOk() ? attr.textColour : theme.textColour);
            textX += kStatusMarkWidth;
            textWidth -= kStatusMarkWidth;
        }
        else if (cell.image >= 0 && m_smallImages && cell.image < m_smallImages->GetImageCount())
        {
            const wxSize imageSize = m_smallImages->GetSize();
            m_smallImages->Draw(cell.image, dc, columnLeft, top + (m_lineHeight - imageSize.GetHeight()) / 2,
                                wxIMAGELIST_DRAW_TRANSPARENT);
            textX += imageSize.GetWidth() + kImageTextGap;
            textWidth -= imageSize.GetWidth() + kImageTextGap;
        }

        if (cell.text.empty())
            continue;
        const bool ownFont = attr.font.IsOk();
        if (ownFont)
            dc.SetFont(attr.font);
        DrawListCellText(dc, cell.text, column.format, textX, yMiddle, textWidth - kCellTextMargin,
                         cell.image != kCellImageNone, ownFont ? nullptr : &m_textCache);
        if (ownFont)
            dc.SetFont(GetFont());
    }
}

void ProfilesKelvoListMainWindow::DrawRules(wxDC& dc, long firstVisible, long lastVisible) const
{
    const bool horizontal = (m_listStyle & wxLC_HRULES) != 0;
    const bool vertical = (m_listStyle & wxLC_VRULES) != 0;
    if (!horizontal && !vertical)
        return;

    // Rules are filled one pixel wide: cairo strokes a line centred on its
    // coordinates, which the X server then rasterises as antialiased edges,
    // while a pixel-aligned fill is a plain rectangle for it.
    const Theme& theme = Themer::GetThemeService()->GetTheme("ListControl");
    dc.SetPen(*wxTRANSPARENT_PEN);
    dc.SetBrush(wxBrush(theme.lineColour, wxBRUSHSTYLE_SOLID));
    const int clientWidth = GetClientSize().GetWidth();
    if (horizontal)
    {
        for (long item = firstVisible + 1; item <= lastVisible; ++item)
            dc.DrawRectangle(0, GetItemRect(item).GetTop(), clientWidth, 1);
        if (lastVisible == GetItemCount() - 1)
            dc.DrawRectangle(0, GetItemRect(lastVisible).GetTop() + m_lineHeight, clientWidth, 1);
    }
    if (vertical)
    {
        const int top = GetItemRect(firstVisible).GetTop() - 1;
        const int bottom = GetItemRect(lastVisible).GetTop() + m_lineHeight;
        int x = -m_scrollX;
        for (const ProfilesKelvoListColumn& column : m_columns)
        {
            x += column.width;
            if (x - 2 >= clientWidth)
                break;
            dc.DrawRectangle(x - 2, top, 1, bottom - top);
        }
    }
}

void ProfilesKelvoListMainWindow::DrawResizeGuide(wxDC& dc) const
{
    if (m_resizeGuideX < 0)
        return;
    const Theme& theme = Themer::GetThemeService()->GetTheme("HeaderView");
    dc.SetPen(*wxTRANSPARENT_PEN);
    dc.SetBrush(wxBrush(theme.lineColour, wxBRUSHSTYLE_SOLID));
    dc.DrawRectangle(m_resizeGuideX, 0, 2, GetClientSize().GetHeight());
}
