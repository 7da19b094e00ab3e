// Selection, focus, keyboard, scrolling, header clicks and column resizing,
// driven by events sent to the windows' handlers; list events checked in order.
#include "ListTestSupport.h"

#include <wx/imaglist.h>

#include <algorithm>
#include <memory>
#include <sstream>
#include <tuple>

using namespace listtest;

namespace
{
// A script of steps "action|events|state;": an action of the user or the
// program (see Do), the list events it sends ("*": not checked), and the state
// after it: the selected rows in order, unless "#n" gives their number; "@i" the
// focused row, "^i" the top row ("^$": the last page), "gx" the column resize
// guide, "c1=w" the width of column 1.
class ListInput : public ListFixture
{
protected:
    void Build(long style, long items, const std::vector<int>& widths = {100, 100})
    {
        m_list = MakeRows(style, widths, items);
        m_rows = m_list->GetMainWindow();
        m_events = std::make_unique<EventLog>(m_list);
    }

    // A row or x: "2p-1" is two pages less one row, "m+100" the header's minimum
    // column width and 100, "w-10" ten pixels left of the header's right edge.
    long Item(const std::string& text) const
    {
        const size_t at = text.find_first_of("pmw");
        if (at == std::string::npos)
            return std::stol(text);
        const ProfilesKelvoListHeaderWindow* header = m_list->GetHeaderWindow();
        const long unit = text[at] == 'p'   ? m_rows->GetCountPerPage()
                          : text[at] == 'm' ? header->GetMinimumColumnWidth()
                                            : header->GetClientSize().GetWidth();
        return (at == 0 ? 1 : std::stol(text.substr(0, at))) * unit +
               (at + 1 < text.size() ? std::stol(text.substr(at + 1)) : 0);
    }

    // "click c+s+3" (with Ctrl and Shift), "rclick 3", "dclick 3", "key c+a", "scroll pagedown",
    // "select 3", "focus 3" (and select), "clear 3" (neither), "count 5", "top 50", "wheel -120",
    // and on the header "hclick 50", "hrclick 50" (right button up), "hdrag 50", "hup 50".
    void Do(const std::string& action)
    {
        std::istringstream in(action);
        std::string verb, arg;
        in >> verb >> arg;
        const bool ctrl = arg.find("c+") != std::string::npos;
        const bool shift = arg.find("s+") != std::string::npos;
        arg = arg.substr(ctrl * 2 + shift * 2);
        const std::string names =
            " down up pgdn pgup home end space enter left click rclick dclick top bottom lineup "
            "linedown pageup pagedown hclick hrclick hdrag hup a ";
        const int keys[] = {WXK_DOWN, WXK_UP,    WXK_PAGEDOWN, WXK_PAGEUP, WXK_HOME,
                            WXK_END,  WXK_SPACE, WXK_RETURN,   WXK_LEFT};
        const int events[] = {wxEVT_LEFT_DOWN,          wxEVT_RIGHT_DOWN,       wxEVT_LEFT_DCLICK,
                              wxEVT_SCROLLWIN_TOP,      wxEVT_SCROLLWIN_BOTTOM, wxEVT_SCROLLWIN_LINEUP,
                              wxEVT_SCROLLWIN_LINEDOWN, wxEVT_SCROLLWIN_PAGEUP, wxEVT_SCROLLWIN_PAGEDOWN};
        const int header[] = {wxEVT_LEFT_DOWN, wxEVT_RIGHT_UP, wxEVT_MOTION, wxEVT_LEFT_UP, 'A'};
        const auto code = [&](const std::string& name)
        {
            const auto at = std::count(names.begin(), names.begin() + names.find(" " + name + " "), ' ');
            return at < 9 ? keys[at] : at < 18 ? events[at - 9] : header[at - 18];
        };
        const long all = wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED;
        m_rows->LayoutIfNeeded();
        const long item = verb == "key" || verb == "scroll" ? 0 : Item(arg);
        const int lh = m_rows->GetLineHeight();
        const bool onHeader = verb[0] == 'h';
        wxMouseEvent mouse(onHeader || verb.find("click") != std::string::npos ? code(verb)
                                                                               : int(wxEVT_MOUSEWHEEL));
        mouse.SetPosition(onHeader ? wxPoint(item, 10)
                                   : wxPoint(50, int((item - m_rows->GetTopItem()) * lh + lh / 2)));
        mouse.SetControlDown(ctrl);
        mouse.SetShiftDown(shift);
        mouse.SetLeftDown(verb == "hdrag" || mouse.GetEventType() == wxEVT_LEFT_DOWN);
        mouse.m_wheelRotation = static_cast<int>(item);
        mouse.m_wheelDelta = 120;
        mouse.m_linesPerAction = 3;
        wxKeyEvent key(wxEVT_KEY_DOWN);
        key.m_keyCode = verb == "key" ? code(arg) : 0;
        key.SetControlDown(ctrl);
        key.SetShiftDown(shift);
        wxScrollWinEvent scroll(verb == "scroll" ? code(arg) : 0, 0, wxVERTICAL);
        wxWindow* target = onHeader ? static_cast<wxWindow*>(m_list->GetHeaderWindow()) : m_rows;
        if (verb == "key" || verb == "scroll")
            target->GetEventHandler()->ProcessEvent(verb == "key" ? static_cast<wxEvent&>(key) : scroll);
        else if (verb == "select")
            m_list->SetItemState(item, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
        else if (verb == "focus" || verb == "clear")
            m_list->SetItemState(item, verb == "focus" ? all : 0, all);
        else if (verb == "count")
            m_list->SetItemCount(item);
        else if (verb == "top")
            m_rows->ScrollToTop(item);
        else
            target->GetEventHandler()->ProcessEvent(mouse);
    }

    void Run(const std::string& script)
    {
        std::istringstream steps(script);
        for (std::string action, events, state; std::getline(steps, action, '|') &&
                                                std::getline(steps, events, '|') &&
                                                std::getline(steps, state, ';');)
        {
            action = action.substr(action.find_first_not_of(' '));
            SCOPED_TRACE(action);
            Do(action);
            const std::string sent = m_events->Take();
            if (events != "*")
                EXPECT_EQ(sent, events);
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
                else if (token[0] == 'g')
                    EXPECT_EQ(m_rows->GetResizeGuide(), Item(rest));
                else if (token[0] == 'c')
                    EXPECT_EQ(m_list->GetColumnWidth(token[1] - '0'), Item(token.substr(3)));
                else
                    selected += (selected.empty() ? "" : " ") + std::to_string(Item(token));
            }
            if (!counted)
                EXPECT_EQ(Selected(), selected);
        }
    }

    std::string Selected() const
    {
        std::string items;
        for (long item = m_list->GetNextItem(-1, wxLIST_NEXT_ALL, wxLIST_STATE_SELECTED); item >= 0;
             item = m_list->GetNextItem(item, wxLIST_NEXT_ALL, wxLIST_STATE_SELECTED))
            items += (items.empty() ? "" : " ") + std::to_string(item);
        return items;
    }

    ProfilesKelvoProfilesListCtrl* m_list = nullptr;
    ProfilesKelvoListMainWindow* m_rows = nullptr;
    std::unique_ptr<EventLog> m_events;
};

TEST_F(ListInput, SingleSelectionKeepsOneSelectedRow)
{
    Build(wxLC_SINGLE_SEL, 20);
    Run("click 2|F2 S2|2 @2; click 4|D2 F4 S4|4; click c+5|D4 F5 S5|5; click 5||5; key c+a|K5|5;"
        "select 7|D5 S7|7 @5; select 7||7; rclick 3|D7 F3 S3 R3|3 @3;");
}

TEST_F(ListInput, MultipleSelectionByMouseAndKeys)
{
    Build(0, 10);
    ASSERT_LT(11 * m_rows->GetLineHeight(), m_rows->GetClientSize().GetHeight()) << "room under the last row";
    Run("click 1|F1 S1|1; click c+3|F3 S3|1 3; click s+5|D1 F5 S4 S5|3 4 5; click c+4|F4 D4|3 5;"
        "click 2|D3 D5 F2 S2|2; key s+down|K2 F3 S3|2 3; key s+down|K3 F4 S4|2 3 4; key s+up|K4 D4 F3|2 3;"
        "key c+down|K3 F4|2 3 @4; key c+down|K4 F5|2 3 @5; key c+space|K5 S5|2 3 5; key c+space|K5 D5|2 3;"
        "key c+down|K5 F6|2 3; key space|K6 S6|2 3 6; key enter|K6 A6|2 3 6; dclick 7|A7|2 3 6;"
        "key c+a|K6 S0 S1 S4 S5 S7 S8 S9|0 1 2 3 4 5 6 7 8 9; key down|*|7 @7; click c+5|F5 S5|5 7;"
        "click 10|D5 D7|;");
    EXPECT_EQ(m_events->lastKeyCode, WXK_DOWN);
}

TEST_F(ListInput, KeysMoveTheSelectedRowAndScrollItIntoView)
{
    Build(wxLC_SINGLE_SEL, 200);
    Run("key pgdn|*|p-1 @p-1; clear p-1|*|; top 50||^50; key pgup|*|50; clear 50|*|^50; top 0||;"
        "key down|K-1 F0 S0|0; key down|K0 D0 F1 S1|1; key up|*|0; key up|*|0 @0; key pgdn|*|p-1 ^0;"
        "key pgdn|*|2p-2 ^p-1; key pgup|*|p-1 ^p-1; key end|*|199 ^$; key down|*|199; key home|*|0 ^0;");
}

TEST_F(ListInput, WheelAndScrollbarMoveByLinesAndPagesAndStopAtTheEnds)
{
    Build(0, 100);
    Run("wheel -120||^3; wheel -60||^3; wheel -60||^6; wheel 1200||^0; wheel -12000||^$; scroll top||^0;"
        "scroll linedown||^1; scroll pagedown||^p+1; scroll lineup||^p; scroll pageup||^0; scroll "
        "bottom||^$;");
}

TEST_F(ListInput, VirtualListsKeepTheSelectionInsideTheCountAndChangeManyRowsInOneEvent)
{
    Build(wxLC_VIRTUAL, 10);
    Run("focus 7|F7 S7|7 @7; select 2|S2|2 7; count 5||2 @4; count 10||2; count 0||@-1; count 100000||;"
        "key c+a|K-1 S-1|#100000; click 3|D-1 F3|3; key s+end|*|#99997 ^$;");
}

TEST_F(ListInput, RowsKeepTheirSelectionTextsAndDataThroughInsertsAndDeletes)
{
    Build(0, 6);
    Run("focus 3|F3 S3|3 @3;");
    EXPECT_EQ(m_list->InsertItem(0, wxS("new first"), 0), 0);
    EXPECT_TRUE(m_list->DeleteItem(2));
    Run("focus 3||3 @3;");
    EXPECT_EQ(m_list->GetItemText(3), wxS("row 3"));
    EXPECT_EQ(m_list->InsertItem(99, wxS("appended")), 6) << "an index past the end appends";
    EXPECT_TRUE(m_list->SetItem(0, 1, wxS("cell")));
    EXPECT_TRUE(m_list->SetItemData(0, 42));
    Run("select 0|S0|0 3;");
    wxListItem info;
    info.SetId(0);
    info.SetColumn(1);
    info.SetMask(wxLIST_MASK_TEXT | wxLIST_MASK_DATA | wxLIST_MASK_STATE | wxLIST_MASK_IMAGE);
    info.SetStateMask(wxLIST_STATE_SELECTED);
    ASSERT_TRUE(m_list->GetItem(info));
    EXPECT_EQ(std::make_tuple(info.GetText(), info.GetData(), info.GetState(), info.GetImage()),
              std::make_tuple(wxString("cell"), wxUIntPtr(42), long(wxLIST_STATE_SELECTED), -1));
    info.SetColumn(0);
    ASSERT_TRUE(m_list->GetItem(info));
    EXPECT_EQ(info.GetImage(), 0);
    m_list->DeleteAllItems();
    EXPECT_EQ(m_list->GetItemCount(), 0);
    Run("top 0||@-1;");
}

// An index one past the last row, or beyond it, changes nothing and reports nothing.
TEST_F(ListInput, ItemsBeyondTheCountAreLeftAlone)
{
    for (const long style : {0L, long(wxLC_VIRTUAL)})
    {
        Build(style, 5);
        for (const long item : {5L, 6L})
        {
            SCOPED_TRACE(testing::Message() << "style " << style << ", item " << item);
            wxRect rect;
            EXPECT_FALSE(m_list->SetItemState(item, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED) ||
                         m_list->SetItem(item, 0, wxS("x")) || m_list->DeleteItem(item) ||
                         m_list->SetItemData(item, 1) || m_list->SetItemTextColour(item, *wxRED) ||
                         m_list->EnsureVisible(item) || m_list->GetItemRect(item, rect) ||
                         m_list->GetSubItemRect(0, 2, rect));
            m_rows->SetItemSelected(item, true);
            m_rows->SetCurrent(item);
            EXPECT_EQ(m_list->GetItemState(item, wxLIST_STATE_SELECTED), 0);
            EXPECT_EQ(m_list->GetItemText(item), wxString());
            EXPECT_EQ(m_list->GetItemCount(), 5);
            Run("top 0||@-1;");
        }
        m_frame->Destroy();
    }
    m_frame = nullptr;
}

TEST_F(ListInput, HeaderClicksReportTheColumnOrMinusTwoNearTheRightEdge)
{
    Build(0, 3);
    ASSERT_GT(m_list->GetHeaderWindow()->GetClientSize().GetWidth(), 300);
    Run("hclick 50|C0|; hclick 150|C1|; hrclick 150|X1|; hclick 250||; hclick w-10|C-2|; hclick w-1|C-2|;"
        "hclick w-19|C-2|; hclick w-20||; hclick w||; hrclick w-5|X-2|;");
}

TEST_F(ListInput, DraggingABorderResizesTheColumnDownToItsMinimumUnlessVetoed)
{
    Build(0, 3);
    wxImageList marks(16, 16, true, 1);
    marks.Add(wxBitmap(wxImage(16, 16)));
    m_list->SetImageList(&marks, kHeaderImageList);
    ProfilesKelvoListHeaderWindow* header = m_list->GetHeaderWindow();
    EXPECT_EQ(header->GetMinimumColumnWidth(), header->GetTextExtent(wxS("M")).GetWidth() + 8 + 16 + 5);
    // The guide follows the border down to the minimum; the second border moved with the first.
    Run("hclick 100|B0|g99; hdrag 150|G0|g149; hdrag 3|G0|gm-1; hup 3|E0|g-1 c0=m;"
        "hclick m+100|B1|; hup m+140|E1|c1=140;");
    m_list->Bind(wxEVT_LIST_COL_BEGIN_DRAG, [](wxListEvent& event) { event.Veto(); });
    Run("hclick m|*|g-1; hup m+60||c0=m;");
    m_list->SetImageList(nullptr, kHeaderImageList);

    m_list->InsertItem(0, wxS("a considerably longer cell text"));
    ASSERT_TRUE(m_list->SetColumnWidth(0, wxLIST_AUTOSIZE));
    EXPECT_EQ(m_list->GetColumnWidth(0),
              m_rows->GetTextExtent(wxS("a considerably longer cell text")).x + 16);
    ASSERT_TRUE(m_list->SetColumnWidth(0, wxLIST_AUTOSIZE_USEHEADER));
    EXPECT_EQ(m_list->GetColumnWidth(0), m_rows->GetTextExtent(wxS("C0")).x + 16);
    EXPECT_FALSE(m_list->SetColumnWidth(5, 10)) << "no such column";
}

TEST_F(ListInput, ColumnsWiderThanTheWindowScrollSidewaysWithTheHeader)
{
    Build(wxLC_VRULES, 1, {300, 300, 300});
    const int client = m_rows->GetClientSize().GetWidth();
    EXPECT_EQ(m_rows->GetScrollRange(wxHORIZONTAL), 900);
    EXPECT_EQ(m_rows->GetScrollThumb(wxHORIZONTAL), client);
    m_rows->ScrollToX(100);
    EXPECT_EQ(m_rows->GetScrollPos(wxHORIZONTAL), 100);
    const wxColour border = Themer::GetThemeService()->GetTheme("HeaderView").lineColour;
    const wxImage header = RenderHeader(m_list);
    EXPECT_EQ(PixelAt(header, 200, 12), border) << "first column's edge moved left by the scroll";
    EXPECT_NE(PixelAt(header, 300, 12), border);
    const wxImage rows = RenderRows(m_list);
    EXPECT_EQ(PixelAt(rows, 198, m_rows->GetLineHeight() / 2), ListTheme().lineColour);
    EXPECT_EQ(PixelAt(rows, 498, m_rows->GetLineHeight() / 2), ListTheme().lineColour);
    Run("key left|K-1|;");
    EXPECT_EQ(m_rows->GetScrollX(), 85);
    m_rows->ScrollToX(100000);
    EXPECT_EQ(m_rows->GetScrollX(), 900 - client) << "no scrolling past the last column";
    // Narrower and wider columns change the scrollbar's range.
    for (const auto& [width, range] : {std::pair<int, int>{100, 700}, {500, 1100}})
    {
        m_list->SetColumnWidth(2, width);
        m_rows->LayoutIfNeeded();
        EXPECT_EQ(m_rows->GetScrollRange(wxHORIZONTAL), range);
        EXPECT_LE(m_rows->GetScrollX(), range - client);
    }
}
} // namespace
