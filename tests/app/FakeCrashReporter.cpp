// A stand-in crash reporter library. Each call of an entry appends its name to
// the file that WYX_TEST_CRASH_LOG names. Built twice: with both entries, and
// with WYX_INSTALL_ONLY, without "UninstallCrashReporter".
#include <cstdlib>
#include <fstream>

static void Record(const char* entry)
{
    const char* path = std::getenv("WYX_TEST_CRASH_LOG");
    if (path != nullptr)
        std::ofstream(path, std::ios::app) << entry << "\n";
}

extern "C" __attribute__((visibility("default"))) void InstallCrashReporter()
{
    Record("install");
}

#ifndef WYX_INSTALL_ONLY
extern "C" __attribute__((visibility("default"))) void UninstallCrashReporter()
{
    Record("uninstall");
}
#endif
