#include "platform/os/TextDecoding.h"

namespace wyxos
{

wxString DecodeConfigurationText(const std::string& bytes)
{
    std::size_t start = bytes.compare(0, 3, "\xEF\xBB\xBF") == 0 ? 3 : 0;
    wxString text;
    while (start < bytes.size())
    {
        std::size_t end = bytes.find('\n', start);
        end = end == std::string::npos ? bytes.size() : end + 1;
        const char* line = bytes.data() + start;
        const std::size_t length = end - start;
        const wxString utf8 = wxString::FromUTF8(line, length);
        // An empty result from bytes that were not empty means they were not UTF-8.
        text += !utf8.empty() ? utf8 : wxString(line, wxConvISO8859_1, length);
        start = end;
    }
    return text;
}

} // namespace wyxos
