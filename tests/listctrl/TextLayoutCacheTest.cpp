// Texts drawn from kept layouts, and shortened texts, must look exactly as wxDC::DrawText draws them.
#include "platform/ui/TextLayoutCache.h"
#include "platform/ui/DrawTextTruncate.h"

#include "PixelCompare.h"

#include <gtest/gtest.h>
#include <wx/dcmemory.h>

#include <functional>

namespace
{
// `text` in `font` drawn once by `draw` and once by wxDC::DrawText: the first difference, or "".
std::string Compare(const wxFont& font, const std::function<void(wxDC&)>& draw, const wxString& text)
{
    const auto render = [&](const std::function<void(wxDC&)>& paint)
    {
        return pixels::Render(wxSize(320, 40), *wxWHITE,
                              [&](wxDC& dc)
                              {
                                  dc.SetFont(font);
                                  dc.SetTextForeground(wxColour(0, 90, 200));
                                  paint(dc);
                              });
    };
    const wxImage expected = render([&](wxDC& dc) { dc.DrawText(text, 7, 9); });
    EXPECT_TRUE(pixels::AnyPixelDiffersIn(expected, 0, 320, *wxWHITE)) << "nothing drawn: " << text;
    return pixels::FirstDifference(render(draw), expected);
}

// Kept per font and text: an equal font in another object finds the layouts kept for the first. What it
// cannot draw alone (two lines) it leaves to DrawText. A cell too narrow for its text shows the longest
// start that fits, with an ellipsis.
TEST(ListTextLayout, DrawsWhatDrawTextDrawsAndShortensWithAnEllipsis)
{
    TextLayoutCache cache;
    const wxString texts[] = {wxS("Transferring to server"),
                              wxString::FromUTF8("M\xC3\xBCnchen \xE5\x8D\xB0 caf\xC3\xA9"),
                              wxS("two\nlines")};
    for (const wxFont& font : {*wxNORMAL_FONT, wxFont(*wxNORMAL_FONT), wxFont(wxFontInfo(15).Bold())})
        for (const wxString& text : texts)
            for (int round = 0; round < 2; ++round)
                EXPECT_EQ(Compare(
                              font, [&](wxDC& dc) { cache.DrawText(dc, text, 7, 9); }, text),
                          "")
                    << text;
    EXPECT_EQ(cache.Size(), 2u);

    const wxString text = wxS("A rather long file name.pdf");
    wxBitmap probe(1, 1);
    wxMemoryDC dc(probe);
    dc.SetFont(*wxNORMAL_FONT);
    const wxString shown = TruncateTextToWidth(dc, text, 60, false);
    EXPECT_TRUE(shown.EndsWith(wxS("...")) && text.StartsWith(shown.Left(shown.length() - 3))) << shown;
    EXPECT_LE(dc.GetTextExtent(shown).GetWidth(), 60);
    const auto draw = [&](wxDC& on) { DrawTextTruncate(on, text, wxRect(7, 9, 60, 20), 0, false); };
    EXPECT_EQ(Compare(*wxNORMAL_FONT, draw, shown), "");
    EXPECT_EQ(TruncateTextToWidth(dc, text, 1000, false) + "|" + TruncateTextToWidth(dc, text, 2, true),
              text + "|")
        << "an image cell shows no lone ellipsis";
}
} // namespace
