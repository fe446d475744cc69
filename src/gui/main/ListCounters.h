// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/look/Palette.h"

#include <cstddef>

namespace cadrel::core {
class EventList;
} // namespace cadrel::core

namespace cadrel::gui {

/// What the counters below a table say.
struct ListCounters {
    std::size_t total = 0;
    std::size_t selected = 0;
    std::size_t invalid = 0; ///< events with any flaw

    static ListCounters of(const core::EventList& list, std::size_t selected);

    PaletteColour invalidColour() const { return invalid > 0 ? Palette::red : Palette::green; }
    bool operator==(const ListCounters&) const = default;
};

} // namespace cadrel::gui
