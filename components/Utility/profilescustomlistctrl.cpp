#include "components/Utility/profilescustomlistctrl.h"

#include "components/Utility/ListAutomation.h"
#include "platform/themer/Themer.h"

#include <algorithm>

// clang-format off
wxBEGIN_EVENT_TABLE(ProfilesKelvoProfilesListCtrl, wxControl)
    EVT_SIZE(ProfilesKelvoProfilesListCtrl::OnSize)
wxEND_EVENT_TABLE()
    // clang-format on

    ProfilesKelvoProfilesListCtrl::ProfilesKelvoProfilesListCtrl(const headerStyle* style, wxWindow* parent,
                                                                 wxWindowID id, const wxPoint& pos,
                                                                 const wxSize& size, long listStyle,
                                                                 const wxValidator& validator,
                                                                 const wxString& name)
{
    Create(style, parent, id, pos, size, listStyle, validator, name);
}

ProfilesKelvoProfilesListCtrl::ProfilesKelvoProfilesListCtrl() = default;

ProfilesKelvoProfilesListCtrl::~ProfilesKelvoProfilesListCtrl() = default;

bool ProfilesKelvoProfilesListCtrl::Create(const headerStyle* style, wxWindow* parent, wxWindowID id,
                                           const wxPoint& pos, const wxSize& size, long listStyle,
                                           const wxValidator& validator, const wxString& name)
{
    // Only report mode exists; the other modes' flags are ignored.
    listStyle = (listStyle & ~(wxLC_ICON | wxLC_SMALL_ICON | wxLC_LIST)) | wxLC_REPORT;
    const long windowStyle = (listStyle & wxBORDER_MASK) | wxCLIP_CHILDREN;
    if (!wxControl::Create(parent, id, pos, size, windowStyle, validator, name))
        return false;
    SetWindowStyleFlag(listStyle);
    if (style)
        m_headerStyle = std::make_unique<headerStyle>(*style);

    // Colours and font of our own: without them every paint of the control
    // and of its rows asks GTK for the defaults, which builds a style context
    // each time, a third of what repainting an unchanged page costs.
    const Theme& theme = Themer::GetThemeService()->GetTheme("ListControl");
    SetOwnFont(GetFont());
    SetOwnForegroundColour(theme.textColour);
    SetOwnBackgroundColour(*wxWHITE);

    m_main = new ProfilesKelvoListMainWindow(this, wxID_ANY, listStyle);
    m_header = new ProfilesKelvoListHeaderWindow(this, m_main, m_headerStyle.get());
    m_main->SetFont(GetFont());
    m_main->SetOwnForegroundColour(GetForegroundColour());
    m_main->SetOwnBackgroundColour(GetBackgroundColour());
    LayoutChildren();
    SetInitialSize(size);
    m_automation = std::make_unique<ListAutomation>(*this);
    return true;
}

const automation::AutomationSource* ProfilesKelvoProfilesListCtrl::GetAutomationSource() const
{
    return m_automation ? &m_automation->Source() : nullptr;
}

void ProfilesKelvoProfilesListCtrl::RowsChanged()
{
    if (m_automation)
        m_automation->RowsChanged();
}

wxSize ProfilesKelvoProfilesListCtrl::DoGetBestClientSize() const
{
    // A list grows with its sizer; this is only what it asks for when alone.
    return wxSize(200, 150);
}

void ProfilesKelvoProfilesListCtrl::OnSize(wxSizeEvent& event)
{
    LayoutChildren();
    event.Skip();
}

void ProfilesKelvoProfilesListCtrl::LayoutChildren()
{
    if (!m_main || !m_header)
        return;
    const wxSize client = GetClientSize();
    const int headerHeight = std::min(m_header->GetPreferredHeight(), client.GetHeight());
    m_header->SetSize(0, 0, client.GetWidth(), headerHeight);
    m_main->SetSize(0, headerHeight, client.GetWidth(), client.GetHeight() - headerHeight);
}

// ---------------------------------------------------------------- columns

long ProfilesKelvoProfilesListCtrl::InsertColumn(long col, const wxString& heading, int format, int width)
{
    wxListItem info;
    info.SetText(heading);
    info.SetAlign(static_cast<wxListColumnFormat>(format));
    info.SetWidth(width);
    return InsertColumn(col, info);
}

long ProfilesKelvoProfilesListCtrl::InsertColumn(long col, const wxListItem& info)
{
    ProfilesKelvoListColumn column;
    const long mask = info.GetMask();
    if (mask & wxLIST_MASK_TEXT)
        column.text = info.GetText();
    if (mask & wxLIST_MASK_FORMAT)
        column.format = info.GetAlign();
    if (mask & wxLIST_MASK_IMAGE)
        column.image = info.GetImage();
    const int width = (mask & wxLIST_MASK_WIDTH) ? info.GetWidth() : -1;
    column.width = width;
    const long at = m_main->InsertColumn(col, column);
    if (width == wxLIST_AUTOSIZE_USEHEADER)
        m_main->SetColumnWidth(at, wxLIST_AUTOSIZE_USEHEADER);
    m_header->Refresh();
    return at;
}

bool ProfilesKelvoProfilesListCtrl::SetColumn(int col, const wxListItem& info)
{
    ProfilesKelvoListColumn* column = m_main->GetColumnAt(col);
    if (!column)
        return false;
    const long mask = info.GetMask();
    if (mask & wxLIST_MASK_TEXT)
        column->text = info.GetText();
    if (mask & wxLIST_MASK_FORMAT)
        column->format = info.GetAlign();
    if (mask & wxLIST_MASK_IMAGE)
        column->image = info.GetImage();
    if (mask & wxLIST_MASK_WIDTH)
        m_main->SetColumnWidth(col, info.GetWidth());
    m_header->Refresh();
    m_main->Refresh();
    return true;
}

bool ProfilesKelvoProfilesListCtrl::GetColumn(int col, wxListItem& info) const
{
    ProfilesKelvoListColumn* column = m_main->GetColumnAt(col);
    if (!column)
        return false;
    info.SetColumn(col);
    info.SetText(column->text);
    info.SetAlign(static_cast<wxListColumnFormat>(column->format));
    info.SetImage(column->image);
    info.SetWidth(column->width);
    return true;
}

int ProfilesKelvoProfilesListCtrl::GetColumnCount() const
{
    return m_main->GetColumnCount();
}

int ProfilesKelvoProfilesListCtrl::GetColumnWidth(int col) const
{
    const ProfilesKelvoListColumn* column = m_main->GetColumnAt(col);
    return column ? column->width : 0;
}

bool ProfilesKelvoProfilesListCtrl::SetColumnWidth(int col, int width)
{
    if (!m_main->GetColumnAt(col))
        return false;
    m_main->SetColumnWidth(col, width);
    m_header->Refresh();
    return true;
}

// ---------------------------------------------------------------- items

long ProfilesKelvoProfilesListCtrl::InsertItem(long index, const wxString& label, int imageIndex)
{
    wxListItem info;
    info.SetId(index);
    info.SetText(label);
    info.SetImage(imageIndex);
    return InsertItem(info);
}

long ProfilesKelvoProfilesListCtrl::InsertItem(const wxListItem& info)
{
    if (IsVirtual())
        return -1;
    ProfilesKelvoListLineData line(static_cast<size_t>(GetColumnCount()));
    ProfilesKelvoListCell& cell = line.Cell(0);
    const long mask = info.GetMask();
    if (mask & wxLIST_MASK_TEXT)
        cell.text = info.GetText();
    if (mask & wxLIST_MASK_IMAGE)
        cell.image = info.GetImage();
    if (mask & wxLIST_MASK_DATA)
        line.SetData(info.GetData());
    const long at = m_main->InsertLine(info.GetId(), std::move(line));
    if (at >= 0 && (mask & wxLIST_MASK_STATE))
        SetItemState(at, info.GetState(), info.m_stateMask);
    RowsChanged();
    return at;
}

long ProfilesKelvoProfilesListCtrl::InsertItems(long index, std::vector<ProfilesKelvoListLineData> lines)
{
    const long at = m_main->InsertLines(index, std::move(lines));
    RowsChanged();
    return at;
}

bool ProfilesKelvoProfilesListCtrl::SetItem(long index, int col, const wxString& label, int imageId)
{
    wxListItem info;
    info.SetId(index);
    info.SetColumn(col);
    info.SetText(label);
    if (imageId != kCellImageNone)
        info.SetImage(imageId);
    return SetItem(info);
}

bool ProfilesKelvoProfilesListCtrl::SetItem(wxListItem& info)
{
    const long item = info.GetId();
    const int col = info.GetColumn();
    const long mask = info.GetMask();
    if (item < 0 || item >= GetItemCount() || col < 0)
        return false;
    if (mask & wxLIST_MASK_STATE)
        SetItemState(item, info.GetState(), info.m_stateMask);
    ProfilesKelvoListLineData* line = m_main->GetStoredLine(item);
    if (!line)
    {
        // Virtual rows carry nothing of their own but their state.
        return (mask & wxLIST_MASK_STATE) != 0;
    }
    ProfilesKelvoListCell& cell = line->Cell(col);
    if (mask & wxLIST_MASK_TEXT)
        cell.text = info.GetText();
    if (mask & wxLIST_MASK_IMAGE)
        cell.image = info.GetImage();
    if (mask & wxLIST_MASK_DATA)
        line->SetData(info.GetData());
    if (const wxItemAttr* attr = info.GetAttributes())
    {
        if (attr->HasTextColour())
            line->Attr().textColour = attr->GetTextColour();
        if (attr->HasBackgroundColour())
            line->Attr().backgroundColour = attr->GetBackgroundColour();
        if (attr->HasFont())
            line->Attr().font = attr->GetFont();
    }
    m_main->RefreshLine(item);
    return true;
}

bool ProfilesKelvoProfilesListCtrl::SetItemData(long item, long data)
{
    return SetItemPtrData(item, static_cast<wxUIntPtr>(data));
}

bool ProfilesKelvoProfilesListCtrl::SetItemPtrData(long item, wxUIntPtr data)
{
    ProfilesKelvoListLineData* line = m_main->GetStoredLine(item);
    if (!line)
        return false;
    line->SetData(data);
    return true;
}

wxUIntPtr ProfilesKelvoProfilesListCtrl::GetItemData(long item) const
{
    const ProfilesKelvoListLineData* line = m_main->GetStoredLine(item);
    return line ? line->GetData() : 0;
}

bool ProfilesKelvoProfilesListCtrl::GetItem(wxListItem& info) const
{
    const long item = info.GetId();
    const int col = info.GetColumn();
    if (item < 0 || item >= GetItemCount() || col < 0 || (col > 0 && col >= GetColumnCount()))
        return false;

    const long mask = info.GetMask();
    ProfilesKelvoListCellAttr attr;
    if (IsVirtual())
    {
        if (mask & wxLIST_MASK_TEXT)
            info.SetText(OnGetItemText(item, col));
        if (mask & wxLIST_MASK_IMAGE)
            info.SetImage(OnGetItemImage(item, col));
        if (const wxItemAttr* own = OnGetItemAttr(item, col))
        {
            attr.textColour = own->GetTextColour();
            attr.backgroundColour = own->GetBackgroundColour();
            attr.font = own->GetFont();
        }
    }
    else
    {
        const ProfilesKelvoListLineData& line = *m_main->GetStoredLine(item);
        const ProfilesKelvoListCell& cell = line.GetCell(col);
        if (mask & wxLIST_MASK_TEXT)
            info.SetText(cell.text);
        if (mask & wxLIST_MASK_IMAGE)
            info.SetImage(cell.image);
        if (mask & wxLIST_MASK_DATA)
            info.SetData(line.GetData());
        attr = ProfilesKelvoListMainWindow::EffectiveAttr(line, col);
    }
    if (mask & wxLIST_MASK_STATE)
    {
        const long stateMask =
            info.m_stateMask ? info.m_stateMask : long(wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED);
        info.m_state = GetItemState(item, stateMask);
        info.m_stateMask = stateMask;
    }

    // Rows are drawn in the theme's text colour whatever colour they carry, so
    // that is the colour reported.
    if (attr.textColour.IsOk())
        info.SetTextColour(Themer::GetThemeService()->GetTheme("ListControl").textColour);
    if (attr.backgroundColour.IsOk())
        info.SetBackgroundColour(attr.backgroundColour);
    if (attr.font.IsOk())
        info.SetFont(attr.font);
    return true;
}

wxString ProfilesKelvoProfilesListCtrl::GetItemText(long item, int col) const
{
    wxListItem info;
    info.SetId(item);
    info.SetColumn(col);
    info.SetMask(wxLIST_MASK_TEXT);
    return GetItem(info) ? info.GetText() : wxString();
}

bool ProfilesKelvoProfilesListCtrl::SetItemTextColour(long item, const wxColour& colour)
{
    ProfilesKelvoListLineData* line = m_main->GetStoredLine(item);
    if (!line)
        return false;
    line->Attr().textColour = colour;
    m_main->RefreshLine(item);
    return true;
}

bool ProfilesKelvoProfilesListCtrl::SetItemBackgroundColour(long item, const wxColour& colour)
{
    ProfilesKelvoListLineData* line = m_main->GetStoredLine(item);
    if (!line)
        return false;
    line->Attr().backgroundColour = colour;
    m_main->RefreshLine(item);
    return true;
}

long ProfilesKelvoProfilesListCtrl::GetItemCount() const
{
    return m_main->GetItemCount();
}

int ProfilesKelvoProfilesListCtrl::GetSelectedItemCount() const
{
    return static_cast<int>(m_main->GetSelectedCount());
}

long ProfilesKelvoProfilesListCtrl::GetNextItem(long item, int geometry, int state) const
{
    const long count = GetItemCount();
    if (geometry == wxLIST_NEXT_ABOVE || geometry == wxLIST_NEXT_LEFT)
    {
        // Backwards: rare, and only ever over a small non-virtual list.
        for (long i = std::min(item, count) - 1; i >= 0; --i)
        {
            if (state == wxLIST_STATE_DONTCARE || (GetItemState(i, state) & state))
                return i;
        }
        return -1;
    }
    if (state & wxLIST_STATE_SELECTED)
    {
        for (long i = m_main->GetNextSelected(item); i >= 0 && i < count; i = m_main->GetNextSelected(i))
        {
            if (!(state & wxLIST_STATE_FOCUSED) || i == m_main->GetCurrent())
                return i;
        }
        return -1;
    }
    if (state & wxLIST_STATE_FOCUSED)
        return m_main->GetCurrent() > item ? m_main->GetCurrent() : -1;
    const long next = item + 1;
    return next < count ? next : -1;
}

bool ProfilesKelvoProfilesListCtrl::SetItemState(long item, long state, long stateMask)
{
    if (item == -1)
    {
        if (stateMask & wxLIST_STATE_SELECTED)
            m_main->SetAllSelected((state & wxLIST_STATE_SELECTED) != 0);
        if ((stateMask & wxLIST_STATE_FOCUSED) && !(state & wxLIST_STATE_FOCUSED))
            m_main->ClearCurrentIf(m_main->GetCurrent());
        return true;
    }
    if (item < 0 || item >= GetItemCount())
        return false;
    if (stateMask & wxLIST_STATE_FOCUSED)
    {
        if (state & wxLIST_STATE_FOCUSED)
            m_main->SetCurrent(item);
        else
            m_main->ClearCurrentIf(item);
    }
    if (stateMask & wxLIST_STATE_SELECTED)
        m_main->SetItemSelected(item, (state & wxLIST_STATE_SELECTED) != 0);
    return true;
}

int ProfilesKelvoProfilesListCtrl::GetItemState(long item, long stateMask) const
{
    if (item < 0 || item >= GetItemCount())
        return 0;
    int state = 0;
    if (m_main->IsSelected(item))
        state |= wxLIST_STATE_SELECTED;
    if (m_main->GetCurrent() == item)
        state |= wxLIST_STATE_FOCUSED;
    return state & static_cast<int>(stateMask);
}

bool ProfilesKelvoProfilesListCtrl::DeleteItem(long item)
{
    if (!m_main->DeleteLine(item))
        return false;
    RowsChanged();
    wxListEvent event(wxEVT_LIST_DELETE_ITEM, GetId());
    event.SetEventObject(this);
    event.SetIndex(item);
    GetEventHandler()->ProcessEvent(event);
    return true;
}

bool ProfilesKelvoProfilesListCtrl::DeleteAllItems()
{
    const bool hadItems = GetItemCount() > 0;
    m_main->DeleteAllLines();
    RowsChanged();
    if (hadItems)
    {
        wxListEvent event(wxEVT_LIST_DELETE_ALL_ITEMS, GetId());
        event.SetEventObject(this);
        GetEventHandler()->ProcessEvent(event);
    }
    return true;
}

void ProfilesKelvoProfilesListCtrl::SetItemCount(long count)
{
    m_main->SetItemCount(count);
    RowsChanged();
}

void ProfilesKelvoProfilesListCtrl::RefreshItem(long item)
{
    m_main->RefreshLine(item);
}

void ProfilesKelvoProfilesListCtrl::RefreshItems(long from, long to)
{
    m_main->RefreshLines(from, to);
}

bool ProfilesKelvoProfilesListCtrl::EnsureVisible(long item)
{
    if (item < 0 || item >= GetItemCount())
        return false;
    m_main->LayoutIfNeeded();
    m_main->EnsureVisible(item);
    return true;
}

long ProfilesKelvoProfilesListCtrl::GetTopItem() const
{
    return m_main->GetTopItem();
}

int ProfilesKelvoProfilesListCtrl::GetCountPerPage() const
{
    return static_cast<int>(m_main->GetCountPerPage());
}

bool ProfilesKelvoProfilesListCtrl::GetItemRect(long item, wxRect& rect) const
{
    if (item < 0 || item >= GetItemCount())
        return false;
    rect = m_main->GetItemRect(item);
    return true;
}

bool ProfilesKelvoProfilesListCtrl::GetSubItemRect(long item, long subItem, wxRect& rect) const
{
    if (item < 0 || item >= GetItemCount() || subItem < 0 || subItem >= GetColumnCount())
        return false;
    rect = m_main->GetSubItemRect(item, subItem);
    return true;
}

bool ProfilesKelvoProfilesListCtrl::IsVirtual() const
{
    return m_main->IsVirtual();
}

// ---------------------------------------------------------------- look

void ProfilesKelvoProfilesListCtrl::SetImageList(wxImageList* images, int which)
{
    m_main->SetImageList(images, which);
    m_header->Refresh();
}

wxImageList* ProfilesKelvoProfilesListCtrl::GetImageList(int which) const
{
    return m_main->GetImageList(which);
}

void ProfilesKelvoProfilesListCtrl::SetAlternateRowColour(const wxColour& colour)
{
    m_main->SetAlternateRowColour(colour);
    m_main->Refresh();
}

bool ProfilesKelvoProfilesListCtrl::SetBackgroundColour(const wxColour& colour)
{
    const bool changed = wxControl::SetBackgroundColour(colour);
    if (m_main)
    {
        m_main->SetBackgroundColour(colour);
        m_main->MarkDirty();
    }
    return changed;
}

bool ProfilesKelvoProfilesListCtrl::SetFont(const wxFont& font)
{
    if (!wxControl::SetFont(font))
        return false;
    if (m_main)
    {
        m_main->SetFont(font);
        m_main->MarkDirty();
        LayoutChildren();
    }
    return true;
}

// ---------------------------------------------------------------- virtual callbacks

wxString ProfilesKelvoProfilesListCtrl::OnGetItemText(long, long) const
{
    return wxString();
}

int ProfilesKelvoProfilesListCtrl::OnGetItemImage(long, long) const
{
    return kCellImageNone;
}

wxItemAttr* ProfilesKelvoProfilesListCtrl::OnGetItemAttr(long, long) const
{
    return nullptr;
}
