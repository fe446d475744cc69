// SPDX-License-Identifier: GPL-3.0-or-later

// The edits of a change EDL that heal events and extend them.

#include "core/change/HealCheck.h"
#include "core/change/HealProcessing.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"
#include "core/edl/ProgrammeOrder.h"
#include "core/settings/Settings.h"
#include "util/Result.h"

#include <algorithm>
#include <iterator>
#include <unordered_set>
#include <utility>
#include <vector>

namespace cadrel::core {

using util::Result;

namespace {

using Events = std::vector<std::shared_ptr<EventBase>>;
using EventSet = std::unordered_set<const EventBase*>;

/// The events whose timecodes are usable.
EventSet timedOf(const Events& events)
{
    EventSet set;
    set.reserve(events.size());
    for (const auto& event : events) {
        if (!event->hasFlaw(EventFlaw::TimecodeInvalid))
            set.insert(event.get());
    }
    return set;
}

/// The events of `events` that are in `selected`, in the list's order; a healed event is taken apart into its members.
Events withoutHealing(const EventList& events, const EventSet& selected)
{
    Events taken;
    taken.reserve(selected.size());
    for (const auto& event : events.events()) {
        if (!selected.contains(event.get()))
            continue;
        if (const auto* const healed = dynamic_cast<const HealedEvent*>(event.get()))
            taken.insert(taken.end(), healed->healedEvents().events().begin(), healed->healedEvents().events().end());
        else
            taken.push_back(event);
    }
    return taken;
}

/// Removes the events with invalid timecodes, because healing would drop them.
Events takeUntimed(Events& events)
{
    const auto untimed = std::stable_partition(
        events.begin(), events.end(), [](const auto& event) { return !event->hasFlaw(EventFlaw::TimecodeInvalid); });
    Events taken(std::make_move_iterator(untimed), std::make_move_iterator(events.end()));
    events.erase(untimed, events.end());
    return taken;
}

bool isHealed(const EventBase& event)
{
    return dynamic_cast<const HealedEvent*>(&event) != nullptr;
}

HealContext makeContext(const EventList& referenceList, const Settings& settings)
{
    return {&referenceList, &settings, Timecode::framerate()};
}

/// The event before or after `event` in the order of DST IN; null when there is none or the list doesn't hold it.
std::shared_ptr<EventBase> neighbourOf(const EventList& events, const std::shared_ptr<EventBase>& event, bool previous)
{
    if (!events.contains(event) || event->hasFlaw(EventFlaw::TimecodeInvalid))
        return nullptr;
    const std::vector<PlacedEvent> order = inProgrammeOrder(events.events(), Timecode::framerate());
    const std::int32_t key = event->dstIn().toFrameCount();
    if (previous) {
        const auto place = std::partition_point(order.begin(), order.end(),
                                                [&](const PlacedEvent& other) { return other.dstIn < key; });
        return place == order.begin() ? nullptr : events.eventAt(std::prev(place)->index);
    }
    const auto place =
        std::partition_point(order.begin(), order.end(), [&](const PlacedEvent& other) { return other.dstIn <= key; });
    return place == order.end() ? nullptr : events.eventAt(place->index);
}

} // namespace

void EventList::heal(const EventList& selection, const EventList& referenceList, std::int32_t healMode)
{
    {
        const PausedListening paused(*this);
        healSelection(selection, referenceList, healMode);
    }
    notifyListeners();
}

void EventList::healSelection(const EventList& selection, const EventList& referenceList, std::int32_t healMode)
{
    const EventSet selected = timedOf(selection.events());
    Events collected = withoutHealing(*this, selected);
    const Events untimed = takeUntimed(collected);
    EventList healed;
    healed.append(std::move(collected));
    Settings settings;
    settings.setHealMode(healMode);
    HealProcessing().process(healed, makeContext(referenceList, settings));

    Events all;
    std::remove_copy_if(m_events.begin(), m_events.end(), std::back_inserter(all),
                        [&](const auto& event) { return selected.contains(event.get()); });
    all.insert(all.end(), healed.events().begin(), healed.events().end());
    all.insert(all.end(), untimed.begin(), untimed.end());
    std::sort(all.begin(), all.end(), [](const auto& a, const auto& b) { return a->dstIn() < b->dstIn(); });

    std::vector<std::pair<HealedEvent*, std::string>> names;
    for (const auto& event : all) {
        if (auto* healedEvent = dynamic_cast<HealedEvent*>(event.get()))
            names.emplace_back(healedEvent, HealProcessing::healedEventName(names.size() + 1));
    }

    // Nothing can fail from here on.
    m_events = std::move(all);
    std::uint32_t number = 1;
    for (const auto& event : m_events)
        event->setEventNumber(number++);
    for (const auto& [event, name] : names)
        event->setRollName(name);
}

HealCheck::HealCheck(const EventList& list, const std::vector<std::shared_ptr<EventBase>>& selection,
                     const EventList& referenceList)
    : m_referenceList(referenceList), m_selectedCount(selection.size())
{
    const EventSet selected = timedOf(selection);
    // One event has no neighbours, and the list may be long.
    if (selected.size() < 2 || !collectRun(list, selected))
        collectWithoutHealing(list, selected);
}

/// Takes the selected events where they follow each other and none of them is healed. False for a healed one.
bool HealCheck::collectRun(const EventList& list, const std::unordered_set<const EventBase*>& selected)
{
    const auto isSelected = [&](const PlacedEvent& placed) { return selected.contains(&list.at(placed.index)); };
    const std::vector<PlacedEvent> whole = inProgrammeOrder(list.events(), Timecode::framerate());
    const auto first = std::find_if(whole.begin(), whole.end(), isSelected);
    const auto end = std::find_if_not(first, whole.end(), isSelected);
    m_isFragmented = static_cast<std::size_t>(end - first) != selected.size();
    if (m_isFragmented)
        return true;
    if (std::any_of(first, end, [&](const PlacedEvent& placed) { return isHealed(list.at(placed.index)); }))
        return false;
    m_collected.assign(first, end);
    return true;
}

void HealCheck::collectWithoutHealing(const EventList& list, const std::unordered_set<const EventBase*>& selected)
{
    Events collected = withoutHealing(list, selected);
    m_untimed = takeUntimed(collected).size();
    m_collected = inProgrammeOrder(collected, Timecode::framerate());
}

bool HealCheck::canHeal(std::int32_t healMode) const
{
    if (m_isFragmented)
        return false;
    Settings settings;
    settings.setHealMode(healMode);
    const std::size_t timed = HealProcessing().countAfter(m_collected, makeContext(m_referenceList, settings));
    return timed + m_untimed != m_selectedCount;
}

bool EventList::canHeal(const EventList& selection, const EventList& referenceList, std::int32_t healMode) const
{
    return HealCheck(*this, selection.events(), referenceList).canHeal(healMode);
}

void EventList::extendEvent(const std::shared_ptr<EventBase>& event, bool previous)
{
    {
        const PausedListening paused(*this);
        extendInto(event, previous);
    }
    notifyListeners();
}

void EventList::extendInto(const std::shared_ptr<EventBase>& event, bool previous) const
{
    const std::shared_ptr<EventBase> neighbour = neighbourOf(*this, event, previous);
    if (!neighbour)
        return;
    if (previous) {
        const Timecode dstIn = neighbour->dstOut();
        const Timecode srcIn = event->srcIn() - (event->dstIn() - dstIn);
        event->setDstIn(dstIn);
        event->setSrcIn(srcIn);
    } else {
        const Timecode dstOut = neighbour->dstIn();
        const Timecode srcOut = event->srcOut() + (dstOut - event->dstOut());
        event->setDstOut(dstOut);
        event->setSrcOut(srcOut);
    }
}

bool EventList::canExtendEvent(const std::shared_ptr<EventBase>& event, bool previous) const
{
    try {
        const std::shared_ptr<EventBase> neighbour = neighbourOf(*this, event, previous);
        if (!neighbour)
            return false;
        const Timecode gap = previous ? event->dstIn() - neighbour->dstOut() : neighbour->dstIn() - event->dstOut();
        return gap.toSeconds() > 0.0;
    } catch (Result::Type) {
        return false;
    }
}

} // namespace cadrel::core
