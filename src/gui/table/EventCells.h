// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::core {
class EventBase;
} // namespace cadrel::core

namespace cadrel::gui {

/// The texts of a row of an event table, as they are shown: whatever the names hold, each has a text of one line. Columns are
/// those of EventColumn; any other has an empty text.
class EventCells {
public:
    /// What the cell shows. Empty for the state, which is a dot.
    static std::wstring text(const core::EventBase& event, int column);
    /// The whole text of a cell that may be cut, and for the state what is wrong with the event, a line each. Empty for a
    /// valid event and for all other columns.
    static std::wstring tooltip(const core::EventBase& event, int column);
    /// What a screen reader says of a cell: its text, and the state in words. `isRelated` is as EventRows::isHighlighted.
    static std::wstring spokenText(const core::EventBase& event, int column, bool isRelated);
    /// The spoken texts of all cells of a row.
    static std::wstring spokenRow(const core::EventBase& event, bool isRelated);
};

} // namespace cadrel::gui
