#pragma once

#include <array>
#include <wx/string.h>

// One job as held in memory: eight texts addressed by position, copied by value.
// Positions 0 to 3 mean the same in both models; 4 to 7 depend on the journal.
using JobRecord = std::array<wxString, 8>;

// Positions of a record of the status model.
namespace StatusField
{
enum : std::size_t
{
    Key = 0,
    FilePath,
    HotFolderPath,
    Server,
    Size,
    Format,
    TimeText,
    Status
};
}

// Positions of a record of the log model.
namespace LogField
{
enum : std::size_t
{
    Key = 0,
    FilePath,
    HotFolderPath,
    Server,
    TimeText,
    Status,
    Detail,
    DosTime
};
}
