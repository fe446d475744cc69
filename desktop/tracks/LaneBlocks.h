// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/tracks/SpanIndex.h"
#include "desktop/tracks/TimeScale.h"

#include <cstddef>
#include <optional>
#include <vector>

namespace desktop {

/// Columns of pixels, from `first` up to and without `end`.
struct Columns {
    int first = 0;
    int end = 0;

    int count() const { return end - first; }
    bool operator==(const Columns&) const = default;
};

/// What is seen of the spans of a lane on `width` columns. A span takes the columns between its rounded edges, and one at
/// least. Those that are too narrow for a block of their own are joined to strips with those beside them:
///
///     spans     |------------|  | || ||     |   |---------|
///     drawn     [   block    ]  [strip]     []  [  block  ]
///
/// Columns reach at most Beyond past either edge, so that no edge shows that isn't there.
struct LaneBlocks {
    static constexpr int Beyond = 16;
    static constexpr int LeastBlock = 3; ///< columns

    struct Block {
        std::size_t index; ///< of the span
        Columns columns;
    };

    LaneBlocks() = default;
    LaneBlocks(const SpanIndex& spans, const TimeScale& scale, int width) : LaneBlocks(spans, scale, {0, width}, width)
    {
    }
    /// Only what is seen in `shown`, such as that of a part.
    LaneBlocks(const SpanIndex& spans, const TimeScale& scale, Columns shown, int width);

    /// The columns of a span. They may lie outside of the row, and have then no more than one column there.
    static Columns columnsOf(const SpanIndex::Span& span, const TimeScale& scale, int width);
    /// The span that is drawn on top in a column: a narrow one before a block, and the last of them. Nothing where none is.
    static std::optional<std::size_t> hit(const SpanIndex& spans, const TimeScale& scale, int column, int width);

    std::vector<Block> blocks;   ///< in the order of the spans: later ones lie on top
    std::vector<Columns> strips; ///< from left to right; they lie on top of the blocks, and don't touch each other
};

} // namespace desktop
