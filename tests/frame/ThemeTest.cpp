// The theme records: lookup rules and the legibility of every text the program
// draws on a themed background (WCAG 2 contrast ratio, at least 4.5:1).
#include "platform/themer/Themer.h"

#include <gtest/gtest.h>
#include <wx/settings.h>

#include <algorithm>
#include <cctype>
#include <cmath>
#include <functional>
#include <string>

namespace
{
double Linear(unsigned char channel)
{
    const double c = channel / 255.0;
    return c <= 0.03928 ? c / 12.92 : std::pow((c + 0.055) / 1.055, 2.4);
}

double Luminance(const wxColour& colour)
{
    return 0.2126 * Linear(colour.Red()) + 0.7152 * Linear(colour.Green()) + 0.0722 * Linear(colour.Blue());
}

double ContrastRatio(const wxColour& a, const wxColour& b)
{
    const double la = Luminance(a);
    const double lb = Luminance(b);
    return (std::max(la, lb) + 0.05) / (std::min(la, lb) + 0.05);
}

const Theme& Get(const char* name)
{
    return Themer::GetThemeService()->GetTheme(name);
}

TEST(ContrastRatio, MatchesTheKnownExtremes)
{
    EXPECT_NEAR(ContrastRatio(*wxBLACK, *wxWHITE), 21.0, 1e-9);
    EXPECT_NEAR(ContrastRatio(*wxWHITE, *wxWHITE), 1.0, 1e-9);
    // #777777 on white is the classic example just under 4.5:1.
    EXPECT_NEAR(ContrastRatio(wxColour(0x77, 0x77, 0x77), *wxWHITE), 4.48, 0.01);
}

struct TextPair
{
    const char* what;
    std::function<wxColour()> text;
    std::function<wxColour()> background;
};

class ThemeTextContrast : public ::testing::TestWithParam<TextPair>
{
};

TEST_P(ThemeTextContrast, IsAtLeastFourAndAHalfToOne)
{
    const TextPair& pair = GetParam();
    const wxColour text = pair.text();
    const wxColour background = pair.background();
    ASSERT_TRUE(text.IsOk());
    ASSERT_TRUE(background.IsOk());
    EXPECT_GE(ContrastRatio(text, background), 4.5)
        << pair.what << ": " << text.GetAsString(wxC2S_HTML_SYNTAX) << " on "
        << background.GetAsString(wxC2S_HTML_SYNTAX);
}

INSTANTIATE_TEST_SUITE_P(
    DrawnPairs, ThemeTextContrast,
    ::testing::Values(
        TextPair{"list rows", [] { return Get("ListControl").textColour; }, [] { return *wxWHITE; }},
        TextPair{"list odd rows", [] { return Get("ListControl").textColour; },
                 [] { return Get("ListControl").alternateRowColour; }},
        TextPair{"selected row", [] { return Get("ListControl").selectedTextColour; },
                 [] { return Get("ListControl").selectionColour; }},
        TextPair{"selected row without focus", [] { return Get("ListControl").selectedTextColour; },
                 [] { return Get("ListControl").inactiveSelectionColour; }},
        TextPair{"list header", [] { return Get("ListControl").foregroundColour; },
                 [] { return Get("ListControl").controlColour; }},
        TextPair{"idle tab", [] { return Get("Notebook").textColour; },
                 [] { return Get("Notebook").panelColour; }},
        TextPair{"selected tab", [] { return Get("Notebook").textColour; },
                 [] { return Get("Notebook").backgroundColour; }},
        TextPair{"error detail", [] { return *wxBLACK; }, [] { return Get("Error").backgroundColour; }}),
    [](const ::testing::TestParamInfo<TextPair>& info)
    {
        std::string name = info.param.what;
        for (char& c : name)
            if (!std::isalnum(static_cast<unsigned char>(c)))
                c = '_';
        return name;
    });

TEST(ThemeSelection, StandsOutFromBothRowBackgrounds)
{
    const Theme& list = Get("ListControl");
    for (const wxColour& row : {*wxWHITE, list.alternateRowColour})
    {
        EXPECT_GE(ContrastRatio(list.selectionColour, row), 1.3) << row.GetAsString(wxC2S_HTML_SYNTAX);
        EXPECT_GE(ContrastRatio(list.inactiveSelectionColour, row), 1.15)
            << row.GetAsString(wxC2S_HTML_SYNTAX);
    }
    EXPECT_NE(list.selectionColour, list.inactiveSelectionColour);
}

TEST(ThemeLookup, GivesOneRecordPerNameForTheWholeRun)
{
    Themer* service = Themer::GetThemeService();
    ASSERT_NE(service, nullptr);
    EXPECT_EQ(service, Themer::GetThemeService());
    for (const char* name : {"Default", "ListControl", "HeaderView", "Notebook", "FooterView", "Error"})
        EXPECT_EQ(&service->GetTheme(name), &Themer::GetThemeService()->GetTheme(name)) << name;
}

TEST(ThemeLookup, KnownNamesHaveTheirOwnRecords)
{
    const Theme* defaults = &Get("Default");
    for (const char* name : {"ListControl", "HeaderView", "Notebook", "FooterView", "Error"})
        EXPECT_NE(&Get(name), defaults) << name;
    EXPECT_NE(Get("Error").backgroundColour, Get("Default").backgroundColour);
}

TEST(ThemeLookup, UnknownNamesAndNullGiveTheDefaultRecord)
{
    const Theme* defaults = &Get("Default");
    for (const char* name : {"", "default", "Notebook ", "Unknown", "ListControlX"})
        EXPECT_EQ(&Get(name), defaults) << '"' << name << '"';
    EXPECT_EQ(&Get(nullptr), defaults);
}

TEST(ThemeLookup, EveryFieldTheProgramReadsIsSet)
{
    for (const char* name : {"Default", "ListControl", "HeaderView", "Notebook", "FooterView", "Error"})
    {
        const Theme& theme = Get(name);
        for (const wxColour* colour :
             {&theme.backgroundColour, &theme.panelColour, &theme.selectionColour,
              &theme.inactiveSelectionColour, &theme.textColour, &theme.selectedTextColour,
              &theme.foregroundColour, &theme.controlColour, &theme.lineColour, &theme.alternateRowColour})
            EXPECT_TRUE(colour->IsOk()) << name;
        EXPECT_TRUE(theme.textFont.IsOk()) << name;
        EXPECT_TRUE(theme.titleFont.IsOk()) << name;
    }
}

TEST(ThemeFonts, AreTheSystemGuiFontAndItsBoldForTitles)
{
    const wxFont system = wxSystemSettings::GetFont(wxSYS_DEFAULT_GUI_FONT);
    const Theme& error = Get("Error");
    EXPECT_EQ(error.textFont.GetFaceName(), system.GetFaceName());
    EXPECT_EQ(error.textFont.GetFractionalPointSize(), system.GetFractionalPointSize());
    EXPECT_EQ(error.titleFont.GetFaceName(), system.GetFaceName());
    EXPECT_EQ(error.titleFont.GetFractionalPointSize(), system.GetFractionalPointSize());
    EXPECT_EQ(error.titleFont.GetWeight(), wxFONTWEIGHT_BOLD);
    EXPECT_NE(error.textFont.GetWeight(), wxFONTWEIGHT_BOLD);
}
} // namespace
