// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventEdges.h"

#include "core/edl/EventBase.h"
#include "core/edl/StableSort.h"
#include "util/Result.h"

namespace cadrel::core {

EventEdges::EventEdges(const std::vector<std::shared_ptr<EventBase>>& events, TimecodeOf in, TimecodeOf out,
                       const Framerate& framerate)
    : m_events(events)
{
    m_edges.reserve(2 * events.size());
    for (std::uint32_t index = 0; index < events.size(); ++index) {
        const EventBase& event = *events[index];
        if (event.hasFlaw(EventFlaw::TimecodeInvalid))
            continue;
        m_edges.push_back({(event.*in)().toSeconds(framerate), index});
        m_edges.push_back({(event.*out)().toSeconds(framerate), index});
    }
    sortStably(m_edges, [](const Edge& a, const Edge& b) { return a.seconds < b.seconds; });
}

SecondsRange EventEdges::span() const
{
    if (m_edges.empty())
        return {};
    if (m_edges.front().seconds > m_edges.back().seconds)
        throw util::Result::InvalidArgument;
    return {m_edges.front().seconds, m_edges.back().seconds};
}

} // namespace cadrel::core
