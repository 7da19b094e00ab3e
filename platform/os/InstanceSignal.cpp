#include "platform/os/InstanceSignal.h"

#include <cerrno>
#include <cstdint>
#include <cstring>

#include <poll.h>
#include <sys/eventfd.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

#include "platform/os/InstanceLock.h"

namespace wyxos
{

namespace
{

// The socket's address; false when the path does not fit one.
bool AddressFor(const wxString& name, wxString& path, sockaddr_un& address)
{
    const wxString folder = InstanceLock::FolderFor();
    if (folder.empty() || name.empty() || name.Contains("/"))
        return false;
    path = folder + "/" + name + ".sock";
    const wxScopedCharBuffer bytes = path.utf8_str();
    std::memset(&address, 0, sizeof address);
    address.sun_family = AF_UNIX;
    if (bytes.length() >= sizeof address.sun_path)
        return false;
    std::memcpy(address.sun_path, bytes.data(), bytes.length());
    return true;
}

void CloseQuietly(int fd)
{
    if (fd >= 0)
        ::close(fd);
}

} // namespace

InstanceSignal::InstanceSignal(const wxString& name, std::function<void()> onKnock)
    : m_onKnock(std::move(onKnock))
{
    sockaddr_un address;
    if (!AddressFor(name, m_path, address))
        return;
    // The caller holds the instance lock, so a socket at the path is a
    // leftover of a copy that ended without removing it. Anything else there
    // was put by someone else: leave it, and listen for nobody.
    struct stat info;
    if (::lstat(address.sun_path, &info) == 0)
    {
        if (!S_ISSOCK(info.st_mode) || ::unlink(address.sun_path) != 0)
            return;
    }
    m_listenFd = ::socket(AF_UNIX, SOCK_STREAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0);
    m_wakeFd = ::eventfd(0, EFD_NONBLOCK | EFD_CLOEXEC);
    if (m_listenFd < 0 || m_wakeFd < 0 ||
        ::bind(m_listenFd, reinterpret_cast<sockaddr*>(&address), sizeof address) != 0 ||
        ::listen(m_listenFd, 4) != 0)
    {
        CloseQuietly(m_listenFd);
        CloseQuietly(m_wakeFd);
        m_listenFd = m_wakeFd = -1;
        return;
    }
    m_thread = std::thread([this] { Listen(); });
}

InstanceSignal::~InstanceSignal()
{
    if (m_thread.joinable())
    {
        const std::uint64_t one = 1;
        while (::write(m_wakeFd, &one, sizeof one) < 0 && errno == EINTR)
        {
        }
        m_thread.join();
    }
    if (m_listenFd >= 0)
        ::unlink(m_path.utf8_str());
    CloseQuietly(m_listenFd);
    CloseQuietly(m_wakeFd);
}

void InstanceSignal::Listen()
{
    while (true)
    {
        pollfd fds[2] = {{m_listenFd, POLLIN, 0}, {m_wakeFd, POLLIN, 0}};
        if (::poll(fds, 2, -1) < 0)
        {
            if (errno == EINTR)
                continue;
            return;
        }
        if (fds[1].revents != 0)
            return;
        if (fds[0].revents == 0)
            continue;
        const int peer = ::accept4(m_listenFd, nullptr, nullptr, SOCK_NONBLOCK | SOCK_CLOEXEC);
        if (peer < 0)
            continue;
        ucred credentials{};
        socklen_t size = sizeof credentials;
        const bool sameUser = ::getsockopt(peer, SOL_SOCKET, SO_PEERCRED, &credentials, &size) == 0 &&
                              credentials.uid == ::geteuid();
        ::close(peer);
        if (sameUser && m_onKnock)
            m_onKnock();
    }
}

bool InstanceSignal::Knock(const wxString& name)
{
    wxString path;
    sockaddr_un address;
    if (!AddressFor(name, path, address))
        return false;
    // Connecting to what is not a listening socket fails at once; a full
    // backlog does too (non-blocking).
    const int fd = ::socket(AF_UNIX, SOCK_STREAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0);
    if (fd < 0)
        return false;
    int result;
    do
        result = ::connect(fd, reinterpret_cast<sockaddr*>(&address), sizeof address);
    while (result != 0 && errno == EINTR);
    ::close(fd);
    return result == 0;
}

} // namespace wyxos
