#include "data/NamedMutex.h"

#include "platform/os/FileLock.h"

named_mutex::named_mutex(const wxString& name) : m_fd(wyxos::OpenLockFile(name)) {}

named_mutex::~named_mutex()
{
    wyxos::CloseLockFile(m_fd);
}

named_mutex_lock::named_mutex_lock(const wxString& name) : m_name(name)
{
    auto mutex = std::make_unique<named_mutex>(name);
    if (mutex->IsOk())
        m_mutex = std::move(mutex);
}

named_mutex_lock::~named_mutex_lock()
{
    unlock();
}

bool named_mutex_lock::lock(const std::atomic<bool>* keepWaiting)
{
    if (!m_mutex)
        return false;
    m_locked = m_locked || wyxos::LockFile(m_mutex->Descriptor(), keepWaiting);
    return m_locked;
}

bool named_mutex_lock::try_lock()
{
    if (!m_mutex)
        return false;
    m_locked = m_locked || wyxos::TryLockFile(m_mutex->Descriptor());
    return m_locked;
}

void named_mutex_lock::unlock()
{
    if (m_mutex && m_locked)
        wyxos::UnlockFile(m_mutex->Descriptor());
    m_locked = false;
}
