// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventRows.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"

#include <algorithm>
#include <utility>

namespace cadrel::gui {

using core::EventBase;

namespace {

using EventSet = std::unordered_set<const EventBase*>;

EventSet setOf(const EventRows::Events& events)
{
    EventSet set;
    set.reserve(events.size());
    for (const auto& event : events)
        set.insert(event.get());
    set.erase(nullptr);
    return set;
}

/// The weak references may have expired.
bool isIn(const std::weak_ptr<EventBase>& event, const EventSet& set)
{
    return set.contains(event.lock().get());
}

std::vector<std::weak_ptr<EventBase>> validEventsOf(const std::vector<EventRow>& rows)
{
    std::vector<std::weak_ptr<EventBase>> valid;
    valid.reserve(rows.size());
    for (const EventRow& row : rows) {
        if (const auto event = row.event.lock(); event && event->isValid())
            valid.push_back(row.event);
    }
    return valid;
}

} // namespace

core::EventList EventRows::listOf(const Events& events)
{
    core::EventList list;
    list.append(events);
    return list;
}

void EventRows::reload(const core::EventList& list)
{
    const Events selected = selectedEvents();

    std::vector<EventRow> rows;
    rows.reserve(list.size());
    for (const auto& event : list.events())
        rows.push_back({event, static_cast<std::uint32_t>(rows.size())});
    const SortKey programmeOrder;
    sortEventRows(rows, programmeOrder);
    m_programme = validEventsOf(rows);
    if (m_sortKey != programmeOrder)
        sortEventRows(rows, m_sortKey);
    m_rows = std::move(rows);

    selectEvents(selected);
}

bool EventRows::sort(const SortKey& key)
{
    if (key == m_sortKey)
        return false;
    const Events selected = selectedEvents();
    sortEventRows(m_rows, key);
    m_sortKey = key;
    selectEvents(selected);
    return true;
}

std::shared_ptr<EventBase> EventRows::eventAt(int row) const
{
    return row >= 0 && row < count() ? m_rows[static_cast<std::size_t>(row)].event.lock() : nullptr;
}

int EventRows::rowOf(const std::shared_ptr<EventBase>& event) const
{
    if (!event)
        return -1;
    const auto found =
        std::find_if(m_rows.begin(), m_rows.end(), [&](const EventRow& row) { return row.event.lock() == event; });
    return found == m_rows.end() ? -1 : static_cast<int>(found - m_rows.begin());
}

void EventRows::select(const RowSet& rows)
{
    RowSet bounded;
    for (const RowSet::Range& range : rows.ranges())
        bounded.append(std::max(range.first, 0), std::min(range.end, count()));
    m_selection = std::move(bounded);
}

EventRows::Events EventRows::selectedEvents() const
{
    Events events;
    events.reserve(m_selection.count());
    m_selection.forEach([&](int row) {
        if (auto event = eventAt(row))
            events.push_back(std::move(event));
    });
    return events;
}

void EventRows::selectEvents(const Events& events)
{
    RowSet rows;
    if (!events.empty()) {
        const EventSet set = setOf(events);
        for (int row = 0; row < count(); ++row) {
            if (isIn(m_rows[static_cast<std::size_t>(row)].event, set))
                rows.append(row);
        }
    }
    m_selection = std::move(rows);
}

EventRows::Events EventRows::withNeighbours(const Events& selected, std::size_t& before, std::size_t& after) const
{
    Events programme;
    programme.reserve(m_programme.size());
    for (const auto& reference : m_programme) {
        if (auto event = reference.lock())
            programme.push_back(std::move(event));
    }

    const EventSet set = setOf(selected);
    const auto isSelected = [&](const std::shared_ptr<EventBase>& event) { return set.contains(event.get()); };
    const auto first = std::find_if(programme.begin(), programme.end(), isSelected);
    if (first == programme.end())
        return {};
    const auto pastLast = std::find_if(programme.rbegin(), programme.rend(), isSelected).base();

    before = std::min(before, static_cast<std::size_t>(first - programme.begin()));
    after = std::min(after, static_cast<std::size_t>(programme.end() - pastLast));
    return {first - static_cast<std::ptrdiff_t>(before), pastLast + static_cast<std::ptrdiff_t>(after)};
}

void EventRows::setHighlight(const Events& events)
{
    m_highlight = {events.begin(), events.end()};
    m_highlight.erase(nullptr);
}

} // namespace cadrel::gui
