#include <gtest/gtest.h>

#include <set>

#include <wx/filename.h>
#include <wx/tokenzr.h>

#include "StatusTestSupport.h"
#include "data/JobReadWriter.h"
#include "data/JobStatusManager.h"
#include "platform/datasource/WyxDataSource.h"
#include "tools/simulator/HotFolderSimulator.h"

namespace
{

const auto* const kWx = testing::AddGlobalTestEnvironment(new statustest::WxEnvironment);

// The journal's lines, each split into its pieces.
std::vector<wxArrayString> ReadJournal(const wxString& path)
{
    wyx::JobsFileReadWriter reader;
    reader.SetPath(path);
    wxArrayString lines;
    EXPECT_EQ(reader.ReadJobs(lines), wyx::JobOk) << path;
    std::vector<wxArrayString> pieces;
    for (const wxString& line : lines)
        pieces.push_back(wxStringTokenize(line, "\t", wxTOKEN_STRTOK));
    return pieces;
}

// Half the jobs fail: each failed one marks its hot folder, and every job
// finished removes its line from the status journal again.
TEST(Simulator, WritesWellFormedTrafficThatTheModelsRead)
{
    statustest::SystemRoot root;
    // 200 jobs a second for 0.05 s, half failing, 0.005 s in each stage, from a fixed seed.
    const SimulatorOptions options{200, 0.05, 0.5, 0.005, 0, true, "", root.Path() + "/srv/hotfolders"};
    HotFolderSimulator simulator(options, [] { return false; });
    wxString problem;
    ASSERT_TRUE(simulator.Prepare(problem)) << problem;
    JobStatusManager status(simulator.DataDirectory() + "TiveraJobsStatusFile.txt");
    ASSERT_EQ(status.Parse(), 1);
    const HotFolderSimulator::Totals totals = simulator.Run();
    EXPECT_TRUE(totals.failed > 0 && totals.succeeded > 0 && totals.journalErrors == 0);
    EXPECT_EQ(totals.started, totals.succeeded + totals.failed);

    // Every finished job is logged whole, in a hot folder the data source names.
    const std::vector<wxArrayString> log = ReadJournal(simulator.DataDirectory() + "TiveraJobsLogFile.txt");
    EXPECT_EQ(log.size(), totals.started);
    std::set<wxString> failedFolders;
    for (const wxArrayString& pieces : log)
    {
        ASSERT_EQ(pieces.size(), 8u);
        EXPECT_TRUE(pieces[2].StartsWith(pieces[1] + "/") && pieces[4].IsNumber() && pieces[7] == "ADDED");
        if (pieces[5] != "Transferred Successfully")
            failedFolders.insert(pieces[1]);
    }
    wxArrayString hotFolders;
    WyxDataSource::GetInstance().GetHotFoldersList(hotFolders);
    EXPECT_GE(hotFolders.size(), failedFolders.size());
    for (const wxString& folder : hotFolders)
        EXPECT_EQ(wxFileName::FileExists(folder + "/[_KELVO_HotFolder_]/Error.er"),
                  failedFolders.erase(folder) == 1)
            << folder;
    EXPECT_TRUE(failedFolders.empty()) << "a failed job in a folder the data source does not list";
    EXPECT_TRUE(ReadJournal(simulator.DataDirectory() + "TiveraJobsStatusFile.txt").empty());
}

} // namespace
