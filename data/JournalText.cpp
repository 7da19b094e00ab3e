#include "data/JournalText.h"

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

std::wstring DecodeSingleByte(const char* bytes, std::size_t size)
{
    std::wstring text(size, L'\0');
    for (std::size_t at = 0; at < size; ++at)
        text[at] = static_cast<wchar_t>(static_cast<unsigned char>(bytes[at]));
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

// Decodes the whole file to one text; exact is cleared when bytes were lost.
std::wstring DecodeText(const char* bytes, std::size_t size, bool& exact)
{
    exact = true;
    if (size == 0)
        return std::wstring();

    const wxBOM bom = wxConvAuto::DetectBOM(bytes, size);
    if (size == BomLength(bom))
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

    const std::size_t skip = BomLength(bom);
    switch (bom)
    {
    case wxBOM_UTF16BE:
    case wxBOM_UTF16LE:
    case wxBOM_UTF32BE:
    case wxBOM_UTF32LE:
        exact = false;
        return DecodeWideLeniently(reinterpret_cast<const unsigned char*>(bytes) + skip, size - skip, bom);
    case wxBOM_UTF8:
        exact = false;
        return DecodeSingleByte(bytes + skip, size - skip);
    default:
        // Too short to tell a mark from text ("\xFF" alone): the fallback.
        return DecodeSingleByte(bytes, size);
    }
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

// Calls add(text, length, end) for each line of the decoded text.
template <typename Add> void SplitLines(const std::wstring& text, Add add)
{
    const wchar_t* const data = text.data();
    const std::size_t length = text.length();

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
        add(data + start, lineLength, end);
        start = at + 1;
    }
    if (start < length)
        add(data + start, length - start, LineEnd::None);
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

// Calls add(text, length, end) for each line of a UTF-8 journal, decoding line
// by line: the whole file is never held as wide text, which for journals of a
// hundred thousand lines would double the memory a read touches. False, with
// nothing added, when the bytes are not (all) UTF-8.
template <typename Add> bool SplitUtf8Lines(const char* bytes, std::size_t size, Add add)
{
    const auto* at = reinterpret_cast<const unsigned char*>(bytes);
    const auto* const end = at + size;
    // The mark, and any repeat of it (a mark written twice), is no text.
    static constexpr unsigned char kMark[] = {0xEF, 0xBB, 0xBF};
    while (end - at >= 3 && std::memcmp(at, kMark, 3) == 0)
        at += 3;
    if (!IsValidUtf8(at, end))
        return false;

    std::wstring line;
    auto addLine = [&](const unsigned char* start, const unsigned char* lineEnd, LineEnd ending)
    {
        const std::size_t byteLength = static_cast<std::size_t>(lineEnd - start);
        if (line.size() < byteLength)
            line.resize(byteLength);
        add(line.data(), DecodeValidUtf8(start, lineEnd, &line[0]), ending);
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
        if (carriage != nullptr)
        {
            const bool pair = carriage + 1 == feed;
            addLine(at, carriage, pair ? LineEnd::CrLf : LineEnd::Cr);
            at = carriage + (pair ? 2 : 1);
        }
        else if (feed != nullptr)
        {
            addLine(at, feed, LineEnd::Lf);
            at = feed + 1;
        }
        else
        {
            addLine(at, end, LineEnd::None);
            at = end;
        }
    }
    return true;
}

// Plain UTF-8 (with or without its mark) is read line by line; every other
// form is decoded whole and split afterwards.
template <typename Reserve, typename Add>
bool SplitJournal(const char* bytes, std::size_t size, Reserve reserve, Add add)
{
    bool exact = true;
    const wxBOM bom = size == 0 ? wxBOM_None : wxConvAuto::DetectBOM(bytes, size);
    if (bom == wxBOM_None || bom == wxBOM_UTF8)
    {
        reserve(CountLineFeeds(bytes, bytes + size) + 1);
        if (SplitUtf8Lines(bytes, size, add))
            return true;
    }
    const std::wstring text = DecodeText(bytes, size, exact);
    reserve(CountLineBreaks(text) + 1);
    SplitLines(text, add);
    return exact;
}

} // namespace

DecodedJournal DecodeJournal(const char* bytes, std::size_t size)
{
    DecodedJournal journal;
    journal.exact = SplitJournal(
        bytes, size, [&journal](std::size_t count) { journal.lines.reserve(count); },
        [&journal](const wchar_t* line, std::size_t length, LineEnd end)
        {
            // Built in place: wxString has no move, so a pushed temporary is copied.
            journal.lines.emplace_back();
            journal.lines.back().text.assign(line, length);
            journal.lines.back().end = end;
        });
    return journal;
}

void DecodeJournalTexts(const char* bytes, std::size_t size, wxArrayString& lines)
{
    lines.Clear();
    SplitJournal(
        bytes, size, [&lines](std::size_t count) { lines.Alloc(count); },
        [&lines](const wchar_t* line, std::size_t length, LineEnd)
        {
            static const wxString empty;
            lines.Add(empty);
            lines.Last().assign(line, length);
        });
}

std::string EncodeJournal(const std::vector<JournalLine>& lines)
{
    std::string out;
    for (const JournalLine& line : lines)
    {
        const wchar_t* const data = line.text.wc_str();
        for (std::size_t at = 0, length = line.text.length(); at < length; ++at)
            AppendUtf8(out, static_cast<wxUint32>(data[at]));
        out += LineEndBytes(line.end);
    }
    return out;
}

} // namespace wyx
