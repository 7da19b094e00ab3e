#pragma once

#include <cstddef>
#include <limits>
#include <string>

#include <wx/string.h>

namespace wyxos
{

enum class ReadResult
{
    Read,
    Missing,   // nothing at the path
    Unreadable // not a regular file, or opening or reading failed
};

// Reads a whole regular file, or its first maxBytes bytes. Never blocks on a
// FIFO or device at the path.
ReadResult ReadFileContents(const wxString& path, std::string& bytes,
                            std::size_t maxBytes = std::numeric_limits<std::size_t>::max());

// Replaces the content of an existing file so that a reader, or a crash at any
// moment, sees either the old or the new content in full: the bytes go to a new
// file in the same folder, which is flushed to disk and renamed over the old
// one. The file keeps its permissions (and its owner, where the process may set
// it); a symbolic link at the path stays a link and its target is replaced.
// On failure the old file is untouched and no temporary file is left behind.
bool ReplaceFileContents(const wxString& path, const std::string& bytes);

} // namespace wyxos
