#include "data/DataLocations.h"

#include <vector>

#include <wx/filename.h>
#include <wx/log.h>
#include <wx/mstream.h>
#include <wx/stdpaths.h>
#include <wx/xml/xml.h>

#include "platform/os/CommonFolders.h"
#include "platform/os/SystemPaths.h"

namespace
{

constexpr const wchar_t* kConfigurationElement = L"WyxConfiguration";

// The first "WyxConfiguration" below the root: the root's own children first,
// then each child's subtree in document order, depth first. Walked with an
// explicit stack so that a deeply nested document cannot exhaust the stack.
const wxXmlNode* FindConfiguration(const wxXmlNode* root)
{
    std::vector<const wxXmlNode*> pending{root};
    while (!pending.empty())
    {
        const wxXmlNode* parent = pending.back();
        pending.pop_back();
        std::vector<const wxXmlNode*> children;
        for (const wxXmlNode* child = parent->GetChildren(); child != nullptr; child = child->GetNext())
        {
            if (child->GetType() != wxXML_ELEMENT_NODE)
                continue;
            if (child->GetName() == kConfigurationElement)
                return child;
            children.push_back(child);
        }
        pending.insert(pending.end(), children.rbegin(), children.rend());
    }
    return nullptr;
}

void InsertEntries(const wxXmlDocument& document, std::map<wxString, wxString>& entries)
{
    const wxXmlNode* root = document.GetRoot();
    const wxXmlNode* configuration = root != nullptr ? FindConfiguration(root) : nullptr;
    if (configuration == nullptr)
        return;
    for (const wxXmlNode* child = configuration->GetChildren(); child != nullptr; child = child->GetNext())
    {
        const wxXmlAttribute* key = child->GetAttributes();
        const wxXmlAttribute* value = key != nullptr ? key->GetNext() : nullptr;
        if (value != nullptr)
            entries.emplace(key->GetValue(), value->GetValue()); // never replaces a known key
    }
}

} // namespace

wxString GetDataDirectory()
{
    wxFileName folder = wxFileName::DirName(wyxos::CommonAppDataFolder());
    folder.AppendDir("Corvane");
    folder.AppendDir("HotFolders");
    return folder.GetPath(wxPATH_GET_VOLUME | wxPATH_GET_SEPARATOR);
}

ConfigStore& ConfigStore::Instance()
{
    static ConfigStore store;
    return store;
}

bool ConfigStore::Load()
{
    return LoadFile(GetConfigFilePath());
}

bool ConfigStore::Lookup(const wxString& key, wxString& value) const
{
    std::lock_guard<std::mutex> guard(m_lock);
    const auto found = m_entries.find(key);
    if (found == m_entries.end())
        return false;
    value = found->second;
    return true;
}

bool ConfigStore::LoadFile(const wxString& path)
{
    if (path.empty() || !wxFileName::FileExists(path))
        return false;
    wxLogNull quiet; // a broken file adds nothing and says nothing
    wxXmlDocument document;
    if (document.Load(path, "UTF-8"))
        Merge(document);
    return true;
}

void ConfigStore::LoadDocument(const char* bytes, std::size_t size)
{
    wxLogNull quiet;
    wxMemoryInputStream stream(bytes, size);
    wxXmlDocument document;
    if (document.Load(stream, "UTF-8"))
        Merge(document);
}

void ConfigStore::Merge(const wxXmlDocument& document)
{
    // Parsed outside the lock; readers on other threads see the old entries or all the new ones.
    std::map<wxString, wxString> entries;
    InsertEntries(document, entries);
    std::lock_guard<std::mutex> guard(m_lock);
    // A key once loaded keeps its value, as a key first met in this document takes its own.
    m_entries.insert(entries.begin(), entries.end());
}

wxString FindProgramFile(const wxString& name)
{
    const wxFileName executable(wxStandardPaths::Get().GetExecutablePath());
    const wxString beside = executable.GetPathWithSep() + name;
    if (wxFileName::Exists(beside))
        return beside;
    wxFileName installed(executable.GetPath(), name);
    installed.RemoveLastDir();
    installed.AppendDir("share");
    installed.AppendDir("wyxprogress");
    return wxFileName::Exists(installed.GetFullPath()) ? installed.GetFullPath() : beside;
}

wxString GetConfigFilePath()
{
    const wxString name = "WyxConfig.cfg";
    const wxString beside = wxFileName(wxStandardPaths::Get().GetExecutablePath()).GetPathWithSep() + name;
    if (wxFileName::FileExists(beside))
        return beside;
    const wxString administrators = wyxos::UnderSystemRoot("/etc/wyxprogress/") + name;
    if (wxFileName::FileExists(administrators))
        return administrators;
    return FindProgramFile(name);
}

wxString GetApplicationVersion(bool reload)
{
    if (reload)
        ConfigStore::Instance().Load();
    wxString version;
    ConfigStore::Instance().Lookup("APP_WYX_VERSION", version);
    return version;
}
