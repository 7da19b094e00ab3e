#include <condition_variable>
#include <mutex>
#include <set>
#include <thread>

#include <sys/stat.h>

#include <gtest/gtest.h>

#include "LogTestSupport.h"
#include "data/DosTime.h"
#include "data/JobLogManager.h"
#include "data/JobReadWriter.h"
#include "data/NamedMutex.h"
#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"

using logtest::LogLine;
using logtest::SystemRoot;

namespace
{

const auto* const g_wx = ::testing::AddGlobalTestEnvironment(new logtest::WxEnvironment);

std::vector<JobRecord> AllRecords(const JobLogManager& manager)
{
    std::vector<JobRecord> records;
    manager.GetAllRecords(records);
    return records;
}

std::vector<JobRecord> NewRecords(const JobLogManager& manager)
{
    std::vector<JobRecord> records;
    manager.GetNewRecords(records);
    return records;
}

std::vector<wxString> Keys(const std::vector<JobRecord>& records)
{
    std::vector<wxString> keys;
    for (const JobRecord& record : records)
        keys.push_back(record[LogField::Key]);
    return keys;
}

std::vector<wxString> Strings(const wxArrayString& array)
{
    return std::vector<wxString>(array.begin(), array.end());
}

class LogModel : public ::testing::Test
{
protected:
    void Write(const wxString& text) { SystemRoot::WriteFile(m_root.JournalPath(), text); }
    void Append(const wxString& text) { SystemRoot::AppendFile(m_root.JournalPath(), text); }

    SystemRoot m_root;
    JobLogManager m_model{m_root.JournalPath()};
};

// --- the first read ---------------------------------------------------------

TEST_F(LogModel, FirstReadTakesEveryLineDuplicatesIncluded)
{
    Write(LogLine("42", "ADDED") + LogLine("42", "COMMIT") + LogLine("43", "MODIFIED"));

    EXPECT_EQ(1, m_model.Parse());
    EXPECT_EQ((std::vector<wxString>{"42", "42", "43"}), Keys(AllRecords(m_model)));
    EXPECT_EQ(3u, NewRecords(m_model).size());

    // The same content again, as a new file: nothing new.
    wxRemoveFile(m_root.JournalPath());
    Write(LogLine("42", "ADDED") + LogLine("42", "COMMIT") + LogLine("43", "MODIFIED"));
    EXPECT_EQ(0, m_model.Parse());
    EXPECT_EQ(3u, m_model.GetRecordCount());
}

TEST_F(LogModel, FieldsTakeTheirPositions)
{
    Write("K1\t/hf/In\t/hf/In/a.pdf\tPRN-7\t" + logtest::SampleDosTime() +
          "\tDisk full\tno space\tADDED\r\n");
    ASSERT_EQ(1, m_model.Parse());

    const JobRecord record = AllRecords(m_model).at(0);
    EXPECT_EQ("K1", record[LogField::Key]);
    EXPECT_EQ("/hf/In/a.pdf", record[LogField::FilePath]);
    EXPECT_EQ("/hf/In", record[LogField::HotFolderPath]);
    EXPECT_EQ("PRN-7", record[LogField::Server]);
    EXPECT_EQ(FormatDosTime(logtest::SampleDosTime()), record[LogField::TimeText]);
    EXPECT_FALSE(record[LogField::TimeText].empty());
    EXPECT_EQ("Disk full", record[LogField::Status]);
    EXPECT_EQ("no space", record[LogField::Detail]);
    EXPECT_EQ(logtest::SampleDosTime(), record[LogField::DosTime]);
}

TEST_F(LogModel, EmptyJournalStillEndsTheFirstRead)
{
    Write("");
    EXPECT_EQ(0, m_model.Parse());

    Append(LogLine("1", "COMMIT"));
    EXPECT_EQ(0, m_model.Parse());
    Append(LogLine("2", "ADDED"));
    EXPECT_EQ(1, m_model.Parse());
    EXPECT_EQ((std::vector<wxString>{"2"}), Keys(AllRecords(m_model)));
}

TEST_F(LogModel, FirstPollReadsAJournalWrittenJustBeforeStart)
{
    Write(LogLine("1", "ADDED"));
    JobLogManager model(m_root.JournalPath());
    EXPECT_EQ(1, model.Parse());
}

TEST_F(LogModel, MissingJournalTakesNothing)
{
    EXPECT_EQ(0, m_model.Parse());
    EXPECT_EQ(0u, m_model.GetRecordCount());
}

// --- line shapes --------------------------------------------------------------

struct LineCase
{
    const char* name;
    const char* line;
    bool taken;
};

class LogLineShapes : public ::testing::TestWithParam<LineCase>
{
};

TEST_P(LogLineShapes, OnlyEightPiecesMakeARecord)
{
    JobRecord record;
    wxString action;
    EXPECT_EQ(GetParam().taken, SplitLogLine(wxString::FromUTF8(GetParam().line), record, action));
}

INSTANTIATE_TEST_SUITE_P(
    Lines, LogLineShapes,
    ::testing::Values(LineCase{"eight", "k\th\tf\ts\t1\tst\td\tADDED", true},
                      LineCase{"seven", "k\th\tf\ts\t1\tst\tADDED", false},
                      LineCase{"emptyFieldMakesSeven", "k\th\t\ts\t1\tst\td\tADDED", false},
                      LineCase{"nine", "k\th\tf\ts\t1\tst\td\tx\tADDED", false},
                      LineCase{"outerTabsIgnored", "\tk\th\tf\ts\t1\tst\td\tADDED\t", true},
                      LineCase{"doubledTabsAreOne", "k\t\th\tf\ts\t1\tst\td\tADDED", true},
                      LineCase{"empty", "", false}, LineCase{"onlyTabs", "\t\t\t", false},
                      LineCase{"nonAscii", "ключ\th\tf\ts\t1\tÉchec\td\tADDED", true}),
    [](const ::testing::TestParamInfo<LineCase>& info) { return std::string(info.param.name); });

TEST_F(LogModel, MalformedLinesAreSkippedNotFatal)
{
    Write("k\th\tf\ts\t1\tst\tADDED\r\n\r\n" + LogLine("ok", "ADDED") + wxString("\t\t\r\n"));
    EXPECT_EQ(1, m_model.Parse());
    EXPECT_EQ((std::vector<wxString>{"ok"}), Keys(AllRecords(m_model)));
}

// --- later reads ------------------------------------------------------------

struct LaterLineCase
{
    const char* name;
    const char* key;
    const char* tag;
    bool taken;
};

class LogLaterReads : public LogModel, public ::testing::WithParamInterface<LaterLineCase>
{
};

TEST_P(LogLaterReads, OnlyAddedLinesOfUnseenKeysComeIn)
{
    Write(LogLine("Job-A", "ADDED") + LogLine(wxString::FromUTF8("ÄRGER-1"), "ADDED"));
    ASSERT_EQ(1, m_model.Parse());

    Append(LogLine(wxString::FromUTF8(GetParam().key), GetParam().tag));
    EXPECT_EQ(GetParam().taken ? 1 : 0, m_model.Parse());
    EXPECT_EQ(GetParam().taken ? 3u : 2u, m_model.GetRecordCount());
    EXPECT_EQ(GetParam().taken ? 1u : 0u, NewRecords(m_model).size());
}

INSTANTIATE_TEST_SUITE_P(Tags, LogLaterReads,
                         ::testing::Values(LaterLineCase{"addedNewKey", "Job-B", "ADDED", true},
                                           LaterLineCase{"lowerCaseAdded", "Job-B", "added", true},
                                           LaterLineCase{"mixedCaseAdded", "Job-B", "AdDeD", true},
                                           LaterLineCase{"modifiedIgnored", "Job-B", "MODIFIED", false},
                                           LaterLineCase{"commitIgnored", "Job-B", "COMMIT", false},
                                           LaterLineCase{"sameKey", "Job-A", "ADDED", false},
                                           LaterLineCase{"keyDiffersInCase", "JOB-a", "ADDED", false},
                                           LaterLineCase{"nonAsciiKeyDiffersInCase", "ärger-1", "ADDED",
                                                         false},
                                           LaterLineCase{"leadingZeroIsAnotherKey", "0Job-A", "ADDED", true}),
                         [](const ::testing::TestParamInfo<LaterLineCase>& info)
                         { return std::string(info.param.name); });

TEST_F(LogModel, UnchangedSecondPollLeavesNoNewRecords)
{
    Write(LogLine("1", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());
    ASSERT_EQ(1u, NewRecords(m_model).size());

    EXPECT_EQ(0, m_model.Parse());
    EXPECT_TRUE(NewRecords(m_model).empty());
    EXPECT_EQ(1u, m_model.GetRecordCount());
}

TEST_F(LogModel, SameSizeRewriteIsStillSeen)
{
    Write(LogLine("1", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());
    // Same length, new content, at once: a whole-second time check would miss it.
    Write(LogLine("1", "ADDED") + LogLine("2", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());
    Write(LogLine("1", "ADDED") + LogLine("3", "ADDED"));
    EXPECT_EQ(1, m_model.Parse());
    EXPECT_EQ((std::vector<wxString>{"1", "2", "3"}), Keys(AllRecords(m_model)));
}

// --- error folders ----------------------------------------------------------

TEST_F(LogModel, FailedJobsNameTheirFoldersOnceInFirstSeenOrder)
{
    Write(LogLine("1", "ADDED", "Transfer failed", "/hf/B") +
          LogLine("2", "ADDED", "transferred successfully", "/hf/C") +
          LogLine("3", "ADDED", "Disk full", "/hf/A") + LogLine("4", "ADDED", "Disk full", "/hf/B") +
          LogLine("5", "ADDED", "Disk full", "/hf/b"));
    ASSERT_EQ(1, m_model.Parse());
    EXPECT_EQ((std::vector<wxString>{"/hf/B", "/hf/A", "/hf/b"}), Strings(m_model.GetErrorFolders()));
}

TEST_F(LogModel, FailedDuplicateStillMarksItsFolder)
{
    Write(LogLine("7", "ADDED", "Transferred Successfully", "/hf/Good"));
    ASSERT_EQ(1, m_model.Parse());
    ASSERT_TRUE(m_model.GetErrorFolders().empty());

    Append(LogLine("7", "ADDED", "Conversion failed", "/hf/Bad"));
    EXPECT_EQ(0, m_model.Parse());
    EXPECT_EQ(1u, m_model.GetRecordCount());
    EXPECT_EQ((std::vector<wxString>{"/hf/Bad"}), Strings(m_model.GetErrorFolders()));
}

// --- running flag -----------------------------------------------------------

TEST_F(LogModel, StoppedModelTakesNothingUntilRunningAgain)
{
    Write(LogLine("1", "ADDED"));
    m_model.SetRunning(false);
    EXPECT_EQ(0, m_model.Parse());
    EXPECT_EQ(0u, m_model.GetRecordCount());

    m_model.SetRunning(true);
    EXPECT_EQ(1, m_model.Parse());
    EXPECT_EQ(1u, m_model.GetRecordCount());
}

// --- the journal lock -------------------------------------------------------

TEST_F(LogModel, ChangeMadeWhileTheProducerHoldsTheLockIsReadLater)
{
    Write(LogLine("1", "ADDED"));
    {
        named_mutex_lock producer("TiveraJobsLogFile");
        ASSERT_TRUE(producer.try_lock());
        EXPECT_EQ(0, m_model.Parse());
    }
    EXPECT_EQ(1, m_model.Parse());
    EXPECT_EQ(1u, m_model.GetRecordCount());
}

TEST_F(LogModel, AnIdlePollLeavesTheLockAloneAndAHeldLockMakesAChangedJournalBusy)
{
    Write(LogLine("1", "ADDED"));
    ASSERT_EQ(1, m_model.Refresh());
    named_mutex_lock producer("TiveraJobsLogFile");
    ASSERT_TRUE(producer.try_lock());
    for (int poll = 0; poll < 2 * JournalWatch::kBusyPolls; ++poll)
        EXPECT_EQ(0, m_model.Refresh());
    EXPECT_EQ(JournalWatch::State::Readable, m_model.GetJournalReport().state) << "unchanged: lock never tried";

    Append(LogLine("2", "ADDED"));
    for (int poll = 0; poll < JournalWatch::kBusyPolls; ++poll)
        EXPECT_EQ(0, m_model.Refresh());
    EXPECT_EQ(JournalWatch::State::Busy, m_model.GetJournalReport().state);
    producer.unlock();
    EXPECT_EQ(1, m_model.Refresh());
    EXPECT_TRUE(m_model.GetJournalReport().recovered);
}

// Reads through a real journal reader but reports the lock as lost a given number of times.
class LockLosingReader : public wyx::JobsFileReadWriter
{
public:
    LockLosingReader(const wxString& path, int failures) : m_failures(failures) { SetPath(path); }

    int ReadJobs(wxArrayString& lines) override
    {
        if (m_failures > 0)
        {
            --m_failures;
            return wyx::JobLockFailed;
        }
        return wyx::JobsFileReadWriter::ReadJobs(lines);
    }

private:
    int m_failures;
};

TEST_F(LogModel, ReadThatLostTheLockIsRetriedWithoutAFurtherChange)
{
    Write(LogLine("1", "ADDED"));
    JobLogManager model(m_root.JournalPath(), std::make_unique<LockLosingReader>(m_root.JournalPath(), 2));
    EXPECT_EQ(0, model.Parse());
    EXPECT_EQ(0, model.Parse());
    EXPECT_EQ(1, model.Parse());
    EXPECT_EQ(1u, model.GetRecordCount());
}

// --- handing records to the view ---------------------------------------------

TEST_F(LogModel, CursorCollectsEveryRecordAcrossPollsTheViewMissed)
{
    std::uint64_t cursor = 0;
    std::vector<JobRecord> seen;
    Write(LogLine("1", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());
    EXPECT_EQ(1u, m_model.GetRecordsSince(cursor, seen));

    // Three polls bring records before the view gets to handle any update.
    Append(LogLine("2", "ADDED") + LogLine("3", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());
    Append(LogLine("4", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());
    EXPECT_EQ(0, m_model.Parse());

    EXPECT_TRUE(NewRecords(m_model).empty());
    EXPECT_EQ(3u, m_model.GetRecordsSince(cursor, seen));
    EXPECT_EQ(0u, m_model.GetRecordsSince(cursor, seen));
    EXPECT_EQ((std::vector<wxString>{"1", "2", "3", "4"}), Keys(seen));
}

TEST_F(LogModel, CursorStartsAgainAfterClearLog)
{
    Write(LogLine("1", "ADDED") + LogLine("2", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());
    std::uint64_t current = 0;
    std::uint64_t stale = 0;
    std::vector<JobRecord> ignored;
    m_model.GetRecordsSince(current, ignored);

    ASSERT_EQ(0, m_model.ClearLog());
    Append(LogLine("1", "ADDED") + LogLine("3", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());

    std::vector<JobRecord> fromCurrent;
    std::vector<JobRecord> fromStale;
    EXPECT_EQ(2u, m_model.GetRecordsSince(current, fromCurrent));
    EXPECT_EQ(2u, m_model.GetRecordsSince(stale, fromStale));
    EXPECT_EQ((std::vector<wxString>{"1", "3"}), Keys(fromCurrent));
    EXPECT_EQ((std::vector<wxString>{"1", "3"}), Keys(fromStale));
    EXPECT_EQ(current, stale);
}

// A log view's stand-in: takes what came in since its cursor on each update.
class UpdateCounter : public wxEvtHandler
{
public:
    explicit UpdateCounter(JobLogManager& model) : m_model(model)
    {
        Bind(wxEventTypeTag<wxCommandEvent>(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG), &UpdateCounter::OnUpdate,
             this);
    }
    ~UpdateCounter() override { EventBus::Get().Unsubscribe(this); }

    int updates = 0;
    std::vector<JobRecord> shown;
    std::vector<JobRecord> shownFromNewRecords;

private:
    void OnUpdate(wxCommandEvent&)
    {
        ++updates;
        m_model.GetRecordsSince(m_cursor, shown);
        m_model.GetNewRecords(shownFromNewRecords);
    }

    JobLogManager& m_model;
    std::uint64_t m_cursor = 0;
};

TEST_F(LogModel, RefreshTellsTheLogChannelOnlyWhenRecordsCameIn)
{
    EventBus::Get().AddChannel(ChannelKey(1));
    UpdateCounter view(m_model);
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(1), &view));

    Write(LogLine("1", "ADDED"));
    EXPECT_EQ(1, m_model.Refresh());
    EXPECT_EQ(0, m_model.Refresh());
    Append(LogLine("1", "ADDED") + LogLine("2", "MODIFIED"));
    EXPECT_EQ(0, m_model.Refresh());
    Append(LogLine("2", "ADDED"));
    EXPECT_EQ(1, m_model.Refresh());
    Append(LogLine("3", "ADDED"));
    EXPECT_EQ(1, m_model.Refresh());

    // The view's turn comes only now, after several polls.
    wxAppConsole::GetInstance()->ProcessPendingEvents();
    EXPECT_EQ(3, view.updates);
    EXPECT_EQ((std::vector<wxString>{"1", "2", "3"}), Keys(view.shown));
    // What the view would have lost through the latest read's list alone.
    EXPECT_EQ((std::vector<wxString>{"3", "3", "3"}), Keys(view.shownFromNewRecords));
}

// --- clearing the log -------------------------------------------------------

TEST_F(LogModel, ClearLogCreatesAMissingJournal)
{
    ASSERT_FALSE(wxFileExists(m_root.JournalPath()));
    EXPECT_EQ(0, m_model.ClearLog());
    EXPECT_TRUE(wxFileExists(m_root.JournalPath()));
    EXPECT_EQ(0, wxFileName::GetSize(m_root.JournalPath()));
}

TEST_F(LogModel, ClearLogEmptiesListAndJournalAndForgetsKeys)
{
    Write(LogLine("1", "ADDED") + LogLine("2", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());

    EXPECT_EQ(0, m_model.ClearLog());
    EXPECT_EQ(0u, m_model.GetRecordCount());
    EXPECT_EQ(0, wxFileName::GetSize(m_root.JournalPath()));
    EXPECT_EQ(0, m_model.Parse());

    Append(LogLine("2", "ADDED") + LogLine("3", "COMMIT"));
    EXPECT_EQ(1, m_model.Parse());
    EXPECT_EQ((std::vector<wxString>{"2"}), Keys(AllRecords(m_model)));
}

TEST_F(LogModel, NewRecordsOfAClearedLogAreGone)
{
    Write(LogLine("1", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());
    ASSERT_EQ(0, m_model.ClearLog());
    EXPECT_TRUE(NewRecords(m_model).empty());
}

TEST_F(LogModel, ClearLogLeavesTheJournalAloneWhileTheProducerHoldsItsLock)
{
    Write(LogLine("1", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());
    named_mutex_lock producer("TiveraJobsLogFile");
    ASSERT_TRUE(producer.try_lock());

    EXPECT_EQ(1, m_model.ClearLog());
    EXPECT_GT(wxFileName::GetSize(m_root.JournalPath()), 0);
    // A clear that did not happen changes nothing: the records and their keys
    // stay, so the next change of the journal brings no line back twice.
    EXPECT_EQ(1u, m_model.GetRecordCount());
    producer.unlock();
    Append(LogLine("1", "ADDED") + LogLine("2", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());
    EXPECT_EQ((std::vector<wxString>{"1", "2"}), Keys(AllRecords(m_model)));
}

TEST_F(LogModel, ClearLogKeepsTheJournalsMode)
{
    Write(LogLine("1", "ADDED"));
    ASSERT_TRUE(wxFileName(m_root.JournalPath())
                    .SetPermissions(wxPOSIX_USER_READ | wxPOSIX_USER_WRITE | wxPOSIX_GROUP_READ |
                                    wxPOSIX_GROUP_WRITE));
    ASSERT_EQ(0, m_model.ClearLog());
    EXPECT_EQ(0, wxFileName::GetSize(m_root.JournalPath()));
    struct stat journal;
    ASSERT_EQ(0, ::stat(m_root.JournalPath().utf8_str(), &journal));
    EXPECT_EQ(0660u, journal.st_mode & 07777);
}

// Clears the log from inside a read, as the GUI thread may while the poller reads.
class ClearingReader : public wyx::JobsFileReadWriter
{
public:
    explicit ClearingReader(const wxString& path) { SetPath(path); }

    JobLogManager* model = nullptr;

    int ReadJobs(wxArrayString& lines) override
    {
        const int result = wyx::JobsFileReadWriter::ReadJobs(lines);
        if (model != nullptr)
            std::exchange(model, nullptr)->ClearLog();
        return result;
    }
};

TEST_F(LogModel, LinesReadBeforeAClearDoNotComeBack)
{
    Write(LogLine("1", "ADDED"));
    auto reader = std::make_unique<ClearingReader>(m_root.JournalPath());
    ClearingReader& clearing = *reader;
    JobLogManager model(m_root.JournalPath(), std::move(reader));
    ASSERT_EQ(1, model.Parse());

    Append(LogLine("2", "ADDED"));
    clearing.model = &model;
    EXPECT_EQ(0, model.Parse());
    EXPECT_EQ(0u, model.GetRecordCount());

    // What the producer writes after the clear is read at the next poll.
    Append(LogLine("3", "ADDED"));
    EXPECT_EQ(1, model.Parse());
    EXPECT_EQ((std::vector<wxString>{"3"}), Keys(AllRecords(model)));
}

// --- threads ----------------------------------------------------------------

TEST_F(LogModel, ClearLogBesideAnAppendingProducerKeepsEveryLaterLineAndNoEarlierOne)
{
    constexpr int kJobs = 200;
    Write("");
    ASSERT_EQ(0, m_model.Parse());

    std::mutex halfwayLock;
    std::condition_variable halfwayReached;
    bool halfway = false;
    std::thread producer(
        [&]
        {
            wyx::JobsFileReadWriter journal;
            journal.SetPath(m_root.JournalPath());
            for (int i = 0; i < kJobs; ++i)
            {
                wxString line = logtest::LogFields(wxString::Format("job-%d", i));
                EXPECT_EQ(wyx::JobOk, journal.AddJob(line)) << i;
                if (i == kJobs / 2)
                {
                    std::lock_guard<std::mutex> guard(halfwayLock);
                    halfway = true;
                    halfwayReached.notify_one();
                }
            }
        });
    {
        std::unique_lock<std::mutex> guard(halfwayLock);
        halfwayReached.wait(guard, [&] { return halfway; });
    }
    EXPECT_EQ(0, m_model.ClearLog());
    producer.join();
    m_model.Parse();

    // Each append happened wholly before the clear (and is gone) or wholly
    // after it: the journal holds an unbroken run of the last jobs, nothing older.
    wyx::JobsFileReadWriter journal;
    journal.SetPath(m_root.JournalPath());
    wxArrayString lines;
    ASSERT_EQ(wyx::JobOk, journal.ReadJobs(lines));
    ASSERT_LT(lines.size(), static_cast<std::size_t>(kJobs / 2));
    const int first = kJobs - static_cast<int>(lines.size());
    std::vector<wxString> expected;
    for (int i = 0; i < static_cast<int>(lines.size()); ++i)
    {
        EXPECT_TRUE(lines[i].StartsWith(wxString::Format("job-%d\t", first + i))) << lines[i];
        expected.push_back(wxString::Format("job-%d", first + i));
    }
    EXPECT_EQ(expected, Keys(AllRecords(m_model)));
}

TEST_F(LogModel, PollerProducerAndViewTogetherLoseAndRepeatNothing)
{
    constexpr int kJobs = 400;
    Write("");
    std::atomic<bool> producing{true};
    std::thread producer(
        [&]
        {
            wyx::JobsFileReadWriter journal;
            journal.SetPath(m_root.JournalPath());
            for (int i = 0; i < kJobs; ++i)
            {
                wxString line = logtest::LogFields(wxString::Format("job-%d", i));
                journal.AddJob(line);
            }
            producing = false;
        });
    std::atomic<bool> polling{true};
    std::thread poller(
        [&]
        {
            while (producing)
                m_model.Parse();
            m_model.Parse();
            polling = false;
        });

    // The GUI thread's part: take what came in, as updates would make it.
    std::uint64_t cursor = 0;
    std::vector<JobRecord> shown;
    while (polling)
    {
        m_model.GetRecordsSince(cursor, shown);
        std::this_thread::yield();
    }
    producer.join();
    poller.join();
    m_model.GetRecordsSince(cursor, shown);

    std::multiset<wxString> keys;
    for (const JobRecord& record : shown)
        keys.insert(record[LogField::Key]);
    EXPECT_EQ(static_cast<std::size_t>(kJobs), shown.size());
    for (int i = 0; i < kJobs; ++i)
        EXPECT_EQ(1u, keys.count(wxString::Format("job-%d", i))) << i;
}

} // namespace
