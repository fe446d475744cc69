// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/SecondsRange.h"

namespace cadrel::host {

/// Whether one time lies before another, in seconds, and isn't the same instant. Times lose and gain the time origin on
/// their way, and are a hair off afterwards.
inline bool isBefore(double time, double other)
{
    return other - time >= core::SameInstant;
}

/// Bounds included.
inline bool isWithin(double time, double start, double end)
{
    return !isBefore(time, start) && !isBefore(end, time);
}

/// Whether an event has more than half of itself in a range, bounds included; of one that sticks out on both sides the half
/// before the end of the range counts.
///
///     range                      |------------|
///     counts                   |-----|     |-----|
///     doesn't count         |-----|          |-----|
///     counts             |------------------------|
///     doesn't count             |------------------------------|
inline bool countsAsIn(const core::SecondsRange& event, const core::SecondsRange& range)
{
    const auto isMostOf = [](double part, double rest) { return isBefore(rest, part); };
    if (isWithin(event.end, range.start, range.end))
        return isWithin(event.start, range.start, range.end) ||
               isMostOf(event.end - range.start, range.start - event.start);
    return isBefore(range.end, event.end) && isMostOf(range.end - event.start, event.end - range.end);
}

} // namespace cadrel::host
