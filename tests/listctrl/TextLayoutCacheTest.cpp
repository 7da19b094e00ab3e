// Texts drawn from kept layouts, and shortened texts, must look exactly as
// wxDC::DrawText draws them.
#include "platform/ui/TextLayoutCache.h"
#include "platform/ui/DrawTextTruncate.h"

#include "PixelCompare.h"

#include <gtest/gtest.h>
#include <wx/dcmemory.h>

#include <functional>

namespace
{
using Paint = std::function<void(wxDC&)>;

// The same set-up drawn once by `draw` and once by wxDC::DrawText: the first difference, or "".
std::string Compare(const Paint& setUp, const std::function<void(wxDC&, int, int)>& draw,
                    const wxString& text)
{
    const auto render = [&](const Paint& paint) { return pixels::Render(wxSize(320, 40), *wxWHITE, paint); };
    const wxImage expected = render([&](wxDC& dc) { setUp(dc), dc.DrawText(text, 7, 9); });
    EXPECT_TRUE(pixels::AnyPixelDiffersIn(expected, 0, 320, *wxWHITE)) << "nothing drawn: " << text;
    return pixels::FirstDifference(render([&](wxDC& dc) { setUp(dc), draw(dc, 7, 9); }), expected);
}

Paint Style(const wxFont& font, const wxColour& colour)
{
    return [font, colour](wxDC& dc)
    {
        dc.SetFont(font);
        dc.SetTextForeground(colour);
        dc.SetBackgroundMode(wxBRUSHSTYLE_TRANSPARENT);
    };
}

const wxString kTexts[] = {wxS("Transferring to server"),
                           wxString::FromUTF8("M\xC3\xBCnchen \xE2\x80\x93 caf\xC3\xA9"), wxS("12,345 KB"),
                           wxString::FromUTF8("\xE5\x8D\xB0\xE5\x88\xB7 job.pdf")};

TEST(ListTextLayout, DrawsWhatDrawTextDrawsAndKeepsLayoutsPerFont)
{
    TextLayoutCache cache;
    const auto byCache = [](TextLayoutCache& from, const wxString& text)
    { return [&from, text](wxDC& dc, int x, int y) { from.DrawText(dc, text, x, y); }; };
    // The layouts kept after the first text of each style: an equal font in another object keeps them all.
    const wxColour grey(20, 20, 20);
    const std::pair<Paint, size_t> styles[] = {
        {Style(*wxNORMAL_FONT, grey), 1},
        {Style(wxFont(*wxNORMAL_FONT), grey), std::size(kTexts)},
        {Style(wxFont(*wxNORMAL_FONT).Bold(), wxColour(0, 90, 200)), 1},
        {Style(wxFont(wxFontInfo(15).Family(wxFONTFAMILY_SWISS)), *wxRED), 1}};
    for (const auto& [style, keptAfterFirst] : styles)
        for (const wxString& text : kTexts)
            for (int round = 0; round < 2; ++round)
            {
                EXPECT_EQ(Compare(style, byCache(cache, text), text), "") << text << ", round " << round;
                if (text == kTexts[0])
                    EXPECT_EQ(cache.Size(), keptAfterFirst);
            }
    EXPECT_EQ(cache.Size(), std::size(kTexts));

    // What it cannot draw alone it leaves to DrawText, and keeps nothing of it.
    TextLayoutCache other;
    const Paint onYellow = [](wxDC& dc)
    {
        Style(*wxNORMAL_FONT, *wxBLACK)(dc);
        dc.SetBackgroundMode(wxBRUSHSTYLE_SOLID);
        dc.SetTextBackground(wxColour(255, 255, 0));
    };
    EXPECT_EQ(Compare(Style(wxFont(*wxNORMAL_FONT).Underlined(), *wxBLACK), byCache(other, "underlined"),
                      "underlined"),
              "");
    EXPECT_EQ(Compare(onYellow, byCache(other, "on yellow"), "on yellow"), "");
    EXPECT_EQ(Compare(Style(*wxNORMAL_FONT, *wxBLACK), byCache(other, "two\nlines"), "two\nlines"), "");
    EXPECT_EQ(other.Size(), 0u);
}

// What a cell too narrow for its text shows: the longest start that fits with an ellipsis.
TEST(ListTruncate, ShortensWithAnEllipsisWithinTheWidthAndDrawsItAsDrawText)
{
    const Paint plain = Style(*wxNORMAL_FONT, *wxBLACK);
    const wxString text = wxS("A rather long file name.pdf");
    wxBitmap probe(1, 1);
    wxMemoryDC dc(probe);
    plain(dc);
    const int full = dc.GetTextExtent(text).GetWidth();
    EXPECT_EQ(TruncateTextToWidth(dc, text, full, false), text);
    for (int width : {full - 1, full / 2, 30})
    {
        const wxString shown = TruncateTextToWidth(dc, text, width, false);
        EXPECT_TRUE(shown.EndsWith(wxS("..."))) << width;
        EXPECT_LE(dc.GetTextExtent(shown).GetWidth(), width) << width;
        EXPECT_TRUE(text.StartsWith(shown.Left(shown.length() - 3).Trim())) << width;
        const auto drawn = [&text, width](wxDC& on, int x, int y)
        { DrawTextTruncate(on, text, wxRect(x, y, width, 20), 0, false); };
        for (int round = 0; round < 2; ++round)
            EXPECT_EQ(Compare(plain, drawn, shown), "") << width << ", round " << round;
    }
    EXPECT_EQ(TruncateTextToWidth(dc, text, 2, true), wxString()) << "an image cell shows no lone ellipsis";
    EXPECT_EQ(TruncateTextToWidth(dc, text, 2, false), wxS("..."));
}
} // namespace
