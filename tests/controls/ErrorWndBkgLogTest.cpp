#include "views/ErrorWndBkgLog.h"

#include "platform/themer/Themer.h"

#include "GuiTest.h"
#include "PixelCompare.h"

#include <gtest/gtest.h>
#include <wx/frame.h>
#include <wx/intl.h>

#include <sstream>
#include <tuple>
#include <vector>

namespace
{

struct LayoutCase
{
    const char* name;
    const char* text;
    int clientWidth;
    int lineHeight;
    std::vector<std::tuple<int, int, const char*>> lines; // x, y, text
};

void PrintTo(const LayoutCase& c, std::ostream* out)
{
    *out << c.name;
}

class ErrorPanelLayout : public testing::TestWithParam<LayoutCase>
{
};

// With a heading 100 pixels wide and a font of 10 pixels per character the
// heading's line starts at 109 and holds 195 pixels; later lines start at 4 and
// hold the client width less 4.
TEST_P(ErrorPanelLayout, PlacesTheLines)
{
    const LayoutCase& c = GetParam();
    const auto measure = [&c](const wxString& text)
    { return wxSize(10 * static_cast<int>(text.length()), c.lineHeight); };
    std::ostringstream laidOut;
    for (const ErrorDetailLine& line :
         LayoutErrorDetail(SplitErrorDetailWords(c.text), 100, c.clientWidth, measure))
        laidOut << "(" << line.start.x << ", " << line.start.y << ") \"" << line.text.utf8_string() << "\" ";
    std::ostringstream expected;
    for (const auto& [x, y, text] : c.lines)
        expected << "(" << x << ", " << y << ") \"" << text << "\" ";
    EXPECT_EQ(laidOut.str(), expected.str());
}

INSTANTIATE_TEST_SUITE_P(
    ErrorPanelCases, ErrorPanelLayout,
    testing::Values(
        LayoutCase{"EmptyTextGivesNoLine", "", 300, 16, {}},
        LayoutCase{"WhiteSpaceOnlyGivesNoLine", " \t\r\n  ", 300, 16, {}},
        LayoutCase{"ShortDetailStandsBesideTheHeading", "Disk full", 300, 16, {{109, 4, " Disk full"}}},
        LayoutCase{"LineBreakIsReflowed", "Disk\r\nfull", 300, 16, {{109, 4, " Disk full"}}},
        LayoutCase{"RunsOfBlanksCountAsOne", "  Disk \t\t full \n", 300, 16, {{109, 4, " Disk full"}}},
        LayoutCase{
            "ExactFitStaysOnTheLine", "aaaa bbbb cccc dddd", 305, 16, {{109, 4, " aaaa bbbb cccc dddd"}}},
        LayoutCase{"WordThatDoesNotFitStartsLineTwo",
                   "aaaa bbbb cccc dddd",
                   300,
                   16,
                   {{109, 4, " aaaa bbbb cccc"}, {4, 20, " dddd"}}},
        LayoutCase{"FirstWordTooWideLeavesTheHeadingLineEmpty",
                   "xxxxxxxxxxxxxxxxxxxx",
                   300,
                   16,
                   {{109, 4, ""}, {4, 20, " xxxxxxxxxxxxxxxxxxxx"}}},
        LayoutCase{"LaterLinesWrapAtTheFullWidth",
                   "ab cd ef gh ij kl",
                   120,
                   13,
                   {{109, 4, ""}, {4, 17, " ab cd ef"}, {4, 30, " gh ij kl"}}},
        LayoutCase{"OverlongWordStandsAlone",
                   "a verylongwordthatoverflows b",
                   120,
                   16,
                   {{109, 4, ""}, {4, 20, " a"}, {4, 36, " verylongwordthatoverflows"}, {4, 52, " b"}}}),
    [](const testing::TestParamInfo<LayoutCase>& info) { return std::string(info.param.name); });

class ErrorPanel : public testing::Test
{
protected:
    void SetUp() override
    {
        frame = new wxFrame(nullptr, wxID_ANY, "error panel", wxDefaultPosition, wxSize(500, 200));
        panel = new CErrorWndBkgLog(frame, wxID_ANY);
    }

    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump(0);
    }

    wxFrame* frame = nullptr;
    CErrorWndBkgLog* panel = nullptr;
};

TEST_F(ErrorPanel, KeepsTheTextInItsLabelAndRepaintsWhollyWhenResized)
{
    EXPECT_EQ(panel->GetErrorText(), "");
    panel->SetErrorText("Disk full");
    EXPECT_EQ(panel->GetErrorText(), "Disk full");
    EXPECT_EQ(panel->GetLabel(), _("Error Detail:") + "Disk full");
    panel->SetErrorText("");
    EXPECT_EQ(panel->GetLabel(), _("Error Detail:"));
    EXPECT_TRUE(panel->HasFlag(wxFULL_REPAINT_ON_RESIZE)) << "narrowing rewraps";
}

// What the user reads: the heading in the title font and the wrapped detail in
// the text font, black on the panel's own background, which fills the panel.
TEST_F(ErrorPanel, ShowsTheHeadingAndTheWrappedDetailOnItsBackground)
{
    const wxColour background(0xFF, 0xF4, 0xE5);
    panel->SetBackgroundColour(background);
    const Theme& theme = Themer::GetThemeService()->GetTheme("Error");
    const wxString heading = " " + _("Error Detail:");
    wxSize headingSize;
    wxSize firstSize;
    pixels::Render(wxSize(1, 1), background,
                   [&](wxDC& dc)
                   {
                       dc.SetFont(theme.titleFont);
                       headingSize = dc.GetTextExtent(heading);
                       dc.SetFont(theme.textFont);
                       firstSize = dc.GetTextExtent(" Transfer");
                   });
    const wxSize size(headingSize.x + 5 + firstSize.x + 2, 60);
    const auto expect = [&](const std::vector<std::pair<wxPoint, wxString>>& lines)
    {
        const wxImage expected = pixels::Render(size, background,
                                                [&](wxDC& dc)
                                                {
                                                    dc.SetTextForeground(*wxBLACK);
                                                    dc.SetFont(theme.titleFont);
                                                    dc.DrawText(heading, 4, 4);
                                                    dc.SetFont(theme.textFont);
                                                    for (const auto& [at, text] : lines)
                                                        dc.DrawText(text, at);
                                                });
        const wxImage painted = pixels::Render(size, *wxRED, [&](wxDC& dc) { panel->Render(dc, size); });
        EXPECT_EQ(pixels::FirstDifference(painted, expected), "");
    };
    expect({});
    panel->SetErrorText("Transfer\nfailed");
    expect({{{headingSize.x + 9, 4}, " Transfer"}, {{4, 4 + firstSize.y}, " failed"}});
}

} // namespace
