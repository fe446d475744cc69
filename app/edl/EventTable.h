// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"

#include <array>
#include <cstddef>
#include <iosfwd>
#include <memory>
#include <span>
#include <string>

namespace cadrel::app {

/// Events as a table for people: a line each, and under a flawed event a line for everything that is wrong with it.
class EventTable {
public:
    using Events = std::span<const std::shared_ptr<core::EventBase>>;

    /// The columns become as wide as the events need, within reason.
    EventTable(Events events, bool colour);

    void print(std::ostream& out) const;

private:
    static constexpr std::size_t ColumnCount = 11;
    using Row = std::array<std::string, ColumnCount>;
    using Widths = std::array<std::size_t, ColumnCount>;

    static const Row Titles;
    static Row rowOf(const core::EventBase& event, Widths& widths);
    std::string lineOf(const Row& row, const Widths& widths) const;

    Events m_events;
    bool m_colour;
    Widths m_columnWidths;
};

} // namespace cadrel::app
