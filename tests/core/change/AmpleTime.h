// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <ctime>

namespace cadrel::tests {

#if defined(__SANITIZE_ADDRESS__)
inline constexpr bool IsSanitized = true;
#elif defined(__has_feature)
inline constexpr bool IsSanitized = __has_feature(address_sanitizer);
#else
inline constexpr bool IsSanitized = false;
#endif
#ifdef NDEBUG
inline constexpr bool IsOptimized = true;
#else
inline constexpr bool IsOptimized = false;
#endif

/// The seconds that the processor works on an action.
template <typename Action>
double secondsOf(Action action)
{
    const std::clock_t start = std::clock();
    action();
    return static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC;
}

} // namespace cadrel::tests
