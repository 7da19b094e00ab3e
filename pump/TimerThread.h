#pragma once

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <mutex>

#include <wx/thread.h>

class INotify;

// The polling thread: calls its owner's Notify at once, then once per interval
// until asked to stop. A stop request also cuts the sleep short, so the thread
// ends right after the pass in progress rather than up to one interval later.
class TimerThread : public wxThread
{
public:
    static constexpr int kInitialIntervalMs = 5000;

    explicit TimerThread(INotify* owner);
    ~TimerThread() override;

    void SetInterval(int milliseconds) { m_interval = milliseconds; }
    int GetInterval() const { return m_interval; }

    void RequestStop();
    bool IsStopRequested() const { return m_stop; }
    // Waits at most `limit` for Entry to return; true once it has.
    bool WaitUntilFinished(std::chrono::milliseconds limit);
    // True while the thread waits between two passes.
    bool IsAsleep() const { return m_asleep; }

protected:
    ExitCode Entry() override;

private:
    INotify* m_owner;
    std::atomic<int> m_interval{kInitialIntervalMs};
    std::atomic<bool> m_stop{false};
    std::atomic<bool> m_asleep{false};
    bool m_finished = false; // under m_sleepLock
    std::mutex m_sleepLock;
    std::condition_variable m_wakeUp;
};
