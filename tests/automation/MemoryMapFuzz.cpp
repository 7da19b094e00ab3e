// Any text as a memory map: the regions read from it are well formed and the
// pointer checks over them never claim memory the map does not hold.
#include "platform/automation/MemoryRegions.h"

#include <cstdint>
#include <cstdlib>
#include <string_view>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* bytes, size_t size)
{
    const std::string_view text(reinterpret_cast<const char*>(bytes), size);
    const std::vector<automation::MemoryRegion> regions = automation::ParseMemoryMap(text);
    for (const automation::MemoryRegion& region : regions)
    {
        if (region.end <= region.begin)
            std::abort();
    }
    const automation::RegionList memory(regions);
    for (const automation::MemoryRegion& region : regions)
    {
        const std::uintptr_t probes[] = {region.begin, region.end - 1, region.end,
                                         region.begin / 2 + region.end / 2};
        for (std::uintptr_t address : probes)
        {
            const std::optional<automation::MemoryRegion> found = memory.RegionOf(address);
            if (found && (address < found->begin || address >= found->end))
                std::abort();
            if (automation::IsReadable(memory, address, 1) && !found)
                std::abort();
        }
    }
    return 0;
}
