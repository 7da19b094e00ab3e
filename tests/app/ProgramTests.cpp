// The program as a user meets it: started on the X display the tests run on
// (Xvfb, without a window manager), closed through the window's close request.
#include <gtest/gtest.h>

#include <pwd.h>
#include <sys/inotify.h>

#include <algorithm>
#include <sstream>
#include <utility>

#include "ProgramSandbox.h"

namespace
{

namespace fs = std::filesystem;
using programtest::Program;

class ProgramTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        ASSERT_TRUE(box.Ready());
        box.folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsStatusFile.txt", "");
        box.environment.push_back("WYX_TEST_CRASH_LOG=" + (box.folder.Path() / "crash-calls.log").string());
    }

    // Starts the program; its window (0, with a failure, when it ended first).
    Window Start(std::unique_ptr<Program>& program)
    {
        program = std::make_unique<Program>(WYX_PROGRAM, box.environment);
        const Window window = box.WaitForWindow(*program);
        EXPECT_TRUE(window == 0 || box.x.Title(window) == "Kelvo Duv Ureruve - Status & Log")
            << box.x.Title(window);
        return window;
    }

    std::string CrashCalls() const
    {
        std::stringstream text;
        text << std::ifstream(box.folder.Path() / "crash-calls.log").rdbuf();
        return text.str();
    }

    // The "No." column of the Status table and the footer beneath it, as the display shows them,
    // once it differs from `before` (a bounded number of polls).
    std::vector<unsigned char> NumberColumn(Window window, const std::vector<unsigned char>& before = {})
    {
        std::vector<unsigned char> now;
        for (int poll = 0; poll < 300 && (now.empty() || now == before); ++poll, ::usleep(20000))
            now = box.x.Brightness(window, 4, 0, 30, box.x.Attributes(window).height);
        return now;
    }

    programtest::Sandbox box;
};

long Dark(const std::vector<unsigned char>& levels)
{
    return std::count_if(levels.begin(), levels.end(), [](unsigned char level) { return level < 128; });
}

// The titled window opens (a second launch is in tests/install); a killed
// copy's lock files keep no later copy from starting; and a job another process
// writes into the status journal becomes a row on the display and leaves with it.
TEST_F(ProgramTest, OpensTheWindowDespiteAKilledCopysLocksAndShowsTheJobsAnotherProcessWrites)
{
    std::unique_ptr<Program> first, next;
    const Window window = Start(first);
    ASSERT_NE(window, 0u);
    // 800 x 600 at the original platform's font, wider for this one's.
    EXPECT_GE(box.x.Attributes(window).width, 800);
    EXPECT_GE(box.x.Attributes(window).height, 600);
    ::kill(first->Pid(), SIGKILL);
    first->Wait();
    // Whatever a lock file says now (here: the id of a live process of this
    // user, as after the killed copy's id was given to another process).
    const std::string name = std::string("WyxProgress-") + ::getpwuid(::geteuid())->pw_name;
    for (const std::string& leftover : {"home/run/" + name + ".lock", "home/" + name})
        box.folder.Write(leftover, std::to_string(::getpid()) + "\n");
    const Window nextWindow = Start(next);
    ASSERT_NE(nextWindow, 0u);

    // Steady once two pictures a poll apart agree.
    std::vector<unsigned char> empty = NumberColumn(nextWindow), before;
    for (int poll = 0; poll < 100 && before != empty; ++poll)
    {
        ::usleep(300000);
        before = std::exchange(empty, NumberColumn(nextWindow));
    }
    ASSERT_EQ(box.Run(WYX_JOURNAL,
                      {"status", "add",
                       "42\t/srv/in/Proofs\t/srv/in/Proofs/a.pdf\tPRN-01\t1383035055\tQueued\t4096\tPDF"}),
              0);
    const std::vector<unsigned char> shown = NumberColumn(nextWindow, empty);
    EXPECT_GT(Dark(shown), Dark(empty)) << "row 1 appeared";
    ASSERT_EQ(box.Run(WYX_JOURNAL, {"status", "delete", "42"}), 0);
    EXPECT_EQ(NumberColumn(nextWindow, shown), empty) << "the row went and the footer counts 0 again";
    box.Close(*next, nextWindow);
}

// The crash reporter is installed at the start and uninstalled at the exit (one
// without the uninstall entry is never called: PlatformTests). FIFOs planted
// where the locks and the log journal belong are opened on each poll, and keep
// nothing from closing.
TEST_F(ProgramTest, TheCrashReporterIsInstalledAndUninstalledAndPlantedFifosKeepNothingFromClosing)
{
    const fs::path locks = box.folder.Path() / "root/dev/shm";
    fs::create_directories(locks);
    const int watch = ::inotify_init1(IN_NONBLOCK | IN_CLOEXEC);
    for (const fs::path& fifo : {locks / "TiveraJobsStatusFile.lock", locks / "TiveraJobsLogFile.lock",
                                 box.folder.Path() / "root/var/lib/Corvane/HotFolders/TiveraJobsLogFile.txt"})
    {
        ASSERT_EQ(::mkfifo(fifo.c_str(), 0666), 0) << fifo;
        ASSERT_GE(::inotify_add_watch(watch, fifo.c_str(), IN_OPEN), 0) << fifo;
    }
    box.folder.Write("root/etc/kelvo/registry.ini", "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=" +
                                                        fs::path(WYX_FULL_REPORTER).parent_path().string() +
                                                        "\n");
    std::unique_ptr<Program> program;
    const Window window = Start(program);
    ASSERT_NE(window, 0u);
    EXPECT_EQ(CrashCalls(), "install\n");
    // A few polls, each opening the FIFOs (a watched file's events carry no name).
    std::size_t opens = 0;
    for (int wait = 0; wait < 3000 && opens < 6 && !program->HasEnded(); ++wait)
    {
        inotify_event events[16];
        const ssize_t got = ::read(watch, events, sizeof events);
        opens += got > 0 ? static_cast<std::size_t>(got) / sizeof(inotify_event) : 0;
        if (got <= 0)
            ::usleep(20000);
    }
    ::close(watch);
    EXPECT_GE(opens, 6u);
    box.Close(*program, window);
    EXPECT_EQ(CrashCalls(), "install\nuninstall\n");
}

} // namespace
