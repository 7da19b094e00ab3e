// The program as a user meets it: started on the X display the tests run on
// (Xvfb, without a window manager), closed through the window's close request.
#include <gtest/gtest.h>

#include <pwd.h>
#include <sys/inotify.h>
#include <sys/stat.h>

#include <algorithm>
#include <fstream>
#include <optional>
#include <sstream>
#include <string>
#include <vector>

#include "ProgramSession.h"
#include "TempFolder.h"

namespace fs = std::filesystem;
using programtest::Program;
using programtest::XSession;
using Strings = std::vector<std::string>;

const char* const kTitle = "Kelvo Duv Ureruve - Status & Log";

// A private system root, home and runtime folder for the copies of one test.
class ProgramTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        ASSERT_TRUE(x.IsOpen()) << "no X display: run the tests under xvfb-run -a";
        ::chmod(folder.Path().c_str(), 0755); // readable by another user, for the test that starts one
        fs::create_directories(Data());
        std::ofstream(Data() / "TiveraJobsStatusFile.txt").flush();
    }

    fs::path Data() const { return folder.Path() / "root/var/lib/Corvane/HotFolders"; }

    // The environment of a copy whose home folder is home (below the test folder).
    Strings Environment(const std::string& home, std::optional<uid_t> owner = std::nullopt)
    {
        const fs::path homePath = folder.Path() / home, runtime = homePath / "run";
        fs::create_directories(runtime);
        ::chmod(runtime.c_str(), 0700);
        Strings environment = {"HOME=" + homePath.string(),
                               "WYX_SYSTEM_ROOT=" + (folder.Path() / "root").string(),
                               "XDG_CONFIG_HOME=" + (homePath / ".config").string(),
                               "XDG_STATE_HOME=" + (homePath / ".local/state").string(),
                               "XDG_RUNTIME_DIR=" + runtime.string(),
                               "NO_AT_BRIDGE=1",
                               "GDK_BACKEND=x11",
                               "LANG=C.UTF-8",
                               "WYX_TEST_CRASH_LOG=" + crashLog.string()};
        for (const char* name : {"DISPLAY", "PATH"})
            if (const char* value = ::getenv(name))
                environment.push_back(std::string(name) + "=" + value);
        if (const char* authority = ::getenv("XAUTHORITY"))
        {
            // The other user cannot read root's copy of the display's cookie.
            fs::copy_file(authority, homePath / ".Xauthority", fs::copy_options::overwrite_existing);
            environment.push_back("XAUTHORITY=" + (homePath / ".Xauthority").string());
        }
        for (const auto& entry : fs::recursive_directory_iterator(homePath))
            if (owner)
                ::chown(entry.path().c_str(), *owner, *owner);
        if (owner)
            ::chown(homePath.c_str(), *owner, *owner);
        return environment;
    }

    // The program with its libraries and files in a folder every user can
    // read: the build folder may sit below a home that others cannot enter.
    fs::path InstalledCopy()
    {
        const fs::path program = WYX_PROGRAM, target = folder.Path() / "bin";
        fs::create_directories(target);
        for (const auto& entry : fs::directory_iterator(program.parent_path()))
        {
            const std::string name = entry.path().filename().string(),
                              extension = entry.path().extension().string();
            if (entry.is_regular_file() &&
                (name == program.filename() || name.find(".so") != std::string::npos || extension == ".cfg" ||
                 extension == ".ico"))
                fs::copy_file(entry.path(), target / name);
        }
        ::chmod(target.c_str(), 0755);
        return target / program.filename();
    }

    std::string CrashCalls() const
    {
        std::stringstream text;
        text << std::ifstream(crashLog).rdbuf();
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
    fs::path crashLog = folder.Path() / "crash-calls.log";
    XSession x;
};

TEST_F(ProgramTest, OpensTheTitledWindowBesideAnotherUsersAndAKilledCopyDoesNotKeepTheNextFromStarting)
{
    const Strings environment = Environment("home");
    {
        Program first(WYX_PROGRAM, environment);
        const Window window = x.WaitForWindow(first);
        ASSERT_NE(window, 0u) << "no window: the program " << first.Outcome();
        EXPECT_EQ(x.Title(window), kTitle);
        // 800 x 600 at the original platform's font, wider for this one's.
        EXPECT_GE(x.Attributes(window).width, 800);
        EXPECT_GE(x.Attributes(window).height, 600);

        // One copy per user (a second launch is in tests/install), but another
        // user runs a copy of its own beside the first.
        if (::geteuid() == 0)
        {
            Program other(InstalledCopy().string(), Environment("other-home", 65534), 65534);
            const Window otherWindow = x.WaitForWindow(other);
            ASSERT_NE(otherWindow, 0u) << "no window: the other user's copy " << other.Outcome();
            EXPECT_EQ(x.Title(otherWindow), kTitle);
            CloseAndExpectCleanExit(other, otherWindow);
        }
        ::kill(first.Pid(), SIGKILL);
        first.Wait();
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

TEST_F(ProgramTest, TheCrashReporterIsInstalledAtStartAndUninstalledAtExitAndAPartialOneNeverCalled)
{
    for (const auto& [library, atStart, atExit] :
         {std::tuple<std::string, std::string, std::string>{WYX_FULL_REPORTER, "install\n",
                                                            "install\nuninstall\n"},
          {WYX_PARTIAL_REPORTER, "", ""}})
    {
        fs::remove(crashLog);
        folder.Write("root/etc/kelvo/registry.ini", "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=" +
                                                        fs::path(library).parent_path().string() + "\n");
        Program program(WYX_PROGRAM, Environment("home"));
        const Window window = x.WaitForWindow(program);
        ASSERT_NE(window, 0u) << "no window: the program " << program.Outcome();
        EXPECT_EQ(CrashCalls(), atStart) << library;
        CloseAndExpectCleanExit(program, window);
        EXPECT_EQ(CrashCalls(), atExit) << library;
    }
}

// Another process writes the status journal; the running program shows the job
// and takes it away again, on the display, within a few polls.
class ProgramWithJournalTest : public ProgramTest
{
protected:
    int Journal(const Strings& arguments)
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
    const fs::path locks = folder.Path() / "root/dev/shm";
    fs::create_directories(locks);
    const int watch = ::inotify_init1(IN_NONBLOCK | IN_CLOEXEC);
    for (const fs::path& fifo : {locks / "TiveraJobsStatusFile.lock", locks / "TiveraJobsLogFile.lock",
                                 Data() / "TiveraJobsLogFile.txt"})
    {
        ASSERT_EQ(::mkfifo(fifo.c_str(), 0666), 0) << fifo;
        ASSERT_GE(::inotify_add_watch(watch, fifo.c_str(), IN_OPEN), 0) << fifo;
    }
    Program program(WYX_PROGRAM, Environment("home"));
    const Window window = x.WaitForWindow(program);
    ASSERT_NE(window, 0u) << "no window: the program " << program.Outcome();
    // A few polls, each opening the FIFOs (a watched file's events carry no name).
    std::size_t opens = 0;
    for (int wait = 0; wait < 3000 && opens < 6 && !program.HasEnded(); ++wait)
    {
        inotify_event events[16];
        const ssize_t got = ::read(watch, events, sizeof events);
        opens += got > 0 ? static_cast<std::size_t>(got) / sizeof(inotify_event) : 0;
        if (got <= 0)
            ::usleep(20000);
    }
    ::close(watch);
    EXPECT_GE(opens, 6u);
    EXPECT_FALSE(program.HasEnded());
    CloseAndExpectCleanExit(program, window);
}
