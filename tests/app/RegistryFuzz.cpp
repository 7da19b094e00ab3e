// Any bytes in the registry file, read as UTF-8 or as Latin-1, parse without
// crashing, and every value that parsing keeps can be queried back.
#include <cstddef>
#include <cstdint>

#include <wx/strconv.h>

#include "platform/os/Registry.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const char* bytes = reinterpret_cast<const char*>(data);
    for (const wxString& text : {wxString::FromUTF8(bytes, size), wxString(bytes, wxConvISO8859_1, size)})
    {
        const wyxos::RegistryFile file = wyxos::RegistryFile::Parse(text);
        wxString value;
        file.QueryValue("SOFTWARE\\Kelvo Systems\\CrashReporter", "InstallPath", value);
        file.QueryValue(text.BeforeFirst('\n'), text.AfterFirst('=').BeforeFirst('\n'), value);
    }
    return 0;
}
