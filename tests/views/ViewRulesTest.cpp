// The rules the tab pages apply to records, without windows.
#include "views/ViewRules.h"
#include "views/StatusRows.h"

#include <gtest/gtest.h>

#include <wx/init.h>

using namespace viewrules;

namespace
{
// Translations need wx's base library set up.
const wxInitializer kWx;

using Order = std::vector<std::size_t>;

Order SortOrder(std::vector<wxString> values, SortKind kind, bool descending)
{
    return SortKeys(values.size(), kind, [&](std::size_t i) { return values[i]; }).Order(descending);
}

TEST(ViewRules, SizesShowInTheLargestUnitExceededSortsKeepTiesInOrderAndWidthsNeverShrink)
{
    wxString shown;
    for (const char* bytes : {"2048", "1048576", "1048577", "1073741825", "5497558138880", "", "N/A", "nan"})
        shown << FormatSize(bytes) << ",";
    EXPECT_EQ(shown, "2.00KB,1024.00KB,1.00MB,1.00GB,5120.00GB,,N/A,0.00KB,");

    EXPECT_EQ(SortOrder({"b", "A", "a", "C"}, SortKind::Text, true), (Order{3, 0, 1, 2}));
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

TEST(StatusTable, RowsHandedOutShowTheChosenServersJobsAndKeepThemWhenTheTableIsReplaced)
{
    auto read = std::make_shared<JobSnapshot>();
    read->jobs = {Job("1", "b.pdf", "SRV1 ", "2048"), Job("2", "A.pdf", "srv2", "N/A"),
                  Job("3", "c.tiff", "srv1", "1048577")};
    read->startTimes = {30, 10, 20};
    StatusTable table;
    table.Replace(read);
    const auto srv1 = table.Rows(true, "srv1");
    table.Replace(std::make_shared<JobSnapshot>());
    ASSERT_EQ(srv1->GetRowCount(), 2u);
    JobRecord row;
    srv1->MakeRow(1, row);
    EXPECT_EQ(row, (JobRecord{"3", "c", "Proofs", "srv1", "1.00MB", "PDF", "12/06/26", "Queued"}));
}
} // namespace
