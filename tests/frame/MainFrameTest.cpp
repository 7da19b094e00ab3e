// The main frame as the program starts it: title, size, place, the notebook's
// pages filling the window as it is resized, and the tabs in the Notebook
// theme's colours.
#include "app/MainFrame.h"
#include "app/MainView.h"
#include "components/Utility/CustomListCtrl.h"
#include "platform/themer/Themer.h"
#include "views/JobStatusView.h"

#include "ColourPrint.h"
#include "GuiTest.h"

#include <gtest/gtest.h>
#include <wx/display.h>

namespace
{
TEST(MainFrameTest, OpensCentredOnTheStatusTabFillsTheWindowAndDrawsTheTabsInTheThemeColours)
{
    auto* frame = new CMainFrame("WyxProgress Status & Log", wxDefaultPosition, wxSize(800, 600));
    frame->Show();
    MainView* book = frame->GetNotebook();
    // A window shown on a busy display gets its first size events late.
    ASSERT_TRUE(
        guitest::PumpUntil([&] { return book->GetTabStrip()->GetSize().x == frame->GetClientSize().x; }));
    EXPECT_EQ(frame->GetTitle(), "WyxProgress Status & Log");
    // At least the size asked for; wider where the font is, so the Status table fits whole.
    EXPECT_TRUE(frame->GetSize().x >= 800 && frame->GetSize().y >= 600);
    auto* jobs = static_cast<JobStatusView*>(frame->GetStatusView())->GetJobList()->GetMainWindow();
    EXPECT_LE(jobs->GetTotalColumnWidth(), jobs->GetClientSize().x);
    EXPECT_EQ(frame->GetWindowStyleFlag() & wxDEFAULT_FRAME_STYLE, long(wxDEFAULT_FRAME_STYLE));
    const int display = wxDisplay::GetFromWindow(frame);
    const wxRect area = wxDisplay(display == wxNOT_FOUND ? 0u : unsigned(display)).GetClientArea();
    const wxRect window = frame->GetRect();
    EXPECT_NEAR(window.x + window.width / 2, area.x + area.width / 2, 2);
    EXPECT_NEAR(window.y + window.height / 2, area.y + area.height / 2, 2);

    ASSERT_EQ(book->GetPageCount(), 2u);
    EXPECT_EQ(book->GetPageText(0) + "," + book->GetPageText(1), "Status,Log");
    EXPECT_TRUE(book->GetPage(0) == frame->GetStatusView() && book->GetPage(1) == frame->GetLogView());
    EXPECT_TRUE(book->GetPageImage(0) == 1 && book->GetPageImage(1) == 2);
    EXPECT_TRUE(book->GetSelection() == 0 && frame->GetStatusView()->IsShown() &&
                !frame->GetLogView()->IsShown());

    const Theme& theme = Themer::GetThemeService()->GetTheme("Notebook");
    const wxImage strip = RenderStrip(*book);
    const wxRect status = book->GetTabRects().at(0), log = book->GetTabRects().at(1);
    EXPECT_EQ(Pixel(strip, status.GetRight() - 1, status.y + status.height / 2), theme.backgroundColour);
    EXPECT_EQ(Pixel(strip, log.GetRight() - 1, log.y + log.height / 2), theme.panelColour);

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
    frame->Destroy();
    guitest::Pump(10);
}
} // namespace
