// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Timecode.h"

#include <optional>
#include <string_view>

namespace cadrel::core::fileio {

/// A motion line, which says how fast the shot of an event before it plays, in frames per second. A negative speed plays it
/// backwards.
///
///     M2   A002C001       -24.0                11:00:03:00
struct MotionLine {
    /// Whether a trimmed line is one.
    static bool isOne(std::string_view line);

    /// `roll` is a part of the line.
    explicit MotionLine(std::string_view line);

    std::string_view roll;         ///< may be empty
    bool isReadable = false;       ///< whether it has a speed
    bool isBackwards = false;      ///< whether the speed is below zero
    std::optional<Timecode> start; ///< where in the source the motion begins
};

} // namespace cadrel::core::fileio
