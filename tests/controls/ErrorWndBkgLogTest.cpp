#include "views/ErrorWndBkgLog.h"

#include "platform/themer/Themer.h"

#include "GuiTest.h"
#include "PixelCompare.h"

#include <gtest/gtest.h>
#include <wx/frame.h>
#include <wx/intl.h>

#include <ostream>
#include <sstream>
#include <vector>

namespace
{

struct ExpectedLine
{
    int x;
    int y;
    const char* text;
};

bool operator==(const ErrorDetailLine& actual, const ExpectedLine& expected)
{
    return actual.start == wxPoint(expected.x, expected.y) && actual.text == expected.text;
}

struct LayoutCase
{
    const char* name;
    const char* text;
    int clientWidth;
    int lineHeight;
    std::vector<ExpectedLine> lines;
};

void PrintTo(const LayoutCase& c, std::ostream* out)
{
    *out << c.name;
}

std::ostream& operator<<(std::ostream& out, const ErrorDetailLine& line)
{
    return out << "(" << line.start.x << ", " << line.start.y << ") \"" << line.text.utf8_string() << "\"";
}

// Every case has a heading 100 pixels wide and a font of 10 pixels per
// character: the heading's line starts at 109 and holds 195 pixels, later
// lines start at 4 and hold the client width less 4.
constexpr int kHeadingWidth = 100;

class ErrorDetailLayoutTest : public testing::TestWithParam<LayoutCase>
{
};

TEST_P(ErrorDetailLayoutTest, PlacesTheLines)
{
    const LayoutCase& c = GetParam();
    const auto measure = [&c](const wxString& text)
    { return wxSize(10 * static_cast<int>(text.length()), c.lineHeight); };
    const std::vector<ErrorDetailLine> lines =
        LayoutErrorDetail(SplitErrorDetailWords(c.text), kHeadingWidth, c.clientWidth, measure);

    std::ostringstream laidOut;
    for (const ErrorDetailLine& line : lines)
        laidOut << line << " ";
    ASSERT_EQ(lines.size(), c.lines.size()) << laidOut.str();
    for (size_t i = 0; i < lines.size(); ++i)
        EXPECT_TRUE(lines[i] == c.lines[i]) << "line " << i << " of " << laidOut.str();
}

INSTANTIATE_TEST_SUITE_P(
    Cases, ErrorDetailLayoutTest,
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

TEST(ErrorDetailLayout, NarrowingRewraps)
{
    const auto measure = [](const wxString& text)
    { return wxSize(10 * static_cast<int>(text.length()), 16); };
    const wxArrayString words = SplitErrorDetailWords("aaaa bbbb cccc dddd");
    EXPECT_EQ(LayoutErrorDetail(words, kHeadingWidth, 400, measure).size(), 1u);
    EXPECT_EQ(LayoutErrorDetail(words, kHeadingWidth, 250, measure).size(), 2u);
    EXPECT_EQ(LayoutErrorDetail(words, kHeadingWidth, 150, measure).size(), 3u);
}

TEST(ErrorDetailWords, SplitAtEveryKindOfWhiteSpace)
{
    const wxArrayString words = SplitErrorDetailWords("\tone  two\r\nthree\n\nfour ");
    ASSERT_EQ(words.size(), 4u);
    EXPECT_EQ(words[0], "one");
    EXPECT_EQ(words[3], "four");
}

class ErrorPanelTest : public testing::Test
{
protected:
    void SetUp() override
    {
        frame = new wxFrame(nullptr, wxID_ANY, "error panel", wxDefaultPosition, wxSize(500, 200));
        panel = new CErrorWndBkgLog(frame, wxID_ANY);
        panel->SetBackgroundColour(kPaper);
        const Theme& theme = Themer::GetThemeService()->GetTheme("Error");
        titleFont = theme.titleFont;
        textFont = theme.textFont;
        heading = " " + _("Error Detail:");
        headingWidth = Measure(titleFont, heading).x;
    }

    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump(0);
    }

    wxSize Measure(const wxFont& font, const wxString& text) const
    {
        wxSize size;
        pixels::Render(wxSize(1, 1), kPaper,
                       [&](wxDC& dc)
                       {
                           dc.SetFont(font);
                           size = dc.GetTextExtent(text);
                       });
        return size;
    }

    wxImage Painted(const wxSize& size) const
    {
        return pixels::Render(size, *wxRED, [&](wxDC& dc) { panel->Render(dc, size); });
    }

    // The heading and the given detail lines drawn directly.
    wxImage Expected(const wxSize& size, const std::vector<std::pair<wxPoint, wxString>>& lines) const
    {
        return pixels::Render(size, kPaper,
                              [&](wxDC& dc)
                              {
                                  dc.SetTextForeground(*wxBLACK);
                                  dc.SetFont(titleFont);
                                  dc.DrawText(heading, 4, 4);
                                  dc.SetFont(textFont);
                                  for (const auto& line : lines)
                                      dc.DrawText(line.second, line.first);
                              });
    }

    const wxColour kPaper = wxColour(255, 255, 255);
    wxFrame* frame = nullptr;
    CErrorWndBkgLog* panel = nullptr;
    wxFont titleFont;
    wxFont textFont;
    wxString heading;
    int headingWidth = 0;
};

TEST_F(ErrorPanelTest, SetErrorTextSetsTheTextAndTheLabel)
{
    EXPECT_EQ(panel->GetErrorText(), "");
    panel->SetErrorText("Disk full");
    EXPECT_EQ(panel->GetErrorText(), "Disk full");
    EXPECT_EQ(panel->GetLabel(), _("Error Detail:") + "Disk full");
    panel->SetErrorText("");
    EXPECT_EQ(panel->GetErrorText(), "");
    EXPECT_EQ(panel->GetLabel(), _("Error Detail:"));
}

TEST_F(ErrorPanelTest, EmptyTextDrawsOnlyTheHeading)
{
    const wxSize size(400, 48);
    const wxImage painted = Painted(size);
    EXPECT_EQ(pixels::FirstDifference(painted, Expected(size, {})), "");
    EXPECT_TRUE(pixels::AnyPixelDiffersIn(painted, 0, size.x, kPaper)) << "no heading drawn";
}

TEST_F(ErrorPanelTest, ShortDetailStartsNinePixelsAfterTheHeading)
{
    const wxSize size(400, 48);
    panel->SetErrorText("Disk full");
    const wxImage painted = Painted(size);
    EXPECT_EQ(pixels::FirstDifference(painted, Expected(size, {{{headingWidth + 9, 4}, " Disk full"}})), "");
    EXPECT_FALSE(pixels::AnyPixelDiffersIn(painted, headingWidth + 4, headingWidth + 9, kPaper))
        << "the gap after the heading must stay empty";
}

TEST_F(ErrorPanelTest, LineBreakInTheTextIsReflowed)
{
    const wxSize size(400, 48);
    panel->SetErrorText("Disk\r\nfull");
    EXPECT_EQ(pixels::FirstDifference(Painted(size), Expected(size, {{{headingWidth + 9, 4}, " Disk full"}})),
              "");
}

TEST_F(ErrorPanelTest, WordThatDoesNotFitBeginsTheSecondLineAtFour)
{
    const int firstWidth = Measure(textFont, " Transfer").x;
    const wxSize size(headingWidth + 5 + firstWidth + 2, 60);
    const int lineHeight = Measure(textFont, " Transfer failed").y;
    panel->SetErrorText("Transfer failed");
    const wxImage expected =
        Expected(size, {{{headingWidth + 9, 4}, " Transfer"}, {{4, 4 + lineHeight}, " failed"}});
    EXPECT_EQ(pixels::FirstDifference(Painted(size), expected), "");
}

TEST_F(ErrorPanelTest, FirstWordWiderThanTheHeadingLineLeavesItEmpty)
{
    const int wordWidth = Measure(textFont, " Unreachable").x;
    const wxSize size(headingWidth + 5 + wordWidth - 1, 60);
    const int lineHeight = Measure(textFont, " Unreachable").y;
    panel->SetErrorText("Unreachable");
    const wxImage expected = Expected(size, {{{4, 4 + lineHeight}, " Unreachable"}});
    EXPECT_EQ(pixels::FirstDifference(Painted(size), expected), "");
}

TEST_F(ErrorPanelTest, RepaintsWhollyWhenResizedSoNarrowingRewraps)
{
    EXPECT_TRUE(panel->HasFlag(wxFULL_REPAINT_ON_RESIZE));
}

TEST_F(ErrorPanelTest, FillsTheWholeAreaWithItsBackground)
{
    const wxSize size(300, 48);
    panel->SetBackgroundColour(wxColour(0xFF, 0xF4, 0xE5));
    const wxImage painted = Painted(size);
    EXPECT_EQ(pixels::At(painted, 0, 0), wxColour(0xFF, 0xF4, 0xE5));
    EXPECT_EQ(pixels::At(painted, size.x - 1, size.y - 1), wxColour(0xFF, 0xF4, 0xE5));
}

} // namespace
