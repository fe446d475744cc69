// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/CutEventSpans.h"
#include "host/track/AutomationCurve.h"
#include "host/track/TrackSpans.h"

#include <cstdint>
#include <map>
#include <vector>

namespace cadrel::host {

/// What stands on a track, read once, so that each of the many questions of a run costs no walk of its own. Times are
/// seconds of the project's clock. It says what was there when it was made.
class TrackIndex {
public:
    TrackIndex(TrackSpans spans, std::vector<AutomationCurve> curves, double origin);

    /// The events around a time, as TrackSpans::around tells; a pair without an event is (0, 0).
    core::CutEventSpans spansAround(double time) const;
    /// The points around a time, by the number of their curve.
    std::map<std::int32_t, core::AutomationState> automationStateAt(double time) const;

private:
    TrackSpans m_spans;
    std::vector<AutomationCurve> m_curves;
    double m_origin;
};

} // namespace cadrel::host
