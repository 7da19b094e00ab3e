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

// Shown are whole lines of nine pieces (empty ones do not count) of live jobs, in journal order.
TEST_F(StatusModel, KeepsJournalOrderShowsOnlyWholeLinesOfLiveJobsAndPublishesEachNewList)
{
    const wxString k7 =
        "K7\t/hf/In\t/hf/In/report final.ps\tPRN-02\t1383035055\tTransferring to server\tN/A\t"
        "PostScript\tadded";
    Write({StatusLine("3", "ADDED"), "", StatusLine("4", "COMMIT"), "ADDED", "\t\t\t",
           "5\t/hf\t/hf/a.pdf\tPRN\t1383035055\tSaving...\t\tPDF\tADDED",
           "6\t/hf\t/hf/a.pdf\tPRN\t1383035055\tSaving...\tPDF\tADDED", StatusLine("7", "extra\tADDED"),
           StatusLine("8", "ADDED2"), StatusLine("1", "modified"), StatusLine("2", "MODIFIED"),
           "\t\t" + StatusLine("9", "ADDED") + "\t", StatusLine(" ", "ADDED"), k7});
    JobStatusManager manager(m_root.JournalPath());
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(Keys(manager), (std::vector<wxString>{"3", "1", "2", "9", " ", "K7"}));
    JobRecord record;
    EXPECT_FALSE(ParseStatusLine(StatusLine("1", "ADDED\r"), record)) << "a carriage return stays in the tag";
    ASSERT_TRUE(ParseStatusLine(k7, record));
    EXPECT_EQ(record, (JobRecord{"K7", "/hf/In/report final.ps", "/hf/In", "PRN-02", "N/A", "PostScript",
                                 FormatDosTime("1383035055"), "Transferring to server"}));
    EXPECT_FALSE(record[StatusField::TimeText].empty());

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
