// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/tracks/ProjectClock.h"
#include "desktop/tracks/TimeScale.h"

#include <cstdint>
#include <string>
#include <vector>

namespace desktop {

/// A line of the ruler, at the beginning of a frame.
struct RulerTick {
    double pixel = 0.0;
    std::int64_t frame = 0;
    std::string label; ///< empty for the small ones
};

/// The lines of a ruler of `width` pixels, from left to right, with one before it whose label reaches in. Labels are at least
/// `labelWidth` apart, at times that are easy to read: each hour, each ten seconds, each second frame.
std::vector<RulerTick> rulerTicks(const ProjectClock& clock, const TimeScale& scale, double width, double labelWidth);

} // namespace desktop
