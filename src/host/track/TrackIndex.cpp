// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/TrackIndex.h"

#include <utility>

namespace cadrel::host {

TrackIndex::TrackIndex(TrackSpans spans, std::vector<AutomationCurve> curves, double origin)
    : m_spans(std::move(spans)), m_curves(std::move(curves)), m_origin(origin)
{
}

core::CutEventSpans TrackIndex::spansAround(double time) const
{
    core::CutEventSpans spans = m_spans.around(time - m_origin);
    for (core::SecondsRange* const span : {&spans.across, &spans.before, &spans.after}) {
        if (*span != core::SecondsRange{})
            *span = {span->start + m_origin, span->end + m_origin};
    }
    return spans;
}

std::map<std::int32_t, core::AutomationState> TrackIndex::automationStateAt(double time) const
{
    std::map<std::int32_t, core::AutomationState> states;
    for (const AutomationCurve& curve : m_curves)
        states.emplace(curve.number(), curve.stateAt(time));
    return states;
}

} // namespace cadrel::host
