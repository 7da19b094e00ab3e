#include "components/Utility/ProfilesKelvoListSelection.h"

#include <gtest/gtest.h>

#include <climits>

namespace
{
using Ranges = std::vector<std::pair<long, long>>;

TEST(ListSelection, SingleItemsMergeIntoRanges)
{
    ProfilesKelvoListSelection selection;
    EXPECT_TRUE(selection.Select(3, true));
    EXPECT_TRUE(selection.Select(5, true));
    EXPECT_FALSE(selection.Select(5, true)) << "no change, no report";
    EXPECT_TRUE(selection.Select(4, true));
    EXPECT_EQ(selection.Ranges(), (Ranges{{3, 5}}));
    EXPECT_EQ(selection.Count(), 3);
    EXPECT_TRUE(selection.IsSelected(4));
    EXPECT_FALSE(selection.IsSelected(2));
    EXPECT_FALSE(selection.IsSelected(6));
}

TEST(ListSelection, DeselectingSplitsARange)
{
    ProfilesKelvoListSelection selection;
    selection.SelectRange(10, 20, true);
    EXPECT_TRUE(selection.Select(15, false));
    EXPECT_EQ(selection.Ranges(), (Ranges{{10, 14}, {16, 20}}));
    EXPECT_EQ(selection.Count(), 10);
    selection.SelectRange(12, 18, false);
    EXPECT_EQ(selection.Ranges(), (Ranges{{10, 11}, {19, 20}}));
    EXPECT_EQ(selection.Count(), 4);
}

TEST(ListSelection, RangesGivenBackwardsOrOverlappingAreJoined)
{
    ProfilesKelvoListSelection selection;
    selection.SelectRange(8, 4, true);
    selection.SelectRange(20, 25, true);
    selection.SelectRange(7, 21, true);
    EXPECT_EQ(selection.Ranges(), (Ranges{{4, 25}}));
    EXPECT_EQ(selection.Count(), 22);
}

TEST(ListSelection, NextWalksSelectedItemsInOrder)
{
    ProfilesKelvoListSelection selection;
    selection.SelectRange(2, 3, true);
    selection.Select(7, true);
    std::vector<long> walked;
    for (long item = selection.Next(-1); item >= 0; item = selection.Next(item))
        walked.push_back(item);
    EXPECT_EQ(walked, (std::vector<long>{2, 3, 7}));
}

struct TruncateCase
{
    long count;
    Ranges expected;
    long expectedCount;
};

class ListSelectionTruncate : public ::testing::TestWithParam<TruncateCase>
{
};

// A filtered virtual list shrinks under its selection: rows past the end must not stay selected.
TEST_P(ListSelectionTruncate, KeepsOnlyRowsBelowTheCount)
{
    ProfilesKelvoListSelection selection;
    selection.SelectRange(2, 4, true);
    selection.Select(7, true);
    selection.Truncate(GetParam().count);
    EXPECT_EQ(selection.Ranges(), GetParam().expected);
    EXPECT_EQ(selection.Count(), GetParam().expectedCount);
    EXPECT_FALSE(selection.IsSelected(7) && GetParam().count <= 7);
}

INSTANTIATE_TEST_SUITE_P(Counts, ListSelectionTruncate,
                         ::testing::Values(TruncateCase{10, {{2, 4}, {7, 7}}, 4},
                                           TruncateCase{5, {{2, 4}}, 3}, TruncateCase{3, {{2, 2}}, 1},
                                           TruncateCase{2, {}, 0}, TruncateCase{0, {}, 0}));

TEST(ListSelection, InsertedRowShiftsLaterRowsAndIsNotSelected)
{
    ProfilesKelvoListSelection selection;
    selection.SelectRange(2, 4, true);
    selection.Select(8, true);
    selection.InsertGap(3);
    EXPECT_EQ(selection.Ranges(), (Ranges{{2, 2}, {4, 5}, {9, 9}}));
    EXPECT_EQ(selection.Count(), 4);
    selection.InsertGap(0);
    EXPECT_EQ(selection.Ranges(), (Ranges{{3, 3}, {5, 6}, {10, 10}}));
}

TEST(ListSelection, RemovedRowPullsLaterRowsUpAndJoinsNeighbours)
{
    ProfilesKelvoListSelection selection;
    selection.SelectRange(2, 3, true);
    selection.SelectRange(5, 6, true);
    selection.Remove(4);
    EXPECT_EQ(selection.Ranges(), (Ranges{{2, 5}}));
    EXPECT_EQ(selection.Count(), 4);
    selection.Remove(2);
    EXPECT_EQ(selection.Ranges(), (Ranges{{2, 4}}));
    EXPECT_EQ(selection.Count(), 3);
}

TEST(ListSelection, WholeHundredThousandRowListIsOneRange)
{
    ProfilesKelvoListSelection selection;
    selection.SelectRange(0, 99999, true);
    EXPECT_EQ(selection.Count(), 100000);
    EXPECT_EQ(selection.Ranges().size(), 1u);
    selection.Select(50000, false);
    EXPECT_EQ(selection.Count(), 99999);
    EXPECT_EQ(selection.Next(49999), 50001);
    selection.Truncate(50000);
    EXPECT_EQ(selection.Count(), 50000);
    selection.Clear();
    EXPECT_TRUE(selection.Empty());
    EXPECT_EQ(selection.Next(-1), -1);
}

TEST(ListSelection, RangeUpToTheLargestIndexDoesNotOverflow)
{
    ProfilesKelvoListSelection selection;
    selection.SelectRange(LONG_MAX - 2, LONG_MAX, true);
    selection.SelectRange(LONG_MAX - 5, LONG_MAX - 3, true);
    EXPECT_EQ(selection.Ranges(), (Ranges{{LONG_MAX - 5, LONG_MAX}}));
    selection.SelectRange(0, LONG_MAX, false);
    EXPECT_TRUE(selection.Empty());
}

TEST(ListSelection, NegativeItemsAreIgnored)
{
    ProfilesKelvoListSelection selection;
    EXPECT_FALSE(selection.Select(-1, true));
    selection.SelectRange(-5, 1, true);
    EXPECT_EQ(selection.Ranges(), (Ranges{{0, 1}}));
}
} // namespace
