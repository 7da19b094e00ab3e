// The main frame as the program starts it: title, size, position, the
// notebook's pages and colours, and the notebook filling the window.
#include "app/MainFrame.h"
#include "app/MainView.h"
#include "components/Utility/CustomListCtrl.h"
#include "platform/themer/Themer.h"
#include "views/JobStatusView.h"

#include "ColourPrint.h"
#include "GuiTest.h"
#include "Settle.h"

#include <gtest/gtest.h>
#include <wx/dcmemory.h>
#include <wx/display.h>
#include <wx/imaglist.h>
#include <wx/panel.h>
#include <wx/sizer.h>

namespace
{
class MainFrameTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        frame = new CMainFrame("WyxProgress Status & Log", wxDefaultPosition, wxSize(800, 600));
        frame->Show();
        ASSERT_TRUE(PumpUntil(
            [this]
            {
                MainView* book = frame->GetNotebook();
                return book->GetTabStrip()->GetSize().x == frame->GetClientSize().x;
            }));
    }

    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump(10);
    }

    CMainFrame* frame = nullptr;
};

TEST_F(MainFrameTest, HasItsTitleAndSize)
{
    EXPECT_EQ(frame->GetTitle(), "WyxProgress Status & Log");
    // At least the size asked for; wider where the font is, so the Status table fits whole.
    EXPECT_GE(frame->GetSize().x, 800);
    EXPECT_GE(frame->GetSize().y, 600);
    auto* jobs = static_cast<JobStatusView*>(frame->GetStatusView())->GetJobList()->GetMainWindow();
    EXPECT_LE(jobs->GetTotalColumnWidth(), jobs->GetClientSize().x);
    EXPECT_EQ(frame->GetParent(), nullptr);
    EXPECT_EQ(frame->GetWindowStyleFlag() & wxDEFAULT_FRAME_STYLE, long(wxDEFAULT_FRAME_STYLE));
}

TEST_F(MainFrameTest, StartsCentredOnTheScreen)
{
    const wxRect area = wxDisplay(wxDisplay::GetFromWindow(frame) == wxNOT_FOUND
                                      ? 0u
                                      : static_cast<unsigned>(wxDisplay::GetFromWindow(frame)))
                            .GetClientArea();
    const wxRect window = frame->GetRect();
    const wxPoint windowCentre(window.x + window.width / 2, window.y + window.height / 2);
    const wxPoint areaCentre(area.x + area.width / 2, area.y + area.height / 2);
    EXPECT_NEAR(windowCentre.x, areaCentre.x, 2);
    EXPECT_NEAR(windowCentre.y, areaCentre.y, 2);
}

TEST_F(MainFrameTest, HoldsTheNotebookWithStatusThenLog)
{
    MainView* book = frame->GetNotebook();
    ASSERT_NE(book, nullptr);
    EXPECT_EQ(book->GetParent(), frame);
    EXPECT_EQ(book->GetId(), 5001);
    EXPECT_EQ(book->GetName(), "CNOwnerDrawNotebook");
    EXPECT_TRUE(book->HasFlag(wxNB_TOP));
    EXPECT_EQ(book->GetBorder(), wxBORDER_NONE);
    EXPECT_NE(dynamic_cast<wxNotebookBase*>(book), nullptr);

    ASSERT_EQ(book->GetPageCount(), 2u);
    EXPECT_EQ(book->GetPageText(0), "Status");
    EXPECT_EQ(book->GetPageText(1), "Log");
    EXPECT_EQ(book->GetPageImage(0), 1);
    EXPECT_EQ(book->GetPageImage(1), 2);
    EXPECT_EQ(book->GetPage(0), frame->GetStatusView());
    EXPECT_EQ(book->GetPage(1), frame->GetLogView());
    ASSERT_NE(book->GetImageList(), nullptr);
    EXPECT_GE(book->GetImageList()->GetImageCount(), 3);
}

TEST_F(MainFrameTest, OpensOnTheStatusTab)
{
    MainView* book = frame->GetNotebook();
    EXPECT_EQ(book->GetSelection(), 0);
    EXPECT_TRUE(frame->GetStatusView()->IsShown());
    EXPECT_FALSE(frame->GetLogView()->IsShown());
}

TEST_F(MainFrameTest, TheNotebookFillsTheClientAreaAndFollowsResizes)
{
    MainView* book = frame->GetNotebook();
    ASSERT_NE(frame->GetSizer(), nullptr);
    EXPECT_EQ(book->GetRect(), wxRect(wxPoint(0, 0), frame->GetClientSize()));

    for (const wxSize& size : {wxSize(1000, 700), wxSize(640, 480)})
    {
        frame->SetSize(size);
        // The window manager's answer comes as an event; the notebook must follow it.
        EXPECT_TRUE(PumpUntil(
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

TEST_F(MainFrameTest, TheNotebookTakesTheNotebookThemeColours)
{
    const Theme& theme = Themer::GetThemeService()->GetTheme("Notebook");
    const CNNotebookCustomInfo& info = frame->GetNotebook()->GetCustomInfo();
    EXPECT_EQ(info.baseColours[0], theme.panelColour);
    EXPECT_EQ(info.baseColours[1], theme.backgroundColour);
    for (const CNTabStateInfo& state : info.states)
        EXPECT_EQ(state.textColour, theme.textColour);
    EXPECT_EQ(info.states[CNNotebookCustomInfo::Selected].fillColour, theme.backgroundColour);
    EXPECT_EQ(info.states[CNNotebookCustomInfo::Normal].fillColour, theme.panelColour);
}

TEST_F(MainFrameTest, DrawsTheSelectedTabAndItsLabelInTheThemeColours)
{
    const Theme& theme = Themer::GetThemeService()->GetTheme("Notebook");
    MainView* book = frame->GetNotebook();
    wxBitmap bitmap(book->GetTabStrip()->GetClientSize());
    {
        wxMemoryDC dc(bitmap);
        book->RenderTabStrip(dc);
    }
    const wxImage strip = bitmap.ConvertToImage();
    const wxRect status = book->GetTabRects().at(0);
    const wxRect log = book->GetTabRects().at(1);
    auto pixel = [&](int x, int y)
    { return wxColour(strip.GetRed(x, y), strip.GetGreen(x, y), strip.GetBlue(x, y)); };
    EXPECT_EQ(pixel(status.GetRight() - 1, status.y + status.height / 2), theme.backgroundColour);
    EXPECT_EQ(pixel(log.GetRight() - 1, log.y + log.height / 2), theme.panelColour);

    // The label is written in the theme's text colour: its darkest pixel is close to it.
    int darkest = 3 * 255;
    wxColour darkestColour;
    for (int y = status.y; y < status.GetBottom(); ++y)
        for (int x = status.x + 24; x < status.GetRight() - 6; ++x)
        {
            const wxColour c = pixel(x, y);
            if (c.Red() + c.Green() + c.Blue() < darkest)
            {
                darkest = c.Red() + c.Green() + c.Blue();
                darkestColour = c;
            }
        }
    const int distance = std::abs(darkestColour.Red() - theme.textColour.Red()) +
                         std::abs(darkestColour.Green() - theme.textColour.Green()) +
                         std::abs(darkestColour.Blue() - theme.textColour.Blue());
    EXPECT_LT(distance, 60) << darkestColour.GetAsString(wxC2S_HTML_SYNTAX);
}

// MainView answers every drawing hook so that the notebook keeps its own look.
TEST_F(MainFrameTest, MainViewLaysOutTabsAsThePlainNotebookDoes)
{
    MainView* book = frame->GetNotebook();
    auto* plain = new CNOwnerDrawNotebook(false, -1, -1);
    ASSERT_TRUE(plain->Create(frame, wxID_ANY, wxDefaultPosition, book->GetSize(), wxNB_TOP | wxBORDER_NONE));
    plain->SetFont(book->GetFont());
    for (size_t i = 0; i < book->GetPageCount(); ++i)
        plain->AddPage(new wxPanel(plain), book->GetPageText(i), false, book->GetPageImage(i), nullptr, -1,
                       false);
    plain->SetSize(book->GetSize());
    EXPECT_EQ(plain->GetTabRects(), book->GetTabRects());
    EXPECT_EQ(plain->GetTabStripHeight(), book->GetTabStripHeight());
    EXPECT_EQ(plain->GetPageRect(), book->GetPageRect());
    plain->Destroy();
}
} // namespace
