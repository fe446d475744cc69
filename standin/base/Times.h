// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace standin {

/// Edges that are closer than this, in seconds, are one instant.
inline constexpr double SameInstant = 1.0 / 384000;
/// All that is measured in time is limited to this, in seconds: over 30 years.
inline constexpr double FurthestTime = 1e9;

} // namespace standin
