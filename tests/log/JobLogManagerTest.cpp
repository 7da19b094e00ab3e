// The log model's own rules; how it polls its journal is checked beside the
// status model in tests/status/JournalPollTest.cpp.
#include <condition_variable>
#include <mutex>
#include <thread>

#include <sys/stat.h>

#include <gtest/gtest.h>

#include "LogTestSupport.h"
#include "data/DosTime.h"
#include "data/JobLogManager.h"
#include "data/NamedMutex.h"
#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"

using logtest::LogLine;

namespace
{

const auto* const g_wx = ::testing::AddGlobalTestEnvironment(new logtest::WxEnvironment);

using Keys = std::vector<wxString>;

Keys KeysOf(const std::vector<JobRecord>& records)
{
    Keys keys;
    for (const JobRecord& record : records)
        keys.push_back(record[LogField::Key]);
    return keys;
}

class LogModel : public ::testing::Test
{
protected:
    void Write(const wxString& text) { logtest::SystemRoot::WriteFile(m_root.JournalPath(), text); }
    void Append(const wxString& text) { logtest::SystemRoot::AppendFile(m_root.JournalPath(), text); }
    static Keys All(const JobLogManager& model)
    {
        std::vector<JobRecord> records;
        model.GetAllRecords(records);
        return KeysOf(records);
    }
    static Keys New(const JobLogManager& model)
    {
        std::vector<JobRecord> records;
        model.GetNewRecords(records);
        return KeysOf(records);
    }

    logtest::SystemRoot m_root;
    JobLogManager m_model{m_root.JournalPath()};
};

// Only lines of eight pieces (empty ones do not count) make a record; the first read takes all of them.
TEST_F(LogModel, FirstReadTakesEveryWholeLineDuplicatesIncludedAndPlacesTheFields)
{
    const wxString k1 =
        "K1\t/hf/In\t/hf/In/a.pdf\tPRN-7\t" + logtest::SampleDosTime() + "\tDisk full\tno space\tADDED";
    Write(k1 + "\r\n" +
          wxString::FromUTF8("k2\th\tf\ts\t1\tst\tADDED\r\n"
                             "k3\th\t\ts\t1\tst\td\tADDED\r\n"
                             "k4\th\tf\ts\t1\tst\td\tx\tADDED\r\n"
                             "\tk5\th\tf\ts\t1\tst\td\tADDED\t\r\n"
                             "k6\t\th\tf\ts\t1\tst\td\tADDED\r\n\r\n\t\t\t\r\n"
                             "ключ\th\tf\ts\t1\tÉchec\td\tADDED\r\n") +
          LogLine("42", "COMMIT") + LogLine("42", "MODIFIED"));
    // Written before the model starts: its first poll reads it all the same.
    JobLogManager model(m_root.JournalPath());
    EXPECT_EQ(1, model.Parse());
    EXPECT_EQ((Keys{"K1", "k5", "k6", wxString::FromUTF8("ключ"), "42", "42"}), All(model));
    EXPECT_EQ(6u, New(model).size());
    std::vector<JobRecord> records;
    model.GetAllRecords(records);
    const JobRecord expected{"K1",
                             "/hf/In/a.pdf",
                             "/hf/In",
                             "PRN-7",
                             FormatDosTime(logtest::SampleDosTime()),
                             "Disk full",
                             "no space",
                             logtest::SampleDosTime()};
    EXPECT_EQ(records[0], expected);
    EXPECT_FALSE(records[0][LogField::TimeText].empty());
    JobRecord split;
    wxString action;
    ASSERT_TRUE(SplitLogLine(k1, split, action));
    EXPECT_EQ(action, "ADDED");
    split[LogField::TimeText] = expected[LogField::TimeText]; // left to the caller
    EXPECT_EQ(split, expected);
    EXPECT_FALSE(SplitLogLine("k\th\tf\ts\t1\tst\tADDED", split, action));

    // An unchanged poll leaves no new records; the same lines again, as a new file, bring nothing.
    EXPECT_EQ(0, model.Parse());
    EXPECT_TRUE(New(model).empty());
    wxRemoveFile(m_root.JournalPath());
    Write(LogLine("K1", "ADDED") + LogLine("42", "ADDED"));
    EXPECT_EQ(0, model.Parse());
    EXPECT_EQ(6u, model.GetRecordCount());
}

TEST_F(LogModel, AnEmptyJournalStillEndsTheFirstReadAndAStoppedModelTakesNothing)
{
    Write("");
    EXPECT_EQ(0, m_model.Parse());
    Append(LogLine("1", "COMMIT"));
    EXPECT_EQ(0, m_model.Parse());

    m_model.SetRunning(false);
    Append(LogLine("2", "ADDED"));
    EXPECT_EQ(0, m_model.Parse());
    EXPECT_EQ(0u, m_model.GetRecordCount());
    m_model.SetRunning(true);
    EXPECT_EQ(1, m_model.Parse());
    EXPECT_EQ(Keys{"2"}, All(m_model));
}

TEST_F(LogModel, LaterReadsTakeOnlyAddedLinesOfUnseenKeys)
{
    const std::vector<std::pair<const char*, bool>> lines = {
        {"Job-B\tADDED", true},     {"Job-B\tadded", true},    {"Job-B\tAdDeD", true},
        {"Job-B\tMODIFIED", false}, {"Job-B\tCOMMIT", false},  {"Job-A\tADDED", false},
        {"JOB-a\tADDED", false},    {"ärger-1\tADDED", false}, {"0Job-A\tADDED", true}};
    for (const auto& [line, taken] : lines)
    {
        SCOPED_TRACE(line);
        Write(LogLine("Job-A", "ADDED") + LogLine(wxString::FromUTF8("ÄRGER-1"), "ADDED"));
        JobLogManager model(m_root.JournalPath());
        ASSERT_EQ(1, model.Parse());
        const wxString text = wxString::FromUTF8(line);
        Append(LogLine(text.BeforeFirst('\t'), text.AfterFirst('\t')));
        EXPECT_EQ(taken ? 1 : 0, model.Parse());
        EXPECT_EQ(taken ? 3u : 2u, model.GetRecordCount());
        EXPECT_EQ(taken ? 1u : 0u, New(model).size());
    }
}

TEST_F(LogModel, FailedJobsNameTheirFoldersOnceInFirstSeenOrderDuplicatesIncluded)
{
    Write(LogLine("1", "ADDED", "Transfer failed", "/hf/B") +
          LogLine("2", "ADDED", "transferred successfully", "/hf/C") +
          LogLine("3", "ADDED", "Disk full", "/hf/A") + LogLine("4", "ADDED", "Disk full", "/hf/B") +
          LogLine("5", "ADDED", "Disk full", "/hf/b"));
    ASSERT_EQ(1, m_model.Parse());
    const auto folders = [this]
    {
        const wxArrayString array = m_model.GetErrorFolders();
        return Keys(array.begin(), array.end());
    };
    EXPECT_EQ((Keys{"/hf/B", "/hf/A", "/hf/b"}), folders());

    Append(LogLine("2", "ADDED", "Conversion failed", "/hf/Bad"));
    EXPECT_EQ(0, m_model.Parse());
    EXPECT_EQ(5u, m_model.GetRecordCount());
    EXPECT_EQ((Keys{"/hf/B", "/hf/A", "/hf/b", "/hf/Bad"}), folders());
}

// A log view's stand-in takes what came in since its cursor on each update.
TEST_F(LogModel, CursorCollectsEveryRecordAcrossPollsTheViewMissed)
{
    int updates = 0;
    std::uint64_t cursor = 0;
    std::vector<JobRecord> shown;
    std::vector<JobRecord> shownFromNewRecords;
    wxEvtHandler view;
    view.Bind(wxEventTypeTag<wxCommandEvent>(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG),
              [&](wxCommandEvent&)
              {
                  ++updates;
                  m_model.GetRecordsSince(cursor, shown);
                  m_model.GetNewRecords(shownFromNewRecords);
              });
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(1), &view));

    // Refresh tells the log channel only when records came in.
    Write(LogLine("1", "ADDED"));
    EXPECT_EQ(1, m_model.Refresh());
    EXPECT_EQ(0, m_model.Refresh());
    Append(LogLine("1", "ADDED") + LogLine("2", "MODIFIED"));
    EXPECT_EQ(0, m_model.Refresh());
    Append(LogLine("2", "ADDED") + LogLine("3", "ADDED"));
    EXPECT_EQ(1, m_model.Refresh());
    Append(LogLine("4", "ADDED"));
    EXPECT_EQ(1, m_model.Refresh());

    // The view's turn comes only now, after several polls.
    wxAppConsole::GetInstance()->ProcessPendingEvents();
    EventBus::Get().Unsubscribe(&view);
    EXPECT_EQ(3, updates);
    EXPECT_EQ((Keys{"1", "2", "3", "4"}), KeysOf(shown));
    EXPECT_EQ(0u, m_model.GetRecordsSince(cursor, shown));
    // What the view would have lost through the latest read's list alone.
    EXPECT_EQ((Keys{"4", "4", "4"}), KeysOf(shownFromNewRecords));

    // After a clear, a view's cursor and a new one both start at what came in since.
    std::uint64_t fresh = 0;
    ASSERT_EQ(0, m_model.ClearLog());
    Append(LogLine("1", "ADDED") + LogLine("5", "ADDED"));
    ASSERT_EQ(1, m_model.Parse());
    std::vector<JobRecord> fromCurrent;
    std::vector<JobRecord> fromFresh;
    EXPECT_EQ(2u, m_model.GetRecordsSince(cursor, fromCurrent));
    EXPECT_EQ(2u, m_model.GetRecordsSince(fresh, fromFresh));
    EXPECT_EQ((Keys{"1", "5"}), KeysOf(fromCurrent));
    EXPECT_EQ((Keys{"1", "5"}), KeysOf(fromFresh));
    EXPECT_EQ(cursor, fresh);
}

// --- clearing the log -------------------------------------------------------

TEST_F(LogModel, ClearLogEmptiesListAndJournalKeepingItsModeAndForgetsKeys)
{
    EXPECT_EQ(0, m_model.ClearLog());
    EXPECT_EQ(0, wxFileName::GetSize(m_root.JournalPath())) << "a missing journal is created";

    Write(LogLine("1", "ADDED") + LogLine("2", "ADDED"));
    ASSERT_TRUE(wxFileName(m_root.JournalPath())
                    .SetPermissions(wxPOSIX_USER_READ | wxPOSIX_USER_WRITE | wxPOSIX_GROUP_READ |
                                    wxPOSIX_GROUP_WRITE));
    ASSERT_EQ(1, m_model.Parse());
    EXPECT_EQ(0, m_model.ClearLog());
    EXPECT_EQ(0u, m_model.GetRecordCount());
    EXPECT_TRUE(New(m_model).empty());
    EXPECT_EQ(0, wxFileName::GetSize(m_root.JournalPath()));
    struct stat journal;
    ASSERT_EQ(0, ::stat(m_root.JournalPath().utf8_str(), &journal));
    EXPECT_EQ(0660u, journal.st_mode & 07777);
    EXPECT_EQ(0, m_model.Parse());

    Append(LogLine("2", "ADDED") + LogLine("3", "COMMIT"));
    EXPECT_EQ(1, m_model.Parse());
    EXPECT_EQ(Keys{"2"}, All(m_model));
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
    EXPECT_EQ((Keys{"1", "2"}), All(m_model));
}

// Clears the log from inside a read, as the GUI thread may while the poller reads.
class ClearingReader : public wyx::JobsFileReadWriter
{
public:
    explicit ClearingReader(const wxString& path) { SetPath(path); }
    int ReadJobs(wxArrayString& lines) override
    {
        const int result = wyx::JobsFileReadWriter::ReadJobs(lines);
        if (model != nullptr)
            std::exchange(model, nullptr)->ClearLog();
        return result;
    }
    JobLogManager* model = nullptr;
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
    EXPECT_EQ(Keys{"3"}, All(model));
}

TEST_F(LogModel, ClearLogBesideAnAppendingProducerKeepsEveryLaterLineAndNoEarlierOne)
{
    constexpr int kJobs = 80;
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
    Keys expected;
    for (int i = 0; i < static_cast<int>(lines.size()); ++i)
    {
        EXPECT_TRUE(lines[i].StartsWith(wxString::Format("job-%d\t", first + i))) << lines[i];
        expected.push_back(wxString::Format("job-%d", first + i));
    }
    EXPECT_EQ(expected, All(m_model));
}

} // namespace
