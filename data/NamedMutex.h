#pragma once

#include <atomic>
#include <memory>

#include <wx/string.h>

// A named lock shared by every process and thread that uses the same name: an
// advisory lock on the lock file "<name>.lock" of the system's lock folder.
// Each object has its own descriptor, so two objects exclude each other even
// within one thread. Closing it (destruction) releases the lock.
class named_mutex
{
public:
    explicit named_mutex(const wxString& name);
    virtual ~named_mutex();

    bool IsOk() const { return m_fd >= 0; }
    int Descriptor() const { return m_fd; }

private:
    named_mutex(const named_mutex&) = delete;
    named_mutex& operator=(const named_mutex&) = delete;

    int m_fd = -1;
};

// Holds one named_mutex for the length of one operation; releases on destruction.
class named_mutex_lock
{
public:
    explicit named_mutex_lock(const wxString& name);
    ~named_mutex_lock();

    // Waits without a time limit; with keepWaiting, gives up (false) as soon as
    // it reads false. False as well when the mutex could not be created.
    bool lock(const std::atomic<bool>* keepWaiting = nullptr);
    // Does not wait.
    bool try_lock();
    // False when the lock file could not be opened: nothing can ever take it.
    bool usable() const { return m_mutex != nullptr; }
    void unlock();

private:
    named_mutex_lock(const named_mutex_lock&) = delete;
    named_mutex_lock& operator=(const named_mutex_lock&) = delete;

    wxString m_name;
    std::unique_ptr<named_mutex> m_mutex;
    bool m_locked = false;
};
