// The program as a user meets it: started on the X display the tests run on
// (Xvfb, without a window manager), closed through the window's close request.
#include <gtest/gtest.h>

#include <pwd.h>
#include <sys/stat.h>

#include <algorithm>
#include <cstring>
#include <fstream>
#include <optional>
#include <sstream>
#include <string>
#include <vector>

#include "ProgramSession.h"
#include "TempFolder.h"

extern char** environ;

namespace
{

using programtest::Program;
using programtest::XSession;

const char* const kTitle = "Kelvo Duv Ureruve - Status & Log";
constexpr uid_t kOtherUser = 65534;

// A private system root, home and runtime folder for the copies of one test.
class ProgramTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        ASSERT_FALSE(folder.Path().empty());
        ASSERT_TRUE(x.IsOpen()) << "no X display: run the tests under xvfb-run -a";
        // Readable by another user, for the tests that start one.
        ::chmod(folder.Path().c_str(), 0755);
    }

    // The environment of a copy whose home folder is home (below the test folder).
    std::vector<std::string> Environment(const std::string& home, std::optional<uid_t> owner = std::nullopt)
    {
        const std::filesystem::path homePath = folder.Path() / home;
        const std::filesystem::path runtime = homePath / "run";
        std::filesystem::create_directories(runtime);
        ::chmod(runtime.c_str(), 0700);
        std::vector<std::string> environment = {
            "HOME=" + homePath.string(),
            "WYX_SYSTEM_ROOT=" + (folder.Path() / "root").string(),
            "XDG_CONFIG_HOME=" + (homePath / ".config").string(),
            "XDG_STATE_HOME=" + (homePath / ".local/state").string(),
            "XDG_RUNTIME_DIR=" + runtime.string(),
            "NO_AT_BRIDGE=1",
            "GDK_BACKEND=x11",
            "LANG=C.UTF-8",
            "WYX_TEST_CRASH_LOG=" + crashLog.string(),
        };
        for (const char* name : {"DISPLAY", "PATH"})
            if (const char* value = ::getenv(name))
                environment.push_back(std::string(name) + "=" + value);
        if (const char* authority = ::getenv("XAUTHORITY"))
        {
            // The other user cannot read root's copy of the display's cookie.
            const std::filesystem::path copy = homePath / ".Xauthority";
            std::filesystem::copy_file(authority, copy, std::filesystem::copy_options::overwrite_existing);
            environment.push_back("XAUTHORITY=" + copy.string());
        }
        if (owner)
            for (const auto& entry : std::filesystem::recursive_directory_iterator(homePath))
                ::chown(entry.path().c_str(), *owner, *owner);
        if (owner)
            ::chown(homePath.c_str(), *owner, *owner);
        return environment;
    }

    // The program with its libraries and files in a folder every user can
    // read: the build folder may sit below a home that others cannot enter.
    std::filesystem::path InstalledCopy()
    {
        const std::filesystem::path source = std::filesystem::path(WYX_PROGRAM).parent_path();
        const std::filesystem::path target = folder.Path() / "bin";
        std::filesystem::create_directories(target);
        for (const auto& entry : std::filesystem::directory_iterator(source))
        {
            const std::string name = entry.path().filename().string();
            const bool needed = name == std::filesystem::path(WYX_PROGRAM).filename().string() ||
                                name.find(".so") != std::string::npos || entry.path().extension() == ".cfg" ||
                                entry.path().extension() == ".ico";
            if (needed && entry.is_regular_file())
                std::filesystem::copy_file(entry.path(), target / name);
        }
        ::chmod(target.c_str(), 0755);
        return target / std::filesystem::path(WYX_PROGRAM).filename();
    }

    std::string CrashCalls() const
    {
        std::ifstream file(crashLog);
        std::stringstream text;
        text << file.rdbuf();
        return text.str();
    }

    void CloseAndExpectCleanExit(Program& program, Window window)
    {
        x.RequestClose(window);
        const int status = program.Wait();
        ASSERT_TRUE(WIFEXITED(status)) << "wait status " << status;
        EXPECT_EQ(WEXITSTATUS(status), 0);
    }

    TempFolder folder;
    std::filesystem::path crashLog = folder.Path() / "crash-calls.log";
    XSession x;
};

TEST_F(ProgramTest, OpensTheTitledWindowAndEndsCleanlyWhenItIsClosed)
{
    Program program(WYX_PROGRAM, Environment("home"));
    const Window window = x.WaitForWindow(program);
    ASSERT_NE(window, 0u) << "no window: the program " << program.Outcome();

    EXPECT_EQ(x.Title(window), kTitle);
    const XWindowAttributes attributes = x.Attributes(window);
    // 800 x 600 at the original platform's font, wider for this one's.
    EXPECT_GE(attributes.width, 800);
    EXPECT_GE(attributes.height, 600);

    CloseAndExpectCleanExit(program, window);
}

TEST_F(ProgramTest, ASecondCopyOfTheSameUserEndsAtOnceWithoutAWindow)
{
    const std::vector<std::string> environment = Environment("home");
    Program first(WYX_PROGRAM, environment);
    const Window window = x.WaitForWindow(first);
    ASSERT_NE(window, 0u) << "no window: the program " << first.Outcome();

    Program second(WYX_PROGRAM, environment);
    // A copy that opened its window would wait for the user; this one ends first.
    const Window secondWindow = x.WaitForWindow(second);
    EXPECT_EQ(secondWindow, 0u) << "the second copy opened a window";
    if (secondWindow != 0)
        x.RequestClose(secondWindow);
    const int status = second.Wait();
    EXPECT_TRUE(WIFEXITED(status)) << "wait status " << status;
    EXPECT_FALSE(first.HasEnded());

    CloseAndExpectCleanExit(first, window);
}

TEST_F(ProgramTest, ACopyThatWasKilledDoesNotKeepTheNextOneFromStarting)
{
    const std::vector<std::string> environment = Environment("home");
    {
        Program killed(WYX_PROGRAM, environment);
        ASSERT_NE(x.WaitForWindow(killed), 0u) << killed.Outcome();
        ::kill(killed.Pid(), SIGKILL);
        killed.Wait();
    }
    // Whatever a lock file says now (here: the id of a live process of this
    // user, as after the killed copy's id was given to another process).
    const std::string name = std::string("WyxProgress-") + ::getpwuid(::geteuid())->pw_name;
    for (const std::string& leftover : {"home/run/" + name + ".lock", "home/" + name})
        std::ofstream(folder.Path() / leftover) << ::getpid() << "\n";
    Program next(WYX_PROGRAM, environment);
    const Window window = x.WaitForWindow(next);
    ASSERT_NE(window, 0u) << "no window: the program " << next.Outcome();
    CloseAndExpectCleanExit(next, window);
}

TEST_F(ProgramTest, AnotherUserRunsItsOwnCopyBesideTheFirst)
{
    if (::geteuid() != 0)
        GTEST_SKIP() << "starting a copy as another user needs root";
    Program first(WYX_PROGRAM, Environment("home"));
    const Window firstWindow = x.WaitForWindow(first);
    ASSERT_NE(firstWindow, 0u) << "no window: the program " << first.Outcome();

    Program other(InstalledCopy().string(), Environment("other-home", kOtherUser), kOtherUser);
    const Window otherWindow = x.WaitForWindow(other);
    ASSERT_NE(otherWindow, 0u) << "no window: the program " << other.Outcome();
    EXPECT_EQ(x.Title(otherWindow), kTitle);

    CloseAndExpectCleanExit(other, otherWindow);
    CloseAndExpectCleanExit(first, firstWindow);
}

TEST_F(ProgramTest, TheCrashReporterIsInstalledAtStartAndUninstalledAtExit)
{
    const std::string libraryFolder = std::filesystem::path(WYX_FULL_REPORTER).parent_path().string();
    folder.Write("root/etc/kelvo/registry.ini",
                 "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=" + libraryFolder + "\n");
    Program program(WYX_PROGRAM, Environment("home"));
    const Window window = x.WaitForWindow(program);
    ASSERT_NE(window, 0u) << "no window: the program " << program.Outcome();
    EXPECT_EQ(CrashCalls(), "install\n");
    CloseAndExpectCleanExit(program, window);
    EXPECT_EQ(CrashCalls(), "install\nuninstall\n");
}

TEST_F(ProgramTest, AReporterLackingAnEntryIsNeverCalled)
{
    const std::string libraryFolder = std::filesystem::path(WYX_PARTIAL_REPORTER).parent_path().string();
    folder.Write("root/etc/kelvo/registry.ini",
                 "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=" + libraryFolder + "\n");
    Program program(WYX_PROGRAM, Environment("home"));
    const Window window = x.WaitForWindow(program);
    ASSERT_NE(window, 0u) << "no window: the program " << program.Outcome();
    CloseAndExpectCleanExit(program, window);
    EXPECT_EQ(CrashCalls(), "");
}

} // namespace

// Another process writes the status journal; the running program shows the job
// and takes it away again, on the display, within a few polls.
class ProgramWithJournalTest : public ProgramTest
{
protected:
    void SetUp() override
    {
        ProgramTest::SetUp();
        const std::filesystem::path data = folder.Path() / "root/var/lib/Corvane/HotFolders";
        std::filesystem::create_directories(data);
        std::ofstream(data / "TiveraJobsStatusFile.txt").flush();
    }

    int Journal(const std::vector<std::string>& arguments)
    {
        Program tool(WYX_JOURNAL, Environment("home"), std::nullopt, arguments);
        const int status = tool.Wait();
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }

    // The "No." column of the Status table and the footer beneath it, as the display shows them.
    std::vector<unsigned char> NumberColumn(Window window)
    {
        return x.Brightness(window, 4, 0, 30, x.Attributes(window).height);
    }

    // Waits, a bounded number of polls, for the column to differ from `before`.
    std::vector<unsigned char> NextPicture(Window window, const std::vector<unsigned char>& before)
    {
        std::vector<unsigned char> now = NumberColumn(window);
        for (int poll = 0; poll < 300 && now == before; ++poll)
        {
            ::usleep(20000);
            now = NumberColumn(window);
        }
        return now;
    }

    static long Dark(const std::vector<unsigned char>& levels)
    {
        return std::count_if(levels.begin(), levels.end(), [](unsigned char level) { return level < 128; });
    }
};

TEST_F(ProgramWithJournalTest, AJobWrittenByAnotherProcessBecomesARowAndLeavesWithIt)
{
    Program program(WYX_PROGRAM, Environment("home"));
    const Window window = x.WaitForWindow(program);
    ASSERT_NE(window, 0u) << program.Outcome();
    // Steady once two pictures a poll apart agree.
    std::vector<unsigned char> empty = NumberColumn(window);
    for (int poll = 0; poll < 100; ++poll)
    {
        ::usleep(300000);
        std::vector<unsigned char> again = NumberColumn(window);
        if (again == empty)
            break;
        empty = std::move(again);
    }

    ASSERT_EQ(Journal({"status", "add",
                       "42\t/srv/in/Proofs\t/srv/in/Proofs/a.pdf\tPRN-01\t1383035055\tQueued\t4096\tPDF"}),
              0);
    const std::vector<unsigned char> shown = NextPicture(window, empty);
    EXPECT_GT(Dark(shown), Dark(empty)) << "row 1 appeared";

    ASSERT_EQ(Journal({"status", "delete", "42"}), 0);
    EXPECT_EQ(NextPicture(window, shown), empty) << "the row went and the footer counts 0 again";
    CloseAndExpectCleanExit(program, window);
}

TEST_F(ProgramWithJournalTest, FifosPlantedWhereTheLocksAndAJournalBelongKeepNothingFromClosing)
{
    const std::filesystem::path locks = folder.Path() / "root/dev/shm";
    std::filesystem::create_directories(locks);
    const std::filesystem::path data = folder.Path() / "root/var/lib/Corvane/HotFolders";
    for (const std::filesystem::path& fifo : {locks / "TiveraJobsStatusFile.lock", locks / "TiveraJobsLogFile.lock",
                                              data / "TiveraJobsLogFile.txt"})
        ASSERT_EQ(::mkfifo(fifo.c_str(), 0666), 0) << fifo;
    Program program(WYX_PROGRAM, Environment("home"));
    const Window window = x.WaitForWindow(program);
    ASSERT_NE(window, 0u) << "no window: the program " << program.Outcome();
    ::usleep(2500000); // a few polls, each meeting the FIFOs
    EXPECT_FALSE(program.HasEnded());
    CloseAndExpectCleanExit(program, window);
}
