// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/MarkerPlaces.h"

namespace desktop {

std::vector<MarkerPlace> markerPlaces(const SpanIndex& spans, const TimeScale& scale, int width)
{
    std::vector<MarkerPlace> places;
    const double start = scale.secondsAt(-LaneBlocks::Beyond + 1.0);
    const double end = scale.secondsAt(width);
    spans.visitTouching(start, end, [&](std::size_t index) {
        const Columns columns = LaneBlocks::columnsOf(spans[index], scale, width);
        if (columns.first >= width)
            return;
        if (!places.empty() && places.back().columns == columns)
            places.back() = {index, columns, 0};
        else
            places.push_back({index, columns, 0});
    });
    for (std::size_t at = 0; at < places.size(); ++at) {
        const int next = at + 1 < places.size() ? places[at + 1].columns.first : width;
        places[at].room = next - places[at].columns.first;
    }
    return places;
}

} // namespace desktop
