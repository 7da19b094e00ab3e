#pragma once

#include <cstddef>
#include <map>
#include <mutex>

#include <wx/string.h>

// Folder of both journals, with a trailing separator:
// <system root>/var/lib/Corvane/HotFolders/. Computed anew on each call.
wxString GetDataDirectory();

// The key-value configuration read from "WyxConfig.cfg" beside the executable.
// Keys are only ever inserted: a value, once known, keeps it for the process.
class wxXmlDocument;

class ConfigStore
{
public:
    static ConfigStore& Instance();

    // The program uses Instance(); a store of its own serves tests and tools.
    ConfigStore() = default;

    // True when the file exists, whether or not it could be parsed.
    bool Load();
    // Sets value and returns true when the key is known; else leaves it alone.
    bool Lookup(const wxString& key, wxString& value) const;

    // Reads a given file instead of the one beside the executable (tests, tools).
    bool LoadFile(const wxString& path);
    // Reads a document held in memory; broken XML adds nothing.
    void LoadDocument(const char* bytes, std::size_t size);

private:
    ConfigStore(const ConfigStore&) = delete;
    ConfigStore& operator=(const ConfigStore&) = delete;

    void Merge(const wxXmlDocument& document);

    // Process-wide: any thread may look a key up while another loads.
    mutable std::mutex m_lock;
    std::map<wxString, wxString> m_entries;
};

// "WyxConfig.cfg" beside the running executable.
wxString GetConfigFilePath();

// "APP_WYX_VERSION", or empty; reload first calls ConfigStore::Load.
wxString GetApplicationVersion(bool reload);
