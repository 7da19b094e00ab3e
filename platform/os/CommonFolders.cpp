#include "platform/os/CommonFolders.h"

#include <cerrno>

#include <sys/stat.h>
#include <unistd.h>

#include <wx/filename.h>

#include "platform/os/SystemPaths.h"

namespace wyxos
{

wxString CommonAppDataFolder()
{
    wxFileName folder = wxFileName::DirName(UnderSystemRoot("/var/lib"));
    // A relative WYX_SYSTEM_ROOT still yields a full path, as on Windows.
    folder.MakeAbsolute();
    return folder.GetPath(wxPATH_GET_VOLUME);
}

namespace
{

bool IsFolder(const wxScopedCharBuffer& path)
{
    struct stat info;
    return ::stat(path.data(), &info) == 0 && S_ISDIR(info.st_mode);
}

} // namespace

bool MakeFolders(const wxString& path, unsigned finalMode)
{
    wxString trimmed = path;
    while (trimmed.length() > 1 && trimmed.EndsWith("/"))
        trimmed.RemoveLast();
    if (trimmed.empty())
        return false;
    const wxScopedCharBuffer native = trimmed.utf8_str();
    if (IsFolder(native))
        return true;

    const wxString parent = trimmed.BeforeLast('/');
    if (!parent.empty() && !MakeFolders(parent, 0755))
        return false;
    if (::mkdir(native.data(), finalMode) != 0)
        return errno == EEXIST && IsFolder(native); // another process was quicker
    ::chmod(native.data(), finalMode);
    return true;
}

} // namespace wyxos
