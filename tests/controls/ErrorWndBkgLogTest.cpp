#include "views/ErrorWndBkgLog.h"

#include "platform/themer/Themer.h"

#include "GuiTest.h"
#include "PixelCompare.h"

#include <gtest/gtest.h>
#include <wx/frame.h>
#include <wx/intl.h>

#include <tuple>
#include <vector>

namespace
{

// With a heading 100 pixels wide and a font of 10 pixels per character the
// heading's line starts at 109 and holds 195 pixels; later lines start at 4 and
// hold the client width less 4. Lines as "x,y:text|"; each text begins with a space.
TEST(ErrorPanel, PlacesTheLines)
{
    const std::tuple<const char*, int, int, const char*> cases[] = {
        {"", 300, 16, ""},
        {" \t\r\n  ", 300, 16, ""},
        {"Disk full", 300, 16, "109,4: Disk full|"},
        {"Disk\r\nfull", 300, 16, "109,4: Disk full|"},
        {"  Disk \t\t full \n", 300, 16, "109,4: Disk full|"},
        {"aaaa bbbb cccc dddd", 305, 16, "109,4: aaaa bbbb cccc dddd|"},
        {"aaaa bbbb cccc dddd", 300, 16, "109,4: aaaa bbbb cccc|4,20: dddd|"},
        {"xxxxxxxxxxxxxxxxxxxx", 300, 16, "109,4:|4,20: xxxxxxxxxxxxxxxxxxxx|"},
        {"ab cd ef gh ij kl", 120, 13, "109,4:|4,17: ab cd ef|4,30: gh ij kl|"},
        {"a verylongwordthatoverflows b", 120, 16,
         "109,4:|4,20: a|4,36: verylongwordthatoverflows|4,52: b|"}};
    for (const auto& [text, width, lineHeight, expected] : cases)
    {
        const auto measure = [height = lineHeight](const wxString& line)
        { return wxSize(10 * static_cast<int>(line.length()), height); };
        std::string laidOut;
        for (const ErrorDetailLine& line :
             LayoutErrorDetail(SplitErrorDetailWords(text), 100, width, measure))
            laidOut += std::to_string(line.start.x) + "," + std::to_string(line.start.y) + ":" +
                       line.text.utf8_string() + "|";
        EXPECT_EQ(laidOut, expected) << "\"" << text << "\" in " << width;
    }
}

// What the user reads: the heading in the title font and the wrapped detail in
// the text font, black on the panel's own background, which fills the panel.
TEST(ErrorPanel, ShowsTheHeadingAndTheWrappedDetailOnItsBackgroundAndKeepsTheText)
{
    auto* frame = new wxFrame(nullptr, wxID_ANY, "error panel");
    auto* panel = new CErrorWndBkgLog(frame, wxID_ANY);
    EXPECT_TRUE(panel->HasFlag(wxFULL_REPAINT_ON_RESIZE)) << "narrowing rewraps";
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
    EXPECT_EQ(panel->GetErrorText(), "");
    panel->SetErrorText("Transfer\nfailed");
    expect({{{headingSize.x + 9, 4}, " Transfer"}, {{4, 4 + firstSize.y}, " failed"}});
    EXPECT_EQ(panel->GetErrorText(), "Transfer\nfailed");
    EXPECT_EQ(panel->GetLabel(), _("Error Detail:") + "Transfer\nfailed");
    panel->SetErrorText("");
    EXPECT_EQ(panel->GetLabel(), _("Error Detail:"));
    frame->Destroy();
    guitest::Pump(0);
}

} // namespace
