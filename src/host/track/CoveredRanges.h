// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/SecondsRange.h"

#include <map>
#include <vector>

namespace cadrel::host {

/// What several stretches of time cover together, in whatever order they come. Stretches that touch are one range; nothing
/// that is shorter than an instant lies between two ranges.
///
///     added      |--------|    |----|
///     added          |-------------------|
///     uncovered           |----|    |----|
class CoveredRanges {
public:
    /// Returns what was uncovered until then, as uncovered() does.
    std::vector<core::SecondsRange> add(const core::SecondsRange& stretch);
    /// The pieces of a stretch that nothing covers, in ascending order.
    std::vector<core::SecondsRange> uncovered(const core::SecondsRange& stretch) const;
    bool isEmpty() const { return m_ends.empty(); }

private:
    using Ends = std::map<double, double>;

    /// The first range that doesn't end before a time.
    Ends::const_iterator firstUpTo(double time) const;

    Ends m_ends; ///< by the starts
};

} // namespace cadrel::host
