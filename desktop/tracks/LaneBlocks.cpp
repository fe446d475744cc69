// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/LaneBlocks.h"

#include <algorithm>
#include <cmath>

namespace desktop {

namespace {

int columnAt(double seconds, const TimeScale& scale, int width)
{
    const double pixel = std::floor(scale.pixelAt(seconds) + 0.5);
    return static_cast<int>(std::clamp(pixel, -double{LaneBlocks::Beyond}, double{LaneBlocks::Beyond} + width));
}

bool isNarrow(const Columns& columns)
{
    return columns.count() < LaneBlocks::LeastBlock;
}

/// Calls `visit(index, columns)` for each span that has a column in `shown`.
template <class Visit>
void visitShown(const SpanIndex& spans, const TimeScale& scale, Columns shown, int width, Visit visit)
{
    const double start = scale.secondsAt(shown.first - 1.0);
    const double end = scale.secondsAt(shown.end + 1.0);
    spans.visitTouching(start, end, [&](std::size_t index) {
        const Columns columns = LaneBlocks::columnsOf(spans[index], scale, width);
        if (columns.first < shown.end && columns.end > shown.first)
            visit(index, columns);
    });
}

} // namespace

Columns LaneBlocks::columnsOf(const SpanIndex::Span& span, const TimeScale& scale, int width)
{
    const int first = columnAt(span.start, scale, width);
    return {first, std::max(first + 1, columnAt(span.end, scale, width))};
}

LaneBlocks::LaneBlocks(const SpanIndex& spans, const TimeScale& scale, Columns shown, int width)
{
    visitShown(spans, scale, shown, width, [&](std::size_t index, const Columns& columns) {
        if (!isNarrow(columns))
            blocks.push_back({index, columns});
        else if (!strips.empty() && columns.first <= strips.back().end)
            strips.back().end = std::max(strips.back().end, columns.end);
        else
            strips.push_back(columns);
    });
}

std::optional<std::size_t> LaneBlocks::hit(const SpanIndex& spans, const TimeScale& scale, int column, int width)
{
    std::optional<std::size_t> found;
    bool isFoundNarrow = false;
    visitShown(spans, scale, {column, column + 1}, width, [&](std::size_t index, const Columns& columns) {
        if (isNarrow(columns) || !isFoundNarrow) {
            found = index;
            isFoundNarrow = isNarrow(columns);
        }
    });
    return found;
}

} // namespace desktop
