// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/FadeCurve.h"

#include "standin/ardour/ListText.h"
#include "standin/ardour/SessionClock.h"
#include "standin/project/FileFault.h"

#include <pugixml.hpp>

#include <algorithm>
#include <cmath>
#include <numbers>
#include <string_view>

namespace standin {

namespace {

/// How many straight steps make a fade of constant power.
constexpr int StepsOfAFade = 16;
/// No fade makes anything so loud.
constexpr double Loudest = 1000.0;

} // namespace

FadeCurve FadeCurve::constantPower(std::int64_t length, bool isRising)
{
    FadeCurve curve;
    for (int step = 0; step <= StepsOfAFade; ++step) {
        const double share = static_cast<double>(step) / StepsOfAFade;
        const double value = std::sin((isRising ? share : 1.0 - share) * std::numbers::pi / 2.0);
        curve.m_points.push_back({share * static_cast<double>(length), value, 0.0});
    }
    curve.bend();
    return curve;
}

FadeCurve::FadeCurve(const pugi::xml_node& list, const SessionClock& clock)
{
    for (const ListPoint& point : readPoints(list, clock)) {
        if (!std::isfinite(point.value) || std::abs(point.value) > Loudest)
            throw FileFault("a fade has a value that no fade has");
        const double sample = point.seconds * static_cast<double>(clock.sampleRate());
        // Ardour plays no two points at one time, and neither does a spline.
        if (m_points.empty() || sample > m_points.back().sample)
            m_points.push_back({sample, point.value, 0.0});
    }
    if (std::string_view(list.attribute("interpolation-style").value()) == "Curved")
        bend();
}

void FadeCurve::bend()
{
    const std::size_t count = m_points.size();
    if (count < 3)
        return;
    m_isCurved = true;
    const auto rise = [this](std::size_t from) { return m_points[from + 1].value - m_points[from].value; };
    const auto width = [this](std::size_t from) { return m_points[from + 1].sample - m_points[from].sample; };
    for (std::size_t index = 1; index + 1 < count; ++index) {
        if (rise(index - 1) * rise(index) > 0.0)
            m_points[index].slope = 2.0 / (width(index) / rise(index) + width(index - 1) / rise(index - 1));
    }
    m_points.front().slope = 1.5 * rise(0) / width(0) - m_points[1].slope / 2.0;
    m_points.back().slope = 1.5 * rise(count - 2) / width(count - 2) - m_points[count - 2].slope / 2.0;
}

double FadeCurve::at(double sample) const
{
    if (m_points.empty())
        return 1.0;
    const auto after = std::ranges::upper_bound(m_points, sample, {}, &Point::sample);
    if (after == m_points.begin())
        return after->value;
    const Point& before = *std::prev(after);
    if (after == m_points.end())
        return before.value;
    const double width = after->sample - before.sample;
    const double share = (sample - before.sample) / width;
    if (!m_isCurved)
        return std::lerp(before.value, after->value, share);
    // The cubic with these values and slopes at its ends, in Hermite's form.
    const double rest = 1.0 - share;
    return before.value * (1.0 + 2.0 * share) * rest * rest + before.slope * width * share * rest * rest +
           after->value * (1.0 + 2.0 * rest) * share * share - after->slope * width * rest * share * share;
}

std::vector<double> FadeCurve::times() const
{
    std::vector<double> times;
    for (const Point& point : m_points)
        times.push_back(point.sample);
    return times;
}

} // namespace standin
