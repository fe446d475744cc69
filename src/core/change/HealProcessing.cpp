// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/HealProcessing.h"

#include "core/edl/CutMap.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"
#include "core/settings/Settings.h"
#include "util/StringUtil.h"

#include <memory>
#include <optional>
#include <vector>

namespace cadrel::core {

namespace {

/// The events of a list in the order of DST IN, and which of them need no cut between them.
class JoinableEvents {
public:
    JoinableEvents(const EventList& events, const HealContext& context)
        : m_mode(context.settings->healMode()), m_framerate(context.framerate)
    {
        if (m_mode == HealMode::GapsWithoutInserts)
            m_references.emplace(*context.referenceList, m_framerate);
        const CutMap map(events, m_framerate);
        for (const CutEntry& entry : map.dstInOrder())
            m_events.push_back(entry.event.lock());
    }

    const std::vector<std::shared_ptr<EventBase>>& events() const { return m_events; }

    bool joinsNext(std::size_t index) const
    {
        return index + 1 < m_events.size() && canJoin(*m_events[index], *m_events[index + 1]);
    }

private:
    bool canJoin(const EventBase& earlier, const EventBase& later) const
    {
        if (later.srcIn() < earlier.srcOut() || later.dstIn() < earlier.dstOut())
            return false;
        switch (m_mode) {
        case HealMode::Normal:
            return later.srcIn() == earlier.srcOut() && later.dstIn() == earlier.dstOut();
        case HealMode::GapsWithoutInserts:
            return haveSameGaps(earlier, later) && !hasInsertBetween(earlier, later);
        case HealMode::GapsWithInserts:
            return haveSameGaps(earlier, later);
        default:
            return false;
        }
    }

    static bool haveSameGaps(const EventBase& earlier, const EventBase& later)
    {
        return later.srcIn() - earlier.srcOut() == later.dstIn() - earlier.dstOut();
    }

    bool hasInsertBetween(const EventBase& earlier, const EventBase& later) const
    {
        const auto inGap = m_references->eventsInDestinationRange(earlier.dstOut().toSeconds(m_framerate),
                                                                  later.dstIn().toSeconds(m_framerate));
        for (const auto& entry : inGap) {
            const std::shared_ptr<EventBase> reference = entry.lock();
            const bool onlyTouches = reference->dstOut() == earlier.dstOut() || reference->dstIn() == later.dstIn();
            if (!onlyTouches)
                return true;
        }
        return false;
    }

    std::int32_t m_mode;
    Framerate m_framerate;
    std::optional<CutMap> m_references; ///< only for the mode that asks for inserts
    std::vector<std::shared_ptr<EventBase>> m_events;
};

bool hasNothingToHeal(const EventList& events, const HealContext& context)
{
    return context.settings->healMode() == HealMode::None || events.size() < 2;
}

std::shared_ptr<HealedEvent> makeHealedEvent(std::size_t count, std::int32_t matchBy)
{
    auto healed = std::make_shared<HealedEvent>();
    const std::string name = HealProcessing::healedEventName(count);
    if (matchBy == MatchBy::RollName)
        healed->setRollName(name);
    else
        healed->setClipName(name);
    return healed;
}

} // namespace

void HealProcessing::process(EventList& events, const HealContext& context) const
{
    if (hasNothingToHeal(events, context))
        return;
    const JoinableEvents joinable(events, context);
    EventList result;
    std::shared_ptr<HealedEvent> open;
    std::uint32_t number = 1;
    std::size_t healedCount = 1;
    for (std::size_t index = 0; index < joinable.events().size(); ++index) {
        const std::shared_ptr<EventBase>& current = joinable.events()[index];
        const bool joinsNext = joinable.joinsNext(index);
        if (joinsNext && !open)
            open = makeHealedEvent(healedCount++, context.settings->matchBy());
        if (open)
            open->addEvent(current);
        if (joinsNext)
            continue;
        const std::shared_ptr<EventBase> finished = open ? open : current;
        finished->setEventNumber(number++);
        result.add(finished);
        open.reset();
    }
    events.clear();
    events.append(result);
}

std::size_t HealProcessing::countAfter(const EventList& events, const HealContext& context) const
{
    if (hasNothingToHeal(events, context))
        return events.size();
    const JoinableEvents joinable(events, context);
    std::size_t count = 0;
    for (std::size_t index = 0; index < joinable.events().size(); ++index)
        count += joinable.joinsNext(index) ? 0 : 1;
    return count;
}

std::string HealProcessing::healedEventName(std::size_t count)
{
    std::string digits = std::to_string(count);
    digits.insert(0, digits.size() < 3 ? 3 - digits.size() : 0, '0');
    return util::StringUtil::toUtf8(util::StringUtil::translate(L"Healed Event")) + " " + digits;
}

} // namespace cadrel::core
