#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include <wx/arrstr.h>
#include <wx/string.h>

namespace wyx
{

// What one read may hold. A journal line is a job (two paths and a few short
// fields), so a line of a mebibyte, or a million lines, is no journal a service
// wrote but a file planted or gone wrong: it is refused rather than held.
constexpr std::size_t kMaxJournalLineLength = std::size_t(1) << 20; // characters; UTF-8 bytes
constexpr std::size_t kMaxJournalLines = 1000000;

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
    // The bytes of a line that was no UTF-8 and was read by the single-byte
    // fallback; empty for every other line. While the text is unchanged a
    // rewrite stores these bytes again, so a stray byte stays one byte.
    std::string undecoded;
};

struct DecodedJournal
{
    std::vector<JournalLine> lines;
    // False when bytes had to be replaced (a broken UTF-16 or UTF-32 file):
    // writing these lines back would lose what could not be decoded.
    bool exact = true;
    // A line longer than kMaxJournalLineLength, or more than kMaxJournalLines
    // lines: nothing was decoded.
    bool tooLarge = false;
};

// A journal's bytes as lines. A byte-order mark selects UTF-8, UTF-16 or
// UTF-32; without one (or with the UTF-8 mark) each line is UTF-8 when valid,
// else read by the single-byte fallback, that line alone. A line ends at
// CR LF, LF or CR. Any input gives a result.
DecodedJournal DecodeJournal(const char* bytes, std::size_t size);

// The same lines' texts alone, as a reader wants them, without the copy.
// False, with the lines left as they were, when the journal is too large.
bool DecodeJournalTexts(const char* bytes, std::size_t size, wxArrayString& lines);

// The lines as UTF-8 without a byte-order mark, each with its own line end;
// a line the fallback read and nobody changed goes back as it came.
std::string EncodeJournal(const std::vector<JournalLine>& lines);

} // namespace wyx
