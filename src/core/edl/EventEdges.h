// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"
#include "core/time/SecondsRange.h"
#include "core/time/Timecode.h"

#include <algorithm>
#include <cstdint>
#include <iterator>
#include <memory>
#include <vector>

namespace cadrel::core {

class EventBase;

/// Where events begin and end in their sources or in the programme, sorted by time, to look up what touches a stretch of it.
/// Events with EventFlaw::TimecodeInvalid are left out, since their seconds can't be computed.
class EventEdges {
public:
    using TimecodeOf = const Timecode& (EventBase::*)() const;

    /// `in` and `out` choose the side. The vector has to outlive the edges and stay as it is; changes of its events aren't
    /// followed. Throws what Timecode::toSeconds throws under `framerate`.
    EventEdges(const std::vector<std::shared_ptr<EventBase>>& events, TimecodeOf in, TimecodeOf out,
               const Framerate& framerate);

    /// From the first to the last edge, in seconds; 0 to 0 when there are none.
    SecondsRange span() const;

    /// Calls `take` with each event that has an edge from `start` to `end` seconds, both included, in the order of the
    /// edges; twice for an event if another event's edge is between its two edges. If no edge is in the range, it is
    /// called with the event around the range. It isn't called unless `start` is less than `end`.
    template <class Take>
    void forEachInRange(double start, double end, const Take& take) const
    {
        if (!(start < end))
            return;
        const auto first = std::partition_point(m_edges.begin(), m_edges.end(),
                                                [&](const Edge& edge) { return edge.seconds < start; });
        auto edge = first;
        for (; edge != m_edges.end() && edge->seconds <= end; ++edge) {
            if (edge == first || eventOf(*edge) != eventOf(*std::prev(edge)))
                take(eventOf(*edge));
        }
        const bool hasNone = edge == first;
        if (hasNone && first != m_edges.begin() && first != m_edges.end() &&
            eventOf(*first) == eventOf(*std::prev(first)))
            take(eventOf(*first));
    }

private:
    struct Edge {
        double seconds;
        std::uint32_t index; ///< of the event in `m_events`
    };

    const std::shared_ptr<EventBase>& eventOf(const Edge& edge) const { return m_events[edge.index]; }

    const std::vector<std::shared_ptr<EventBase>>& m_events;
    std::vector<Edge> m_edges;
};

} // namespace cadrel::core
