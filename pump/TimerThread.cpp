#include "pump/TimerThread.h"

#include <chrono>

#include "pump/INotify.h"

TimerThread::TimerThread(INotify* owner) : wxThread(wxTHREAD_JOINABLE), m_owner(owner) {}

TimerThread::~TimerThread() = default;

void TimerThread::RequestStop()
{
    {
        // Set under the sleep lock so that a thread about to sleep cannot miss it.
        std::lock_guard<std::mutex> guard(m_sleepLock);
        m_stop = true;
    }
    m_wakeUp.notify_all();
}

wxThread::ExitCode TimerThread::Entry()
{
    while (!m_stop)
    {
        m_owner->Notify();
        std::unique_lock<std::mutex> lock(m_sleepLock);
        m_asleep = true;
        m_wakeUp.wait_for(lock, std::chrono::milliseconds(m_interval.load()),
                          [this] { return m_stop.load(); });
        m_asleep = false;
    }
    return static_cast<ExitCode>(nullptr);
}
