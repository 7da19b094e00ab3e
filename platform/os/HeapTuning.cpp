#include "platform/os/HeapTuning.h"

#include <malloc.h>

namespace wyxos
{

bool TuneHeapForListRebuilds()
{
    // Without fast bins a free merges at once; with them, a hundred thousand
    // frees are merged in one pass inside the next large allocation.
    const bool noFastBins = mallopt(M_MXFAST, 0) == 1;
    // Up to 256 MB of free memory stays at the top of the heap...
    const bool keepTop = mallopt(M_TRIM_THRESHOLD, 256 * 1024 * 1024) == 1;
    // ...and blocks up to the largest threshold allowed come from the heap,
    // not from a fresh mapping whose every page faults on first use.
    const bool heapBlocks = mallopt(M_MMAP_THRESHOLD, 32 * 1024 * 1024) == 1;
    return noFastBins && keepTop && heapBlocks;
}

bool ReturnLargeFreeHeap(std::size_t keptForRebuilds)
{
    const struct mallinfo2 heap = mallinfo2();
    if (heap.fordblks <= keptForRebuilds || heap.fordblks <= heap.uordblks)
        return false;
    return malloc_trim(0) == 1;
}

} // namespace wyxos
