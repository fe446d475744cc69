// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/Track.h"

#include <cstddef>
#include <optional>
#include <span>
#include <vector>

namespace desktop {

struct TrackRow;

/// How high the rows of the tracks are, and where each begins, in pixels from the top of the first.
class RowLayout {
public:
    enum class Size { Small, Medium, Large };

    RowLayout() = default;
    RowLayout(std::span<const TrackRow> rows, Size size);

    static int heightOf(standin::Track::Kind kind, Size size);

    std::size_t count() const { return m_tops.size() - 1; }
    /// Of all rows together.
    int height() const { return m_tops.back(); }
    /// `row` may be the count, which is below the last.
    int top(std::size_t row) const { return m_tops[row]; }
    int heightOf(std::size_t row) const { return m_tops[row + 1] - m_tops[row]; }
    /// Nothing above the first and below the last.
    std::optional<std::size_t> rowAt(int y) const;
    /// The first row that reaches below `y`; the count when none does.
    std::size_t firstBelow(int y) const;

private:
    std::vector<int> m_tops{0}; ///< of the rows, and the end of the last
};

} // namespace desktop
