// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/AutomationPoint.h"
#include "velmark/Counted.h"

#include <vector>

namespace standin {

class Envelope;

// The automation in edits of ranges. Where a range is replaced, up to two points hold the curve at either edge: the outer
// one has the value that the curve outside comes to or goes on from, the inner one that of what was written.
//
//                     outer        inner
//                    __o            o            Each of them is left out where the curve runs the same without it.
//                 __/  |         __/|            An outer point may be one that stood at the edge before. At the
//              __/     |    ____/   |            start it lies in the range that is replaced and goes like all
//           __/        o___/        o_____       points there, unless it is needed; at the end it lies outside,
//                     inner        outer         and is always kept.
//                 start            end
//
// Where at most one point would be left, which may be far away, the first of those in the range that had its value stays
// where it stands, unless the range is cleared and a point after it is left.
//
// Points within SameInstant of an edge stand at it. Where several do, the curve outside comes to the first at the start and
// goes on from the last at the end, and the range begins with the last and comes to the first.

using CurvePoints = std::vector<Velmark::Counted<AutomationPoint>>;

/// Copies of the points from `start` to `end`, at times from the start of the range, which belong to no curve. The first and
/// the last stand at its edges. Empty for a curve without points.
CurvePoints readCurve(const Envelope& curve, double start, double end);

/// The same of a curve that has got the points of such a range, from `start` to the last of them, which stays as it is.
CurvePoints readRest(const Envelope& written, double start);

/// Replaces what the curve has from `start` to `end` by points as readCurve gives them, which become its own. Without any the
/// range is cleared.
void replaceCurve(Envelope& curve, double start, double end, const CurvePoints& points);

} // namespace standin
