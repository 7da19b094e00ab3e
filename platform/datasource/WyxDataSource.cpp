#include "platform/datasource/WyxDataSource.h"

#include <wx/filename.h>

#include "platform/os/FileContents.h"
#include "platform/os/SystemPaths.h"
#include "platform/os/TextDecoding.h"

namespace
{

const wxString kDataFolder = "/var/lib/Corvane/HotFolders/";

enum class Section
{
    None,
    HotFolders,
    Servers
};

// The configuration is small; anything larger is not ours and is read no further.
constexpr std::size_t kMaxConfigurationBytes = 1024 * 1024;

wxString ReadWholeFile(const wxString& path)
{
    std::string bytes;
    if (wyxos::ReadFileContents(path, bytes, kMaxConfigurationBytes) != wyxos::ReadResult::Read)
        return wxString();
    return wyxos::DecodeConfigurationText(bytes);
}

void ReadConfiguration(wxArrayString* hotFolders, wxArrayString* servers)
{
    wxArrayString folders;
    wxArrayString names;
    WyxDataSource::ParseConfiguration(ReadWholeFile(WyxDataSource::ConfigurationPath()), folders, names);
    if (hotFolders != nullptr)
        *hotFolders = folders;
    if (servers != nullptr)
        *servers = names;
}

} // namespace

WyxDataSource& WyxDataSource::GetInstance()
{
    static WyxDataSource instance;
    return instance;
}

wxString WyxDataSource::ConfigurationPath()
{
    return wyxos::UnderSystemRoot(kDataFolder) + "HotFolders.ini";
}

wxString WyxDataSource::IconLogPath()
{
    return wyxos::UnderSystemRoot(kDataFolder) + "IconChanges.log";
}

void WyxDataSource::ParseConfiguration(const wxString& text, wxArrayString& hotFolders,
                                       wxArrayString& servers)
{
    hotFolders.clear();
    servers.clear();
    Section section = Section::None;
    size_t start = 0;
    while (start <= text.length())
    {
        size_t end = text.find_first_of("\r\n", start);
        if (end == wxString::npos)
            end = text.length();
        wxString line = text.substr(start, end - start);
        start = end + 1;
        line.Trim(true).Trim(false);
        if (line.empty() || line[0] == ';' || line[0] == '#')
            continue;
        if (line[0] == '[' && line.Last() == ']')
        {
            const wxString name = line.Mid(1, line.length() - 2).Trim(true).Trim(false);
            section = name.IsSameAs("HotFolders", false) ? Section::HotFolders
                      : name.IsSameAs("Servers", false)  ? Section::Servers
                                                         : Section::None;
            continue;
        }
        if (section == Section::HotFolders)
            hotFolders.Add(line);
        else if (section == Section::Servers)
            servers.Add(line);
    }
}

long WyxDataSource::GetServersList(wxArrayString& names)
{
    ReadConfiguration(nullptr, &names);
    return static_cast<long>(names.size());
}

long WyxDataSource::GetHotFoldersList(wxArrayString& paths)
{
    ReadConfiguration(&paths, nullptr);
    return static_cast<long>(paths.size());
}

long WyxDataSource::ChangeHotfolderIcon(const wxString& hotFolderPath, const bool& errorState)
{
    if (hotFolderPath.empty())
        return 1;
    std::lock_guard<std::mutex> guard(m_lock);
    m_iconChanges.push_back({hotFolderPath, errorState});
    // The log is a convenience for other processes; a folder that cannot be
    // written does not make the call fail.
    const wxString line = hotFolderPath + "\t" + (errorState ? "1" : "0") + "\n";
    const wxScopedCharBuffer utf8 = line.utf8_str();
    wyxos::AppendFileContents(IconLogPath(), std::string(utf8.data(), utf8.length()));
    return 0;
}

std::vector<WyxDataSource::IconChange> WyxDataSource::GetIconChanges() const
{
    std::lock_guard<std::mutex> guard(m_lock);
    return m_iconChanges;
}
