#include <cstddef>
#include <cstdint>

#include <wx/string.h>

#include "data/JobRecord.h"
#include "data/StatusLine.h"

// One journal line, as decoded text, to a record: never a crash, and a shown
// record always has its key, paths and tag-free status filled.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const wxString line = wxString::FromUTF8(reinterpret_cast<const char*>(data), size);
    JobRecord record;
    if (ParseStatusLine(line, record))
    {
        for (const wxString& field : record)
            if (field.Find('\t') != wxNOT_FOUND)
                __builtin_trap();
        if (record[StatusField::Key].empty() || record[StatusField::Status].empty())
            __builtin_trap();
    }
    return 0;
}
