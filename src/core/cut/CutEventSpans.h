// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/SecondsRange.h"

#include <cstdint>
#include <map>

namespace cadrel::core {

/// The two points of one automation curve around a time. A side without a point holds -1.0 in both of its fields.
struct AutomationState {
    double leftTime = -1.0; ///< seconds; the last point at or before the time
    double leftValue = -1.0;
    double rightTime = -1.0; ///< seconds; the first point after it
    double rightValue = -1.0;
};

/// What is on a track at a time. A range with `start` equal to `end` means that there is no host event.
struct CutEventSpans {
    SecondsRange across;
    SecondsRange before;
    SecondsRange after;
    std::map<std::int32_t, AutomationState> automation; ///< by curve number
};

} // namespace cadrel::core
