// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/FrameClock.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace standin {

namespace {

/// Holds the product of a time and of the four parts of two ratios.
__extension__ typedef __int128 Wide;

std::int64_t toTicks(Wide value)
{
    using Limits = std::numeric_limits<std::int64_t>;
    return static_cast<std::int64_t>(std::clamp<Wide>(value, Limits::min(), Limits::max()));
}

} // namespace

Ratio exactRate(double framesPerSecond)
{
    // Far less than lies between a rate and the one that was pulled down from it, and enough for 23.98.
    constexpr double Tolerance = 2e-4;
    constexpr double WholeTolerance = 1e-6;
    const double whole = std::round(framesPerSecond);
    if (std::abs(framesPerSecond - whole) <= WholeTolerance)
        return {static_cast<std::int64_t>(whole), 1};
    const double pulledDown = std::round(framesPerSecond * 1.001);
    if (std::abs(framesPerSecond * 1.001 - pulledDown) <= Tolerance * pulledDown)
        return {static_cast<std::int64_t>(pulledDown) * 1000, 1001};
    constexpr std::int64_t Parts = 1'000'000;
    return {static_cast<std::int64_t>(std::round(framesPerSecond * Parts)), Parts};
}

bool FrameClock::isBeforeMiddle(std::int64_t ticks, std::uint32_t frame) const
{
    const Wide since = Wide{ticks} - m_origin;
    return 2 * since * m_timeBase.numerator * m_rate.numerator <
           (2 * Wide{frame} + 1) * m_rate.denominator * m_timeBase.denominator;
}

std::int64_t FrameClock::lastTickOf(std::uint32_t frame) const
{
    const Wide middle = (2 * Wide{frame} + 1) * m_rate.denominator * m_timeBase.denominator;
    const Wide tick = 2 * Wide{m_timeBase.numerator} * m_rate.numerator;
    return toTicks(m_origin + (middle - 1) / tick);
}

std::uint32_t FrameClock::frameCount(std::int64_t end) const
{
    const Wide length = 2 * (Wide{end} - m_origin) * m_timeBase.numerator * m_rate.numerator;
    if (length <= 0)
        return 0;
    // Frame n counts when (2 n + 1) halves of a frame are less than the length.
    const Wide halves = (length - 1) / (Wide{m_rate.denominator} * m_timeBase.denominator);
    return static_cast<std::uint32_t>(std::min<Wide>((halves + 1) / 2, std::numeric_limits<std::uint32_t>::max()));
}

} // namespace standin
