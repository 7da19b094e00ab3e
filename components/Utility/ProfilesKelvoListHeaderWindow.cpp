#include "components/Utility/ProfilesKelvoListHeaderWindow.h"

#include "components/Utility/profilescustomlistctrl.h"
#include "platform/themer/Themer.h"

#include <wx/dcbuffer.h>
#include <wx/settings.h>

#include <algorithm>

namespace
{
constexpr int kBorderGrip = 3;
constexpr int kLabelPadding = 8;
constexpr int kLabelIndent = 4;
constexpr int kImageGap = 2;
constexpr int kPlainHeaderExtra = 6;
constexpr int kMinWidthImageGap = 5;
} // namespace

// clang-format off
wxBEGIN_EVENT_TABLE(ProfilesKelvoListHeaderWindow, wxWindow)
    EVT_PAINT(ProfilesKelvoListHeaderWindow::OnPaint)
    EVT_MOUSE_EVENTS(ProfilesKelvoListHeaderWindow::OnMouse)
    EVT_MOUSE_CAPTURE_LOST(ProfilesKelvoListHeaderWindow::OnCaptureLost)
wxEND_EVENT_TABLE()
    // clang-format on

    ProfilesKelvoListHeaderWindow::ProfilesKelvoListHeaderWindow(ProfilesKelvoProfilesListCtrl* owner,
                                                                 ProfilesKelvoListMainWindow* rows,
                                                                 const headerStyle* style)
    : m_owner(owner), m_rows(rows), m_styled(style != nullptr), m_resizeCursor(wxCURSOR_SIZEWE),
      m_normalCursor(wxCURSOR_ARROW)
{
    SetBackgroundStyle(wxBG_STYLE_PAINT);
    Create(owner, wxID_ANY, wxDefaultPosition, wxDefaultSize, wxBORDER_NONE, wxS("wxlistctrlcolumntitles"));

    const Theme& theme = Themer::GetThemeService()->GetTheme("ListControl");
    SetOwnForegroundColour(theme.foregroundColour);
    SetOwnBackgroundColour(theme.controlColour);
    SetOwnFont(wxSystemSettings::GetFont(wxSYS_DEFAULT_GUI_FONT));
    m_textColour = theme.foregroundColour;
    if (style)
    {
        if (style->font.IsOk())
            SetOwnFont(style->font);
        if (style->textColour.IsOk())
            m_textColour = style->textColour;
        if (style->bitmap.IsOk())
            m_bitmapWidth = style->bitmap.GetWidth();
    }
}

int ProfilesKelvoListHeaderWindow::GetPreferredHeight() const
{
    if (m_styled)
        return kStyledHeight;
    int height = 0;
    int descent = 0;
    GetTextExtent(wxS("Hg"), nullptr, &height, &descent);
    return height + descent + kPlainHeaderExtra;
}

int ProfilesKelvoListHeaderWindow::GetMinimumColumnWidth() const
{
    int width = GetTextExtent(wxS("M")).GetWidth() + kLabelPadding;
    wxImageList* images = m_rows->GetImageList(kHeaderImageList);
    if (!images)
        images = m_rows->GetSmallImages();
    if (images && images->GetImageCount() > 0)
    {
        int imageWidth = 0;
        int imageHeight = 0;
        images->GetSize(0, imageWidth, imageHeight);
        width += imageWidth + kMinWidthImageGap;
    }
    return width;
}

int ProfilesKelvoListHeaderWindow::HitTestColumn(int x) const
{
    const int width = GetClientSize().GetWidth();
    if (x > width - kRightEdgeClickWidth && x < width)
        return -2;
    int left = -m_rows->GetScrollX();
    const auto& columns = m_rows->GetColumns();
    for (size_t col = 0; col < columns.size(); ++col)
    {
        if (x >= left && x < left + columns[col].width)
            return static_cast<int>(col);
        left += columns[col].width;
    }
    return -1;
}

int ProfilesKelvoListHeaderWindow::HitTestBorder(int x) const
{
    const auto& columns = m_rows->GetColumns();
    // From the right, so that a column dragged down to nothing can be widened again.
    int right = m_rows->GetTotalColumnWidth() - m_rows->GetScrollX();
    for (size_t col = columns.size(); col-- > 0;)
    {
        if (x >= right - kBorderGrip && x <= right + kBorderGrip)
            return static_cast<int>(col);
        right -= columns[col].width;
    }
    return -1;
}

// ---------------------------------------------------------------- painting

void ProfilesKelvoListHeaderWindow::OnPaint(wxPaintEvent&)
{
    wxAutoBufferedPaintDC dc(this);
    Render(dc);
}

void ProfilesKelvoListHeaderWindow::Render(wxDC& dc) const
{
    const wxSize size = GetClientSize();
    const Theme& headerTheme = Themer::GetThemeService()->GetTheme("HeaderView");
    dc.SetBrush(wxBrush(GetBackgroundColour(), wxBRUSHSTYLE_SOLID));
    dc.SetPen(wxPen(headerTheme.lineColour, 1, wxPENSTYLE_SOLID));
    dc.DrawRectangle(0, 0, size.GetWidth(), size.GetHeight());

    dc.SetFont(GetFont());
    dc.SetTextForeground(m_textColour);
    dc.SetBackgroundMode(wxBRUSHSTYLE_TRANSPARENT);
    int x = -m_rows->GetScrollX();
    const auto& columns = m_rows->GetColumns();
    for (size_t col = 0; col < columns.size() && x < size.GetWidth(); ++col)
    {
        DrawColumn(dc, static_cast<int>(col), x, m_bitmapWidth);
        x += columns[col].width;
    }

    if (m_guideX >= 0)
    {
        dc.SetPen(*wxTRANSPARENT_PEN);
        dc.SetBrush(wxBrush(headerTheme.lineColour, wxBRUSHSTYLE_SOLID));
        dc.DrawRectangle(m_guideX - 1, 0, 2, size.GetHeight());
    }
}

void ProfilesKelvoListHeaderWindow::DrawColumn(wxDC& dc, int column, int x, int bitmapWidth) const
{
    const ProfilesKelvoListColumn& info = m_rows->GetColumns()[column];
    const int width = info.width;
    const int height = GetClientSize().GetHeight();
    const Theme& headerTheme = Themer::GetThemeService()->GetTheme("HeaderView");

    dc.SetPen(wxPen(headerTheme.lineColour, 1, wxPENSTYLE_SOLID));
    const int lineX = x + width - bitmapWidth;
    dc.DrawLine(lineX, 0, lineX, height);

    wxImageList* images = m_rows->GetImageList(kHeaderImageList);
    const bool hasImage = images && info.image >= 0 && info.image < images->GetImageCount();
    const wxSize label = dc.GetTextExtent(info.text);
    int imageWidth = 0;
    int imageHeight = 0;
    if (hasImage)
        images->GetSize(info.image, imageWidth, imageHeight);

    int needed = label.GetWidth() + kLabelPadding;
    if (hasImage)
        needed += imageWidth + kImageGap;
    int aligned = x;
    if (needed < width)
    {
        if (info.format == wxLIST_FORMAT_RIGHT)
            aligned = x + width - needed;
        else if (info.format == wxLIST_FORMAT_CENTRE || info.format == kColumnFormatProgress)
            aligned = x + (width - needed) / 2;
    }

    int clipWidth = width;
    if (hasImage && !info.text.empty())
    {
        images->Draw(info.image, dc, aligned + std::min(needed, width) - imageWidth - kImageGap,
                     (height - imageHeight - 4) / 2 + 1, wxIMAGELIST_DRAW_TRANSPARENT);
        clipWidth -= imageWidth + kImageGap;
    }
    if (info.text.empty() || clipWidth <= 0)
        return;
    wxDCClipper clip(dc, wxRect(x, 1, clipWidth, height - 4));
    dc.DrawText(info.text, aligned + kLabelIndent, height / 2 - label.GetHeight() / 2);
}

// ---------------------------------------------------------------- mouse

void ProfilesKelvoListHeaderWindow::OnMouse(wxMouseEvent& event)
{
    const wxPoint point = event.GetPosition();
    if (IsResizing())
    {
        if (event.LeftUp())
            EndResize(point);
        else if (event.Dragging() || event.Moving())
            ContinueResize(point);
        return;
    }

    const int border = HitTestBorder(point.x);
    if (event.Moving() || event.Entering())
        SetCursor(border >= 0 ? m_resizeCursor : m_normalCursor);
    else if (event.Leaving())
        SetCursor(m_normalCursor);

    if (event.LeftDown())
    {
        if (border >= 0)
        {
            BeginResize(border, point);
            return;
        }
        const int column = HitTestColumn(point.x);
        if (column != -1)
            SendColumnEvent(wxEVT_LIST_COL_CLICK, column, point);
        return;
    }
    if (event.RightUp())
    {
        const int column = border >= 0 ? -1 : HitTestColumn(point.x);
        if (column != -1)
            SendColumnEvent(wxEVT_LIST_COL_RIGHT_CLICK, column, point);
        return;
    }
    event.Skip();
}

void ProfilesKelvoListHeaderWindow::OnCaptureLost(wxMouseCaptureLostEvent&)
{
    m_resizingColumn = -1;
    SetResizeGuide(-1);
}

void ProfilesKelvoListHeaderWindow::BeginResize(int column, const wxPoint& point)
{
    if (!SendColumnEvent(wxEVT_LIST_COL_BEGIN_DRAG, column, point, m_rows->GetColumns()[column].width))
        return;
    m_resizingColumn = column;
    m_resizeColumnLeft = m_rows->GetColumnLeft(column) - m_rows->GetScrollX();
    CaptureMouse();
    SetResizeGuide(m_resizeColumnLeft + ResizedWidth(point.x));
}

void ProfilesKelvoListHeaderWindow::ContinueResize(const wxPoint& point)
{
    const int width = ResizedWidth(point.x);
    SetResizeGuide(m_resizeColumnLeft + width);
    SendColumnEvent(wxEVT_LIST_COL_DRAGGING, m_resizingColumn, point, width);
}

void ProfilesKelvoListHeaderWindow::EndResize(const wxPoint& point)
{
    const int column = m_resizingColumn;
    const int width = ResizedWidth(point.x);
    m_resizingColumn = -1;
    if (HasCapture())
        ReleaseMouse();
    SetResizeGuide(-1);
    m_rows->SetColumnWidth(column, width);
    Refresh();
    SendColumnEvent(wxEVT_LIST_COL_END_DRAG, column, point, width);
}

int ProfilesKelvoListHeaderWindow::ResizedWidth(int x) const
{
    return std::max(GetMinimumColumnWidth(), x - m_resizeColumnLeft);
}

void ProfilesKelvoListHeaderWindow::SetResizeGuide(int x)
{
    if (x == m_guideX)
        return;
    m_guideX = x;
    m_rows->SetResizeGuide(x >= 0 ? x - 1 : -1);
    Refresh();
}

bool ProfilesKelvoListHeaderWindow::SendColumnEvent(wxEventType type, int column, const wxPoint& point,
                                                    int width) const
{
    wxListEvent event(type, m_owner->GetId());
    event.SetEventObject(m_owner);
    event.SetColumn(column);
    event.SetPoint(point);
    wxListItem item;
    item.SetColumn(column);
    if (width >= 0)
        item.SetWidth(width);
    event.SetItem(item);
    m_owner->GetEventHandler()->ProcessEvent(event);
    return event.IsAllowed();
}
