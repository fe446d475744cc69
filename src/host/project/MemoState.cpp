// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MemoState.h"

#include <limits>
#include <utility>

namespace cadrel::host {

MemoState MemoState::of(const HostEvent& event)
{
    return {event.getUserId(), event.getName(), event.getStart(), event.getEnd()};
}

MemoState MemoState::firstOf(std::int64_t id, std::wstring name)
{
    constexpr double First = std::numeric_limits<double>::lowest();
    return {id, std::move(name), First, First};
}

EditedSides differencesOf(const MemoState& one, const MemoState& other)
{
    return {one.name != other.name, one.start != other.start || one.end != other.end};
}

} // namespace cadrel::host
