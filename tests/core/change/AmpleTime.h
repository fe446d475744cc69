// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/support/Sanitizer.h"

namespace cadrel::tests {

inline constexpr bool IsSanitized = CADREL_ADDRESS_SANITIZER;
#ifdef NDEBUG
inline constexpr bool IsOptimized = true;
#else
inline constexpr bool IsOptimized = false;
#endif

} // namespace cadrel::tests
