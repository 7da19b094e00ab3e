#pragma once

#include <cstddef>

namespace wyxos
{

// Tunes the C library's allocator for a process that rebuilds lists of
// hundreds of thousands of strings every second: freed memory is kept for the
// next rebuild instead of being handed back to the system and faulted in
// again, and small blocks are merged when freed rather than in one long pause
// at a later allocation. Resident memory stays at its high-water mark. Call
// once, before anything allocates much; false when a setting was refused.
bool TuneHeapForListRebuilds();

// Hands free heap memory back to the system once there is more of it than a
// rebuild of the largest list that fits a journal needs, and more than is in
// use: after a huge journal has shrunk, gigabytes must not stay resident for
// ever. Cheap when there is little to give back; true when it gave some.
// The default keeps what the rebuilds of a hundred thousand jobs churn through.
bool ReturnLargeFreeHeap(std::size_t keptForRebuilds = std::size_t(256) << 20);

} // namespace wyxos
