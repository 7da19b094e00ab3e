// The named locks, how the operations wait for them, and what a writer may do
// to a journal in a folder other users share.
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <future>

#include "JournalTestSupport.h"
#include "data/NamedMutex.h"
#include "tools/simulator/HotFolderSimulator.h"
#include "tools/simulator/SimulatorOptions.h"

namespace journaltest
{
namespace
{

const char* const kStatus = "TiveraJobsStatusFile";
const char* const kLog = "TiveraJobsLogFile";
const std::string kOne = "1\ta\tADDED\r\n";
// On the status journal; the first argument names the journal.
const std::vector<Arguments> kWritingOperations = {{"status", "add", "2\tb"}, {"status", "modify", "1\tz"},
                                                   {"status", "delete", "1"}, {"status", "remove", "1"},
                                                   {"status", "commit", "1"}, {"status", "clear"}};

using JournalLock = JournalTest;

TEST_F(JournalLock, TwoLocksOfOneNameExcludeEachOtherUntilOneIsReleasedOrGone)
{
    const mode_t previous = ::umask(077);
    named_mutex_lock first(kStatus), other(kLog);
    ::umask(previous);
    ASSERT_TRUE(first.lock());
    // The lock file and its folder are made for every user.
    EXPECT_EQ(fs::status(LockFile(kStatus)).permissions(), static_cast<fs::perms>(0666));
    EXPECT_EQ(fs::status(Root() + "/dev/shm").permissions(), static_cast<fs::perms>(01777));
    EXPECT_TRUE(other.try_lock()); // another name is another lock
    {
        named_mutex_lock second(kStatus);
        EXPECT_FALSE(second.try_lock());
        first.unlock();
        EXPECT_TRUE(second.try_lock());
        // Unlocked, the first holds nothing: it cannot take the lock back while the second has it.
        EXPECT_FALSE(first.try_lock());
        EXPECT_FALSE(first.lock(std::make_unique<std::atomic<bool>>(false).get()));
    }
    EXPECT_TRUE(first.try_lock());
    // Polled every second all day: each lock closes its file when it goes.
    const auto openFiles = [] { return std::distance(fs::directory_iterator("/proc/self/fd"), {}); };
    const auto before = openFiles();
    for (int i = 0; i < 10; ++i)
        named_mutex_lock(kStatus).try_lock();
    EXPECT_EQ(openFiles(), before);
}

TEST_F(JournalLock, WhileTheLockIsHeldWritersWaitAndThoseThatMustNotWaitGiveUpKeepingTheirLines)
{
    std::future<int> add; // joined after the holder has gone
    named_mutex_lock holder(kStatus);
    for (bool command : {false, true})
    {
        SCOPED_TRACE(command ? "wyx-journal" : "AddJob");
        WriteBytes(StatusJournal(), kOne);
        ASSERT_TRUE(holder.lock());
        add = std::async(
            std::launch::async,
            [this, command]
            {
                wxString line = "2\tb";
                return command ? RunTool({"status", "add", "2\tb"}) : Journal(StatusJournal()).AddJob(line);
            });
        ASSERT_TRUE(WaitUntilBlockedOn(
            LockFile(kStatus),
            [&add] { return add.wait_for(std::chrono::seconds(0)) == std::future_status::ready; }));
        EXPECT_EQ(ReadBytes(StatusJournal()), kOne);
        holder.unlock();
        EXPECT_EQ(add.get(), wyx::JobOk);
        EXPECT_EQ(ReadBytes(StatusJournal()), kOne + "2\tb\tADDED\r\n");
    }

    WriteBytes(StatusJournal(), kOne);
    ASSERT_TRUE(holder.lock());
    const std::atomic<bool> running{false};
    wyx::JobsFileReadWriter journal = Journal(StatusJournal());
    journal.SetKeepWaiting(&running);
    wxArrayString lines;
    lines.Add("kept");
    EXPECT_EQ(journal.ReadJobs(lines), wyx::JobLockFailed);
    EXPECT_EQ(wxJoin(lines, '|'), "kept");
    wxString line = "2\tb";
    EXPECT_EQ(journal.AddJob(line), wyx::JobLockFailed);
    EXPECT_EQ(line.utf8_string(), "2\tb");
    EXPECT_EQ(ReadBytes(StatusJournal()), kOne);
    // A wait ends when the flag turns false, and succeeds once the lock is released.
    for (bool release : {false, true})
    {
        std::atomic<bool> waiting{true};
        std::future<bool> wait = std::async(std::launch::async,
                                            [&waiting]
                                            {
                                                named_mutex_lock lock(kStatus);
                                                return lock.lock(&waiting);
                                            });
        (release ? holder.unlock() : void(waiting = false));
        EXPECT_EQ(wait.get(), release);
    }
}

TEST_F(JournalLock, ALinkAtTheLockFileIsNotFollowedAndALockThatCannotBeMadeLocksNothing)
{
    fs::create_directories(Root() + "/dev/shm");
    WriteBytes(Root() + "/victim", "untouched");
    fs::create_symlink(Root() + "/victim", LockFile(kStatus));
    WriteBytes(StatusJournal(), kOne);
    named_mutex_lock lock(kStatus);
    EXPECT_FALSE(lock.lock());
    EXPECT_FALSE(lock.try_lock());
    EXPECT_EQ(Journal(StatusJournal()).DeleteJob("1"), wyx::JobLockFailed);
    EXPECT_EQ(ReadBytes(StatusJournal()), kOne);
    EXPECT_EQ(ReadBytes(Root() + "/victim"), "untouched");

    fs::remove_all(Root() + "/dev");
    WriteBytes(Root() + "/dev", "a file where the lock folder belongs");
    named_mutex_lock unmade(kLog);
    EXPECT_FALSE(unmade.lock());
    EXPECT_FALSE(unmade.try_lock());
    unmade.unlock();
}

// --- a rewrite replaces the journal whole or not at all ---------------------------------

using AtomicWrite = JournalTest;

TEST_F(AtomicWrite, ARewriteIsANewFileWithTheOldModeAndOwnerAndLinksStayLinks)
{
    // Only root can give the journal another owner; everyone else checks the mode.
    const bool root = ::geteuid() == 0;
    WriteBytes(StatusJournal(), kOne);
    ASSERT_EQ(::chmod(StatusJournal().c_str(), 0640), 0);
    ASSERT_EQ(root ? ::chown(StatusJournal().c_str(), 4321, 4322) : 0, 0);
    struct stat before = {}, after = {};
    ASSERT_EQ(::stat(StatusJournal().c_str(), &before), 0);
    ASSERT_EQ(RunTool({"status", "add", "2\tb"}), 0);
    ASSERT_EQ(::stat(StatusJournal().c_str(), &after), 0);
    EXPECT_NE(after.st_ino, before.st_ino);
    EXPECT_EQ(after.st_mode & 07777, 0640u);
    EXPECT_EQ(after.st_uid, root ? 4321u : before.st_uid);
    EXPECT_EQ(after.st_gid, root ? 4322u : before.st_gid);
    EXPECT_EQ(ReadBytes(StatusJournal()), kOne + "2\tb\tADDED\r\n");
    EXPECT_EQ(FolderEntries(DataDirectory()), Lines{"TiveraJobsStatusFile.txt"});

    WriteBytes(Root() + "/real.txt", kOne);
    fs::create_symlink(Root() + "/real.txt", LogJournal());
    ASSERT_EQ(RunTool({"log", "commit", "1"}), 0);
    EXPECT_TRUE(fs::is_symlink(LogJournal()));
    EXPECT_EQ(ReadBytes(Root() + "/real.txt"), "1\ta\tCOMMIT\r\n");
}

TEST_F(AtomicWrite, AWriteThatFailsLeavesTheJournalIntact)
{
    // The file size limit makes the new file's write fail as a full disk
    // would, even for root; its signal must not end the tool beside its temporary file.
    const std::string original(2000, 'x');
    WriteBytes(LogJournal(), original);
    EXPECT_EQ(RunTool({"log", "add", "new\tn.pdf"}, "ulimit -f 1;"), wyx::JobWriteFailed);
    EXPECT_EQ(ReadBytes(LogJournal()), original);
    fs::remove(LogJournal());
    // At the file system's name limit there is no room for the temporary's name.
    const std::string name = DataDirectory() + std::string(250, 'j') + ".txt";
    WriteBytes(name, kOne);
    wyx::JobsFileReadWriter journal = Journal(name);
    wxString line = "2\tb";
    EXPECT_EQ(journal.AddJob(line), wyx::JobWriteFailed);
    EXPECT_EQ(journal.DeleteJob("1"), wyx::JobWriteFailed);
    EXPECT_EQ(journal.ClearJobs(), wyx::JobWriteFailed);
    EXPECT_EQ(ReadBytes(name), kOne);
    EXPECT_EQ(FolderEntries(DataDirectory()), Lines{fs::path(name).filename().string()});
}

// --- what another user planted: links, and things that are no file ---------------------------

using JournalPlant = JournalTest;

TEST_F(JournalPlant, ALinkIsWrittenThroughOnlyWhenEveryLinkIsTheWritersOwn)
{
    if (::geteuid() != 0)
        GTEST_SKIP() << "only root can give a link to another user";
    const std::string target = Root() + "/own-file.txt";
    auto link = [&](std::size_t i)
    { return i == 0 ? StatusJournal() : Root() + "/link" + std::to_string(i); };
    // The chain of links from the journal's path on: true where another user owns the link.
    for (const std::vector<bool>& owners :
         std::vector<std::vector<bool>>{{false}, {true}, {false, true}, {true, false}, {false, false}})
        for (const Arguments& operation : kWritingOperations)
        {
            SCOPED_TRACE(::testing::PrintToString(owners) + " " + operation[1]);
            const bool followed = std::find(owners.begin(), owners.end(), true) == owners.end();
            WriteBytes(target, kOne);
            for (std::size_t i = 0; i < owners.size(); ++i)
            {
                fs::create_symlink(i + 1 == owners.size() ? target : link(i + 1), link(i));
                ASSERT_EQ(::lchown(link(i).c_str(), owners[i] ? 4321 : 0, owners[i] ? 4321 : 0), 0);
            }
            EXPECT_EQ(RunTool(operation), followed ? wyx::JobOk : wyx::JobWriteFailed);
            EXPECT_EQ(ReadBytes(target) == kOne, !followed);
            for (const std::string& entry : FolderEntries(Root()))
                EXPECT_NE(entry.rfind(".own-file", 0), 0u) << "a temporary was left: " << entry;
            for (std::size_t i = 0; i < owners.size(); ++i)
                fs::remove(link(i));
        }
}

TEST_F(JournalPlant, WhatIsNoFileIsNeitherReadNorWrittenAndNothingWaits)
{
    const std::vector<std::pair<const char*, std::function<void(const std::string&)>>> plants = {
        {"fifo", [](const std::string& p) { ASSERT_EQ(::mkfifo(p.c_str(), 0666), 0); }},
        {"folder", [](const std::string& p) { fs::create_directory(p); }},
        {"link to a device", [](const std::string& p) { fs::create_symlink("/dev/zero", p); }},
        {"dangling link", [](const std::string& p) { fs::create_symlink(p + ".gone", p); }}};
    std::vector<Arguments> operations = kWritingOperations;
    operations.push_back({"status", "read"});
    for (const auto& [name, plant] : plants)
    {
        plant(StatusJournal());
        for (const Arguments& operation : operations)
            EXPECT_EQ(Run("exec " + Quoted(WYX_JOURNAL_TOOL), operation),
                      std::make_pair(int(wyx::JobFileMissing), std::string()))
                << name << ": " << operation[1];
        EXPECT_EQ(FolderEntries(DataDirectory()), Lines{"TiveraJobsStatusFile.txt"}) << name;
        fs::remove(StatusJournal());
    }
}

TEST_F(JournalPlant, AReadOnlyJournalIsReplacedByRootAloneNeverBehindItsOwnersBack)
{
    if (::geteuid() != 0)
        GTEST_SKIP() << "needs root to run the command as another user";
    // Folders writable by everyone, as 1777 folders are.
    fs::permissions(Root(), static_cast<fs::perms>(0755));
    fs::permissions(DataDirectory(), static_cast<fs::perms>(01777));
    fs::create_directories(Root() + "/dev/shm");
    fs::permissions(Root() + "/dev/shm", static_cast<fs::perms>(01777));
    const std::string nobody =
        "exec setpriv --reuid=65534 --regid=65534 --clear-groups " + Quoted(WYX_JOURNAL_TOOL);
    for (Arguments operation : kWritingOperations)
    {
        WriteBytes(StatusJournal(), kOne);
        ASSERT_EQ(::chmod(StatusJournal().c_str(), 0444), 0);
        ASSERT_EQ(::chown(StatusJournal().c_str(), 65534, 65534), 0);
        operation[0] = StatusJournal();
        EXPECT_EQ(Run(nobody, operation).first, wyx::JobWriteFailed) << operation[1];
        EXPECT_EQ(ReadBytes(StatusJournal()), kOne) << operation[1];
        EXPECT_EQ(FolderEntries(DataDirectory()), Lines{"TiveraJobsStatusFile.txt"});
        ::unlink(StatusJournal().c_str());
    }
    WriteBytes(StatusJournal(), kOne);
    ASSERT_EQ(::chmod(StatusJournal().c_str(), 0444), 0);
    ASSERT_EQ(RunTool({"status", "commit", "1"}), 0);
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\tCOMMIT\r\n");
}

// The service simulator never writes through what another user planted, and its
// status tells whether every write was made.
TEST_F(JournalPlant, TheSimulatorWritesThroughNoLink)
{
    const std::string hotFolders = Root() + "/srv/hotfolders", victim = Root() + "/victim.txt";
    WriteBytes(victim, "not the simulator's\n");
    // 200 jobs a second for 0.1 s, every one failing, 0.002 s in each stage, from a fixed seed.
    const SimulatorOptions options{200, 0.1, 1, 0.002, 7, true, DataDirectory(), hotFolders};
    HotFolderSimulator simulator(options, [] { return false; });
    wxString problem;
    if (::geteuid() == 0) // only root can give a link to another user
    {
        fs::create_symlink(victim, DataDirectory() + "HotFolders.ini");
        ASSERT_EQ(::lchown((DataDirectory() + "HotFolders.ini").c_str(), 4321, 4321), 0);
        EXPECT_FALSE(HotFolderSimulator(options, [] { return false; }).Prepare(problem));
        fs::remove(DataDirectory() + "HotFolders.ini");
    }
    fs::create_symlink(victim, DataDirectory() + "HotFolders.ini.new"); // the old temporary name
    ASSERT_TRUE(simulator.Prepare(problem)) << problem;
    EXPECT_TRUE(fs::is_regular_file(fs::symlink_status(DataDirectory() + "HotFolders.ini")));
    std::size_t folders = 0;
    for (const auto& entry : fs::recursive_directory_iterator(hotFolders))
        if (entry.is_directory() && entry.path().filename() == "[_KELVO_HotFolder_]" && ++folders)
            fs::create_symlink(victim, entry.path() / "Error.er");
    ASSERT_GT(folders, 0u);
    const HotFolderSimulator::Totals totals = simulator.Run();
    ASSERT_GT(totals.failed, 0u);
    EXPECT_EQ(totals.markerErrors, totals.failed);
    EXPECT_EQ(totals.journalErrors, 0u);
    EXPECT_FALSE(totals.AllWritten());
    EXPECT_EQ(ReadBytes(victim), "not the simulator's\n");

    const Arguments arguments{"--rate",         "200/s",         "--duration",       "0.1",
                              "--step-seconds", "0.002",         "--seed",           "7",
                              "--data-dir",     DataDirectory(), "--hotfolder-root", Root() + "/srv/other"};
    const std::string program = "exec 2>/dev/null " + Quoted(WYX_SIMULATOR_TOOL);
    EXPECT_EQ(Run(program, arguments).first, 0);
    fs::remove(StatusJournal());
    fs::create_directories(StatusJournal());
    EXPECT_EQ(Run(program, arguments).first, 3);
}

} // namespace
} // namespace journaltest
