// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/change/GenerationFailure.h"

#include <cstddef>
#include <cstdint>
#include <functional>
#include <vector>

namespace cadrel::core {

class EventList;

/// Cuts the dissolves and wipes out of their events: each becomes a cut, and a piece of its own, after all events of
/// the list, has the transition.
///
///     one event       |<-- D 024 -->|------ body ------|
///     two events      |---- piece --|                       dissolve, 24 frames
///                                   |------ body ------|    cut
///
/// A piece whose event shares its number with the event before it, as the two lines of a transition do, is named after
/// both. An event that isn't valid and whose transition can't be cut out stays whole. For a valid one `onFailure` gets its
/// index: either what the timecode arithmetic throws is thrown, or the event gets a flaw and stays whole.
///
/// Returns the index of the event that each piece was cut from, in the order of the pieces.
std::vector<std::size_t> expandTransitions(EventList& events,
                                           const std::function<FailureAnswer(std::size_t)>& onFailure);

/// Puts each transition piece and the body that follows it on both sides together again, and makes cuts of all events.
/// Names are compared by clip name when `matchBy` is 1, otherwise by roll name.
void mergeTransitionPieces(EventList& changeEvents, std::int32_t matchBy);

} // namespace cadrel::core
