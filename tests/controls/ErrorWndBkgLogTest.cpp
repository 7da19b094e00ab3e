#include "views/ErrorWndBkgLog.h"

#include "GuiTest.h"
#include "PixelCompare.h"

#include <gtest/gtest.h>
#include <wx/frame.h>
#include <wx/intl.h>

#include <tuple>

namespace
{

// With a heading 100 pixels wide and a font of 10 pixels per character the heading's line
// starts at 109 and holds 195 pixels; later lines start at 4 and hold the client width less 4.
// Lines as "x,y:text|"; each text begins with a space.
TEST(ErrorPanel, PlacesTheLines)
{
    const std::tuple<const char*, int, const char*> cases[] = {
        {"  Disk\r\n \t\t full \n", 300, "109,4: Disk full|"},
        {"aaaa bbbb cccc dddd", 300, "109,4: aaaa bbbb cccc|4,20: dddd|"},
        {"a verylongwordthatoverflows b", 120, "109,4:|4,20: a|4,36: verylongwordthatoverflows|4,52: b|"}};
    const auto measure = [](const wxString& line)
    { return wxSize(10 * static_cast<int>(line.length()), 16); };
    for (const auto& [text, width, expected] : cases)
    {
        std::string laidOut;
        for (const ErrorDetailLine& line :
             LayoutErrorDetail(SplitErrorDetailWords(text), 100, width, measure))
            laidOut += std::to_string(line.start.x) + "," + std::to_string(line.start.y) + ":" +
                       line.text.utf8_string() + "|";
        EXPECT_EQ(laidOut, expected) << "\"" << text << "\" in " << width;
    }
}

// What the user reads: the panel's own background over the whole panel, the heading, and the
// detail beside it (where each line goes is checked above).
TEST(ErrorPanel, PaintsItsBackgroundTheHeadingAndTheDetail)
{
    auto* frame = new wxFrame(nullptr, wxID_ANY, "error panel");
    auto* panel = new CErrorWndBkgLog(frame, wxID_ANY);
    const wxColour background(0xFF, 0xF4, 0xE5);
    panel->SetBackgroundColour(background);
    const wxSize size(400, 40);
    const auto render = [&](const wxString& text)
    {
        panel->SetErrorText(text);
        return pixels::Render(size, *wxRED, [&](wxDC& dc) { panel->Render(dc, size); });
    };
    const wxImage heading = render(""), detail = render("Transfer\nfailed");
    EXPECT_TRUE(pixels::At(heading, 399, 39) == background && pixels::At(heading, 0, 0) == background);
    EXPECT_TRUE(pixels::AnyPixelDiffersIn(heading, 0, 400, background)) << "the heading is drawn";
    EXPECT_NE(pixels::FirstDifference(detail, heading), "") << "the detail is drawn";
    EXPECT_EQ(panel->GetLabel(), _("Error Detail:") + "Transfer\nfailed");
    frame->Destroy();
    guitest::Pump(0);
}

} // namespace
