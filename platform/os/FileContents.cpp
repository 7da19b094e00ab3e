#include "platform/os/FileContents.h"

#include <algorithm>
#include <cerrno>
#include <climits>
#include <csignal>
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

std::string FolderOf(const std::string& path)
{
    const std::size_t slash = path.rfind('/');
    if (slash == std::string::npos)
        return ".";
    return slash == 0 ? "/" : path.substr(0, slash);
}

bool ReadLink(const std::string& path, std::string& target)
{
    std::vector<char> buffer(PATH_MAX);
    const ssize_t length = ::readlink(path.c_str(), buffer.data(), buffer.size());
    if (length <= 0 || static_cast<std::size_t>(length) >= buffer.size())
        return false;
    target.assign(buffer.data(), static_cast<std::size_t>(length));
    return true;
}

// As many links as the kernel follows in one path.
constexpr int kMostLinksFollowed = 40;

// The file a path finally names, so that a link is not replaced by a file.
// A link is followed only when the caller owns it, the rule of the kernel's
// protected_symlinks applied in every folder, whatever its mode: false for a
// link of another user, a dangling link, or a loop.
bool ResolveOwnLinks(const std::string& path, std::string& target)
{
    std::string current = path;
    for (int followed = 0; followed <= kMostLinksFollowed; ++followed)
    {
        struct stat info;
        if (::lstat(current.c_str(), &info) != 0)
            return false;
        if (!S_ISLNK(info.st_mode))
        {
            target = current;
            return true;
        }
        std::string link;
        if (info.st_uid != ::geteuid() || !ReadLink(current, link))
            return false;
        current = link.front() == '/' ? link : FolderOf(current) + "/" + link;
    }
    return false;
}

// Whether the caller may write the file, asked as the kernel decides it for
// the effective user (so root may).
bool MayWrite(const std::string& path)
{
    return ::faccessat(AT_FDCWD, path.c_str(), W_OK, AT_EACCESS) == 0;
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

// Writes the bytes to a new file beside target, lets finish set its owner and
// permissions, and renames it over target. On failure nothing is left behind.
template <typename Finish> bool PutInPlace(const std::string& target, const std::string& bytes, Finish finish)
{
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
        finish(fd.Get());
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
    std::string target;
    struct stat original;
    if (!ResolveOwnLinks(std::string(path.utf8_str()), target) || ::lstat(target.c_str(), &original) != 0 ||
        !S_ISREG(original.st_mode) || !MayWrite(target))
        return false;
    return PutInPlace(target, bytes,
                      [&original](int fd)
                      {
                          // The owner goes first because a change of owner clears set-id bits.
                          GiveOwnership(fd, original);
                          ::fchmod(fd, original.st_mode & 07777);
                      });
}

bool WriteFileContents(const wxString& path, const std::string& bytes)
{
    const std::string target(path.utf8_str());
    struct stat info;
    if (::lstat(target.c_str(), &info) == 0)
        return ReplaceFileContents(path, bytes);
    return errno == ENOENT && PutInPlace(target, bytes, [](int fd) { ::fchmod(fd, 0644); });
}

bool AppendFileContents(const wxString& path, const std::string& bytes)
{
    Descriptor fd(
        ::open(path.utf8_str(), O_WRONLY | O_APPEND | O_CREAT | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC, 0666));
    struct stat info;
    if (fd.Get() < 0 || ::fstat(fd.Get(), &info) != 0 || !S_ISREG(info.st_mode))
        return false;
    return WriteAll(fd.Get(), bytes.data(), bytes.size()) && fd.Close();
}

bool CreateFileIfMissing(const wxString& path)
{
    // O_EXCL: whatever is there already, a link included, is never opened.
    Descriptor fd(::open(path.utf8_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0666));
    return fd.Get() >= 0 ? fd.Close() : errno == EEXIST;
}

void FailWritesBeyondFileSizeLimit()
{
    ::signal(SIGXFSZ, SIG_IGN);
}

} // namespace wyxos
