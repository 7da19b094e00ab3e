#include "platform/os/FileContents.h"

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cstdlib>
#include <memory>
#include <vector>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace wyxos
{

namespace
{

// Closes a descriptor on every path out of a function.
class Descriptor
{
public:
    explicit Descriptor(int fd = -1) : m_fd(fd) {}
    ~Descriptor() { Close(); }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;

    int Get() const { return m_fd; }
    bool Close()
    {
        if (m_fd < 0)
            return true;
        const bool closed = ::close(m_fd) == 0;
        m_fd = -1;
        return closed;
    }

private:
    int m_fd;
};

bool WriteAll(int fd, const char* data, std::size_t size)
{
    while (size > 0)
    {
        const ssize_t written = ::write(fd, data, size);
        if (written < 0)
        {
            if (errno == EINTR)
                continue;
            return false;
        }
        data += written;
        size -= static_cast<std::size_t>(written);
    }
    return true;
}

// The file a path finally names, so that a link is not replaced by a file.
std::string ResolvedPath(const std::string& path)
{
    std::unique_ptr<char, decltype(&std::free)> resolved(::realpath(path.c_str(), nullptr), &std::free);
    return resolved ? std::string(resolved.get()) : path;
}

std::string FolderOf(const std::string& path)
{
    const std::size_t slash = path.rfind('/');
    if (slash == std::string::npos)
        return ".";
    return slash == 0 ? "/" : path.substr(0, slash);
}

// Only root may give a file away; for anyone else this fails harmlessly, or
// keeps just the group, and the journal then belongs to its writer.
bool GiveOwnership(int fd, const struct stat& original)
{
    if (original.st_uid == ::geteuid() && original.st_gid == ::getegid())
        return true;
    return ::fchown(fd, original.st_uid, original.st_gid) == 0 ||
           ::fchown(fd, static_cast<uid_t>(-1), original.st_gid) == 0;
}

void SyncFolder(const std::string& folder)
{
    // Makes the rename itself durable; a file system that cannot sync a
    // folder still has the new content in place.
    Descriptor fd(::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (fd.Get() >= 0)
        ::fsync(fd.Get());
}

} // namespace

ReadResult ReadFileContents(const wxString& path, std::string& bytes, std::size_t maxBytes)
{
    // O_NONBLOCK: opening a FIFO placed at the path must not wait for a writer.
    Descriptor fd(::open(path.utf8_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
    if (fd.Get() < 0)
        return errno == ENOENT || errno == ENOTDIR ? ReadResult::Missing : ReadResult::Unreadable;
    struct stat info;
    if (::fstat(fd.Get(), &info) != 0 || !S_ISREG(info.st_mode))
        return ReadResult::Unreadable;

    std::string content;
    if (info.st_size > 0)
        content.reserve(std::min(static_cast<std::size_t>(info.st_size), maxBytes));
    std::vector<char> block(64 * 1024);
    while (content.size() < maxBytes)
    {
        const ssize_t got = ::read(fd.Get(), block.data(), std::min(block.size(), maxBytes - content.size()));
        if (got < 0)
        {
            if (errno == EINTR)
                continue;
            return ReadResult::Unreadable;
        }
        if (got == 0)
            break;
        content.append(block.data(), static_cast<std::size_t>(got));
    }
    bytes.swap(content);
    return ReadResult::Read;
}

bool ReplaceFileContents(const wxString& path, const std::string& bytes)
{
    const std::string target = ResolvedPath(std::string(path.utf8_str()));
    struct stat original;
    if (::stat(target.c_str(), &original) != 0 || !S_ISREG(original.st_mode))
        return false;

    const std::size_t slash = target.rfind('/');
    const std::string name = slash == std::string::npos ? target : target.substr(slash + 1);
    const std::string folder = FolderOf(target);
    std::string temporary = folder + "/." + name + ".XXXXXX";
    Descriptor fd(::mkostemp(&temporary[0], O_CLOEXEC));
    if (fd.Get() < 0)
        return false;

    bool written = WriteAll(fd.Get(), bytes.data(), bytes.size());
    if (written)
    {
        // The owner goes first because a change of owner clears set-id bits.
        GiveOwnership(fd.Get(), original);
        ::fchmod(fd.Get(), original.st_mode & 07777);
        written = ::fsync(fd.Get()) == 0;
    }
    written = fd.Close() && written;
    if (!written || ::rename(temporary.c_str(), target.c_str()) != 0)
    {
        ::unlink(temporary.c_str());
        return false;
    }
    SyncFolder(folder);
    return true;
}

} // namespace wyxos
