#pragma once

#include <wx/string.h>

namespace wyxos
{

// One running copy per user: an exclusive flock on "<name>.lock" in the user's
// runtime folder ($XDG_RUNTIME_DIR, else the home folder). The kernel lets go
// of it when the process ends, however it ends, so a copy that crashed never
// keeps the next one from starting (a lock file naming a process id would,
// once that id belongs to another process).
class InstanceLock
{
public:
    explicit InstanceLock(const wxString& name);
    ~InstanceLock();
    InstanceLock(const InstanceLock&) = delete;
    InstanceLock& operator=(const InstanceLock&) = delete;

    // True when another process holds the lock. A lock file that cannot be
    // used (something else planted at its path) does not stop this copy.
    bool IsAnotherRunning() const { return m_anotherRunning; }

    static wxString FolderFor();

private:
    int m_fd = -1;
    bool m_anotherRunning = false;
};

} // namespace wyxos
