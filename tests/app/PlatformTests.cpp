// The crash reporter loader, the log folder, the system root and the heap.
#include <stdlib.h>
#include <unistd.h>

#include <fstream>
#include <memory>
#include <sstream>
#include <vector>

#include <gtest/gtest.h>

#include "TempFolder.h"
#include "app/CrashReporterLoader.h"
#include "platform/os/HeapTuning.h"
#include "platform/os/SystemPaths.h"
#include "platform/services/WyxLogger.h"

namespace
{

class CrashReporter : public ::testing::Test
{
protected:
    std::string Calls() const
    {
        std::stringstream text;
        text << std::ifstream(log).rdbuf();
        return text.str();
    }

    TempFolder folder;
    std::string log = (folder.Path() / "calls.log").string();
    ScopedEnv logVariable{"WYX_TEST_CRASH_LOG", log};
    ScopedEnv root{"WYX_SYSTEM_ROOT", folder.Path().string()};
};

TEST_F(CrashReporter, ALibraryWithBothEntriesIsFoundThroughTheRegistryInstalledAndUninstalled)
{
    EXPECT_EQ(CrashReporterLibraryPath(), "");
    folder.Write("etc/kelvo/registry.ini", "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=\n");
    EXPECT_EQ(CrashReporterLibraryPath(), "");
    const std::string libraryFolder = std::filesystem::path(WYX_FULL_REPORTER).parent_path().string();
    folder.Write("etc/kelvo/registry.ini",
                 "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=" + libraryFolder + "\n");
    EXPECT_EQ(CrashReporterLibraryPath(), wxString(libraryFolder + "/crashreport.so"));
    {
        CrashReporterLoader loader;
        EXPECT_FALSE(loader.IsLoaded());
        ASSERT_TRUE(loader.Load());
        EXPECT_TRUE(loader.IsLoaded());
        EXPECT_EQ(Calls(), "") << "loading alone calls nothing";
        loader.Install();
        EXPECT_EQ(Calls(), "install\n");
        loader.Uninstall();
    }
    EXPECT_EQ(Calls(), "install\nuninstall\n");
}

TEST_F(CrashReporter, ALibraryLackingAnEntryOrNoLibraryIsNeverCalled)
{
    const auto notALibrary = folder.Write("lib/crashreport.so", "not an ELF file");
    for (const std::string& path :
         {std::string(WYX_PARTIAL_REPORTER), std::string(), (folder.Path() / "absent.so").string(),
          notALibrary.string(), folder.Path().string()})
    {
        CrashReporterLoader loader;
        EXPECT_FALSE(loader.LoadFrom(path)) << path;
        EXPECT_FALSE(loader.IsLoaded()) << path;
        loader.Install();
        loader.Uninstall();
    }
    EXPECT_EQ(Calls(), "");
}

struct LoggerCase
{
    const char* stateHome; // nullptr: unset
    const char* home;      // nullptr: unset
    const char* name;
    const char* expected;
};

class LogDirectory : public ::testing::TestWithParam<LoggerCase>
{
};

TEST_P(LogDirectory, ResolvesUnderTheStateFolderAndCreatesNothing)
{
    const LoggerCase& c = GetParam();
    ScopedEnv state("XDG_STATE_HOME", c.stateHome ? c.stateHome : "");
    ScopedEnv home("HOME", c.home ? c.home : "");
    if (c.stateHome == nullptr)
        ::unsetenv("XDG_STATE_HOME");
    if (c.home == nullptr)
        ::unsetenv("HOME");
    WyxLogger::SetLogDirectory("previous");
    WyxLogger::SetLogDirectory(c.name);
    EXPECT_EQ(WyxLogger::GetLogDirectory(), c.expected);
    EXPECT_FALSE(std::filesystem::exists("/state"));
}

INSTANTIATE_TEST_SUITE_P(
    Cases, LogDirectory,
    ::testing::Values(LoggerCase{"/state", "/home/u", "WyxProgress", "/state/WyxProgress"},
                      LoggerCase{"/state/", "/home/u", "WyxProgress", "/state/WyxProgress"},
                      LoggerCase{nullptr, "/home/u", "WyxProgress", "/home/u/.local/state/WyxProgress"},
                      LoggerCase{"state", "/home/u", "WyxProgress", "/home/u/.local/state/WyxProgress"},
                      LoggerCase{nullptr, "/", "WyxProgress", "/.local/state/WyxProgress"},
                      LoggerCase{nullptr, nullptr, "WyxProgress", ""},
                      LoggerCase{nullptr, "home", "WyxProgress", ""}, LoggerCase{"/state", "/home/u", "", ""},
                      LoggerCase{"/state", "/home/u", "..", ""}, LoggerCase{"/state", "/home/u", ".", ""},
                      LoggerCase{"/state", "/home/u", "a/b", ""},
                      LoggerCase{"/state", "/home/u", "/etc", ""}));

// A relative root means the folder it named when the program started,
// whatever the program's working folder later.
TEST(SystemRoot, ARelativeRootIsResolvedOnceAgainstTheStartingFolder)
{
    TempFolder folder;
    ScopedEnv root("WYX_SYSTEM_ROOT", "");
    const std::filesystem::path started = std::filesystem::current_path();
    for (const auto& [given, expected] : std::vector<std::pair<const char*, std::string>>{
             {"demo/root", folder.Path().string() + "/demo/root"},
             {"/srv/abs", "/srv/abs"},
             {"", "/"},
             {nullptr, "/"}})
    {
        ASSERT_EQ(::chdir(folder.Path().c_str()), 0);
        if (given)
            ::setenv("WYX_SYSTEM_ROOT", given, 1);
        else
            ::unsetenv("WYX_SYSTEM_ROOT");
        wyxos::ResolveSystemRoot();
        ASSERT_EQ(::chdir("/"), 0); // as the program does, to its own folder
        EXPECT_EQ(wyxos::SystemRoot(), expected) << (given ? given : "unset");
    }
    std::filesystem::current_path(started);
}

long ResidentKiB()
{
    long pages = 0, resident = 0;
    std::ifstream("/proc/self/statm") >> pages >> resident;
    return resident * (::sysconf(_SC_PAGESIZE) / 1024);
}

// Freed lists are kept for the next rebuild, but not gigabytes of them for ever.
TEST(Heap, FreedMemoryBeyondWhatARebuildNeedsGoesBackToTheSystem)
{
#if defined(__has_feature)
#if __has_feature(address_sanitizer) || __has_feature(thread_sanitizer)
    GTEST_SKIP() << "the sanitizers bring their own allocator";
#endif
#endif
    wyxos::TuneHeapForListRebuilds();
    constexpr std::size_t kKept = std::size_t(64) << 20;
    EXPECT_FALSE(wyxos::ReturnLargeFreeHeap(kKept)) << "nothing much is free yet";
    // A huge journal's records, 160 MiB of small blocks; when it shrinks a few
    // stay scattered among the freed ones, so trimming the heap's top gives nothing back.
    std::vector<std::unique_ptr<char[]>> records(160 * 1024 / 4);
    for (std::size_t i = 0; i < records.size(); ++i)
    {
        records[i] = std::make_unique<char[]>(4096);
        records[i][0] = records[i][4095] = 1;
    }
    for (std::size_t i = 0; i < records.size(); ++i)
        if (i % 64 != 0)
            records[i].reset();
    const long before = ResidentKiB();
    EXPECT_TRUE(wyxos::ReturnLargeFreeHeap(kKept));
    EXPECT_LT(ResidentKiB(), before - 100 * 1024);
}

} // namespace
