#include "platform/automation/MemoryRegions.h"

#include <algorithm>
#include <cstdio>
#include <string>

namespace automation
{

namespace
{

// The region the structure starts in, when the structure ends within it.
std::optional<MemoryRegion> Containing(const MemoryRegions& memory, std::uintptr_t address, std::size_t size)
{
    if (address == 0 || size == 0)
        return std::nullopt;
    const std::optional<MemoryRegion> region = memory.RegionOf(address);
    if (!region || address < region->begin || address >= region->end)
        return std::nullopt;
    if (region->guard || (!region->readable && !region->writable && !region->executable))
        return std::nullopt;
    if (size > region->end - address)
        return std::nullopt;
    return region;
}

bool ParseHex(std::string_view& text, std::uintptr_t& value)
{
    value = 0;
    std::size_t used = 0;
    for (; used < text.size(); ++used)
    {
        const char c = text[used];
        int digit = -1;
        if (c >= '0' && c <= '9')
            digit = c - '0';
        else if (c >= 'a' && c <= 'f')
            digit = c - 'a' + 10;
        else if (c >= 'A' && c <= 'F')
            digit = c - 'A' + 10;
        else
            break;
        if (value > (UINTPTR_MAX >> 4))
            return false;
        value = (value << 4) | static_cast<std::uintptr_t>(digit);
    }
    text.remove_prefix(used);
    return used > 0;
}

std::optional<MemoryRegion> ParseLine(std::string_view line)
{
    MemoryRegion region;
    if (!ParseHex(line, region.begin) || line.empty() || line.front() != '-')
        return std::nullopt;
    line.remove_prefix(1);
    if (!ParseHex(line, region.end) || region.end <= region.begin)
        return std::nullopt;
    if (line.size() < 5 || line[0] != ' ')
        return std::nullopt;
    const std::string_view perms = line.substr(1, 4);
    if ((perms[0] != 'r' && perms[0] != '-') || (perms[1] != 'w' && perms[1] != '-') ||
        (perms[2] != 'x' && perms[2] != '-') || (perms[3] != 'p' && perms[3] != 's'))
        return std::nullopt;
    region.readable = perms[0] == 'r';
    region.writable = perms[1] == 'w';
    region.executable = perms[2] == 'x';
    return region;
}

} // namespace

bool IsReadable(const MemoryRegions& memory, std::uintptr_t address, std::size_t size)
{
    const std::optional<MemoryRegion> region = Containing(memory, address, size);
    return region && region->readable;
}

bool IsWritable(const MemoryRegions& memory, std::uintptr_t address, std::size_t size)
{
    // Written memory is read back by its owner: a write-only mapping is no buffer.
    const std::optional<MemoryRegion> region = Containing(memory, address, size);
    return region && region->readable && region->writable;
}

std::vector<MemoryRegion> ParseMemoryMap(std::string_view text)
{
    std::vector<MemoryRegion> regions;
    while (!text.empty())
    {
        const std::size_t end = text.find('\n');
        const std::string_view line = text.substr(0, end);
        if (const std::optional<MemoryRegion> region = ParseLine(line))
            regions.push_back(*region);
        if (end == std::string_view::npos)
            break;
        text.remove_prefix(end + 1);
    }
    return regions;
}

RegionList::RegionList(std::vector<MemoryRegion> regions) : m_regions(std::move(regions))
{
    std::sort(m_regions.begin(), m_regions.end(),
              [](const MemoryRegion& a, const MemoryRegion& b) { return a.begin < b.begin; });
    // Neighbours with the same access are one region, as the native memory
    // query reports them: a buffer may span two mappings of the heap.
    std::vector<MemoryRegion> merged;
    for (const MemoryRegion& region : m_regions)
    {
        if (!merged.empty())
        {
            MemoryRegion& last = merged.back();
            if (last.end == region.begin && last.readable == region.readable &&
                last.writable == region.writable && last.executable == region.executable &&
                last.guard == region.guard)
            {
                last.end = region.end;
                continue;
            }
        }
        merged.push_back(region);
    }
    m_regions.swap(merged);
}

std::optional<MemoryRegion> RegionList::RegionOf(std::uintptr_t address) const
{
    // The last region starting at or below the address.
    auto after = std::upper_bound(m_regions.begin(), m_regions.end(), address,
                                  [](std::uintptr_t a, const MemoryRegion& r) { return a < r.begin; });
    if (after == m_regions.begin())
        return std::nullopt;
    const MemoryRegion& region = *(after - 1);
    if (address >= region.end)
        return std::nullopt;
    return region;
}

std::optional<MemoryRegion> ProcessMemory::RegionOf(std::uintptr_t address) const
{
    std::FILE* file = std::fopen("/proc/self/maps", "re");
    if (!file)
        return std::nullopt;
    std::string text;
    char buffer[16384];
    std::size_t got = 0;
    while ((got = std::fread(buffer, 1, sizeof buffer, file)) > 0)
        text.append(buffer, got);
    std::fclose(file);
    return RegionList(ParseMemoryMap(text)).RegionOf(address);
}

} // namespace automation
