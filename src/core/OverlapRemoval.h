#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace cadrel::core {

/// A candidate for a stretch of a new event's source, reduced to what decides between overlapping ones.
struct CandidateStretch {
    std::int32_t start = 0; ///< frames of the new event's source
    std::int32_t end = 0;   ///< behind the last frame
    double distance = 0.0;  ///< seconds between its displacement and that of the previous placement

    std::int32_t length() const { return end - start; }
    bool isEmpty() const { return length() <= 0; }

    /// Whether this one stays when the two overlap and this one stands before `later` in the list: the longer one
    /// does, of equal ones that which moves less against the previous placement, and the later one in a tie.
    bool beatsLater(const CandidateStretch& later) const
    {
        return length() != later.length() ? length() > later.length() : distance < later.distance;
    }
};

/// The places of those that survive when the candidates are taken in list order and each is held against all that
/// overlap it: of two, the one that doesn't stay is taken out of the list, and a candidate that is taken out is held
/// against no further ones. Empty stretches overlap nothing. Takes n log n where the pairwise walk takes n squared.
std::vector<std::size_t> survivorsOfOverlaps(const std::vector<CandidateStretch>& candidates);

} // namespace cadrel::core
