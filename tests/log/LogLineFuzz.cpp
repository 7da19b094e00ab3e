// Any bytes as a log journal line: splitting and key folding never fail, and a
// line they accept gives eight non-empty pieces without a TAB in any of them.
#include <cstddef>
#include <cstdint>
#include <cstdlib>

#include "data/JobLogManager.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const wxString line = wxString::FromUTF8(reinterpret_cast<const char*>(data), size);
    JobRecord record;
    wxString action;
    if (SplitLogLine(line, record, action))
    {
        for (std::size_t field = 0; field < record.size(); ++field)
        {
            if (field == LogField::TimeText)
                continue;
            if (record[field].empty() || record[field].Contains("\t"))
                std::abort();
        }
        if (action.empty() || action.Contains("\t"))
            std::abort();
        if (FoldedJobKey(record[LogField::Key]).size() != record[LogField::Key].length())
            std::abort();
    }
    return 0;
}
