// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Timecode.h"

namespace cadrel::core {

/// A stretch of time between two timecodes.
struct TimecodeRange {
    /// Throws Result::InvalidArgument when `to` lies before `from`.
    TimecodeRange(const Timecode& from, const Timecode& to);

    /// The smallest range that holds both.
    static TimecodeRange unite(const TimecodeRange& a, const TimecodeRange& b);

    Timecode start;
    Timecode end;
};

} // namespace cadrel::core
