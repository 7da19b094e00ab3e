// What the Log tab makes of log records, without windows: cells, filters,
// acknowledged folders and sorted columns.
#include "views/LogRows.h"

#include <gtest/gtest.h>
#include <wx/arrstr.h>

#include <deque>
#include <vector>

namespace
{
using logrows::LogFilter;

// In LogField order: key, file, folder, server, time, status, detail, DosTime.
JobRecord Record(const wxString& key, const wxString& folder, const wxString& file, const wxString& status,
                 const wxString& dosTime = "1")
{
    return {key, file, folder, "PRN-01", "15.03.2021 14:05:30", status, "detail", dosTime};
}

wxString Marked(const wxString& text)
{
    return "T:" + text;
}

// The cells of a row joined by '|', "!" first when the row shows the warning.
wxString Cells(const JobRecord& record)
{
    logrows::StatusTexts statuses(&Marked);
    logrows::LogRowCells cells;
    logrows::FillCells(record, statuses, cells);
    return (cells.warning ? "!" : "") +
           wxJoin(wxArrayString(cells.texts.size(), cells.texts.data()), '|', '\0');
}

TEST(LogRows, ARecordAndItsRowCopyGiveTheSameCells)
{
    // folder, file, status; the cells before and after the server and time, "!" for a warning.
    for (const auto& [folder, file, status, before, after] :
         {std::tuple{"/srv/in/Proofs", "/srv/in/Proofs/a.b.pdf", "Transferred Successfully", "|a.b|Proofs",
                     "Transferred Successfully"},
          {"/srv/in/Proofs", "/srv/in/Proofs/a.pdf", "Transferred Successfully  \t", "|a|Proofs",
           "Transferred Successfully"},
          {"/srv/in/Proofs", "/srv/in/Proofs/a.pdf", "transferred successfully", "!|a|Proofs",
           "transferred successfully"},
          {"/srv/in/Proofs/", "/srv/in/Proofs/report", "Conversion failed ", "!|report|Proofs",
           "Conversion failed"},
          {"/In", "/In/.rc", " Transferred Successfully", "!|.rc|In", " Transferred Successfully"}})
    {
        JobRecord record = Record("1", folder, file, status);
        const wxString expected = wxString(before) + "|PRN-01|15.03.2021 14:05:30|T:" + after;
        EXPECT_EQ(Cells(record), expected) << status;
        logrows::MakeRowCopy(record);
        EXPECT_EQ(Cells(record), expected) << "row copy of " << status;
    }
}

TEST(LogRows, EachDistinctStatusIsTranslatedOnce)
{
    int calls = 0;
    logrows::StatusTexts statuses([&](const wxString& text) { return ++calls, Marked(text); });
    for (int i = 0; i < 3; ++i)
    {
        EXPECT_EQ("T:Failed", statuses.Translated("Failed "));
        EXPECT_EQ("T:Transferred Successfully", statuses.Translated("Transferred Successfully"));
    }
    EXPECT_EQ(2, calls);
}

TEST(LogRows, ListOnlyWhatBothFiltersLetThrough)
{
    // errors only, by folder, the folder chosen, the record's folder and status, shown.
    for (const auto& [errorsOnly, byFolder, chosen, folder, status, shown] :
         {std::tuple{false, false, "", "/hf/In", "Transferred Successfully", true},
          {true, false, "", "/hf/In", "Transferred Successfully", false},
          {true, false, "", "/hf/In", "Transferred Successfully   ", false},
          {true, false, "", "/hf/In", "TRANSFERRED SUCCESSFULLY", true},
          {true, false, "", "/hf/In", "Failed", true},
          {false, true, "in ", "/hf/IN", "Failed", true},
          {false, true, "In", "/hf/In/", "Failed", true},
          {false, true, "In", "/hf/Out", "Failed", false},
          {false, true, "hf", "/hf/In", "Failed", false},
          {true, true, "In", "/hf/In", "Transferred Successfully", false}})
        EXPECT_EQ(shown,
                  (LogFilter{errorsOnly, byFolder, chosen}.Shows(Record("1", folder, "/x/a.pdf", status))))
            << errorsOnly << byFolder << " '" << chosen << "' " << folder << " " << status;
}

TEST(LogRows, AcknowledgeEveryFolderInFirstSeenOrderOrOnlyTheChosenOne)
{
    // by folder, the folder chosen, the records' folders, the folders acknowledged.
    for (const auto& [byFolder, chosen, folders, acknowledged] :
         {std::tuple{false, "", "", ""},
          {false, "", "/hf/B,/hf/A,/hf/B,/hf/A,/hf/C",
           "/hf/B,/hf/A,/hf/C"}, // all successful, still acknowledged
          {false, "", "/hf/a,/hf/A", "/hf/a,/hf/A"},
          {true, "a ", "/hf/B,/x/A,/y/a,/x/A", "/x/A"},
          {true, "Z", "/hf/B", ""}})
    {
        const LogFilter filter{true, byFolder, chosen};
        logrows::FoldersToAcknowledge noted(filter);
        for (const wxString& folder : *folders ? wxSplit(folders, ',') : wxArrayString())
            noted.Note(Record("1", folder, "/x/a.pdf", "Transferred Successfully"));
        EXPECT_EQ(wxJoin(wxArrayString(noted.Folders().size(), noted.Folders().data()), ',', '\0'),
                  acknowledged)
            << folders;
    }
}

TEST(LogRows, ColumnsSortByTheirField)
{
    // column, descending, the keys in order.
    for (const auto& [column, descending, keys] : {std::tuple{1, true, "acb"}, // file name
                                                   {1, false, "bca"},          // file name, ignoring case
                                                   {2, false, "bac"},          // hot folder path
                                                   {3, true, "bac"},  // server; ties keep their order
                                                   {4, true, "bac"},  // start time, newest first by number
                                                   {4, false, "cab"}, // start time, oldest first
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
