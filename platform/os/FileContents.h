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
// it). Refused, as a write in place would be, when the caller may not write the
// file. A symbolic link at the path stays a link and its target is replaced,
// but only a link the caller owns is followed: in a folder other users may
// write, a link of theirs must not make us replace a file of ours.
// On failure the old file is untouched and no temporary file is left behind.
bool ReplaceFileContents(const wxString& path, const std::string& bytes);

// ReplaceFileContents, or when nothing is at the path a new file (mode 0644)
// put in place as one step.
bool WriteFileContents(const wxString& path, const std::string& bytes);

// Appends to a regular file, created when missing. Never through a symbolic
// link, and never waiting on a FIFO at the path.
bool AppendFileContents(const wxString& path, const std::string& bytes);

// Creates an empty file when nothing is at the path; true also when something
// already is there (what it is, is for its readers to judge).
bool CreateFileIfMissing(const wxString& path);

// A write beyond the process's file size limit then fails as a full disk
// would, instead of ending the process (SIGXFSZ) before it could remove its
// temporary file and report the failure.
void FailWritesBeyondFileSizeLimit();

} // namespace wyxos
