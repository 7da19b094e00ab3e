// The program as a user meets it: started on the X display the tests run on
// (Xvfb, without a window manager), closed through the window's close request.
#include <gtest/gtest.h>

#include <pwd.h>
#include <sys/inotify.h>

#include "ProgramSandbox.h"
#include "WaitUntil.h"

namespace
{

namespace fs = std::filesystem;
using programtest::Program;

// Two copies in turn (the jobs they show are tests/automation's, a second
// launch while one runs is tests/install's). The first is killed, and its lock
// files keep no later copy from starting. The next, with FIFOs planted where
// the journals' locks and the log journal belong, opens them on each poll and
// still closes.
TEST(ProgramTest, StartsDespiteAKilledCopysLocksAndClosesDespitePlantedFifos)
{
    programtest::Sandbox box;
    ASSERT_TRUE(box.Ready()) << "run the tests under xvfb-run -a";
    box.folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsStatusFile.txt", "");
    Program killed(WYX_PROGRAM, box.environment);
    ASSERT_NE(box.WaitForWindow(killed), 0u);
    ::kill(killed.Pid(), SIGKILL);
    killed.Wait();
    // Whatever a lock file says now (here: the id of a live process of this
    // user, as after the killed copy's id was given to another process).
    const std::string name = std::string("WyxProgress-") + ::getpwuid(::geteuid())->pw_name;
    for (const std::string& leftover : {"home/run/" + name + ".lock", "home/" + name})
        box.folder.Write(leftover, std::to_string(::getpid()) + "\n");

    const fs::path locks = box.folder.Path() / "root/dev/shm";
    fs::create_directories(locks);
    const int watch = ::inotify_init1(IN_NONBLOCK | IN_CLOEXEC);
    for (const fs::path& fifo : {locks / "TiveraJobsStatusFile.lock", locks / "TiveraJobsLogFile.lock",
                                 box.folder.Path() / "root/var/lib/Corvane/HotFolders/TiveraJobsLogFile.txt"})
    {
        fs::remove(fifo); // the killed copy's lock file
        ASSERT_EQ(::mkfifo(fifo.c_str(), 0666), 0) << fifo;
        ASSERT_GE(::inotify_add_watch(watch, fifo.c_str(), IN_OPEN), 0) << fifo;
    }
    Program next(WYX_PROGRAM, box.environment);
    const Window window = box.WaitForWindow(next);
    ASSERT_NE(window, 0u);
    EXPECT_EQ(box.x.Title(window), "Kelvo Duv Ureruve - Status & Log");
    // A few polls, each opening the FIFOs (a watched file's events carry no name).
    std::size_t opens = 0;
    WaitUntil(
        [&]
        {
            inotify_event events[16];
            const ssize_t got = ::read(watch, events, sizeof events);
            opens += got > 0 ? static_cast<std::size_t>(got) / sizeof(inotify_event) : 0;
            return opens >= 6 || next.HasEnded();
        },
        60000);
    ::close(watch);
    EXPECT_GE(opens, 6u);
    box.Close(next, window);
}

} // namespace
