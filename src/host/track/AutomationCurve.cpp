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
    const auto first = m_points.begin() + static_cast<std::ptrdiff_t>(firstAt(start));
    const auto last = m_points.begin() + static_cast<std::ptrdiff_t>(firstAfter(end));

    const Point left = insertPoint(context, transaction, start, valueBefore(start));
    const Point right = insertPoint(context, transaction, end, valueBehind(end));
    for (auto point = first; point != last; ++point)
        requireOk(transaction.remove(m_curve.get(), point->node.get()));

    m_points.insert(m_points.erase(first, last), {left, right});
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
