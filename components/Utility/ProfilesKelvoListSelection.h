#pragma once

#include <map>
#include <utility>
#include <vector>

// The selected items of a list as disjoint, non-adjacent ranges. Selecting,
// clearing or cutting a span of a 100,000-row virtual list costs a few map
// operations, not one per row. Plain C++ so it is tested without a display.
class ProfilesKelvoListSelection
{
public:
    bool IsSelected(long item) const;
    // Returns whether the item's state changed.
    bool Select(long item, bool selected);
    // first and last inclusive, in either order.
    void SelectRange(long first, long last, bool selected);
    void Clear();

    long Count() const { return m_count; }
    bool Empty() const { return m_count == 0; }
    // The first selected item after the given one (-1: from the start), or -1.
    long Next(long after) const;
    // The selected items as inclusive ranges, in order.
    std::vector<std::pair<long, long>> Ranges() const;

    // Keeps only items below count, for a list that shrank.
    void Truncate(long count);
    // A row was inserted at the index: items from it on move down by one.
    void InsertGap(long at);
    // The row at the index was removed: items after it move up by one.
    void Remove(long at);

private:
    std::map<long, long> m_ranges; // first -> last, inclusive
    long m_count = 0;
};
