// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/tracks/TimeScale.h"
#include "desktop/tracks/TrackIndex.h"

#include <vector>

namespace desktop {

/// What a curve goes through within one column of pixels, from 0 to 1.
struct CurveColumn {
    float low = 0.0F;
    float high = 0.0F;
};

/// The value at a time, after the points that stand there. The curve has points.
float valueOf(const CurvePoints& curve, double time);

/// The columns of a curve on a row of `width` pixels, however many points it has: before its first point and after its last it
/// keeps their values. Empty for a curve without points.
std::vector<CurveColumn> curveColumns(const CurvePoints& curve, const TimeScale& scale, int width);

} // namespace desktop
