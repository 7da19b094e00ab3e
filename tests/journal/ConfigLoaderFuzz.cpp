// Arbitrary bytes as the configuration document: loading adds what it finds
// and never crashes; a second load changes no value already known.
#include <cstdint>
#include <cstdlib>
#include <string>

#include <wx/init.h>

#include "data/DataLocations.h"

extern "C" int LLVMFuzzerInitialize(int*, char***)
{
    static wxInitializer initializer;
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    ConfigStore store;
    wxString value = "preset";
    if (store.Lookup("APP_WYX_VERSION", value) || value != "preset")
        std::abort();

    store.LoadDocument(reinterpret_cast<const char*>(data), size);
    wxString first = "absent";
    const bool known = store.Lookup("APP_WYX_VERSION", first);

    store.LoadDocument(reinterpret_cast<const char*>(data), size);
    wxString second = "absent";
    if (store.Lookup("APP_WYX_VERSION", second) != known || second != first)
        std::abort();
    return 0;
}
