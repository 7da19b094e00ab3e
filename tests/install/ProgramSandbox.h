#pragma once

// A program started as a user starts it, in a folder of its own: a private
// system root, home and runtime folder, an environment without the build's
// library folder in it, and the display its window goes to. Shared by the
// install and accessibility-bus process tests.
// Include after GoogleTest (see ProgramSession.h).
#include <sys/stat.h>

#include <filesystem>
#include <string>
#include <vector>

#include "ProgramSession.h"
#include "TempFolder.h"

namespace programtest
{

class Sandbox
{
public:
    // accessibility: the bridge left on and the session bus passed, as a desktop session starts programs.
    explicit Sandbox(bool accessibility = false)
    {
        const std::string home = (folder.Path() / "home").string();
        std::filesystem::create_directories(home + "/run");
        ::chmod((home + "/run").c_str(), 0700);
        environment = {"HOME=" + home, "WYX_SYSTEM_ROOT=" + (folder.Path() / "root").string(),
                       "XDG_RUNTIME_DIR=" + home + "/run", "LANG=C.UTF-8"};
        if (!accessibility)
            environment.push_back("NO_AT_BRIDGE=1");
        for (const char* name :
             {"DISPLAY", "PATH", "XAUTHORITY", accessibility ? "DBUS_SESSION_BUS_ADDRESS" : ""})
            if (const char* value = ::getenv(name))
                environment.push_back(std::string(name) + "=" + value);
    }

    // The folder and the display are there (the tests run under xvfb-run -a).
    bool Ready() const { return !folder.Path().empty() && x.IsOpen(); }

    // Runs a program to its end; its wait status (0 when it exited with code 0).
    int Run(const std::string& program, const std::vector<std::string>& arguments) const
    {
        return Program(program, environment, std::nullopt, arguments).Wait();
    }

    // The program's window once it is mapped; 0, with a failure, when the program ended first.
    Window WaitForWindow(Program& program)
    {
        const Window window = x.WaitForWindow(program);
        EXPECT_NE(window, 0u) << "no window: the program ended with wait status " << program.Wait();
        return window;
    }

    // Closes the window as the user does; the program must end with exit code 0, not a signal.
    void Close(Program& program, Window window)
    {
        x.RequestClose(window);
        EXPECT_EQ(program.Wait(), 0);
    }

    TempFolder folder;
    XSession x;
    std::vector<std::string> environment;
};

} // namespace programtest
