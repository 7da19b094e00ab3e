#pragma once

#include <wx/dynlib.h>
#include <wx/string.h>

// The optional crash reporter library, "crashreport" with the platform's
// library extension, in the folder that the registry value
// "SOFTWARE\Kelvo Systems\CrashReporter" / "InstallPath" names. It is used
// only when it exports both "InstallCrashReporter" and
// "UninstallCrashReporter"; otherwise it is unloaded at once and neither entry
// is ever called. Destruction unloads it.
class CrashReporterLoader
{
public:
    CrashReporterLoader() = default;

    // From the folder the registry names; the path is worked out once per process.
    bool Load();
    // From the given library file.
    bool LoadFrom(const wxString& libraryPath);

    bool IsLoaded() const { return m_library.IsLoaded(); }

    // Call the library's entries when it is loaded; nothing otherwise.
    void Install() const;
    void Uninstall() const;

private:
    using Entry = void (*)();

    CrashReporterLoader(const CrashReporterLoader&) = delete;
    CrashReporterLoader& operator=(const CrashReporterLoader&) = delete;

    wxDynamicLibrary m_library;
    Entry m_install = nullptr;
    Entry m_uninstall = nullptr;
};

// The crash reporter library's full path from the registry, or empty.
wxString CrashReporterLibraryPath();
