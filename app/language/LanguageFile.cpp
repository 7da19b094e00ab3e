#include "app/language/LanguageFile.h"

#include <wx/convauto.h>

namespace uilanguage
{

namespace
{

// Lines end at "\r\n", "\n" or "\r", whichever editor wrote the file.
std::size_t EndOfLine(const wxString& text, std::size_t from)
{
    const std::size_t end = text.find_first_of(wxS("\r\n"), from);
    return end == wxString::npos ? text.length() : end;
}

std::size_t StartOfNextLine(const wxString& text, std::size_t endOfLine)
{
    if (endOfLine >= text.length())
        return wxString::npos;
    if (text[endOfLine] == '\r' && endOfLine + 1 < text.length() && text[endOfLine + 1] == '\n')
        return endOfLine + 2;
    return endOfLine + 1;
}

wxString Trimmed(wxString text)
{
    return text.Trim(true).Trim(false);
}

} // namespace

wxString DecodeLanguageFile(const std::string& bytes)
{
    if (bytes.empty())
        return wxString();
    // A converter of its own per file: it remembers the byte-order mark it saw.
    wxConvAuto converter(wxFONTENCODING_ISO8859_1);
    return wxString(bytes.data(), converter, bytes.size());
}

wxString UserFileCode(const wxString& text)
{
    return Trimmed(text.substr(0, EndOfLine(text, 0)));
}

bool ServerFileCode(const wxString& text, wxString& code)
{
    bool found = false;
    for (std::size_t start = 0; start != wxString::npos;)
    {
        const std::size_t end = EndOfLine(text, start);
        // Every line is looked at: the last one that begins with the key wins.
        const wxString line = text.substr(start, end - start);
        if (line.StartsWith(wxS("serverlang")))
        {
            code = Trimmed(line.AfterFirst('='));
            found = true;
        }
        start = StartOfNextLine(text, end);
    }
    return found;
}

} // namespace uilanguage
