#pragma once

// What the install tests share: a private system root, home and runtime
// folder, the environment of a program started there (without the build's
// library folder anywhere in it), and running a command to its end.
// Include after GoogleTest (see ProgramSession.h).
#include <sys/stat.h>

#include <filesystem>
#include <string>
#include <vector>

#include "ProgramSession.h"
#include "TempFolder.h"

namespace installtest
{

inline std::vector<std::string> Environment(const std::filesystem::path& folder)
{
    const std::filesystem::path home = folder / "home";
    const std::filesystem::path runtime = home / "run";
    std::filesystem::create_directories(runtime);
    ::chmod(runtime.c_str(), 0700);
    std::vector<std::string> environment = {
        "HOME=" + home.string(),
        "WYX_SYSTEM_ROOT=" + (folder / "root").string(),
        "XDG_CONFIG_HOME=" + (home / ".config").string(),
        "XDG_STATE_HOME=" + (home / ".local/state").string(),
        "XDG_RUNTIME_DIR=" + runtime.string(),
        "NO_AT_BRIDGE=1",
        "GDK_BACKEND=x11",
        "LANG=C.UTF-8",
    };
    for (const char* name : {"DISPLAY", "PATH", "XAUTHORITY"})
        if (const char* value = ::getenv(name))
            environment.push_back(std::string(name) + "=" + value);
    return environment;
}

// Runs a program to its end; its exit code, or -1 when it did not exit.
inline int RunToEnd(const std::string& program, const std::vector<std::string>& arguments,
                    const std::vector<std::string>& environment)
{
    programtest::Program process(program, environment, std::nullopt, arguments);
    const int status = process.Wait();
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

// The first folder of PATH holding an executable of that name, or empty.
inline std::string FindOnPath(const std::string& name)
{
    const char* path = ::getenv("PATH");
    std::string folders = path ? path : "/usr/bin:/bin";
    std::size_t start = 0;
    while (start <= folders.size())
    {
        const std::size_t end = std::min(folders.find(':', start), folders.size());
        const std::string candidate = folders.substr(start, end - start) + "/" + name;
        if (end > start && ::access(candidate.c_str(), X_OK) == 0)
            return candidate;
        start = end + 1;
    }
    return std::string();
}

} // namespace installtest
