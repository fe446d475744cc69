// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/KeptChangeList.h"

#include "core/change/HealProcessing.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"
#include "core/settings/MatchBy.h"
#include "util/StringUtil.h"

#include <cstddef>
#include <memory>
#include <string>

namespace cadrel::core {

namespace {

void setName(EventBase& event, const std::string& name, std::int32_t matchBy)
{
    if (matchBy == MatchBy::ClipName)
        event.setClipName(name);
    else
        event.setRollName(name);
}

Timecode timecodeOf(std::int32_t frame, const Framerate& framerate)
{
    Timecode timecode;
    timecode.setFrameCount(frame, framerate);
    return timecode;
}

std::shared_ptr<EventBase> makePart(const CarriedStretch& part, const EventList& newEvents, std::int32_t matchBy,
                                    const Framerate& framerate)
{
    auto event = std::make_shared<EventBase>();
    if (part.from == CarriedFrom::Black) {
        setName(*event, util::StringUtil::toUtf8(util::StringUtil::translate(L"Black")), matchBy);
    } else if (part.event != CarriedStretch::NoEvent) {
        const EventBase& named = newEvents.at(static_cast<std::size_t>(part.event));
        event->setRollName(named.rollName());
        event->setClipName(named.clipName());
        event->setVfx(named.vfx());
    }
    const FrameRange source = part.source();
    event->setTimecodes(timecodeOf(source.start, framerate), timecodeOf(source.end, framerate),
                        timecodeOf(part.destination.start, framerate), timecodeOf(part.destination.end, framerate));
    return event;
}

} // namespace

EventList keptChangeList(const KeepPlan& plan, const EventList& newEvents, std::int32_t matchBy,
                         const Framerate& framerate)
{
    EventList list;
    std::size_t healedCount = 0;
    std::uint32_t number = 1;
    for (const KeptEvent& kept : plan.events) {
        std::shared_ptr<EventBase> event;
        if (kept.parts.size() == 1) {
            event = makePart(kept.parts.front(), newEvents, matchBy, framerate);
        } else {
            auto healed = std::make_shared<HealedEvent>();
            setName(*healed, HealProcessing::healedEventName(++healedCount), matchBy);
            for (const CarriedStretch& part : kept.parts)
                healed->addEvent(makePart(part, newEvents, matchBy, framerate));
            event = std::move(healed);
        }
        event->setEventNumber(number++);
        list.add(std::move(event));
    }
    return list;
}

SecondsRange hullSeconds(const KeepPlan& plan, const Framerate& framerate)
{
    return {plan.hull->start / framerate.rate, plan.hull->end / framerate.rate};
}

} // namespace cadrel::core
