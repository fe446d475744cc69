// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <vector>

namespace cadrel::core {

class Programme;

/// A stretch of the new programme that shows the same picture as a stretch of the old one, frame by frame.
struct KeptStretch {
    std::int32_t oldStart;
    std::int32_t newStart;
    std::int32_t length;
    bool isDoubled; ///< another stretch of the new programme has the same old frames for its own

    std::int32_t oldEnd() const { return oldStart + length; }
    std::int32_t newEnd() const { return newStart + length; }
    bool operator==(const KeptStretch&) const = default;
};

/// All picture of the new programme that stands in the old one, in the order of the new programme. Stretches are as long
/// as they can be and lie within one reel on both sides. Each old frame goes to one new frame, where there is a choice so
/// that as many frames as possible keep their order. Further uses of an old frame are
/// doubled, unless they only make a kept shot longer. The frames of a gap are kept where they keep their order, and all of them
/// where they move with the shot before or after them.
///
/// The time is n log n. Where more than a few dozen old shots use the same stretch of source, those nearest to the place
/// of the new shot are looked at.
std::vector<KeptStretch> findKeptStretches(const Programme& oldCut, const Programme& newCut);

} // namespace cadrel::core
