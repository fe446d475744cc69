// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>

namespace cadrel::core {

/// How many frames the user can choose for the thresholds of the settings. What is stored may lie outside.
struct FrameBounds {
    static constexpr std::int32_t Fewest = 0;
    static constexpr std::int32_t Most = 10000;
};

} // namespace cadrel::core
