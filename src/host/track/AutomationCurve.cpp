// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/AutomationCurve.h"

#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "host/track/Instant.h"
#include "velmark/Automation.h"
#include "velmark/ClassId.h"
#include "velmark/Context.h"
#include "velmark/Editing.h"

#include <algorithm>
#include <cmath>
#include <iterator>

using namespace Velmark;

namespace cadrel::host {

AutomationCurve::AutomationCurve(FUnknown* curve, double origin)
    : m_curve(required(query<IProjectNode>(curve))), m_origin(origin),
      m_number(required(query<IEnvelopeTrack>(curve))->curveNumber())
{
    for (const Counted<IProjectNode>& point : childrenOf(*m_curve)) {
        const double value = required(query<IAutomationPoint>(point))->getValue();
        m_points.push_back({point->getStart(m_curve.get()) + origin, value, point});
    }
}

core::AutomationState AutomationCurve::stateAt(double time) const
{
    core::AutomationState state;
    const std::size_t right = firstAfter(time);
    if (right > 0) {
        const Point& left = m_points[right - 1];
        state = {left.time, left.value, time, left.value};
    }
    if (right < m_points.size()) {
        state.rightTime = m_points[right].time;
        state.rightValue = m_points[right].value;
    }
    return state;
}

void AutomationCurve::fill(IHostContext* context, IEditTransaction& transaction, double start, double end)
{
    if (end < start || m_points.empty())
        return;
    replace(context, transaction, firstAt(start), firstAfter(end),
            {{start, valueBefore(start)}, {end, valueBehind(end)}});
}

void AutomationCurve::hold(IHostContext* context, IEditTransaction& transaction, double start, double end)
{
    holdAsAt(start, context, transaction, start, end);
}

void AutomationCurve::holdAsAt(double time, IHostContext* context, IEditTransaction& transaction, double start,
                               double end)
{
    if (!m_points.empty())
        level(context, transaction, start, end, valueBefore(time));
}

void AutomationCurve::holdBackwards(IHostContext* context, IEditTransaction& transaction, double start, double end)
{
    if (!m_points.empty())
        level(context, transaction, start, end, valueBehind(end));
}

void AutomationCurve::holdLast(IHostContext* context, IEditTransaction& transaction, double start, double end)
{
    if (m_points.empty() || firstAfter(end) < m_points.size()) {
        hold(context, transaction, start, end);
        return;
    }
    const double value = valueBefore(start);
    const bool isSteady = std::all_of(m_points.begin() + static_cast<std::ptrdiff_t>(firstAt(start)), m_points.end(),
                                      [value](const Point& point) { return point.value == value; });
    if (!isSteady)
        replace(context, transaction, firstAt(start), m_points.size(), {{start, value}});
}

bool AutomationCurve::isLevel(double start, double end, double value) const
{
    const auto from = m_points.begin() + static_cast<std::ptrdiff_t>(firstAfter(start));
    const auto to = m_points.begin() + static_cast<std::ptrdiff_t>(firstAt(end));
    return valueBehind(start) == value && valueBefore(end) == value &&
           std::all_of(from, to, [value](const Point& point) { return point.value == value; });
}

void AutomationCurve::level(IHostContext* context, IEditTransaction& transaction, double start, double end,
                            double value)
{
    if (!isBefore(start, end) || isLevel(start, end, value))
        return;
    const Place before{start, valueBefore(start)};
    const Place behind{end, valueBehind(end)};
    std::vector<Place> places{{start, value}, {end, value}};
    if (before.value != value)
        places.insert(places.begin(), before);
    if (behind.value != value)
        places.push_back(behind);
    replace(context, transaction, firstAt(start), firstAfter(end), places);
}

void AutomationCurve::replace(IHostContext* context, IEditTransaction& transaction, std::size_t first, std::size_t last,
                              const std::vector<Place>& places)
{
    const auto from = m_points.begin() + static_cast<std::ptrdiff_t>(first);
    const auto to = m_points.begin() + static_cast<std::ptrdiff_t>(last);
    for (auto point = from; point != to; ++point)
        requireOk(transaction.remove(m_curve.get(), point->node.get()));
    std::vector<Point> inserted;
    for (const Place& place : places)
        inserted.push_back(insertPoint(context, transaction, place.time, place.value));
    m_points.insert(m_points.erase(from, to), inserted.begin(), inserted.end());
}

std::size_t AutomationCurve::firstAt(double time) const
{
    const auto found =
        std::ranges::partition_point(m_points, [time](const Point& point) { return isBefore(point.time, time); });
    return static_cast<std::size_t>(found - m_points.begin());
}

std::size_t AutomationCurve::firstAfter(double time) const
{
    const auto found =
        std::ranges::partition_point(m_points, [time](const Point& point) { return !isBefore(time, point.time); });
    return static_cast<std::size_t>(found - m_points.begin());
}

double AutomationCurve::valueBetween(std::size_t index, double time) const
{
    if (index == 0)
        return m_points.front().value;
    const Point& left = m_points[index - 1];
    if (index == m_points.size())
        return left.value;
    const Point& right = m_points[index];
    return std::lerp(left.value, right.value, (time - left.time) / (right.time - left.time));
}

double AutomationCurve::valueBefore(double time) const
{
    const std::size_t index = firstAt(time);
    return index < firstAfter(time) ? m_points[index].value : valueBetween(index, time);
}

double AutomationCurve::valueBehind(double time) const
{
    const std::size_t index = firstAfter(time);
    return index > firstAt(time) ? m_points[index - 1].value : valueBetween(index, time);
}

AutomationCurve::Point AutomationCurve::insertPoint(IHostContext* context, IEditTransaction& transaction, double time,
                                                    double value) const
{
    const auto point = required(create<IAutomationPoint>(context, ClassId::AutomationPoint));
    const auto node = required(query<IProjectNode>(point));
    const auto held = static_cast<float>(value);
    requireOk(point->setValue(held));
    requireOk(node->setStart(m_curve.get(), 0, time - m_origin));
    requireOk(transaction.insert(m_curve.get(), node.get()));
    return {time, held, node};
}

} // namespace cadrel::host
