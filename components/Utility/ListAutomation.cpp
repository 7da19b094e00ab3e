#include "components/Utility/ListAutomation.h"

#include "components/Utility/profilescustomlistctrl.h"
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

automation::Alignment ToAlignment(wxListColumnFormat format)
{
    switch (static_cast<int>(format))
    {
    case wxLIST_FORMAT_RIGHT:
        return automation::Alignment::Right;
    case wxLIST_FORMAT_CENTRE:
    case kColumnFormatProgress: // progress bars are drawn centred under a centred heading
        return automation::Alignment::Centre;
    default:
        return automation::Alignment::Left;
    }
}

bool ColumnOf(const ProfilesKelvoProfilesListCtrl& list, int column, automation::ColumnInfo& info)
{
    wxListItem item;
    if (column < 0 || column >= list.GetColumnCount() || !list.GetColumn(column, item))
        return false;
    info.heading = Utf16(item.GetText());
    info.width = item.GetWidth();
    info.alignment = ToAlignment(item.GetAlign());
    info.image = item.GetImage();
    return true;
}

// The client area of a window on the screen.
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

// ---------------------------------------------------------------- header

HeaderAutomationSource::HeaderAutomationSource(const ProfilesKelvoProfilesListCtrl& list,
                                               const ProfilesKelvoListHeaderWindow& header)
    : m_list(list), m_header(header)
{
}

std::uintptr_t HeaderAutomationSource::Handle() const
{
    return reinterpret_cast<std::uintptr_t>(m_header.GetHandle());
}

int HeaderAutomationSource::ColumnCount() const
{
    return m_list.GetColumnCount();
}

bool HeaderAutomationSource::Column(int column, automation::ColumnInfo& info) const
{
    return ColumnOf(m_list, column, info);
}

int HeaderAutomationSource::ScrolledLeft() const
{
    return -m_list.GetMainWindow()->GetScrollX();
}

automation::Rect HeaderAutomationSource::ClientRect() const
{
    return ToRect(m_header.GetClientRect());
}

bool HeaderAutomationSource::ScreenRect(automation::Rect& rect) const
{
    return ClientOnScreen(m_header, rect);
}

bool HeaderAutomationSource::IsShown() const
{
    return m_header.IsShownOnScreen();
}

// ---------------------------------------------------------------- list

ListAutomationSource::ListAutomationSource(const ProfilesKelvoProfilesListCtrl& list)
    : m_list(list), m_header(list, *list.GetHeaderWindow())
{
}

std::uintptr_t ListAutomationSource::Handle() const
{
    return reinterpret_cast<std::uintptr_t>(m_list.GetHandle());
}

std::u16string ListAutomationSource::AccessibleName() const
{
    return Utf16(m_list.GetAccessibleName());
}

std::u16string ListAutomationSource::AccessibleId() const
{
    return Utf16(m_list.GetName());
}

long ListAutomationSource::ItemCount() const
{
    return m_list.GetItemCount();
}

std::u16string ListAutomationSource::ItemText(long item, int column) const
{
    if (item < 0 || item >= ItemCount() || column < 0 || (column > 0 && column >= ColumnCount()))
        return std::u16string();
    return Utf16(m_list.GetItemText(item, column));
}

long ListAutomationSource::Current() const
{
    return m_list.GetMainWindow()->GetCurrent();
}

long ListAutomationSource::TopIndex() const
{
    return m_list.GetTopItem();
}

long ListAutomationSource::LastVisible() const
{
    return m_list.GetMainWindow()->GetLastVisibleItem();
}

unsigned ListAutomationSource::ItemState(long item) const
{
    // The list's state bits are the GUI library's.
    return static_cast<unsigned>(m_list.GetItemState(item, wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED));
}

int ListAutomationSource::ItemImage(long item, int column) const
{
    wxListItem info;
    info.SetId(item);
    info.SetColumn(column);
    info.SetMask(wxLIST_MASK_IMAGE);
    return m_list.GetItem(info) ? info.GetImage() : -1;
}

std::intptr_t ListAutomationSource::ItemData(long item) const
{
    return static_cast<std::intptr_t>(m_list.GetItemData(item));
}

bool ListAutomationSource::IsSingleSelection() const
{
    return m_list.HasFlag(wxLC_SINGLE_SEL);
}

long ListAutomationSource::SelectedCount() const
{
    return m_list.GetSelectedItemCount();
}

bool ListAutomationSource::ItemRect(long item, automation::Rect& rect) const
{
    wxRect area;
    if (!m_list.GetItemRect(item, area))
        return false;
    rect = ToRect(area);
    return true;
}

bool ListAutomationSource::CellRect(long item, int column, automation::Rect& rect) const
{
    wxRect area;
    if (!m_list.GetSubItemRect(item, column, area))
        return false;
    rect = ToRect(area);
    return true;
}

std::optional<int> ListAutomationSource::HeaderHeight() const
{
    const ProfilesKelvoListHeaderWindow* header = m_list.GetHeaderWindow();
    if (!header->IsShown())
        return std::nullopt;
    return header->GetSize().GetHeight();
}

bool ListAutomationSource::HasFocus() const
{
    return m_list.GetMainWindow()->HasListFocus();
}

int ListAutomationSource::ColumnCount() const
{
    return m_list.GetColumnCount();
}

bool ListAutomationSource::Column(int column, automation::ColumnInfo& info) const
{
    return ColumnOf(m_list, column, info);
}

automation::Rect ListAutomationSource::ClientRect() const
{
    return ToRect(m_list.GetClientRect());
}

bool ListAutomationSource::ScreenRect(automation::Rect& rect) const
{
    return ClientOnScreen(m_list, rect);
}

bool ListAutomationSource::IsShown() const
{
    return m_list.IsShownOnScreen();
}

// ---------------------------------------------------------------- wiring

ListAutomation::ListAutomation(ProfilesKelvoProfilesListCtrl& list)
    : m_list(list), m_source(list), m_exposure(list, m_source)
{
    m_list.Bind(wxEVT_LIST_ITEM_SELECTED, &ListAutomation::OnSelection, this);
    m_list.Bind(wxEVT_LIST_ITEM_DESELECTED, &ListAutomation::OnSelection, this);
    m_list.Bind(wxEVT_LIST_ITEM_FOCUSED, &ListAutomation::OnCurrent, this);
    m_list.GetMainWindow()->Bind(wxEVT_SET_FOCUS, &ListAutomation::OnFocus, this);
    m_list.GetMainWindow()->Bind(wxEVT_KILL_FOCUS, &ListAutomation::OnFocus, this);
}

ListAutomation::~ListAutomation()
{
    m_list.Unbind(wxEVT_LIST_ITEM_SELECTED, &ListAutomation::OnSelection, this);
    m_list.Unbind(wxEVT_LIST_ITEM_DESELECTED, &ListAutomation::OnSelection, this);
    m_list.Unbind(wxEVT_LIST_ITEM_FOCUSED, &ListAutomation::OnCurrent, this);
    m_list.GetMainWindow()->Unbind(wxEVT_SET_FOCUS, &ListAutomation::OnFocus, this);
    m_list.GetMainWindow()->Unbind(wxEVT_KILL_FOCUS, &ListAutomation::OnFocus, this);
}

void ListAutomation::OnSelection(wxListEvent& event)
{
    m_exposure.SelectionChanged();
    event.Skip();
}

void ListAutomation::OnCurrent(wxListEvent& event)
{
    m_exposure.CurrentChanged();
    event.Skip();
}

void ListAutomation::OnFocus(wxFocusEvent& event)
{
    // Seen before the rows window records it: the event says which way it went.
    m_exposure.FocusChanged(event.GetEventType() == wxEVT_SET_FOCUS);
    event.Skip();
}
