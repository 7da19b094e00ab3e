#pragma once

#include <map>

#include <wx/string.h>

namespace wyxos
{

// The machine-wide registry values (install path, crash reporter folder) live
// in a read-only text file, <system root>/etc/kelvo/registry.ini:
//
//   [SOFTWARE\Kelvo Systems\CrashReporter]
//   InstallPath=/opt/kelvo/crashreport
//
// One section per key path, "name=value" lines. Key paths and value names are
// matched without regard to case, as the registry does. Blank lines, lines
// starting with ';' or '#', lines without '=' and lines before the first
// section are ignored; white space around names and values is dropped; a
// later line for the same value replaces an earlier one. An absent file, key
// or value is an absent value.
wxString RegistryFilePath();

class RegistryFile
{
public:
    // The parsed contents of a file; empty when it is missing, not a regular
    // file or unreadable. Files above 1 MiB are read up to that size only.
    static RegistryFile Load(const wxString& path);
    static RegistryFile Parse(const wxString& text);

    // True and value set when the key has the value; otherwise value is untouched.
    bool QueryValue(const wxString& keyPath, const wxString& valueName, wxString& value) const;

private:
    std::map<wxString, std::map<wxString, wxString>> m_keys;
};

// One value of the registry file at RegistryFilePath(), read anew on each call.
bool ReadRegistryValue(const wxString& keyPath, const wxString& valueName, wxString& value);

} // namespace wyxos
