// The program as a user meets it: started on the X display the tests run on
// (Xvfb, without a window manager), closed through the window's close request.
#include <gtest/gtest.h>

// After GoogleTest: Xlib's macros (None, Bool, Status) would break its headers.
#include <X11/Xatom.h>
#include <X11/Xlib.h>
#include <X11/Xutil.h>

#include <grp.h>
#include <poll.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstring>
#include <fstream>
#include <optional>
#include <sstream>
#include <string>
#include <vector>

#include "TempFolder.h"

extern char** environ;

namespace
{

const char* const kTitle = "Kelvo Duv Ureruve - Status & Log";
constexpr uid_t kOtherUser = 65534;

// One started copy of the program.
class Program
{
public:
    // uid: run as that user (and group) instead of the current one.
    Program(const std::vector<std::string>& environment, std::optional<uid_t> uid = std::nullopt,
            const std::string& program = WYX_PROGRAM)
    {
        std::vector<char*> envp;
        for (const std::string& entry : environment)
            envp.push_back(const_cast<char*>(entry.c_str()));
        envp.push_back(nullptr);
        char* argv[] = {const_cast<char*>(program.c_str()), nullptr};
        m_pid = ::fork();
        if (m_pid == 0)
        {
            if (uid && (::setgroups(0, nullptr) != 0 || ::setgid(*uid) != 0 || ::setuid(*uid) != 0))
                ::_exit(126);
            ::execve(argv[0], argv, envp.data());
            ::_exit(127);
        }
    }
    ~Program()
    {
        if (m_pid > 0 && !m_status)
        {
            ::kill(m_pid, SIGKILL);
            Wait();
        }
    }
    Program(const Program&) = delete;
    Program& operator=(const Program&) = delete;

    pid_t Pid() const { return m_pid; }

    // Blocks until the process ends; its wait status.
    int Wait()
    {
        while (!m_status)
        {
            int status = 0;
            if (::waitpid(m_pid, &status, 0) == m_pid)
                m_status = status;
            else if (errno != EINTR)
                m_status = -1;
        }
        return *m_status;
    }

    // How the process ended, for failure messages.
    std::string Outcome()
    {
        if (!HasEnded())
            return "still running";
        const int status = *m_status;
        if (WIFEXITED(status))
            return "ended with exit code " + std::to_string(WEXITSTATUS(status));
        if (WIFSIGNALED(status))
            return "ended by signal " + std::to_string(WTERMSIG(status));
        return "ended with wait status " + std::to_string(status);
    }

    bool HasEnded()
    {
        int status = 0;
        if (!m_status && ::waitpid(m_pid, &status, WNOHANG) == m_pid)
            m_status = status;
        return m_status.has_value();
    }

private:
    pid_t m_pid = -1;
    std::optional<int> m_status;
};

int IgnoreXErrors(Display*, XErrorEvent*)
{
    return 0;
}

// A connection to the display that watches top-level windows appear.
class XSession
{
public:
    XSession() : m_display(XOpenDisplay(nullptr))
    {
        if (m_display == nullptr)
            return;
        XSetErrorHandler(IgnoreXErrors);
        XSelectInput(m_display, DefaultRootWindow(m_display), SubstructureNotifyMask);
        XSync(m_display, False);
    }
    ~XSession()
    {
        if (m_display != nullptr)
            XCloseDisplay(m_display);
    }
    XSession(const XSession&) = delete;
    XSession& operator=(const XSession&) = delete;

    bool IsOpen() const { return m_display != nullptr; }

    // The mapped top-level window of the program, once there is one; 0 when
    // the program ended first.
    Window WaitForWindow(Program& program)
    {
        while (true)
        {
            if (const Window window = MappedWindowOf(program.Pid()))
                return window;
            if (program.HasEnded())
                return 0;
            WaitForEvents();
        }
    }

    std::string Title(Window window)
    {
        const std::string utf8 = TextProperty(window, "_NET_WM_NAME");
        if (!utf8.empty())
            return utf8;
        char* name = nullptr;
        std::string result;
        if (XFetchName(m_display, window, &name) && name != nullptr)
        {
            result = name;
            XFree(name);
        }
        return result;
    }

    XWindowAttributes Attributes(Window window)
    {
        XWindowAttributes attributes{};
        XGetWindowAttributes(m_display, window, &attributes);
        return attributes;
    }

    // What a window manager sends when the user clicks the close button.
    void RequestClose(Window window)
    {
        XEvent event{};
        event.xclient.type = ClientMessage;
        event.xclient.window = window;
        event.xclient.message_type = XInternAtom(m_display, "WM_PROTOCOLS", False);
        event.xclient.format = 32;
        event.xclient.data.l[0] = static_cast<long>(XInternAtom(m_display, "WM_DELETE_WINDOW", False));
        event.xclient.data.l[1] = CurrentTime;
        XSendEvent(m_display, window, False, NoEventMask, &event);
        XFlush(m_display);
    }

private:
    void WaitForEvents()
    {
        XFlush(m_display);
        pollfd connection{ConnectionNumber(m_display), POLLIN, 0};
        // The timeout only lets the caller notice a program that ended.
        ::poll(&connection, 1, 100);
        while (XPending(m_display) > 0)
        {
            XEvent event;
            XNextEvent(m_display, &event);
        }
    }

    Window MappedWindowOf(pid_t pid)
    {
        Window root = 0, parent = 0;
        Window* children = nullptr;
        unsigned int count = 0;
        Window found = 0;
        if (!XQueryTree(m_display, DefaultRootWindow(m_display), &root, &parent, &children, &count))
            return 0;
        for (unsigned int i = 0; i < count && found == 0; ++i)
        {
            XWindowAttributes attributes{};
            if (XGetWindowAttributes(m_display, children[i], &attributes) &&
                attributes.map_state == IsViewable && !attributes.override_redirect &&
                PidOf(children[i]) == pid)
                found = children[i];
        }
        if (children != nullptr)
            XFree(children);
        return found;
    }

    pid_t PidOf(Window window)
    {
        Atom type = 0;
        int format = 0;
        unsigned long items = 0, remaining = 0;
        unsigned char* data = nullptr;
        pid_t pid = 0;
        if (XGetWindowProperty(m_display, window, XInternAtom(m_display, "_NET_WM_PID", False), 0, 1, False,
                               XA_CARDINAL, &type, &format, &items, &remaining, &data) == Success &&
            data != nullptr && items == 1 && format == 32)
            pid = static_cast<pid_t>(*reinterpret_cast<unsigned long*>(data));
        if (data != nullptr)
            XFree(data);
        return pid;
    }

    std::string TextProperty(Window window, const char* property)
    {
        Atom type = 0;
        int format = 0;
        unsigned long items = 0, remaining = 0;
        unsigned char* data = nullptr;
        std::string text;
        if (XGetWindowProperty(m_display, window, XInternAtom(m_display, property, False), 0, 1024, False,
                               AnyPropertyType, &type, &format, &items, &remaining, &data) == Success &&
            data != nullptr && format == 8)
            text.assign(reinterpret_cast<char*>(data), items);
        if (data != nullptr)
            XFree(data);
        return text;
    }

    Display* m_display;
};

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
    Program program(Environment("home"));
    const Window window = x.WaitForWindow(program);
    ASSERT_NE(window, 0u) << "no window: the program " << program.Outcome();

    EXPECT_EQ(x.Title(window), kTitle);
    const XWindowAttributes attributes = x.Attributes(window);
    EXPECT_EQ(attributes.width, 800);
    EXPECT_EQ(attributes.height, 600);

    CloseAndExpectCleanExit(program, window);
}

TEST_F(ProgramTest, ASecondCopyOfTheSameUserEndsAtOnceWithoutAWindow)
{
    const std::vector<std::string> environment = Environment("home");
    Program first(environment);
    const Window window = x.WaitForWindow(first);
    ASSERT_NE(window, 0u) << "no window: the program " << first.Outcome();

    Program second(environment);
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

TEST_F(ProgramTest, AnotherUserRunsItsOwnCopyBesideTheFirst)
{
    if (::geteuid() != 0)
        GTEST_SKIP() << "starting a copy as another user needs root";
    Program first(Environment("home"));
    const Window firstWindow = x.WaitForWindow(first);
    ASSERT_NE(firstWindow, 0u) << "no window: the program " << first.Outcome();

    Program other(Environment("other-home", kOtherUser), kOtherUser, InstalledCopy().string());
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
    Program program(Environment("home"));
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
    Program program(Environment("home"));
    const Window window = x.WaitForWindow(program);
    ASSERT_NE(window, 0u) << "no window: the program " << program.Outcome();
    CloseAndExpectCleanExit(program, window);
    EXPECT_EQ(CrashCalls(), "");
}

} // namespace
