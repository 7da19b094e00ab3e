// The log model's own rules; how it polls its journal is checked beside the
// status model in tests/status/JournalPollTest.cpp.
#include <atomic>
#include <thread>

#include <sys/stat.h>

#include <gtest/gtest.h>

#include "LogTestSupport.h"
#include "data/DosTime.h"
#include "data/JobLogManager.h"
#include "data/NamedMutex.h"

using logtest::LogLine;

namespace
{

const auto* const g_wx = ::testing::AddGlobalTestEnvironment(new logtest::WxEnvironment);

using Keys = std::vector<wxString>;

// The keys of the records held, or of those since the cursor when one is given.
Keys All(const JobLogManager& model, std::uint64_t* since = nullptr)
{
    std::uint64_t start = 0; // a view that starts at 0 gets the whole list
    std::vector<JobRecord> records;
    model.GetRecordsSince(since != nullptr ? *since : start, records);
    Keys keys;
    for (const JobRecord& record : records)
        keys.push_back(record[LogField::Key]);
    return keys;
}

// Clears the log from inside a read, as the GUI thread may while the poller reads.
struct ClearingReader : wyx::JobsFileReadWriter
{
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

class LogModel : public ::testing::Test
{
protected:
    void Write(const wxString& text) { logtest::SystemRoot::WriteFile(m_root.JournalPath(), text); }
    void Append(const wxString& text) { logtest::SystemRoot::AppendFile(m_root.JournalPath(), text); }

    logtest::SystemRoot m_root;
    ClearingReader* m_reader = new ClearingReader(m_root.JournalPath()); // owned by the model
    JobLogManager m_model{m_root.JournalPath(), std::unique_ptr<wyx::JobsFileReadWriter>(m_reader)};
};

// Only lines of eight pieces (empty ones do not count) make a record; the first
// read takes all of them, later reads only ADDED lines of keys not seen yet.
TEST_F(LogModel, FirstReadTakesEveryWholeLineLaterReadsOnlyAddedLinesOfUnseenKeysAndFailedJobsNameFolders)
{
    Write(wxString::FromUTF8(
              "K1\t/hf/In\t/hf/In/a.pdf\tPRN-7\t1383035055\tDisk full\tno space\tADDED\r\n"
              "k2\th\tf\ts\t1\tst\tADDED\r\nk3\th\t\ts\t1\tst\td\tADDED\r\n"
              "k4\th\tf\ts\t1\tst\td\tx\tADDED\r\n\tk5\th\tf\ts\t1\tst\td\tADDED\t\r\n"
              "k6\t\th\tf\ts\t1\tst\td\tADDED\r\n\r\n\t\t\t\r\nключ\th\tf\ts\t1\tÉchec\td\tADDED\r\n") +
          LogLine("42", "COMMIT") + LogLine("42", "MODIFIED"));
    ASSERT_EQ(1, m_model.Parse());
    EXPECT_EQ((Keys{"K1", "k5", "k6", wxString::FromUTF8("ключ"), "42", "42"}), All(m_model));
    std::vector<JobRecord> records;
    m_model.GetNewRecords(records);
    ASSERT_EQ(6u, records.size());
    EXPECT_EQ(records[0], (JobRecord{"K1", "/hf/In/a.pdf", "/hf/In", "PRN-7", FormatDosTime("1383035055"),
                                     "Disk full", "no space", "1383035055"}));
    EXPECT_FALSE(records[0][LogField::TimeText].empty());

    // Later reads: ADDED in any case, keys folded to lower case, each key once.
    Write(LogLine("Job-A", "ADDED") + LogLine(wxString::FromUTF8("ÄRGER-1"), "ADDED"));
    JobLogManager model(m_root.JournalPath());
    ASSERT_EQ(1, model.Parse());
    Append(LogLine("B1", "AdDeD") + LogLine("B2", "MODIFIED") + LogLine("B3", "COMMIT") +
           LogLine("JOB-a", "ADDED") + LogLine(wxString::FromUTF8("ärger-1"), "ADDED") +
           LogLine("0Job-A", "added") + LogLine("B4", "ADDED") + LogLine("b4", "ADDED"));
    EXPECT_EQ(1, model.Parse());
    EXPECT_EQ((Keys{"Job-A", wxString::FromUTF8("ÄRGER-1"), "B1", "0Job-A", "B4"}), All(model));

    // An empty journal ends the first read; a stopped model takes nothing in, and failed jobs
    // name their folders.
    Write("");
    JobLogManager stopped(m_root.JournalPath());
    EXPECT_EQ(0, stopped.Parse());
    Append(LogLine("1", "COMMIT"));
    EXPECT_EQ(0, stopped.Parse());
    stopped.SetRunning(false);
    Append(LogLine("2", "ADDED", "Transfer failed", "/hf/B") +
           LogLine("3", "ADDED", "transferred successfully", "/hf/C") +
           LogLine("4", "ADDED", "Disk full", "/hf/A") + LogLine("5", "ADDED", "Disk full", "/hf/B") +
           LogLine("6", "ADDED", "Disk full", "/hf/b"));
    EXPECT_EQ(0, stopped.Parse());
    stopped.SetRunning(true);
    EXPECT_EQ(1, stopped.Parse());
    EXPECT_EQ((Keys{"2", "3", "4", "5", "6"}), All(stopped));
    // Once each, in first-seen order; a line not taken in still names its folder.
    EXPECT_EQ("/hf/B|/hf/A|/hf/b", wxJoin(stopped.GetErrorFolders(), '|', 0));
    Append(LogLine("2", "ADDED", "Conversion failed", "/hf/Bad"));
    EXPECT_EQ(0, stopped.Parse());
    EXPECT_EQ("/hf/B|/hf/A|/hf/b|/hf/Bad", wxJoin(stopped.GetErrorFolders(), '|', 0));
}

// A log view takes what came in since its cursor when its turn comes, after
// several polls; after a clear, its cursor and a new one both start at what came in since.
TEST_F(LogModel,
       ClearLogEmptiesListAndJournalKeepingItsModeUnlessTheProducerHoldsTheLockAndCursorsMissNothing)
{
    EXPECT_EQ(0, m_model.ClearLog());
    EXPECT_EQ(0, wxFileName::GetSize(m_root.JournalPath())) << "a missing journal is created";
    ASSERT_EQ(0, ::chmod(m_root.JournalPath().utf8_str(), 0660));
    std::uint64_t cursor = 0;
    Append(LogLine("1", "ADDED"));
    EXPECT_EQ(1, m_model.Refresh());
    Append(LogLine("1", "ADDED") + LogLine("2", "MODIFIED"));
    EXPECT_EQ(0, m_model.Refresh());
    Append(LogLine("2", "ADDED"));
    EXPECT_EQ(1, m_model.Refresh());
    EXPECT_EQ((Keys{"1", "2"}), All(m_model, &cursor));
    {
        // A clear that did not happen changes nothing: the records and their
        // keys stay, so no line comes back twice.
        named_mutex_lock producer("TiveraJobsLogFile");
        ASSERT_TRUE(producer.try_lock());
        EXPECT_EQ(1, m_model.ClearLog());
        EXPECT_GT(wxFileName::GetSize(m_root.JournalPath()), 0);
    }
    Append(LogLine("2", "ADDED"));
    EXPECT_EQ(0, m_model.Parse());
    EXPECT_EQ(2u, m_model.GetRecordCount());

    EXPECT_EQ(0, m_model.ClearLog());
    EXPECT_EQ(0u, m_model.GetRecordCount());
    EXPECT_EQ(0, wxFileName::GetSize(m_root.JournalPath()));
    struct stat journal;
    ASSERT_EQ(0, ::stat(m_root.JournalPath().utf8_str(), &journal));
    EXPECT_EQ(0660u, journal.st_mode & 07777);
    EXPECT_EQ(0, m_model.Parse());
    std::uint64_t fresh = 0;
    Append(LogLine("1", "ADDED") + LogLine("5", "ADDED") + LogLine("6", "COMMIT"));
    ASSERT_EQ(1, m_model.Parse());
    EXPECT_EQ((Keys{"1", "5"}), All(m_model, &cursor)) << "the keys were forgotten";
    EXPECT_EQ((Keys{"1", "5"}), All(m_model, &fresh));
    EXPECT_EQ(cursor, fresh);

    // A clear from inside a read: the lines read before it do not come back.
    Append(LogLine("7", "ADDED"));
    m_reader->model = &m_model;
    EXPECT_EQ(0, m_model.Parse());
    EXPECT_EQ(0u, m_model.GetRecordCount());
    Append(LogLine("8", "ADDED"));
    EXPECT_EQ(1, m_model.Parse());
    EXPECT_EQ(Keys{"8"}, All(m_model)) << "what came after the clear is read at the next poll";
}

TEST_F(LogModel, ClearLogBesideAnAppendingProducerKeepsEveryLaterLineAndNoEarlierOne)
{
    constexpr int kJobs = 80;
    Write("");
    ASSERT_EQ(0, m_model.Parse());
    std::atomic<int> appended{0};
    std::thread producer(
        [&]
        {
            wyx::JobsFileReadWriter journal;
            journal.SetPath(m_root.JournalPath());
            for (wxString line; appended < kJobs; ++appended)
            {
                line = LogLine(wxString::Format("job-%d", appended.load()), "").BeforeLast('\t');
                EXPECT_EQ(wyx::JobOk, journal.AddJob(line));
            }
        });
    while (appended <= kJobs / 2)
        std::this_thread::yield();
    EXPECT_EQ(0, m_model.ClearLog());
    producer.join();
    m_model.Parse();

    // Each append happened wholly before the clear (and is gone) or wholly
    // after it: the journal holds an unbroken run of the last jobs, nothing older.
    const Keys kept = All(m_model);
    ASSERT_LT(kept.size(), static_cast<std::size_t>(kJobs / 2));
    Keys expected;
    for (int i = kJobs - static_cast<int>(kept.size()); i < kJobs; ++i)
        expected.push_back(wxString::Format("job-%d", i));
    EXPECT_EQ(expected, kept);
}

} // namespace
