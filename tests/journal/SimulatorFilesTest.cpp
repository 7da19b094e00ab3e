// The service simulator writes its files as a service in a shared folder must:
// never through what another user planted, and it says when writes failed.
#include <filesystem>
#include <string>
#include <vector>

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include "JournalTestSupport.h"
#include "tools/simulator/HotFolderSimulator.h"
#include "tools/simulator/SimulatorOptions.h"

namespace journaltest
{
namespace
{

namespace fs = std::filesystem;

const std::string kVictim = "not the simulator's\n";

class SimulatorFiles : public JournalTest
{
protected:
    std::string HotFolderRoot() const { return Root() + "/srv/hotfolders"; }
    std::string Victim() const { return Root() + "/victim.txt"; }

    SimulatorOptions Options() const
    {
        SimulatorOptions options;
        options.jobsPerSecond = 200;
        options.durationSeconds = 0.1;
        options.stepSeconds = 0.002;
        options.failureShare = 1;
        options.seed = 7;
        options.seedGiven = true;
        options.dataDirectory = DataDirectory();
        options.hotFolderRoot = HotFolderRoot();
        return options;
    }

    static HotFolderSimulator Simulator(const SimulatorOptions& options)
    {
        return HotFolderSimulator(options, [] { return false; });
    }

    // The service subfolders of every hot folder Prepare made.
    std::vector<std::string> ServiceFolders() const
    {
        std::vector<std::string> folders;
        for (const auto& entry : fs::recursive_directory_iterator(HotFolderRoot()))
            if (entry.is_directory() && entry.path().filename() == "[_KELVO_HotFolder_]")
                folders.push_back(entry.path().string());
        return folders;
    }
};

TEST_F(SimulatorFiles, ALinkAtTheOldTemporaryNameOfHotFoldersIniIsLeftAlone)
{
    WriteBytes(Victim(), kVictim);
    fs::create_symlink(Victim(), DataDirectory() + "HotFolders.ini.new");

    wxString problem;
    ASSERT_TRUE(Simulator(Options()).Prepare(problem)) << problem;
    EXPECT_EQ(ReadBytes(Victim()), kVictim);
    EXPECT_TRUE(fs::is_regular_file(fs::symlink_status(DataDirectory() + "HotFolders.ini")));
    EXPECT_NE(ReadBytes(DataDirectory() + "HotFolders.ini").find("[Servers]"), std::string::npos);
}

TEST_F(SimulatorFiles, AnotherUsersLinkInPlaceOfHotFoldersIniIsNotWrittenThrough)
{
    if (::geteuid() != 0)
        GTEST_SKIP() << "only root can give a link to another user";
    WriteBytes(Victim(), kVictim);
    const std::string ini = DataDirectory() + "HotFolders.ini";
    fs::create_symlink(Victim(), ini);
    ASSERT_EQ(::lchown(ini.c_str(), 4321, 4321), 0);

    wxString problem;
    EXPECT_FALSE(Simulator(Options()).Prepare(problem));
    EXPECT_EQ(ReadBytes(Victim()), kVictim);
}

TEST_F(SimulatorFiles, ErrorMarkersAreNeverWrittenThroughALink)
{
    WriteBytes(Victim(), kVictim);
    HotFolderSimulator simulator = Simulator(Options());
    wxString problem;
    ASSERT_TRUE(simulator.Prepare(problem)) << problem;
    const std::vector<std::string> folders = ServiceFolders();
    ASSERT_FALSE(folders.empty());
    for (const std::string& folder : folders)
        fs::create_symlink(Victim(), folder + "/Error.er");

    const HotFolderSimulator::Totals totals = simulator.Run();
    ASSERT_GT(totals.failed, 0u);
    EXPECT_EQ(totals.markerErrors, totals.failed);
    EXPECT_EQ(totals.journalErrors, 0u);
    EXPECT_FALSE(totals.AllWritten());
    EXPECT_EQ(ReadBytes(Victim()), kVictim);
}

// --- the program's exit status ------------------------------------------------------------

int RunSimulator(const std::vector<std::string>& arguments)
{
    std::string command = "exec " + ShellQuoted(WYX_SIMULATOR_TOOL);
    for (const std::string& argument : arguments)
        command += " " + ShellQuoted(argument);
    command += " > /dev/null 2>&1";
    const int status = std::system(command.c_str());
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

struct ExitCase
{
    const char* name;
    bool journalIsAFolder;
    int status;
};

class SimulatorExit : public SimulatorFiles, public ::testing::WithParamInterface<ExitCase>
{
};

TEST_P(SimulatorExit, TellsWhetherEveryWriteWasMade)
{
    if (GetParam().journalIsAFolder)
        fs::create_directories(StatusJournal());
    EXPECT_EQ(RunSimulator({"--rate", "200/s", "--duration", "0.1", "--step-seconds", "0.002", "--seed", "7",
                            "--data-dir", DataDirectory(), "--hotfolder-root", HotFolderRoot()}),
              GetParam().status);
}

INSTANTIATE_TEST_SUITE_P(Runs, SimulatorExit,
                         ::testing::Values(ExitCase{"EveryWriteMade", false, 0},
                                           ExitCase{"StatusJournalIsAFolder", true, 3}),
                         [](const ::testing::TestParamInfo<ExitCase>& info)
                         { return std::string(info.param.name); });

} // namespace
} // namespace journaltest
