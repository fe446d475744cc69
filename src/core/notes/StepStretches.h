// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/SecondsRange.h"

#include <cstddef>
#include <vector>

namespace cadrel::core {

/// Stretches and instants of one programme, each of them of a step of change notes. A question takes log n, however many
/// stretches the answer is chosen from.
class StepStretches {
public:
    /// What is farther away from all stretches than so long, in seconds, belongs to no step. A transition and the longest
    /// sliver are shorter.
    static constexpr double Reach = 1.0;

    /// An instant is a range without a length. Steps are numbered from 1.
    void add(const SecondsRange& range, std::size_t step);
    /// Before anything is looked for. Where stretches overlap, the one that starts first has the time.
    void sort();

    /// The step whose stretch has most of the range; where none has any of it, the one that touches it or is the nearest. The
    /// first of several. 0 where there is none within reach.
    std::size_t stepOf(const SecondsRange& range) const;

private:
    struct Stretch {
        SecondsRange range;
        std::size_t step;

        double length() const { return range.end - range.start; }
    };

    std::size_t longest(std::size_t first, std::size_t end) const;
    std::size_t nearest(const SecondsRange& range, std::size_t after) const;

    std::vector<Stretch> m_stretches;
    std::vector<std::vector<std::size_t>> m_longest; ///< of 1, 2, 4 ... stretches from each on
};

} // namespace cadrel::core
