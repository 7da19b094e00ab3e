// What the status view is told when its journal cannot be read: the journal
// watch's rules from a table, and the model over lock paths another user
// planted, which it must neither wait on nor follow.
#include <gtest/gtest.h>

#include <sys/file.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

#include <functional>

#include "StatusTestSupport.h"
#include "data/JobStatusManager.h"
#include "data/JournalWatch.h"

namespace
{

const auto* const kWx = testing::AddGlobalTestEnvironment(new statustest::WxEnvironment);

using State = JournalWatch::State;

struct Poll
{
    char outcome; // r read, b busy, u unreadable
    bool told;
    State state;
    std::time_t since;
    bool recovered;
};

TEST(JournalWatch, TellsOfABusyJournalAfterAFewPollsAndOfAnUnreadableOneAtOnce)
{
    const std::vector<std::vector<Poll>> sequences = {
        // A lock held at two polls is a producer at work: no news.
        {{'b', false, State::Readable, 0, false}, {'b', false, State::Readable, 0, false},
         {'r', false, State::Readable, 0, false}},
        // Busy since the first of three polls in a row; readable again when read.
        {{'b', false, State::Readable, 0, false}, {'b', false, State::Readable, 0, false},
         {'b', true, State::Busy, 1, false}, {'b', false, State::Busy, 1, false},
         {'r', true, State::Readable, 5, true}, {'r', false, State::Readable, 5, true}},
        {{'u', true, State::Unreadable, 1, false}, {'u', false, State::Unreadable, 1, false},
         {'b', false, State::Unreadable, 1, false}, {'r', true, State::Readable, 4, true}},
        {{'b', false, State::Readable, 0, false}, {'r', false, State::Readable, 0, false},
         {'b', false, State::Readable, 0, false}, {'b', false, State::Readable, 0, false}},
    };
    for (std::size_t s = 0; s < sequences.size(); ++s)
    {
        JournalWatch watch;
        std::time_t now = 0;
        for (const Poll& poll : sequences[s])
        {
            ++now;
            const bool told = poll.outcome == 'r'   ? watch.NoteRead(now)
                              : poll.outcome == 'b' ? watch.NoteBusy(now)
                                                    : watch.NoteUnreadable(now);
            const JournalWatch::Report report = watch.Get();
            EXPECT_EQ(told, poll.told) << "sequence " << s << " poll " << now;
            EXPECT_EQ(report.state, poll.state) << "sequence " << s << " poll " << now;
            EXPECT_EQ(report.since, poll.since) << "sequence " << s << " poll " << now;
            EXPECT_EQ(report.recovered, poll.recovered) << "sequence " << s << " poll " << now;
        }
    }
}

// Something other than a lock file, put where the status journal's lock belongs.
struct Planted
{
    const char* name;
    std::function<void(const std::string& path)> plant;
};

class PlantedLockPath : public testing::TestWithParam<Planted>
{
};

TEST_P(PlantedLockPath, IsNeverWaitedOnAndTheJournalIsReportedUnreadable)
{
    statustest::SystemRoot root;
    statustest::WriteFile(root.JournalPath(), statustest::StatusLine("1", "ADDED") + "\n");
    ::mkdir((root.Path() + "/dev").utf8_str(), 0755);
    ::mkdir((root.Path() + "/dev/shm").utf8_str(), 01777);
    GetParam().plant(root.LockPath().ToStdString());

    JobStatusManager manager(root.JournalPath());
    statustest::UpdateCounter updates;
    // A FIFO opened for reading would block here for ever.
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_EQ(manager.GetJournalReport().state, State::Unreadable);
    EXPECT_EQ(updates.Delivered(), 1) << "the view is told once";
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_EQ(updates.Delivered(), 1);

    // Once the path is a lock file again, the journal is read and the view told.
    ::unlink(root.LockPath().utf8_str());
    ::rmdir(root.LockPath().utf8_str());
    statustest::WriteFile(root.JournalPath(), statustest::StatusLine("2", "ADDED") + "\n");
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_TRUE(manager.GetJournalReport().recovered);
}

INSTANTIATE_TEST_SUITE_P(
    Kinds, PlantedLockPath,
    testing::Values(Planted{"Fifo", [](const std::string& path) { ASSERT_EQ(::mkfifo(path.c_str(), 0666), 0); }},
                    Planted{"Directory", [](const std::string& path) { ASSERT_EQ(::mkdir(path.c_str(), 0777), 0); }},
                    Planted{"SymbolicLink",
                            [](const std::string& path) { ASSERT_EQ(::symlink("/etc/passwd", path.c_str()), 0); }},
                    Planted{"Socket",
                            [](const std::string& path)
                            {
                                const int fd = ::socket(AF_UNIX, SOCK_STREAM, 0);
                                sockaddr_un address{};
                                address.sun_family = AF_UNIX;
                                ASSERT_LT(path.size(), sizeof(address.sun_path));
                                path.copy(address.sun_path, path.size());
                                ASSERT_EQ(::bind(fd, reinterpret_cast<sockaddr*>(&address), sizeof(address)), 0);
                                ::close(fd);
                            }}),
    [](const testing::TestParamInfo<Planted>& info) { return std::string(info.param.name); });

TEST(StatusModelLock, AProducerHoldingTheLockMakesTheJournalBusyWithoutBlockingThePoll)
{
    statustest::SystemRoot root;
    statustest::WriteFile(root.JournalPath(), statustest::StatusLine("1", "ADDED") + "\n");
    JobStatusManager manager(root.JournalPath());
    statustest::UpdateCounter updates;
    ASSERT_EQ(manager.Refresh(), 1);

    ::mkdir((root.Path() + "/dev/shm").utf8_str(), 01777);
    const int producer = ::open(root.LockPath().utf8_str(), O_RDONLY | O_CREAT, 0666);
    ASSERT_EQ(::flock(producer, LOCK_EX), 0);
    statustest::WriteFile(root.JournalPath(), statustest::StatusLine("2", "ADDED") + "\n");
    for (int poll = 1; poll < JournalWatch::kBusyPolls; ++poll)
        EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_EQ(manager.GetJournalReport().state, State::Readable) << "a producer at work is no news";
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_EQ(manager.GetJournalReport().state, State::Busy);
    EXPECT_EQ(updates.Delivered(), 2) << "told of the busy journal";

    ::close(producer);
    EXPECT_EQ(manager.Refresh(), 1);
    EXPECT_EQ(manager.GetJournalReport().state, State::Readable);
    EXPECT_TRUE(manager.GetJournalReport().recovered);
}

TEST(StatusModelMemory, AReadNoViewShowsAnyMoreIsFreedAtTheNextPollEvenWithoutAChange)
{
    statustest::SystemRoot root;
    statustest::WriteFile(root.JournalPath(), statustest::StatusLine("1", "ADDED") + "\n");
    JobStatusManager manager(root.JournalPath());
    ASSERT_EQ(manager.Refresh(), 1);
    std::weak_ptr<const JobSnapshot> first = manager.GetSnapshot();
    {
        const std::shared_ptr<const JobSnapshot> shown = manager.GetSnapshot(); // as a view holds it
        statustest::WriteFile(root.JournalPath(), statustest::StatusLine("2", "ADDED") + "\n");
        ASSERT_EQ(manager.Refresh(), 1);
        EXPECT_EQ(manager.Refresh(), 0);
        EXPECT_FALSE(first.expired()) << "still shown";
    }
    EXPECT_EQ(manager.Refresh(), 0);
    EXPECT_TRUE(first.expired()) << "the journal did not change, and the old read went all the same";
}

} // namespace
