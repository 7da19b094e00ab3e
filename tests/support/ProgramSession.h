#pragma once

// The built program started as a user starts it, and the X display it shows
// its window on: shared by the process tests and the end-to-end benchmarks.
// Include after GoogleTest: Xlib's macros (None, Bool, Status) break its headers.
#include <X11/Xlib.h>
#include <X11/Xutil.h>

#include <grp.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace programtest
{

// One started copy of the program, killed if it still runs when the object goes.
class Program
{
public:
    // uid: run as that user (and group) instead of the current one.
    Program(const std::string& program, const std::vector<std::string>& environment,
            std::optional<uid_t> uid = std::nullopt, const std::vector<std::string>& arguments = {})
    {
        std::vector<char*> envp, argv = {const_cast<char*>(program.c_str())};
        for (const std::string& entry : environment)
            envp.push_back(const_cast<char*>(entry.c_str()));
        for (const std::string& argument : arguments)
            argv.push_back(const_cast<char*>(argument.c_str()));
        envp.push_back(nullptr);
        argv.push_back(nullptr);
        if ((m_pid = ::fork()) == 0)
        {
            if (uid && (::setgroups(0, nullptr) != 0 || ::setgid(*uid) != 0 || ::setuid(*uid) != 0))
                ::_exit(126);
            ::execve(argv[0], argv.data(), envp.data());
            ::_exit(127);
        }
    }
    ~Program()
    {
        if (m_pid > 0 && !HasEnded() && ::kill(m_pid, SIGKILL) == 0)
            Wait();
    }

    pid_t Pid() const { return m_pid; }
    bool HasEnded() { return Reap(WNOHANG); }
    // Blocks until the process ends; its wait status (-1 when there is none to have).
    int Wait() { return Reap(0) ? *m_status : -1; }

private:
    bool Reap(int flags)
    {
        int status = 0;
        if (const pid_t got = m_status ? 0 : ::waitpid(m_pid, &status, flags))
            m_status = got == m_pid ? status : -1;
        return m_status.has_value();
    }

    pid_t m_pid = -1;
    std::optional<int> m_status;
};

// A connection to the display the program's windows appear on.
class XSession
{
public:
    XSession() { XSetErrorHandler(IgnoreErrors); }

    bool IsOpen() const { return m_display != nullptr; }

    // The mapped top-level window of the program, once there is one; 0 when the program ended first.
    Window WaitForWindow(Program& program)
    {
        const long pid = program.Pid();
        const std::string owner(reinterpret_cast<const char*>(&pid), sizeof pid);
        for (;; ::usleep(20000))
        {
            Window root = 0, parent = 0, found = 0, *children = nullptr;
            unsigned int count = 0;
            XQueryTree(m_display, DefaultRootWindow(m_display), &root, &parent, &children, &count);
            for (unsigned int i = 0; i < count && found == 0; ++i)
                if (Attributes(children[i]).map_state == IsViewable &&
                    !Attributes(children[i]).override_redirect &&
                    Property(children[i], "_NET_WM_PID") == owner)
                    found = children[i];
            XFree(children);
            if (found != 0 || program.HasEnded())
                return found;
        }
    }

    std::string Title(Window window) { return Property(window, "_NET_WM_NAME"); }

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
        const Visual* visual = DefaultVisual(m_display, DefaultScreen(m_display));
        for (int row = 0; image != nullptr && row < height; ++row)
            for (int column = 0; column < width; ++column)
            {
                // A channel's bits scaled to 0..255: the shifts of value and mask cancel out.
                unsigned long sum = 0;
                for (unsigned long mask : {visual->red_mask, visual->green_mask, visual->blue_mask})
                    sum += mask != 0 ? (XGetPixel(image, column, row) & mask) * 255 / mask : 0;
                levels.push_back(static_cast<unsigned char>(sum / 3));
            }
        if (image != nullptr)
            XDestroyImage(image);
        return levels;
    }

    // What a window manager sends when the user clicks the close button.
    void RequestClose(Window window)
    {
        XEvent event{ClientMessage};
        event.xclient.window = window;
        event.xclient.message_type = XInternAtom(m_display, "WM_PROTOCOLS", False);
        event.xclient.format = 32;
        event.xclient.data.l[0] = static_cast<long>(XInternAtom(m_display, "WM_DELETE_WINDOW", False));
        XSendEvent(m_display, window, False, NoEventMask, &event);
        XFlush(m_display);
    }

private:
    // A window may go between finding it and reading it: that is no error here.
    static int IgnoreErrors(Display*, XErrorEvent*) { return 0; }

    // A property's bytes (a title) or longs (a process id), as they are stored.
    std::string Property(Window window, const char* name)
    {
        Atom type = 0;
        int format = 0;
        unsigned long items = 0, remaining = 0;
        unsigned char* data = nullptr;
        XGetWindowProperty(m_display, window, XInternAtom(m_display, name, False), 0, 1024, False,
                           AnyPropertyType, &type, &format, &items, &remaining, &data);
        const std::string bytes(reinterpret_cast<char*>(data),
                                data ? (format == 32 ? sizeof(long) : 1) * items : 0);
        XFree(data);
        return bytes;
    }

    Display* const m_display = XOpenDisplay(nullptr);
    const std::unique_ptr<Display, int (*)(Display*)> m_close{m_display, XCloseDisplay};
};

} // namespace programtest
