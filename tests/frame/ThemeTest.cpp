// The theme records: every text the program draws on a themed background is
// legible (WCAG 2 contrast ratio, at least 4.5:1), and a selected row stands out.
#include "platform/themer/Themer.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

namespace
{
double Luminance(const wxColour& colour)
{
    const auto linear = [](unsigned char channel)
    {
        const double c = channel / 255.0;
        return c <= 0.03928 ? c / 12.92 : std::pow((c + 0.055) / 1.055, 2.4);
    };
    return 0.2126 * linear(colour.Red()) + 0.7152 * linear(colour.Green()) + 0.0722 * linear(colour.Blue());
}

double ContrastRatio(const wxColour& a, const wxColour& b)
{
    const double la = Luminance(a), lb = Luminance(b);
    return (std::max(la, lb) + 0.05) / (std::min(la, lb) + 0.05);
}

const Theme& Get(const char* name)
{
    return Themer::GetThemeService()->GetTheme(name);
}

TEST(Theme, EveryDrawnTextHasAContrastOfAtLeastFourAndAHalfToOne)
{
    const Theme& list = Get("ListControl");
    const Theme& book = Get("Notebook");
    const struct
    {
        const char* what;
        wxColour text, background;
    } pairs[] = {{"list rows", list.textColour, *wxWHITE},
                 {"list odd rows", list.textColour, list.alternateRowColour},
                 {"selected row", list.selectedTextColour, list.selectionColour},
                 {"selected row without focus", list.selectedTextColour, list.inactiveSelectionColour},
                 {"list header", list.foregroundColour, list.controlColour},
                 {"idle tab", book.textColour, book.panelColour},
                 {"selected tab", book.textColour, book.backgroundColour},
                 {"error detail", *wxBLACK, Get("Error").backgroundColour}};
    for (const auto& pair : pairs)
        EXPECT_GE(pair.text.IsOk() && pair.background.IsOk() ? ContrastRatio(pair.text, pair.background) : 0,
                  4.5)
            << pair.what;
    // The selection still stands out from both row backgrounds, with and without focus.
    for (const wxColour& row : {*wxWHITE, list.alternateRowColour})
    {
        EXPECT_GE(ContrastRatio(list.selectionColour, row), 1.3);
        EXPECT_GE(ContrastRatio(list.inactiveSelectionColour, row), 1.15);
    }
    EXPECT_NE(list.selectionColour, list.inactiveSelectionColour);
}

} // namespace
