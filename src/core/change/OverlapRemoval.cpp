// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/OverlapRemoval.h"

#include <algorithm>
#include <iterator>
#include <map>

namespace cadrel::core {

std::vector<std::size_t> survivorsOfOverlaps(const std::vector<CandidateStretch>& candidates)
{
    // All comparisons are made in one pass: the candidates that survive so far are compared with the next one, in their
    // order. No two of them overlap, because one of the two would have been taken out. So they can be found by their
    // starts.
    //
    //     standing     |--- 0 ---|     |-- 2 --||-- 1 --|
    //     next                |------- 3 -------|
    std::map<std::int32_t, std::size_t> standing;
    std::vector<std::size_t> met;
    for (std::size_t next = 0; next < candidates.size(); ++next) {
        const CandidateStretch& candidate = candidates[next];
        auto first = standing.upper_bound(candidate.start);
        if (first != standing.begin() && candidates[std::prev(first)->second].end > candidate.start)
            --first;
        met.clear();
        for (auto other = first; other != standing.end() && other->first < candidate.end; ++other)
            met.push_back(other->second);
        std::sort(met.begin(), met.end());

        bool stands = true;
        for (const std::size_t other : met) {
            if (candidates[other].beatsLater(candidate)) {
                stands = false;
                break;
            }
            standing.erase(candidates[other].start);
        }
        if (stands)
            standing.emplace(candidate.start, next);
    }

    std::vector<std::size_t> survivors;
    survivors.reserve(standing.size());
    for (const auto& [start, place] : standing)
        survivors.push_back(place);
    return survivors;
}

} // namespace cadrel::core
