#include "pump/ServerEventListner.h"

#include <algorithm>

#include "pump/TimerThread.h"

ServerEventListner::ServerEventListner() = default;

ServerEventListner::~ServerEventListner() = default;

bool ServerEventListner::AddListener(const wxString& name, INotify* listener)
{
    if (listener == nullptr)
        return false;
    wxCriticalSectionLocker guard(m_lock);
    m_entries.push_back(ListenerEntry{name, listener});
    return true;
}

INotify* ServerEventListner::RemoveListener(const wxString& name)
{
    wxCriticalSectionLocker guard(m_lock);
    const auto found = std::find_if(m_entries.begin(), m_entries.end(),
                                    [&name](const ListenerEntry& entry) { return entry.name == name; });
    if (found == m_entries.end())
        return nullptr;
    INotify* listener = found->listener;
    m_entries.erase(found);
    return listener;
}

void ServerEventListner::Notify()
{
    wxCriticalSectionLocker guard(m_lock);
    for (const ListenerEntry& entry : m_entries)
        entry.listener->Notify();
}

void ServerEventListner::SetRunning(bool running)
{
    // No lock: the entries only change on this (the GUI) thread, and the pass
    // that holds the lock is the one this call has to reach.
    for (const ListenerEntry& entry : m_entries)
        entry.listener->SetRunning(running);
}

bool ServerEventListner::CreateOsThread(TimerThread& thread)
{
    return thread.Create() == wxTHREAD_NO_ERROR;
}

bool ServerEventListner::RunOsThread(TimerThread& thread)
{
    return thread.Run() == wxTHREAD_NO_ERROR;
}

bool ServerEventListner::StartTimer()
{
    if (m_thread)
        return false;
    m_thread = std::make_unique<TimerThread>(this);
    m_threadState = ThreadState::NotCreated;
    m_thread->SetInterval(m_pollingInterval);
    if (!CreateOsThread(*m_thread))
        return false;
    m_threadState = ThreadState::Created;
    if (!RunOsThread(*m_thread))
        return false;
    m_threadState = ThreadState::Running;
    return true;
}

bool ServerEventListner::StopTimer()
{
    if (!m_thread)
        return false;
    SetRunning(false);
    m_thread->RequestStop();
    switch (m_threadState)
    {
    case ThreadState::Running:
        if (m_thread->WaitUntilFinished(std::chrono::milliseconds(kStopLimitMs)))
        {
            m_thread->Wait(wxTHREAD_WAIT_BLOCK);
        }
        else
        {
            // Stuck in a system call: joining could take for ever.
            m_threadOutlivedStop = true;
            static_cast<void>(m_thread.release());
        }
        break;
    case ThreadState::Created:
        // A thread parked before Entry: wx's Delete would have it delete its
        // own object while we still use it. Run with the stop already
        // requested, it makes no pass and is joined like any other.
        if (m_thread->Run() == wxTHREAD_NO_ERROR)
            m_thread->Wait(wxTHREAD_WAIT_BLOCK);
        else
            static_cast<void>(m_thread.release()); // left parked for the process's end
        break;
    case ThreadState::NotCreated:
        break;
    }
    m_thread.reset();
    m_threadState = ThreadState::NotCreated;
    return true;
}
