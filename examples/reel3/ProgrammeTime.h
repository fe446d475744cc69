// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace reel3 {

/// Times and lengths of the reel in quarters of a frame, the finest that is edited.
using Quarters = long;

inline constexpr double QuartersOfASecond = 24.0 * 4.0;

inline constexpr Quarters frames(long count)
{
    return 4 * count;
}

inline constexpr double toSeconds(Quarters quarters)
{
    return static_cast<double>(quarters) / QuartersOfASecond;
}

/// Reads "HH:MM:SS:FF" and every shorter form of it, such as "SS:FF", with an optional ".25", ".50" or ".75" of a frame
/// after it. Throws std::invalid_argument.
Quarters parseQuarters(const std::string& text);

/// The same, from the start of the reel, which is 03:00:00:00.
Quarters parseTime(const std::string& timecode);

} // namespace reel3
