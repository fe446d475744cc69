// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>

namespace Velmark {

using int32 = std::int32_t;
using int64 = std::int64_t;
using uint8 = std::uint8_t;
using uint16 = std::uint16_t;
using uint32 = std::uint32_t;
using uint64 = std::uint64_t;

/// What an operation of an interface returns, unless it says otherwise: 0 is success and every other value a failure.
/// These are the values that have a meaning of their own.
inline constexpr int32 ResultOk = 0;
/// "No", or: there was nothing to do.
inline constexpr int32 ResultFalse = 1;
/// The object has no such interface.
inline constexpr int32 ResultNoInterface = -1;

} // namespace Velmark
