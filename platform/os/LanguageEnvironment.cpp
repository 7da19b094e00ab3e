#include "platform/os/LanguageEnvironment.h"

#include <cstdlib>

#include <pwd.h>
#include <unistd.h>

namespace wyxos
{

namespace
{

wxString HomeFolder()
{
    const wxString home = AbsolutePathFrom(std::getenv("HOME"));
    if (!home.empty())
        return home;
    // A service started without HOME still has a home in the user database.
    struct passwd entry;
    struct passwd* found = nullptr;
    char buffer[4096];
    if (::getpwuid_r(::getuid(), &entry, buffer, sizeof buffer, &found) == 0 && found != nullptr)
        return AbsolutePathFrom(found->pw_dir);
    return wxString();
}

} // namespace

wxString UserConfigFolder()
{
    const wxString configured = AbsolutePathFrom(std::getenv("XDG_CONFIG_HOME"));
    if (!configured.empty())
        return configured;
    const wxString home = HomeFolder();
    if (home.empty())
        return wxString();
    return (home == "/" ? wxString() : home) + "/.config";
}

wxString UserMessagesLocaleName()
{
    for (const char* variable : {"LC_ALL", "LC_MESSAGES", "LANG"})
    {
        const char* value = std::getenv(variable);
        if (value != nullptr && *value != '\0')
            return wxString::FromUTF8(value);
    }
    return "C";
}

wxString AbsolutePathFrom(const char* value)
{
    if (value == nullptr || value[0] != '/')
        return wxString();
    wxString path = wxString::FromUTF8(value);
    while (path.length() > 1 && path.EndsWith("/"))
        path.RemoveLast();
    return path;
}

} // namespace wyxos
