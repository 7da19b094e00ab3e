#include "platform/os/Registry.h"

#include <string>

#include <wx/tokenzr.h>

#include "platform/os/FileContents.h"
#include "platform/os/SystemPaths.h"
#include "platform/os/TextDecoding.h"

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

} // namespace

wxString RegistryFilePath()
{
    return UnderSystemRoot("/etc/kelvo/registry.ini");
}

RegistryFile RegistryFile::Load(const wxString& path)
{
    std::string bytes;
    if (ReadFileContents(path, bytes, kMaxFileBytes) != ReadResult::Read)
        return RegistryFile();
    return Parse(DecodeConfigurationText(bytes));
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
