#pragma once

#include <atomic>

#include <wx/string.h>

namespace wyxos
{

// Named locks between processes: an advisory whole-file lock (flock) on
// "<name>.lock" in the lock folder, /dev/shm below the system root. Any
// producer, a shell script with util-linux flock included, takes the same lock.
wxString LockFolder();

// Opens (creating it, and the folder, when missing) the lock file of a name;
// -1 on failure, also when something other than a regular file stands there
// (it is never waited on or followed). A new lock file is readable by every user whatever the umask,
// so that producer and consumer under different accounts share it.
int OpenLockFile(const wxString& name);
void CloseLockFile(int descriptor);

// Waits for the exclusive lock. With keepWaiting, polls without blocking and
// gives up (false) once the flag reads false, after one attempt in any case;
// without it, waits for ever.
bool LockFile(int descriptor, const std::atomic<bool>* keepWaiting);
// Takes the exclusive lock only if it is free right now.
bool TryLockFile(int descriptor);
void UnlockFile(int descriptor);

} // namespace wyxos
