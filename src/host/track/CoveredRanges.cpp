// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/CoveredRanges.h"

#include "host/track/Instant.h"

#include <algorithm>
#include <iterator>

using cadrel::core::SecondsRange;

namespace cadrel::host {

std::vector<SecondsRange> CoveredRanges::add(const SecondsRange& stretch)
{
    std::vector<SecondsRange> pieces = uncovered(stretch);
    SecondsRange whole = stretch;
    auto range = firstUpTo(stretch.start);
    while (range != m_ends.end() && !isBefore(stretch.end, range->first)) {
        whole = {std::min(whole.start, range->first), std::max(whole.end, range->second)};
        range = m_ends.erase(range);
    }
    m_ends.emplace(whole.start, whole.end);
    return pieces;
}

std::vector<SecondsRange> CoveredRanges::uncovered(const SecondsRange& stretch) const
{
    std::vector<SecondsRange> pieces;
    double covered = stretch.start;
    for (auto range = firstUpTo(stretch.start); range != m_ends.end() && !isBefore(stretch.end, range->first);
         ++range) {
        if (isBefore(covered, range->first))
            pieces.push_back({covered, range->first});
        covered = std::max(covered, range->second);
    }
    if (isBefore(covered, stretch.end))
        pieces.push_back({covered, stretch.end});
    return pieces;
}

CoveredRanges::Ends::const_iterator CoveredRanges::firstUpTo(double time) const
{
    auto range = m_ends.upper_bound(time);
    while (range != m_ends.begin() && !isBefore(std::prev(range)->second, time))
        --range;
    return range;
}

} // namespace cadrel::host
