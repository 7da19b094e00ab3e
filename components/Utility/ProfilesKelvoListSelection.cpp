#include "components/Utility/ProfilesKelvoListSelection.h"

#include <algorithm>
#include <climits>

bool ProfilesKelvoListSelection::IsSelected(long item) const
{
    auto it = m_ranges.upper_bound(item);
    if (it == m_ranges.begin())
        return false;
    --it;
    return item <= it->second;
}

bool ProfilesKelvoListSelection::Select(long item, bool selected)
{
    if (item < 0 || IsSelected(item) == selected)
        return false;
    SelectRange(item, item, selected);
    return true;
}

void ProfilesKelvoListSelection::SelectRange(long first, long last, bool selected)
{
    if (first > last)
        std::swap(first, last);
    first = std::max(first, 0L);
    if (last < first)
        return;

    if (selected)
    {
        // Absorb every range that overlaps or touches [first, last].
        auto it = m_ranges.upper_bound(first);
        if (it != m_ranges.begin())
        {
            auto before = std::prev(it);
            if (before->second >= first - 1)
                it = before;
        }
        long mergedFirst = first;
        long mergedLast = last;
        while (it != m_ranges.end() && (last == LONG_MAX || it->first <= last + 1))
        {
            mergedFirst = std::min(mergedFirst, it->first);
            mergedLast = std::max(mergedLast, it->second);
            m_count -= it->second - it->first + 1;
            it = m_ranges.erase(it);
        }
        m_ranges.emplace(mergedFirst, mergedLast);
        m_count += mergedLast - mergedFirst + 1;
        return;
    }

    auto it = m_ranges.upper_bound(first);
    if (it != m_ranges.begin())
    {
        auto before = std::prev(it);
        if (before->second >= first)
            it = before;
    }
    std::vector<std::pair<long, long>> kept;
    while (it != m_ranges.end() && it->first <= last)
    {
        const long a = it->first;
        const long b = it->second;
        m_count -= b - a + 1;
        it = m_ranges.erase(it);
        if (a < first)
            kept.emplace_back(a, first - 1);
        if (b > last)
            kept.emplace_back(last + 1, b);
    }
    for (const auto& range : kept)
    {
        m_ranges.emplace(range.first, range.second);
        m_count += range.second - range.first + 1;
    }
}

void ProfilesKelvoListSelection::Clear()
{
    m_ranges.clear();
    m_count = 0;
}

long ProfilesKelvoListSelection::Next(long after) const
{
    const long from = after < 0 ? 0 : after + 1;
    auto it = m_ranges.upper_bound(from);
    if (it != m_ranges.begin())
    {
        auto before = std::prev(it);
        if (before->second >= from)
            return from;
    }
    return it == m_ranges.end() ? -1 : it->first;
}

std::vector<std::pair<long, long>> ProfilesKelvoListSelection::Ranges() const
{
    return {m_ranges.begin(), m_ranges.end()};
}

void ProfilesKelvoListSelection::Truncate(long count)
{
    if (count <= 0)
    {
        Clear();
        return;
    }
    SelectRange(count, LONG_MAX, false);
}

void ProfilesKelvoListSelection::InsertGap(long at)
{
    if (at < 0)
        return;
    std::vector<std::pair<long, long>> moved;
    auto it = m_ranges.upper_bound(at);
    if (it != m_ranges.begin())
    {
        auto before = std::prev(it);
        if (before->second >= at)
            it = before;
    }
    while (it != m_ranges.end())
    {
        const long a = it->first;
        const long b = it->second;
        it = m_ranges.erase(it);
        if (a < at)
        {
            // The new row splits this range: it is not selected itself.
            moved.emplace_back(a, at - 1);
            moved.emplace_back(at + 1, b + 1);
        }
        else
        {
            moved.emplace_back(a + 1, b + 1);
        }
    }
    for (const auto& range : moved)
        m_ranges.emplace(range.first, range.second);
}

void ProfilesKelvoListSelection::Remove(long at)
{
    if (at < 0)
        return;
    Select(at, false);
    std::vector<std::pair<long, long>> moved;
    for (auto it = m_ranges.upper_bound(at); it != m_ranges.end();)
    {
        moved.emplace_back(it->first - 1, it->second - 1);
        it = m_ranges.erase(it);
    }
    for (const auto& range : moved)
    {
        // The range may now touch the one that ended just before the removed row.
        m_count -= range.second - range.first + 1;
        SelectRange(range.first, range.second, true);
    }
}
