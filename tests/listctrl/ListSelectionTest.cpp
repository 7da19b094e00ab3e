#include "components/Utility/ProfilesKelvoListSelection.h"

#include <gtest/gtest.h>

#include <sstream>
#include <string>

namespace
{
// The ranges as " a:b" words, as Next walks them; Count must agree.
std::string Described(const ProfilesKelvoListSelection& selection)
{
    std::string walked;
    long count = 0;
    for (long item = selection.Next(-1), start = item; item >= 0; ++count)
    {
        const long next = selection.Next(item);
        if (next < 0 || next != item + 1)
            walked += " " + std::to_string(start) + ":" + std::to_string(item), start = next;
        item = next;
    }
    EXPECT_EQ(selection.Count(), count) << walked;
    return walked;
}

// "changes = ranges;" steps; a step that begins with '&' goes on from the one before. Changes are "+3"
// (select), "-3" (deselect), "+2:4" and "-2:4" (ranges, either order), "t5" (truncate), "i3" (insert a
// row), "r4" (remove a row) and "c" (clear).
TEST(ListSelection, RangesFollowEveryChange)
{
    std::istringstream steps(
        "+3 +5 +4 = 3:5; +10:20 -15 = 10:14 16:20; & -12:18 = 10:11 19:20; +8:4 +20:25 +7:21 = 4:25;"
        // A filtered virtual list shrinks under its selection.
        "+2:4 +7 t10 = 2:4 7:7; +2:4 +7 t3 = 2:2; +2:4 +7 t2 = ;"
        // Inserted rows shift later ones and are not selected; removed ones pull them up.
        "+2:4 +8 i3 = 2:2 4:5 9:9; & i0 = 3:3 5:6 10:10; +2:3 +5:6 r4 = 2:5; & r2 = 2:4; & c = ;"
        // Negative items are ignored.
        "+-1 +-5:1 = 0:1;");
    ProfilesKelvoListSelection selection;
    for (std::string script, expected;
         std::getline(steps, script, '=') && std::getline(steps, expected, ';');)
    {
        if (script.find('&') == std::string::npos)
            selection = ProfilesKelvoListSelection();
        std::istringstream in(script.substr(script.find('&') + 1));
        for (std::string op; in >> op;)
        {
            const size_t colon = op.find(':');
            const long first = op.size() > 1 ? std::stol(op.substr(1, colon - 1)) : 0;
            if ((op[0] == '+' || op[0] == '-') && colon != std::string::npos)
                selection.SelectRange(first, std::stol(op.substr(colon + 1)), op[0] == '+');
            else if (op[0] == '+' || op[0] == '-')
                selection.Select(first, op[0] == '+');
            else if (op[0] == 't')
                selection.Truncate(first);
            else if (op[0] == 'i')
                selection.InsertGap(first);
            else if (op[0] == 'r')
                selection.Remove(first);
            else
                selection.Clear();
        }
        std::istringstream words(expected);
        std::string want;
        for (std::string word; words >> word;)
            want += " " + word;
        EXPECT_EQ(Described(selection), want) << script;
    }
}
} // namespace
