// What the Log tab makes of log records, without windows: cells, filters,
// acknowledged folders and sorted columns.
#include "views/LogRows.h"

#include <gtest/gtest.h>
#include <wx/arrstr.h>

#include <deque>

namespace
{
using logrows::LogFilter;

// In LogField order: key, file, folder, server, time, status, detail, DosTime.
JobRecord Record(const wxString& key, const wxString& folder, const wxString& file, const wxString& status,
                 const wxString& dosTime = "1")
{
    return {key, file, folder, "PRN-01", "15.03.2021 14:05:30", status, "detail", dosTime};
}

TEST(LogRows, ARecordAndItsRowCopyGiveTheSameCells)
{
    logrows::StatusTexts statuses([](const wxString& text) { return "T:" + text; });
    // Only a success as written (trailing space aside) goes without the warning, shown as "!".
    for (const auto& [folder, file, status, cells] :
         {std::tuple{"/srv/in/Proofs/", "/srv/in/Proofs/a.b.pdf", "Transferred Successfully  \t",
                     "|a.b|Proofs|PRN-01|15.03.2021 14:05:30|T:Transferred Successfully"},
          {"/In", "/In/.rc", " transferred successfully",
           "!|.rc|In|PRN-01|15.03.2021 14:05:30|T: transferred successfully"}})
    {
        JobRecord record = Record("1", folder, file, status);
        for (const char* what : {"record", "row copy"})
        {
            logrows::LogRowCells shown;
            logrows::FillCells(record, statuses, shown);
            const wxArrayString texts(shown.texts.size(), shown.texts.data());
            EXPECT_EQ((shown.warning ? "!" : "") + wxJoin(texts, '|', '\0'), cells) << what << " " << status;
            logrows::MakeRowCopy(record);
        }
    }
}

TEST(LogRows, ListOnlyWhatBothFiltersLetThroughAndAcknowledgeOnlyTheChosenFolder)
{
    // errors only, by folder, the folder chosen, the record's folder and status, shown.
    for (const auto& [errorsOnly, byFolder, chosen, folder, status, shown] :
         {std::tuple{false, true, "in ", "/hf/IN/", "Failed", true},
          {false, true, "hf", "/hf/In", "Failed", false},
          {true, true, "In", "/hf/In", "Transferred Successfully", false}})
        EXPECT_EQ(shown,
                  (LogFilter{errorsOnly, byFolder, chosen}.Shows(Record("1", folder, "/x/a.pdf", status))))
            << byFolder << " '" << chosen << "' " << folder << " " << status;

    const LogFilter filter{true, true, "a "}; // held by reference
    logrows::FoldersToAcknowledge noted(filter);
    for (const char* folder : {"/hf/B", "/x/A", "/y/a", "/x/A"})
        noted.Note(Record("1", folder, "/x/a.pdf", "Transferred Successfully"));
    EXPECT_EQ(wxJoin(wxArrayString(noted.Folders().size(), noted.Folders().data()), ',', '\0'), "/x/A");
}

TEST(LogRows, ColumnsSortByTheirField)
{
    std::deque<JobRecord> records = {Record("a", "/hf/beta", "Zeta.pdf", "ok", "9"),
                                     Record("b", "/hf/Alpha", "alpha.pdf", "Failed", "10"),
                                     Record("c", "/hf/gamma", "Mid.pdf", "Waiting", "x")};
    records[1][LogField::Server] = "prn-02";
    wxString orders;
    for (int column = 0; column < 6; ++column)
    {
        std::deque<JobRecord> rows = records;
        logrows::Reorder(rows, logrows::SortOrder(rows, column, column % 2 == 1));
        orders << rows[0][LogField::Key] << rows[1][LogField::Key] << rows[2][LogField::Key] << ",";
    }
    // The warning column leaves the order; then descending file name, folder, descending server (a tie
    // keeps its order), start time as a number, descending status; text ignores case.
    EXPECT_EQ(orders, "abc,acb,bac,bac,cab,cab,");
}
} // namespace
