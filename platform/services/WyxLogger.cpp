#include "platform/services/WyxLogger.h"

#include <cstdlib>
#include <mutex>

#include "platform/os/LanguageEnvironment.h"

namespace
{

std::mutex& DirectoryLock()
{
    static std::mutex lock;
    return lock;
}

wxString& CurrentDirectory()
{
    static wxString directory;
    return directory;
}

bool IsPlainComponent(const wxString& name)
{
    return !name.empty() && name != "." && name != ".." && name.find('/') == wxString::npos &&
           name.find(wxUniChar(0)) == wxString::npos;
}

wxString AbsoluteEnvironmentPath(const char* variable)
{
    return wyxos::AbsolutePathFrom(std::getenv(variable));
}

wxString StateFolder()
{
    const wxString state = AbsoluteEnvironmentPath("XDG_STATE_HOME");
    if (!state.empty())
        return state;
    const wxString home = AbsoluteEnvironmentPath("HOME");
    if (home.empty())
        return wxString();
    return (home == "/" ? wxString() : home) + "/.local/state";
}

} // namespace

void WyxLogger::SetLogDirectory(const wxString& name)
{
    wxString resolved;
    if (IsPlainComponent(name))
    {
        const wxString folder = StateFolder();
        if (!folder.empty())
            resolved = (folder == "/" ? wxString() : folder) + "/" + name;
    }
    std::lock_guard<std::mutex> guard(DirectoryLock());
    CurrentDirectory() = resolved;
}

wxString WyxLogger::GetLogDirectory()
{
    std::lock_guard<std::mutex> guard(DirectoryLock());
    return CurrentDirectory();
}
