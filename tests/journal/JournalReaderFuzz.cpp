// Arbitrary bytes as a journal file: reading never fails or crashes, valid
// UTF-8 reads as the library's decoder reads it, a journal that decodes
// exactly survives a rewrite line for line, and one without a wide mark byte
// for byte.
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <memory>
#include <string>

#include <wx/convauto.h>
#include <wx/init.h>
#include <wx/strconv.h>

#include "data/JobReadWriter.h"
#include "data/JournalText.h"

namespace
{

std::string g_folder;
std::string g_journal;

void RemoveFolder()
{
    std::error_code ignored;
    std::filesystem::remove_all(g_folder, ignored);
}

bool IsWideText(const std::string& bytes)
{
    if (bytes.empty())
        return false;
    const wxBOM bom = wxConvAuto::DetectBOM(bytes.data(), bytes.size());
    return bom == wxBOM_UTF16BE || bom == wxBOM_UTF16LE || bom == wxBOM_UTF32BE || bom == wxBOM_UTF32LE;
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***)
{
    static wxInitializer initializer;
    char folder[] = "/tmp/wyx-journal-fuzz.XXXXXX";
    if (::mkdtemp(folder) == nullptr)
        std::abort();
    ::setenv("WYX_SYSTEM_ROOT", folder, 1);
    g_folder = folder;
    g_journal = g_folder + "/TiveraJobsLogFile.txt";
    std::atexit(RemoveFolder);
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    std::FILE* file = std::fopen(g_journal.c_str(), "wb");
    if (file == nullptr)
        std::abort();
    std::fwrite(data, 1, size, file);
    std::fclose(file);

    wyx::JobsFileReadWriter journal;
    journal.SetPath(wxString::FromUTF8(g_journal));
    wxArrayString lines;
    if (journal.ReadJobs(lines) != wyx::JobOk || lines.size() > size)
        std::abort();

    const wyx::DecodedJournal decoded = wyx::DecodeJournal(reinterpret_cast<const char*>(data), size);
    if (decoded.lines.size() != lines.size())
        std::abort();

    // Without a UTF-16 or UTF-32 mark every line goes back byte for byte,
    // UTF-8 or not; only marks at the start go. Where that would make the
    // file begin with such a mark, it must not.
    const std::string input(reinterpret_cast<const char*>(data), size);
    if (!IsWideText(input))
    {
        std::size_t mark = 0;
        while (input.compare(mark, 3, "\xEF\xBB\xBF") == 0)
            mark += 3;
        const std::string asRead = input.substr(mark);
        const std::string rewritten = wyx::EncodeJournal(decoded.lines);
        const bool kept = IsWideText(asRead) ? !IsWideText(rewritten) : rewritten == asRead;
        if (!decoded.exact || !kept)
            std::abort();
    }

    // Valid UTF-8 reads as the library's own strict decoder reads it, split at
    // the line ends; marks at the start are no text.
    const char* const bytes = reinterpret_cast<const char*>(data);
    if (wxConvUTF8.ToWChar(nullptr, 0, bytes, size) != wxCONV_FAILED)
    {
        wxString whole(bytes, wxConvUTF8, size);
        // The library also takes overlong forms (E0 9B BF for U+06FF), which the
        // reader, strict, does not: only text that encodes back to the same bytes
        // is valid UTF-8 here.
        const wxScopedCharBuffer canonical = whole.utf8_str();
        if (canonical.length() != size || std::memcmp(canonical.data(), bytes, size) != 0)
            return 0;
        while (whole.StartsWith(L"\uFEFF"))
            whole.erase(0, 1);
        // The library lets encoded surrogates and values beyond U+10FFFF through; the
        // reader replaces them, which the encoding tests check.
        for (wxUniChar c : whole)
            if ((c.GetValue() >= 0xD800 && c.GetValue() <= 0xDFFF) || c.GetValue() > 0x10FFFF)
                return 0;
        wxString joined;
        for (const wyx::JournalLine& line : decoded.lines)
            joined += line.text + (line.end == wyx::LineEnd::CrLf ? "\r\n"
                                   : line.end == wyx::LineEnd::Lf ? "\n"
                                   : line.end == wyx::LineEnd::Cr ? "\r"
                                                                  : "");
        if (!decoded.exact || joined != whole)
            std::abort();
    }

    // What a writing operation would put in the file must read back as the
    // same lines, and write out again byte for byte (checked in memory: a
    // real rewrite waits for the disk and would slow the fuzzer to a crawl).
    if (!decoded.exact)
        return 0;
    const std::string rewritten = wyx::EncodeJournal(decoded.lines);
    const wyx::DecodedJournal reread = wyx::DecodeJournal(rewritten.data(), rewritten.size());
    if (!reread.exact || reread.lines.size() != decoded.lines.size() ||
        wyx::EncodeJournal(reread.lines) != rewritten)
        std::abort();
    for (std::size_t i = 0; i < reread.lines.size(); ++i)
        if (reread.lines[i].text != lines[i])
            std::abort();
    return 0;
}
