#pragma once

#include <string>
#include <vector>

#include <wx/arrstr.h>
#include <wx/string.h>

namespace wyx
{

// How a journal line ended in the file; a rewrite keeps it.
enum class LineEnd
{
    None, // the last line of a file that does not end in a line break
    CrLf,
    Lf,
    Cr
};

struct JournalLine
{
    wxString text;
    LineEnd end = LineEnd::CrLf;
};

struct DecodedJournal
{
    std::vector<JournalLine> lines;
    // False when bytes had to be replaced (a broken UTF-16 or UTF-32 file, a
    // UTF-8 file with a mark but invalid sequences): writing these lines back
    // would lose what could not be decoded.
    bool exact = true;
};

// A journal's bytes as lines. A byte-order mark selects UTF-8, UTF-16 or
// UTF-32; without one the text is UTF-8 when valid, else the single-byte
// fallback. A line ends at CR LF, LF or CR. Any input gives a result.
DecodedJournal DecodeJournal(const char* bytes, std::size_t size);

// The same lines' texts alone, as a reader wants them, without the copy.
void DecodeJournalTexts(const char* bytes, std::size_t size, wxArrayString& lines);

// The lines as UTF-8 without a byte-order mark, each with its own line end.
std::string EncodeJournal(const std::vector<JournalLine>& lines);

} // namespace wyx
