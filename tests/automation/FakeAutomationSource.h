#pragma once

#include "platform/automation/AutomationSource.h"
#include "platform/automation/MemoryRegions.h"

#include <algorithm>
#include <cstdint>
#include <string>
#include <vector>

namespace automationtest
{

// A control made of plain fields, as a test or the fuzzer sets them, 300 by 200
// pixels with rows 20 high.
struct FakeSource : automation::AutomationSource
{
    automation::ControlKind kind = automation::ControlKind::ListCtrl;
    std::vector<std::vector<std::u16string>> rows; // a box's entries are rows of one cell
    std::vector<unsigned> states;
    std::vector<automation::ColumnInfo> columns;
    long current = -1, top = 0, lastVisible = -1;
    bool singleSelection = true, dropped = false;
    std::optional<int> headerHeight;
    int scrolledLeft = 0;
    const FakeSource *header = nullptr, *popup = nullptr;

    automation::ControlKind Kind() const override { return kind; }
    std::uintptr_t Handle() const override { return reinterpret_cast<std::uintptr_t>(this); }
    long ItemCount() const override { return static_cast<long>(rows.size()); }
    std::u16string ItemText(long item, int column) const override // negative positions wrap to none
    {
        const bool in = size_t(item) < rows.size() && size_t(column) < rows[size_t(item)].size();
        return in ? rows[size_t(item)][size_t(column)] : u"";
    }
    long Current() const override { return current; }
    long TopIndex() const override { return top; }
    long LastVisible() const override { return lastVisible; }
    unsigned ItemState(long item) const override
    {
        return size_t(item) < states.size() ? states[size_t(item)] : 0;
    }
    int ItemImage(long, int column) const override { return column == 1 ? 7 : -1; }
    std::intptr_t ItemData(long item) const override { return 1000 + item; }
    bool IsSingleSelection() const override { return singleSelection; }
    long SelectedCount() const override
    {
        return std::count_if(states.begin(), states.end(),
                             [](unsigned s) { return s & automation::itemstate::kSelected; });
    }
    bool ItemRect(long item, automation::Rect& rect) const override
    {
        rect = automation::Rect{0, int(item - top) * 20, 300, int(item - top) * 20 + 20};
        return item >= 0 && item < ItemCount();
    }
    bool CellRect(long item, int column, automation::Rect& rect) const override
    {
        if (!ItemRect(item, rect) || size_t(column) >= columns.size()) // a negative column wraps to none
            return false;
        for (int i = 0; i < column; ++i)
            rect.left += columns[size_t(i)].width;
        rect.right = rect.left + columns[size_t(column)].width;
        return true;
    }
    const automation::AutomationSource* Header() const override { return header; }
    std::optional<int> HeaderHeight() const override { return headerHeight; }
    int ColumnCount() const override { return static_cast<int>(columns.size()); }
    bool Column(int column, automation::ColumnInfo& info) const override
    {
        return size_t(column) < columns.size() && (info = columns[size_t(column)], true);
    }
    int ScrolledLeft() const override { return scrolledLeft; }
    int ItemHeight(long) const override { return 18; }
    bool IsDroppedDown() const override { return dropped; }
    const automation::AutomationSource* Popup() const override { return popup; }
    automation::Rect ClientRect() const override { return automation::Rect{0, 0, 300, 200}; }
};

// Memory that holds only what a test says it holds.
inline automation::MemoryRegion Region(const void* begin, size_t size, bool writable = true)
{
    const auto at = reinterpret_cast<std::uintptr_t>(begin);
    return automation::MemoryRegion{at, at + size, true, writable, false, false};
}

} // namespace automationtest
