// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/change/MaterialIndex.h"
#include "core/change/SharedStretch.h"

#include <vector>

namespace cadrel::core {

/// A stretch at the place of one of its twins: a candidate for an event of the change EDL.
struct Placement {
    const SharedStretch* stretch;
    TwinGroup::Place place;
};

/// Of the placements of all stretches that one new event shares with old events, those that survive when the same
/// source is given to one only; see OverlapRemoval for the rule. `lastDisplacement`, in seconds, is that of the
/// placement before. In the order of the old list.
///
/// Stretches that overlap nothing cost no more than their number, and a stretch that stands in thousands of places, or
/// thousands of stretches that all overlap each other, cost a search. Only twins of several stretches that overlap in
/// a chain and alternate in the old list are looked at one by one.
std::vector<Placement> survivingPlacements(const std::vector<SharedStretch>& stretches, double lastDisplacement);

} // namespace cadrel::core
