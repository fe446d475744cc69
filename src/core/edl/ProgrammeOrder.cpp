// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/ProgrammeOrder.h"

#include "core/edl/EventBase.h"
#include "core/edl/StableSort.h"

namespace cadrel::core {

std::vector<PlacedEvent> inProgrammeOrder(const std::vector<std::shared_ptr<EventBase>>& events,
                                          const Framerate& framerate)
{
    std::vector<PlacedEvent> ordered;
    ordered.reserve(events.size());
    for (std::uint32_t index = 0; index < events.size(); ++index) {
        const EventBase& event = *events[index];
        if (event.hasFlaw(EventFlaw::TimecodeInvalid))
            continue;
        ordered.push_back({index, event.srcIn().toFrameCount(framerate), event.srcOut().toFrameCount(framerate),
                           event.dstIn().toFrameCount(framerate), event.dstOut().toFrameCount(framerate)});
    }
    sortStably(ordered, [](const PlacedEvent& a, const PlacedEvent& b) { return a.dstIn < b.dstIn; });
    return ordered;
}

} // namespace cadrel::core
