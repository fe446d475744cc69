// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/ProgrammePlace.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"

#include <algorithm>
#include <cctype>
#include <string_view>

namespace cadrel::core {

bool hasPlace(const EventBase& event, const Framerate& framerate)
{
    // EventFlaw::TimecodeInvalid and TimecodeRangeInvalid may be those of the source.
    return !event.hasFlaw(EventFlaw::DstInUnreadable) && !event.hasFlaw(EventFlaw::DstOutUnreadable) &&
           event.dstIn().isValid(framerate) && event.dstOut().isValid(framerate) && !(event.dstOut() < event.dstIn());
}

bool fillsProgramme(const EventBase& event, const Framerate& framerate)
{
    return event.dstIn().isInitialized() && event.dstOut().isInitialized() && hasPlace(event, framerate) &&
           event.dstIn() < event.dstOut() && !event.hasFlaw(EventFlaw::NotVideoEvent);
}

bool isBlack(const EventBase& event)
{
    const auto isRoll = [&roll = event.rollName()](std::string_view name) {
        return std::equal(roll.begin(), roll.end(), name.begin(), name.end(),
                          [](unsigned char letter, char capital) { return std::toupper(letter) == capital; });
    };
    return isRoll("BL") || isRoll("BLACK");
}

const EventBase* outgoingOf(const EventList& events, std::size_t index)
{
    if (index == 0 || events.at(index - 1).eventNumber() != events.at(index).eventNumber())
        return nullptr;
    return &events.at(index - 1);
}

} // namespace cadrel::core
