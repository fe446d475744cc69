// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/picture/FrameRange.h"

#include <utility>

namespace cadrel::core {

FrameRanges joinedWithin(std::int32_t distance, std::vector<FrameRange> ranges)
{
    std::erase_if(ranges, [](const FrameRange& range) { return range.isEmpty(); });
    std::sort(ranges.begin(), ranges.end(), [](const FrameRange& a, const FrameRange& b) { return a.start < b.start; });
    FrameRanges joined;
    for (const FrameRange& range : ranges) {
        if (!joined.empty() && range.start - joined.back().end < distance)
            joined.back().end = std::max(joined.back().end, range.end);
        else
            joined.push_back(range);
    }
    return joined;
}

FrameRanges without(const FrameRanges& ranges, const FrameRanges& taken)
{
    FrameRanges rest;
    auto next = taken.begin();
    for (FrameRange range : ranges) {
        while (next != taken.end() && next->end <= range.start)
            ++next;
        for (auto cut = next; cut != taken.end() && cut->start < range.end; ++cut) {
            if (range.start < cut->start)
                rest.push_back({range.start, cut->start});
            range.start = cut->end;
        }
        if (!range.isEmpty())
            rest.push_back(range);
    }
    return rest;
}

FrameRanges within(const FrameRange& bounds, const FrameRanges& ranges)
{
    FrameRanges inside;
    auto range = std::partition_point(ranges.begin(), ranges.end(),
                                      [&](const FrameRange& other) { return other.end <= bounds.start; });
    for (; range != ranges.end() && range->start < bounds.end; ++range) {
        const FrameRange common = intersect(*range, bounds);
        if (!common.isEmpty())
            inside.push_back(common);
    }
    return inside;
}

std::int32_t lengthOf(const FrameRanges& ranges)
{
    std::int32_t frames = 0;
    for (const FrameRange& range : ranges)
        frames += range.length();
    return frames;
}

FrameRanges shiftedBy(std::int32_t frames, FrameRanges ranges)
{
    for (FrameRange& range : ranges)
        range = range.shiftedBy(frames);
    return ranges;
}

} // namespace cadrel::core
