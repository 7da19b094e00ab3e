// The listener registry, its polling thread, and the bus that carries the
// models' updates to the views.
#include <atomic>
#include <memory>
#include <new>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>
#include <wx/app.h>

#include "pump/ServerEventListner.h"
#include "pump/TimerThread.h"
#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"

#include "SystemRoot.h"
#include "WaitUntil.h"

namespace
{

// The pump needs the library's thread module and an application object for its
// pending-event queues; a console application is enough.
const auto* const registered = ::testing::AddGlobalTestEnvironment(new wyxtest::WxEnvironment);

struct StopCase
{
    const char* name;
    bool create, run; // whether the OS thread is created and run
    // The sleep between passes; the listener's call StopTimer finds in progress, 0: it finds the thread
    // asleep.
    int pollingMs, blockedCall;
    bool stuck, throwsFirst;
    int calls; // the listener's calls in all
};

// Counts its calls. The call numbered blockedCall lasts until SetRunning(false)
// reaches it (a re-read that checks its flag between lines), and, stuck, until
// the test releases it (a system call that does not return); with throwsFirst
// the first call throws (a journal too large to hold).
struct Listener final : INotify
{
    explicit Listener(const StopCase& how = {}) : row(how) {}
    void Notify() override
    {
        const int call = ++calls;
        inPass = true;
        blocked = call == row.blockedCall;
        WaitUntil([&] { return !blocked || (!running && (!row.stuck || released)); });
        inPass = false;
        if (row.throwsFirst && call == 1)
            throw std::bad_alloc();
    }
    void SetRunning(bool run) override { running = run; }

    const StopCase row;
    std::atomic<int> calls{0};
    std::atomic<bool> inPass{false}, blocked{false}, running{true}, released{false};
};

// Sees the thread each StartTimer makes, and can refuse to create or to run it.
struct ProbedRegistry final : ServerEventListner
{
    explicit ProbedRegistry(const StopCase& how) : row(how) {}
    bool CreateOsThread(TimerThread& made) override
    {
        thread = &made;
        return row.create && ServerEventListner::CreateOsThread(made);
    }
    bool RunOsThread(TimerThread& made) override { return row.run && ServerEventListner::RunOsThread(made); }

    const StopCase row;
    TimerThread* thread = nullptr;
};

EventBus& bus = EventBus::Get();

// Counts the events the GUI thread delivers to it, and tells the test when a
// publisher has posted to it. It leaves the bus in its destructor, as the views
// do, before its overrides go away.
struct Recorder : wxEvtHandler
{
    ~Recorder() override { bus.Unsubscribe(this); }
    bool ProcessEvent(wxEvent&) override { return ++count; }
    void QueueEvent(wxEvent* event) override
    {
        wxEvtHandler::QueueEvent(event);
        reached.Post();
    }

    int count = 0;
    wxSemaphore reached;
};

} // namespace

using StopTimer = ::testing::TestWithParam<StopCase>;

// Once the thread sleeps, only StopTimer's wake-up can end it in time; a pass
// in progress only ends when SetRunning(false) reaches it, so StopTimer would
// block if it took the registry lock or skipped that step; a pass stuck in a
// system call is given up on. A thread never run must be released once: under
// the sanitizers a second deletion of the thread object, or a race with one
// that deletes itself, fails here. A pass that throws costs only that pass.
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
    Listener listener(row), other;
    ProbedRegistry registry(row);
    // Registered twice, the listener is called twice a pass.
    EXPECT_FALSE(registry.AddListener("OnNewData", nullptr));
    ASSERT_TRUE(registry.AddListener("OnNewData", &listener));
    ASSERT_TRUE(registry.AddListener("onnewdata", &other));
    ASSERT_TRUE(registry.AddListener("OnNewData", &listener));
    registry.SetPollingInterval(row.pollingMs);
    ASSERT_EQ(registry.StartTimer(), started);
    EXPECT_EQ(registry.thread->GetInterval(), row.pollingMs);
    EXPECT_FALSE(registry.StartTimer());
    // The first pass runs at once: wait until the call is in progress, or the pass over and the thread
    // asleep.
    if (started)
        WaitUntil([&] { return row.blockedCall ? listener.blocked.load() : registry.thread->IsAsleep(); });
    // Asleep only between passes, also in a pass that follows a sleep.
    EXPECT_EQ(started && registry.thread->IsAsleep(), started && row.blockedCall == 0);

    EXPECT_TRUE(registry.StopTimer());
    EXPECT_EQ(registry.ThreadOutlivedStop(), row.stuck);
    EXPECT_FALSE(registry.StopTimer());
    // A stuck pass is let go: it sees the stop request and ends by itself. The
    // thread holds the registry lock until its pass is over; once AddListener
    // has it, the thread touches neither object again.
    listener.released = true;
    registry.AddListener("Released", &other);
    EXPECT_FALSE(listener.inPass || listener.running || other.running);
    EXPECT_EQ(listener.calls, started ? row.calls : 0);
    // Removal takes an entry of exactly that name.
    EXPECT_EQ(registry.RemoveListener("onnewdata"), &other);
    EXPECT_EQ(registry.RemoveListener("onnewdata"), nullptr);
}

INSTANTIATE_TEST_SUITE_P(
    PollingThread, StopTimer,
    // Polled once an hour: no second pass comes by itself.
    ::testing::Values(
        StopCase{"WakesASleepingThread", true, true, 3600000, 0, false, false, 2},
        StopCase{"EndsAPassInProgressAndNoPassFollows", true, true, 3600000, 1, false, false, 2},
        StopCase{"GivesUpOnAPassThatNeverReturns", true, true, 3600000, 1, true, false, 2},
        StopCase{"ReleasesAThreadNeverCreated", false, false, 3600000, 0, false, false, 0},
        StopCase{"ReleasesAThreadCreatedButNeverRunOnce", true, false, 3600000, 0, false, false, 0},
        // The throw ends the first pass at its first call; the second pass's second call is stopped.
        StopCase{"KeepsPollingAfterAPassThatThrew", true, true, 1, 3, false, true, 3}),
    [](const auto& info) { return std::string(info.param.name); });

// The bus holds its subscribers by weak reference: a handler that forgot to
// unsubscribe is skipped (under AddressSanitizer a post to it fails here), and
// its dead entry is dropped without being counted. Channels are found by id
// alone. A handler destroyed while a thread publishes is never reached.
TEST(EventBus, EachLiveSubscriptionGetsAQueuedCopyUntilItsHandlerLeaves)
{
    Recorder once, twice, leaving;
    auto* forgetful = new wxEvtHandler;
    for (wxEvtHandler* handler :
         std::initializer_list<wxEvtHandler*>{&twice, &leaving, forgetful, &once, &twice, &leaving})
        ASSERT_TRUE(bus.Subscribe(ChannelKey(1), handler));
    ASSERT_TRUE(bus.Subscribe(ChannelKey(0, "any name"), &leaving));
    delete forgetful;
    EXPECT_EQ(bus.Unsubscribe(&leaving), 3);
    // A temporary: the publisher's own event is gone before delivery.
    ASSERT_TRUE(bus.Publish(ChannelKey(1, "other"), wxCommandEvent(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS)));
    EXPECT_EQ(once.count, 0) << "delivery is queued, never synchronous";
    // The tests run a console application; wxTheApp would take it for a GUI one.
    wxAppConsole::GetInstance()->ProcessPendingEvents();
    EXPECT_EQ(std::vector<int>({once.count, twice.count, leaving.count}), std::vector<int>({1, 2, 0}));

    std::atomic<bool> publishing{true};
    std::thread publisher(
        [&]
        {
            while (publishing)
                bus.Publish(ChannelKey(2), wxCommandEvent(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS));
        });
    for (int i = 0; i < 300; ++i)
    {
        auto handler = std::make_unique<Recorder>();
        EXPECT_TRUE(bus.Subscribe(ChannelKey(2), handler.get()));
        handler->reached.Wait();
        // Destroyed while the thread keeps publishing: a post that still
        // reached it would touch freed memory (AddressSanitizer reports it).
        handler.reset();
    }
    publishing = false;
    publisher.join();
}
