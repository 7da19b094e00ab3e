// Selection, focus, keyboard, header clicks and column resizing, driven by
// events sent to the windows' handlers; the list events are checked in order.
#include "ListTestSupport.h"

#include <wx/imaglist.h>

#include <memory>

using namespace listtest;

namespace
{
class ListInput : public ListFixture
{
protected:
    void Build(long style, long items)
    {
        m_list = MakeList(wxLC_REPORT | style);
        m_list->InsertColumn(0, wxS("Name"), wxLIST_FORMAT_LEFT, 100);
        m_list->InsertColumn(1, wxS("Size"), wxLIST_FORMAT_LEFT, 100);
        if (style & wxLC_VIRTUAL)
            m_list->SetItemCount(items);
        else
            for (long item = 0; item < items; ++item)
                m_list->InsertItem(item, wxString::Format("row %ld", item));
        m_rows = m_list->GetMainWindow();
        m_rows->LayoutIfNeeded();
        m_events = std::make_unique<EventLog>(m_list);
    }

    void Click(long item, bool ctrl = false, bool shift = false)
    {
        const int lh = m_rows->GetLineHeight();
        SendMouse(m_rows, wxEVT_LEFT_DOWN, 50, static_cast<int>((item - m_rows->GetTopItem()) * lh + lh / 2),
                  ctrl, shift);
        SendMouse(m_rows, wxEVT_LEFT_UP, 50, static_cast<int>((item - m_rows->GetTopItem()) * lh + lh / 2),
                  ctrl, shift);
    }

    std::vector<long> SelectedItems() const
    {
        std::vector<long> items;
        for (long item = m_list->GetNextItem(-1, wxLIST_NEXT_ALL, wxLIST_STATE_SELECTED); item >= 0;
             item = m_list->GetNextItem(item, wxLIST_NEXT_ALL, wxLIST_STATE_SELECTED))
            items.push_back(item);
        return items;
    }

    long FocusedItem() const { return m_list->GetNextItem(-1, wxLIST_NEXT_ALL, wxLIST_STATE_FOCUSED); }

    ProfilesKelvoProfilesListCtrl* m_list = nullptr;
    ProfilesKelvoListMainWindow* m_rows = nullptr;
    std::unique_ptr<EventLog> m_events;
};

using Events = std::vector<EventRecord>;

TEST_F(ListInput, SingleSelectionClickMovesTheOneSelectedRow)
{
    Build(wxLC_SINGLE_SEL, 20);
    Click(2);
    EXPECT_EQ(m_events->Take(), (Events{Focused(2), Selected(2)}));
    Click(4);
    EXPECT_EQ(m_events->Take(), (Events{Deselected(2), Focused(4), Selected(4)}));
    Click(5, true);
    EXPECT_EQ(m_events->Take(), (Events{Deselected(4), Focused(5), Selected(5)})) << "Ctrl adds nothing";
    Click(5);
    EXPECT_EQ(m_events->Take(), Events{}) << "clicking the selected row changes nothing";
    EXPECT_EQ(SelectedItems(), (std::vector<long>{5}));
    EXPECT_EQ(m_list->GetSelectedItemCount(), 1);
}

TEST_F(ListInput, MultipleSelectionWithCtrlAndShift)
{
    Build(0, 10);
    Click(1);
    Click(3, true);
    EXPECT_EQ(m_events->Take(), (Events{Focused(1), Selected(1), Focused(3), Selected(3)}));
    EXPECT_EQ(SelectedItems(), (std::vector<long>{1, 3}));

    Click(5, false, true);
    EXPECT_EQ(m_events->Take(), (Events{Deselected(1), Focused(5), Selected(4), Selected(5)}));
    EXPECT_EQ(SelectedItems(), (std::vector<long>{3, 4, 5}));

    Click(4, true);
    EXPECT_EQ(m_events->Take(), (Events{Focused(4), Deselected(4)}));
    EXPECT_EQ(SelectedItems(), (std::vector<long>{3, 5}));

    // Below the last row: a plain click clears the selection.
    SendMouse(m_rows, wxEVT_LEFT_DOWN, 50, m_rows->GetClientSize().GetHeight() - 2);
    ASSERT_LT(m_list->GetItemCount() * m_rows->GetLineHeight(), m_rows->GetClientSize().GetHeight());
    EXPECT_EQ(m_events->Take(), (Events{Deselected(3), Deselected(5)}));
    EXPECT_EQ(m_list->GetSelectedItemCount(), 0);
}

TEST_F(ListInput, ArrowsHomeEndAndPagesMoveTheSelectedRow)
{
    Build(wxLC_SINGLE_SEL, 200);
    const long page = m_rows->GetCountPerPage();
    ASSERT_GT(page, 2);

    SendKey(m_rows, WXK_DOWN);
    EXPECT_EQ(m_events->Take(), (Events{KeyDown(-1), Focused(0), Selected(0)}));
    EXPECT_EQ(m_events->lastKeyCode, WXK_DOWN);
    SendKey(m_rows, WXK_DOWN);
    EXPECT_EQ(m_events->Take(), (Events{KeyDown(0), Deselected(0), Focused(1), Selected(1)}));
    SendKey(m_rows, WXK_UP);
    SendKey(m_rows, WXK_UP);
    EXPECT_EQ(FocusedItem(), 0) << "Up stops at the first row";

    struct Step
    {
        int key;
        long expected;
    };
    for (const Step& step :
         {Step{WXK_PAGEDOWN, page - 1}, Step{WXK_PAGEDOWN, 2 * (page - 1)}, Step{WXK_PAGEUP, page - 1},
          Step{WXK_END, 199}, Step{WXK_DOWN, 199}, Step{WXK_HOME, 0}})
    {
        SendKey(m_rows, step.key);
        EXPECT_EQ(FocusedItem(), step.expected) << "key " << step.key;
        EXPECT_EQ(SelectedItems(), (std::vector<long>{step.expected})) << "key " << step.key;
        EXPECT_LE(m_rows->GetTopItem(), step.expected) << "the row is scrolled into view";
        EXPECT_GT(m_rows->GetTopItem() + page, step.expected) << "the row is scrolled into view";
    }
}

TEST_F(ListInput, ShiftExtendsCtrlMovesTheFocusAloneAndCtrlAAll)
{
    Build(0, 20);
    Click(2);
    SendKey(m_rows, WXK_DOWN, false, true);
    SendKey(m_rows, WXK_DOWN, false, true);
    EXPECT_EQ(SelectedItems(), (std::vector<long>{2, 3, 4}));
    SendKey(m_rows, WXK_UP, false, true);
    EXPECT_EQ(SelectedItems(), (std::vector<long>{2, 3}));

    SendKey(m_rows, WXK_DOWN, true);
    SendKey(m_rows, WXK_DOWN, true);
    EXPECT_EQ(FocusedItem(), 5);
    EXPECT_EQ(SelectedItems(), (std::vector<long>{2, 3}));
    SendKey(m_rows, WXK_SPACE, true);
    EXPECT_EQ(SelectedItems(), (std::vector<long>{2, 3, 5}));
    SendKey(m_rows, WXK_SPACE, true);
    EXPECT_EQ(SelectedItems(), (std::vector<long>{2, 3}));

    SendKey(m_rows, 'A', true);
    EXPECT_EQ(m_list->GetSelectedItemCount(), 20);
    SendKey(m_rows, WXK_DOWN);
    EXPECT_EQ(SelectedItems(), (std::vector<long>{6}));
}

TEST_F(ListInput, PagesWithoutAFocusedRowStartFromThePage)
{
    Build(wxLC_SINGLE_SEL, 200);
    const long page = m_rows->GetCountPerPage();
    SendKey(m_rows, WXK_PAGEDOWN);
    EXPECT_EQ(FocusedItem(), page - 1) << "the last row of the page";
    m_list->SetItemState(page - 1, 0, wxLIST_STATE_FOCUSED | wxLIST_STATE_SELECTED);
    ASSERT_EQ(FocusedItem(), -1);
    m_rows->ScrollToTop(50);
    SendKey(m_rows, WXK_PAGEUP);
    EXPECT_EQ(FocusedItem(), 50) << "the first row of the page";
}

TEST_F(ListInput, CtrlADoesNothingInASingleSelectionList)
{
    Build(wxLC_SINGLE_SEL, 5);
    Click(1);
    SendKey(m_rows, 'A', true);
    EXPECT_EQ(SelectedItems(), (std::vector<long>{1}));
}

TEST_F(ListInput, SpaceSelectsTheFocusedRowAndEnterOrDoubleClickActivates)
{
    Build(0, 10);
    Click(3);
    SendKey(m_rows, WXK_DOWN, true);
    m_events->Take();
    SendKey(m_rows, WXK_SPACE);
    EXPECT_EQ(m_events->Take(), (Events{KeyDown(4), Selected(4)}));
    SendKey(m_rows, WXK_RETURN);
    EXPECT_EQ(m_events->Take(), (Events{KeyDown(4), Activated(4)}));
    const int lh = m_rows->GetLineHeight();
    SendMouse(m_rows, wxEVT_LEFT_DCLICK, 50, 7 * lh + lh / 2);
    EXPECT_EQ(m_events->Take(), (Events{Activated(7)}));
}

TEST_F(ListInput, ShrinkingAVirtualListDropsTheSelectionBeyondItAndClampsTheFocus)
{
    Build(wxLC_VIRTUAL, 10);
    m_list->SetItemState(7, wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED,
                         wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED);
    m_list->SetItemState(2, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
    ASSERT_EQ(SelectedItems(), (std::vector<long>{2, 7}));

    m_list->SetItemCount(5);
    EXPECT_EQ(SelectedItems(), (std::vector<long>{2}));
    EXPECT_EQ(m_list->GetSelectedItemCount(), 1);
    EXPECT_EQ(FocusedItem(), 4);

    m_list->SetItemCount(10);
    EXPECT_EQ(m_list->GetItemState(7, wxLIST_STATE_SELECTED), 0) << "item 7 does not come back selected";

    m_list->SetItemCount(0);
    EXPECT_EQ(FocusedItem(), -1);
    EXPECT_EQ(m_list->GetSelectedItemCount(), 0);
}

TEST_F(ListInput, HundredThousandVirtualRowsSelectInOneStep)
{
    Build(wxLC_VIRTUAL, 100000);
    SendKey(m_rows, 'A', true);
    EXPECT_EQ(m_list->GetSelectedItemCount(), 100000);
    EXPECT_EQ(m_events->Take(), (Events{KeyDown(-1), Selected(-1)})) << "one event for the whole range";
    Click(3);
    EXPECT_EQ(m_events->Take(), (Events{Deselected(-1), Focused(3)}));
    EXPECT_EQ(SelectedItems(), (std::vector<long>{3}));
    SendKey(m_rows, WXK_END, false, true);
    EXPECT_EQ(m_list->GetSelectedItemCount(), 100000 - 3);
    EXPECT_EQ(m_rows->GetTopItem() + m_rows->GetCountPerPage(), 100000) << "the end is in view";
}

TEST_F(ListInput, DeletingAndInsertingRowsKeepsTheSelectionOnTheSameRows)
{
    Build(0, 6);
    m_list->SetItemState(3, wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED,
                         wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED);
    m_list->InsertItem(0, wxS("new first"));
    EXPECT_EQ(SelectedItems(), (std::vector<long>{4}));
    EXPECT_EQ(m_list->GetItemText(4), wxS("row 3"));
    EXPECT_EQ(FocusedItem(), 4);
    m_list->DeleteItem(1);
    EXPECT_EQ(SelectedItems(), (std::vector<long>{3}));
    EXPECT_EQ(m_list->GetItemText(3), wxS("row 3"));
    m_list->DeleteAllItems();
    EXPECT_EQ(m_list->GetSelectedItemCount(), 0);
    EXPECT_EQ(FocusedItem(), -1);
    EXPECT_EQ(m_list->GetItemCount(), 0);
}

// ---------------------------------------------------------------- header

struct HeaderClickCase
{
    int fromRight; // x = header width - fromRight
    wxEventType type;
    int expectedColumn; // -1: no event
};

class HeaderClick : public ListInput, public ::testing::WithParamInterface<HeaderClickCase>
{
};

TEST_P(HeaderClick, ReportsTheColumnOrMinusTwoNearTheRightEdge)
{
    Build(0, 3);
    ProfilesKelvoListHeaderWindow* header = m_list->GetHeaderWindow();
    const int width = header->GetClientSize().GetWidth();
    ASSERT_GT(width, 300);
    const HeaderClickCase& c = GetParam();
    const wxEventType mouse = c.type == wxEVT_LIST_COL_CLICK ? wxEVT_LEFT_DOWN : wxEVT_RIGHT_UP;
    SendMouse(header, mouse, width - c.fromRight, 10);
    const Events expected =
        c.expectedColumn == -1 ? Events{} : Events{EventRecord{c.type, -1, c.expectedColumn}};
    EXPECT_EQ(m_events->Take(), expected);
}

INSTANTIATE_TEST_SUITE_P(Places, HeaderClick,
                         ::testing::Values(HeaderClickCase{10, wxEVT_LIST_COL_CLICK, -2},
                                           HeaderClickCase{1, wxEVT_LIST_COL_CLICK, -2},
                                           HeaderClickCase{19, wxEVT_LIST_COL_CLICK, -2},
                                           HeaderClickCase{20, wxEVT_LIST_COL_CLICK, -1},
                                           HeaderClickCase{0, wxEVT_LIST_COL_CLICK, -1},
                                           HeaderClickCase{5, wxEVT_LIST_COL_RIGHT_CLICK, -2}));

TEST_F(ListInput, HeaderClickOnAColumnReportsIt)
{
    Build(0, 3);
    ProfilesKelvoListHeaderWindow* header = m_list->GetHeaderWindow();
    SendMouse(header, wxEVT_LEFT_DOWN, 50, 10);
    SendMouse(header, wxEVT_LEFT_DOWN, 150, 10);
    SendMouse(header, wxEVT_RIGHT_UP, 150, 10);
    EXPECT_EQ(m_events->Take(),
              (Events{EventRecord{wxEVT_LIST_COL_CLICK, -1, 0}, EventRecord{wxEVT_LIST_COL_CLICK, -1, 1},
                      EventRecord{wxEVT_LIST_COL_RIGHT_CLICK, -1, 1}}));
}

TEST_F(ListInput, DraggingABorderResizesTheColumnDownToItsMinimum)
{
    Build(0, 3);
    std::unique_ptr<wxImageList> marks(new wxImageList(16, 16, true, 1));
    marks->Add(wxBitmap(wxImage(16, 16)));
    m_list->SetImageList(marks.get(), kHeaderImageList);
    ProfilesKelvoListHeaderWindow* header = m_list->GetHeaderWindow();
    const int minimum = header->GetTextExtent(wxS("M")).GetWidth() + 8 + 16 + 5;
    EXPECT_EQ(header->GetMinimumColumnWidth(), minimum);

    SendMouse(header, wxEVT_LEFT_DOWN, 100, 10);
    ASSERT_TRUE(header->IsResizing());
    SendMouse(header, wxEVT_MOTION, 150, 10, false, false, true);
    EXPECT_EQ(m_rows->GetResizeGuide(), 150 - 1) << "the guide follows the border";
    SendMouse(header, wxEVT_MOTION, 3, 10, false, false, true);
    EXPECT_EQ(m_rows->GetResizeGuide(), minimum - 1) << "the guide stops at the minimum";
    SendMouse(header, wxEVT_LEFT_UP, 3, 10);
    EXPECT_FALSE(header->IsResizing());
    EXPECT_EQ(m_rows->GetResizeGuide(), -1);
    EXPECT_EQ(m_list->GetColumnWidth(0), minimum);
    EXPECT_EQ(
        m_events->Take(),
        (Events{EventRecord{wxEVT_LIST_COL_BEGIN_DRAG, -1, 0}, EventRecord{wxEVT_LIST_COL_DRAGGING, -1, 0},
                EventRecord{wxEVT_LIST_COL_DRAGGING, -1, 0}, EventRecord{wxEVT_LIST_COL_END_DRAG, -1, 0}}));

    // The second column's border moved with the first column's width.
    const int border = minimum + 100;
    SendMouse(header, wxEVT_LEFT_DOWN, border, 10);
    SendMouse(header, wxEVT_LEFT_UP, border + 40, 10);
    EXPECT_EQ(m_list->GetColumnWidth(1), 140);
    m_list->SetImageList(nullptr, kHeaderImageList);
}

TEST_F(ListInput, VetoedDragLeavesTheColumnAlone)
{
    Build(0, 3);
    m_list->Bind(wxEVT_LIST_COL_BEGIN_DRAG, [](wxListEvent& event) { event.Veto(); });
    ProfilesKelvoListHeaderWindow* header = m_list->GetHeaderWindow();
    SendMouse(header, wxEVT_LEFT_DOWN, 100, 10);
    EXPECT_FALSE(header->IsResizing());
    SendMouse(header, wxEVT_LEFT_UP, 160, 10);
    EXPECT_EQ(m_list->GetColumnWidth(0), 100);
}
} // namespace

namespace
{
TEST_F(ListInput, WheelScrollsByLinesAndStopsAtTheEnds)
{
    Build(0, 100);
    wxMouseEvent wheel(wxEVT_MOUSEWHEEL);
    wheel.SetEventObject(m_rows);
    wheel.m_wheelRotation = -120;
    wheel.m_wheelDelta = 120;
    wheel.m_linesPerAction = 3;
    m_rows->GetEventHandler()->ProcessEvent(wheel);
    EXPECT_EQ(m_rows->GetTopItem(), 3);
    wheel.m_wheelRotation = -60;
    m_rows->GetEventHandler()->ProcessEvent(wheel);
    EXPECT_EQ(m_rows->GetTopItem(), 3) << "half a notch waits for the other half";
    m_rows->GetEventHandler()->ProcessEvent(wheel);
    EXPECT_EQ(m_rows->GetTopItem(), 6);
    wheel.m_wheelRotation = 120 * 10;
    m_rows->GetEventHandler()->ProcessEvent(wheel);
    EXPECT_EQ(m_rows->GetTopItem(), 0);
    wheel.m_wheelRotation = -120 * 100;
    m_rows->GetEventHandler()->ProcessEvent(wheel);
    EXPECT_EQ(m_rows->GetTopItem() + m_rows->GetCountPerPage(), 100);
}

TEST_F(ListInput, ScrollbarEventsMoveByLinesAndPages)
{
    Build(0, 100);
    const long page = m_rows->GetCountPerPage();
    struct Step
    {
        wxEventType type;
        long expectedTop;
    };
    for (const Step& step : {Step{wxEVT_SCROLLWIN_LINEDOWN, 1}, Step{wxEVT_SCROLLWIN_PAGEDOWN, 1 + page},
                             Step{wxEVT_SCROLLWIN_LINEUP, page}, Step{wxEVT_SCROLLWIN_BOTTOM, 100 - page},
                             Step{wxEVT_SCROLLWIN_TOP, 0}})
    {
        wxScrollWinEvent event(step.type, 0, wxVERTICAL);
        event.SetEventObject(m_rows);
        m_rows->GetEventHandler()->ProcessEvent(event);
        EXPECT_EQ(m_rows->GetTopItem(), step.expectedTop) << "event " << step.type;
    }
}

TEST_F(ListInput, HeaderFollowsTheRowsWhenScrolledSideways)
{
    m_list = MakeList(wxLC_REPORT | wxLC_VRULES);
    for (int column = 0; column < 3; ++column)
        m_list->InsertColumn(column, wxS("Wide"), wxLIST_FORMAT_LEFT, 300);
    m_list->InsertItem(0, wxString());
    m_rows = m_list->GetMainWindow();
    m_rows->LayoutIfNeeded();
    m_rows->ScrollToX(100);
    ASSERT_EQ(m_rows->GetScrollX(), 100);

    const wxColour border = Themer::GetThemeService()->GetTheme("HeaderView").lineColour;
    const wxImage header = RenderHeader(m_list);
    EXPECT_EQ(PixelAt(header, 200, 12), border) << "first column's edge moved left by the scroll";
    EXPECT_NE(PixelAt(header, 300, 12), border);
    const wxImage rows = RenderRows(m_list);
    const int mid = m_rows->GetLineHeight() / 2;
    EXPECT_EQ(PixelAt(rows, 198, mid), ListTheme().lineColour);
    EXPECT_EQ(PixelAt(rows, 498, mid), ListTheme().lineColour);

    SendKey(m_rows, WXK_LEFT);
    EXPECT_EQ(m_rows->GetScrollX(), 85);
    m_rows->ScrollToX(100000);
    EXPECT_EQ(m_rows->GetScrollX(), 900 - m_rows->GetClientSize().GetWidth())
        << "no scrolling past the last column";
}
} // namespace

namespace
{
TEST_F(ListInput, AutosizeFitsTheWidestCellOrTheLabel)
{
    Build(0, 0);
    m_list->InsertItem(0, wxS("short"));
    m_list->InsertItem(1, wxS("a considerably longer cell text"));
    const int widest = m_rows->GetTextExtent(wxS("a considerably longer cell text")).GetWidth();
    ASSERT_TRUE(m_list->SetColumnWidth(0, wxLIST_AUTOSIZE));
    EXPECT_EQ(m_list->GetColumnWidth(0), widest + 16);
    ASSERT_TRUE(m_list->SetColumnWidth(0, wxLIST_AUTOSIZE_USEHEADER));
    EXPECT_EQ(m_list->GetColumnWidth(0), m_rows->GetTextExtent(wxS("Name")).GetWidth() + 16);
    EXPECT_FALSE(m_list->SetColumnWidth(5, 10)) << "no such column";
}
} // namespace

namespace
{
TEST_F(ListInput, RightClickSelectsTheRowThenReportsIt)
{
    Build(wxLC_SINGLE_SEL, 5);
    Click(1);
    m_events->Take();
    const int lh = m_rows->GetLineHeight();
    SendMouse(m_rows, wxEVT_RIGHT_DOWN, 50, 3 * lh + lh / 2);
    EXPECT_EQ(m_events->Take(), (Events{Deselected(1), Focused(3), Selected(3),
                                        EventRecord{wxEVT_LIST_ITEM_RIGHT_CLICK, 3, -1}}));
}

TEST_F(ListInput, ItemsKeepTheirTextsImagesDataAndState)
{
    Build(wxLC_SINGLE_SEL, 0);
    EXPECT_EQ(m_list->InsertItem(0, wxString(), 0), 0);
    EXPECT_EQ(m_list->InsertItem(1, wxS("second")), 1);
    EXPECT_EQ(m_list->InsertItem(99, wxS("appended")), 2) << "an index past the end appends";
    EXPECT_TRUE(m_list->SetItem(0, 1, wxS("cell")));
    EXPECT_FALSE(m_list->SetItem(7, 1, wxS("no such row")));
    EXPECT_TRUE(m_list->SetItemData(0, 42));
    m_list->SetItemState(0, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);

    wxListItem info;
    info.SetId(0);
    info.SetColumn(1);
    info.SetMask(wxLIST_MASK_TEXT | wxLIST_MASK_DATA | wxLIST_MASK_STATE | wxLIST_MASK_IMAGE);
    info.SetStateMask(wxLIST_STATE_SELECTED);
    ASSERT_TRUE(m_list->GetItem(info));
    EXPECT_EQ(info.GetText(), wxS("cell"));
    EXPECT_EQ(info.GetData(), 42u);
    EXPECT_EQ(info.GetState(), wxLIST_STATE_SELECTED);
    EXPECT_EQ(info.GetImage(), -1) << "column 1 has no image of its own";
    info.SetColumn(0);
    ASSERT_TRUE(m_list->GetItem(info));
    EXPECT_EQ(info.GetImage(), 0);
    EXPECT_EQ(m_list->GetItemData(0), 42u);
    EXPECT_EQ(m_list->GetNextItem(-1, wxLIST_NEXT_ALL, wxLIST_STATE_SELECTED), 0);
    EXPECT_EQ(m_list->GetSelectedItemCount(), 1);
    EXPECT_EQ(m_list->GetItemText(2), wxS("appended"));
    info.SetId(3);
    EXPECT_FALSE(m_list->GetItem(info)) << "no such row";
}
} // namespace
