#include "app/InstallPath.h"

#include "platform/os/Registry.h"

namespace
{

const wxString kProductKey = "SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve";
constexpr std::size_t kValueBufferBytes = 517;

std::size_t Utf16Units(const wxString& text)
{
    std::size_t units = 0;
    for (const wxUniChar c : text)
        units += c.GetValue() > 0xFFFF ? 2 : 1;
    return units;
}

} // namespace

wxString ReadInstallPath()
{
    wxString value;
    if (!wyxos::ReadRegistryValue(kProductKey, "InstallPath", value))
        return wxString();
    // A registry text ends at its first terminator.
    const std::size_t terminator = value.find(wxUniChar(0));
    if (terminator != wxString::npos)
        value.erase(terminator);
    if ((Utf16Units(value) + 1) * 2 > kValueBufferBytes)
        return wxString();
    return value;
}
