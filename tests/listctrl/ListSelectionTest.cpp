#include "components/Utility/ProfilesKelvoListSelection.h"

#include <gtest/gtest.h>

#include <climits>
#include <sstream>
#include <string>

namespace
{
using Selection = ProfilesKelvoListSelection;

// "M" is the largest index, "M-2" two less.
long Number(const std::string& text)
{
    return text[0] == 'M' ? LONG_MAX - (text.size() > 1 ? std::stol(text.substr(2)) : 0) : std::stol(text);
}

// Runs "+3" (select), "-3" (deselect), "+2:4" and "-2:4" (ranges, either order),
// "t5" (truncate), "i3" (insert a row), "r4" (remove a row) and "c" (clear).
void Apply(Selection& selection, const std::string& script)
{
    std::istringstream in(script);
    for (std::string op; in >> op;)
    {
        const size_t colon = op.find(':');
        const long first = op.size() > 1 ? Number(op.substr(1, colon - 1)) : 0;
        const bool on = op[0] == '+';
        if ((op[0] == '+' || op[0] == '-') && colon != std::string::npos)
            selection.SelectRange(first, Number(op.substr(colon + 1)), on);
        else if (op[0] == '+' || op[0] == '-')
            selection.Select(first, on);
        else if (op[0] == 't')
            selection.Truncate(first);
        else if (op[0] == 'i')
            selection.InsertGap(first);
        else if (op[0] == 'r')
            selection.Remove(first);
        else
            selection.Clear();
    }
}

std::string Name(long item)
{
    if (item > LONG_MAX - 10)
        return item == LONG_MAX ? "M" : "M-" + std::to_string(LONG_MAX - item);
    return std::to_string(item);
}

// The ranges as " a:b" words, as the store gives them, and as Next and IsSelected find them.
std::string Described(const Selection& selection)
{
    std::string ranges, walked;
    long count = 0;
    for (const auto& [first, last] : selection.Ranges())
    {
        ranges += " " + Name(first) + ":" + Name(last);
        count += last - first + 1;
        EXPECT_TRUE(selection.IsSelected(first) && selection.IsSelected(last)) << first << ":" << last;
        EXPECT_FALSE(selection.IsSelected(first - 1) || (last < LONG_MAX && selection.IsSelected(last + 1)));
    }
    for (long item = selection.Next(-1), start = item; item >= 0;)
    {
        const long next = item == LONG_MAX ? -1 : selection.Next(item);
        if (next < 0 || next != item + 1)
            walked += " " + Name(start) + ":" + Name(item), start = next;
        item = next;
    }
    EXPECT_EQ(walked, ranges) << "walked with Next";
    EXPECT_EQ(selection.Count(), count);
    EXPECT_EQ(selection.Empty(), count == 0);
    return ranges;
}

TEST(ListSelection, RangesFollowEveryChange)
{
    // "changes = ranges;" steps; a step that begins with '&' goes on from the one before.
    std::istringstream steps(
        "+3 +5 +4 = 3:5; +10:20 -15 = 10:14 16:20; & -12:18 = 10:11 19:20; +8:4 +20:25 +7:21 = 4:25;"
        // A filtered virtual list shrinks under its selection.
        "+2:4 +7 t10 = 2:4 7:7; +2:4 +7 t5 = 2:4; +2:4 +7 t3 = 2:2; +2:4 +7 t2 = ; +2:4 +7 t0 = ;"
        // Inserted rows shift later ones and are not selected; removed ones pull them up.
        "+2:4 +8 i3 = 2:2 4:5 9:9; & i0 = 3:3 5:6 10:10; +2:3 +5:6 r4 = 2:5; & r2 = 2:4;"
        "+0:99999 -50000 = 0:49999 50001:99999; & t50000 = 0:49999; & c = ;"
        // Up to the largest index without overflow; negative items are ignored.
        "+M-2:M +M-5:M-3 = M-5:M; & -0:M = ; +-1 +-5:1 = 0:1;");
    Selection selection;
    for (std::string script, expected;
         std::getline(steps, script, '=') && std::getline(steps, expected, ';');)
    {
        if (script.find('&') == std::string::npos)
            selection = Selection();
        Apply(selection, script.substr(script.find('&') + 1));
        std::istringstream words(expected);
        std::string want;
        for (std::string word; words >> word;)
            want += " " + word;
        EXPECT_EQ(Described(selection), want) << script;
    }
}

TEST(ListSelection, ReportsOnlyChanges)
{
    Selection selection;
    EXPECT_TRUE(selection.Select(5, true));
    EXPECT_FALSE(selection.Select(5, true));
    EXPECT_FALSE(selection.Select(-1, true));
    EXPECT_FALSE(selection.Select(6, false));
    EXPECT_TRUE(selection.Select(5, false));
}
} // namespace
