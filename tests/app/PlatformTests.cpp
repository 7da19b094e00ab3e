// The crash reporter loader, the system root, the heap, files, locks and the
// second copy's signal.
#include <stdlib.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <chrono>
#include <ctime>
#include <fstream>
#include <iterator>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "TempFolder.h"
#include "WaitUntil.h"
#include "app/CrashReporterLoader.h"
#include "platform/os/FileContents.h"
#include "platform/os/FileLock.h"
#include "platform/os/HeapTuning.h"
#include "platform/os/InstanceLock.h"
#include "platform/os/InstanceSignal.h"
#include "platform/os/SystemPaths.h"

namespace
{

TEST(CrashReporter, OnlyALibraryWithBothEntriesIsFoundThroughTheRegistryInstalledAndUninstalled)
{
    TempFolder folder;
    const std::string log = (folder.Path() / "calls.log").string();
    ScopedEnv logVariable("WYX_TEST_CRASH_LOG", log), root("WYX_SYSTEM_ROOT", folder.Path().string());
    const auto calls = [&]
    { return std::string(std::istreambuf_iterator<char>(std::ifstream(log).rdbuf()), {}); };
    EXPECT_EQ(CrashReporterLibraryPath(), "");
    const std::string libraryFolder = std::filesystem::path(WYX_FULL_REPORTER).parent_path().string();
    folder.Write("etc/kelvo/registry.ini",
                 "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=" + libraryFolder + "\n");
    EXPECT_EQ(CrashReporterLibraryPath(), wxString(libraryFolder + "/crashreport.so"));
    {
        CrashReporterLoader loader;
        ASSERT_TRUE(loader.Load());
        loader.Install();
        EXPECT_EQ(calls(), "install\n");
        loader.Uninstall();
    }
    EXPECT_EQ(calls(), "install\nuninstall\n");
    // A library lacking an entry is never called.
    CrashReporterLoader partial;
    EXPECT_FALSE(partial.LoadFrom(WYX_PARTIAL_REPORTER));
    partial.Install();
    partial.Uninstall();
    EXPECT_EQ(calls(), "install\nuninstall\n");
}

// A relative root means the folder it named when the program started,
// whatever the program's working folder later.
TEST(SystemRoot, ARelativeRootIsResolvedOnceAgainstTheStartingFolder)
{
    TempFolder folder;
    ScopedEnv root("WYX_SYSTEM_ROOT", "");
    const std::filesystem::path started = std::filesystem::current_path();
    const std::pair<const char*, std::string> cases[] = {
        {"demo/root", folder.Path().string() + "/demo/root"}, {"/srv/abs", "/srv/abs"}, {"", "/"}};
    for (const auto& [given, expected] : cases)
    {
        ASSERT_EQ(::chdir(folder.Path().c_str()), 0);
        ::setenv("WYX_SYSTEM_ROOT", given, 1);
        wyxos::ResolveSystemRoot();
        ASSERT_EQ(::chdir("/"), 0); // as the program does, to its own folder
        EXPECT_EQ(wyxos::SystemRoot(), expected) << given;
    }
    std::filesystem::current_path(started);
}

TEST(FileContents, TellsAMissingFileFromAnUnreadableOneReadsNoMoreThanAskedAndRewritesKeepingTheGroup)
{
    TempFolder folder;
    std::string bytes = "kept";
    EXPECT_EQ(wyxos::ReadFileContents((folder.Path() / "absent").string(), bytes),
              wyxos::ReadResult::Missing);
    EXPECT_EQ(wyxos::ReadFileContents(folder.Path().string(), bytes), wyxos::ReadResult::Unreadable);
    EXPECT_EQ(bytes, "kept");
    const auto file = folder.Write("file", "0123456789");
    ASSERT_EQ(wyxos::ReadFileContents(file.string(), bytes, 4), wyxos::ReadResult::Read);
    EXPECT_EQ(bytes, "0123");
    EXPECT_EQ(wyxos::ReadFileContents((file / "below").string(), bytes), wyxos::ReadResult::Missing)
        << "below a file is nothing";
    // A rewrite keeps the group of the writer's own file (only root may give it to another group).
    struct stat info;
    if (::geteuid() == 0 && ::chown(file.c_str(), 0, 1) == 0)
    {
        ASSERT_TRUE(wyxos::ReplaceFileContents(file.string(), "new"));
        ASSERT_EQ(::stat(file.c_str(), &info), 0);
        EXPECT_EQ(info.st_gid, 1u);
    }
}

// A reader waiting for the producer's lock must leave the processor to it.
TEST(FileLock, AWaitForAHeldLockSleepsAndEndsWhenToldTo)
{
    TempFolder folder;
    ScopedEnv root("WYX_SYSTEM_ROOT", folder.Path().string());
    const int holder = wyxos::OpenLockFile("held"), waiter = wyxos::OpenLockFile("held");
    ASSERT_TRUE(wyxos::TryLockFile(holder));
    std::atomic<bool> keepWaiting{true};
    bool locked = true;
    const auto start = std::chrono::steady_clock::now();
    const std::clock_t cpuStart = std::clock(); // the whole process's: the waiter is its only busy thread
    std::thread waiting([&] { locked = wyxos::LockFile(waiter, &keepWaiting); });
    // Long enough for a spinning wait to show in the processor time.
    std::this_thread::sleep_for(std::chrono::milliseconds(300));
    keepWaiting = false;
    waiting.join();
    const double cpu = double(std::clock() - cpuStart) / CLOCKS_PER_SEC,
                 wall = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    EXPECT_FALSE(locked);
    EXPECT_LT(cpu, wall / 4) << "the wait spun: " << cpu << " s of processor in " << wall << " s";
    wyxos::UnlockFile(holder);
    EXPECT_TRUE(wyxos::LockFile(waiter, &keepWaiting)) << "a free lock is taken even when no longer waiting";
    wyxos::CloseLockFile(holder);
    wyxos::CloseLockFile(waiter);
}

// One copy per user: the lock and the knock live in the user's own runtime folder.
TEST(SecondCopy, FindsTheFirstThroughItsRuntimeFolderAndKnocksOnlyOnIt)
{
    TempFolder runtime, home;
    ScopedEnv runtimeDir("XDG_RUNTIME_DIR", runtime.Path().string());
    ScopedEnv homeDir("HOME", home.Path().string());
    EXPECT_EQ(wyxos::InstanceLock::FolderFor(), wxString(runtime.Path().string()));
    {
        ScopedEnv relative("XDG_RUNTIME_DIR", "relative");
        EXPECT_EQ(wyxos::InstanceLock::FolderFor(), wxString(home.Path().string()));
    }
    wyxos::InstanceLock first("wyx-copy");
    EXPECT_FALSE(first.IsAnotherRunning());
    EXPECT_TRUE(wyxos::InstanceLock("wyx-copy").IsAnotherRunning());

    std::atomic<int> knocks{0};
    {
        wyxos::InstanceSignal a("a", [&] { ++knocks; });
        ASSERT_TRUE(a.IsListening());
        EXPECT_TRUE(std::filesystem::exists(runtime.Path() / "a.sock"));
        EXPECT_TRUE(wyxos::InstanceSignal::Knock("a"));
        EXPECT_TRUE(WaitUntil([&] { return knocks == 1; }));
        EXPECT_FALSE(wyxos::InstanceSignal::Knock("c"));
    }
    EXPECT_FALSE(std::filesystem::exists(runtime.Path() / "a.sock")) << "the socket goes with its listener";
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
    constexpr std::size_t kKept = std::size_t(16) << 20;
    EXPECT_FALSE(wyxos::ReturnLargeFreeHeap(kKept)) << "nothing much is free yet";
    // A huge journal's records, 48 MiB of small blocks; when it shrinks a few
    // stay scattered among the freed ones, so trimming the heap's top gives nothing back.
    std::vector<std::vector<char>> records(48 * 1024 / 4, std::vector<char>(4096, 1));
    for (std::size_t i = 0; i < records.size(); ++i)
        if (i % 64 != 0)
            std::vector<char>().swap(records[i]);
    const long before = ResidentKiB();
    EXPECT_TRUE(wyxos::ReturnLargeFreeHeap(kKept));
    EXPECT_LT(ResidentKiB(), before - 30 * 1024);
}

} // namespace
