// The main frame as the program starts it: the Status tab first, the
// notebook's pages filling the window as it is resized, the tabs in the
// Notebook theme's colours, and clicks and the keyboard showing the right page.
#include "app/MainFrame.h"
#include "app/MainView.h"
#include "components/Utility/CustomListCtrl.h"
#include "platform/themer/Themer.h"
#include "views/JobStatusView.h"

#include "GuiTest.h"
#include "PixelCompare.h"

#include <gtest/gtest.h>

#include <tuple>

namespace
{
void Send(wxWindow* to, wxEvent& event)
{
    event.SetEventObject(to);
    to->GetEventHandler()->ProcessEvent(event);
}

TEST(MainFrameTest, OpensOnTheStatusTabFillsTheWindowDrawsTheTabsInTheThemeColoursAndSwitchesPages)
{
    auto* frame = new CMainFrame("WyxProgress Status & Log", wxDefaultPosition, wxSize(800, 600));
    frame->Show();
    MainView* book = frame->GetNotebook();
    // A window shown on a busy display gets its first size events late.
    ASSERT_TRUE(
        guitest::PumpUntil([&] { return book->GetTabStrip()->GetSize().x == frame->GetClientSize().x; }));
    // At least the size asked for; wider where the font is, so the Status table fits whole.
    EXPECT_TRUE(frame->GetSize().x >= 800 && frame->GetSize().y >= 600);
    auto* jobs = static_cast<JobStatusView*>(frame->GetStatusView())->GetJobList()->GetMainWindow();
    EXPECT_LE(jobs->GetTotalColumnWidth(), jobs->GetClientSize().x);

    ASSERT_EQ(book->GetPageCount(), 2u);
    EXPECT_EQ(book->GetPageText(0) + "," + book->GetPageText(1), "Status,Log");
    // The page selected, "?" unless it alone is shown.
    const auto shown = [book]
    {
        const int page = book->GetSelection();
        return wxString::Format("%d", page) +
               (book->GetPage(page)->IsShown() && !book->GetPage(1 - page)->IsShown() ? "" : "?");
    };
    EXPECT_EQ(shown(), "0");

    // The strip as its paint handler draws it: the selected tab in the background colour.
    const Theme& theme = Themer::GetThemeService()->GetTheme("Notebook");
    const wxImage strip = pixels::Render(book->GetTabStrip()->GetClientSize(), *wxRED,
                                         [book](wxDC& dc) { book->RenderTabStrip(dc); });
    const wxRect status = book->GetTabRects().at(0), log = book->GetTabRects().at(1);
    EXPECT_EQ(pixels::At(strip, status.GetRight() - 1, status.y + status.height / 2), theme.backgroundColour);
    EXPECT_EQ(pixels::At(strip, log.GetRight() - 1, log.y + log.height / 2), theme.panelColour);

    for (const wxSize& size : {wxSize(1000, 700), wxSize(640, 480)})
    {
        frame->SetSize(size);
        // The window manager's answer comes as an event; the notebook must follow it.
        EXPECT_TRUE(guitest::PumpUntil(
            [&] { return frame->GetSize() == size && book->GetRect() == wxRect(frame->GetClientSize()); }))
            << size.x << "x" << size.y;
        const int top = book->GetTabStripHeight();
        EXPECT_EQ(frame->GetStatusView()->GetRect(),
                  wxRect(0, top, book->GetClientSize().x, book->GetClientSize().y - top));
    }

    bool reachedFrame = false;
    frame->Bind(wxEVT_CHAR_HOOK,
                [&](wxKeyEvent& event)
                {
                    reachedFrame = true;
                    event.Skip();
                });
    const int ctrl = wxMOD_CONTROL, back = wxMOD_CONTROL | wxMOD_SHIFT, shift = wxMOD_SHIFT,
              none = wxMOD_NONE;
    // Control keys in the page (where the focus is) cycle; arrows on the strip stop at the ends.
    const std::tuple<bool, int, int> presses[] = {
        {false, WXK_TAB, ctrl},       {false, WXK_TAB, ctrl},      {false, WXK_TAB, back},
        {false, WXK_PAGEUP, ctrl},    {false, WXK_PAGEDOWN, ctrl}, {false, WXK_TAB, none},
        {false, WXK_PAGEDOWN, shift}, {true, WXK_RIGHT, none},     {true, WXK_LEFT, none},
        {true, WXK_LEFT, none},       {true, WXK_END, none},       {true, WXK_HOME, none}};
    wxString selections;
    for (const auto& [onStrip, key, modifiers] : presses)
    {
        wxKeyEvent press(onStrip ? wxEVT_KEY_DOWN : wxEVT_CHAR_HOOK);
        press.m_keyCode = key;
        press.m_controlDown = (modifiers & wxMOD_CONTROL) != 0;
        press.m_shiftDown = (modifiers & wxMOD_SHIFT) != 0;
        Send(onStrip ? book->GetTabStrip() : book->GetCurrentPage(), press);
        selections << shown();
    }
    EXPECT_EQ(selections, "101011110010");
    EXPECT_TRUE(reachedFrame) << "keys without Control are left to the page and go on to the frame";

    // A click beside the tabs changes nothing; one on the Log tab shows its page filling the page area.
    const auto click = [book](const wxPoint& at)
    {
        wxMouseEvent mouse(wxEVT_LEFT_DOWN);
        mouse.SetPosition(at);
        Send(book->GetTabStrip(), mouse);
    };
    click(wxPoint(book->GetTabStrip()->GetClientSize().x - 2, 2));
    EXPECT_EQ(shown(), "0");
    click(wxPoint(log.GetRight() - 1, log.y + log.height / 2));
    EXPECT_EQ(shown(), "1");
    const int top = book->GetTabStripHeight();
    EXPECT_EQ(frame->GetLogView()->GetRect(),
              wxRect(0, top, book->GetClientSize().x, book->GetClientSize().y - top));
    frame->Destroy();
    guitest::Pump(10);
}
} // namespace
