// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/HealProcessing.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventEdges.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"
#include "core/edl/ProgrammeOrder.h"
#include "core/settings/Settings.h"
#include "util/StringUtil.h"

#include <memory>
#include <optional>
#include <vector>

namespace cadrel::core {

namespace {

/// Tells which neighbours in programme order need no cut between them.
class Joining {
public:
    explicit Joining(const HealContext& context) : m_mode(context.settings->healMode()), m_framerate(context.framerate)
    {
        if (m_mode == HealMode::GapsWithoutInserts)
            m_references.emplace(context.referenceList->events(), &EventBase::dstIn, &EventBase::dstOut, m_framerate);
    }

    bool canJoin(const PlacedEvent& earlier, const PlacedEvent& later) const
    {
        if (later.srcIn < earlier.srcOut || later.dstIn < earlier.dstOut)
            return false;
        switch (m_mode) {
        case HealMode::Normal:
            return later.srcIn == earlier.srcOut && later.dstIn == earlier.dstOut;
        case HealMode::GapsWithoutInserts:
            return haveSameGaps(earlier, later) && !hasInsertBetween(earlier, later);
        case HealMode::GapsWithInserts:
            return haveSameGaps(earlier, later);
        default:
            return false;
        }
    }

private:
    static bool haveSameGaps(const PlacedEvent& earlier, const PlacedEvent& later)
    {
        return later.srcIn - earlier.srcOut == later.dstIn - earlier.dstOut;
    }

    bool hasInsertBetween(const PlacedEvent& earlier, const PlacedEvent& later) const
    {
        bool hasInsert = false;
        m_references->forEachInRange(earlier.dstOut / m_framerate.rate, later.dstIn / m_framerate.rate,
                                     [&](const std::shared_ptr<EventBase>& reference) {
                                         const bool onlyTouches =
                                             reference->dstOut().toFrameCount(m_framerate) == earlier.dstOut ||
                                             reference->dstIn().toFrameCount(m_framerate) == later.dstIn;
                                         hasInsert = hasInsert || !onlyTouches;
                                     });
        return hasInsert;
    }

    std::int32_t m_mode;
    Framerate m_framerate;
    std::optional<EventEdges> m_references; ///< only for the mode that asks for inserts
};

bool hasNothingToHeal(std::size_t count, const HealContext& context)
{
    return context.settings->healMode() == HealMode::None || count < 2;
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
    if (hasNothingToHeal(events.size(), context))
        return;
    const Joining joining(context);
    const std::vector<PlacedEvent> ordered = inProgrammeOrder(events.events(), context.framerate);
    EventList result;
    std::shared_ptr<HealedEvent> open;
    std::uint32_t number = 1;
    std::size_t healedCount = 1;
    for (std::size_t index = 0; index < ordered.size(); ++index) {
        const std::shared_ptr<EventBase> current = events.eventAt(ordered[index].index);
        const bool joinsNext = index + 1 < ordered.size() && joining.canJoin(ordered[index], ordered[index + 1]);
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

std::size_t HealProcessing::countAfter(const std::vector<PlacedEvent>& ordered, const HealContext& context) const
{
    if (hasNothingToHeal(ordered.size(), context))
        return ordered.size();
    const Joining joining(context);
    std::size_t count = ordered.size();
    for (std::size_t index = 1; index < ordered.size(); ++index)
        count -= joining.canJoin(ordered[index - 1], ordered[index]) ? 1 : 0;
    return count;
}

std::string HealProcessing::healedEventName(std::size_t count)
{
    std::string digits = std::to_string(count);
    digits.insert(0, digits.size() < 3 ? 3 - digits.size() : 0, '0');
    return util::StringUtil::toUtf8(util::StringUtil::translate(L"Healed Event")) + " " + digits;
}

} // namespace cadrel::core
