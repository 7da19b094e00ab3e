// The owner-drawn notebook as a user meets it: tabs in order, clicks and the
// keyboard switch pages with the notebook events, and the selected tab is
// drawn in its state's colours.
#include "platform/ui/NOwnerDrawNotebook.h"

#include "ColourPrint.h"
#include "GuiTest.h"
#include "Settle.h"

#include <gtest/gtest.h>
#include <wx/dcmemory.h>
#include <wx/frame.h>
#include <wx/panel.h>

#include <vector>

#ifdef WYX_TEST_SCREEN_GRAB
#include "ScreenGrab.h"
#endif

namespace
{
// Colours chosen to be told apart in pixels.
const wxColour kStrip(0xD0, 0xE0, 0xC0);
const wxColour kPage(0xF8, 0xF0, 0xE0);
const wxColour kText(0x20, 0x10, 0x60);

class TestNotebook : public CNOwnerDrawNotebook
{
public:
    wxSize extraPadding;
    wxSize extraTabSize;
    wxRect pageInsets;
    mutable std::vector<std::pair<size_t, wxRect>> decorated;

protected:
    void SetupCustomInfo() override
    {
        CustomInfo().baseColours[0] = kStrip;
        CustomInfo().baseColours[1] = kPage;
        DefaultCustomInfo();
    }
    wxSize GetExtraTabPadding() const override { return extraPadding; }
    wxRect GetPageInsets() const override { return pageInsets; }
    wxSize AdjustTabSize(const wxSize& size) const override { return size + extraTabSize; }
    void DrawTabDecoration(wxDC&, const wxRect& tabRect, size_t page) const override
    {
        decorated.emplace_back(page, tabRect);
    }
};

struct PageEvent
{
    wxEventType type;
    int oldSelection;
    int selection;
};

class NotebookTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        frame = new wxFrame(nullptr, wxID_ANY, "notebook", wxDefaultPosition, wxSize(500, 300));
        book = new TestNotebook;
        ASSERT_TRUE(book->Create(frame, 77, wxDefaultPosition, wxDefaultSize, wxNB_TOP | wxBORDER_NONE));
        for (const char* title : {"First", "Second", "Third"})
        {
            pages.push_back(new wxPanel(book));
            ASSERT_TRUE(book->AddPage(pages.back(), title, false, 1, nullptr, -1, false));
        }
        book->Bind(wxEVT_NOTEBOOK_PAGE_CHANGING, &NotebookTest::Record, this);
        book->Bind(wxEVT_NOTEBOOK_PAGE_CHANGED, &NotebookTest::Record, this);
        frame->Show();
        ASSERT_TRUE(PumpUntil(
            [this]
            {
                return frame->GetClientSize().x > 100 && book->GetSize() == frame->GetClientSize() &&
                       book->GetTabStrip()->GetSize().x == book->GetClientSize().x;
            }));
    }

    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump(10);
    }

    void Record(wxBookCtrlEvent& event)
    {
        events.push_back({event.GetEventType(), event.GetOldSelection(), event.GetSelection()});
        if (event.GetEventType() == wxEVT_NOTEBOOK_PAGE_CHANGING && vetoChanges)
            event.Veto(); // a veto counts only if the event is not skipped
        else
            event.Skip();
    }

    void ClickTab(int tab)
    {
        const wxRect rect = book->GetTabRects().at(tab);
        wxMouseEvent click(wxEVT_LEFT_DOWN);
        click.SetPosition(wxPoint(rect.x + rect.width / 2, rect.y + rect.height / 2));
        click.SetEventObject(book->GetTabStrip());
        book->GetTabStrip()->GetEventHandler()->ProcessEvent(click);
    }

    // A key pressed while the focus is inside the current page.
    void PressInPage(int key, int modifiers)
    {
        wxKeyEvent press(wxEVT_CHAR_HOOK);
        press.m_keyCode = key;
        press.m_controlDown = (modifiers & wxMOD_CONTROL) != 0;
        press.m_shiftDown = (modifiers & wxMOD_SHIFT) != 0;
        wxWindow* page = book->GetCurrentPage();
        press.SetEventObject(page);
        page->GetEventHandler()->ProcessEvent(press);
    }

    wxImage RenderStrip() const
    {
        const wxSize size = book->GetTabStrip()->GetClientSize();
        wxBitmap bitmap(size);
        {
            wxMemoryDC dc(bitmap);
            book->RenderTabStrip(dc);
        }
        return bitmap.ConvertToImage();
    }

    wxFrame* frame = nullptr;
    TestNotebook* book = nullptr;
    std::vector<wxWindow*> pages;
    std::vector<PageEvent> events;
    bool vetoChanges = false;
};

wxColour Pixel(const wxImage& image, const wxPoint& at)
{
    return wxColour(image.GetRed(at.x, at.y), image.GetGreen(at.x, at.y), image.GetBlue(at.x, at.y));
}

// A point of the tab's own fill: below the accent bar, between the label's
// focus ring and the tab's edge.
wxPoint FillPoint(const wxRect& tab)
{
    return wxPoint(tab.GetRight() - 1, tab.y + tab.height / 2);
}

TEST_F(NotebookTest, KeepsPagesInTheOrderAddedWithTheirTitlesAndImages)
{
    ASSERT_EQ(book->GetPageCount(), 3u);
    EXPECT_EQ(book->GetPageText(0), "First");
    EXPECT_EQ(book->GetPageText(1), "Second");
    EXPECT_EQ(book->GetPageText(2), "Third");
    for (size_t i = 0; i < 3; ++i)
    {
        EXPECT_EQ(book->GetPage(i), pages[i]);
        EXPECT_EQ(book->GetPageImage(i), 1);
    }
    const std::vector<wxRect> tabs = book->GetTabRects();
    ASSERT_EQ(tabs.size(), 3u);
    EXPECT_LT(tabs[0].GetRight(), tabs[1].GetLeft());
    EXPECT_LT(tabs[1].GetRight(), tabs[2].GetLeft());
}

TEST_F(NotebookTest, ShowsTheFirstPageAddedWithoutSendingEvents)
{
    EXPECT_EQ(book->GetSelection(), 0);
    EXPECT_TRUE(pages[0]->IsShown());
    EXPECT_FALSE(pages[1]->IsShown());
    EXPECT_FALSE(pages[2]->IsShown());
    EXPECT_TRUE(events.empty());
}

TEST_F(NotebookTest, ClickingATabSelectsItAndSendsChangingThenChanged)
{
    ClickTab(2);
    EXPECT_EQ(book->GetSelection(), 2);
    EXPECT_TRUE(pages[2]->IsShown());
    EXPECT_FALSE(pages[0]->IsShown());
    ASSERT_EQ(events.size(), 2u);
    EXPECT_EQ(events[0].type, wxEVT_NOTEBOOK_PAGE_CHANGING);
    EXPECT_EQ(events[1].type, wxEVT_NOTEBOOK_PAGE_CHANGED);
    for (const PageEvent& event : events)
    {
        EXPECT_EQ(event.oldSelection, 0);
        EXPECT_EQ(event.selection, 2);
    }
}

TEST_F(NotebookTest, ClickingTheSelectedTabOrBesideTheTabsChangesNothing)
{
    ClickTab(0);
    wxMouseEvent click(wxEVT_LEFT_DOWN);
    click.SetPosition(wxPoint(book->GetTabStrip()->GetClientSize().x - 2, 2));
    book->GetTabStrip()->GetEventHandler()->ProcessEvent(click);
    EXPECT_EQ(book->GetSelection(), 0);
    EXPECT_TRUE(events.empty());
}

TEST_F(NotebookTest, AVetoedChangeKeepsTheCurrentPage)
{
    vetoChanges = true;
    ClickTab(1);
    EXPECT_EQ(book->GetSelection(), 0);
    EXPECT_TRUE(pages[0]->IsShown());
    ASSERT_EQ(events.size(), 1u);
    EXPECT_EQ(events[0].type, wxEVT_NOTEBOOK_PAGE_CHANGING);
}

TEST_F(NotebookTest, ChangeSelectionSendsNoEvents)
{
    EXPECT_EQ(book->ChangeSelection(1), 0);
    EXPECT_EQ(book->GetSelection(), 1);
    EXPECT_TRUE(events.empty());
}

struct KeyCycle
{
    const char* name;
    int key;
    int modifiers;
    std::vector<int> selections; // after each press, starting from page 0
};

class NotebookKeyboard : public NotebookTest, public ::testing::WithParamInterface<KeyCycle>
{
};

TEST_P(NotebookKeyboard, CyclesThroughThePagesWithEvents)
{
    const KeyCycle& cycle = GetParam();
    int previous = book->GetSelection();
    for (int expected : cycle.selections)
    {
        events.clear();
        PressInPage(cycle.key, cycle.modifiers);
        ASSERT_EQ(book->GetSelection(), expected);
        EXPECT_TRUE(book->GetPage(expected)->IsShown());
        ASSERT_EQ(events.size(), 2u);
        EXPECT_EQ(events[1].type, wxEVT_NOTEBOOK_PAGE_CHANGED);
        EXPECT_EQ(events[1].oldSelection, previous);
        EXPECT_EQ(events[1].selection, expected);
        previous = expected;
    }
}

INSTANTIATE_TEST_SUITE_P(
    Shortcuts, NotebookKeyboard,
    ::testing::Values(KeyCycle{"CtrlTab", WXK_TAB, wxMOD_CONTROL, {1, 2, 0, 1}},
                      KeyCycle{"CtrlShiftTab", WXK_TAB, wxMOD_CONTROL | wxMOD_SHIFT, {2, 1, 0, 2}},
                      KeyCycle{"CtrlPageDown", WXK_PAGEDOWN, wxMOD_CONTROL, {1, 2, 0}},
                      KeyCycle{"CtrlPageUp", WXK_PAGEUP, wxMOD_CONTROL, {2, 1, 0}}),
    [](const ::testing::TestParamInfo<KeyCycle>& info) { return std::string(info.param.name); });

TEST_F(NotebookTest, KeysWithoutControlAreLeftToThePage)
{
    bool reachedFrame = false;
    frame->Bind(wxEVT_CHAR_HOOK,
                [&](wxKeyEvent& event)
                {
                    reachedFrame = true;
                    event.Skip();
                });
    PressInPage(WXK_TAB, wxMOD_NONE);
    PressInPage(WXK_PAGEDOWN, wxMOD_SHIFT);
    EXPECT_EQ(book->GetSelection(), 0);
    EXPECT_TRUE(events.empty());
    EXPECT_TRUE(reachedFrame);
}

TEST_F(NotebookTest, ArrowKeysOnTheStripMoveWithoutWrapping)
{
    auto press = [&](int key)
    {
        wxKeyEvent down(wxEVT_KEY_DOWN);
        down.m_keyCode = key;
        down.SetEventObject(book->GetTabStrip());
        book->GetTabStrip()->GetEventHandler()->ProcessEvent(down);
        return book->GetSelection();
    };
    EXPECT_EQ(press(WXK_LEFT), 0);
    EXPECT_EQ(press(WXK_RIGHT), 1);
    EXPECT_EQ(press(WXK_END), 2);
    EXPECT_EQ(press(WXK_RIGHT), 2);
    EXPECT_EQ(press(WXK_HOME), 0);
}

TEST_F(NotebookTest, DrawsTheSelectedTabInItsStateColourAndTheOthersIdle)
{
    const CNNotebookCustomInfo& info = book->GetCustomInfo();
    EXPECT_EQ(info.states[CNNotebookCustomInfo::Selected].fillColour, kPage);
    EXPECT_EQ(info.states[CNNotebookCustomInfo::Normal].fillColour, kStrip);

    const std::vector<wxRect> tabs = book->GetTabRects();
    wxImage strip = RenderStrip();
    EXPECT_EQ(Pixel(strip, FillPoint(tabs[0])), kPage);
    EXPECT_EQ(Pixel(strip, FillPoint(tabs[1])), kStrip);
    EXPECT_EQ(Pixel(strip, wxPoint(tabs[0].x + tabs[0].width / 2, tabs[0].y)), info.accentColour);
    EXPECT_EQ(Pixel(strip, wxPoint(tabs[1].x + tabs[1].width / 2, tabs[1].y)), kStrip);

    ClickTab(1);
    strip = RenderStrip();
    EXPECT_EQ(Pixel(strip, FillPoint(tabs[0])), kStrip);
    EXPECT_EQ(Pixel(strip, FillPoint(tabs[1])), kPage);
}

#ifdef WYX_TEST_SCREEN_GRAB
// What the strip's paint handler put on the display, read back from the screen.
TEST_F(NotebookTest, ThePaintedStripShowsTheSelectedTabInItsColour)
{
    wxWindow* strip = book->GetTabStrip();
    const wxRect onScreen(strip->ClientToScreen(wxPoint(0, 0)), strip->GetClientSize());
    const std::vector<wxRect> tabs = book->GetTabRects();
    const auto shows = [&](int tab, const wxColour& colour)
    {
        const wxImage screen = GrabScreen(onScreen);
        return screen.IsOk() && Pixel(screen, FillPoint(tabs[tab])) == colour;
    };
    // The toolkit paints on its own schedule.
    EXPECT_TRUE(PumpUntil([&] { return shows(0, kPage) && shows(1, kStrip); }));

    ClickTab(1);
    EXPECT_TRUE(PumpUntil([&] { return shows(0, kStrip) && shows(1, kPage); }));
}
#endif

TEST_F(NotebookTest, TheSelectedTabOpensOntoItsPage)
{
    const std::vector<wxRect> tabs = book->GetTabRects();
    const wxImage strip = RenderStrip();
    const int bottom = strip.GetHeight() - 1;
    const wxColour border = book->GetCustomInfo().borderColour;
    EXPECT_EQ(Pixel(strip, wxPoint(tabs[0].x + tabs[0].width / 2, bottom)), kPage);
    EXPECT_EQ(Pixel(strip, wxPoint(tabs[1].x + tabs[1].width / 2, bottom)), border);
}

TEST_F(NotebookTest, PagesFillTheAreaBelowTheStripAndFollowResizes)
{
    book->SetSize(400, 250);
    const int strip = book->GetTabStripHeight();
    EXPECT_EQ(book->GetTabStrip()->GetRect(), wxRect(0, 0, 400, strip));
    EXPECT_EQ(pages[0]->GetRect(), wxRect(0, strip, 400, 250 - strip));

    ClickTab(2);
    EXPECT_EQ(pages[2]->GetRect(), wxRect(0, strip, 400, 250 - strip));
}

TEST_F(NotebookTest, HooksChangeTheLayoutOnlyWhenTheyAnswerSomething)
{
    const std::vector<wxRect> before = book->GetTabRects();
    const int stripBefore = book->GetTabStripHeight();
    book->extraPadding = wxSize(5, 2);
    const std::vector<wxRect> after = book->GetTabRects();
    ASSERT_EQ(after.size(), before.size());
    for (size_t i = 0; i < before.size(); ++i)
        EXPECT_EQ(after[i].GetSize(), before[i].GetSize() + wxSize(10, 4));
    EXPECT_EQ(book->GetTabStripHeight(), stripBefore + 4);

    book->extraPadding = wxSize();
    book->pageInsets = wxRect(3, 4, 5, 6);
    book->SetSize(400, 250);
    const wxRect page = book->GetPageRect();
    EXPECT_EQ(page, wxRect(3, stripBefore + 4, 400 - 3 - 5, 250 - stripBefore - 4 - 6));
}

TEST_F(NotebookTest, SizeAndDecorationHooksSeeEveryTab)
{
    const std::vector<wxRect> before = book->GetTabRects();
    const int stripBefore = book->GetTabStripHeight();
    book->extraTabSize = wxSize(7, 6);
    const std::vector<wxRect> after = book->GetTabRects();
    for (size_t i = 0; i < before.size(); ++i)
        EXPECT_EQ(after[i].GetSize(), before[i].GetSize() + wxSize(7, 6));
    EXPECT_EQ(book->GetTabStripHeight(), stripBefore + 6);

    book->decorated.clear();
    RenderStrip();
    ASSERT_EQ(book->decorated.size(), 3u);
    for (size_t i = 0; i < 3; ++i)
    {
        EXPECT_EQ(book->decorated[i].first, i);
        EXPECT_EQ(book->decorated[i].second, after[i]);
    }
}

TEST_F(NotebookTest, TheTabUnderThePointerIsDrawnInItsHoverColour)
{
    const std::vector<wxRect> tabs = book->GetTabRects();
    const wxColour hover = book->GetCustomInfo().states[CNNotebookCustomInfo::Hover].fillColour;
    ASSERT_NE(hover, kStrip);
    ASSERT_NE(hover, kPage);

    wxMouseEvent motion(wxEVT_MOTION);
    motion.SetPosition(tabs[2].GetPosition() + wxPoint(2, tabs[2].height / 2));
    book->GetTabStrip()->GetEventHandler()->ProcessEvent(motion);
    EXPECT_EQ(Pixel(RenderStrip(), FillPoint(tabs[2])), hover);
    EXPECT_EQ(Pixel(RenderStrip(), FillPoint(tabs[1])), kStrip);

    wxMouseEvent leave(wxEVT_LEAVE_WINDOW);
    book->GetTabStrip()->GetEventHandler()->ProcessEvent(leave);
    EXPECT_EQ(Pixel(RenderStrip(), FillPoint(tabs[2])), kStrip);
}

TEST_F(NotebookTest, HitTestFindsTabsAndThePage)
{
    const std::vector<wxRect> tabs = book->GetTabRects();
    long flags = 0;
    EXPECT_EQ(book->HitTest(tabs[1].GetPosition() + wxPoint(1, 1), &flags), 1);
    EXPECT_EQ(flags, wxBK_HITTEST_ONITEM);
    EXPECT_EQ(book->HitTest(wxPoint(10, book->GetTabStripHeight() + 10), &flags), wxNOT_FOUND);
    EXPECT_EQ(flags, wxBK_HITTEST_ONPAGE);
}

TEST_F(NotebookTest, RemovingPagesKeepsTheSelectionOnTheSamePageOrItsNeighbour)
{
    book->ChangeSelection(2);
    ASSERT_TRUE(book->DeletePage(0));
    EXPECT_EQ(book->GetSelection(), 1);
    EXPECT_EQ(book->GetPageText(1), "Third");

    ASSERT_TRUE(book->DeletePage(1)); // the selected one
    EXPECT_EQ(book->GetSelection(), 0);
    EXPECT_EQ(book->GetPageText(0), "Second");
    EXPECT_TRUE(book->GetPage(0)->IsShown());

    ASSERT_TRUE(book->DeleteAllPages());
    EXPECT_EQ(book->GetPageCount(), 0u);
    EXPECT_EQ(book->GetSelection(), wxNOT_FOUND);
    EXPECT_TRUE(book->GetTabRects().empty());
    EXPECT_FALSE(book->DeletePage(0));
}

TEST_F(NotebookTest, ASelectedPageTakenOutIsHiddenAndItsNeighbourShown)
{
    ASSERT_TRUE(book->RemovePage(0));
    EXPECT_FALSE(pages[0]->IsShown());
    EXPECT_TRUE(pages[1]->IsShown());
    EXPECT_EQ(book->GetSelection(), 0);
    EXPECT_EQ(book->GetCurrentPage(), pages[1]);
    pages[0]->Destroy();
}

TEST_F(NotebookTest, InsertingBeforeTheSelectionKeepsTheSamePageSelected)
{
    book->ChangeSelection(1);
    auto* page = new wxPanel(book);
    ASSERT_TRUE(book->InsertPage(0, page, "Zero"));
    EXPECT_EQ(book->GetSelection(), 2);
    EXPECT_EQ(book->GetCurrentPage(), pages[1]);
    EXPECT_FALSE(page->IsShown());
}

TEST_F(NotebookTest, RefusesPagesItCannotOwn)
{
    EXPECT_FALSE(book->AddPage(nullptr, "none", false, -1, nullptr, -1, false));
    auto* stranger = new wxPanel(frame);
    EXPECT_FALSE(book->AddPage(stranger, "stranger", false, -1, nullptr, -1, false));
    EXPECT_FALSE(book->InsertPage(9, new wxPanel(book), "far"));
    EXPECT_EQ(book->GetPageCount(), 3u);
}

TEST_F(NotebookTest, TabExtrasSetTheWidthAndTheBoldLabel)
{
    auto* page = new wxPanel(book);
    ASSERT_TRUE(book->AddPage(page, "Wide", false, -1, nullptr, 140, true));
    EXPECT_EQ(book->GetTabRects().at(3).width, 140);
}

TEST_F(NotebookTest, UnknownImagesAreLeftOutRatherThanDrawn)
{
    const int withImage = book->GetTabRects()[0].width;
    ASSERT_TRUE(book->SetPageImage(0, 99));
    const wxImage strip = RenderStrip(); // must not fail on the missing image
    EXPECT_TRUE(strip.IsOk());
    EXPECT_EQ(book->GetTabRects()[0].width, withImage - 16 - 6);
}
} // namespace
