// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/edit/RangeCurves.h"

#include "standin/project/Envelope.h"

#include <algorithm>
#include <cmath>

using namespace Velmark;

namespace standin {

namespace {

/// Values of a curve that are closer than this are the same. What comes through the interface is a 32-bit float, and so is
/// what a curve is held at.
constexpr double SameValue = 1e-7;

bool isHoldingPoint(const Counted<AutomationPoint>& point)
{
    return point && point->isHolding();
}

Counted<AutomationPoint> makeHoldingPoint(double time, double value)
{
    auto point = makeCounted<AutomationPoint>();
    point->setHolding(true);
    point->setSpan(time, time);
    point->setValue(value);
    return point;
}

Counted<AutomationPoint> copyOf(const Counted<AutomationPoint>& point, double time)
{
    auto copy = makeCounted<AutomationPoint>();
    copy->setHolding(point->isHolding());
    copy->setSpan(time, time);
    copy->setValue(point->value());
    copy->setName(point->name());
    for (const auto& [key, attribute] : point->attributes())
        copy->setAttribute(key, attribute);
    copy->setSelected(point->selected());
    copy->setUnknownMembers(point->unknownMembers());
    return copy;
}

/// The points of a curve in and around a range, parted by where they stand.
struct PointsAround {
    Counted<AutomationPoint> before; ///< the nearest before the range
    CurvePoints atStart;
    CurvePoints within;
    CurvePoints atEnd;
    Counted<AutomationPoint> behind; ///< the nearest after it
};

PointsAround pointsAround(const Envelope& curve, double start, double end)
{
    PointsAround around;
    Node* node = curve.firstChildAfter(start - SameInstant);
    const auto pointOf = [](Node* child) {
        return Counted<AutomationPoint>::share(static_cast<AutomationPoint*>(child));
    };
    around.before = pointOf(node ? curve.childBefore(*node) : curve.lastChild());
    for (; node && node->start() < end + SameInstant; node = curve.childBehind(*node)) {
        const bool isAtEnd = node->start() > end - SameInstant;
        const bool isAtStart = node->start() < start + SameInstant;
        (isAtEnd ? around.atEnd : isAtStart ? around.atStart : around.within).push_back(pointOf(node));
    }
    around.behind = pointOf(node);
    return around;
}

/// Copies of the points of a range up to before its end, at times from its start.
CurvePoints pointsBeforeEnd(const Envelope& curve, const PointsAround& around, double start)
{
    CurvePoints points;
    points.push_back(around.atStart.empty() ? makeHoldingPoint(0.0, *curve.valueBehind(start))
                                            : copyOf(around.atStart.back(), 0.0));
    for (const Counted<AutomationPoint>& point : around.within)
        points.push_back(copyOf(point, point->start() - start));
    return points;
}

/// Whether a curve runs the same without a point that stands between two others, or beside the one that there is.
bool isNeedless(const AutomationPoint* before, const AutomationPoint& point, const AutomationPoint* behind)
{
    const auto hasValue = [&](double value) { return std::abs(point.value() - value) <= SameValue; };
    if (!before || !behind) {
        const AutomationPoint* const only = before ? before : behind;
        return only && hasValue(only->value());
    }
    // Points outside of a range stand apart from those at its edges, so these two are never at one time.
    const double share = (point.start() - before->start()) / (behind->start() - before->start());
    return hasValue(std::lerp(before->value(), behind->value(), share));
}

/// Takes a point out of a run of points where the curve is the same without it.
void leaveOutIfNeedless(CurvePoints& run, const Counted<AutomationPoint>& point)
{
    const auto found = std::ranges::find(run, point);
    const AutomationPoint* const before = found != run.begin() ? std::prev(found)->get() : nullptr;
    const AutomationPoint* const behind = std::next(found) != run.end() ? std::next(found)->get() : nullptr;
    if (isNeedless(before, *point, behind))
        run.erase(found);
}

/// The first of the points in and at a range that has a value; null when none has it.
Counted<AutomationPoint> firstWithValue(const PointsAround& around, double value)
{
    for (const CurvePoints* const stood : {&around.atStart, &around.within, &around.atEnd}) {
        for (const Counted<AutomationPoint>& point : *stood) {
            if (std::abs(point->value() - value) <= SameValue)
                return point;
        }
    }
    return nullptr;
}

} // namespace

CurvePoints readCurve(const Envelope& curve, double start, double end)
{
    const PointsAround around = pointsAround(curve, start, end);
    if (!curve.firstChild())
        return {};
    CurvePoints points = pointsBeforeEnd(curve, around, start);
    // Where the curve steps, the first point of the step belongs to what is before it.
    if (around.atEnd.size() > 1) {
        points.push_back(copyOf(around.atEnd.front(), end - start));
    } else {
        const double last = around.atEnd.empty() ? *curve.valueBefore(end) : around.atEnd.front()->value();
        points.push_back(makeHoldingPoint(end - start, last));
    }
    return points;
}

CurvePoints readRest(const Envelope& written, double start)
{
    const auto last = Counted<AutomationPoint>::share(static_cast<AutomationPoint*>(written.lastChild()));
    if (!last)
        return {};
    CurvePoints points = pointsBeforeEnd(written, pointsAround(written, start, last->start()), start);
    points.push_back(copyOf(last, last->start() - start));
    return points;
}

void replaceCurve(Envelope& curve, double start, double end, const CurvePoints& points)
{
    const PointsAround around = pointsAround(curve, start, end);
    Counted<AutomationPoint> outerStart;
    Counted<AutomationPoint> outerEnd;
    if (curve.firstChild()) {
        // Before the start of the project there is nothing that a curve could come from.
        if (start >= SameInstant)
            outerStart =
                around.atStart.empty() ? makeHoldingPoint(start, *curve.valueBefore(start)) : around.atStart.front();
        outerEnd = around.atEnd.empty() ? makeHoldingPoint(end, *curve.valueBehind(end)) : around.atEnd.back();
    }

    CurvePoints run;
    const auto append = [&run](const Counted<AutomationPoint>& point) {
        if (point)
            run.push_back(point);
    };
    append(around.before);
    append(outerStart);
    // An outer point that stood there before may be a hair inside of the edge, and the inner one goes behind it.
    const double first = outerStart ? std::max(start, outerStart->start()) : start;
    const double last = outerEnd ? std::min(end, outerEnd->start()) : end;
    for (const Counted<AutomationPoint>& point : points) {
        const double time = std::min(std::max(start + point->start(), first), last);
        point->setSpan(time, time);
        append(point);
    }
    append(outerEnd);
    append(around.behind);

    if (!points.empty()) {
        for (const Counted<AutomationPoint>& inner : {points.front(), points.back()}) {
            if (isHoldingPoint(inner))
                leaveOutIfNeedless(run, inner);
        }
    }
    if (outerStart)
        leaveOutIfNeedless(run, outerStart);
    if (isHoldingPoint(outerEnd))
        leaveOutIfNeedless(run, outerEnd);
    // The one point that is left may be far from all else, and what is edited between it and there would bend.
    if (run.size() == 1 && (isHoldingPoint(run.front()) || run.front() == around.behind)) {
        const auto kept = firstWithValue(around, run.front()->value());
        if (kept && run.front() == outerEnd)
            run = {outerEnd = kept};
        // It may be a copy that goes one day. A range that is cleared may have been a copy itself, and leaves nothing.
        else if (kept && !isHoldingPoint(kept) && !points.empty() && run.front() == around.behind)
            run = {outerEnd = kept, around.behind};
    }

    const auto stays = [&](const Counted<AutomationPoint>& point) {
        return (point == outerStart || point == outerEnd) && std::ranges::find(run, point) != run.end();
    };
    for (const CurvePoints* const stood : {&around.atStart, &around.within, &around.atEnd}) {
        for (const Counted<AutomationPoint>& point : *stood) {
            if (!stays(point))
                point->remove();
        }
    }
    for (const Counted<AutomationPoint>& point : run) {
        if (!point->parent())
            point->insertInto(curve);
    }
    // What was inserted at the time of the outer point stands behind it so far.
    if (outerEnd && outerEnd->parent() && curve.pointBehind(*outerEnd) != around.behind.get())
        outerEnd->insertInto(curve);
}

} // namespace standin
