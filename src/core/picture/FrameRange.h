// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <algorithm>
#include <cstdint>
#include <vector>

namespace cadrel::core {

/// A stretch of a programme in frames: `start` up to and including the frame before `end`.
struct FrameRange {
    std::int32_t start = 0;
    std::int32_t end = 0;

    bool isEmpty() const { return start >= end; }
    std::int32_t length() const { return end - start; }
    bool contains(std::int32_t frame) const { return start <= frame && frame < end; }
    FrameRange shiftedBy(std::int32_t frames) const { return {start + frames, end + frames}; }

    bool operator==(const FrameRange&) const = default;
};

/// What both have in common; empty when that is nothing.
inline FrameRange intersect(const FrameRange& a, const FrameRange& b)
{
    return {std::max(a.start, b.start), std::min(a.end, b.end)};
}

/// Ascending, not empty, with no overlaps.
using FrameRanges = std::vector<FrameRange>;

/// Joins ranges that overlap or stand less than `distance` frames apart. The ranges may come in any order; empty ones
/// drop out.
///
///     distance 3    |--|  |--|   |--|
///                   |--------|   |--|
FrameRanges joinedWithin(std::int32_t distance, std::vector<FrameRange> ranges);

/// Joins ranges that overlap or touch.
inline FrameRanges united(std::vector<FrameRange> ranges)
{
    return joinedWithin(1, std::move(ranges));
}

/// What `taken` leaves of `ranges`.
FrameRanges without(const FrameRanges& ranges, const FrameRanges& taken);

/// What of `ranges` lies in `bounds`, in no more time than that takes.
FrameRanges within(const FrameRange& bounds, const FrameRanges& ranges);

/// How many frames they hold.
std::int32_t lengthOf(const FrameRanges& ranges);

FrameRanges shiftedBy(std::int32_t frames, FrameRanges ranges);

} // namespace cadrel::core
