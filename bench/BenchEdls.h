// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

namespace cadrel::bench {

/// A stretch of a roll in a programme at 24 fps, in frames.
struct Shot {
    std::uint32_t roll;
    std::uint32_t srcIn;
    std::uint32_t length;
};

/// A programme without gaps, from 00:00:00:00.
using Cut = std::vector<Shot>;

/// Scenes of fifty shots that intercut ten rolls. A million shots are the most that a day can hold.
Cut makeCut(std::size_t shotCount);

/// The cut with so many evenly spread changes: trims, lifts, inserts of new material and moved shots by turns.
Cut recut(const Cut& cut, std::size_t changeCount);

/// Writes a CMX EDL of File32 roll names with two comment lines an event, about 170 bytes each.
void writeEdl(const std::filesystem::path& path, const Cut& cut);

} // namespace cadrel::bench
