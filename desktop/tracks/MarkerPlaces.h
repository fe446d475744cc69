// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/tracks/LaneBlocks.h"

#include <cstddef>
#include <vector>

namespace desktop {

/// A column of a row in which at least one marker begins.
struct MarkerPlace {
    std::size_t index; ///< of the last marker that begins there
    Columns columns;   ///< what that one covers, one column at least
    int room;          ///< columns up to the next place or the edge of the row
};

/// The markers of a row of `width` columns, from left to right: however many there are, a column has one place at most.
std::vector<MarkerPlace> markerPlaces(const SpanIndex& spans, const TimeScale& scale, int width);

} // namespace desktop
