// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace cadrel::core {

/// A candidate for a stretch of a new event's source, reduced to what decides between overlapping ones.
struct CandidateStretch {
    std::int32_t start = 0; ///< frames of the new event's source
    std::int32_t end = 0;   ///< after the last frame; greater than `start`
    double distance = 0.0;  ///< seconds between its displacement and that of the previous placement

    std::int32_t length() const { return end - start; }

    /// Whether this one survives when the two overlap and this one comes before `later` in the list. The longer one
    /// survives. If both have the same length, it is the one that moves less against the previous placement, and in a
    /// tie the later one.
    bool beatsLater(const CandidateStretch& later) const
    {
        return length() != later.length() ? length() > later.length() : distance < later.distance;
    }
};

/// The indexes of the candidates that survive. The rule: take the candidates in list order, and compare each with all
/// later ones that overlap it, in their order. Of the two, the one that loses is taken out of the list, and isn't
/// compared with any further ones. The indexes are in no particular order.
std::vector<std::size_t> survivorsOfOverlaps(const std::vector<CandidateStretch>& candidates);

} // namespace cadrel::core
