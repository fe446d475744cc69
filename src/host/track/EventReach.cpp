// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/EventReach.h"

#include "host/track/Instant.h"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <utility>

namespace cadrel::host {

using core::SecondsRange;

EventReach::EventReach(std::vector<SecondsRange> events) : m_events(std::move(events))
{
    std::ranges::sort(m_events, {}, &SecondsRange::start);
    for (std::size_t index = 1; index < m_events.size(); ++index)
        m_events[index].end = std::max(m_events[index].end, m_events[index - 1].end);
}

bool EventReach::reachesInto(const SecondsRange& stretch) const
{
    const auto next = std::ranges::partition_point(
        m_events, [&stretch](const SecondsRange& event) { return isBefore(event.start, stretch.end); });
    if (next == m_events.begin())
        return false;
    const SecondsRange& last = *std::prev(next);
    return !isBefore(last.start, stretch.start) || isBefore(stretch.start, last.end);
}

} // namespace cadrel::host
