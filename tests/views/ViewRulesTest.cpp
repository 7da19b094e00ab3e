// The rules the tab pages apply to records, without windows.
#include "views/ViewRules.h"
#include "views/StatusRows.h"

#include <gtest/gtest.h>

#include <wx/datetime.h>
#include <wx/init.h>

using namespace viewrules;

namespace
{
// Translations need wx's base library set up.
const wxInitializer kWx;

struct SizeCase
{
    const char* bytes;
    const char* shown;
};

class FormatSizeRule : public ::testing::TestWithParam<SizeCase>
{
};

TEST_P(FormatSizeRule, ShowsBytesInTheLargestUnitExceeded)
{
    EXPECT_EQ(FormatSize(GetParam().bytes), GetParam().shown);
}

INSTANTIATE_TEST_SUITE_P(Sizes, FormatSizeRule,
                         ::testing::Values(SizeCase{"2048", "2.00KB"}, SizeCase{"0", "0.00KB"},
                                           SizeCase{"1048576", "1024.00KB"}, SizeCase{"1048577", "1.00MB"},
                                           SizeCase{"1073741824", "1024.00MB"}, SizeCase{"1073741825", "1.00GB"},
                                           SizeCase{"5368709120", "5.00GB"},
                                           SizeCase{"5497558138880", "5120.00GB"}, SizeCase{"", ""},
                                           SizeCase{"N/A", "N/A"}, SizeCase{"n/a", "n/a"},
                                           SizeCase{"lots", "0.00KB"}, SizeCase{"nan", "0.00KB"}));

TEST(PathRules, NameTheFileAndTheFolderAsTheTableShowsThem)
{
    struct Case
    {
        const char* path;
        const char* last;
        const char* title;
    };
    for (const Case& c :
         {Case{"/srv/in/Proofs/a.b.pdf", "a.b.pdf", "a.b"}, Case{"/srv/in/Proofs/", "Proofs", "Proofs"},
          Case{"/srv/in/.profile", ".profile", ".profile"}, Case{"report", "report", "report"},
          Case{"/", "", ""}, Case{"", "", ""}})
    {
        EXPECT_EQ(LastPathComponent(c.path), c.last) << c.path;
        EXPECT_EQ(FileTitle(c.path), c.title) << c.path;
    }
}

TEST(FilterRules, MatchIgnoringCaseAndTrailingSpace)
{
    EXPECT_TRUE(SameFilterText("srv1", "SRV1 \t"));
    EXPECT_FALSE(SameFilterText(" srv1", "srv1"));
    EXPECT_FALSE(SameFilterText("srv1", "srv10"));
}

TEST(FilterRules, MergeAddsIgnoringCaseAndKeepsRespectingCase)
{
    const wxString all = "All Servers      ";
    struct Case
    {
        std::vector<const char*> entries;
        std::vector<const char*> names;
        std::vector<const char*> expected;
    };
    const Case cases[] = {
        // abc is not added (ABC is there, ignoring case) and ABC goes (abc is not ABC).
        {{"ABC"}, {"abc"}, {}},
        {{}, {"srv1", "srv2 "}, {"srv1", "srv2"}},
        {{"srv2", "gone", "srv1"}, {"srv1", "srv2", "new"}, {"srv2", "srv1", "new"}},
        {{"srv1 "}, {"srv1"}, {"srv1 "}},
        {{"srv1"}, {}, {}},
    };
    for (const Case& c : cases)
    {
        wxArrayString entries, names, expected;
        entries.Add(all);
        expected.Add(all);
        for (const char* e : c.entries)
            entries.Add(e);
        for (const char* n : c.names)
            names.Add(n);
        for (const char* e : c.expected)
            expected.Add(e);
        EXPECT_EQ(MergeFilterEntries(entries, names, all), expected) << wxJoin(entries, ',');
    }
}

TEST(FooterRules, CountAndSelectionInAnyOrderTheTranslationChooses)
{
    EXPECT_EQ(CountFooter(3), "3 Items ");
    EXPECT_EQ(SelectionFooter("[WYX3Value1] of [WYX3Value2] items selected.", 1, 12),
              "1 of 12 items selected.");
    EXPECT_EQ(SelectionFooter("[WYX3Value2] Zeilen, [WYX3Value1] markiert", 1, 12), "12 Zeilen, 1 markiert");
    EXPECT_EQ(SelectionFooter("[WYX3Value1]/[WYX3Value1]", 2, 5), "2/[WYX3Value1]");
}

TEST(FooterRules, SayWhenTheJournalCouldNotBeReadAndWhenItCameBack)
{
    const JournalNoticeTexts texts{"busy since %s", "cannot be read", "back since %s"};
    const std::time_t at = wxDateTime(6, wxDateTime::Dec, 2026, 10, 42).GetTicks();
    using State = JournalWatch::State;
    struct Case
    {
        JournalWatch::Report report;
        const char* notice;
    };
    for (const Case& c : {Case{{State::Busy, at, false}, "busy since 10:42"},
                          Case{{State::Unreadable, at, false}, "cannot be read"},
                          Case{{State::Readable, at, true}, "back since 10:42"}, Case{{State::Readable, 0, false}, ""}})
        EXPECT_EQ(JournalNotice(c.report, texts), c.notice);
}

std::vector<std::size_t> TextOrder(std::vector<const char*> values, bool descending)
{
    return SortKeys(values.size(), SortKind::Text, [&](std::size_t i) { return wxString(values[i]); })
        .Order(descending);
}

TEST(SortRules, TextIgnoresCaseAndEqualKeysKeepTheirOrder)
{
    EXPECT_EQ(TextOrder({"b", "A", "a", "C"}, false), (std::vector<std::size_t>{1, 2, 0, 3}));
    EXPECT_EQ(TextOrder({"b", "A", "a", "C"}, true), (std::vector<std::size_t>{3, 0, 1, 2}));
    EXPECT_EQ(TextOrder({"Zulu", "apple", "ZEBRA"}, false), (std::vector<std::size_t>{1, 2, 0}));
    const std::vector<wxString> accented = {wxString::FromUTF8("\xc3\xa9t\xc3\xa9"), "Zoo"};
    EXPECT_EQ(SortKeys(2, SortKind::Text, [&](std::size_t i) { return accented[i]; }).Order(false),
              (std::vector<std::size_t>{1, 0}));
}

TEST(SortRules, NumbersReadAsUnsignedDecimalsAndUnreadableCountsAsZero)
{
    const std::vector<const char*> values = {"1383035055", "x", "99", "18446744073709551616999"};
    const auto order =
        SortKeys(values.size(), SortKind::Number, [&](std::size_t i) { return wxString(values[i]); })
            .Order(true);
    EXPECT_EQ(order, (std::vector<std::size_t>{3, 0, 2, 1}));
}

TEST(SortRules, ApplyOrderRearrangesWholeRecords)
{
    std::vector<JobRecord> records(4);
    for (std::size_t i = 0; i < records.size(); ++i)
        records[i].fill(wxString::Format("r%zu", i));
    ApplyOrder(records, {2, 0, 3, 1});
    for (const auto& [at, from] : {std::pair{0, 2}, {1, 0}, {2, 3}, {3, 1}})
        EXPECT_EQ(records[at][7], wxString::Format("r%d", from)) << at;
}

TEST(SortRules, EachColumnKeepsItsOwnAlternation)
{
    ColumnSortState state(7, 1, false);
    struct Click
    {
        int column;
        bool accepted;
        int sorted;
        bool descending;
    };
    for (const Click& click : {Click{4, true, 4, true}, Click{2, true, 2, true}, Click{4, true, 4, false},
                               Click{0, false, 4, false}, Click{-1, false, 4, false},
                               Click{8, false, 4, false}, Click{4, true, 4, true}, Click{1, true, 1, true}})
    {
        EXPECT_EQ(state.Click(click.column), click.accepted) << click.column;
        EXPECT_EQ(state.Column(), click.sorted) << click.column;
        EXPECT_EQ(state.Descending(), click.descending) << click.column;
    }
}

TEST(WidthRules, ScaleWithTheFontButNeverNarrower)
{
    EXPECT_EQ(ScaleColumnWidth(145, 6.5), 145);
    EXPECT_EQ(ScaleColumnWidth(145, 5.0), 145);
    EXPECT_EQ(ScaleColumnWidth(100, 8.125), 125);
}

// Status records as the model gives them: key, path, folder, server, size, format, time, status.
JobRecord Job(const char* key, const char* file, const char* server, const char* size, const char* status)
{
    return {key,   wxString("/srv/in/Proofs/") + file, "/srv/in/Proofs", server, size, "PDF", "12/06/26",
            status};
}

std::vector<JobRecord> Shown(const StatusRows& rows)
{
    std::vector<JobRecord> made(rows.GetRowCount());
    for (std::size_t i = 0; i < made.size(); ++i)
        rows.MakeRow(i, made[i]);
    return made;
}

TEST(StatusTable, ShowsDisplayRowsInSortOrderForTheChosenServer)
{
    auto read = std::make_shared<JobSnapshot>();
    read->jobs = {Job("1", "b.pdf", "SRV1 ", "2048", "Saving..."), Job("2", "A.pdf", "srv2", "N/A", "Queued"),
                  Job("3", "c.tiff", "srv1", "1048577", "Transferring to server")};
    read->startTimes = {30, 10, 20};
    StatusTable table;
    table.Replace(read);
    const std::vector<JobRecord> unsorted = Shown(*table.Rows(false, wxString()));
    ASSERT_EQ(unsorted.size(), 3u);
    EXPECT_EQ(unsorted[1][0] + unsorted[2][0], "23") << "journal order until sorted";

    table.Sort(1, false);
    std::vector<JobRecord> rows = Shown(*table.Rows(false, wxString()));
    ASSERT_EQ(rows.size(), 3u);
    EXPECT_EQ(rows[0], (JobRecord{"2", "A", "Proofs", "srv2", "N/A", "PDF", "12/06/26", "Queued"}));
    EXPECT_EQ(rows[1][1], "b");
    EXPECT_EQ(rows[1][4], "2.00KB");
    EXPECT_EQ(rows[2][4], "1.00MB");

    table.Sort(6, true); // Time: latest start first
    const auto srv1 = table.Rows(true, "srv1");
    rows = Shown(*srv1);
    ASSERT_EQ(rows.size(), 2u);
    EXPECT_EQ(rows[0][0], "1");
    EXPECT_EQ(rows[1][0], "3");
    EXPECT_EQ(srv1->FindKey("3"), 1);
    EXPECT_EQ(srv1->FindKey("2"), -1) << "filtered out";

    table.Sort(0, true); // not a sortable column: the order stays
    EXPECT_EQ(table.SortedJob(0)[0], "1");

    table.Replace(std::make_shared<JobSnapshot>());
    EXPECT_EQ(table.Size(), 0u);
    EXPECT_EQ(srv1->GetRowCount(), 2u) << "rows handed out keep their jobs";
    EXPECT_EQ(Shown(*srv1)[1][0], "3");
}

} // namespace
