#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

namespace automation
{

// One mapped range of the process's address space, [begin, end).
struct MemoryRegion
{
    std::uintptr_t begin = 0;
    std::uintptr_t end = 0;
    bool readable = false;
    bool writable = false;
    bool executable = false;
    // Touching it raises a fault on purpose (a stack guard page).
    bool guard = false;
};

// Where an address lies: the platform's memory query.
class MemoryRegions
{
public:
    virtual ~MemoryRegions() = default;
    // The region holding the address, nothing when it is not mapped.
    virtual std::optional<MemoryRegion> RegionOf(std::uintptr_t address) const = 0;
};

// A pointer from another process or a hook is used only when its whole
// structure lies readable (or writable) within the one region it starts in.
bool IsReadable(const MemoryRegions& memory, std::uintptr_t address, std::size_t size);
bool IsWritable(const MemoryRegions& memory, std::uintptr_t address, std::size_t size);

// The regions of a /proc/<pid>/maps text, in its order; lines that do not
// read as a region are left out.
std::vector<MemoryRegion> ParseMemoryMap(std::string_view text);

// A fixed list of regions, sorted by address.
class RegionList : public MemoryRegions
{
public:
    explicit RegionList(std::vector<MemoryRegion> regions);
    std::optional<MemoryRegion> RegionOf(std::uintptr_t address) const override;

private:
    std::vector<MemoryRegion> m_regions;
};

// This process's own memory as the kernel maps it now: read anew at each
// query, since mappings come and go between queries.
class ProcessMemory : public MemoryRegions
{
public:
    std::optional<MemoryRegion> RegionOf(std::uintptr_t address) const override;
};

} // namespace automation
