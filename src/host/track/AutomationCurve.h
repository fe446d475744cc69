// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/CutEventSpans.h"
#include "velmark/Counted.h"
#include "velmark/ProjectNode.h"

#include <cstddef>
#include <cstdint>
#include <vector>

namespace Velmark {
class FUnknown;
class IEditTransaction;
class IHostContext;
} // namespace Velmark

namespace cadrel::host {

/// An automation curve of a track with its points as they stood when it was read. Times are seconds of the project's
/// clock, values lie from 0 to 1.
class AutomationCurve {
public:
    /// Reads the curve; `origin` is the project's time origin. Throws Result::HostObjectMissing for what is no curve.
    AutomationCurve(Velmark::FUnknown* curve, double origin);

    /// What it automates.
    std::int32_t number() const { return m_number; }

    /// The points on both sides of a time; after the last one the curve keeps its value.
    core::AutomationState stateAt(double time) const;

    /// Lets the curve run straight from its value at `start` to its value at `end`. All points from `start` to `end` are
    /// replaced by one new point at each of them. Does nothing to a curve without points, and for an end before the
    /// start.
    ///
    ///     before   --\  .--.  /--          after   --.        /--
    ///                 \_|  |_/                        `-.____/
    ///                start  end
    void fill(Velmark::IHostContext* context, Velmark::IEditTransaction& transaction, double start, double end);

    // Stretches that one value takes. A curve that has the value there already stays as it is, and so does one without
    // points. A stretch shorter than an instant is none.

    /// Keeps what the curve has come to at `start` up to `end`, where it steps to what it goes on with.
    ///
    ///     before   --\  .--.  /--          after   --.      ./--
    ///                 \_|  |_/                        `-----|
    ///                start  end
    void hold(Velmark::IHostContext* context, Velmark::IEditTransaction& transaction, double start, double end);
    /// Likewise, with what the curve has come to at another time.
    void holdAsAt(double time, Velmark::IHostContext* context, Velmark::IEditTransaction& transaction, double start,
                  double end);
    /// Has what the curve goes on with at `end` from `start` on, where it steps from what it has come to.
    void holdBackwards(Velmark::IHostContext* context, Velmark::IEditTransaction& transaction, double start,
                       double end);
    /// As hold, but for good where no point stands after `end`.
    void holdLast(Velmark::IHostContext* context, Velmark::IEditTransaction& transaction, double start, double end);

    /// Takes away what was held by an object of this class from `start` to `end`, where the curve runs the same without it.
    void dropNeedless(Velmark::IEditTransaction& transaction, double start, double end);

private:
    struct Point {
        double time;
        double value;
        Velmark::Counted<Velmark::IProjectNode> node;
    };

    /// A new point.
    struct Place {
        double time;
        double value;
        bool isForGood = false; ///< also where the curve runs the same without it
    };

    std::size_t size() const { return m_left.size() + m_right.size(); }
    bool isEmpty() const { return size() == 0; }
    const Point& at(std::size_t index) const
    {
        return index < m_left.size() ? m_left[index] : m_right[size() - 1 - index];
    }
    /// Parts the points before that at `index`.
    void partAt(std::size_t index);
    /// Whether the points from `first` up to `last`, by index, have that value.
    bool haveValue(std::size_t first, std::size_t last, double value) const;
    /// The first point of which something isn't true that is true of all before it, by index.
    template <typename IsTrue>
    std::size_t firstWithout(const IsTrue& isTrue) const;
    /// The first point that doesn't stand before the time, and the first that stands after it, by index.
    std::size_t firstAt(double time) const;
    std::size_t firstAfter(double time) const;
    /// The curve between the point before `index` and that at `index`, beyond either end as at its only neighbour.
    double valueBetween(std::size_t index, double time) const;
    /// What the curve comes to and goes on from at a time; they differ where several points stand.
    double valueBefore(double time) const;
    double valueBehind(double time) const;
    /// Whether the curve has the value all the way from just after the one time to just before the other.
    bool isLevel(double start, double end, double value) const;
    void level(Velmark::IHostContext* context, Velmark::IEditTransaction& transaction, double start, double end,
               double value);
    /// Lets the curve go from the first place to the last through those between. The first is at `start`, with what the curve
    /// has come to there, and the last at `end`, with what it goes on with. Points that stand there stay.
    void leadThrough(Velmark::IHostContext* context, Velmark::IEditTransaction& transaction, std::vector<Place> places);
    /// Whether the curve runs the same without the next point to the right.
    bool isNextNeedless() const;
    /// Puts new points in the place of those from `first` up to `last`, by index.
    void replace(Velmark::IHostContext* context, Velmark::IEditTransaction& transaction, std::size_t first,
                 std::size_t last, const std::vector<Place>& places);
    Point insertPoint(Velmark::IHostContext* context, Velmark::IEditTransaction& transaction, const Place& place) const;

    Velmark::Counted<Velmark::IProjectNode> m_curve;
    double m_origin;
    std::int32_t m_number;
    // The points in the order of the curve, parted where it was changed last, so that changes one after the other move few.
    std::vector<Point> m_left;
    std::vector<Point> m_right; ///< the next one is the last
};

} // namespace cadrel::host
