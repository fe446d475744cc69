// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace cadrel::core {

/// Two times held as floats count as one instant when they are closer than this, in seconds.
inline constexpr double SameInstant = 1.0 / 384000;

/// A stretch of time in seconds.
struct SecondsRange {
    double start = 0.0;
    double end = 0.0;

    bool operator==(const SecondsRange&) const = default;
};

} // namespace cadrel::core
