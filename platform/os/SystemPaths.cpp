#include "platform/os/SystemPaths.h"

#include <cstdlib>
#include <string>

#include <unistd.h>

namespace wyxos
{

wxString SystemRoot()
{
    const char* root = std::getenv("WYX_SYSTEM_ROOT");
    if (root == nullptr || *root == '\0')
        return "/";
    return wxString::FromUTF8(root);
}

void ResolveSystemRoot()
{
    const char* root = std::getenv("WYX_SYSTEM_ROOT");
    if (root == nullptr || *root == '\0' || *root == '/')
        return;
    char* folder = ::getcwd(nullptr, 0);
    if (folder == nullptr)
        return;
    const std::string absolute = std::string(folder) + "/" + root;
    std::free(folder);
    ::setenv("WYX_SYSTEM_ROOT", absolute.c_str(), 1);
}

wxString UnderSystemRoot(const wxString& absolutePath)
{
    wxString root = SystemRoot();
    while (root.length() > 1 && root.EndsWith("/"))
        root.RemoveLast();
    if (root == "/")
        return absolutePath;
    return absolutePath.StartsWith("/") ? root + absolutePath : root + "/" + absolutePath;
}

} // namespace wyxos
