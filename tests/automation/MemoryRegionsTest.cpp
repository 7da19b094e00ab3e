// Reading the process's memory map and checking pointers against it.
#include "platform/automation/MemoryRegions.h"

#include <gtest/gtest.h>

#include <tuple>

using namespace automation;

namespace
{

const char kConstantText[] = "held in read-only memory";

TEST(PointerCheck, AStructureMustLieWhollyInOneAccessibleRegionOfTheMap)
{
    // Writable, no access, a guard page, read-only, writable again.
    const RegionList memory({{0x6000, 0x7000, true, true, false, false},
                             {0x1000, 0x2000, false, false, false, false},
                             {0x2000, 0x3000, true, true, false, true},
                             {0x3000, 0x4000, true, false, false, false},
                             {0x5000, 0x6000, true, true, false, false}});
    // address, size, readable, writable; neighbours with the same access are one region (0x5ffc)
    const std::tuple<std::uintptr_t, size_t, bool, bool> cases[] = {
        {0x1800, 4, false, false}, {0x2800, 4, false, false}, {0x3ffc, 4, true, false},
        {0x3ffd, 4, false, false}, {0x4800, 1, false, false}, {0x5000, 8, true, true},
        {0x5ffc, 8, true, true},   {0x5000, 0, false, false}, {0x5000, SIZE_MAX, false, false}};
    for (const auto& [address, size, readable, writable] : cases)
        EXPECT_EQ(std::pair(IsReadable(memory, address, size), IsWritable(memory, address, size)),
                  std::pair(readable, writable))
            << std::hex << address << "+" << size;

    // The process's own map knows its stack and its constants.
    ProcessMemory process;
    int onStack = 0;
    EXPECT_TRUE(IsWritable(process, reinterpret_cast<std::uintptr_t>(&onStack), sizeof onStack));
    EXPECT_TRUE(IsReadable(process, reinterpret_cast<std::uintptr_t>(kConstantText), sizeof kConstantText));
    EXPECT_FALSE(IsWritable(process, reinterpret_cast<std::uintptr_t>(kConstantText), sizeof kConstantText));
    EXPECT_FALSE(IsReadable(process, 16, 4));
}

} // namespace
