#pragma once

#include "data/JobRecord.h"

#include <cstddef>

// Display rows made on demand for the virtual job table. A table of 100,000
// jobs shows forty at a time: a row is made only when a cell of it is asked for.
class JobRowSource
{
public:
    virtual ~JobRowSource() = default;
    virtual std::size_t GetRowCount() const = 0;
    // Fills `row` with the display texts of row `index` (< GetRowCount()).
    virtual void MakeRow(std::size_t index, JobRecord& row) const = 0;
};
