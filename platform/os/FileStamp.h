#pragma once

#include <cstdint>

#include <wx/string.h>

namespace wyxos
{

// What a change check compares, as git does for its index: modification time
// at full resolution, size and inode. Two writes within one second, or within
// the file system's timestamp granularity, still differ in one of them as long
// as the content length or the inode (a rename over the file) changed.
struct FileStamp
{
    bool exists = false;
    std::int64_t mtimeSeconds = 0;
    std::int64_t mtimeNanoseconds = 0;
    std::int64_t ctimeSeconds = 0;
    std::int64_t ctimeNanoseconds = 0;
    std::uint64_t size = 0;
    std::uint64_t inode = 0;
    std::uint64_t device = 0;

    bool operator==(const FileStamp& other) const;
    bool operator!=(const FileStamp& other) const { return !(*this == other); }
};

// The stamp of a file; exists is false when it cannot be read.
FileStamp StatFile(const wxString& path);

} // namespace wyxos
