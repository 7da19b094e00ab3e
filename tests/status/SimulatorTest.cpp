#include <gtest/gtest.h>

#include <set>
#include <string>

#include <wx/filename.h>
#include <wx/tokenzr.h>

#include "StatusTestSupport.h"
#include "data/JobReadWriter.h"
#include "data/JobStatusManager.h"
#include "platform/datasource/WyxDataSource.h"
#include "tools/simulator/HotFolderSimulator.h"
#include "tools/simulator/SimulatorOptions.h"

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

// Runs the option parser over a command line given as one text.
bool Parse(const char* line, SimulatorOptions& options)
{
    const wxArrayString words = wxSplit(line, ' ');
    std::vector<std::string> texts(words.begin(), words.end());
    std::vector<const char*> argv;
    for (const std::string& text : texts)
        argv.push_back(text.c_str());
    wxString problem;
    const bool parsed = ParseSimulatorOptions(static_cast<int>(argv.size()), argv.data(), options, problem);
    EXPECT_EQ(parsed, problem.empty()) << line << ": " << problem;
    return parsed;
}

TEST(SimulatorOptions, ReadsEveryOptionAndRefusesWhatItCannotRead)
{
    SimulatorOptions options;
    ASSERT_TRUE(Parse("x --rate 30/min --duration 3600 --failure-share 0.5 --seed 42 --data-dir /tmp/d "
                      "--step-seconds 0.1",
                      options));
    EXPECT_DOUBLE_EQ(options.jobsPerSecond, 0.5);
    EXPECT_DOUBLE_EQ(options.durationSeconds + options.failureShare + options.stepSeconds, 3600.6);
    EXPECT_TRUE(options.seedGiven && options.seed == 42u && options.dataDirectory == "/tmp/d");
    for (const char* bad :
         {"x --rate fast", "x --rate -3", "x --rate 3/h", "x --failure-share 2", "x --duration -1",
          "x --seed 99999999999", "x --bogus 1", "x --rate", "x stray", "x --data-dir "})
        EXPECT_FALSE(Parse(bad, options)) << bad;
}

// Half the jobs fail: each failed one marks its hot folder, and every job
// finished removes its line from the status journal again.
TEST(Simulator, WritesWellFormedTrafficThatTheModelsRead)
{
    statustest::SystemRoot root;
    SimulatorOptions options;
    options.jobsPerSecond = 200;
    options.durationSeconds = 0.05;
    options.stepSeconds = 0.005;
    options.failureShare = 0.5;
    options.seedGiven = true;
    options.hotFolderRoot = root.Path() + "/srv/hotfolders";
    HotFolderSimulator simulator(options, [] { return false; });
    wxString problem;
    ASSERT_TRUE(simulator.Prepare(problem)) << problem;
    JobStatusManager status(simulator.DataDirectory() + "TiveraJobsStatusFile.txt");
    ASSERT_EQ(status.Parse(), 1);
    const HotFolderSimulator::Totals totals = simulator.Run();
    EXPECT_GT(totals.failed, 0u);
    EXPECT_GT(totals.succeeded, 0u);
    EXPECT_EQ(totals.started, totals.succeeded + totals.failed);
    EXPECT_EQ(totals.journalErrors, 0u);

    wxArrayString hotFolders;
    WyxDataSource::GetInstance().GetHotFoldersList(hotFolders);
    EXPECT_GE(hotFolders.size(), 3u);
    const std::set<wxString> folderSet(hotFolders.begin(), hotFolders.end());
    const std::vector<wxArrayString> log = ReadJournal(simulator.DataDirectory() + "TiveraJobsLogFile.txt");
    EXPECT_EQ(log.size(), totals.started);
    std::set<wxString> failedFolders;
    for (const wxArrayString& pieces : log)
    {
        ASSERT_EQ(pieces.size(), 8u);
        EXPECT_EQ(folderSet.count(pieces[1]), 1u) << pieces[1];
        EXPECT_TRUE(pieces[2].StartsWith(pieces[1] + "/") && pieces[4].IsNumber() && pieces[7] == "ADDED")
            << pieces[2];
        if (pieces[5] != "Transferred Successfully")
            failedFolders.insert(pieces[1]);
    }
    for (const wxString& folder : hotFolders)
        EXPECT_EQ(wxFileName::FileExists(folder + "/[_KELVO_HotFolder_]/Error.er"),
                  failedFolders.count(folder) == 1)
            << folder;
    EXPECT_TRUE(ReadJournal(simulator.DataDirectory() + "TiveraJobsStatusFile.txt").empty());
}

TEST(Simulator, AStopRequestEndsTheRunBetweenTwoWholeOperations)
{
    statustest::SystemRoot root;
    SimulatorOptions options;
    options.jobsPerSecond = 200;
    options.stepSeconds = 0.005;
    options.hotFolderRoot = root.Path() + "/srv/hotfolders";
    int checks = 0;
    HotFolderSimulator simulator(options, [&checks] { return ++checks > 40; });
    wxString problem;
    ASSERT_TRUE(simulator.Prepare(problem)) << problem;
    EXPECT_GT(simulator.Run().started, 0u);
    const std::vector<wxArrayString> left =
        ReadJournal(simulator.DataDirectory() + "TiveraJobsStatusFile.txt");
    EXPECT_FALSE(left.empty());
    for (const wxArrayString& pieces : left)
        EXPECT_EQ(pieces.size(), 9u);
}

} // namespace
