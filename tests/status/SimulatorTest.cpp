#include <gtest/gtest.h>

#include <set>
#include <string>

#include <csignal>
#include <sys/wait.h>
#include <unistd.h>

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

using statustest::SystemRoot;

const auto* const kWx = testing::AddGlobalTestEnvironment(new statustest::WxEnvironment);

wxArrayString Pieces(const wxString& line)
{
    return wxStringTokenize(line, "\t", wxTOKEN_STRTOK);
}

wxArrayString ReadJournal(const wxString& path)
{
    wyx::JobsFileReadWriter reader;
    reader.SetPath(path);
    wxArrayString lines;
    EXPECT_EQ(reader.ReadJobs(lines), wyx::JobOk) << path;
    return lines;
}

SimulatorOptions FastOptions(const SystemRoot& root)
{
    SimulatorOptions options;
    options.jobsPerSecond = 200;
    options.durationSeconds = 0.2;
    options.stepSeconds = 0.005;
    options.failureShare = 0.5;
    options.seed = 7;
    options.seedGiven = true;
    options.hotFolderRoot = root.Path() + "/srv/hotfolders";
    return options;
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
    ASSERT_TRUE(Parse("x --rate 3/s --duration 3600 --failure-share 0.5 --seed 42 --data-dir /tmp/d "
                      "--step-seconds 0.1",
                      options));
    EXPECT_DOUBLE_EQ(options.jobsPerSecond, 3);
    EXPECT_DOUBLE_EQ(options.durationSeconds, 3600);
    EXPECT_DOUBLE_EQ(options.failureShare, 0.5);
    EXPECT_DOUBLE_EQ(options.stepSeconds, 0.1);
    EXPECT_TRUE(options.seedGiven);
    EXPECT_EQ(options.seed, 42u);
    EXPECT_EQ(options.dataDirectory, "/tmp/d");

    for (const char* bad :
         {"x --rate fast", "x --rate -3", "x --rate 3/h", "x --failure-share 2", "x --duration -1",
          "x --seed -4", "x --seed 99999999999", "x --bogus 1", "x --rate", "x stray", "x --data-dir "})
        EXPECT_FALSE(Parse(bad, options)) << bad;
    double perSecond = 0;
    ASSERT_TRUE(ParseRate("30", perSecond));
    EXPECT_DOUBLE_EQ(perSecond, 0.5);
    ASSERT_TRUE(ParseRate("30/min", perSecond));
    EXPECT_DOUBLE_EQ(perSecond, 0.5);
}

TEST(Simulator, WritesWellFormedTrafficThatTheModelsRead)
{
    SystemRoot root;
    HotFolderSimulator simulator(FastOptions(root), [] { return false; });
    wxString problem;
    ASSERT_TRUE(simulator.Prepare(problem)) << problem;
    JobStatusManager status(simulator.DataDirectory() + "TiveraJobsStatusFile.txt");
    ASSERT_EQ(status.Parse(), 1);

    const HotFolderSimulator::Totals totals = simulator.Run();
    EXPECT_GT(totals.started, 10u);
    EXPECT_EQ(totals.started, totals.succeeded + totals.failed);
    EXPECT_GT(totals.failed, 0u);
    EXPECT_EQ(totals.journalErrors, 0u);

    wxArrayString hotFolders;
    wxArrayString servers;
    WyxDataSource::GetInstance().GetHotFoldersList(hotFolders);
    WyxDataSource::GetInstance().GetServersList(servers);
    EXPECT_GE(hotFolders.size(), 3u);
    EXPECT_GE(servers.size(), 3u);
    const std::set<wxString> folderSet(hotFolders.begin(), hotFolders.end());
    const std::set<wxString> serverSet(servers.begin(), servers.end());

    const wxArrayString log = ReadJournal(simulator.DataDirectory() + "TiveraJobsLogFile.txt");
    EXPECT_EQ(log.size(), totals.started);
    std::set<wxString> failedFolders;
    unsigned failed = 0;
    for (const wxString& line : log)
    {
        const wxArrayString pieces = Pieces(line);
        ASSERT_EQ(pieces.size(), 8u) << line;
        EXPECT_EQ(folderSet.count(pieces[1]), 1u) << line;
        EXPECT_TRUE(pieces[2].StartsWith(pieces[1] + "/")) << line;
        EXPECT_EQ(serverSet.count(pieces[3]), 1u) << line;
        EXPECT_TRUE(pieces[4].IsNumber()) << line;
        EXPECT_EQ(pieces[7], "ADDED");
        if (pieces[5] != "Transferred Successfully")
        {
            ++failed;
            failedFolders.insert(pieces[1]);
        }
    }
    EXPECT_EQ(failed, totals.failed);
    for (const wxString& folder : hotFolders)
        EXPECT_EQ(wxFileName::FileExists(folder + "/[_KELVO_HotFolder_]/Error.er"),
                  failedFolders.count(folder) == 1)
            << folder;

    // Every job finished and its committed line was removed again.
    EXPECT_TRUE(ReadJournal(simulator.DataDirectory() + "TiveraJobsStatusFile.txt").empty());
}

TEST(Simulator, AStopRequestEndsTheRunBetweenTwoWholeOperations)
{
    SystemRoot root;
    int checks = 0;
    SimulatorOptions options = FastOptions(root);
    options.durationSeconds = 60;
    HotFolderSimulator simulator(options, [&checks] { return ++checks > 40; });
    wxString problem;
    ASSERT_TRUE(simulator.Prepare(problem)) << problem;
    const HotFolderSimulator::Totals totals = simulator.Run();
    EXPECT_GT(totals.started, 0u);

    // What is left in progress is whole lines of nine pieces.
    JobStatusManager status(simulator.DataDirectory() + "TiveraJobsStatusFile.txt");
    for (const wxString& line : ReadJournal(simulator.DataDirectory() + "TiveraJobsStatusFile.txt"))
        EXPECT_EQ(Pieces(line).size(), 9u) << line;
    EXPECT_EQ(status.Parse(), 1);
}

#ifdef WYX_SIMULATOR_TOOL
// The program itself: started in a fresh system root, stopped by SIGTERM once
// it has said where it writes.
TEST(SimulatorProgram, StopsCleanlyOnSigterm)
{
    SystemRoot root;
    int output[2];
    ASSERT_EQ(pipe(output), 0);
    const pid_t child = fork();
    if (child == 0)
    {
        dup2(output[1], STDOUT_FILENO);
        close(output[0]);
        close(output[1]);
        execl(WYX_SIMULATOR_TOOL, WYX_SIMULATOR_TOOL, "--rate", "50/s", "--duration", "3600",
              "--step-seconds", "0.01", static_cast<char*>(nullptr));
        _exit(127);
    }
    close(output[1]);
    ASSERT_GT(child, 0);
    std::string said;
    char c = 0;
    while (said.find('\n') == std::string::npos && read(output[0], &c, 1) == 1)
        said += c;
    EXPECT_NE(said.find("writing to"), std::string::npos) << said;
    kill(child, SIGTERM);
    while (read(output[0], &c, 1) == 1)
        said += c;
    close(output[0]);
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ASSERT_TRUE(WIFEXITED(status)) << said;
    EXPECT_EQ(WEXITSTATUS(status), 0) << said;
    EXPECT_NE(said.find("(stopped)"), std::string::npos) << said;

    for (const wxString& line : ReadJournal(GetDataDirectory() + "TiveraJobsStatusFile.txt"))
        EXPECT_EQ(Pieces(line).size(), 9u) << line;
    for (const wxString& line : ReadJournal(GetDataDirectory() + "TiveraJobsLogFile.txt"))
        EXPECT_EQ(Pieces(line).size(), 8u) << line;
    wxArrayString hotFolders;
    WyxDataSource::GetInstance().GetHotFoldersList(hotFolders);
    EXPECT_FALSE(hotFolders.empty());
}
#endif

} // namespace
