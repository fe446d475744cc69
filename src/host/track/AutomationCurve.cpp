// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/AutomationCurve.h"

#include "core/time/SecondsRange.h"
#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "host/track/HeldPoint.h"
#include "host/track/Instant.h"
#include "velmark/Automation.h"
#include "velmark/Context.h"
#include "velmark/Editing.h"

#include <cmath>
#include <utility>

using namespace Velmark;

namespace cadrel::host {

namespace {

/// Values of a curve that are closer than this are the same.
constexpr double SameValue = 1e-7;

} // namespace

AutomationCurve::AutomationCurve(FUnknown* curve, double origin)
    : m_curve(required(query<IProjectNode>(curve))), m_origin(origin),
      m_number(required(query<IEnvelopeTrack>(curve))->curveNumber())
{
    for (const Counted<IProjectNode>& point : childrenOf(*m_curve)) {
        const double value = required(query<IAutomationPoint>(point))->getValue();
        m_left.push_back({point->getStart(m_curve.get()) + origin, value, point});
    }
}

core::AutomationState AutomationCurve::stateAt(double time) const
{
    core::AutomationState state;
    const std::size_t right = firstAfter(time);
    if (right > 0) {
        const Point& left = at(right - 1);
        state = {left.time, left.value, time, left.value};
    }
    if (right < size()) {
        state.rightTime = at(right).time;
        state.rightValue = at(right).value;
    }
    return state;
}

void AutomationCurve::fill(IHostContext* context, IEditTransaction& transaction, double start, double end)
{
    if (end < start || isEmpty())
        return;
    // Whoever wants it filled wants these points: none of them goes again by itself.
    replace(context, transaction, firstAt(start), firstAfter(end),
            {{start, valueBefore(start), true}, {end, valueBehind(end), true}});
}

void AutomationCurve::hold(IHostContext* context, IEditTransaction& transaction, double start, double end)
{
    holdAsAt(start, context, transaction, start, end);
}

void AutomationCurve::holdAsAt(double time, IHostContext* context, IEditTransaction& transaction, double start,
                               double end)
{
    if (!isEmpty())
        level(context, transaction, start, end, valueBefore(time));
}

void AutomationCurve::holdBackwards(IHostContext* context, IEditTransaction& transaction, double start, double end)
{
    if (!isEmpty())
        level(context, transaction, start, end, valueBehind(end));
}

void AutomationCurve::holdLast(IHostContext* context, IEditTransaction& transaction, double start, double end)
{
    if (isEmpty() || firstAfter(end) < size()) {
        hold(context, transaction, start, end);
        return;
    }
    const double value = valueBefore(start);
    const std::size_t first = firstAt(start);
    if (haveValue(first, size(), value))
        return;
    if (first < firstAfter(start))
        replace(context, transaction, first + 1, size(), {});
    else
        replace(context, transaction, first, size(), {{start, value}});
}

void AutomationCurve::dropNeedless(IEditTransaction& transaction, double start, double end)
{
    partAt(firstAt(start));
    while (!m_right.empty() && !isBefore(end, m_right.back().time)) {
        if (isNextNeedless() && isHeld(*m_right.back().node, static_cast<float>(m_right.back().value))) {
            requireOk(transaction.remove(m_curve.get(), m_right.back().node.get()));
            m_right.pop_back();
        } else {
            partAt(m_left.size() + 1);
        }
    }
}

bool AutomationCurve::isNextNeedless() const
{
    const Point& point = m_right.back();
    const Point* const before = m_left.empty() ? nullptr : &m_left.back();
    const Point* const behind = m_right.size() < 2 ? nullptr : &m_right[m_right.size() - 2];
    const auto hasValue = [&](double value) { return std::abs(point.value - value) <= SameValue; };
    if (!before || !behind) {
        const Point* const only = before ? before : behind;
        return only && hasValue(only->value);
    }
    // Of more than two at one time the curve comes to the first and goes on from the last.
    const double length = behind->time - before->time;
    return length < core::SameInstant ||
           hasValue(std::lerp(before->value, behind->value, (point.time - before->time) / length));
}

bool AutomationCurve::isLevel(double start, double end, double value) const
{
    return valueBehind(start) == value && valueBefore(end) == value &&
           haveValue(firstAfter(start), firstAt(end), value);
}

bool AutomationCurve::haveValue(std::size_t first, std::size_t last, double value) const
{
    for (std::size_t index = first; index < last; ++index) {
        if (at(index).value != value)
            return false;
    }
    return true;
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
    leadThrough(context, transaction, std::move(places));
}

void AutomationCurve::leadThrough(IHostContext* context, IEditTransaction& transaction, std::vector<Place> places)
{
    const double start = places.front().time;
    const double end = places.back().time;
    std::size_t first = firstAt(start);
    std::size_t last = firstAfter(end);
    // What comes to stand at the same time stands exactly there, so that only its order counts.
    const auto moveTo = [&places](double from, double to) {
        for (Place& place : places) {
            if (place.time == from)
                place.time = to;
        }
    };
    if (first < last && !isBefore(start, at(first).time)) {
        moveTo(start, at(first).time);
        places.erase(places.begin());
        ++first;
    }
    const bool keepsLast = first < last && !isBefore(at(last - 1).time, end);
    if (keepsLast) {
        --last;
        moveTo(end, at(last).time);
        places.pop_back();
    }
    replace(context, transaction, first, last, places);
    // The host puts a point after those that stand there already.
    if (keepsLast && !places.empty() && !isBefore(places.back().time, end)) {
        IProjectNode* const kept = m_right.back().node.get();
        requireOk(transaction.remove(m_curve.get(), kept));
        requireOk(transaction.insert(m_curve.get(), kept));
    }
}

void AutomationCurve::replace(IHostContext* context, IEditTransaction& transaction, std::size_t first, std::size_t last,
                              const std::vector<Place>& places)
{
    partAt(first);
    for (std::size_t index = first; index < last; ++index) {
        requireOk(transaction.remove(m_curve.get(), m_right.back().node.get()));
        m_right.pop_back();
    }
    for (const Place& place : places)
        m_left.push_back(insertPoint(context, transaction, place));
}

void AutomationCurve::partAt(std::size_t index)
{
    while (m_left.size() > index) {
        m_right.push_back(std::move(m_left.back()));
        m_left.pop_back();
    }
    while (m_left.size() < index) {
        m_left.push_back(std::move(m_right.back()));
        m_right.pop_back();
    }
}

template <typename IsTrue>
std::size_t AutomationCurve::firstWithout(const IsTrue& isTrue) const
{
    std::size_t first = 0;
    for (std::size_t count = size(); count > 0;) {
        const std::size_t half = count / 2;
        if (isTrue(at(first + half))) {
            first += half + 1;
            count -= half + 1;
        } else {
            count = half;
        }
    }
    return first;
}

std::size_t AutomationCurve::firstAt(double time) const
{
    return firstWithout([time](const Point& point) { return isBefore(point.time, time); });
}

std::size_t AutomationCurve::firstAfter(double time) const
{
    return firstWithout([time](const Point& point) { return !isBefore(time, point.time); });
}

double AutomationCurve::valueBetween(std::size_t index, double time) const
{
    if (index == 0)
        return at(0).value;
    const Point& left = at(index - 1);
    if (index == size())
        return left.value;
    const Point& right = at(index);
    return std::lerp(left.value, right.value, (time - left.time) / (right.time - left.time));
}

double AutomationCurve::valueBefore(double time) const
{
    const std::size_t index = firstAt(time);
    return index < firstAfter(time) ? at(index).value : valueBetween(index, time);
}

double AutomationCurve::valueBehind(double time) const
{
    const std::size_t index = firstAfter(time);
    return index > firstAt(time) ? at(index - 1).value : valueBetween(index, time);
}

AutomationCurve::Point AutomationCurve::insertPoint(IHostContext* context, IEditTransaction& transaction,
                                                    const Place& place) const
{
    const auto value = static_cast<float>(place.value);
    auto node = makePoint(context, *m_curve, place.time - m_origin, value);
    if (!place.isForGood)
        markAsHeld(*node, value);
    requireOk(transaction.insert(m_curve.get(), node.get()));
    return {place.time, value, std::move(node)};
}

} // namespace cadrel::host
