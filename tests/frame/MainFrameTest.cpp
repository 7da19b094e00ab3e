// The main frame as the program starts it: title, size, position, the
// notebook's pages, the notebook filling the window, and the tabs in the
// Notebook theme's colours.
#include "app/MainFrame.h"
#include "app/MainView.h"
#include "components/Utility/CustomListCtrl.h"
#include "platform/themer/Themer.h"
#include "views/JobStatusView.h"

#include "ColourPrint.h"
#include "GuiTest.h"

#include <gtest/gtest.h>
#include <wx/display.h>
#include <wx/imaglist.h>

namespace
{
class MainFrameTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        frame = new CMainFrame("WyxProgress Status & Log", wxDefaultPosition, wxSize(800, 600));
        frame->Show();
        book = frame->GetNotebook();
        // A window shown on a busy display gets its first size events late.
        ASSERT_TRUE(guitest::PumpUntil(
            [this] { return book->GetTabStrip()->GetSize().x == frame->GetClientSize().x; }));
    }
    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump(10);
    }

    CMainFrame* frame = nullptr;
    MainView* book = nullptr;
};

TEST_F(MainFrameTest, OpensCentredOnTheStatusTabWithStatusThenLog)
{
    EXPECT_EQ(frame->GetTitle(), "WyxProgress Status & Log");
    // At least the size asked for; wider where the font is, so the Status table fits whole.
    EXPECT_GE(frame->GetSize().x, 800);
    EXPECT_GE(frame->GetSize().y, 600);
    auto* jobs = static_cast<JobStatusView*>(frame->GetStatusView())->GetJobList()->GetMainWindow();
    EXPECT_LE(jobs->GetTotalColumnWidth(), jobs->GetClientSize().x);
    EXPECT_EQ(frame->GetWindowStyleFlag() & wxDEFAULT_FRAME_STYLE, long(wxDEFAULT_FRAME_STYLE));

    const int display = wxDisplay::GetFromWindow(frame);
    const wxRect area = wxDisplay(display == wxNOT_FOUND ? 0u : unsigned(display)).GetClientArea();
    const wxRect window = frame->GetRect();
    EXPECT_NEAR(window.x + window.width / 2, area.x + area.width / 2, 2);
    EXPECT_NEAR(window.y + window.height / 2, area.y + area.height / 2, 2);

    EXPECT_EQ(book->GetParent(), frame);
    EXPECT_EQ(book->GetId(), 5001);
    ASSERT_EQ(book->GetPageCount(), 2u);
    EXPECT_EQ(book->GetPageText(0) + "," + book->GetPageText(1), "Status,Log");
    EXPECT_TRUE(book->GetPageImage(0) == 1 && book->GetPageImage(1) == 2);
    EXPECT_TRUE(book->GetPage(0) == frame->GetStatusView() && book->GetPage(1) == frame->GetLogView());
    ASSERT_NE(book->GetImageList(), nullptr);
    EXPECT_GE(book->GetImageList()->GetImageCount(), 3);
    EXPECT_EQ(book->GetSelection(), 0);
    EXPECT_TRUE(frame->GetStatusView()->IsShown() && !frame->GetLogView()->IsShown());
}

TEST_F(MainFrameTest, TheNotebookFillsTheClientAreaAndFollowsResizes)
{
    EXPECT_EQ(book->GetRect(), wxRect(wxPoint(0, 0), frame->GetClientSize()));
    for (const wxSize& size : {wxSize(1000, 700), wxSize(640, 480)})
    {
        frame->SetSize(size);
        // The window manager's answer comes as an event; the notebook must follow it.
        EXPECT_TRUE(guitest::PumpUntil(
            [&] {
                return frame->GetSize() == size &&
                       book->GetRect() == wxRect(wxPoint(0, 0), frame->GetClientSize());
            }))
            << size.x << "x" << size.y;
        const int strip = book->GetTabStripHeight();
        EXPECT_EQ(frame->GetStatusView()->GetRect(),
                  wxRect(0, strip, book->GetClientSize().x, book->GetClientSize().y - strip));
    }
}

TEST_F(MainFrameTest, DrawsTheTabsAndTheLabelInTheNotebookThemeColours)
{
    const Theme& theme = Themer::GetThemeService()->GetTheme("Notebook");
    const wxImage strip = RenderStrip(*book);
    const auto pixel = [&](int x, int y) { return Pixel(strip, x, y); };
    const wxRect status = book->GetTabRects().at(0);
    const wxRect log = book->GetTabRects().at(1);
    EXPECT_EQ(pixel(status.GetRight() - 1, status.y + status.height / 2), theme.backgroundColour);
    EXPECT_EQ(pixel(log.GetRight() - 1, log.y + log.height / 2), theme.panelColour);

    // The label is written in the theme's text colour: its darkest pixel is close to it.
    wxColour darkest = *wxWHITE;
    const auto sum = [](const wxColour& c) { return c.Red() + c.Green() + c.Blue(); };
    for (int y = status.y; y < status.GetBottom(); ++y)
        for (int x = status.x + 24; x < status.GetRight() - 6; ++x)
            darkest = sum(pixel(x, y)) < sum(darkest) ? pixel(x, y) : darkest;
    const wxColour& text = theme.textColour;
    EXPECT_LT(std::abs(darkest.Red() - text.Red()) + std::abs(darkest.Green() - text.Green()) +
                  std::abs(darkest.Blue() - text.Blue()),
              60)
        << darkest.GetAsString(wxC2S_HTML_SYNTAX);
}
} // namespace
