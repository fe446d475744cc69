// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/SecondsRange.h"
#include "host/project/HighestNumber.h"

#include <cstddef>
#include <optional>
#include <vector>

namespace cadrel::host {

bool reachesInto(const core::SecondsRange& memo, const core::SecondsRange& range);
/// A range doesn't hold its end, and what is copied doesn't either.
bool liesIn(const core::SecondsRange& memo, const core::SecondsRange& range);

/// Where a memo belongs among stretches that don't overlap.
class MemoPlaces {
public:
    /// The stretches are given in the order in which they are preferred.
    explicit MemoPlaces(const std::vector<core::SecondsRange>& stretches);

    struct Belongs {
        std::optional<std::size_t> inside;  ///< the first stretch in which most of it lies
        std::optional<std::size_t> touched; ///< the first into which it reaches
    };
    Belongs find(const core::SecondsRange& memo) const;

private:
    void look(const core::SecondsRange& memo, std::size_t index, Belongs& found) const;

    std::vector<std::size_t> m_order; ///< by their starts
    const std::vector<core::SecondsRange>& m_stretches;
    HighestNumber m_preference;
};

} // namespace cadrel::host
