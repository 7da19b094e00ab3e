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

using Order = std::vector<std::size_t>;

TEST(ViewRules, FormatSizeShowsBytesInTheLargestUnitExceeded)
{
    wxString shown;
    for (const char* bytes : {"2048", "1048576", "1048577", "1073741825", "5497558138880", "", "N/A", "nan"})
        shown << FormatSize(bytes) << ",";
    EXPECT_EQ(shown, "2.00KB,1024.00KB,1.00MB,1.00GB,5120.00GB,,N/A,0.00KB,");
}

TEST(ViewRules, FiltersMatchIgnoringCaseAndTrailingSpaceAndMergeTellsCaseApart)
{
    EXPECT_TRUE(SameFilterText("srv1", "SRV1 \t"));
    EXPECT_FALSE(SameFilterText(" srv1", "srv1") || SameFilterText("srv1", "srv10"));
    // The entries before, the names now, the entries after: "All" stays first, gone names go, new
    // ones come last, trimmed; abc is not added (ABC is there), and ABC goes (it is not abc).
    for (const auto& [entries, names, merged] :
         {std::tuple{"All,srv2,gone,srv1 ", "srv1,srv2,new ", "All,srv2,srv1 ,new"},
          {"All,ABC", "abc", "All"}})
        EXPECT_EQ(wxJoin(MergeFilterEntries(wxSplit(entries, ','), wxSplit(names, ','), "All"), ','), merged);
}

TEST(ViewRules, FootersFollowTheTranslatedOrderAndSayWhenTheJournalCouldNotBeRead)
{
    EXPECT_EQ(SelectionFooter("[WYX3Value2] Zeilen, [WYX3Value1] markiert", 1, 12), "12 Zeilen, 1 markiert");
    const JournalNoticeTexts texts{"busy since %s", "cannot be read", "back since %s"};
    const std::time_t at = wxDateTime(6, wxDateTime::Dec, 2026, 10, 42).GetTicks();
    using State = JournalWatch::State;
    for (const auto& [report, notice] :
         {std::pair{JournalWatch::Report{State::Busy, at, false}, "busy since 10:42"},
          {{State::Unreadable, at, false}, "cannot be read"},
          {{State::Readable, at, true}, "back since 10:42"},
          {{State::Readable, 0, false}, ""}})
        EXPECT_EQ(JournalNotice(report, texts), notice);
}

Order SortOrder(std::vector<wxString> values, SortKind kind, bool descending)
{
    return SortKeys(values.size(), kind, [&](std::size_t i) { return values[i]; }).Order(descending);
}

TEST(ViewRules, SortsTextIgnoringCaseNumbersAsUnsignedTiesKeepTheirOrderAndWidthsNeverShrink)
{
    EXPECT_EQ(SortOrder({"b", "A", "a", "C"}, SortKind::Text, true), (Order{3, 0, 1, 2}));
    EXPECT_EQ(SortOrder({wxString::FromUTF8("\xc3\xa9t\xc3\xa9"), "Zoo"}, SortKind::Text, false),
              (Order{1, 0}));
    // Unreadable counts as zero; a number beyond 64 bits still sorts above.
    EXPECT_EQ(SortOrder({"1383035055", "x", "99", "18446744073709551616999"}, SortKind::Number, true),
              (Order{3, 0, 2, 1}));
    // Columns are laid out for the reference font and widen for a wider one, never narrow.
    EXPECT_EQ(ScaleColumnWidth(145, 5.0), 145);
    EXPECT_EQ(ScaleColumnWidth(100, 8.125), 125);
}

// Status records as the model gives them: key, path, folder, server, size, format, time, status.
JobRecord Job(const char* key, const char* file, const char* server, const char* size)
{
    return {key,     wxString("/srv/in/Proofs/") + file, "/srv/in/Proofs", server, size, "PDF", "12/06/26",
            "Queued"};
}

TEST(StatusTable, ShowsDisplayRowsInSortOrderForTheChosenServerAndKeepsThoseHandedOut)
{
    auto read = std::make_shared<JobSnapshot>();
    read->jobs = {Job("1", "b.pdf", "SRV1 ", "2048"), Job("2", "A.pdf", "srv2", "N/A"),
                  Job("3", "c.tiff", "srv1", "1048577")};
    read->startTimes = {30, 10, 20};
    StatusTable table;
    table.Replace(read);
    table.Sort(6, true); // Time: latest start first
    const auto srv1 = table.Rows(true, "srv1");
    ASSERT_EQ(srv1->GetRowCount(), 2u);
    JobRecord row;
    srv1->MakeRow(1, row);
    EXPECT_EQ(row, (JobRecord{"3", "c", "Proofs", "srv1", "1.00MB", "PDF", "12/06/26", "Queued"}));
    EXPECT_EQ(srv1->FindKey("1"), 0);
    EXPECT_EQ(srv1->FindKey("2"), -1) << "filtered out";

    table.Replace(std::make_shared<JobSnapshot>());
    EXPECT_EQ(table.Size(), 0u);
    srv1->MakeRow(1, row);
    EXPECT_EQ(row[0] + wxString::Format("%zu", srv1->GetRowCount()), "32")
        << "rows handed out keep their jobs";
}
} // namespace
