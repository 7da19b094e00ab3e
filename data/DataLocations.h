#pragma once

#include <map>

#include <wx/string.h>

// Folder of both journals, with a trailing separator:
// <system root>/var/lib/Corvane/HotFolders/. Computed anew on each call.
wxString GetDataDirectory();

// The key-value configuration read from "WyxConfig.cfg" beside the executable.
// Keys are only ever inserted: a value, once known, keeps it for the process.
class ConfigStore
{
public:
    static ConfigStore& Instance();

    // True when the file exists, whether or not it could be parsed.
    bool Load();
    // Sets value and returns true when the key is known; else leaves it alone.
    bool Lookup(const wxString& key, wxString& value) const;

    // Reads a given file instead of the one beside the executable (tests, tools).
    bool LoadFile(const wxString& path);

private:
    ConfigStore() = default;

    std::map<wxString, wxString> m_entries;
};

// "APP_WYX_VERSION", or empty; reload first calls ConfigStore::Load.
wxString GetApplicationVersion(bool reload);
