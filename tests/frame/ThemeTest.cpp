// The theme records: every text the program draws on a themed background is
// legible (WCAG 2 contrast ratio, at least 4.5:1), and a selected row stands out
// from the rows around it.
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

TEST(Theme, EveryDrawnTextIsLegibleAndTheSelectionStandsOutFromBothRowBackgrounds)
{
    const Theme& list = Themer::GetThemeService()->GetTheme("ListControl");
    const Theme& book = Themer::GetThemeService()->GetTheme("Notebook");
    const struct
    {
        const char* what;
        wxColour front, back;
        double least;
    } pairs[] = {{"list rows", list.textColour, *wxWHITE, 4.5},
                 {"list odd rows", list.textColour, list.alternateRowColour, 4.5},
                 {"selected row", list.selectedTextColour, list.selectionColour, 4.5},
                 {"selected row without focus", list.selectedTextColour, list.inactiveSelectionColour, 4.5},
                 {"idle tab", book.textColour, book.panelColour, 4.5},
                 {"selected tab", book.textColour, book.backgroundColour, 4.5},
                 {"selection on a row", list.selectionColour, *wxWHITE, 1.3},
                 {"selection on an odd row", list.selectionColour, list.alternateRowColour, 1.3}};
    for (const auto& pair : pairs)
    {
        const double a = Luminance(pair.front), b = Luminance(pair.back);
        EXPECT_GE(pair.front.IsOk() && pair.back.IsOk() ? (std::max(a, b) + 0.05) / (std::min(a, b) + 0.05)
                                                        : 0,
                  pair.least)
            << pair.what;
    }
}
} // namespace
