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
         {std::tuple{"/srv/in/Proofs", "/srv/in/Proofs/a.b.pdf", "Transferred Successfully  \t",
                     "|a.b|Proofs|PRN-01|15.03.2021 14:05:30|T:Transferred Successfully"},
          {"/srv/in/Proofs/", "/srv/in/Proofs/report", "transferred successfully ",
           "!|report|Proofs|PRN-01|15.03.2021 14:05:30|T:transferred successfully"},
          {"/In", "/In/.rc", " Transferred Successfully",
           "!|.rc|In|PRN-01|15.03.2021 14:05:30|T: Transferred Successfully"}})
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

TEST(LogRows, ListOnlyWhatBothFiltersLetThrough)
{
    // errors only, by folder, the folder chosen, the record's folder and status, shown.
    for (const auto& [errorsOnly, byFolder, chosen, folder, status, shown] :
         {std::tuple{true, false, "", "/hf/In", "TRANSFERRED SUCCESSFULLY", true},
          {false, true, "in ", "/hf/IN", "Failed", true},
          {false, true, "In", "/hf/In/", "Failed", true},
          {false, true, "In", "/hf/Out", "Failed", false},
          {false, true, "hf", "/hf/In", "Failed", false},
          {true, true, "In", "/hf/In", "Transferred Successfully", false}})
        EXPECT_EQ(shown,
                  (LogFilter{errorsOnly, byFolder, chosen}.Shows(Record("1", folder, "/x/a.pdf", status))))
            << errorsOnly << byFolder << " '" << chosen << "' " << folder << " " << status;
}

TEST(LogRows, AcknowledgeEveryFolderOnceInFirstSeenOrderOrOnlyTheChosenOne)
{
    // by folder, the folder chosen, the records' folders (all successful), the folders acknowledged.
    for (const auto& [byFolder, chosen, folders, acknowledged] :
         {std::tuple{false, "", "/hf/B,/hf/A,/hf/B,/hf/a,/hf/A", "/hf/B,/hf/A,/hf/a"},
          {true, "a ", "/hf/B,/x/A,/y/a,/x/A", "/x/A"}})
    {
        const LogFilter filter{true, byFolder, chosen}; // held by reference
        logrows::FoldersToAcknowledge noted(filter);
        for (const wxString& folder : wxSplit(folders, ','))
            noted.Note(Record("1", folder, "/x/a.pdf", "Transferred Successfully"));
        EXPECT_EQ(wxJoin(wxArrayString(noted.Folders().size(), noted.Folders().data()), ',', '\0'),
                  acknowledged);
    }
}

TEST(LogRows, ColumnsSortByTheirField)
{
    // column, descending, the keys in order.
    for (const auto& [column, descending, keys] : {std::tuple{1, true, "acb"}, // file name
                                                   {2, false, "bac"},          // hot folder path
                                                   {3, true, "bac"},  // server; ties keep their order
                                                   {4, true, "bac"},  // start time, by number
                                                   {5, false, "cba"}, // status
                                                   {0, true, "abc"}}) // the warning column leaves the order
    {
        std::deque<JobRecord> rows = {Record("a", "/hf/beta", "Zeta.pdf", "ok", "9"),
                                      Record("b", "/hf/Alpha", "alpha.pdf", "Failed", "10"),
                                      Record("c", "/hf/gamma", "Mid.pdf", "broken", "x")};
        rows[1][LogField::Server] = "prn-02";
        logrows::Reorder(rows, logrows::SortOrder(rows, column, descending));
        EXPECT_EQ(rows[0][LogField::Key] + rows[1][LogField::Key] + rows[2][LogField::Key], keys)
            << column << descending;
    }
}
} // namespace
