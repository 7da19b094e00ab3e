#pragma once

#include <memory>
#include <vector>

#include <wx/string.h>
#include <wx/thread.h>

#include "pump/INotify.h"

class TimerThread;

// One registered listener. Names need not be unique; the listener is not owned.
struct ListenerEntry
{
    wxString name;
    INotify* listener;
};

// The listener registry. It owns the polling thread, and each pass of that
// thread is its own Notify, which runs every registered listener in
// registration order under the registry lock.
//
// Everything but Notify runs on the GUI thread. AddListener and RemoveListener
// wait for a pass in progress; SetRunning does not, so that it reaches a long
// pass while it runs.
class ServerEventListner : public INotify
{
public:
    static constexpr int kPollingIntervalMs = 1000;

    ServerEventListner();
    // Does not touch the thread: the owner calls StopTimer first.
    virtual ~ServerEventListner();

    bool AddListener(const wxString& name, INotify* listener);
    // The first entry of exactly that name, removed; null when there is none.
    INotify* RemoveListener(const wxString& name);

    void Notify() override;
    void SetRunning(bool running) override;

    // True when the polling thread runs; its first pass starts at once.
    bool StartTimer();
    // Stops every listener's pass in progress, then ends and joins the thread.
    // False when there was no thread. A thread still inside a pass after
    // kStopLimitMs is left to the end of the process (see ThreadOutlivedStop).
    bool StopTimer();
    // True when the last StopTimer gave up on a thread stuck in a system call:
    // the models it uses must then outlive it, so the process ends at once.
    bool ThreadOutlivedStop() const { return m_threadOutlivedStop; }

    static constexpr int kStopLimitMs = 1500;

    bool HasTimer() const { return m_thread != nullptr; }

    // The sleep between passes of threads started afterwards (tools, tests).
    void SetPollingInterval(int milliseconds) { m_pollingInterval = milliseconds; }
    int GetPollingInterval() const { return m_pollingInterval; }

protected:
    // Creates the operating-system thread of a new TimerThread, and lets it run.
    virtual bool CreateOsThread(TimerThread& thread);
    virtual bool RunOsThread(TimerThread& thread);

private:
    enum class ThreadState
    {
        NotCreated, // the object exists but no OS thread: nothing to wait for
        Created,    // an OS thread parked before Entry: run with the stop requested, then joined
        Running,
    };

    ServerEventListner(const ServerEventListner&) = delete;
    ServerEventListner& operator=(const ServerEventListner&) = delete;

    std::vector<ListenerEntry> m_entries;
    std::unique_ptr<TimerThread> m_thread;
    ThreadState m_threadState = ThreadState::NotCreated;
    bool m_threadOutlivedStop = false;
    int m_pollingInterval = kPollingIntervalMs;
    wxCriticalSection m_lock;
};
