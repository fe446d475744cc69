// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/table/EventColumn.h"

#include <cstdint>
#include <memory>
#include <vector>

namespace cadrel::core {
class EventBase;
} // namespace cadrel::core

namespace cadrel::gui {

/// An event in a table. The event expires when it has left its list and nobody else holds it.
struct EventRow {
    std::weak_ptr<core::EventBase> event;
    std::uint32_t position; ///< in the list
};

/// By what a table is sorted. The default is the order of the programme.
struct SortKey {
    int column = EventColumn::DstIn;
    /// What a table's header calls so: the values fall down the table.
    bool forwards = false;

    bool operator==(const SortKey&) const = default;
};

/// The column itself, or that of the event numbers for a number that is no column.
inline int shownSortColumn(int column)
{
    return EventColumn::exists(column) ? column : EventColumn::Number;
}

/// Sorts the rows by the column. Rows that are equal there follow their event numbers, and then the list; so do all rows for a
/// number that is no column. Names are compared as bytes. Invalid events are lower than valid ones, and expired ones lowest.
/// Falling is the exact reverse of rising.
void sortEventRows(std::vector<EventRow>& rows, const SortKey& key);

} // namespace cadrel::gui
