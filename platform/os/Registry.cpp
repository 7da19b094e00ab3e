#include "platform/os/Registry.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <string>

#include <wx/strconv.h>
#include <wx/tokenzr.h>

#include "platform/os/SystemPaths.h"

namespace wyxos
{
namespace
{

constexpr std::size_t kMaxFileBytes = 1024 * 1024;

wxString NormalisedName(const wxString& name)
{
    wxString result = name;
    result.Trim(true).Trim(false);
    return result.Lower();
}

// Reads a regular file without ever blocking on it: a FIFO or device put in
// the file's place is refused rather than waited for.
bool ReadRegularFile(const wxString& path, std::string& bytes)
{
    const int fd = ::open(path.utf8_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY | O_NONBLOCK);
    if (fd < 0)
        return false;
    struct stat info;
    if (::fstat(fd, &info) != 0 || !S_ISREG(info.st_mode))
    {
        ::close(fd);
        return false;
    }
    char buffer[8192];
    while (bytes.size() < kMaxFileBytes)
    {
        const ssize_t got = ::read(fd, buffer, sizeof buffer);
        if (got < 0 && errno == EINTR)
            continue;
        if (got <= 0)
            break;
        bytes.append(buffer, static_cast<std::size_t>(got));
    }
    ::close(fd);
    if (bytes.size() > kMaxFileBytes)
        bytes.resize(kMaxFileBytes);
    return true;
}

// UTF-8 as written by any current editor; anything else is taken as Latin-1 so
// that a stray byte never empties the whole file.
wxString DecodeText(const std::string& bytes)
{
    std::size_t start = 0;
    if (bytes.compare(0, 3, "\xEF\xBB\xBF") == 0)
        start = 3;
    if (start == bytes.size())
        return wxString();
    const wxString utf8 = wxString::FromUTF8(bytes.data() + start, bytes.size() - start);
    if (!utf8.empty())
        return utf8;
    return wxString(bytes.data() + start, wxConvISO8859_1, bytes.size() - start);
}

} // namespace

wxString RegistryFilePath()
{
    return UnderSystemRoot("/etc/kelvo/registry.ini");
}

RegistryFile RegistryFile::Load(const wxString& path)
{
    std::string bytes;
    if (!ReadRegularFile(path, bytes))
        return RegistryFile();
    return Parse(DecodeText(bytes));
}

RegistryFile RegistryFile::Parse(const wxString& text)
{
    RegistryFile file;
    std::map<wxString, wxString>* section = nullptr;
    wxStringTokenizer lines(text, "\r\n", wxTOKEN_STRTOK);
    while (lines.HasMoreTokens())
    {
        wxString line = lines.GetNextToken();
        line.Trim(true).Trim(false);
        if (line.empty() || line[0] == ';' || line[0] == '#')
            continue;
        if (line[0] == '[')
        {
            section = nullptr;
            if (line.Last() == ']' && line.length() > 2)
                section = &file.m_keys[NormalisedName(line.Mid(1, line.length() - 2))];
            continue;
        }
        const int equals = line.Find('=');
        if (section == nullptr || equals == wxNOT_FOUND)
            continue;
        const wxString name = NormalisedName(line.Left(static_cast<std::size_t>(equals)));
        if (name.empty())
            continue;
        wxString value = line.Mid(static_cast<std::size_t>(equals) + 1);
        (*section)[name] = value.Trim(false);
    }
    return file;
}

bool RegistryFile::QueryValue(const wxString& keyPath, const wxString& valueName, wxString& value) const
{
    const auto key = m_keys.find(NormalisedName(keyPath));
    if (key == m_keys.end())
        return false;
    const auto found = key->second.find(NormalisedName(valueName));
    if (found == key->second.end())
        return false;
    value = found->second;
    return true;
}

bool ReadRegistryValue(const wxString& keyPath, const wxString& valueName, wxString& value)
{
    return RegistryFile::Load(RegistryFilePath()).QueryValue(keyPath, valueName, value);
}

} // namespace wyxos
