#pragma once

namespace wyxos
{

// Tunes the C library's allocator for a process that rebuilds lists of
// hundreds of thousands of strings every second: freed memory is kept for the
// next rebuild instead of being handed back to the system and faulted in
// again, and small blocks are merged when freed rather than in one long pause
// at a later allocation. Resident memory stays at its high-water mark. Call
// once, before anything allocates much; false when a setting was refused.
bool TuneHeapForListRebuilds();

} // namespace wyxos
