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

} // namespace cadrel::host
