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

// A file or folder the program ships: beside the running executable (the
// build folder, where the development build finds it), else in
// ../share/wyxprogress next to the executable's folder (an installed program,
// whatever its prefix). The path beside the executable when neither exists.
wxString FindProgramFile(const wxString& name);

// "WyxConfig.cfg": beside the running executable when there is one there (the
// development build), else the administrator's <system root>/etc/wyxprogress
// one, else the installed read-only defaults (see FindProgramFile).
wxString GetConfigFilePath();

// "APP_WYX_VERSION", or empty; reload first calls ConfigStore::Load.
wxString GetApplicationVersion(bool reload);
