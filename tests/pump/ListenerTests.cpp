#include <atomic>
#include <condition_variable>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "pump/ServerEventListner.h"
#include "pump/TimerThread.h"

namespace
{

constexpr int kOneHourMs = 60 * 60 * 1000;

// Counts passes and lets a test wait for a number of them.
class CountingListener final : public INotify
{
public:
    void Notify() override
    {
        {
            std::lock_guard<std::mutex> guard(m_lock);
            ++m_passes;
        }
        m_changed.notify_all();
    }
    void SetRunning(bool running) override { m_running = running; }

    void WaitForPasses(int count)
    {
        std::unique_lock<std::mutex> lock(m_lock);
        m_changed.wait(lock, [&] { return m_passes >= count; });
    }
    int Passes()
    {
        std::lock_guard<std::mutex> guard(m_lock);
        return m_passes;
    }
    bool Running() const { return m_running; }

private:
    std::mutex m_lock;
    std::condition_variable m_changed;
    int m_passes = 0;
    std::atomic<bool> m_running{true};
};

// A pass that lasts until SetRunning(false) reaches it, as a journal re-read
// that checks its running flag between lines.
class LongPassListener final : public INotify
{
public:
    void Notify() override
    {
        std::unique_lock<std::mutex> lock(m_lock);
        ++m_passes;
        m_inPass = true;
        m_changed.notify_all();
        m_changed.wait(lock, [&] { return !m_running; });
        m_gaveUp = true;
        m_inPass = false;
    }
    void SetRunning(bool running) override
    {
        {
            std::lock_guard<std::mutex> guard(m_lock);
            m_running = running;
        }
        m_changed.notify_all();
    }

    void WaitUntilInPass()
    {
        std::unique_lock<std::mutex> lock(m_lock);
        m_changed.wait(lock, [&] { return m_inPass; });
    }
    int Passes()
    {
        std::lock_guard<std::mutex> guard(m_lock);
        return m_passes;
    }
    bool GaveUp()
    {
        std::lock_guard<std::mutex> guard(m_lock);
        return m_gaveUp && !m_inPass;
    }

private:
    std::mutex m_lock;
    std::condition_variable m_changed;
    int m_passes = 0;
    bool m_inPass = false;
    bool m_running = true;
    bool m_gaveUp = false;
};

// Records the order in which a registry reaches its listeners.
class TracingListener final : public INotify
{
public:
    TracingListener(std::string name, std::vector<std::string>& trace)
        : m_name(std::move(name)), m_trace(trace)
    {
    }
    void Notify() override { m_trace.push_back(m_name + ".Notify"); }
    void SetRunning(bool running) override { m_trace.push_back(m_name + (running ? ".Run" : ".Stop")); }

private:
    std::string m_name;
    std::vector<std::string>& m_trace;
};

// A registry whose operating-system thread cannot be created.
class NoThreadListener final : public ServerEventListner
{
protected:
    bool CreateOsThread(TimerThread&) override { return false; }
};

} // namespace

TEST(ListenerRegistry, RefusesANullListener)
{
    ServerEventListner registry;
    EXPECT_FALSE(registry.AddListener("OnNewData", nullptr));
    EXPECT_EQ(registry.RemoveListener("OnNewData"), nullptr);
}

TEST(ListenerRegistry, NotifiesAndStopsEveryListenerInRegistrationOrder)
{
    std::vector<std::string> trace;
    TracingListener first("first", trace), second("second", trace);
    ServerEventListner registry;
    ASSERT_TRUE(registry.AddListener("OnNewData", &first));
    ASSERT_TRUE(registry.AddListener("OnNewData", &second));
    ASSERT_TRUE(registry.AddListener("Again", &first));

    registry.Notify();
    registry.SetRunning(false);

    const std::vector<std::string> expected = {"first.Notify", "second.Notify", "first.Notify",
                                               "first.Stop",   "second.Stop",   "first.Stop"};
    EXPECT_EQ(trace, expected);
}

struct RemovalCase
{
    const char* name;
    std::vector<int> expectedListeners; // indices into the registered listeners; -1 for none
};

class ListenerRemoval : public ::testing::TestWithParam<RemovalCase>
{
};

TEST_P(ListenerRemoval, RemovesTheFirstEntryOfExactlyThatName)
{
    // Registered: OnNewData(0), onnewdata(1), OnNewData(2), OnNewData (3).
    std::vector<std::string> trace;
    TracingListener listeners[] = {{"0", trace}, {"1", trace}, {"2", trace}, {"3", trace}};
    ServerEventListner registry;
    registry.AddListener("OnNewData", &listeners[0]);
    registry.AddListener("onnewdata", &listeners[1]);
    registry.AddListener("OnNewData", &listeners[2]);
    registry.AddListener("OnNewData ", &listeners[3]);

    for (const int expected : GetParam().expectedListeners)
    {
        INotify* removed = registry.RemoveListener(GetParam().name);
        EXPECT_EQ(removed, expected < 0 ? nullptr : static_cast<INotify*>(&listeners[expected]));
    }
}

INSTANTIATE_TEST_SUITE_P(Names, ListenerRemoval,
                         ::testing::Values(RemovalCase{"OnNewData", {0, 2, -1}},
                                           RemovalCase{"onnewdata", {1, -1}},
                                           RemovalCase{"OnNewData ", {3, -1}}, RemovalCase{"Unknown", {-1}},
                                           RemovalCase{"", {-1}}));

TEST(ListenerRegistry, RemovalKeepsTheOrderOfTheRest)
{
    std::vector<std::string> trace;
    TracingListener a("a", trace), b("b", trace), c("c", trace);
    ServerEventListner registry;
    registry.AddListener("a", &a);
    registry.AddListener("b", &b);
    registry.AddListener("c", &c);
    ASSERT_EQ(registry.RemoveListener("b"), &b);
    registry.Notify();
    EXPECT_EQ(trace, (std::vector<std::string>{"a.Notify", "c.Notify"}));
}

TEST(PollingThread, StartsOnceAndStopsOnce)
{
    CountingListener listener;
    ServerEventListner registry;
    registry.AddListener("OnNewData", &listener);
    EXPECT_EQ(registry.GetPollingInterval(), 1000);
    EXPECT_FALSE(registry.StopTimer());

    registry.SetPollingInterval(kOneHourMs);
    ASSERT_TRUE(registry.StartTimer());
    EXPECT_FALSE(registry.StartTimer());
    // The first pass runs at once, not after the first interval.
    listener.WaitForPasses(1);

    // The thread now sleeps for an hour: StopTimer must wake it rather than wait.
    EXPECT_TRUE(registry.StopTimer());
    EXPECT_FALSE(registry.HasTimer());
    EXPECT_FALSE(registry.StopTimer());
    EXPECT_EQ(listener.Passes(), 1);
    EXPECT_FALSE(listener.Running());
}

TEST(PollingThread, StopTimerEndsAPassInProgressAndNoPassFollows)
{
    LongPassListener listener;
    ServerEventListner registry;
    registry.AddListener("OnNewData", &listener);
    registry.SetPollingInterval(0);
    ASSERT_TRUE(registry.StartTimer());
    listener.WaitUntilInPass();

    // The pass only ends when SetRunning(false) reaches it; StopTimer would
    // block for ever if it took the registry lock or skipped that step.
    ASSERT_TRUE(registry.StopTimer());
    EXPECT_TRUE(listener.GaveUp());
    const int passesAtStop = listener.Passes();
    EXPECT_EQ(passesAtStop, 1);

    // The thread is joined: nothing can run a pass any more.
    registry.Notify();
    EXPECT_EQ(listener.Passes(), passesAtStop + 1);
}

TEST(PollingThread, ListenersComeAndGoWhileTheThreadPolls)
{
    CountingListener resident, visitor;
    ServerEventListner registry;
    registry.AddListener("OnNewData", &resident);
    registry.SetPollingInterval(1);
    ASSERT_TRUE(registry.StartTimer());

    constexpr int kRounds = 2000;
    int removed = 0;
    for (int round = 0; round < kRounds; ++round)
    {
        ASSERT_TRUE(registry.AddListener("Visitor", &visitor));
        removed += registry.RemoveListener("Visitor") == &visitor ? 1 : 0;
    }
    // However the passes fell between the rounds, the thread kept polling.
    resident.WaitForPasses(resident.Passes() + 2);
    ASSERT_TRUE(registry.StopTimer());

    EXPECT_EQ(removed, kRounds);
    EXPECT_EQ(registry.RemoveListener("Visitor"), nullptr);
    EXPECT_EQ(registry.RemoveListener("OnNewData"), &resident);
}

TEST(PollingThread, AThreadThatWasNeverCreatedDoesNotBlockStopTimer)
{
    CountingListener listener;
    NoThreadListener registry;
    registry.AddListener("OnNewData", &listener);

    EXPECT_FALSE(registry.StartTimer());
    EXPECT_TRUE(registry.HasTimer());
    EXPECT_FALSE(registry.StartTimer());
    EXPECT_TRUE(registry.StopTimer());
    EXPECT_FALSE(registry.HasTimer());
    EXPECT_EQ(listener.Passes(), 0);
    EXPECT_FALSE(listener.Running());
}

TEST(PollingThread, ThreadStartsWithTheLongIntervalAndStopsWhileAsleep)
{
    CountingListener listener;
    TimerThread thread(&listener);
    EXPECT_EQ(thread.GetInterval(), TimerThread::kInitialIntervalMs);
    EXPECT_FALSE(thread.IsStopRequested());

    thread.SetInterval(kOneHourMs);
    ASSERT_EQ(thread.Create(), wxTHREAD_NO_ERROR);
    ASSERT_EQ(thread.Run(), wxTHREAD_NO_ERROR);
    listener.WaitForPasses(1);
    // The flag is set under the lock the sleep releases: once it shows, the
    // stop request below can only arrive while the thread waits.
    while (!thread.IsAsleep())
        std::this_thread::yield();
    thread.RequestStop();
    thread.Wait();
    EXPECT_EQ(listener.Passes(), 1);
}

TEST(PollingThread, AStopRequestedBeforeTheThreadRunsMeansNoPass)
{
    CountingListener listener;
    TimerThread thread(&listener);
    thread.RequestStop();
    ASSERT_EQ(thread.Run(), wxTHREAD_NO_ERROR);
    thread.Wait();
    EXPECT_EQ(listener.Passes(), 0);
}

namespace
{
// Throws on its first pass, as a read of a journal too large to hold would.
class ThrowingListener final : public INotify
{
public:
    void Notify() override
    {
        if (m_passes++ == 0)
            throw std::bad_alloc();
    }
    void SetRunning(bool) override {}
    int Passes() const { return m_passes; }

private:
    std::atomic<int> m_passes{0};
};

// Never comes back from its pass, like a system call that does not return.
class StuckListener final : public INotify
{
public:
    void Notify() override
    {
        m_entered = true;
        std::unique_lock<std::mutex> lock(m_lock);
        m_release.wait(lock, [this] { return m_released; });
    }
    void SetRunning(bool) override {}
    bool Entered() const { return m_entered; }
    void Release()
    {
        {
            std::lock_guard<std::mutex> guard(m_lock);
            m_released = true;
        }
        m_release.notify_all();
    }

private:
    std::atomic<bool> m_entered{false};
    std::mutex m_lock;
    std::condition_variable m_release;
    bool m_released = false;
};

// Creates its thread, then fails to run it.
class NeverRunListener final : public ServerEventListner
{
protected:
    bool RunOsThread(TimerThread&) override { return false; }
};
} // namespace

TEST(PollingThread, APassThatThrowsCostsOnlyThatPass)
{
    ThrowingListener listener;
    ServerEventListner registry;
    registry.SetPollingInterval(1);
    registry.AddListener("OnNewData", &listener);
    ASSERT_TRUE(registry.StartTimer());
    while (listener.Passes() < 3)
        std::this_thread::yield();
    EXPECT_TRUE(registry.StopTimer());
    EXPECT_FALSE(registry.ThreadOutlivedStop());
}

TEST(PollingThread, StopTimerGivesUpOnAPassThatNeverReturns)
{
#if defined(__has_feature)
#if __has_feature(thread_sanitizer)
    GTEST_SKIP() << "the thread given up on is never joined, which ThreadSanitizer reports as a leak";
#endif
#endif
    // Both outlive the test: the thread still runs in them after StopTimer.
    static StuckListener listener;
    static ServerEventListner registry;
    registry.AddListener("OnNewData", &listener);
    ASSERT_TRUE(registry.StartTimer());
    while (!listener.Entered())
        std::this_thread::yield();
    EXPECT_TRUE(registry.StopTimer());
    EXPECT_TRUE(registry.ThreadOutlivedStop());
    EXPECT_FALSE(registry.HasTimer());
    // Let it go: it sees the stop request and ends by itself.
    listener.Release();
}

TEST(PollingThread, AThreadCreatedButNeverRunIsReleasedOnce)
{
    CountingListener listener;
    NeverRunListener registry;
    registry.AddListener("OnNewData", &listener);
    EXPECT_FALSE(registry.StartTimer());
    // Under the sanitizers a second deletion of the thread object, or a race
    // with one that deletes itself, fails here.
    EXPECT_TRUE(registry.StopTimer());
    EXPECT_FALSE(registry.HasTimer());
    EXPECT_EQ(listener.Passes(), 0);
}
