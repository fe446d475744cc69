// SPDX-License-Identifier: GPL-3.0-or-later

// The edits of a change EDL that heal events and extend them.

#include "core/change/HealCheck.h"
#include "core/change/HealProcessing.h"
#include "core/edl/CutMap.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"
#include "core/settings/Settings.h"
#include "util/Result.h"

#include <algorithm>
#include <functional>
#include <utility>
#include <vector>

namespace cadrel::core {

using util::Result;

namespace {

/// The events of `events` that are in `selected`, in the list's order; a healed event is taken apart into its members.
EventList withoutHealing(const EventList& events, const CutMap& selected)
{
    std::vector<std::shared_ptr<EventBase>> taken;
    for (const auto& event : events.events()) {
        if (!selected.contains(event))
            continue;
        if (const auto healed = std::dynamic_pointer_cast<HealedEvent>(event))
            taken.insert(taken.end(), healed->healedEvents().events().begin(), healed->healedEvents().events().end());
        else
            taken.push_back(event);
    }
    EventList list;
    list.append(std::move(taken));
    return list;
}

/// Removes the events with invalid timecodes, because healing would drop them.
EventList takeUntimed(EventList& events)
{
    EventList untimed;
    for (const auto& event : events.events()) {
        if (event->hasFlaw(EventFlaw::TimecodeInvalid))
            untimed.add(event);
    }
    events.remove(untimed);
    return untimed;
}

/// Whether two neighbours in the selection have other events between them in the whole list.
bool isFragmented(const CutMap& selected, const EventList& list)
{
    // It has no neighbours then, and the list may be long.
    if (selected.dstInOrder().size() < 2)
        return false;
    const CutMap whole(list, Timecode::framerate());
    using Neighbours = std::pair<const EventBase*, const EventBase*>;
    const auto neighboursOf = [](const CutMap& map) {
        std::vector<Neighbours> neighbours;
        neighbours.reserve(map.dstInOrder().size());
        const EventBase* previous = nullptr;
        for (const CutEntry& entry : map.dstInOrder()) {
            const EventBase* const event = entry.event.lock().get();
            if (previous != nullptr)
                neighbours.emplace_back(previous, event);
            previous = event;
        }
        std::sort(neighbours.begin(), neighbours.end());
        neighbours.erase(std::unique(neighbours.begin(), neighbours.end()), neighbours.end());
        return neighbours;
    };
    const std::vector<Neighbours> inSelection = neighboursOf(selected);
    const std::vector<Neighbours> inWhole = neighboursOf(whole);
    return !std::includes(inWhole.begin(), inWhole.end(), inSelection.begin(), inSelection.end());
}

HealContext makeContext(const EventList& referenceList, const Settings& settings)
{
    return {&referenceList, &settings, Timecode::framerate()};
}

/// The event before or after `event` in the order of DST IN; null when there is none or the list doesn't hold it.
std::shared_ptr<EventBase> neighbourOf(const EventList& events, const std::shared_ptr<EventBase>& event, bool previous)
{
    const CutMap map(events, Timecode::framerate());
    if (!map.contains(event))
        return nullptr;
    const auto& order = map.dstInOrder();
    const Timecode& key = event->dstIn();
    if (previous) {
        const auto place =
            std::partition_point(order.begin(), order.end(), [&](const CutEntry& entry) { return entry.time < key; });
        return place == order.begin() ? nullptr : std::prev(place)->event.lock();
    }
    const auto place =
        std::partition_point(order.begin(), order.end(), [&](const CutEntry& entry) { return !(entry.time > key); });
    return place == order.end() ? nullptr : place->event.lock();
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
    const CutMap selected(selection, Timecode::framerate());
    EventList healed = withoutHealing(*this, selected);
    const EventList untimed = takeUntimed(healed);
    Settings settings;
    settings.setHealMode(healMode);
    HealProcessing().process(healed, makeContext(referenceList, settings));

    std::vector<std::shared_ptr<EventBase>> all;
    std::remove_copy_if(m_events.begin(), m_events.end(), std::back_inserter(all),
                        [&](const auto& event) { return selected.contains(event); });
    all.insert(all.end(), healed.events().begin(), healed.events().end());
    all.insert(all.end(), untimed.events().begin(), untimed.events().end());
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

HealCheck::HealCheck(const EventList& list, const EventList& selection, const EventList& referenceList)
    : m_referenceList(referenceList), m_selectedCount(selection.size()), m_selected(selection, Timecode::framerate()),
      m_isFragmented(isFragmented(m_selected, list)),
      m_collected(m_isFragmented ? EventList() : withoutHealing(list, m_selected)),
      m_untimed(takeUntimed(m_collected).size())
{
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
    return HealCheck(*this, selection, referenceList).canHeal(healMode);
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
