#include <atomic>
#include <chrono>
#include <new>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>
#include <wx/init.h>

#include "pump/ServerEventListner.h"
#include "pump/TimerThread.h"

namespace
{

// The pump needs the library's thread module and an application object for its
// pending-event queues; a console application is enough.
struct WxBaseEnvironment : ::testing::Environment
{
    void SetUp() override { ASSERT_TRUE(wxInitialize()); }
    void TearDown() override { wxUninitialize(); }
};
const auto* const registered = ::testing::AddGlobalTestEnvironment(new WxBaseEnvironment);

template <typename Done> void WaitUntil(Done done)
{
    while (!done())
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
}

// Counts its passes. How a pass behaves is set before the thread starts: it
// may last until SetRunning(false) reaches it (a re-read that checks its flag
// between lines), until the test releases it (a system call that does not
// return), or throw the first time (a journal too large to hold).
struct Listener final : INotify
{
    void Notify() override
    {
        const int pass = ++passes;
        inPass = true;
        WaitUntil([&] { return (!untilStopped || !running) && (!stuck || released); });
        inPass = false;
        if (throwsFirst && pass == 1)
            throw std::bad_alloc();
    }
    void SetRunning(bool run) override { running = run; }

    bool untilStopped = false, stuck = false, throwsFirst = false;
    std::atomic<int> passes{0};
    std::atomic<bool> inPass{false}, running{true}, released{false};
};

// Sees the thread each StartTimer makes, and can refuse to create or to run it.
struct ProbedRegistry final : ServerEventListner
{
    bool CreateOsThread(TimerThread& made) override
    {
        thread = &made;
        return create && ServerEventListner::CreateOsThread(made);
    }
    bool RunOsThread(TimerThread& made) override { return run && ServerEventListner::RunOsThread(made); }

    bool create = true, run = true;
    TimerThread* thread = nullptr;
};

} // namespace

TEST(ListenerRegistry, RemovesTheFirstEntryOfExactlyThatName)
{
    // Each row: a name, then the listeners it removes in turn (indices below; -1 for none).
    const std::vector<std::pair<const char*, std::vector<int>>> cases = {
        {"OnNewData", {0, 2, -1}}, {"onnewdata", {1, -1}}, {"OnNewData ", {3, -1}}, {"Unknown", {-1}}};
    for (const auto& [name, removals] : cases)
    {
        SCOPED_TRACE(name);
        Listener listeners[4];
        ServerEventListner registry;
        const char* names[] = {"OnNewData", "onnewdata", "OnNewData", "OnNewData "};
        for (int i = 0; i < 4; ++i)
            registry.AddListener(names[i], &listeners[i]);
        for (const int removed : removals)
            EXPECT_EQ(registry.RemoveListener(name), removed < 0 ? nullptr : &listeners[removed]);
    }
}

struct StopCase
{
    const char* name;
    bool create, run;       // whether the OS thread is created and run
    bool duringPass, stuck; // StopTimer finds a pass in progress; one that never returns
};

using StopTimer = ::testing::TestWithParam<StopCase>;

// Once the thread sleeps, only StopTimer's wake-up can end it in time; a pass
// in progress only ends when SetRunning(false) reaches it, so StopTimer would
// block if it took the registry lock or skipped that step; a pass stuck in a
// system call is given up on. A thread never run must be released once: under
// the sanitizers a second deletion of the thread object, or a race with one
// that deletes itself, fails here.
TEST_P(StopTimer, EndsTheThreadOnceAndNoPassFollows)
{
    const StopCase& row = GetParam();
#if defined(__has_feature)
#if __has_feature(thread_sanitizer)
    if (row.stuck)
        GTEST_SKIP() << "the thread given up on is never joined, which ThreadSanitizer reports as a leak";
#endif
#endif
    const bool started = row.create && row.run;
    Listener listener, other;
    listener.untilStopped = row.duringPass;
    listener.stuck = row.stuck;
    ProbedRegistry registry;
    registry.create = row.create;
    registry.run = row.run;
    // Registered twice, the listener is called twice a pass.
    EXPECT_FALSE(registry.AddListener("OnNewData", nullptr));
    ASSERT_TRUE(registry.AddListener("OnNewData", &listener));
    ASSERT_TRUE(registry.AddListener("Other", &other));
    ASSERT_TRUE(registry.AddListener("Again", &listener));
    registry.SetPollingInterval(60 * 60 * 1000); // an hour: no second pass comes by itself
    ASSERT_EQ(registry.StartTimer(), started);
    EXPECT_EQ(registry.thread->GetInterval(), registry.GetPollingInterval());
    EXPECT_FALSE(registry.StartTimer());
    // The first pass runs at once: wait until it is in progress, or over and the thread asleep.
    WaitUntil(
        [&] { return !started || (row.duringPass ? listener.inPass.load() : registry.thread->IsAsleep()); });

    EXPECT_TRUE(registry.StopTimer());
    EXPECT_EQ(registry.ThreadOutlivedStop(), row.stuck);
    EXPECT_FALSE(registry.StopTimer());
    if (row.stuck)
    {
        // Let it go: it sees the stop request and ends by itself. The thread
        // holds the registry lock until its pass is over; once AddListener has
        // it, the thread touches neither object again.
        listener.released = true;
        registry.AddListener("Released", &other);
    }
    EXPECT_FALSE(listener.inPass || listener.running || other.running);
    EXPECT_EQ(listener.passes, started ? 2 : 0);
    registry.SetRunning(true);
    EXPECT_TRUE(listener.running && other.running);
}

INSTANTIATE_TEST_SUITE_P(
    PollingThread, StopTimer,
    ::testing::Values(StopCase{"WakesASleepingThread", true, true, false, false},
                      StopCase{"EndsAPassInProgressAndNoPassFollows", true, true, true, false},
                      StopCase{"GivesUpOnAPassThatNeverReturns", true, true, true, true},
                      StopCase{"ReleasesAThreadNeverCreated", false, false, false, false},
                      StopCase{"ReleasesAThreadCreatedButNeverRunOnce", true, false, false, false}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(PollingThread, APassThatThrowsCostsOnlyThatPassAndListenersComeAndGoMeanwhile)
{
    Listener listener, visitor;
    listener.throwsFirst = true;
    ServerEventListner registry;
    registry.SetPollingInterval(1);
    registry.AddListener("OnNewData", &listener);
    ASSERT_TRUE(registry.StartTimer());
    for (int round = 0; round < 2000; ++round)
    {
        EXPECT_TRUE(registry.AddListener("Visitor", &visitor));
        EXPECT_EQ(registry.RemoveListener("Visitor"), &visitor);
    }
    // However the passes fell between the rounds, the thread kept polling.
    WaitUntil([&, until = listener.passes + 2] { return listener.passes >= until; });
    EXPECT_TRUE(registry.StopTimer());
}
