#include "data/JournalText.h"

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

} // namespace

DecodedJournal DecodeJournal(const char* bytes, std::size_t size)
{
    DecodedJournal journal;
    const std::wstring text = DecodeText(bytes, size, journal.exact);
    journal.lines.reserve(CountLineBreaks(text) + 1);
    SplitLines(text,
               [&journal](const wchar_t* line, std::size_t length, LineEnd end) {
                   journal.lines.push_back(JournalLine{wxString(line, length), end});
               });
    return journal;
}

void DecodeJournalTexts(const char* bytes, std::size_t size, wxArrayString& lines)
{
    bool exact = true;
    const std::wstring text = DecodeText(bytes, size, exact);
    lines.Clear();
    lines.Alloc(CountLineBreaks(text) + 1);
    SplitLines(text, [&lines](const wchar_t* line, std::size_t length, LineEnd)
               { lines.Add(wxString(line, length)); });
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
