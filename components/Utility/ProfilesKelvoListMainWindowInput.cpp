// Mouse, keyboard, scrolling and focus of the rows window.
#include "components/Utility/ProfilesKelvoListMainWindow.h"
#include "components/Utility/profilescustomlistctrl.h"

#include <algorithm>

namespace
{
constexpr int kHorizontalScrollStep = 15;
} // namespace

void ProfilesKelvoListMainWindow::OnMouse(wxMouseEvent& event)
{
    if (event.GetEventType() == wxEVT_MOUSEWHEEL)
    {
        OnMouseWheel(event);
        return;
    }

    const long item = HitTestItem(event.GetPosition());
    if (event.LeftDown() || event.RightDown())
        SetFocus();

    if (event.LeftDClick())
    {
        if (item >= 0)
            SendListEvent(wxEVT_LIST_ITEM_ACTIVATED, item);
        return;
    }
    if (event.LeftDown())
    {
        ClickItem(item, event.CmdDown(), event.ShiftDown());
        return;
    }
    if (event.RightDown())
    {
        // As in native lists: a right click on an unselected row selects it first.
        if (item >= 0 && !IsSelected(item))
            ClickItem(item, false, false);
        if (item >= 0)
            SendListEvent(wxEVT_LIST_ITEM_RIGHT_CLICK, item);
        return;
    }
    event.Skip();
}

void ProfilesKelvoListMainWindow::ClickItem(long item, bool ctrl, bool shift)
{
    if (item < 0)
    {
        if (!IsSingleSelection() && !ctrl && !shift)
            DeselectAllNotifying();
        return;
    }

    if (IsSingleSelection() || (!ctrl && !shift))
    {
        DeselectOutsideNotifying(item, item);
        ChangeCurrentNotifying(item);
        SelectNotifying(item, true);
        m_anchor = item;
    }
    else if (!shift)
    {
        ChangeCurrentNotifying(item);
        SelectNotifying(item, !IsSelected(item));
        m_anchor = item;
    }
    else
    {
        const long anchor = m_anchor >= 0 ? m_anchor : item;
        if (!ctrl)
            DeselectOutsideNotifying(anchor, item);
        ChangeCurrentNotifying(item);
        SelectRangeNotifying(anchor, item);
        m_anchor = anchor;
    }
    EnsureVisible(item);
}

void ProfilesKelvoListMainWindow::OnKeyDown(wxKeyEvent& event)
{
    const int code = event.GetKeyCode();
    {
        wxListEvent report(wxEVT_LIST_KEY_DOWN, m_owner->GetId());
        report.SetEventObject(m_owner);
        report.SetKeyCode(code);
        report.SetIndex(m_current);
        m_owner->GetEventHandler()->ProcessEvent(report);
    }

    const long count = GetItemCount();
    const bool ctrl = event.ControlDown();
    const bool shift = event.ShiftDown();
    if (code == WXK_LEFT || code == WXK_NUMPAD_LEFT)
    {
        ScrollToX(m_scrollX - kHorizontalScrollStep);
        return;
    }
    if (code == WXK_RIGHT || code == WXK_NUMPAD_RIGHT)
    {
        ScrollToX(m_scrollX + kHorizontalScrollStep);
        return;
    }
    if (count == 0)
    {
        event.Skip();
        return;
    }

    const long current = m_current;
    const long page = GetCountPerPage();
    long target = -1;
    switch (code)
    {
    case WXK_UP:
    case WXK_NUMPAD_UP:
        target = current < 0 ? 0 : std::max(0L, current - 1);
        break;
    case WXK_DOWN:
    case WXK_NUMPAD_DOWN:
        target = current < 0 ? 0 : std::min(count - 1, current + 1);
        break;
    case WXK_PAGEUP:
    case WXK_NUMPAD_PAGEUP:
        // First to the top of the page, then a page further, keeping one row in view.
        target = (current < 0 || current > m_topItem) ? m_topItem : std::max(0L, current - (page - 1));
        break;
    case WXK_PAGEDOWN:
    case WXK_NUMPAD_PAGEDOWN:
    {
        const long pageBottom = std::min(count - 1, m_topItem + page - 1);
        target = (current < pageBottom) ? pageBottom : std::min(count - 1, current + (page - 1));
        break;
    }
    case WXK_HOME:
    case WXK_NUMPAD_HOME:
        target = 0;
        break;
    case WXK_END:
    case WXK_NUMPAD_END:
        target = count - 1;
        break;
    case WXK_SPACE:
        if (current >= 0)
        {
            if (ctrl && !IsSingleSelection())
                SelectNotifying(current, !IsSelected(current));
            else
                SetItemSelected(current, true);
        }
        return;
    case WXK_RETURN:
    case WXK_NUMPAD_ENTER:
        if (current >= 0)
            SendListEvent(wxEVT_LIST_ITEM_ACTIVATED, current);
        return;
    default:
        if ((code == 'A' || code == 'a') && event.CmdDown() && !IsSingleSelection())
        {
            SelectRangeNotifying(0, count - 1);
            return;
        }
        event.Skip();
        return;
    }
    MoveCurrentByKey(target, ctrl, shift);
}

void ProfilesKelvoListMainWindow::MoveCurrentByKey(long target, bool ctrl, bool shift)
{
    if (IsSingleSelection() || (!ctrl && !shift))
    {
        DeselectOutsideNotifying(target, target);
        ChangeCurrentNotifying(target);
        SelectNotifying(target, true);
        m_anchor = target;
    }
    else if (shift)
    {
        const long anchor = m_anchor >= 0 ? m_anchor : (m_current >= 0 ? m_current : target);
        if (!ctrl)
            DeselectOutsideNotifying(anchor, target);
        ChangeCurrentNotifying(target);
        SelectRangeNotifying(anchor, target);
        m_anchor = anchor;
    }
    else
    {
        // Ctrl moves the focus alone; Ctrl+Space then toggles the focused row.
        ChangeCurrentNotifying(target);
    }
    EnsureVisible(target);
}

void ProfilesKelvoListMainWindow::OnMouseWheel(wxMouseEvent& event)
{
    const int delta = event.GetWheelDelta() > 0 ? event.GetWheelDelta() : 120;
    m_wheelRotation += event.GetWheelRotation();
    const int steps = m_wheelRotation / delta;
    if (steps == 0)
        return;
    m_wheelRotation -= steps * delta;
    const int lines = steps * std::max(1, event.GetLinesPerAction());
    if (event.GetWheelAxis() == wxMOUSE_WHEEL_HORIZONTAL)
        ScrollToX(m_scrollX + lines * kHorizontalScrollStep);
    else
        ScrollToTop(m_topItem - lines);
}

void ProfilesKelvoListMainWindow::OnScroll(wxScrollWinEvent& event)
{
    const wxEventType type = event.GetEventType();
    const bool vertical = event.GetOrientation() == wxVERTICAL;
    const long position = vertical ? m_topItem : m_scrollX;
    const long line = vertical ? 1 : kHorizontalScrollStep;
    const long page = vertical ? GetCountPerPage() : std::max(1, GetClientSize().GetWidth());
    long target = position;
    if (type == wxEVT_SCROLLWIN_TOP)
        target = 0;
    else if (type == wxEVT_SCROLLWIN_BOTTOM)
        target = vertical ? GetItemCount() : GetTotalColumnWidth();
    else if (type == wxEVT_SCROLLWIN_LINEUP)
        target = position - line;
    else if (type == wxEVT_SCROLLWIN_LINEDOWN)
        target = position + line;
    else if (type == wxEVT_SCROLLWIN_PAGEUP)
        target = position - page;
    else if (type == wxEVT_SCROLLWIN_PAGEDOWN)
        target = position + page;
    else if (type == wxEVT_SCROLLWIN_THUMBTRACK || type == wxEVT_SCROLLWIN_THUMBRELEASE)
        target = event.GetPosition();

    if (vertical)
        ScrollToTop(target);
    else
        ScrollToX(static_cast<int>(target));
}

void ProfilesKelvoListMainWindow::OnSize(wxSizeEvent& event)
{
    MarkDirty();
    event.Skip();
}

void ProfilesKelvoListMainWindow::OnFocus(wxFocusEvent& event)
{
    const bool hasFocus = event.GetEventType() == wxEVT_SET_FOCUS;
    if (hasFocus != m_hasFocus)
    {
        m_hasFocus = hasFocus;
        // Selected rows change colour with the focus.
        if (!m_selection.Empty())
            Refresh();
    }
    event.Skip();
}
