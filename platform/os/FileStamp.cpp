#include "platform/os/FileStamp.h"

#include <sys/stat.h>

namespace wyxos
{

bool FileStamp::operator==(const FileStamp& other) const
{
    return exists == other.exists && mtimeSeconds == other.mtimeSeconds &&
           mtimeNanoseconds == other.mtimeNanoseconds && ctimeSeconds == other.ctimeSeconds &&
           ctimeNanoseconds == other.ctimeNanoseconds && size == other.size && inode == other.inode &&
           device == other.device;
}

FileStamp StatFile(const wxString& path)
{
    FileStamp stamp;
    struct stat info;
    if (::stat(path.utf8_str(), &info) != 0)
        return stamp;
    stamp.exists = true;
    stamp.mtimeSeconds = info.st_mtim.tv_sec;
    stamp.mtimeNanoseconds = info.st_mtim.tv_nsec;
    stamp.ctimeSeconds = info.st_ctim.tv_sec;
    stamp.ctimeNanoseconds = info.st_ctim.tv_nsec;
    stamp.size = static_cast<std::uint64_t>(info.st_size);
    stamp.inode = static_cast<std::uint64_t>(info.st_ino);
    stamp.device = static_cast<std::uint64_t>(info.st_dev);
    return stamp;
}

} // namespace wyxos
