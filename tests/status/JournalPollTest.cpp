// How both models poll their journal (ChangedJournal): read only on a changed
// stamp, never wait for the producer's lock, keep data and stamp when a read
// fails so the change is read later, and report a busy or unreadable journal.
#include <gtest/gtest.h>

#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <functional>
#include <memory>
#include <set>
#include <thread>

#include <wx/filename.h>

#include "../log/LogTestSupport.h"
#include "StatusTestSupport.h"
#include "data/DosTime.h"
#include "data/JobLogManager.h"
#include "data/JobStatusManager.h"
#include "data/NamedMutex.h"
#include "data/StatusLine.h"
#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"

namespace
{

const auto* const kWx = testing::AddGlobalTestEnvironment(new wyxtest::WxEnvironment);
using Records = std::vector<JobRecord>;

struct StatusModelKind
{
    using Model = JobStatusManager;
    static constexpr const char* kJournal = "TiveraJobsStatusFile";
    static wxString Fields(const wxString& key) { return statustest::StatusLine(key, "").BeforeLast('\t'); }
    // What a view shows: the status model's latest read.
    static void Take(const Model& model, std::uint64_t&, Records& out) { model.GetJobs(out = {}); }
};

struct LogModelKind
{
    using Model = JobLogManager;
    static constexpr const char* kJournal = "TiveraJobsLogFile";
    static wxString Fields(const wxString& key) { return logtest::LogLine(key, "").BeforeLast('\t'); }
    // What a log view shows: every record handed over through its cursor.
    static void Take(const Model& model, std::uint64_t& at, Records& out) { model.GetRecordsSince(at, out); }
};

// Reads the journal file, but answers `failWith` for the next `failures` reads.
struct FailingReader : wyx::JobsFileReadWriter
{
    explicit FailingReader(const wxString& path) { SetPath(path); }
    int ReadJobs(wxArrayString& lines) override
    {
        ++reads;
        return failures-- > 0 ? failWith : wyx::JobsFileReadWriter::ReadJobs(lines);
    }
    int failWith = wyx::JobLockFailed;
    int failures = 0;
    int reads = 0;
};

template <typename Kind> class JournalPoll : public testing::Test
{
protected:
    using Model = typename Kind::Model;

    // Counts the updates either model publishes.
    JournalPoll()
    {
        for (const wxEventType type :
             {wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG, wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS})
            m_handler.Bind(wxEventTypeTag<wxCommandEvent>(type),
                           [this](wxCommandEvent& event) { m_ids.push_back(event.GetId()); });
        for (const int channel : {1, 2})
            EventBus::Get().Subscribe(ChannelKey(channel), &m_handler);
    }
    ~JournalPoll() override { EventBus::Get().Unsubscribe(&m_handler); }
    wxString Journal() const { return GetDataDirectory() + Kind::kJournal + ".txt"; }
    // Writes one line for each key, the key's fields and the tag; with no tag, the lines as given.
    void Write(std::initializer_list<wxString> keys, const wxString& tag = "ADDED")
    {
        wxString text;
        for (const wxString& key : keys)
            text += (tag.empty() ? key : Kind::Fields(key) + "\t" + tag) + "\r\n";
        wyxtest::SystemRoot::WriteFile(Journal(), text);
    }
    // The field of each record shown, each followed by '|'.
    wxString Keys(const Model& model, std::size_t field = 0) const
    {
        std::uint64_t cursor = 0;
        Records shown;
        Kind::Take(model, cursor, shown);
        wxString keys;
        for (const JobRecord& record : shown)
            keys += record[field] + "|";
        return keys;
    }
    int Updates()
    {
        wxAppConsole::GetInstance()->ProcessPendingEvents();
        return static_cast<int>(m_ids.size());
    }
    statustest::SystemRoot m_root;
    Model m_model{Journal()};
    wxEvtHandler m_handler;
    std::vector<int> m_ids; // of each update published
};

using ModelKinds = testing::Types<StatusModelKind, LogModelKind>;
TYPED_TEST_SUITE(JournalPoll, ModelKinds);

// A change made while the producer holds the lock is read once it lets go.
TYPED_TEST(JournalPoll, AnIdlePollLeavesTheLockAloneAndAHeldLockMakesAChangedJournalBusy)
{
    this->Write({"1"});
    ASSERT_EQ(this->m_model.Refresh(), 1);
    named_mutex_lock producer(TypeParam::kJournal);
    ASSERT_TRUE(producer.try_lock());
    for (int poll = 0; poll < 4 * JournalWatch::kBusyPolls; ++poll)
    {
        if (poll == 2 * JournalWatch::kBusyPolls)
            wxRemoveFile(this->Journal()); // a journal that vanished is no change to read either
        EXPECT_EQ(this->m_model.Refresh(), 0);
    }
    EXPECT_EQ(this->Updates(), 1) << "the lock never tried, so no busy journal told";

    this->Write({"1", "2"});
    for (int poll = 1; poll < JournalWatch::kBusyPolls; ++poll)
        EXPECT_EQ(this->m_model.Refresh(), 0);
    EXPECT_EQ(this->m_model.GetJournalReport().state, JournalWatch::State::Readable) << "a producer at work";
    EXPECT_EQ(this->m_model.Refresh(), 0);
    EXPECT_EQ(this->m_model.GetJournalReport().state, JournalWatch::State::Busy);
    EXPECT_EQ(this->Updates(), 2) << "told of the busy journal";

    producer.unlock();
    EXPECT_EQ(this->m_model.Refresh(), 1);
    EXPECT_TRUE(this->m_model.GetJournalReport().recovered);
    EXPECT_EQ(this->Keys(this->m_model), "1|2|");
}

TYPED_TEST(JournalPoll, AFailedReadKeepsDataAndStampUnlessTheJournalIsUnreadable)
{
    FailingReader& reader = *new FailingReader(this->Journal()); // owned by the model
    typename TypeParam::Model model(this->Journal(), std::unique_ptr<FailingReader>(&reader));
    this->Write({"1"});
    ASSERT_EQ(model.Parse(), 1);

    // A lost lock: retried at the next polls without a further change.
    this->Write({"1", "2"});
    reader.failures = 2;
    EXPECT_EQ(model.Parse(), 0);
    EXPECT_EQ(model.Parse(), 0);
    EXPECT_EQ(this->Keys(model), "1|");
    EXPECT_EQ(model.Parse(), 1);
    EXPECT_EQ(this->Keys(model), "1|2|");

    // An unreadable journal is reported and waits for its next change.
    this->Write({"1", "3"});
    reader.failWith = wyx::JobFileMissing;
    reader.failures = 1;
    const int reads = reader.reads;
    EXPECT_EQ(model.Parse(), 0);
    EXPECT_EQ(model.GetJournalReport().state, JournalWatch::State::Unreadable);
    EXPECT_EQ(model.Parse(), 0);
    EXPECT_EQ(reader.reads, reads + 1);

    // Same length, same second: only the finer stamp tells the two apart.
    this->Write({"1", "4"});
    EXPECT_EQ(model.Parse(), 1);
    EXPECT_TRUE(model.GetJournalReport().recovered);
    EXPECT_TRUE(this->Keys(model).EndsWith("|4|")) << this->Keys(model);
}

// Something other than a lock file, put where the journal's lock belongs.
TYPED_TEST(JournalPoll, APlantedLockPathIsNeverWaitedOnAndMakesTheJournalUnreadable)
{
    const std::vector<std::pair<const char*, std::function<int(const char*)>>> plants = {
        {"fifo", [](const char* path) { return ::mkfifo(path, 0666); }},
        {"directory", [](const char* path) { return ::mkdir(path, 0777); }},
        {"link", [](const char* path) { return ::symlink("/etc/passwd", path); }}};
    ::mkdir((this->m_root.Path() + "/dev").utf8_str(), 0755);
    ::mkdir((this->m_root.Path() + "/dev/shm").utf8_str(), 01777);
    const std::string lock =
        (this->m_root.Path() + "/dev/shm/" + TypeParam::kJournal + ".lock").ToStdString();
    for (const auto& [name, plant] : plants)
    {
        SCOPED_TRACE(name);
        typename TypeParam::Model model(this->Journal());
        const int updates = this->Updates();
        this->Write({"1"});
        ::unlink(lock.c_str()); // the lock file the last round left
        ASSERT_EQ(plant(lock.c_str()), 0);
        // A FIFO opened for reading would block here for ever.
        EXPECT_EQ(model.Refresh(), 0);
        EXPECT_EQ(model.GetJournalReport().state, JournalWatch::State::Unreadable);
        EXPECT_EQ(model.Refresh(), 0);
        EXPECT_EQ(this->Updates(), updates + 1) << "the view is told once";

        ::unlink(lock.c_str());
        ::rmdir(lock.c_str());
        this->Write({"a", "b"});
        EXPECT_EQ(model.Refresh(), 1);
        EXPECT_TRUE(model.GetJournalReport().recovered);
    }
}

// Producer, poller and the GUI thread at once; run under ThreadSanitizer too.
TYPED_TEST(JournalPoll, PollerProducerAndViewTogetherLoseAndRepeatNothing)
{
    constexpr int kJobs = 100;
    this->Write({});
    std::atomic<bool> produced{false}, polled{false};
    std::thread producer(
        [&]
        {
            wyx::JobsFileReadWriter journal;
            journal.SetPath(this->Journal());
            for (int i = 0; i < kJobs; ++i)
            {
                wxString fields = TypeParam::Fields(wxString::Format("job-%d", i));
                EXPECT_EQ(journal.AddJob(fields), wyx::JobOk);
            }
            produced = true;
        });
    std::thread poller(
        [&]
        {
            while (!produced)
                this->m_model.Refresh();
            this->m_model.Refresh();
            polled = true;
        });
    std::uint64_t cursor = 0;
    Records shown;
    while (!polled)
        TypeParam::Take(this->m_model, cursor, shown);
    TypeParam::Take(this->m_model, cursor, shown);
    producer.join();
    poller.join();

    std::set<wxString> keys;
    for (const JobRecord& record : shown)
        keys.insert(record[0]);
    EXPECT_EQ(shown.size(), static_cast<std::size_t>(kJobs));
    EXPECT_EQ(keys.size(), static_cast<std::size_t>(kJobs)) << "only the producer's keys, each once";
}

// The status model's own rules.
using StatusModel = JournalPoll<StatusModelKind>;

// Shown are whole lines of nine pieces (empty ones do not count) of live jobs, in journal order.
TEST_F(StatusModel, ShowsWholeLinesOfLiveJobsInJournalOrderReadsWholeOnlyWhenRunningAndFreesOldReads)
{
    using statustest::StatusLine;
    const wxString k7 =
        "K7\t/hf/In\t/hf/In/report final.ps\tPRN-02\t1383035055\tTransferring to server\tN/A\t"
        "PostScript\tadded";
    Write({StatusLine("3", "ADDED"), "", StatusLine("4", "COMMIT"), "ADDED", "\t\t\t",
           "5\t/hf\t/hf/a.pdf\tPRN\t1383035055\tSaving...\t\tPDF\tADDED",
           "6\t/hf\t/hf/a.pdf\tPRN\t1383035055\tSaving...\tPDF\tADDED", StatusLine("7", "extra\tADDED"),
           StatusLine("8", "ADDED2"), StatusLine("1", "modified"), StatusLine("2", "MODIFIED"),
           "\t\t" + StatusLine("9", "ADDED") + "\t", StatusLine(" ", "ADDED"), k7},
          "");
    EXPECT_EQ(m_model.Refresh(), 1);
    EXPECT_EQ(Keys(m_model), "3|1|2|9| |K7|");
    JobRecord record;
    ASSERT_TRUE(ParseStatusLine(k7, record));
    EXPECT_EQ(record, (JobRecord{"K7", "/hf/In/report final.ps", "/hf/In", "PRN-02", "N/A", "PostScript",
                                 FormatDosTime("1383035055"), "Transferring to server"}));

    // A touched file is read again, even with nothing changed in it.
    wxFileName file(Journal());
    const wxDateTime later = file.GetModificationTime() + wxTimeSpan::Seconds(7);
    ASSERT_TRUE(file.SetTimes(nullptr, &later, nullptr));
    EXPECT_EQ(m_model.Refresh(), 1);
    // Only committed jobs left: the list empties, published once.
    Write({"1", "2"}, "COMMIT");
    EXPECT_EQ(m_model.Refresh(), 1);
    EXPECT_EQ(m_model.Refresh(), 0);
    EXPECT_EQ(Updates(), 3);
    EXPECT_EQ(m_ids.back(), 0);
    EXPECT_EQ(Keys(m_model), "");

    // Stopped, a free lock is still taken; the read stops at once and keeps what
    // it has, and the journal counts as not yet read.
    Write({"1"});
    ASSERT_EQ(m_model.Refresh(), 1);
    m_model.SetRunning(false);
    Write({statustest::StatusLine("1", "ADDED"), statustest::StatusLine("2", "ADDED", "Sent")}, "");
    EXPECT_EQ(m_model.Refresh(), 1);
    EXPECT_EQ(Keys(m_model), "");
    m_model.SetRunning(true);
    EXPECT_EQ(m_model.Refresh(), 1);
    EXPECT_EQ(Keys(m_model, StatusField::Status), "Saving...|Sent|");
    EXPECT_EQ(Updates(), 6);

    // A read no view shows any more is freed at the next poll, even without a change.
    std::weak_ptr<const JobSnapshot> first = m_model.GetSnapshot();
    {
        const std::shared_ptr<const JobSnapshot> shown = m_model.GetSnapshot(); // as a view holds it
        Write({"3"});
        ASSERT_EQ(m_model.Refresh(), 1);
        EXPECT_EQ(m_model.Refresh(), 0);
        EXPECT_FALSE(first.expired()) << "still shown";
    }
    EXPECT_EQ(m_model.Refresh(), 0);
    EXPECT_TRUE(first.expired()) << "the journal did not change, and the old read went all the same";
}

} // namespace
