// The owner-drawn notebook as a user meets it: clicks and the keyboard show
// the right page, the display shows which tab is selected, and a page shown
// later or after one is removed fills the page area.
#include "platform/ui/NOwnerDrawNotebook.h"

#include "ColourPrint.h"
#include "GuiTest.h"

#include <gtest/gtest.h>
#include <wx/frame.h>
#include <wx/panel.h>

#include <tuple>
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
protected:
    void SetupCustomInfo() override
    {
        CustomInfo().baseColours[0] = kStrip;
        CustomInfo().baseColours[1] = kPage;
        DefaultCustomInfo();
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
            ASSERT_TRUE(book->AddPage(new wxPanel(book), title, false, 1, nullptr, -1, false));
        frame->Show();
        ASSERT_TRUE(guitest::PumpUntil(
            [this] {
                return frame->GetClientSize().x > 100 &&
                       book->GetTabStrip()->GetSize().x == frame->GetClientSize().x;
            }));
        tabs = book->GetTabRects();
    }
    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump(10);
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
    void ClickStrip(const wxPoint& at)
    {
        wxMouseEvent mouse(wxEVT_LEFT_DOWN);
        mouse.SetPosition(at);
        Send(book->GetTabStrip(), mouse);
    }
    void ClickTab(int tab) { ClickStrip(FillPoint(tabs.at(tab))); }
    // A point of the tab's own fill: below the accent bar, beside the label.
    static wxPoint FillPoint(const wxRect& tab)
    {
        return wxPoint(tab.GetRight() - 1, tab.y + tab.height / 2);
    }

    wxFrame* frame = nullptr;
    TestNotebook* book = nullptr;
    std::vector<wxRect> tabs;
};

TEST_F(NotebookTest, ControlKeysInAPageCycleArrowsOnTheStripMoveWithoutWrappingAndOtherKeysGoOn)
{
    bool reachedFrame = false;
    frame->Bind(wxEVT_CHAR_HOOK, [&](wxKeyEvent& event) { reachedFrame = true, event.Skip(); });
    const int ctrl = wxMOD_CONTROL, back = wxMOD_CONTROL | wxMOD_SHIFT, shift = wxMOD_SHIFT,
              none = wxMOD_NONE;
    // In the page (where the focus is) or on the strip; the key and its modifiers.
    const std::tuple<bool, int, int> presses[] = {
        {false, WXK_TAB, ctrl},      {false, WXK_TAB, ctrl},    {false, WXK_TAB, ctrl},
        {false, WXK_TAB, back},      {false, WXK_PAGEUP, ctrl}, {false, WXK_PAGEDOWN, ctrl},
        {false, WXK_PAGEDOWN, ctrl}, {false, WXK_TAB, none},    {false, WXK_PAGEDOWN, shift},
        {true, WXK_LEFT, none},      {true, WXK_RIGHT, none},   {true, WXK_END, none},
        {true, WXK_RIGHT, none},     {true, WXK_HOME, none}};
    wxString selections;
    for (const auto& [onStrip, key, modifiers] : presses)
    {
        wxKeyEvent press(onStrip ? wxEVT_KEY_DOWN : wxEVT_CHAR_HOOK);
        press.m_keyCode = key;
        press.m_controlDown = (modifiers & wxMOD_CONTROL) != 0;
        press.m_shiftDown = (modifiers & wxMOD_SHIFT) != 0;
        Send(onStrip ? book->GetTabStrip() : book->GetCurrentPage(), press);
        // The page selected, "?" unless it alone is shown.
        selections << book->GetSelection()
                   << (State().Freq('+') == 1 && book->GetCurrentPage()->IsShown() ? "" : "?");
    }
    EXPECT_EQ(selections, "12021200001220");
    EXPECT_TRUE(reachedFrame) << "keys without Control are left to the page and go on to the frame";
}

#ifdef WYX_TEST_SCREEN_GRAB
// What the strip's paint handler put on the display, read back from the screen.
TEST_F(NotebookTest, ThePaintedStripShowsTheSelectedTabInItsColour)
{
    wxWindow* strip = book->GetTabStrip();
    const auto shows = [&](int selected, int idle)
    {
        const wxImage screen =
            GrabScreen(wxRect(strip->ClientToScreen(wxPoint(0, 0)), strip->GetClientSize()));
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

// The page shown at start fills the area below the strip as MainFrameTest checks; here pages shown later.
TEST_F(NotebookTest, AClickOnATabShowsItsPageFillingThePageAreaAndRemovingTheSelectedOneShowsItsNeighbour)
{
    ClickStrip(wxPoint(book->GetTabStrip()->GetClientSize().x - 2, 2)); // beside the tabs
    EXPECT_EQ(State(), "First*+ Second Third");
    book->SetSize(400, 250);
    const int strip = book->GetTabStripHeight();
    const wxRect area(0, strip, 400, 250 - strip);
    EXPECT_EQ(book->GetTabStrip()->GetRect(), wxRect(0, 0, 400, strip));
    ClickTab(2);
    EXPECT_EQ(State(), "First Second Third*+");
    EXPECT_EQ(book->GetCurrentPage()->GetRect(), area);
    book->ChangeSelection(0);
    ASSERT_TRUE(book->DeletePage(0));
    EXPECT_EQ(State(), "Second*+ Third");
    EXPECT_EQ(book->GetCurrentPage()->GetRect(), area);
    ASSERT_TRUE(book->InsertPage(0, new wxPanel(book), "Zero"));
    book->ChangeSelection(2);
    ASSERT_TRUE(book->DeletePage(2));
    EXPECT_EQ(State(), "Zero Second*+");
}
} // namespace
