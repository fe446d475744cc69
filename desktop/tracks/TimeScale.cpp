// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/TimeScale.h"

#include "standin/base/Times.h"

#include <algorithm>
#include <cmath>

namespace desktop {

namespace {

constexpr double Margin = 0.01; ///< of the width, on either side of what fits

} // namespace

void TimeScale::setLeft(double seconds)
{
    if (!std::isnan(seconds))
        m_left = std::clamp(seconds, -standin::FurthestTime, standin::FurthestTime);
}

void TimeScale::zoomBy(double factor, double aroundPixel)
{
    if (!(factor > 0.0))
        return;
    const double kept = secondsAt(aroundPixel);
    m_secondsPerPixel = std::clamp(m_secondsPerPixel / factor, Finest, Coarsest);
    setLeft(kept - aroundPixel * m_secondsPerPixel);
}

void TimeScale::fit(double start, double end, double width)
{
    const double length = end > start ? end - start : 1.0;
    const double room = std::max(width, 1.0) * (1.0 - 2.0 * Margin);
    m_secondsPerPixel = std::clamp(length / room, Finest, Coarsest);
    setLeft(start - width * Margin * m_secondsPerPixel);
}

} // namespace desktop
