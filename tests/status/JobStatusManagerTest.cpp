#include <gtest/gtest.h>

#include <atomic>
#include <thread>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/wait.h>
#include <unistd.h>

#include <wx/arrstr.h>

#include "StatusTestSupport.h"
#include "data/DosTime.h"
#include "data/JobReadWriter.h"
#include "data/JobStatusManager.h"
#include "data/StatusLine.h"

namespace
{

using statustest::StatusLine;
using statustest::SystemRoot;
using statustest::UpdateCounter;
using statustest::WriteFile;

const auto* const kWx = testing::AddGlobalTestEnvironment(new statustest::WxEnvironment);

std::vector<JobRecord> Jobs(const JobStatusManager& manager)
{
    std::vector<JobRecord> jobs;
    manager.GetJobs(jobs);
    return jobs;
}

std::vector<wxString> Keys(const JobStatusManager& manager)
{
    std::vector<wxString> keys;
    for (const JobRecord& job : Jobs(manager))
        keys.push_back(job[StatusField::Key]);
    return keys;
}

// ---- one line to one record ------------------------------------------------

struct LineCase
{
    const char* name;
    wxString line;
    bool shown;
};

class StatusLineParsing : public testing::TestWithParam<LineCase>
{
};

TEST_P(StatusLineParsing, ShowsOnlyWholeLinesOfLiveJobs)
{
    JobRecord record;
    EXPECT_EQ(ParseStatusLine(GetParam().line, record), GetParam().shown) << GetParam().name;
}

INSTANTIATE_TEST_SUITE_P(
    Lines, StatusLineParsing,
    testing::Values(LineCase{"added", StatusLine("1", "ADDED"), true},
                    LineCase{"modified", StatusLine("1", "MODIFIED"), true},
                    LineCase{"tag case ignored", StatusLine("1", "Modified"), true},
                    LineCase{"committed", StatusLine("1", "COMMIT"), false},
                    LineCase{"unknown tag", StatusLine("1", "ADDED2"), false},
                    LineCase{"empty size field gives 8 pieces",
                             "1\t/hf\t/hf/a.pdf\tPRN\t1383035055\tSaving...\t\tPDF\tADDED", false},
                    LineCase{"8 pieces", "1\t/hf\t/hf/a.pdf\tPRN\t1383035055\tSaving...\tPDF\tADDED", false},
                    LineCase{"10 pieces", StatusLine("1", "extra\tADDED"), false},
                    LineCase{"leading and trailing tabs", "\t\t" + StatusLine("1", "ADDED") + "\t", true},
                    LineCase{"blank piece counts", StatusLine(" ", "ADDED"), true},
                    LineCase{"empty line", "", false}, LineCase{"tabs only", "\t\t\t", false},
                    LineCase{"no tabs", "ADDED", false},
                    LineCase{"carriage return kept in the tag", StatusLine("1", "ADDED\r"), false}),
    [](const testing::TestParamInfo<LineCase>& info)
    {
        wxString name(info.param.name);
        name.Replace(" ", "_");
        return std::string(name.utf8_str());
    });

TEST(StatusLineParsing, PlacesEachFieldWhereTheViewsLookForIt)
{
    JobRecord record;
    ASSERT_TRUE(
        ParseStatusLine("K7\t/srv/hf/In\t/srv/hf/In/report final.ps\tPRN-02\t1383035055\tTransferring to "
                        "server\tN/A\tPostScript\tadded",
                        record));
    EXPECT_EQ(record[StatusField::Key], "K7");
    EXPECT_EQ(record[StatusField::FilePath], "/srv/hf/In/report final.ps");
    EXPECT_EQ(record[StatusField::HotFolderPath], "/srv/hf/In");
    EXPECT_EQ(record[StatusField::Server], "PRN-02");
    EXPECT_EQ(record[StatusField::Size], "N/A");
    EXPECT_EQ(record[StatusField::Format], "PostScript");
    EXPECT_EQ(record[StatusField::TimeText], FormatDosTime("1383035055"));
    EXPECT_FALSE(record[StatusField::TimeText].empty());
    EXPECT_EQ(record[StatusField::Status], "Transferring to server");
}

// ---- the model over a journal -----------------------------------------------

class StatusModel : public testing::Test
{
protected:
    void Write(const std::vector<wxString>& lines)
    {
        wxString text;
        for (const wxString& line : lines)
            text += line + "\r\n";
        WriteFile(m_root.JournalPath(), text);
    }

    SystemRoot m_root;
};

TEST_F(StatusModel, AMissingJournalReportsNothingUntilItAppears)
{
    JobStatusManager manager(m_root.JournalPath());
    UpdateCounter updates;
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_EQ(updates.Delivered(), 0);

    Write({StatusLine("1", "ADDED")});
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(updates.Delivered(), 1);
    EXPECT_EQ(Keys(manager), std::vector<wxString>{"1"});
}

TEST_F(StatusModel, TheFirstPollReadsAJournalWrittenJustBeforeStart)
{
    Write({StatusLine("1", "ADDED"), StatusLine("2", "MODIFIED")});
    JobStatusManager manager(m_root.JournalPath());
    EXPECT_EQ(manager.Parse(), 1);
    EXPECT_EQ(Keys(manager), (std::vector<wxString>{"1", "2"}));
}

TEST_F(StatusModel, KeepsJournalOrderAndSkipsLinesThatAreNotLiveJobs)
{
    Write({StatusLine("3", "ADDED"), "", StatusLine("4", "COMMIT"), "garbage line",
           "5\t/hf\t/hf/a.pdf\tPRN\t1383035055\tSaving...\t\tPDF\tADDED", StatusLine("1", "modified"),
           StatusLine("2", "ADDED")});
    JobStatusManager manager(m_root.JournalPath());
    EXPECT_EQ(manager.Parse(), 1);
    EXPECT_EQ(Keys(manager), (std::vector<wxString>{"3", "1", "2"}));
}

TEST_F(StatusModel, ACommitOnlyJournalEmptiesTheListAndPublishesOnce)
{
    Write({StatusLine("1", "ADDED")});
    JobStatusManager manager(m_root.JournalPath());
    UpdateCounter updates;
    ASSERT_EQ(manager.Refresh(), 1);

    Write({StatusLine("1", "COMMIT"), StatusLine("2", "COMMIT")});
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_EQ(updates.Delivered(), 2);
    EXPECT_EQ(updates.LastId(), 0);
    EXPECT_TRUE(Jobs(manager).empty());
}

TEST_F(StatusModel, AnUnchangedJournalIsNotReadAgain)
{
    Write({StatusLine("1", "ADDED")});
    JobStatusManager manager(m_root.JournalPath());
    UpdateCounter updates;
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_EQ(updates.Delivered(), 1);
}

TEST_F(StatusModel, TheSameFileTouchedIsReadAgain)
{
    Write({StatusLine("1", "ADDED")});
    JobStatusManager manager(m_root.JournalPath());
    UpdateCounter updates;
    ASSERT_EQ(manager.Refresh(), 1);

    wxFileName file(m_root.JournalPath());
    const wxDateTime later = file.GetModificationTime() + wxTimeSpan::Seconds(7);
    ASSERT_TRUE(file.SetTimes(nullptr, &later, nullptr));
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(updates.Delivered(), 2);
    EXPECT_EQ(Keys(manager), std::vector<wxString>{"1"});
}

TEST_F(StatusModel, TwoWritesInTheSameSecondAreBothSeen)
{
    WriteFile(m_root.JournalPath(), "");
    wyx::JobsFileReadWriter writer;
    writer.SetPath(m_root.JournalPath());
    JobStatusManager manager(m_root.JournalPath());

    wxString line = StatusLine("1", "").BeforeLast('\t');
    ASSERT_EQ(writer.AddJob(line), wyx::JobOk);
    ASSERT_EQ(manager.Parse(), 1);
    // Same length, same second: only the finer stamp tells the two apart.
    ASSERT_EQ(writer.ModifyJob(StatusLine("1", "", "Saving,..").BeforeLast('\t')), wyx::JobOk);
    EXPECT_EQ(manager.Parse(), 1);
    const auto jobs = Jobs(manager);
    ASSERT_EQ(jobs.size(), 1u);
    EXPECT_EQ(jobs[0][StatusField::Status], "Saving,..");

    // The same once more, with the file rewritten in place.
    Write({StatusLine("1", "MODIFIED", "Saving;..")});
    EXPECT_EQ(manager.Parse(), 1);
    EXPECT_EQ(Jobs(manager)[0][StatusField::Status], "Saving;..");
}

TEST_F(StatusModel, WhileStoppedAFreeLockIsTakenAndTheCutReadIsReadWholeLater)
{
    Write({StatusLine("1", "ADDED")});
    JobStatusManager manager(m_root.JournalPath());
    UpdateCounter updates;
    ASSERT_EQ(manager.Refresh(), 1);

    // Stopped, a free lock is still taken; the read stops at once and keeps
    // what it has, and the journal counts as not yet read.
    manager.SetRunning(false);
    Write({StatusLine("1", "ADDED"), StatusLine("2", "ADDED")});
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(Keys(manager), std::vector<wxString>{});
    EXPECT_EQ(updates.Delivered(), 2);

    manager.SetRunning(true);
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(Keys(manager), (std::vector<wxString>{"1", "2"}));
    EXPECT_EQ(updates.Delivered(), 3);
}

// A reader that hands out fixed results, and can stop the model while it reads.
class ScriptedReader : public wyx::IJobReadWriter
{
public:
    int ReadJobs(wxArrayString& lines) override
    {
        ++reads;
        if (result == wyx::JobOk)
            lines = content;
        if (onRead)
            onRead();
        return result;
    }
    int AddJob(wxString&) override { return wyx::JobOk; }
    int ModifyJob(wxString) override { return wyx::JobOk; }
    int DeleteJob(wxString) override { return wyx::JobOk; }
    int RemoveJob(wxString) override { return wyx::JobOk; }
    int ClearJobs() override { return wyx::JobOk; }
    int CommitJob(wxString) override { return wyx::JobOk; }
    int Reserved1() override { return wyx::JobOk; }
    int Reserved2() override { return wyx::JobOk; }

    int result = wyx::JobOk;
    wxArrayString content;
    std::function<void()> onRead;
    int reads = 0;
};

TEST_F(StatusModel, StoppingDuringAReadKeepsOnlyWhatWasCollected)
{
    Write({StatusLine("0", "ADDED")});
    auto reader = std::make_unique<ScriptedReader>();
    ScriptedReader& script = *reader;
    JobStatusManager manager(m_root.JournalPath(), std::move(reader));
    for (int i = 0; i < 5; ++i)
        script.content.Add(StatusLine(wxString::Format("%d", i), "ADDED"));
    script.onRead = [&manager] { manager.SetRunning(false); };
    EXPECT_EQ(manager.Parse(), 1);
    EXPECT_TRUE(Jobs(manager).empty());
}

TEST_F(StatusModel, ALockNotObtainedByTheReadIsRetriedAtTheNextPoll)
{
    Write({StatusLine("0", "ADDED")});
    auto reader = std::make_unique<ScriptedReader>();
    ScriptedReader& script = *reader;
    JobStatusManager manager(m_root.JournalPath(), std::move(reader));
    UpdateCounter updates;
    script.content.Add(StatusLine("1", "ADDED"));
    ASSERT_EQ(manager.Refresh(), 1);

    Write({StatusLine("0", "ADDED"), StatusLine("1", "ADDED")});
    script.content.Add(StatusLine("2", "ADDED"));
    script.result = wyx::JobLockFailed;
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_EQ(Keys(manager), std::vector<wxString>{"1"});

    // The journal has not changed since, and is still read.
    script.result = wyx::JobOk;
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(Keys(manager), (std::vector<wxString>{"1", "2"}));
    EXPECT_EQ(updates.Delivered(), 2);
}

TEST_F(StatusModel, AnUnreadableJournalWaitsForItsNextChange)
{
    Write({StatusLine("0", "ADDED")});
    auto reader = std::make_unique<ScriptedReader>();
    ScriptedReader& script = *reader;
    JobStatusManager manager(m_root.JournalPath(), std::move(reader));
    script.content.Add(StatusLine("1", "ADDED"));
    script.result = wyx::JobFileMissing;
    EXPECT_EQ(manager.Parse(), 0);
    script.result = wyx::JobOk;
    EXPECT_EQ(manager.Parse(), 0);
    EXPECT_EQ(script.reads, 1);
    EXPECT_TRUE(Jobs(manager).empty());

    Write({StatusLine("0", "MODIFIED")});
    EXPECT_EQ(manager.Parse(), 1);
    EXPECT_EQ(Keys(manager), std::vector<wxString>{"1"});
}

// ---- other processes -------------------------------------------------------

// A child process that holds the journal's lock until told to let go.
class LockHolder
{
public:
    explicit LockHolder(const wxString& lockPath)
    {
        int locked[2];
        int release[2];
        if (pipe(locked) != 0 || pipe(release) != 0)
            return;
        const wxScopedCharBuffer path = lockPath.utf8_str();
        m_child = fork();
        if (m_child == 0)
        {
            // Only the parent may keep the release pipe open, or its close would not be seen.
            close(release[1]);
            close(locked[0]);
            const int fd = open(path.data(), O_RDONLY | O_CREAT | O_CLOEXEC, 0666);
            const char ok = fd >= 0 && flock(fd, LOCK_EX) == 0 ? '1' : '0';
            (void)!write(locked[1], &ok, 1);
            char ignored;
            (void)!read(release[0], &ignored, 1);
            _exit(0);
        }
        close(locked[1]);
        close(release[0]);
        m_release = release[1];
        char ok = '0';
        m_holding = read(locked[0], &ok, 1) == 1 && ok == '1';
        close(locked[0]);
    }
    ~LockHolder() { Release(); }

    bool Holding() const { return m_holding; }

    // Returns once the child has gone, and with it its lock.
    void Release()
    {
        if (m_child <= 0)
            return;
        close(m_release);
        int status = 0;
        waitpid(m_child, &status, 0);
        m_child = -1;
    }

private:
    pid_t m_child = -1;
    int m_release = -1;
    bool m_holding = false;
};

TEST_F(StatusModel, APollWhileAnotherProcessHoldsTheLockReportsNothingAndTheNextOneReads)
{
    // The lock file exists once any reader or writer has used it.
    WriteFile(m_root.JournalPath(), "");
    JobStatusManager manager(m_root.JournalPath());
    UpdateCounter updates;
    ASSERT_EQ(manager.Refresh(), 1);

    Write({StatusLine("1", "ADDED")});
    LockHolder holder(m_root.LockPath());
    ASSERT_TRUE(holder.Holding());
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_TRUE(Jobs(manager).empty());

    holder.Release();
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(Keys(manager), std::vector<wxString>{"1"});
    EXPECT_EQ(updates.Delivered(), 2);
}

int RunProducer(const wxString& journal, const wxString& line)
{
#ifdef WYX_JOURNAL_TOOL
    const pid_t child = fork();
    if (child == 0)
    {
        execl(WYX_JOURNAL_TOOL, WYX_JOURNAL_TOOL, static_cast<const char*>(journal.utf8_str()), "add",
              static_cast<const char*>(line.utf8_str()), static_cast<char*>(nullptr));
        _exit(127);
    }
#else
    const pid_t child = fork();
    if (child == 0)
    {
        wyx::JobsFileReadWriter writer;
        writer.SetPath(journal);
        wxString copy = line;
        _exit(writer.AddJob(copy));
    }
#endif
    int status = 0;
    if (child < 0 || waitpid(child, &status, 0) != child || !WIFEXITED(status))
        return -1;
    return WEXITSTATUS(status);
}

TEST_F(StatusModel, ALineAnotherProcessWritesBecomesARecordAndAnUpdateWithinOnePoll)
{
    WriteFile(m_root.JournalPath(), "");
    JobStatusManager manager(m_root.JournalPath());
    UpdateCounter updates;
    ASSERT_EQ(manager.Refresh(), 1);
    ASSERT_EQ(updates.Delivered(), 1);

    ASSERT_EQ(RunProducer(m_root.JournalPath(), StatusLine("J-77", "").BeforeLast('\t')), 0);
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(updates.Delivered(), 2);
    const auto jobs = Jobs(manager);
    ASSERT_EQ(jobs.size(), 1u);
    EXPECT_EQ(jobs[0][StatusField::Key], "J-77");
    EXPECT_EQ(jobs[0][StatusField::FilePath], "/srv/hotfolders/Proofs/J-77.pdf");
    EXPECT_EQ(jobs[0][StatusField::Status], "Saving...");
}

// ---- threads -----------------------------------------------------------------

TEST_F(StatusModel, APollingThreadAndTheGuiThreadShareTheListSafely)
{
    WriteFile(m_root.JournalPath(), "");
    JobStatusManager manager(m_root.JournalPath());
    constexpr int kJobs = 40;
    std::atomic<bool> writing{true};
    std::atomic<bool> polling{true};

    std::thread producer(
        [&]
        {
            wyx::JobsFileReadWriter writer;
            writer.SetPath(m_root.JournalPath());
            for (int i = 0; i < kJobs; ++i)
            {
                wxString line = StatusLine(wxString::Format("%d", i), "").BeforeLast('\t');
                writer.AddJob(line);
            }
            writing = false;
        });
    std::thread poller(
        [&]
        {
            while (writing)
                manager.Refresh();
            polling = false;
        });
    size_t seen = 0;
    while (polling)
    {
        std::vector<JobRecord> jobs;
        manager.GetJobs(jobs);
        EXPECT_GE(jobs.size(), seen);
        seen = jobs.size();
        manager.SetRunning(true);
    }
    producer.join();
    poller.join();

    // Whatever the last poll saw, nothing written is missed by the next one.
    manager.Refresh();
    EXPECT_EQ(Jobs(manager).size(), static_cast<size_t>(kJobs));
}

} // namespace
