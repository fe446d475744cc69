// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/support/SecondsOf.h"

#include <algorithm>
#include <functional>
#include <limits>

namespace cadrel::tests {

/// No more runs than these are done for the sake of a limit.
constexpr int MostRuns = 15;

/// The time of the processor that the fastest of some runs takes, as what else the machine does makes a run slower. As long as
/// none takes less than `limit` seconds, there are more than `runs`, up to MostRuns. What is prepared doesn't count.
inline double bestSecondsOf(
    int runs, double limit, const std::function<void()>& work, const std::function<void()>& prepare = [] {})
{
    double best = std::numeric_limits<double>::max();
    for (int run = 0; run < runs || (run < MostRuns && best >= limit); ++run) {
        prepare();
        best = std::min(best, secondsOf(work));
    }
    return best;
}

} // namespace cadrel::tests
