// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/change/MaterialIndex.h"
#include "core/change/SharedStretch.h"

#include <vector>

namespace cadrel::core {

/// A stretch at the place of one of the twins that have it: a candidate for an event of the change EDL.
struct Placement {
    const SharedStretch* stretch;
    TwinGroup::Place place;
};

/// Takes the placements of all stretches that one new event shares with old events, and returns those that survive when
/// each piece of source is used only once; see OverlapRemoval for the rule. `lastDisplacement`, in seconds, is that of
/// the previous placement. The result is in the order of the old list.
///
/// Stretches that overlap nothing take linear time. A stretch with thousands of places, or thousands of stretches that
/// all overlap each other, take a search each. Only twins of several stretches that overlap in a chain and alternate in
/// the old list are compared one by one.
std::vector<Placement> survivingPlacements(const std::vector<SharedStretch>& stretches, double lastDisplacement);

} // namespace cadrel::core
