// The named locks between processes and threads, and how the operations wait.
#include <atomic>
#include <filesystem>
#include <future>
#include <thread>

#include <gtest/gtest.h>
#include <sys/stat.h>

#include "JournalTestSupport.h"
#include "data/NamedMutex.h"

namespace journaltest
{
namespace
{

using Lines = std::vector<std::string>;

class JournalLock : public JournalTest
{
};

TEST_F(JournalLock, TryLockFailsWhileAnotherProcessHoldsTheLock)
{
    ExternalLockHolder holder(LockFile("TiveraJobsStatusFile"));
    ASSERT_TRUE(holder.Holding());
    {
        named_mutex_lock lock("TiveraJobsStatusFile");
        EXPECT_FALSE(lock.try_lock());
        // Another name is another lock.
        named_mutex_lock other("TiveraJobsLogFile");
        EXPECT_TRUE(other.try_lock());
    }
    holder.Release();
    named_mutex_lock lock("TiveraJobsStatusFile");
    EXPECT_TRUE(lock.try_lock());
}

TEST_F(JournalLock, AWritingOperationWaitsUntilTheLockIsReleased)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n");
    ExternalLockHolder holder(LockFile("TiveraJobsStatusFile"));
    ASSERT_TRUE(holder.Holding());

    std::atomic<bool> returned{false};
    auto add = std::async(std::launch::async,
                          [this, &returned]
                          {
                              wyx::JobsFileReadWriter journal = Journal(StatusJournal());
                              wxString line = "2\tb";
                              const int result = journal.AddJob(line);
                              returned = true;
                              return result;
                          });
    ASSERT_TRUE(
        WaitUntilBlockedOn(LockFile("TiveraJobsStatusFile"), [&returned] { return returned.load(); }));
    EXPECT_FALSE(returned.load());
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\tADDED\r\n");

    holder.Release();
    EXPECT_EQ(add.get(), wyx::JobOk);
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\tADDED\r\n2\tb\tADDED\r\n");
}

TEST_F(JournalLock, TheProducerCommandWaitsForTheLockToo)
{
    WriteBytes(LogJournal(), "");
    ExternalLockHolder holder(LockFile("TiveraJobsLogFile"));
    ASSERT_TRUE(holder.Holding());
    auto add = std::async(std::launch::async, [] { return RunTool({"log", "add", "9\tz"}).status; });
    ASSERT_TRUE(
        WaitUntilBlockedOn(LockFile("TiveraJobsLogFile"), [&add]
                           { return add.wait_for(std::chrono::seconds(0)) == std::future_status::ready; }));
    EXPECT_EQ(ReadBytes(LogJournal()), "");
    holder.Release();
    EXPECT_EQ(add.get(), 0);
    EXPECT_EQ(ReadBytes(LogJournal()), "9\tz\tADDED\r\n");
}

TEST_F(JournalLock, AReaderThatMustNotWaitGivesUpWithLockFailed)
{
    WriteBytes(LogJournal(), "1\ta\tADDED\r\n");
    ExternalLockHolder holder(LockFile("TiveraJobsLogFile"));
    ASSERT_TRUE(holder.Holding());

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
    EXPECT_EQ(ReadBytes(LogJournal()), "1\ta\tADDED\r\n");

    named_mutex_lock lock("TiveraJobsLogFile");
    EXPECT_FALSE(lock.lock(&running));
}

TEST_F(JournalLock, AWaitEndsWhenTheFlagTurnsFalse)
{
    ExternalLockHolder holder(LockFile("TiveraJobsLogFile"));
    ASSERT_TRUE(holder.Holding());
    std::atomic<bool> running{true};
    auto wait = std::async(std::launch::async,
                           [&running]
                           {
                               named_mutex_lock lock("TiveraJobsLogFile");
                               return lock.lock(&running);
                           });
    running = false;
    EXPECT_FALSE(wait.get());
}

TEST_F(JournalLock, AWaitWithTheFlagSetSucceedsOnceReleased)
{
    ExternalLockHolder holder(LockFile("TiveraJobsLogFile"));
    ASSERT_TRUE(holder.Holding());
    const std::atomic<bool> running{true};
    auto wait = std::async(std::launch::async,
                           [&running]
                           {
                               named_mutex_lock lock("TiveraJobsLogFile");
                               return lock.lock(&running);
                           });
    holder.Release();
    EXPECT_TRUE(wait.get());
}

TEST_F(JournalLock, TwoLocksOfOneProcessExcludeEachOther)
{
    named_mutex_lock first("TiveraJobsStatusFile");
    ASSERT_TRUE(first.lock());
    {
        named_mutex_lock second("TiveraJobsStatusFile");
        EXPECT_FALSE(second.try_lock());
        first.unlock();
        EXPECT_TRUE(second.try_lock());
        // Destroying the lock releases it.
    }
    EXPECT_TRUE(first.try_lock());
}

TEST_F(JournalLock, TheLockFileAndItsFolderAreMadeForEveryUser)
{
    const mode_t previous = ::umask(077);
    {
        named_mutex_lock lock("TiveraJobsStatusFile");
        EXPECT_TRUE(lock.try_lock());
    }
    ::umask(previous);
    struct stat info;
    ASSERT_EQ(::stat(LockFile("TiveraJobsStatusFile").c_str(), &info), 0);
    EXPECT_EQ(info.st_mode & 07777, 0666u);
    ASSERT_EQ(::stat((Root() + "/dev/shm").c_str(), &info), 0);
    EXPECT_EQ(info.st_mode & 07777, 01777u);
}

TEST_F(JournalLock, ALinkInPlaceOfTheLockFileIsNotFollowed)
{
    std::filesystem::create_directories(Root() + "/dev/shm");
    WriteBytes(Root() + "/victim", "untouched");
    std::filesystem::create_symlink(Root() + "/victim", LockFile("TiveraJobsStatusFile"));
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n");

    named_mutex_lock lock("TiveraJobsStatusFile");
    EXPECT_FALSE(lock.lock());
    EXPECT_FALSE(lock.try_lock());
    EXPECT_EQ(Journal(StatusJournal()).DeleteJob("1"), wyx::JobLockFailed);
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\tADDED\r\n");
}

TEST_F(JournalLock, AMutexThatCannotBeMadeLocksNothing)
{
    // The lock folder cannot be created where a file stands.
    WriteBytes(Root() + "/dev", "a file");
    named_mutex_lock lock("TiveraJobsStatusFile");
    EXPECT_FALSE(lock.lock());
    EXPECT_FALSE(lock.try_lock());
    lock.unlock();
}

} // namespace
} // namespace journaltest
