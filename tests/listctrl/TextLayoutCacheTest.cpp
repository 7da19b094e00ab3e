// Texts drawn from kept layouts must look exactly as wxDC::DrawText draws them.
#include "platform/ui/TextLayoutCache.h"
#include "platform/ui/DrawTextTruncate.h"

#include "PixelCompare.h"

#include <gtest/gtest.h>

#include <functional>

namespace
{

const wxSize kCanvas(320, 40);

wxImage Paint(const std::function<void(wxDC&)>& paint)
{
    return pixels::Render(kCanvas, *wxWHITE, paint);
}

using pixels::FirstDifference;

struct Style
{
    wxFont font;
    wxColour colour;
};

void Apply(wxDC& dc, const Style& style)
{
    dc.SetFont(style.font);
    dc.SetTextForeground(style.colour);
    dc.SetBackgroundMode(wxBRUSHSTYLE_TRANSPARENT);
}

const wxString kTexts[] = {wxS("Transferring to server"),
                           wxString::FromUTF8("M\xC3\xBCnchen \xE2\x80\x93 caf\xC3\xA9"), wxS("12,345 KB"),
                           wxString::FromUTF8("\xE5\x8D\xB0\xE5\x88\xB7 job.pdf")};

} // namespace

TEST(TextLayoutCache, DrawsWhatDrawTextDrawsFromTheFirstAndTheKeptLayout)
{
    const Style styles[] = {{*wxNORMAL_FONT, wxColour(20, 20, 20)},
                            {wxFont(*wxNORMAL_FONT).Bold(), wxColour(0, 90, 200)},
                            {wxFont(wxFontInfo(15).Family(wxFONTFAMILY_SWISS)), wxColour(200, 0, 0)}};
    TextLayoutCache cache;
    for (const Style& style : styles)
        for (const wxString& text : kTexts)
        {
            const wxImage expected = Paint(
                [&](wxDC& dc)
                {
                    Apply(dc, style);
                    dc.DrawText(text, 7, 9);
                });
            ASSERT_TRUE(pixels::AnyPixelDiffersIn(expected, 0, kCanvas.GetWidth(), *wxWHITE)) << text;
            for (int round = 0; round < 2; ++round)
            {
                const wxImage actual = Paint(
                    [&](wxDC& dc)
                    {
                        Apply(dc, style);
                        cache.DrawText(dc, text, 7, 9);
                    });
                EXPECT_EQ(FirstDifference(actual, expected), "") << text << ", round " << round;
            }
        }
}

TEST(TextLayoutCache, ForgetsItsLayoutsWhenTheFontChanges)
{
    TextLayoutCache cache;
    const Style normal{*wxNORMAL_FONT, *wxBLACK};
    const Style bold{wxFont(*wxNORMAL_FONT).Bold(), *wxBLACK};
    Paint(
        [&](wxDC& dc)
        {
            Apply(dc, normal);
            for (const wxString& text : kTexts)
                cache.DrawText(dc, text, 0, 0);
        });
    EXPECT_EQ(cache.Size(), std::size(kTexts));

    // An equal font in another object keeps them; another weight does not.
    Paint(
        [&](wxDC& dc)
        {
            Apply(dc, Style{wxFont(*wxNORMAL_FONT), *wxBLACK});
            cache.DrawText(dc, kTexts[0], 0, 0);
        });
    EXPECT_EQ(cache.Size(), std::size(kTexts));
    const wxImage actual = Paint(
        [&](wxDC& dc)
        {
            Apply(dc, bold);
            cache.DrawText(dc, kTexts[0], 4, 4);
        });
    EXPECT_EQ(cache.Size(), 1u);
    const wxImage expected = Paint(
        [&](wxDC& dc)
        {
            Apply(dc, bold);
            dc.DrawText(kTexts[0], 4, 4);
        });
    EXPECT_EQ(FirstDifference(actual, expected), "");
}

TEST(TextLayoutCache, LeavesWhatItCannotDrawAloneToDrawText)
{
    TextLayoutCache cache;
    const Style underlined{wxFont(*wxNORMAL_FONT).Underlined(), *wxBLACK};
    auto drawBoth = [&](const std::function<void(wxDC&)>& setUp, const wxString& text)
    {
        const wxImage actual = Paint(
            [&](wxDC& dc)
            {
                setUp(dc);
                cache.DrawText(dc, text, 3, 3);
            });
        const wxImage expected = Paint(
            [&](wxDC& dc)
            {
                setUp(dc);
                dc.DrawText(text, 3, 3);
            });
        EXPECT_EQ(FirstDifference(actual, expected), "") << text;
    };
    drawBoth([&](wxDC& dc) { Apply(dc, underlined); }, wxS("underlined"));
    drawBoth(
        [&](wxDC& dc)
        {
            Apply(dc, Style{*wxNORMAL_FONT, *wxBLACK});
            dc.SetBackgroundMode(wxBRUSHSTYLE_SOLID);
            dc.SetTextBackground(wxColour(255, 255, 0));
        },
        wxS("on yellow"));
    drawBoth([&](wxDC& dc) { Apply(dc, Style{*wxNORMAL_FONT, *wxBLACK}); }, wxS("two\nlines"));
    EXPECT_EQ(cache.Size(), 0u);
}

TEST(DrawTextTruncate, DrawsTheShortenedTextAsDrawTextWould)
{
    const wxString text = wxS("A rather long file name of a poster.pdf");
    for (int round = 0; round < 2; ++round)
    {
        wxString shown;
        const wxImage actual = Paint(
            [&](wxDC& dc)
            {
                Apply(dc, Style{*wxNORMAL_FONT, *wxBLACK});
                shown = TruncateTextToWidth(dc, text, 120, false);
                DrawTextTruncate(dc, text, wxRect(5, 5, 120, 20), 0, false);
            });
        const wxImage expected = Paint(
            [&](wxDC& dc)
            {
                Apply(dc, Style{*wxNORMAL_FONT, *wxBLACK});
                dc.DrawText(shown, 5, 5);
            });
        EXPECT_TRUE(shown.EndsWith(wxS("...")));
        EXPECT_EQ(FirstDifference(actual, expected), "") << "round " << round;
    }
}
