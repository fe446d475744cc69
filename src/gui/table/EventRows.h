// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/table/EventSort.h"
#include "gui/table/RowSet.h"

#include <cstddef>
#include <memory>
#include <unordered_set>
#include <vector>

namespace cadrel::core {
class EventList;
} // namespace cadrel::core

namespace cadrel::gui {

/// The rows of one event table: which event is in which row, what is selected and what is highlighted. It doesn't follow the
/// list; an event that leaves the list has its row until the next reload. Rows are counted from 0.
class EventRows {
public:
    using Events = std::vector<std::shared_ptr<core::EventBase>>;
    /// A list of the events, for a call that wants one. It listens to them as long as it lives, so don't make one while they
    /// tell of a change.
    static core::EventList listOf(const Events& events);

    /// Takes the events of the list, in the order of the sort key. What was selected and is still there stays selected.
    void reload(const core::EventList& list);
    /// The selected events stay selected. False when that is the order already.
    bool sort(const SortKey& key);
    const SortKey& sortKey() const { return m_sortKey; }

    int count() const { return static_cast<int>(m_rows.size()); }
    /// Null for a row that isn't there, and when the event has expired.
    std::shared_ptr<core::EventBase> eventAt(int row) const;
    /// The first row of the event; -1 where it has none.
    int rowOf(const std::shared_ptr<core::EventBase>& event) const;

    /// Rows that aren't there are left out.
    void select(const RowSet& rows);
    const RowSet& selection() const { return m_selection; }
    /// In the order of the rows.
    Events selectedEvents() const;

    /// What a preview of `selected` shows: the valid events from the first to the last of them in the order of the programme,
    /// with up to `before` and `after` neighbours on either side. The two are lowered where the programme has fewer. Empty
    /// where none of `selected` is valid; they stay as they are then. The order of the programme is that of the last reload,
    /// by rising DST IN, whatever the table is sorted by.
    Events withNeighbours(const Events& selected, std::size_t& before, std::size_t& after) const;

    void setHighlight(const Events& events);
    bool isHighlighted(const std::shared_ptr<core::EventBase>& event) const { return m_highlight.contains(event); }

private:
    void selectEvents(const Events& events);

    std::vector<EventRow> m_rows;
    std::vector<std::weak_ptr<core::EventBase>> m_programme; ///< the valid events
    RowSet m_selection;
    std::unordered_set<std::shared_ptr<core::EventBase>> m_highlight;
    SortKey m_sortKey;
};

} // namespace cadrel::gui
