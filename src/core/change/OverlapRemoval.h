// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace cadrel::core {

/// A candidate for a stretch of a new event's source, reduced to what decides between overlapping ones.
struct CandidateStretch {
    std::int32_t start = 0; ///< frames of the new event's source
    std::int32_t end = 0;   ///< behind the last frame; greater than `start`
    double distance = 0.0;  ///< seconds between its displacement and that of the previous placement

    std::int32_t length() const { return end - start; }

    /// Whether this one stays when the two overlap and this one stands before `later` in the list: the longer one
    /// does, of equal ones that which moves less against the previous placement, and the later one in a tie.
    bool beatsLater(const CandidateStretch& later) const
    {
        return length() != later.length() ? length() > later.length() : distance < later.distance;
    }
};

/// The places of those that survive when the candidates are taken in list order and each is held against all behind it
/// that overlap it, in their order: of two, the one that doesn't stay is taken out of the list, and a candidate that is
/// taken out is held against no further ones. The places are in no particular order.
std::vector<std::size_t> survivorsOfOverlaps(const std::vector<CandidateStretch>& candidates);

} // namespace cadrel::core
