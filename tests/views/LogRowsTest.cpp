// What the Log tab lets through its filters and which folders it acknowledges, without windows.
#include "views/LogRows.h"

#include <gtest/gtest.h>
#include <wx/arrstr.h>

namespace
{
using logrows::LogFilter;

// In LogField order: key, file, folder, server, time, status, detail, DosTime.
JobRecord Record(const wxString& key, const wxString& folder, const wxString& file, const wxString& status,
                 const wxString& dosTime = "1")
{
    return {key, file, folder, "PRN-01", "15.03.2021 14:05:30", status, "detail", dosTime};
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

} // namespace
