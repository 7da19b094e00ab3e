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
wxString DecodeWideLeniently(const unsigned char* data, std::size_t size, wxBOM bom)
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
    return wxString(text);
}

// Decodes the whole file to one text; exact is cleared when bytes were lost.
wxString DecodeText(const char* bytes, std::size_t size, bool& exact)
{
    exact = true;
    if (size == 0)
        return wxString();

    wxConvAuto automatic;
    wxString text(bytes, automatic, size);
    const wxBOM bom = wxConvAuto::DetectBOM(bytes, size);
    if (!text.empty() || size == BomLength(bom))
    {
        // The library passes UTF-32 values that are no characters through.
        const wchar_t* const data = text.wc_str();
        std::wstring checked;
        for (std::size_t at = 0, length = text.length(); at < length; ++at)
            if (!IsScalarValue(static_cast<wxUint32>(data[at])))
            {
                if (exact)
                    checked.assign(data, length);
                checked[at] = static_cast<wchar_t>(kReplacement);
                exact = false;
            }
        return exact ? text : wxString(checked);
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
        return wxString(bytes + skip, wxConvISO8859_1, size - skip);
    default:
        // Too short to tell a mark from text ("\xFF" alone): the fallback.
        return wxString(bytes, wxConvISO8859_1, size);
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

} // namespace

DecodedJournal DecodeJournal(const char* bytes, std::size_t size)
{
    DecodedJournal journal;
    const wxString text = DecodeText(bytes, size, journal.exact);
    const wchar_t* const data = text.wc_str();
    const std::size_t length = text.length();

    std::size_t start = 0;
    for (std::size_t at = 0; at < length; ++at)
    {
        const wchar_t c = data[at];
        if (c != L'\r' && c != L'\n')
            continue;
        JournalLine line;
        line.text = wxString(data + start, at - start);
        if (c == L'\r' && at + 1 < length && data[at + 1] == L'\n')
        {
            line.end = LineEnd::CrLf;
            ++at;
        }
        else
        {
            line.end = c == L'\r' ? LineEnd::Cr : LineEnd::Lf;
        }
        journal.lines.push_back(std::move(line));
        start = at + 1;
    }
    if (start < length)
        journal.lines.push_back(JournalLine{wxString(data + start, length - start), LineEnd::None});
    return journal;
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
