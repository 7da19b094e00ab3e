#include "data/JournalText.h"

#include <algorithm>
#include <cstdint>
#include <cstring>

#include <wx/convauto.h>
#include <wx/strconv.h>

namespace wyx
{

namespace
{

constexpr wxUint32 kReplacement = 0xFFFD;

bool IsScalarValue(wxUint32 code)
{
    return code <= 0x10FFFF && (code < 0xD800 || code > 0xDFFF);
}

std::size_t BomLength(wxBOM bom)
{
    size_t count = 0;
    if (bom != wxBOM_Unknown && bom != wxBOM_None)
        wxConvAuto::GetBOMChars(bom, &count);
    return count;
}

wxUint32 ReadUnit(const unsigned char* at, std::size_t width, bool bigEndian)
{
    wxUint32 value = 0;
    for (std::size_t i = 0; i < width; ++i)
        value |= wxUint32(at[bigEndian ? i : width - 1 - i]) << (8 * (width - 1 - i));
    return value;
}

// UTF-16 or UTF-32 that the library refused (an odd trailing byte, a lone
// surrogate, a value beyond U+10FFFF): every bad unit becomes U+FFFD.
std::wstring DecodeWideLeniently(const unsigned char* data, std::size_t size, wxBOM bom)
{
    const bool wide32 = bom == wxBOM_UTF32BE || bom == wxBOM_UTF32LE;
    const bool bigEndian = bom == wxBOM_UTF32BE || bom == wxBOM_UTF16BE;
    const std::size_t width = wide32 ? 4 : 2;

    std::wstring text;
    text.reserve(size / width + 1);
    std::size_t at = 0;
    for (; at + width <= size; at += width)
    {
        wxUint32 code = ReadUnit(data + at, width, bigEndian);
        if (!wide32 && code >= 0xD800 && code <= 0xDBFF && at + 2 * width <= size)
        {
            const wxUint32 low = ReadUnit(data + at + width, width, bigEndian);
            if (low >= 0xDC00 && low <= 0xDFFF)
            {
                code = 0x10000 + ((code - 0xD800) << 10) + (low - 0xDC00);
                at += width;
            }
        }
        text.push_back(static_cast<wchar_t>(IsScalarValue(code) ? code : kReplacement));
    }
    if (at < size)
        text.push_back(static_cast<wchar_t>(kReplacement));
    return text;
}

// The library's automatic conversion straight into one buffer: journals of
// 100000 lines make every extra copy of the whole text count.
bool DecodeAutomatically(const char* bytes, std::size_t size, std::wstring& text)
{
    wxConvAuto automatic;
    const std::size_t length = automatic.ToWChar(nullptr, 0, bytes, size);
    if (length == wxCONV_FAILED)
        return false;
    text.assign(length, L'\0');
    return length == 0 || automatic.ToWChar(&text[0], length, bytes, size) == length;
}

bool IsWideMark(wxBOM bom)
{
    return bom == wxBOM_UTF16BE || bom == wxBOM_UTF16LE || bom == wxBOM_UTF32BE || bom == wxBOM_UTF32LE;
}

// A UTF-16 or UTF-32 file decoded whole; exact is cleared when bytes were lost.
std::wstring DecodeWideText(const char* bytes, std::size_t size, wxBOM bom, bool& exact)
{
    exact = true;
    const std::size_t skip = BomLength(bom);
    if (size == skip)
        return std::wstring();
    std::wstring text;
    if (DecodeAutomatically(bytes, size, text) && !text.empty())
    {
        // The library passes UTF-32 values that are no characters through.
        for (wchar_t& c : text)
            if (!IsScalarValue(static_cast<wxUint32>(c)))
            {
                c = static_cast<wchar_t>(kReplacement);
                exact = false;
            }
        return text;
    }
    exact = false;
    return DecodeWideLeniently(reinterpret_cast<const unsigned char*>(bytes) + skip, size - skip, bom);
}

void AppendUtf8(std::string& out, wxUint32 code)
{
    if (!IsScalarValue(code))
        code = kReplacement;
    if (code < 0x80)
    {
        out.push_back(static_cast<char>(code));
    }
    else if (code < 0x800)
    {
        out.push_back(static_cast<char>(0xC0 | (code >> 6)));
        out.push_back(static_cast<char>(0x80 | (code & 0x3F)));
    }
    else if (code < 0x10000)
    {
        out.push_back(static_cast<char>(0xE0 | (code >> 12)));
        out.push_back(static_cast<char>(0x80 | ((code >> 6) & 0x3F)));
        out.push_back(static_cast<char>(0x80 | (code & 0x3F)));
    }
    else
    {
        out.push_back(static_cast<char>(0xF0 | (code >> 18)));
        out.push_back(static_cast<char>(0x80 | ((code >> 12) & 0x3F)));
        out.push_back(static_cast<char>(0x80 | ((code >> 6) & 0x3F)));
        out.push_back(static_cast<char>(0x80 | (code & 0x3F)));
    }
}

const char* LineEndBytes(LineEnd end)
{
    switch (end)
    {
    case LineEnd::CrLf:
        return "\r\n";
    case LineEnd::Lf:
        return "\n";
    case LineEnd::Cr:
        return "\r";
    case LineEnd::None:
        break;
    }
    return "";
}

std::size_t CountLineBreaks(const std::wstring& text)
{
    std::size_t breaks = 0;
    for (wchar_t c : text)
        breaks += c == L'\n' || c == L'\r';
    return breaks;
}

// One line as the splitters hand it on.
struct LinePiece
{
    const wchar_t* text;
    std::size_t length;
    LineEnd end;
    // The stored bytes, when the line was read by the single-byte fallback.
    const char* undecoded = nullptr;
    std::size_t undecodedLength = 0;
};

// Counts lines against what one read may hold.
class LineBudget
{
public:
    bool Take(std::size_t length)
    {
        ++m_lines;
        return m_lines <= kMaxJournalLines && length <= kMaxJournalLineLength;
    }

private:
    std::size_t m_lines = 0;
};

std::size_t ReserveFor(std::size_t lineBreaks)
{
    return std::min(lineBreaks + 1, kMaxJournalLines);
}

// Calls add(piece) for each line of the decoded text; false, part way, when
// the journal is more than one read may hold.
template <typename Add> bool SplitLines(const std::wstring& text, Add add)
{
    const wchar_t* const data = text.data();
    const std::size_t length = text.length();
    LineBudget budget;
    auto addLine = [&](std::size_t start, std::size_t lineLength, LineEnd end)
    {
        if (!budget.Take(lineLength))
            return false;
        add(LinePiece{data + start, lineLength, end});
        return true;
    };

    // A second mark after the first (a mark written twice) is no text: kept,
    // it would turn into the mark of the UTF-8 rewrite and vanish only then.
    std::size_t start = 0;
    while (start < length && data[start] == L'\uFEFF')
        ++start;
    for (std::size_t at = start; at < length; ++at)
    {
        const wchar_t c = data[at];
        if (c != L'\r' && c != L'\n')
            continue;
        LineEnd end = c == L'\r' ? LineEnd::Cr : LineEnd::Lf;
        const std::size_t lineLength = at - start;
        if (c == L'\r' && at + 1 < length && data[at + 1] == L'\n')
        {
            end = LineEnd::CrLf;
            ++at;
        }
        if (!addLine(start, lineLength, end))
            return false;
        start = at + 1;
    }
    return start >= length || addLine(start, length - start, LineEnd::None);
}

// Strict UTF-8 as Unicode defines it: no overlong forms, no surrogates,
// nothing beyond U+10FFFF, no sequence cut short.
bool IsValidUtf8(const unsigned char* at, const unsigned char* end)
{
    while (at < end)
    {
        // Eight ASCII bytes at a time: journals are nearly all ASCII.
        while (end - at >= 8)
        {
            std::uint64_t word;
            std::memcpy(&word, at, sizeof word);
            if (word & 0x8080808080808080ull)
                break;
            at += 8;
        }
        if (at == end)
            break;
        const unsigned char lead = *at;
        if (lead < 0x80)
        {
            ++at;
            continue;
        }
        std::size_t length;
        unsigned char low = 0x80, high = 0xBF; // the range of the second byte
        if (lead >= 0xC2 && lead <= 0xDF)
            length = 2;
        else if (lead >= 0xE0 && lead <= 0xEF)
        {
            length = 3;
            if (lead == 0xE0)
                low = 0xA0;
            else if (lead == 0xED)
                high = 0x9F;
        }
        else if (lead >= 0xF0 && lead <= 0xF4)
        {
            length = 4;
            if (lead == 0xF0)
                low = 0x90;
            else if (lead == 0xF4)
                high = 0x8F;
        }
        else
            return false;
        if (static_cast<std::size_t>(end - at) < length || at[1] < low || at[1] > high)
            return false;
        for (std::size_t i = 2; i < length; ++i)
            if ((at[i] & 0xC0) != 0x80)
                return false;
        at += length;
    }
    return true;
}

// Decodes one line of UTF-8 already known to be valid; returns its length in
// characters, which is never more than its length in bytes.
std::size_t DecodeValidUtf8(const unsigned char* at, const unsigned char* end, wchar_t* out)
{
    wchar_t* const start = out;
    while (at < end)
    {
        // Eight ASCII bytes at a time, as in the validation.
        std::uint64_t word;
        if (end - at >= 8 && (std::memcpy(&word, at, sizeof word), (word & 0x8080808080808080ull) == 0))
        {
            for (int i = 0; i < 8; ++i)
                out[i] = at[i];
            at += 8;
            out += 8;
            continue;
        }
        const unsigned char lead = *at;
        if (lead < 0x80)
        {
            *out++ = lead;
            ++at;
        }
        else if (lead < 0xE0)
        {
            *out++ = static_cast<wchar_t>(((lead & 0x1F) << 6) | (at[1] & 0x3F));
            at += 2;
        }
        else if (lead < 0xF0)
        {
            *out++ = static_cast<wchar_t>(((lead & 0x0F) << 12) | ((at[1] & 0x3F) << 6) | (at[2] & 0x3F));
            at += 3;
        }
        else
        {
            *out++ = static_cast<wchar_t>(((lead & 0x07) << 18) | ((at[1] & 0x3F) << 12) |
                                          ((at[2] & 0x3F) << 6) | (at[3] & 0x3F));
            at += 4;
        }
    }
    return static_cast<std::size_t>(out - start);
}

// Lines end mostly in LF (CR LF): a bound to reserve for, found at memchr's speed.
std::size_t CountLineFeeds(const char* at, const char* end)
{
    std::size_t feeds = 0;
    while ((at = static_cast<const char*>(std::memchr(at, '\n', static_cast<std::size_t>(end - at)))) !=
           nullptr)
    {
        ++feeds;
        ++at;
    }
    return feeds;
}

// The single-byte fallback: each byte is the character of that number.
void DecodeSingleBytes(const unsigned char* at, const unsigned char* end, wchar_t* out)
{
    while (at < end)
        *out++ = *at++;
}

// Calls add(piece) for each line of a UTF-8 journal, decoding line by line: a
// line that is no UTF-8 goes to the fallback alone, and the whole file is never
// held as wide text, which for journals of a hundred thousand lines would
// double the memory a read touches. False, part way, when the journal is more
// than one read may hold.
template <typename Add> bool SplitUtf8Lines(const char* bytes, std::size_t size, Add add)
{
    const auto* at = reinterpret_cast<const unsigned char*>(bytes);
    const auto* const end = at + size;
    // The mark, and any repeat of it (a mark written twice), is no text.
    static constexpr unsigned char kMark[] = {0xEF, 0xBB, 0xBF};
    while (end - at >= 3 && std::memcmp(at, kMark, 3) == 0)
        at += 3;
    // Nearly every journal is UTF-8 throughout: one check of the whole spares
    // a check of each line.
    const bool allValid = IsValidUtf8(at, end);

    LineBudget budget;
    std::wstring line;
    auto addLine = [&](const unsigned char* start, const unsigned char* lineEnd, LineEnd ending)
    {
        const std::size_t byteLength = static_cast<std::size_t>(lineEnd - start);
        if (!budget.Take(byteLength))
            return false;
        if (line.size() < byteLength)
            line.resize(byteLength);
        if (allValid || IsValidUtf8(start, lineEnd))
        {
            add(LinePiece{line.data(), DecodeValidUtf8(start, lineEnd, &line[0]), ending});
            return true;
        }
        DecodeSingleBytes(start, lineEnd, &line[0]);
        add(LinePiece{line.data(), byteLength, ending, reinterpret_cast<const char*>(start), byteLength});
        return true;
    };
    // The next LF, then the first CR before it: each a vectorised scan. The LF
    // found is kept while lines end in a lone CR, so a file of CR-ended lines
    // is not searched to its end once per line.
    const unsigned char* feed = nullptr;
    bool feedKnown = false;
    while (at < end)
    {
        if (!feedKnown || (feed != nullptr && feed < at))
        {
            feed =
                static_cast<const unsigned char*>(std::memchr(at, '\n', static_cast<std::size_t>(end - at)));
            feedKnown = true;
        }
        const unsigned char* const stop = feed != nullptr ? feed : end;
        const auto* carriage =
            static_cast<const unsigned char*>(std::memchr(at, '\r', static_cast<std::size_t>(stop - at)));
        bool taken;
        if (carriage != nullptr)
        {
            const bool pair = carriage + 1 == feed;
            taken = addLine(at, carriage, pair ? LineEnd::CrLf : LineEnd::Cr);
            at = carriage + (pair ? 2 : 1);
        }
        else if (feed != nullptr)
        {
            taken = addLine(at, feed, LineEnd::Lf);
            at = feed + 1;
        }
        else
        {
            taken = addLine(at, end, LineEnd::None);
            at = end;
        }
        if (!taken)
            return false;
    }
    return true;
}

enum class Decoding
{
    Exact,
    Lossy,   // characters were replaced
    TooLarge // stopped part way
};

// UTF-8 (with or without its mark, or too short to tell) is read line by line;
// UTF-16 and UTF-32 are decoded whole and split afterwards.
template <typename Reserve, typename Add>
Decoding SplitJournal(const char* bytes, std::size_t size, Reserve reserve, Add add)
{
    const wxBOM bom = size == 0 ? wxBOM_None : wxConvAuto::DetectBOM(bytes, size);
    if (!IsWideMark(bom))
    {
        reserve(ReserveFor(CountLineFeeds(bytes, bytes + size)));
        return SplitUtf8Lines(bytes, size, add) ? Decoding::Exact : Decoding::TooLarge;
    }
    bool exact = true;
    const std::wstring text = DecodeWideText(bytes, size, bom, exact);
    reserve(ReserveFor(CountLineBreaks(text)));
    if (!SplitLines(text, add))
        return Decoding::TooLarge;
    return exact ? Decoding::Exact : Decoding::Lossy;
}

// Whether the text is still what the fallback read from these bytes.
bool IsFallbackReadOf(const wxString& text, const std::string& bytes)
{
    if (bytes.empty() || text.length() != bytes.size())
        return false;
    const wchar_t* const data = text.wc_str();
    for (std::size_t at = 0; at < bytes.size(); ++at)
        if (static_cast<wxUint32>(data[at]) != static_cast<unsigned char>(bytes[at]))
            return false;
    return true;
}

// The lines as UTF-8, except that lines the fallback read and nobody changed
// go back as they came; the first line only where keepFirstAsRead says so.
std::string EncodeLines(const std::vector<JournalLine>& lines, bool keepFirstAsRead)
{
    std::string out;
    for (std::size_t index = 0; index < lines.size(); ++index)
    {
        const JournalLine& line = lines[index];
        if ((index > 0 || keepFirstAsRead) && IsFallbackReadOf(line.text, line.undecoded))
        {
            out += line.undecoded;
        }
        else
        {
            const wchar_t* const data = line.text.wc_str();
            for (std::size_t at = 0, length = line.text.length(); at < length; ++at)
                AppendUtf8(out, static_cast<wxUint32>(data[at]));
        }
        out += LineEndBytes(line.end);
    }
    return out;
}

} // namespace

DecodedJournal DecodeJournal(const char* bytes, std::size_t size)
{
    DecodedJournal journal;
    const Decoding decoding = SplitJournal(
        bytes, size, [&journal](std::size_t count) { journal.lines.reserve(count); },
        [&journal](const LinePiece& piece)
        {
            // Built in place: wxString has no move, so a pushed temporary is copied.
            journal.lines.emplace_back();
            JournalLine& line = journal.lines.back();
            line.text.assign(piece.text, piece.length);
            line.end = piece.end;
            if (piece.undecoded != nullptr)
                line.undecoded.assign(piece.undecoded, piece.undecodedLength);
        });
    journal.exact = decoding == Decoding::Exact;
    if (decoding == Decoding::TooLarge)
    {
        journal.tooLarge = true;
        journal.lines = std::vector<JournalLine>();
    }
    return journal;
}

bool DecodeJournalTexts(const char* bytes, std::size_t size, wxArrayString& lines)
{
    wxArrayString decoded;
    const Decoding decoding = SplitJournal(
        bytes, size, [&decoded](std::size_t count) { decoded.Alloc(count); },
        [&decoded](const LinePiece& piece)
        {
            static const wxString empty;
            decoded.Add(empty);
            decoded.Last().assign(piece.text, piece.length);
        });
    if (decoding == Decoding::TooLarge)
        return false;
    lines.swap(decoded);
    return true;
}

std::string EncodeJournal(const std::vector<JournalLine>& lines)
{
    std::string out = EncodeLines(lines, true);
    // Kept as they were, the bytes of a first line that was no UTF-8 could
    // begin the file with a UTF-16 or UTF-32 mark (a line "\xFF\xFE..." that
    // followed a UTF-8 mark, or a line that another's deletion moved to the
    // top), and the next read would take the whole file for that encoding.
    // Such a line goes as UTF-8, which never holds the bytes of those marks.
    if (!out.empty() && IsWideMark(wxConvAuto::DetectBOM(out.data(), out.size())))
        out = EncodeLines(lines, false);
    return out;
}

} // namespace wyx
