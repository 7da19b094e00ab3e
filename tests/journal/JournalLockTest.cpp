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
    named_mutex_lock first(kStatus), other(kLog);
    ASSERT_TRUE(first.lock());
    EXPECT_TRUE(other.try_lock()); // another name is another lock
    {
        named_mutex_lock second(kStatus);
        EXPECT_FALSE(second.try_lock());
        first.unlock();
        EXPECT_TRUE(second.try_lock());
    }
    EXPECT_TRUE(first.try_lock());
}

TEST_F(JournalLock, WritersAndTheCommandWaitUntilTheLockIsReleased)
{
    for (bool command : {false, true})
    {
        SCOPED_TRACE(command ? "wyx-journal" : "AddJob");
        WriteBytes(StatusJournal(), kOne);
        std::future<int> add; // joined after the holder has gone
        named_mutex_lock holder(kStatus);
        ASSERT_TRUE(holder.lock());
        add = std::async(std::launch::async,
                         [this, command]
                         {
                             wxString line = "2\tb";
                             return command ? RunTool({"status", "add", "2\tb"}).status
                                            : Journal(StatusJournal()).AddJob(line);
                         });
        ASSERT_TRUE(WaitUntilBlockedOn(
            LockFile(kStatus),
            [&add] { return add.wait_for(std::chrono::seconds(0)) == std::future_status::ready; }));
        EXPECT_EQ(ReadBytes(StatusJournal()), kOne);
        holder.unlock();
        EXPECT_EQ(add.get(), wyx::JobOk);
        EXPECT_EQ(ReadBytes(StatusJournal()), kOne + "2\tb\tADDED\r\n");
    }
}

TEST_F(JournalLock, AReaderThatMustNotWaitGivesUpWithLockFailedAndKeepsItsLines)
{
    WriteBytes(LogJournal(), kOne);
    named_mutex_lock holder(kLog);
    ASSERT_TRUE(holder.lock());
    const std::atomic<bool> running{false};
    wyx::JobsFileReadWriter journal = Journal(LogJournal());
    journal.SetKeepWaiting(&running);
    wxArrayString lines;
    lines.Add("kept");
    EXPECT_EQ(journal.ReadJobs(lines), wyx::JobLockFailed);
    EXPECT_EQ(Utf8Lines(lines), Lines{"kept"});
    wxString line = "2\tb";
    EXPECT_EQ(journal.AddJob(line), wyx::JobLockFailed);
    EXPECT_EQ(Utf8(line), "2\tb");
    EXPECT_EQ(ReadBytes(LogJournal()), kOne);
    named_mutex_lock lock(kLog);
    EXPECT_FALSE(lock.lock(&running));
}

TEST_F(JournalLock, AWaitEndsWhenTheFlagTurnsFalseAndSucceedsOnceReleased)
{
    for (bool release : {false, true})
    {
        std::atomic<bool> running{true};
        std::future<bool> wait;
        named_mutex_lock holder(kLog);
        ASSERT_TRUE(holder.lock());
        wait = std::async(std::launch::async,
                          [&running]
                          {
                              named_mutex_lock lock(kLog);
                              return lock.lock(&running);
                          });
        if (release)
            holder.unlock();
        else
            running = false;
        EXPECT_EQ(wait.get(), release);
    }
}

TEST_F(JournalLock, TheLockFileAndItsFolderAreMadeForEveryUser)
{
    const mode_t previous = ::umask(077);
    EXPECT_TRUE(named_mutex_lock(kStatus).try_lock());
    ::umask(previous);
    EXPECT_EQ(fs::status(LockFile(kStatus)).permissions(), static_cast<fs::perms>(0666));
    EXPECT_EQ(fs::status(Root() + "/dev/shm").permissions(), static_cast<fs::perms>(01777));
}

TEST_F(JournalLock, ALinkAtTheLockFileIsNotFollowed)
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
}

TEST_F(JournalLock, AMutexThatCannotBeMadeLocksNothing)
{
    WriteBytes(Root() + "/dev", "a file where the lock folder belongs");
    named_mutex_lock lock(kStatus);
    EXPECT_FALSE(lock.lock());
    EXPECT_FALSE(lock.try_lock());
    lock.unlock();
}

// --- a rewrite replaces the journal whole or not at all ---------------------------------

using AtomicWrite = JournalTest;
using JournalPlant = JournalTest;
using JournalPermission = JournalTest;

TEST_F(AtomicWrite, ARewriteIsANewFileWithTheOldModeAndOwnerAndLinksStayLinks)
{
    // Only root can give the journal another owner; everyone else checks the mode.
    const bool root = ::geteuid() == 0;
    WriteBytes(StatusJournal(), kOne);
    ASSERT_EQ(::chmod(StatusJournal().c_str(), 0640), 0);
    if (root)
        ASSERT_EQ(::chown(StatusJournal().c_str(), 4321, 4322), 0);
    struct stat before = {}, after = {};
    ASSERT_EQ(::stat(StatusJournal().c_str(), &before), 0);
    ASSERT_EQ(RunTool({"status", "add", "2\tb"}).status, 0);
    ASSERT_EQ(::stat(StatusJournal().c_str(), &after), 0);
    EXPECT_NE(after.st_ino, before.st_ino);
    EXPECT_EQ(after.st_mode & 07777, 0640u);
    EXPECT_EQ(after.st_uid, root ? 4321u : before.st_uid);
    EXPECT_EQ(after.st_gid, root ? 4322u : before.st_gid);
    EXPECT_EQ(ReadBytes(StatusJournal()), kOne + "2\tb\tADDED\r\n");
    EXPECT_EQ(FolderEntries(DataDirectory()), Lines{"TiveraJobsStatusFile.txt"});

    WriteBytes(Root() + "/real.txt", kOne);
    fs::create_symlink(Root() + "/real.txt", LogJournal());
    ASSERT_EQ(RunTool({"log", "commit", "1"}).status, 0);
    EXPECT_TRUE(fs::is_symlink(LogJournal()));
    EXPECT_EQ(ReadBytes(Root() + "/real.txt"), "1\ta\tCOMMIT\r\n");
}

TEST_F(AtomicWrite, AFileTooLargeForTheProcessLeavesTheJournalIntact)
{
    // The file size limit makes the new file's write fail as a full disk
    // would, even for root; its signal must not end the tool beside its temporary file.
    const std::string original(2000, 'x');
    WriteBytes(LogJournal(), original);
    EXPECT_EQ(RunTool({"log", "add", "new\tn.pdf"}, "ulimit -f 1;").status, wyx::JobWriteFailed);
    EXPECT_EQ(ReadBytes(LogJournal()), original);
    EXPECT_EQ(FolderEntries(DataDirectory()), Lines{"TiveraJobsLogFile.txt"});
}

TEST_F(AtomicWrite, ATemporaryFileThatCannotBeMadeLeavesTheJournalIntact)
{
    // At the file system's name limit there is no room for the temporary's name.
    const std::string name = std::string(250, 'j') + ".txt";
    WriteBytes(DataDirectory() + name, kOne);
    wyx::JobsFileReadWriter journal = Journal(DataDirectory() + name);
    wxString line = "2\tb";
    EXPECT_EQ(journal.AddJob(line), wyx::JobWriteFailed);
    EXPECT_EQ(journal.DeleteJob("1"), wyx::JobWriteFailed);
    EXPECT_EQ(journal.ClearJobs(), wyx::JobWriteFailed);
    EXPECT_EQ(ReadBytes(DataDirectory() + name), kOne);
    EXPECT_EQ(FolderEntries(DataDirectory()), Lines{name});
    EXPECT_EQ(ReadLines(DataDirectory() + name), Lines{"1\ta\tADDED"});
}

// --- links another user planted -----------------------------------------------------------

using JournalLink = JournalTest;

TEST_F(JournalLink, IsWrittenThroughOnlyWhenEveryLinkIsTheWritersOwn)
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
            EXPECT_EQ(RunTool(operation).status, followed ? wyx::JobOk : wyx::JobWriteFailed);
            EXPECT_EQ(ReadBytes(target) == kOne, !followed);
            EXPECT_TRUE(fs::is_symlink(StatusJournal()));
            for (const std::string& entry : FolderEntries(Root()))
                EXPECT_NE(entry.rfind(".own-file", 0), 0u) << "a temporary was left: " << entry;
            for (std::size_t i = 0; i < owners.size(); ++i)
                fs::remove(link(i));
        }
}

// --- things that are no file, at the journal's path ---------------------------------------

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
        {
            const ToolRun run = RunTool(operation);
            EXPECT_EQ(run.status, wyx::JobFileMissing) << name << ": " << operation[1];
            EXPECT_EQ(run.out, "") << name << ": " << operation[1];
        }
        EXPECT_EQ(FolderEntries(DataDirectory()), Lines{"TiveraJobsStatusFile.txt"}) << name;
        fs::remove(StatusJournal());
    }
}

// --- a journal the writer may not write --------------------------------------------------

TEST_F(JournalPermission, AReadOnlyJournalIsReplacedByRootAloneNeverBehindItsOwnersBack)
{
    if (::geteuid() != 0)
        GTEST_SKIP() << "needs root to run the command as another user";
    // Folders writable by everyone, as 1777 folders are.
    fs::permissions(Root(), fs::perms::owner_all | fs::perms::group_read | fs::perms::group_exec |
                                fs::perms::others_read | fs::perms::others_exec);
    fs::permissions(DataDirectory(), fs::perms::all | fs::perms::sticky_bit);
    fs::create_directories(Root() + "/dev/shm");
    fs::permissions(Root() + "/dev/shm", fs::perms::all | fs::perms::sticky_bit);
    const std::string asNobody = "exec setpriv --reuid=65534 --regid=65534 --clear-groups ";
    for (Arguments operation : kWritingOperations)
    {
        WriteBytes(StatusJournal(), kOne);
        ASSERT_EQ(::chmod(StatusJournal().c_str(), 0444), 0);
        ASSERT_EQ(::chown(StatusJournal().c_str(), 65534, 65534), 0);
        operation[0] = StatusJournal();
        EXPECT_EQ(Run(asNobody + Quoted(WYX_JOURNAL_TOOL), operation).status, wyx::JobWriteFailed)
            << operation[1];
        EXPECT_EQ(ReadBytes(StatusJournal()), kOne) << operation[1];
        EXPECT_EQ(FolderEntries(DataDirectory()), Lines{"TiveraJobsStatusFile.txt"});
        ::unlink(StatusJournal().c_str());
    }
    WriteBytes(StatusJournal(), kOne);
    ASSERT_EQ(::chmod(StatusJournal().c_str(), 0444), 0);
    ASSERT_EQ(RunTool({"status", "commit", "1"}).status, 0);
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\tCOMMIT\r\n");
}

// --- the service simulator: never through what another user planted -----------------------

class SimulatorFiles : public JournalTest
{
protected:
    std::string HotFolderRoot() const { return Root() + "/srv/hotfolders"; }
    std::string Victim() const { return Root() + "/victim.txt"; }
    HotFolderSimulator Simulator() const
    {
        SimulatorOptions options;
        options.jobsPerSecond = 200;
        options.durationSeconds = 0.1;
        options.stepSeconds = 0.002;
        options.failureShare = 1;
        options.seed = 7;
        options.seedGiven = true;
        options.dataDirectory = DataDirectory();
        options.hotFolderRoot = HotFolderRoot();
        return HotFolderSimulator(options, [] { return false; });
    }
    void SetUp() override
    {
        JournalTest::SetUp();
        WriteBytes(Victim(), "not the simulator's\n");
    }
    void TearDown() override { EXPECT_EQ(ReadBytes(Victim()), "not the simulator's\n"); }
};

TEST_F(SimulatorFiles, LinksAtHotFoldersIniAreNotWrittenThroughUnlessTheyAreOwn)
{
    if (::geteuid() != 0)
        GTEST_SKIP() << "only root can give a link to another user";
    fs::create_symlink(Victim(), DataDirectory() + "HotFolders.ini.new"); // the old temporary name
    wxString problem;
    ASSERT_TRUE(Simulator().Prepare(problem)) << problem;
    EXPECT_TRUE(fs::is_regular_file(fs::symlink_status(DataDirectory() + "HotFolders.ini")));
    EXPECT_NE(ReadBytes(DataDirectory() + "HotFolders.ini").find("[Servers]"), std::string::npos);

    fs::remove(DataDirectory() + "HotFolders.ini");
    fs::create_symlink(Victim(), DataDirectory() + "HotFolders.ini");
    ASSERT_EQ(::lchown((DataDirectory() + "HotFolders.ini").c_str(), 4321, 4321), 0);
    EXPECT_FALSE(Simulator().Prepare(problem));
}

TEST_F(SimulatorFiles, ErrorMarkersAreNeverWrittenThroughALink)
{
    HotFolderSimulator simulator = Simulator();
    wxString problem;
    ASSERT_TRUE(simulator.Prepare(problem)) << problem;
    std::size_t folders = 0;
    for (const auto& entry : fs::recursive_directory_iterator(HotFolderRoot()))
        if (entry.is_directory() && entry.path().filename() == "[_KELVO_HotFolder_]" && ++folders)
            fs::create_symlink(Victim(), entry.path() / "Error.er");
    ASSERT_GT(folders, 0u);
    const HotFolderSimulator::Totals totals = simulator.Run();
    ASSERT_GT(totals.failed, 0u);
    EXPECT_EQ(totals.markerErrors, totals.failed);
    EXPECT_EQ(totals.journalErrors, 0u);
    EXPECT_FALSE(totals.AllWritten());
}

TEST_F(SimulatorFiles, TheProgramsStatusTellsWhetherEveryWriteWasMade)
{
    const Arguments arguments{"--rate",         "200/s",         "--duration",       "0.1",
                              "--step-seconds", "0.002",         "--seed",           "7",
                              "--data-dir",     DataDirectory(), "--hotfolder-root", HotFolderRoot()};
    const std::string simulator = "exec 2>/dev/null " + Quoted(WYX_SIMULATOR_TOOL);
    EXPECT_EQ(Run(simulator, arguments).status, 0);
    fs::remove(StatusJournal());
    fs::create_directories(StatusJournal());
    EXPECT_EQ(Run(simulator, arguments).status, 3);
}

} // namespace
} // namespace journaltest
