#include "platform/os/FileLock.h"

#include <cerrno>
#include <chrono>
#include <thread>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include "platform/os/CommonFolders.h"
#include "platform/os/SystemPaths.h"

namespace wyxos
{

namespace
{

// Never blocks: another user may plant a FIFO where the lock file belongs.
constexpr int kOpenFlags = O_RDONLY | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK;
constexpr mode_t kLockFileMode = 0666;
// The lock folder is shared by every user, like /dev/shm itself.
constexpr unsigned kLockFolderMode = 01777;
// How long a cancellable wait sleeps between two attempts.
constexpr std::chrono::milliseconds kPollInterval{20};

// Only a regular file is a lock: a directory, FIFO or device planted in the
// shared folder is refused, and the descriptor closed.
int KeepIfRegularFile(int fd)
{
    struct stat info;
    if (fd >= 0 && (::fstat(fd, &info) != 0 || !S_ISREG(info.st_mode)))
    {
        ::close(fd);
        errno = EINVAL;
        return -1;
    }
    return fd;
}

int OpenOrCreate(const wxScopedCharBuffer& path)
{
    // Two attempts cover a lock file removed between the two opens.
    for (int attempt = 0; attempt < 2; ++attempt)
    {
        int fd = ::open(path.data(), kOpenFlags | O_CREAT | O_EXCL, kLockFileMode);
        if (fd >= 0)
        {
            ::fchmod(fd, kLockFileMode); // the umask narrowed the mode of the new file
            return fd;
        }
        if (errno != EEXIST)
            return -1;
        fd = ::open(path.data(), kOpenFlags);
        if (fd >= 0 || errno != ENOENT)
            return KeepIfRegularFile(fd);
    }
    return -1;
}

bool Flock(int descriptor, int operation)
{
    int result;
    do
        result = ::flock(descriptor, operation);
    while (result != 0 && errno == EINTR);
    return result == 0;
}

} // namespace

wxString LockFolder()
{
    return UnderSystemRoot("/dev/shm");
}

int OpenLockFile(const wxString& name)
{
    if (name.empty() || name.Contains("/"))
        return -1;
    const wxString folder = LockFolder();
    if (!MakeFolders(folder, kLockFolderMode))
        return -1;
    return OpenOrCreate((folder + "/" + name + ".lock").utf8_str());
}

void CloseLockFile(int descriptor)
{
    if (descriptor >= 0)
        ::close(descriptor);
}

bool LockFile(int descriptor, const std::atomic<bool>* keepWaiting)
{
    if (descriptor < 0)
        return false;
    if (keepWaiting == nullptr)
        return Flock(descriptor, LOCK_EX);
    // One attempt whatever the flag says: a free lock is taken even by a
    // caller that may no longer wait for a held one.
    while (true)
    {
        if (Flock(descriptor, LOCK_EX | LOCK_NB))
            return true;
        if (errno != EWOULDBLOCK || !keepWaiting->load())
            return false;
        std::this_thread::sleep_for(kPollInterval);
    }
}

bool TryLockFile(int descriptor)
{
    return descriptor >= 0 && Flock(descriptor, LOCK_EX | LOCK_NB);
}

void UnlockFile(int descriptor)
{
    if (descriptor >= 0)
        Flock(descriptor, LOCK_UN);
}

} // namespace wyxos
