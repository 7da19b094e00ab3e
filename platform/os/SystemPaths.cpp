#include "platform/os/SystemPaths.h"

#include <cstdlib>

namespace wyxos
{

wxString SystemRoot()
{
    const char* root = std::getenv("WYX_SYSTEM_ROOT");
    if (root == nullptr || *root == '\0')
        return "/";
    return wxString::FromUTF8(root);
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
