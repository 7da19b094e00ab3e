#pragma once

// The built program started as a user starts it, and the X display it shows
// its window on: shared by the process tests and the end-to-end benchmarks.
// Include after GoogleTest: Xlib's macros (None, Bool, Status) break its headers.
#include <X11/Xatom.h>
#include <X11/Xlib.h>
#include <X11/Xutil.h>

#include <grp.h>
#include <poll.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <optional>
#include <string>
#include <vector>

namespace programtest
{

// One started copy of the program.
class Program
{
public:
    // uid: run as that user (and group) instead of the current one.
    Program(const std::string& program, const std::vector<std::string>& environment,
            std::optional<uid_t> uid = std::nullopt, const std::vector<std::string>& arguments = {})
    {
        std::vector<char*> envp;
        for (const std::string& entry : environment)
            envp.push_back(const_cast<char*>(entry.c_str()));
        envp.push_back(nullptr);
        std::vector<char*> argv = {const_cast<char*>(program.c_str())};
        for (const std::string& argument : arguments)
            argv.push_back(const_cast<char*>(argument.c_str()));
        argv.push_back(nullptr);
        m_pid = ::fork();
        if (m_pid == 0)
        {
            if (uid && (::setgroups(0, nullptr) != 0 || ::setgid(*uid) != 0 || ::setuid(*uid) != 0))
                ::_exit(126);
            ::execve(argv[0], argv.data(), envp.data());
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

inline int IgnoreXErrors(Display*, XErrorEvent*)
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

    // The brightness (0 to 255) of each pixel of a rectangle of the window, row by row.
    std::vector<unsigned char> Brightness(Window window, int x, int y, int width, int height)
    {
        std::vector<unsigned char> levels;
        XImage* image = XGetImage(m_display, window, x, y, width, height, AllPlanes, ZPixmap);
        if (image == nullptr)
            return levels;
        const Visual* visual = DefaultVisual(m_display, DefaultScreen(m_display));
        const auto channel = [](unsigned long pixel, unsigned long mask)
        {
            unsigned long value = pixel & mask;
            while (mask != 0 && (mask & 1) == 0)
            {
                mask >>= 1;
                value >>= 1;
            }
            return mask ? static_cast<unsigned>(value * 255 / mask) : 0u;
        };
        levels.reserve(static_cast<size_t>(width) * height);
        for (int row = 0; row < height; ++row)
            for (int column = 0; column < width; ++column)
            {
                const unsigned long pixel = XGetPixel(image, column, row);
                levels.push_back(static_cast<unsigned char>((channel(pixel, visual->red_mask) +
                                                             channel(pixel, visual->green_mask) +
                                                             channel(pixel, visual->blue_mask)) /
                                                            3));
            }
        XDestroyImage(image);
        return levels;
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

} // namespace programtest
