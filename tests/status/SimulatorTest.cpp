#include <gtest/gtest.h>

#include <wx/filename.h>

#include "StatusTestSupport.h"
#include "data/JobLogManager.h"
#include "data/JobStatusManager.h"
#include "tools/simulator/HotFolderSimulator.h"

namespace
{

const auto* const kWx = testing::AddGlobalTestEnvironment(new wyxtest::WxEnvironment);

// Half the jobs fail: each failed one marks its hot folder, and every job
// finished removes its line from the status journal again.
TEST(Simulator, WritesWellFormedTrafficThatTheModelsRead)
{
    statustest::SystemRoot root;
    // 200 jobs a second for 0.25 s, half failing, 0.005 s in each stage. The seed is fixed, but which
    // draw decides a job's failure follows the timing of arrivals and stages, so it takes about 50
    // jobs, not 10, before all of them failing, or none, is no longer a chance a loaded machine meets.
    const SimulatorOptions options{200, 0.25, 0.5, 0.005, 0, true, "", root.Path() + "/srv/hotfolders"};
    HotFolderSimulator simulator(options, [] { return false; });
    wxString problem;
    ASSERT_TRUE(simulator.Prepare(problem)) << problem;
    JobStatusManager status(root.JournalPath()); // the program's data directory, as the simulator's
    const wxString logJournal = simulator.DataDirectory() + "TiveraJobsLogFile.txt";
    statustest::SystemRoot::WriteFile(logJournal, "");
    JobLogManager log(logJournal);
    ASSERT_TRUE(status.Parse() == 1 && log.Parse() == 0) << "an empty log journal ends the first read";
    const HotFolderSimulator::Totals totals = simulator.Run();
    EXPECT_TRUE(totals.failed > 0 && totals.succeeded > 0 && totals.journalErrors == 0)
        << totals.succeeded << " succeeded, " << totals.failed << " failed, " << totals.journalErrors
        << " journal errors";
    EXPECT_EQ(wxFileName::GetSize(root.JournalPath()), 0);

    // After the first read the log model takes in only whole ADDED lines of new keys: every
    // finished job is logged so, and each failed one names a folder with its marker.
    ASSERT_EQ(log.Parse(), 1);
    EXPECT_EQ(log.GetRecordCount(), totals.started);
    const wxArrayString failedFolders = log.GetErrorFolders();
    EXPECT_FALSE(failedFolders.empty());
    for (const wxString& folder : failedFolders)
        EXPECT_TRUE(wxFileName::FileExists(folder + "/[_KELVO_HotFolder_]/Error.er")) << folder;
}

} // namespace
