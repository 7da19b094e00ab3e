// The status model's own rules; what it shares with the log model is in JournalPollTest.cpp.
#include <gtest/gtest.h>

#include "StatusTestSupport.h"
#include "data/DosTime.h"
#include "data/JobStatusManager.h"
#include "data/StatusLine.h"

namespace
{

using statustest::StatusLine;

const auto* const kWx = testing::AddGlobalTestEnvironment(new statustest::WxEnvironment);

std::vector<wxString> Keys(const JobStatusManager& manager, std::size_t field = StatusField::Key)
{
    std::vector<JobRecord> jobs;
    manager.GetJobs(jobs);
    std::vector<wxString> keys;
    for (const JobRecord& job : jobs)
        keys.push_back(job[field]);
    return keys;
}

TEST(StatusLineParsing, ShowsOnlyWholeLinesOfLiveJobs)
{
    const std::vector<std::pair<wxString, bool>> lines = {
        {StatusLine("1", "ADDED"), true},
        {StatusLine("1", "MODIFIED"), true},
        {StatusLine("1", "Modified"), true},
        {StatusLine("1", "COMMIT"), false},
        {StatusLine("1", "ADDED2"), false},
        {"1\t/hf\t/hf/a.pdf\tPRN\t1383035055\tSaving...\t\tPDF\tADDED", false}, // an empty piece gives 8
        {"1\t/hf\t/hf/a.pdf\tPRN\t1383035055\tSaving...\tPDF\tADDED", false},
        {StatusLine("1", "extra\tADDED"), false},
        {"\t\t" + StatusLine("1", "ADDED") + "\t", true},
        {StatusLine(" ", "ADDED"), true},
        {"", false},
        {"\t\t\t", false},
        {"ADDED", false},
        {StatusLine("1", "ADDED\r"), false}};
    for (const auto& [line, shown] : lines)
    {
        JobRecord record;
        EXPECT_EQ(ParseStatusLine(line, record), shown) << line;
    }

    JobRecord record;
    ASSERT_TRUE(ParseStatusLine("K7\t/hf/In\t/hf/In/report final.ps\tPRN-02\t1383035055\tTransferring to "
                                "server\tN/A\tPostScript\tadded",
                                record));
    EXPECT_EQ(record, (JobRecord{"K7", "/hf/In/report final.ps", "/hf/In", "PRN-02", "N/A", "PostScript",
                                 FormatDosTime("1383035055"), "Transferring to server"}));
    EXPECT_FALSE(record[StatusField::TimeText].empty());
}

class StatusModel : public testing::Test
{
protected:
    void Write(const std::vector<wxString>& lines)
    {
        wxString text;
        for (const wxString& line : lines)
            text += line + "\r\n";
        statustest::WriteFile(m_root.JournalPath(), text);
    }

    statustest::SystemRoot m_root;
    statustest::UpdateCounter m_updates;
};

TEST_F(StatusModel, KeepsJournalOrderSkipsLinesOfNoLiveJobAndPublishesEachNewList)
{
    Write({StatusLine("3", "ADDED"), "", StatusLine("4", "COMMIT"), "garbage line",
           "5\t/hf\t/hf/a.pdf\tPRN\t1383035055\tSaving...\t\tPDF\tADDED", StatusLine("1", "modified"),
           StatusLine("2", "ADDED")});
    JobStatusManager manager(m_root.JournalPath());
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(Keys(manager), (std::vector<wxString>{"3", "1", "2"}));

    // A touched file is read again, even with nothing changed in it.
    wxFileName file(m_root.JournalPath());
    const wxDateTime later = file.GetModificationTime() + wxTimeSpan::Seconds(7);
    ASSERT_TRUE(file.SetTimes(nullptr, &later, nullptr));
    EXPECT_EQ(manager.Refresh(), 1);

    // Only committed jobs left: the list empties, published once.
    Write({StatusLine("1", "COMMIT"), StatusLine("2", "COMMIT")});
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_EQ(m_updates.Delivered(), 3);
    EXPECT_EQ(m_updates.LastId(), 0);
    EXPECT_TRUE(Keys(manager).empty());
}

TEST_F(StatusModel, WhileStoppedAFreeLockIsTakenAndTheCutReadIsReadWholeLater)
{
    Write({StatusLine("1", "ADDED")});
    JobStatusManager manager(m_root.JournalPath());
    ASSERT_EQ(manager.Refresh(), 1);

    // Stopped, a free lock is still taken; the read stops at once and keeps
    // what it has, and the journal counts as not yet read.
    manager.SetRunning(false);
    Write({StatusLine("1", "ADDED"), StatusLine("2", "ADDED", "Sent")});
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(Keys(manager), std::vector<wxString>{});
    EXPECT_EQ(m_updates.Delivered(), 2);

    manager.SetRunning(true);
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(Keys(manager), (std::vector<wxString>{"1", "2"}));
    EXPECT_EQ(Keys(manager, StatusField::Status), (std::vector<wxString>{"Saving...", "Sent"}));
    EXPECT_EQ(m_updates.Delivered(), 3);
}

TEST_F(StatusModel, AReadNoViewShowsAnyMoreIsFreedAtTheNextPollEvenWithoutAChange)
{
    Write({StatusLine("1", "ADDED")});
    JobStatusManager manager(m_root.JournalPath());
    ASSERT_EQ(manager.Refresh(), 1);
    std::weak_ptr<const JobSnapshot> first = manager.GetSnapshot();
    {
        const std::shared_ptr<const JobSnapshot> shown = manager.GetSnapshot(); // as a view holds it
        Write({StatusLine("2", "ADDED")});
        ASSERT_EQ(manager.Refresh(), 1);
        EXPECT_EQ(manager.Refresh(), 0);
        EXPECT_FALSE(first.expired()) << "still shown";
    }
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_TRUE(first.expired()) << "the journal did not change, and the old read went all the same";
}

// Each row: r read, b busy or u unreadable, then what the watch says after it:
// whether to tell the view, the state (R, B, U), since when, and whether recovered (+).
TEST(JournalWatch, TellsOfABusyJournalAfterAFewPollsAndOfAnUnreadableOneAtOnce)
{
    const std::vector<std::vector<const char*>> sequences = {
        // A lock held at two polls is a producer at work: no news.
        {"b-R0", "b-R0", "r-R0"},
        // Busy since the first of three polls in a row; readable again when read.
        {"b-R0", "b-R0", "b!B1", "b-B1", "r!R5+", "r-R5+"},
        {"u!U1", "u-U1", "b-U1", "r!R4+"},
        {"b-R0", "r-R0", "b-R0", "b-R0"}};
    for (const auto& sequence : sequences)
    {
        JournalWatch watch;
        std::time_t now = 0;
        for (const std::string poll : sequence)
        {
            SCOPED_TRACE(poll + " at poll " + std::to_string(++now));
            const bool told = poll[0] == 'r'   ? watch.NoteRead(now)
                              : poll[0] == 'b' ? watch.NoteBusy(now)
                                               : watch.NoteUnreadable(now);
            const JournalWatch::Report report = watch.Get();
            EXPECT_EQ(told, poll[1] == '!');
            EXPECT_EQ(report.state, poll[2] == 'R'   ? JournalWatch::State::Readable
                                    : poll[2] == 'B' ? JournalWatch::State::Busy
                                                     : JournalWatch::State::Unreadable);
            EXPECT_EQ(report.since, poll[3] - '0');
            EXPECT_EQ(report.recovered, poll.size() > 4);
        }
    }
}

} // namespace
