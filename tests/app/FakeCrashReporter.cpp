// A stand-in crash reporter library. Each call of an entry appends its name to
// the file that WYX_TEST_CRASH_LOG names. Built twice: with both entries, and
// with WYX_INSTALL_ONLY, without "UninstallCrashReporter".
#include <cstdio>
#include <cstdlib>

namespace
{

void Record(const char* entry)
{
    const char* path = std::getenv("WYX_TEST_CRASH_LOG");
    if (FILE* log = path ? std::fopen(path, "a") : nullptr)
    {
        std::fprintf(log, "%s\n", entry);
        std::fclose(log);
    }
}

} // namespace

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
