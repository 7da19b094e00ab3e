#include "components/Utility/ProfilesKelvoListMainWindow.h"

#include "components/Utility/profilescustomlistctrl.h"
#include "platform/themer/Themer.h"

#include <algorithm>
#include <climits>
#include <iterator>
#include <type_traits>

namespace
{
// Room for the status circle (radius 9 around the row's 12th pixel) and a
// little air around the text.
constexpr int kMinLineHeight = 24;
constexpr int kLineTextPadding = 8;
constexpr int kDefaultColumnWidth = 80;
} // namespace

// clang-format off
wxBEGIN_EVENT_TABLE(ProfilesKelvoListMainWindow, wxWindow)
    EVT_PAINT(ProfilesKelvoListMainWindow::OnPaint)
    EVT_MOUSE_EVENTS(ProfilesKelvoListMainWindow::OnMouse)
    EVT_KEY_DOWN(ProfilesKelvoListMainWindow::OnKeyDown)
    EVT_SCROLLWIN(ProfilesKelvoListMainWindow::OnScroll)
    EVT_SIZE(ProfilesKelvoListMainWindow::OnSize)
    EVT_SET_FOCUS(ProfilesKelvoListMainWindow::OnFocus)
    EVT_KILL_FOCUS(ProfilesKelvoListMainWindow::OnFocus)
wxEND_EVENT_TABLE()
    // clang-format on

    ProfilesKelvoListMainWindow::ProfilesKelvoListMainWindow(ProfilesKelvoProfilesListCtrl* owner,
                                                             wxWindowID id, long listStyle)
    : m_owner(owner), m_listStyle(listStyle)
{
    SetBackgroundStyle(wxBG_STYLE_PAINT);
    Create(owner, id, wxDefaultPosition, wxDefaultSize, wxBORDER_NONE | wxWANTS_CHARS | wxVSCROLL | wxHSCROLL,
           wxS("listctrlmainwindow"));
    const Theme& theme = Themer::GetThemeService()->GetTheme("ListControl");
    m_focusedSelectionBrush = wxBrush(theme.selectionColour, wxBRUSHSTYLE_SOLID);
    m_unfocusedSelectionBrush = wxBrush(theme.inactiveSelectionColour, wxBRUSHSTYLE_SOLID);
    UpdateLineHeight();
}

// ---------------------------------------------------------------- columns

long ProfilesKelvoListMainWindow::InsertColumn(long col, const ProfilesKelvoListColumn& column)
{
    const long at = (col < 0 || col > GetColumnCount()) ? GetColumnCount() : col;
    ProfilesKelvoListColumn inserted = column;
    if (inserted.width < 0)
        inserted.width = kDefaultColumnWidth;
    m_columns.insert(m_columns.begin() + at, inserted);
    for (ProfilesKelvoListLineData& line : m_lines)
    {
        if (static_cast<size_t>(at) < line.GetCellCount())
            line.InsertCell(at);
    }
    MarkDirty();
    return at;
}

ProfilesKelvoListColumn* ProfilesKelvoListMainWindow::GetColumnAt(long col)
{
    return (col >= 0 && col < GetColumnCount()) ? &m_columns[col] : nullptr;
}

int ProfilesKelvoListMainWindow::GetTotalColumnWidth() const
{
    int total = 0;
    for (const ProfilesKelvoListColumn& column : m_columns)
        total += column.width;
    return total;
}

int ProfilesKelvoListMainWindow::GetColumnLeft(long col) const
{
    int left = 0;
    for (long i = 0; i < col && i < GetColumnCount(); ++i)
        left += m_columns[i].width;
    return left;
}

void ProfilesKelvoListMainWindow::SetColumnWidth(long col, int width)
{
    if (ProfilesKelvoListColumn* column = GetColumnAt(col))
    {
        if (width == wxLIST_AUTOSIZE || width == wxLIST_AUTOSIZE_USEHEADER)
            width = AutoColumnWidth(col, width == wxLIST_AUTOSIZE_USEHEADER);
        column->width = std::max(0, width);
        MarkDirty();
    }
}

int ProfilesKelvoListMainWindow::AutoColumnWidth(long col, bool useHeader) const
{
    constexpr int kTextRoom = 8 + 2 * 4;
    const ProfilesKelvoListColumn& column = m_columns[col];
    int widest = 0;
    if (useHeader)
    {
        widest = GetTextExtent(column.text).GetWidth();
        if (column.image >= 0 && m_headerImages)
            widest += m_headerImages->GetSize().GetWidth() + 2;
        return widest + kTextRoom;
    }
    // Virtual rows are measured only where they are seen.
    const long first = IsVirtual() ? m_topItem : 0;
    const long last = IsVirtual() ? GetLastVisibleItem() : GetItemCount() - 1;
    for (long item = first; item >= 0 && item <= last; ++item)
    {
        const ProfilesKelvoListLineData line = GetLine(item);
        const ProfilesKelvoListCell& cell = line.GetCell(col);
        int width = GetTextExtent(cell.text).GetWidth();
        if (cell.image >= 0 && m_smallImages)
            width += m_smallImages->GetSize().GetWidth() + 5;
        else if (cell.image == kCellImageStatusCircle || cell.image == kCellImageStatusSquare)
            width += 24;
        widest = std::max(widest, width);
    }
    return widest + kTextRoom;
}

// ---------------------------------------------------------------- items

long ProfilesKelvoListMainWindow::GetItemCount() const
{
    return IsVirtual() ? m_virtualCount : static_cast<long>(m_lines.size());
}

void ProfilesKelvoListMainWindow::SetItemCount(long count)
{
    if (!IsVirtual())
        return;
    m_virtualCount = std::max(0L, count);
    AfterCountChanged();
}

void ProfilesKelvoListMainWindow::AfterCountChanged()
{
    const long count = GetItemCount();
    m_selection.Truncate(count);
    if (m_current >= count)
        m_current = count - 1;
    if (m_anchor >= count)
        m_anchor = count > 0 ? count - 1 : -1;
    ForgetCacheHint();
    MarkDirty();
}

long ProfilesKelvoListMainWindow::InsertLine(long index, ProfilesKelvoListLineData line)
{
    if (IsVirtual())
        return -1;
    const long count = GetItemCount();
    const long at = (index < 0 || index > count) ? count : index;
    m_lines.insert(m_lines.begin() + at, std::move(line));
    if (at < count)
    {
        m_selection.InsertGap(at);
        if (m_current >= at)
            ++m_current;
        if (m_anchor >= at)
            ++m_anchor;
    }
    MarkDirty();
    return at;
}

// A growing list of a hundred thousand rows must move them, not copy every text.
static_assert(std::is_nothrow_move_constructible<ProfilesKelvoListLineData>::value, "rows must move cheaply");

long ProfilesKelvoListMainWindow::InsertLines(long index, std::vector<ProfilesKelvoListLineData> lines)
{
    if (IsVirtual())
        return -1;
    const long count = GetItemCount();
    const long at = (index < 0 || index > count) ? count : index;
    const long added = static_cast<long>(lines.size());
    if (added == 0)
        return at;
    if (count == 0)
    {
        // Taken whole, with the room the caller reserved for later appends.
        m_lines.swap(lines);
        MarkDirty();
        return at;
    }
    m_lines.insert(m_lines.begin() + at, std::make_move_iterator(lines.begin()),
                   std::make_move_iterator(lines.end()));
    if (at < count)
    {
        for (long i = 0; i < added; ++i)
            m_selection.InsertGap(at);
        if (m_current >= at)
            m_current += added;
        if (m_anchor >= at)
            m_anchor += added;
        MarkDirty();
        return at;
    }
    if (m_dirty)
        return at;
    // Appended: the rows above keep their place, so only the new ones and the
    // scrollbar's range need drawing.
    UpdateScrollbars();
    RefreshLines(at, at + added - 1);
    return at;
}

bool ProfilesKelvoListMainWindow::DeleteLine(long index)
{
    if (IsVirtual() || index < 0 || index >= GetItemCount())
        return false;
    m_lines.erase(m_lines.begin() + index);
    m_selection.Remove(index);
    if (m_current > index || m_current >= GetItemCount())
        --m_current;
    if (m_anchor > index || m_anchor >= GetItemCount())
        --m_anchor;
    MarkDirty();
    return true;
}

void ProfilesKelvoListMainWindow::DeleteAllLines()
{
    m_lines.clear();
    m_lines.shrink_to_fit();
    if (IsVirtual())
        m_virtualCount = 0;
    m_selection.Clear();
    m_current = -1;
    m_anchor = -1;
    m_topItem = 0;
    ForgetCacheHint();
    MarkDirty();
}

ProfilesKelvoListLineData* ProfilesKelvoListMainWindow::GetStoredLine(long item)
{
    if (IsVirtual() || item < 0 || item >= GetItemCount())
        return nullptr;
    return &m_lines[item];
}

const ProfilesKelvoListLineData* ProfilesKelvoListMainWindow::GetStoredLine(long item) const
{
    if (IsVirtual() || item < 0 || item >= GetItemCount())
        return nullptr;
    return &m_lines[item];
}

ProfilesKelvoListLineData ProfilesKelvoListMainWindow::GetLine(long item) const
{
    if (!IsVirtual())
    {
        const ProfilesKelvoListLineData* stored = GetStoredLine(item);
        return stored ? *stored : ProfilesKelvoListLineData(m_columns.size());
    }
    ProfilesKelvoListLineData line(m_columns.size());
    for (size_t col = 0; col < m_columns.size(); ++col)
    {
        ProfilesKelvoListCell& cell = line.Cell(col);
        cell.text = m_owner->OnGetItemText(item, static_cast<long>(col));
        cell.image = m_owner->OnGetItemImage(item, static_cast<long>(col));
        if (const wxItemAttr* attr = m_owner->OnGetItemAttr(item, static_cast<long>(col)))
        {
            if (attr->HasTextColour())
                cell.attr.textColour = attr->GetTextColour();
            if (attr->HasBackgroundColour())
                cell.attr.backgroundColour = attr->GetBackgroundColour();
            if (attr->HasFont())
                cell.attr.font = attr->GetFont();
        }
    }
    return line;
}

ProfilesKelvoListCellAttr ProfilesKelvoListMainWindow::EffectiveAttr(const ProfilesKelvoListLineData& line,
                                                                     size_t column)
{
    ProfilesKelvoListCellAttr attr = line.GetCell(column).attr;
    const ProfilesKelvoListCellAttr& row = line.GetAttr();
    if (!attr.textColour.IsOk())
        attr.textColour = row.textColour;
    if (!attr.backgroundColour.IsOk())
        attr.backgroundColour = row.backgroundColour;
    if (!attr.font.IsOk())
        attr.font = row.font;
    return attr;
}

// ---------------------------------------------------------------- selection and focus

void ProfilesKelvoListMainWindow::SetItemSelected(long item, bool selected)
{
    if (item < 0 || item >= GetItemCount())
        return;
    if (selected && IsSingleSelection())
    {
        if (m_selection.IsSelected(item) && m_selection.Count() == 1)
            return;
        SelectOnlyNotifying(item, item);
        return;
    }
    SelectNotifying(item, selected);
}

void ProfilesKelvoListMainWindow::SetAllSelected(bool selected)
{
    if (!selected)
    {
        DeselectAllNotifying();
        return;
    }
    if (IsSingleSelection() || GetItemCount() == 0)
        return;
    SelectOnlyNotifying(0, GetItemCount() - 1);
}

void ProfilesKelvoListMainWindow::SetCurrent(long item)
{
    if (item < 0 || item >= GetItemCount())
        return;
    ChangeCurrentNotifying(item);
}

void ProfilesKelvoListMainWindow::ClearCurrentIf(long item)
{
    if (m_current == item)
        m_current = -1;
}

void ProfilesKelvoListMainWindow::SelectNotifying(long item, bool selected)
{
    if (!m_selection.Select(item, selected))
        return;
    RefreshLine(item);
    SendListEvent(selected ? wxEVT_LIST_ITEM_SELECTED : wxEVT_LIST_ITEM_DESELECTED, item);
}

namespace
{
// Beyond this many rows a selection change is reported by one event for item -1.
constexpr long kMaxItemEvents = 100;
} // namespace

void ProfilesKelvoListMainWindow::DeselectOutsideNotifying(long first, long last)
{
    if (first > last)
        std::swap(first, last);
    std::vector<long> leaving;
    bool many = false;
    for (long item = m_selection.Next(-1); item >= 0; item = m_selection.Next(item))
    {
        if (item >= first && item <= last)
        {
            item = last;
            continue;
        }
        if (static_cast<long>(leaving.size()) == kMaxItemEvents)
        {
            many = true;
            break;
        }
        leaving.push_back(item);
    }
    if (!many)
    {
        for (long item : leaving)
            SelectNotifying(item, false);
        return;
    }
    if (first > 0)
        m_selection.SelectRange(0, first - 1, false);
    if (last < LONG_MAX)
        m_selection.SelectRange(last + 1, LONG_MAX, false);
    Refresh();
    SendListEvent(wxEVT_LIST_ITEM_DESELECTED, -1);
}

void ProfilesKelvoListMainWindow::SelectRangeNotifying(long first, long last)
{
    if (first > last)
        std::swap(first, last);
    if (last - first + 1 > kMaxItemEvents)
    {
        m_selection.SelectRange(first, last, true);
        Refresh();
        SendListEvent(wxEVT_LIST_ITEM_SELECTED, -1);
        return;
    }
    for (long item = first; item <= last; ++item)
        SelectNotifying(item, true);
}

void ProfilesKelvoListMainWindow::SelectOnlyNotifying(long first, long last)
{
    DeselectOutsideNotifying(first, last);
    SelectRangeNotifying(first, last);
}

void ProfilesKelvoListMainWindow::DeselectAllNotifying()
{
    if (m_selection.Empty())
        return;
    if (m_selection.Count() > kMaxItemEvents)
    {
        m_selection.Clear();
        Refresh();
        SendListEvent(wxEVT_LIST_ITEM_DESELECTED, -1);
        return;
    }
    for (long item = m_selection.Next(-1); item >= 0; item = m_selection.Next(-1))
        SelectNotifying(item, false);
}

void ProfilesKelvoListMainWindow::ChangeCurrentNotifying(long item)
{
    if (item == m_current)
        return;
    m_current = item;
    if (item >= 0)
        SendListEvent(wxEVT_LIST_ITEM_FOCUSED, item);
}

bool ProfilesKelvoListMainWindow::SendListEvent(wxEventType type, long item, int column) const
{
    wxListEvent event(type, m_owner->GetId());
    event.SetEventObject(m_owner);
    event.SetIndex(item);
    event.SetColumn(column);
    wxListItem info;
    info.SetId(item);
    info.SetColumn(column < 0 ? 0 : column);
    if (item >= 0 && item < GetItemCount())
    {
        info.SetMask(wxLIST_MASK_TEXT | wxLIST_MASK_IMAGE | wxLIST_MASK_DATA);
        m_owner->GetItem(info);
    }
    event.SetItem(info);
    m_owner->GetEventHandler()->ProcessEvent(event);
    return event.IsAllowed();
}

// ---------------------------------------------------------------- geometry

long ProfilesKelvoListMainWindow::GetCountPerPage() const
{
    return std::max(1, GetClientSize().GetHeight() / m_lineHeight);
}

long ProfilesKelvoListMainWindow::GetLastVisibleItem() const
{
    const long count = GetItemCount();
    if (count == 0)
        return -1;
    const int height = GetClientSize().GetHeight();
    const long rowsInView = std::max(1, (height + m_lineHeight - 1) / m_lineHeight);
    return std::min(count - 1, m_topItem + rowsInView - 1);
}

wxRect ProfilesKelvoListMainWindow::GetItemRect(long item) const
{
    return wxRect(-m_scrollX, static_cast<int>((item - m_topItem) * m_lineHeight),
                  std::max(GetTotalColumnWidth(), GetClientSize().GetWidth()), m_lineHeight);
}

wxRect ProfilesKelvoListMainWindow::GetSubItemRect(long item, long col) const
{
    const wxRect row = GetItemRect(item);
    if (col < 0 || col >= GetColumnCount())
        return row;
    return wxRect(row.x + GetColumnLeft(col), row.y, m_columns[col].width, m_lineHeight);
}

long ProfilesKelvoListMainWindow::HitTestItem(const wxPoint& point) const
{
    if (point.y < 0 || point.x + m_scrollX >= GetTotalColumnWidth())
        return -1;
    const long item = m_topItem + point.y / m_lineHeight;
    return item < GetItemCount() ? item : -1;
}

void ProfilesKelvoListMainWindow::EnsureVisible(long item)
{
    if (item < 0 || item >= GetItemCount())
        return;
    const long page = GetCountPerPage();
    if (item < m_topItem)
        ScrollToTop(item);
    else if (item >= m_topItem + page)
        ScrollToTop(item - page + 1);
}

void ProfilesKelvoListMainWindow::ScrollToTop(long item)
{
    const long old = m_topItem;
    m_topItem = item;
    ClampScrollPosition();
    if (m_topItem != old)
    {
        SetScrollPos(wxVERTICAL, static_cast<int>(m_topItem));
        Refresh();
    }
}

void ProfilesKelvoListMainWindow::ScrollToX(int x)
{
    const int old = m_scrollX;
    m_scrollX = x;
    ClampScrollPosition();
    if (m_scrollX != old)
    {
        SetScrollPos(wxHORIZONTAL, m_scrollX);
        Refresh();
        if (ProfilesKelvoListHeaderWindow* header = m_owner->GetHeaderWindow())
            header->Refresh();
    }
}

void ProfilesKelvoListMainWindow::ClampScrollPosition()
{
    const long maxTop = std::max(0L, GetItemCount() - GetCountPerPage());
    m_topItem = std::clamp(m_topItem, 0L, maxTop);
    const int maxX = std::max(0, GetTotalColumnWidth() - GetClientSize().GetWidth());
    m_scrollX = std::clamp(m_scrollX, 0, maxX);
}

// ---------------------------------------------------------------- layout

void ProfilesKelvoListMainWindow::MarkDirty()
{
    // One refresh per layout: bulk inserts would otherwise invalidate per row.
    if (m_dirty)
        return;
    m_dirty = true;
    Refresh();
}

void ProfilesKelvoListMainWindow::OnInternalIdle()
{
    wxWindow::OnInternalIdle();
    LayoutIfNeeded();
}

void ProfilesKelvoListMainWindow::LayoutIfNeeded()
{
    if (!m_dirty)
        return;
    LayOut();
    Refresh();
}

void ProfilesKelvoListMainWindow::LayOut()
{
    m_dirty = false;
    UpdateLineHeight();
    ClampScrollPosition();
    UpdateScrollbars();
    if (ProfilesKelvoListHeaderWindow* header = m_owner->GetHeaderWindow())
        header->Refresh();
}

void ProfilesKelvoListMainWindow::UpdateLineHeight()
{
    int textHeight = 0;
    GetTextExtent(wxS("Hg"), nullptr, &textHeight);
    int imageHeight = 0;
    if (m_smallImages && m_smallImages->GetImageCount() > 0)
        imageHeight = m_smallImages->GetSize().GetHeight();
    m_lineHeight = std::max({kMinLineHeight, textHeight + kLineTextPadding, imageHeight + kLineTextPadding});
}

void ProfilesKelvoListMainWindow::UpdateScrollbars()
{
    const wxSize client = GetClientSize();
    const long count = GetItemCount();
    const long page = GetCountPerPage();
    const int clampedCount = static_cast<int>(std::min<long>(count, INT_MAX));
    SetScrollbar(wxVERTICAL, static_cast<int>(m_topItem), static_cast<int>(page), clampedCount);
    SetScrollbar(wxHORIZONTAL, m_scrollX, client.GetWidth(), GetTotalColumnWidth());
}

void ProfilesKelvoListMainWindow::RefreshLine(long item)
{
    RefreshLines(item, item);
}

void ProfilesKelvoListMainWindow::RefreshLines(long from, long to)
{
    // The rows' data changed: an owner caching them needs a fresh hint.
    ForgetCacheHint();
    // A pending layout repaints everything anyway.
    if (m_dirty)
        return;
    if (from > to)
        std::swap(from, to);
    const long last = GetLastVisibleItem();
    from = std::max(from, m_topItem);
    to = std::min(to, last);
    if (from > to)
        return;
    const wxRect first = GetItemRect(from);
    RefreshRect(
        wxRect(0, first.y, GetClientSize().GetWidth(), static_cast<int>((to - from + 1) * m_lineHeight)));
}

// ---------------------------------------------------------------- look

void ProfilesKelvoListMainWindow::SetImageList(wxImageList* images, int which)
{
    switch (which)
    {
    case wxIMAGE_LIST_NORMAL:
        m_normalImages = images;
        break;
    case wxIMAGE_LIST_SMALL:
        m_smallImages = images;
        break;
    case wxIMAGE_LIST_STATE:
        m_stateImages = images;
        break;
    case kHeaderImageList:
        m_headerImages = images;
        break;
    default:
        return;
    }
    MarkDirty();
}

wxImageList* ProfilesKelvoListMainWindow::GetImageList(int which) const
{
    switch (which)
    {
    case wxIMAGE_LIST_NORMAL:
        return m_normalImages;
    case wxIMAGE_LIST_SMALL:
        return m_smallImages;
    case wxIMAGE_LIST_STATE:
        return m_stateImages;
    case kHeaderImageList:
        return m_headerImages;
    default:
        return nullptr;
    }
}

void ProfilesKelvoListMainWindow::SetResizeGuide(int x)
{
    if (x == m_resizeGuideX)
        return;
    m_resizeGuideX = x;
    Refresh();
}
