#include "pump/TimerThread.h"


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

bool TimerThread::WaitUntilFinished(std::chrono::milliseconds limit)
{
    std::unique_lock<std::mutex> lock(m_sleepLock);
    return m_wakeUp.wait_for(lock, limit, [this] { return m_finished; });
}

wxThread::ExitCode TimerThread::Entry()
{
    while (!m_stop)
    {
        // A pass that throws (a journal too large to hold, say) costs that
        // pass; polling goes on, or the window would show stale rows for ever.
        try
        {
            m_owner->Notify();
        }
        catch (...)
        {
        }
        std::unique_lock<std::mutex> lock(m_sleepLock);
        m_asleep = true;
        m_wakeUp.wait_for(lock, std::chrono::milliseconds(m_interval.load()),
                          [this] { return m_stop.load(); });
        m_asleep = false;
    }
    {
        std::lock_guard<std::mutex> guard(m_sleepLock);
        m_finished = true;
    }
    m_wakeUp.notify_all();
    return static_cast<ExitCode>(nullptr);
}
