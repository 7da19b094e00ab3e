#include <gtest/gtest.h>

#include <wx/filename.h>

#include "StatusTestSupport.h"
#include "data/JobLogManager.h"
#include "data/JobStatusManager.h"
#include "platform/datasource/WyxDataSource.h"
#include "tools/simulator/HotFolderSimulator.h"

namespace
{

const auto* const kWx = testing::AddGlobalTestEnvironment(new wyxtest::WxEnvironment);

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
    JobStatusManager status(root.JournalPath()); // the program's data directory, as the simulator's
    const wxString logJournal = simulator.DataDirectory() + "TiveraJobsLogFile.txt";
    statustest::SystemRoot::WriteFile(logJournal, "");
    JobLogManager log(logJournal);
    ASSERT_TRUE(status.Parse() == 1 && log.Parse() == 0) << "an empty log journal ends the first read";
    const HotFolderSimulator::Totals totals = simulator.Run();
    EXPECT_TRUE(totals.failed > 0 && totals.succeeded > 0 && totals.journalErrors == 0);
    EXPECT_EQ(totals.started, totals.succeeded + totals.failed);
    EXPECT_EQ(wxFileName::GetSize(root.JournalPath()), 0);

    // After the first read the log model takes in only whole ADDED lines of new keys: every
    // finished job is logged so, in a hot folder the data source names.
    ASSERT_EQ(log.Parse(), 1);
    std::vector<JobRecord> records;
    log.GetAllRecords(records);
    EXPECT_EQ(records.size(), totals.started);
    for (const JobRecord& job : records)
        EXPECT_TRUE(job[LogField::FilePath].StartsWith(job[LogField::HotFolderPath] + "/") &&
                    job[LogField::DosTime].IsNumber());
    wxArrayString hotFolders, failedFolders = log.GetErrorFolders();
    WyxDataSource::GetInstance().GetHotFoldersList(hotFolders);
    for (const wxString& folder : hotFolders)
        EXPECT_EQ(wxFileName::FileExists(folder + "/[_KELVO_HotFolder_]/Error.er"),
                  failedFolders.Index(folder) != wxNOT_FOUND && (failedFolders.Remove(folder), true))
            << folder;
    EXPECT_TRUE(failedFolders.empty()) << "a failed job in a folder the data source does not list";
}

} // namespace
