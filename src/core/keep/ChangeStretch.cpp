// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/ChangeStretch.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"

#include <algorithm>
#include <map>
#include <utility>

namespace cadrel::core {

std::optional<ChangeStretch> changeStretchOf(const EventBase& event, const Framerate& framerate)
{
    for (const Timecode* timecode : {&event.srcIn(), &event.srcOut(), &event.dstIn(), &event.dstOut()}) {
        if (!timecode->isValid(framerate))
            return std::nullopt;
    }
    const std::int32_t srcIn = event.srcIn().toFrameCount(framerate);
    const std::int32_t dstIn = event.dstIn().toFrameCount(framerate);
    const std::int32_t length = event.srcOut().toFrameCount(framerate) - srcIn;
    if (length <= 0)
        return std::nullopt;
    return ChangeStretch{{dstIn, dstIn + length}, dstIn - srcIn};
}

std::vector<ChangeStretch> unhealedStretches(const EventList& changeEvents, const Framerate& framerate)
{
    std::vector<ChangeStretch> stretches;
    std::vector<const EventList*> lists{&changeEvents};
    while (!lists.empty()) {
        const EventList& list = *lists.back();
        lists.pop_back();
        for (const auto& event : list.events()) {
            if (const auto* healed = dynamic_cast<const HealedEvent*>(event.get()))
                lists.push_back(&healed->healedEvents());
            else if (const auto stretch = changeStretchOf(*event, framerate))
                stretches.push_back(*stretch);
        }
    }
    std::stable_sort(stretches.begin(), stretches.end(), [](const ChangeStretch& a, const ChangeStretch& b) {
        return a.destination.start < b.destination.start;
    });
    return stretches;
}

std::vector<ChangeStretch> joinedByShift(const std::vector<ChangeStretch>& stretches)
{
    std::map<std::int32_t, FrameRanges> byShift;
    for (const ChangeStretch& stretch : stretches)
        byShift[stretch.shift].push_back(stretch.destination);
    std::vector<ChangeStretch> joined;
    for (auto& [shift, destinations] : byShift) {
        for (const FrameRange& destination : united(std::move(destinations)))
            joined.push_back({destination, shift});
    }
    return joined;
}

} // namespace cadrel::core
