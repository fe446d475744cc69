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

    /// Lets the curve run straight from what it has come to at `start` to what it goes on with at `end`: a new point at
    /// either takes the place of all that stood from the one to the other. Does nothing to a curve without points, and
    /// for an end before the start.
    ///
    ///     before   --\  .--.  /--          after   --.        /--
    ///                 \_|  |_/                        `-.____/
    ///                start  end
    void fill(Velmark::IHostContext* context, Velmark::IEditTransaction& transaction, double start, double end);

private:
    struct Point {
        double time;
        double value;
        Velmark::Counted<Velmark::IProjectNode> node;
    };

    /// The first point that doesn't stand before the time, and the first that stands after it, by index.
    std::size_t firstAt(double time) const;
    std::size_t firstAfter(double time) const;
    /// The curve between the point before `index` and that at `index`, beyond either end as at its only neighbour.
    double valueBetween(std::size_t index, double time) const;
    /// What the curve comes to and goes on from at a time; they differ where several points stand.
    double valueBefore(double time) const;
    double valueBehind(double time) const;
    Point insertPoint(Velmark::IHostContext* context, Velmark::IEditTransaction& transaction, double time,
                      double value) const;

    Velmark::Counted<Velmark::IProjectNode> m_curve;
    double m_origin;
    std::int32_t m_number;
    std::vector<Point> m_points; ///< in the order of the curve
};

} // namespace cadrel::host
