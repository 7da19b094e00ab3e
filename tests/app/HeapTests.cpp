// Memory after a huge journal: freed lists are kept for the next rebuild, but
// not gigabytes of them for ever.
#include <gtest/gtest.h>

#include <fstream>
#include <unistd.h>
#include <memory>
#include <vector>

#include "platform/os/HeapTuning.h"

namespace
{
long ResidentKiB()
{
    long pages = 0, resident = 0;
    std::ifstream("/proc/self/statm") >> pages >> resident;
    return resident * (::sysconf(_SC_PAGESIZE) / 1024);
}
} // namespace

TEST(Heap, FreedMemoryBeyondWhatARebuildNeedsGoesBackToTheSystem)
{
#if defined(__has_feature)
#if __has_feature(address_sanitizer) || __has_feature(thread_sanitizer)
    GTEST_SKIP() << "the sanitizers bring their own allocator";
#endif
#endif
    wyxos::TuneHeapForListRebuilds();
    constexpr std::size_t kKept = std::size_t(64) << 20;
    EXPECT_FALSE(wyxos::ReturnLargeFreeHeap(kKept)) << "nothing much is free yet";
    std::vector<std::unique_ptr<char[]>> kept;
    {
        // A huge journal's records: small blocks, 160 MiB in all. When it
        // shrinks, a few records stay, scattered among the freed ones: no
        // trimming of the heap's top can give the space between them back.
        std::vector<std::unique_ptr<char[]>> records(160 * 1024 / 4);
        for (auto& record : records)
        {
            record = std::make_unique<char[]>(4096);
            record[0] = record[4095] = 1;
        }
        for (std::size_t i = 0; i < records.size(); ++i)
            if (i % 64 != 0)
                records[i].reset();
        kept.swap(records);
    }
    const long before = ResidentKiB();
    EXPECT_TRUE(wyxos::ReturnLargeFreeHeap(kKept));
    EXPECT_LT(ResidentKiB(), before - 100 * 1024);
}
