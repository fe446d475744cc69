// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <ctime>
#include <functional>

namespace cadrel::tests {

/// The time of the processor that some work takes, so that other programs don't count.
inline double secondsOf(const std::function<void()>& work)
{
    const std::clock_t begun = std::clock();
    work();
    return static_cast<double>(std::clock() - begun) / CLOCKS_PER_SEC;
}

} // namespace cadrel::tests
