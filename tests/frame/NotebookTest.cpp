// The owner-drawn notebook as a user meets it: tabs in order, clicks and the
// keyboard switch pages with the notebook events, the selected tab is drawn in
// its state's colours, and the owner's hooks shape the layout.
#include "platform/ui/NOwnerDrawNotebook.h"

#include "ColourPrint.h"
#include "GuiTest.h"

#include <gtest/gtest.h>
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

class TestNotebook : public CNOwnerDrawNotebook
{
public:
    wxSize extraPadding, extraTabSize;
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
    void DrawTabDecoration(wxDC&, const wxRect& tab, size_t page) const override
    {
        decorated.emplace_back(page, tab);
    }
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
        ASSERT_TRUE(guitest::PumpUntil(
            [this]
            {
                return frame->GetClientSize().x > 100 && book->GetSize() == frame->GetClientSize() &&
                       book->GetTabStrip()->GetSize().x == book->GetClientSize().x;
            }));
        tabs = book->GetTabRects();
    }
    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump(10);
    }

    // Each event as "changing 0>2" or "changed 0>2".
    void Record(wxBookCtrlEvent& event)
    {
        const bool changing = event.GetEventType() == wxEVT_NOTEBOOK_PAGE_CHANGING;
        events.push_back(wxString::Format("%s %d>%d", changing ? "changing" : "changed",
                                          event.GetOldSelection(), event.GetSelection()));
        if (changing && vetoChanges)
            event.Veto(); // a veto counts only if the event is not skipped
        else
            event.Skip();
    }
    // The pages' titles in order, "*" after the selected one and "+" after each page shown.
    wxString State() const
    {
        wxString state;
        for (size_t i = 0; i < book->GetPageCount(); ++i)
            state << (i ? " " : "") << book->GetPageText(i) << (int(i) == book->GetSelection() ? "*" : "")
                  << (book->GetPage(i)->IsShown() ? "+" : "");
        return state;
    }
    void Send(wxWindow* to, wxEvent& event)
    {
        event.SetEventObject(to);
        to->GetEventHandler()->ProcessEvent(event);
    }
    void MouseOnStrip(wxEventType type, const wxPoint& at)
    {
        wxMouseEvent mouse(type);
        mouse.SetPosition(at);
        Send(book->GetTabStrip(), mouse);
    }
    void ClickTab(int tab) { MouseOnStrip(wxEVT_LEFT_DOWN, Middle(tabs.at(tab))); }
    static wxPoint Middle(const wxRect& r) { return wxPoint(r.x + r.width / 2, r.y + r.height / 2); }
    // A point of the tab's own fill: below the accent bar, beside the label.
    static wxPoint FillPoint(const wxRect& tab)
    {
        return wxPoint(tab.GetRight() - 1, tab.y + tab.height / 2);
    }

    // A key pressed while the focus is inside the current page (wxEVT_CHAR_HOOK), or on the strip.
    void Press(wxWindow* to, wxEventType type, int key, int modifiers = wxMOD_NONE)
    {
        wxKeyEvent press(type);
        press.m_keyCode = key;
        press.m_controlDown = (modifiers & wxMOD_CONTROL) != 0;
        press.m_shiftDown = (modifiers & wxMOD_SHIFT) != 0;
        Send(to, press);
    }

    wxColour PixelOfStrip(const wxPoint& at) const { return Pixel(RenderStrip(*book), at.x, at.y); }

    wxFrame* frame = nullptr;
    TestNotebook* book = nullptr;
    std::vector<wxWindow*> pages;
    std::vector<wxRect> tabs;
    std::vector<wxString> events;
    bool vetoChanges = false;
};

TEST_F(NotebookTest, AClickOnATabSelectsItWithChangingThenChangedUnlessVetoed)
{
    EXPECT_EQ(State(), "First*+ Second Third");
    ASSERT_EQ(tabs.size(), 3u);
    EXPECT_TRUE(tabs[0].GetRight() < tabs[1].GetLeft() && tabs[1].GetRight() < tabs[2].GetLeft());
    // Where a click lands: on a tab, or on the page below the strip.
    long flags = 0;
    EXPECT_EQ(book->HitTest(tabs[1].GetPosition() + wxPoint(1, 1), &flags), 1);
    EXPECT_EQ(flags, wxBK_HITTEST_ONITEM);
    EXPECT_EQ(book->HitTest(wxPoint(10, book->GetTabStripHeight() + 10), &flags), wxNOT_FOUND);
    EXPECT_EQ(flags, wxBK_HITTEST_ONPAGE);
    ClickTab(0);                                                                           // the selected one
    MouseOnStrip(wxEVT_LEFT_DOWN, wxPoint(book->GetTabStrip()->GetClientSize().x - 2, 2)); // beside the tabs
    EXPECT_TRUE(events.empty());
    ClickTab(2);
    EXPECT_EQ(State(), "First Second Third*+");
    EXPECT_EQ(events, (std::vector<wxString>{"changing 0>2", "changed 0>2"}));

    events.clear();
    vetoChanges = true;
    ClickTab(1);
    EXPECT_EQ(State(), "First Second Third*+");
    EXPECT_EQ(events, (std::vector<wxString>{"changing 2>1"}));

    events.clear();
    EXPECT_EQ(book->ChangeSelection(1), 2);
    EXPECT_EQ(State(), "First Second*+ Third");
    EXPECT_TRUE(events.empty()) << "ChangeSelection sends nothing";
}

TEST_F(NotebookTest, ControlKeysInAPageCycleAndArrowsOnTheStripMoveWithoutWrapping)
{
    // key, modifiers, the pages selected by each press from page 0.
    for (const auto& [key, modifiers, selections] : {std::tuple{WXK_TAB, int(wxMOD_CONTROL), "120"},
                                                     {WXK_TAB, wxMOD_CONTROL | wxMOD_SHIFT, "210"},
                                                     {WXK_PAGEDOWN, wxMOD_CONTROL, "120"},
                                                     {WXK_PAGEUP, wxMOD_CONTROL, "210"}})
    {
        book->ChangeSelection(0);
        for (int previous = 0, i = 0; selections[i]; previous = selections[i++] - '0')
        {
            events.clear();
            Press(book->GetCurrentPage(), wxEVT_CHAR_HOOK, key, modifiers);
            const wxString step = wxString::Format("%d>%d", previous, selections[i] - '0');
            ASSERT_EQ(events, (std::vector<wxString>{"changing " + step, "changed " + step})) << key;
            EXPECT_TRUE(book->GetCurrentPage()->IsShown() && !book->GetPage(previous)->IsShown());
        }
    }

    // Without Control the keys are left to the page and go on to the frame.
    book->ChangeSelection(0);
    events.clear();
    bool reachedFrame = false;
    frame->Bind(wxEVT_CHAR_HOOK, [&](wxKeyEvent& event) { reachedFrame = true, event.Skip(); });
    Press(book->GetCurrentPage(), wxEVT_CHAR_HOOK, WXK_TAB);
    Press(book->GetCurrentPage(), wxEVT_CHAR_HOOK, WXK_PAGEDOWN, wxMOD_SHIFT);
    EXPECT_EQ(State(), "First*+ Second Third");
    EXPECT_TRUE(events.empty() && reachedFrame);

    for (const auto& [key, selection] :
         {std::pair{WXK_LEFT, 0}, {WXK_RIGHT, 1}, {WXK_END, 2}, {WXK_RIGHT, 2}, {WXK_HOME, 0}})
    {
        Press(book->GetTabStrip(), wxEVT_KEY_DOWN, key);
        EXPECT_EQ(book->GetSelection(), selection) << key;
    }
}

// Which tab shows as selected is read back from the display below; here the
// parts a paint of the strip alone can show.
TEST_F(NotebookTest, DrawsTheAccentTheBorderAndTheHoveredTabOpenOntoThePage)
{
    const CNNotebookCustomInfo& info = book->GetCustomInfo();
    const int bottom = book->GetTabStrip()->GetClientSize().y - 1;
    EXPECT_EQ(PixelOfStrip(wxPoint(Middle(tabs[0]).x, tabs[0].y)), info.accentColour);
    EXPECT_EQ(PixelOfStrip(wxPoint(Middle(tabs[1]).x, tabs[1].y)), kStrip);
    EXPECT_EQ(PixelOfStrip(wxPoint(Middle(tabs[0]).x, bottom)), kPage) << "the selected tab joins its page";
    EXPECT_EQ(PixelOfStrip(wxPoint(Middle(tabs[1]).x, bottom)), info.borderColour);

    const wxColour hover = info.states[CNNotebookCustomInfo::Hover].fillColour;
    ASSERT_TRUE(hover != kStrip && hover != kPage);
    MouseOnStrip(wxEVT_MOTION, tabs[2].GetPosition() + wxPoint(2, tabs[2].height / 2));
    EXPECT_EQ(PixelOfStrip(FillPoint(tabs[2])), hover);
    EXPECT_EQ(PixelOfStrip(FillPoint(tabs[1])), kStrip);
    MouseOnStrip(wxEVT_LEAVE_WINDOW, wxPoint());
    EXPECT_EQ(PixelOfStrip(FillPoint(tabs[2])), kStrip);
}

#ifdef WYX_TEST_SCREEN_GRAB
// What the strip's paint handler put on the display, read back from the screen.
TEST_F(NotebookTest, ThePaintedStripShowsTheSelectedTabInItsColour)
{
    wxWindow* strip = book->GetTabStrip();
    const wxRect onScreen(strip->ClientToScreen(wxPoint(0, 0)), strip->GetClientSize());
    const auto shows = [&](int selected, int idle)
    {
        const wxImage screen = GrabScreen(onScreen);
        const auto at = [&](int tab)
        { return Pixel(screen, FillPoint(tabs[tab]).x, FillPoint(tabs[tab]).y); };
        return screen.IsOk() && at(selected) == kPage && at(idle) == kStrip;
    };
    // The toolkit paints on its own schedule.
    EXPECT_TRUE(guitest::PumpUntil([&] { return shows(0, 1); }));
    ClickTab(1);
    EXPECT_TRUE(guitest::PumpUntil([&] { return shows(1, 0); }));
}
#endif

// The page shown at start fills the area below the strip as MainFrameTest checks;
// here a page shown later, the owner's hooks and the tab's own extras.
TEST_F(NotebookTest, PagesFillTheAreaBelowTheStripAndHooksAndExtrasChangeTheLayout)
{
    book->SetSize(400, 250);
    const int strip = book->GetTabStripHeight();
    EXPECT_EQ(book->GetTabStrip()->GetRect(), wxRect(0, 0, 400, strip));
    ClickTab(2);
    EXPECT_EQ(pages[2]->GetRect(), wxRect(0, strip, 400, 250 - strip));

    book->extraPadding = wxSize(5, 2);
    book->extraTabSize = wxSize(7, 6);
    book->pageInsets = wxRect(3, 4, 5, 6);
    const std::vector<wxRect> grown = book->GetTabRects();
    for (size_t i = 0; i < tabs.size(); ++i)
        EXPECT_EQ(grown[i].GetSize(), tabs[i].GetSize() + wxSize(10 + 7, 4 + 6)) << i;
    EXPECT_EQ(book->GetTabStripHeight(), strip + 10);
    EXPECT_EQ(book->GetPageRect(), wxRect(3, strip + 10 + 4, 400 - 3 - 5, 250 - strip - 10 - 4 - 6));

    book->decorated.clear();
    PixelOfStrip(wxPoint());
    ASSERT_EQ(book->decorated.size(), 3u);
    for (size_t i = 0; i < 3; ++i)
        EXPECT_EQ(book->decorated[i], std::make_pair(i, grown[i]));

    book->extraPadding = book->extraTabSize = wxSize();
    ASSERT_TRUE(book->AddPage(new wxPanel(book), "Wide", false, -1, nullptr, 140, true));
    EXPECT_EQ(book->GetTabRects().at(3).width, 140);
    ASSERT_TRUE(book->SetPageImage(0, 99));
    PixelOfStrip(wxPoint()); // must not fail on the missing image
    EXPECT_EQ(book->GetTabRects()[0].width, tabs[0].width - 16 - 6);
}

TEST_F(NotebookTest, AddingAndRemovingPagesKeepsTheSelectionOnTheSamePageOrItsNeighbour)
{
    EXPECT_FALSE(book->AddPage(nullptr, "none", false, -1, nullptr, -1, false));
    EXPECT_FALSE(book->AddPage(new wxPanel(frame), "stranger", false, -1, nullptr, -1, false));
    EXPECT_FALSE(book->InsertPage(9, new wxPanel(book), "far"));
    ASSERT_TRUE(book->RemovePage(0)); // the selected one
    EXPECT_FALSE(pages[0]->IsShown());
    pages[0]->Destroy();
    EXPECT_EQ(State(), "Second*+ Third");
    ASSERT_TRUE(book->InsertPage(0, new wxPanel(book), "Zero"));
    EXPECT_EQ(State(), "Zero Second*+ Third");
    book->ChangeSelection(2);
    ASSERT_TRUE(book->DeletePage(0));
    EXPECT_EQ(State(), "Second Third*+");
    ASSERT_TRUE(book->DeletePage(1)); // the selected one
    EXPECT_EQ(State(), "Second*+");
    ASSERT_TRUE(book->DeleteAllPages());
    EXPECT_EQ(book->GetSelection(), wxNOT_FOUND);
    EXPECT_TRUE(book->GetTabRects().empty());
    EXPECT_FALSE(book->DeletePage(0));
}

} // namespace
