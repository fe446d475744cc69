// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/TrackSpans.h"

#include "host/track/Instant.h"
#include "util/Result.h"

#include <algorithm>
#include <iterator>

namespace cadrel::host {

using core::SecondsRange;

TrackSpans::TrackSpans(const std::vector<SecondsRange>& events)
{
    SecondsRange last;
    for (const SecondsRange& event : events) {
        if (!isBefore(last.end, event.start)) {
            if (!isBefore(last.end, event.end))
                continue;
            m_endsInFault = event.start < last.start;
        }
        m_endsInFault = m_endsInFault || event.start > event.end;
        if (m_endsInFault)
            return;
        m_spans.push_back(event);
        last = event;
    }
}

//                before   across     after
//     spans    .. |---|  |--------| |-----| ..
//                            time
core::CutEventSpans TrackSpans::around(double time) const
{
    const auto touching =
        std::ranges::partition_point(m_spans, [time](const SecondsRange& span) { return isBefore(span.end, time); });
    const auto behind = std::partition_point(touching, m_spans.end(),
                                             [time](const SecondsRange& span) { return !isBefore(time, span.start); });

    core::CutEventSpans spans;
    if (touching != m_spans.begin())
        spans.before = *std::prev(touching);
    if (behind != touching)
        spans.across = *std::prev(behind);
    if (behind != m_spans.end())
        spans.after = *behind;
    else if (m_endsInFault)
        throw util::Result::InvalidArgument;
    return spans;
}

} // namespace cadrel::host
