#include "platform/os/InstanceLock.h"

#include <cerrno>
#include <cstdlib>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

namespace wyxos
{

wxString InstanceLock::FolderFor()
{
    for (const char* variable : {"XDG_RUNTIME_DIR", "HOME"})
    {
        const char* folder = std::getenv(variable);
        struct stat info;
        // Only a folder of our own: another user could otherwise hold our lock.
        if (folder != nullptr && *folder == '/' && ::stat(folder, &info) == 0 && S_ISDIR(info.st_mode) &&
            info.st_uid == ::geteuid())
            return wxString::FromUTF8(folder);
    }
    return wxString();
}

InstanceLock::InstanceLock(const wxString& name)
{
    const wxString folder = FolderFor();
    if (folder.empty() || name.empty() || name.Contains("/"))
        return;
    const wxString path = folder + "/" + name + ".lock";
    m_fd = ::open(path.utf8_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK, 0600);
    struct stat info;
    if (m_fd >= 0 && (::fstat(m_fd, &info) != 0 || !S_ISREG(info.st_mode)))
    {
        ::close(m_fd);
        m_fd = -1;
    }
    if (m_fd < 0)
        return;
    int result;
    do
        result = ::flock(m_fd, LOCK_EX | LOCK_NB);
    while (result != 0 && errno == EINTR);
    m_anotherRunning = result != 0 && errno == EWOULDBLOCK;
}

InstanceLock::~InstanceLock()
{
    if (m_fd >= 0)
        ::close(m_fd);
}

} // namespace wyxos
