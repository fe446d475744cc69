// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/CurveColumns.h"

#include <algorithm>
#include <cstddef>

namespace desktop {

namespace {

/// Where the curve is at a time that lies after the points before `next` and not after `next`.
float valueBefore(const CurvePoints& curve, std::size_t next, double time)
{
    if (next == 0)
        return curve.values.front();
    if (next == curve.times.size())
        return curve.values.back();
    const double start = curve.times[next - 1];
    const double share = (time - start) / (curve.times[next] - start);
    return curve.values[next - 1] + (curve.values[next] - curve.values[next - 1]) * static_cast<float>(share);
}

/// The first point after a time.
std::size_t pointAfter(const CurvePoints& curve, double time)
{
    const auto begin = curve.times.begin();
    return static_cast<std::size_t>(std::upper_bound(begin, curve.times.end(), time) - begin);
}

} // namespace

float valueOf(const CurvePoints& curve, double time)
{
    return valueBefore(curve, pointAfter(curve, time), time);
}

std::vector<CurveColumn> curveColumns(const CurvePoints& curve, const TimeScale& scale, int width)
{
    std::vector<CurveColumn> columns;
    if (curve.times.empty() || width <= 0)
        return columns;
    columns.reserve(static_cast<std::size_t>(width));
    std::size_t next = pointAfter(curve, scale.secondsAt(0.0));
    float value = valueBefore(curve, next, scale.secondsAt(0.0));
    for (int column = 0; column < width; ++column) {
        const double end = scale.secondsAt(column + 1.0);
        CurveColumn seen{value, value};
        const auto see = [&seen](float passed) {
            seen.low = std::min(seen.low, passed);
            seen.high = std::max(seen.high, passed);
        };
        for (; next < curve.times.size() && curve.times[next] <= end; ++next)
            see(curve.values[next]);
        value = valueBefore(curve, next, end);
        see(value);
        columns.push_back(seen);
    }
    return columns;
}

} // namespace desktop
