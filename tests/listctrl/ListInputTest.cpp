// Selection, focus, keyboard, scrolling, header clicks and column resizing, driven by
// events sent to the windows' handlers; the list events checked in order.
#include "ListTestSupport.h"

#include <wx/imaglist.h>

#include <algorithm>
#include <sstream>

using namespace listtest;

namespace
{
// A script of steps "action|events|state;": an action of the user or the program (see Do); the
// list events it sends ("*": not checked), a word each: S, D, F, K, R and the item for
// selected, deselected, focused, key down, right click, C, X, B, E and the column for column
// click, column right click, drag begin, drag end; and the state after it:
// the selected rows, unless "#n" gives their number, "@i" the focused row, "^i" the top row ("^$":
// the last page), "c1=w" the width of column 1.
class ListInput : public ListFixture
{
protected:
    void Build(long style, long items, const std::vector<int>& widths = {100, 100})
    {
        m_list = MakeRows(style, widths, items);
        m_rows = m_list->GetMainWindow();
        const wxEventType types[] = {
            wxEVT_LIST_ITEM_SELECTED,   wxEVT_LIST_ITEM_DESELECTED,  wxEVT_LIST_ITEM_FOCUSED,
            wxEVT_LIST_KEY_DOWN,        wxEVT_LIST_ITEM_RIGHT_CLICK, wxEVT_LIST_COL_CLICK,
            wxEVT_LIST_COL_RIGHT_CLICK, wxEVT_LIST_COL_BEGIN_DRAG,   wxEVT_LIST_COL_END_DRAG};
        for (int kind = 0; kind < 9; ++kind)
            m_list->Bind(wxEventTypeTag<wxListEvent>(types[kind]),
                         [this, kind](wxListEvent& event)
                         {
                             m_sent += (m_sent.empty() ? "" : " ") + std::string(1, "SDFKRCXBE"[kind]) +
                                       std::to_string(kind >= 5 ? event.GetColumn() : event.GetIndex());
                             event.Skip();
                         });
    }

    // A row or x: "2p-1" is two pages less one row, "m+100" the header's minimum column
    // width and 100.
    long Item(const std::string& text) const
    {
        const size_t at = text.find_first_of("pm");
        if (at == std::string::npos)
            return std::stol(text);
        const ProfilesKelvoListHeaderWindow* header = m_list->GetHeaderWindow();
        const long unit = text[at] == 'p' ? m_rows->GetCountPerPage() : header->GetMinimumColumnWidth();
        return (at == 0 ? 1 : std::stol(text.substr(0, at))) * unit +
               (at + 1 < text.size() ? std::stol(text.substr(at + 1)) : 0);
    }

    // "click c+s+3" (with Ctrl and Shift), "rclick 3", "dclick 3", "key c+a",
    // "wheel -120", "select 3", "focus 3" (and select), "clear 3" (neither), "count 5", "top 50",
    // and on the header "hclick 50", "hrclick 50" (right button up), "hdrag 50", "hup 50".
    void Do(const std::string& action)
    {
        std::istringstream in(action);
        std::string verb, arg;
        in >> verb >> arg;
        wxKeyboardState modifiers(arg.find("c+") != std::string::npos, arg.find("s+") != std::string::npos);
        arg = arg.substr(modifiers.ControlDown() * 2 + modifiers.ShiftDown() * 2);
        const std::string names =
            " down up pgdn pgup home end space enter left click rclick dclick hclick hrclick "
            "hdrag hup wheel a ";
        const int codes[] = {WXK_DOWN,        WXK_UP,           WXK_PAGEDOWN,
                             WXK_PAGEUP,      WXK_HOME,         WXK_END,
                             WXK_SPACE,       WXK_RETURN,       WXK_LEFT,
                             wxEVT_LEFT_DOWN, wxEVT_RIGHT_DOWN, wxEVT_LEFT_DCLICK,
                             wxEVT_LEFT_DOWN, wxEVT_RIGHT_UP,   wxEVT_MOTION,
                             wxEVT_LEFT_UP,   wxEVT_MOUSEWHEEL, 'A'};
        const auto code = [&](const std::string& name)
        { return codes[std::count(names.begin(), names.begin() + names.find(" " + name + " "), ' ')]; };
        const long all = wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED;
        m_rows->LayoutIfNeeded();
        const long item = verb == "key" ? 0 : Item(arg);
        wxKeyEvent key(wxEVT_KEY_DOWN);
        wxMouseEvent mouse(
            verb.find("click") != std::string::npos || verb[0] == 'h' || verb == "wheel" ? code(verb) : 0);
        static_cast<wxKeyboardState&>(key) = static_cast<wxKeyboardState&>(mouse) = modifiers;
        if (verb == "select")
            m_list->SetItemState(item, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
        else if (verb == "focus" || verb == "clear")
            m_list->SetItemState(item, verb == "focus" ? all : 0, all);
        else if (verb == "count")
            m_list->SetItemCount(item);
        else if (verb == "top")
            m_rows->ScrollToTop(item);
        else if (verb == "key" && ((key.m_keyCode = code(arg))))
            m_rows->ProcessWindowEvent(key);
        else
        {
            const int lh = m_rows->GetLineHeight();
            mouse.SetPosition(verb[0] == 'h' ? wxPoint(item, 10)
                                             : wxPoint(50, int((item - m_rows->GetTopItem()) * lh + lh / 2)));
            mouse.SetLeftDown(verb == "hdrag" || mouse.GetEventType() == wxEVT_LEFT_DOWN);
            mouse.m_wheelRotation = static_cast<int>(item);
            mouse.m_wheelDelta = 120;
            mouse.m_linesPerAction = 3;
            (verb[0] == 'h' ? static_cast<wxWindow*>(m_list->GetHeaderWindow()) : m_rows)
                ->ProcessWindowEvent(mouse);
        }
    }

    void Run(const std::string& script)
    {
        std::istringstream steps(script);
        for (std::string action, events, state; std::getline(steps, action, '|') &&
                                                std::getline(steps, events, '|') &&
                                                std::getline(steps, state, ';');)
        {
            SCOPED_TRACE(action);
            Do(action.substr(action.find_first_not_of(' ')));
            if (events != "*")
                EXPECT_EQ(m_sent, events);
            m_sent.clear();
            std::istringstream in(state);
            std::string selected;
            bool counted = false;
            for (std::string token; in >> token;)
            {
                const std::string rest = token.substr(1);
                if (token[0] == '@')
                    EXPECT_EQ(m_list->GetNextItem(-1, wxLIST_NEXT_ALL, wxLIST_STATE_FOCUSED), Item(rest));
                else if (token[0] == '#' && (counted = true))
                    EXPECT_EQ(m_list->GetSelectedItemCount(), Item(rest));
                else if (token == "^$")
                    EXPECT_EQ(m_rows->GetTopItem() + m_rows->GetCountPerPage(), m_list->GetItemCount());
                else if (token[0] == '^')
                    EXPECT_EQ(m_rows->GetTopItem(), Item(rest));
                else if (token[0] == 'c')
                    EXPECT_EQ(m_list->GetColumnWidth(token[1] - '0'), Item(token.substr(3)));
                else
                    selected += (selected.empty() ? "" : " ") + std::to_string(Item(token));
            }
            std::string items;
            for (long i = m_list->GetNextItem(-1, wxLIST_NEXT_ALL, wxLIST_STATE_SELECTED); i >= 0;
                 i = m_list->GetNextItem(i, wxLIST_NEXT_ALL, wxLIST_STATE_SELECTED))
                items += (items.empty() ? "" : " ") + std::to_string(i);
            if (!counted)
                EXPECT_EQ(items, selected);
        }
    }

    ProfilesKelvoProfilesListCtrl* m_list = nullptr;
    ProfilesKelvoListMainWindow* m_rows = nullptr;
    std::string m_sent;
};

TEST_F(ListInput, SingleSelectionKeysAndWheel)
{
    Build(wxLC_SINGLE_SEL, 200);
    Run("click 2|F2 S2|2 @2; click c+5|D2 F5 S5|5; click 5||5; key c+a|K5|5; select 7|D5 S7|7 @5;");
    Run("rclick 3|D7 F3 S3 R3|3 @3; clear 3|*|; key pgdn|*|p-1 @p-1; clear p-1|*|; top 50||^50;");
    Run("key pgup|*|50; clear 50|*|^50; top 0||; key down|K-1 F0 S0|0; key down|K0 D0 F1 S1|1;");
    Run("key up|*|0 @0; key pgdn|*|p-1 ^0; key pgdn|*|2p-2 ^p-1; key pgup|*|p-1 ^p-1; key end|*|199 ^$;");
    Run("key down|*|199; key home|*|0 ^0; clear 0|*|; wheel -120||^3; wheel -60||^3; wheel -60||^6;");
    Run("wheel 1200||^0; wheel -30000||^$;");
    // A wheel event a program sends without a delta counts in notches of 120, as the toolkit's do.
    wxMouseEvent wheel(wxEVT_MOUSEWHEEL);
    wheel.m_wheelRotation = 120;
    wheel.m_linesPerAction = 3;
    const long bottom = m_rows->GetTopItem();
    m_rows->ProcessWindowEvent(wheel);
    EXPECT_EQ(m_rows->GetTopItem(), bottom - 3);
}

TEST_F(ListInput, MultipleSelectionByMouseAndKeys)
{
    Build(0, 10);
    Run("click 1|F1 S1|1; click c+3|F3 S3|1 3; click s+5|D1 F5 S4 S5|3 4 5; click c+4|F4 D4|3 5;"
        "click 2|D3 D5 F2 S2|2; key s+down|K2 F3 S3|2 3; key s+down|K3 F4 S4|2 3 4; key s+up|K4 D4 F3|2 3;"
        "key c+down|K3 F4|2 3 @4; key c+space|K4 S4|2 3 4; key c+space|K4 D4|2 3; key space|K4 S4|2 3 4;"
        "key enter|K4|2 3 4; dclick 7||2 3 4; key c+a|K4 S0 S1 S5 S6 S7 S8 S9|0 1 2 3 4 5 6 7 8 9;"
        "key down|*|5 @5; click 10|D5|;");
}

TEST_F(ListInput, VirtualListsKeepTheSelectionInsideTheCountAndChangeManyRowsInOneEvent)
{
    Build(wxLC_VIRTUAL, 10);
    Run("focus 7|F7 S7|7 @7; select 2|S2|2 7; count 5||2 @4; count 10||2; count 0||@-1; count 100000||;"
        "key c+a|K-1 S-1|#100000; click 3|D-1 F3|3; key s+end|*|#99997 ^$; key c+a|*|#100000;"
        "top 0||#100000; click s+5|*|#3;");
}

TEST_F(ListInput, RowsKeepTheirSelectionTextsAndDataThroughInsertsAndDeletes)
{
    Build(0, 6);
    Run("focus 3|F3 S3|3 @3;");
    EXPECT_EQ(m_list->InsertItem(0, wxS("new first"), 0), 0);
    EXPECT_TRUE(m_list->DeleteItem(2) && m_list->SetItemData(0, 42));
    EXPECT_EQ(m_list->InsertItem(99, wxS("appended")), 6) << "an index past the end appends";
    Run("select 0|S0|0 3 @3;");
    EXPECT_EQ(m_list->GetNextItem(3, wxLIST_NEXT_ABOVE, wxLIST_STATE_SELECTED), 0);
    EXPECT_EQ(m_list->GetNextItem(3, wxLIST_NEXT_ABOVE, wxLIST_STATE_DONTCARE), 2);
    // Fitted to the widest text with some room; row 0 names an image, but without an image list
    // there is none to make room for.
    m_list->SetColumnWidth(0, wxLIST_AUTOSIZE);
    const int widest = m_rows->GetTextExtent(wxS("new first")).GetWidth();
    EXPECT_GT(m_list->GetColumnWidth(0), widest);
    EXPECT_LT(m_list->GetColumnWidth(0), widest + 32);
    m_list->SetBackgroundColour(*wxCYAN);
    EXPECT_EQ(m_rows->GetBackgroundColour(), *wxCYAN) << "the rows window takes the list's background";
    EXPECT_EQ(m_list->GetItemText(3) + m_list->GetItemText(6) +
                  wxString::Format("%d", int(m_list->GetItemData(0))),
              wxS("row 3appended42"));
    wxListItem info;
    info.SetId(0);
    info.SetMask(wxLIST_MASK_IMAGE | wxLIST_MASK_STATE);
    info.SetStateMask(wxLIST_STATE_SELECTED);
    EXPECT_TRUE(m_list->GetItem(info) && info.GetImage() == 0 && info.GetState() == wxLIST_STATE_SELECTED);
    wxListItem data;
    data.SetId(1);
    data.SetMask(wxLIST_MASK_DATA);
    data.SetData(7);
    EXPECT_TRUE(m_list->SetItem(data) && m_list->GetItemData(1) == 7);
    m_list->DeleteAllItems();
    Run("top 0||@-1;");
    // A larger font makes taller rows.
    const int lineHeight = m_rows->GetLineHeight();
    m_list->SetFont(m_list->GetFont().Scaled(2));
    m_rows->LayoutIfNeeded();
    EXPECT_GT(m_rows->GetLineHeight(), lineHeight);
}

// An index one past the last row, or beyond it, changes nothing and reports nothing.
TEST_F(ListInput, ItemsBeyondTheCountAreLeftAlone)
{
    Build(0, 5);
    for (const long item : {5L, 6L})
    {
        wxRect rect;
        EXPECT_FALSE(m_list->SetItemState(item, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED) ||
                     m_list->SetItem(item, 0, wxS("x")) || m_list->DeleteItem(item) ||
                     m_list->GetItemRect(item, rect) || m_list->GetItemState(item, wxLIST_STATE_SELECTED));
        m_rows->SetItemSelected(item, true);
        m_rows->SetCurrent(item);
        EXPECT_EQ(m_list->GetItemText(item) + wxString::Format("%ld", m_list->GetItemCount()), wxS("5"))
            << item;
        Run("top 0||@-1;");
    }
}

// Clicks report the column, or -2 in the last 20 pixels; a dragged border stops at the minimum width.
// Columns wider than the window scroll sideways, the header with them.
TEST_F(ListInput, HeaderClicksDraggedBordersAndSidewaysScrolling)
{
    Build(0, 3, {100, 100, 700});
    Run("hclick 50|C0|; hrclick 150|X1|; hclick 597|C-2|; hclick 579|C-2|; hclick 578|C2|;");
    Run("hclick 100|B0|; hdrag 150||; hdrag 3||; hup 3|E0|c0=m; hclick m+100|B1|; hup m+140|E1|c1=140;");
    const int client = m_rows->GetClientSize().GetWidth();
    const int range = m_list->GetHeaderWindow()->GetMinimumColumnWidth() + 840;
    m_rows->LayoutIfNeeded();
    EXPECT_EQ(m_rows->GetScrollRange(wxHORIZONTAL), range);
    m_rows->ScrollToX(40);
    const wxColour border = Themer::GetThemeService()->GetTheme("HeaderView").lineColour;
    EXPECT_EQ(PixelAt(RenderRows(m_list, true), range - 740, 12), border) << "edges moved left";
    m_rows->ScrollToX(100000);
    EXPECT_EQ(m_rows->GetScrollX(), range - client) << "no scrolling past the last column";
}
} // namespace
