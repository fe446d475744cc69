// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/ListCounters.h"

#include "core/edl/EventList.h"

namespace cadrel::gui {

ListCounters ListCounters::of(const core::EventList& list, std::size_t selected)
{
    return {list.size(), selected, list.countInvalid()};
}

} // namespace cadrel::gui
