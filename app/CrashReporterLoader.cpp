#include "app/CrashReporterLoader.h"

#include <wx/filename.h>
#include <wx/log.h>

#include "platform/os/Registry.h"

wxString CrashReporterLibraryPath()
{
    wxString folder;
    if (!wyxos::ReadRegistryValue("SOFTWARE\\Kelvo Systems\\CrashReporter", "InstallPath", folder) ||
        folder.empty())
        return wxString();
    wxFileName library(folder + wxFileName::GetPathSeparator(), "crashreport");
    library.SetExt(wxDynamicLibrary::GetDllExt(wxDL_LIBRARY).Mid(1));
    return library.GetFullPath();
}

bool CrashReporterLoader::Load()
{
    static const wxString path = CrashReporterLibraryPath();
    return LoadFrom(path);
}

bool CrashReporterLoader::LoadFrom(const wxString& libraryPath)
{
    if (IsLoaded() || !wxFileName::FileExists(libraryPath))
        return false;
    wxLogNull quiet;
    if (!m_library.Load(libraryPath, wxDL_NOW))
        return false;
    void* install = m_library.GetSymbol("InstallCrashReporter");
    void* uninstall = m_library.GetSymbol("UninstallCrashReporter");
    if (install == nullptr || uninstall == nullptr)
    {
        m_library.Unload();
        return false;
    }
    m_install = reinterpret_cast<Entry>(install);
    m_uninstall = reinterpret_cast<Entry>(uninstall);
    return true;
}

void CrashReporterLoader::Install() const
{
    if (IsLoaded() && m_install != nullptr)
        m_install();
}

void CrashReporterLoader::Uninstall() const
{
    if (IsLoaded() && m_uninstall != nullptr)
        m_uninstall();
}
