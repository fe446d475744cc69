// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/WrittenAutomation.h"

#include "host/border/HostFailure.h"
#include "host/project/EventPrint.h"
#include "host/track/Instant.h"
#include "velmark/Automation.h"

#include <algorithm>
#include <cmath>
#include <cstddef>

using namespace Velmark;

namespace cadrel::host {

namespace {

/// Of each point.
constexpr std::size_t PointSize = 3;
/// No number of a curve and no time of a project is as far from 0, and as instants they all fit in 64 bits.
constexpr double FurthestNumber = 4294967296.0;

double numberOf(IProjectNode& curve)
{
    return required(query<IEnvelopeTrack>(&curve))->curveNumber();
}

double valueOf(IProjectNode& point)
{
    return required(query<IAutomationPoint>(&point))->getValue();
}

} // namespace

std::optional<WrittenAutomation> WrittenAutomation::ofNumbers(const Numbers& numbers)
{
    const auto isOne = [](double number) { return std::abs(number) < FurthestNumber; };
    if (numbers.size() % PointSize != 0 || !std::ranges::all_of(numbers, isOne))
        return std::nullopt;
    WrittenAutomation written;
    for (std::size_t index = 0; index < numbers.size(); index += PointSize)
        written.add(numbers[index], numbers[index + 1], numbers[index + 2]);
    return written;
}

WrittenAutomation WrittenAutomation::upTo(double end, std::optional<Numbers> curves)
{
    WrittenAutomation written;
    written.m_unknown = Unknown{end, std::move(curves)};
    return written;
}

void WrittenAutomation::add(IProjectNode& curve, IProjectNode& point)
{
    add(numberOf(curve), point.getStart(&curve), valueOf(point));
}

void WrittenAutomation::add(double curve, double time, double value)
{
    ++m_points[curve][{toInstant(time), value}];
    m_numbers.insert(m_numbers.end(), {curve, time, value});
}

std::vector<WrittenAutomation::Node> WrittenAutomation::others(IProjectNode& curve, std::vector<Node> points) const
{
    const double number = numberOf(curve);
    if (m_unknown) {
        const std::optional<Numbers>& curves = m_unknown->curves;
        if (!curves || std::ranges::find(*curves, number) != curves->end())
            std::erase_if(points,
                          [&](const Node& point) { return !isBefore(m_unknown->end, point->getStart(&curve)); });
        return points;
    }
    const auto written = m_points.find(number);
    if (written == m_points.end())
        return points;
    auto left = written->second;
    std::erase_if(points, [&](const Node& point) {
        const auto found = left.find({toInstant(point->getStart(&curve)), valueOf(*point)});
        return found != left.end() && found->second-- > 0;
    });
    return points;
}

} // namespace cadrel::host
