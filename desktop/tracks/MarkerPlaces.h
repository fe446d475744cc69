// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/tracks/LaneBlocks.h"

#include <cstddef>
#include <vector>

namespace desktop {

/// The columns of a marker, one at least, or of several that have the same ones.
struct MarkerPlace {
    std::size_t index; ///< of the last of them
    Columns columns;
    int room; ///< columns from the first to that of the next place or to the edge of the row; 0 where two begin together
};

/// The markers of a row of `width` columns, from left to right. However many stand in one column, they are one place.
std::vector<MarkerPlace> markerPlaces(const SpanIndex& spans, const TimeScale& scale, int width);

} // namespace desktop
