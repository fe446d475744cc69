// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/notes/PictureRules.h"

#include <cstdint>
#include <rapidcheck.h>
#include <vector>

namespace cadrel::tests {

/// What a random film and its recut are made from.
struct RecutSeed {
    std::uint64_t setting = 0;
    std::vector<std::uint64_t> shots;   ///< of the old cut
    std::vector<std::uint64_t> changes; ///< one after the other
};

std::ostream& operator<<(std::ostream& out, const RecutSeed& seed);

rc::Gen<RecutSeed> genRecutSeed();

/// An old and a new cut of a small film: the same rolls again and again, transitions of one and two lines, retimes, freezes,
/// gaps, reels, events on top of each other, flaws; and between the two cuts trims, lifts, inserts, moves, doubles, slips,
/// new speeds and versions, other transitions, and reels that begin
/// elsewhere.
struct RandomRecut {
    explicit RandomRecut(const RecutSeed& seed);

    core::PictureRules rules;
    core::EventList oldCut;
    core::EventList newCut;
};

/// A film of two to four reels on one timeline, one or two minutes apart, which is long enough that its reels can come to lie on
/// each other; and a new cut in which whole shots have come, gone and moved, also between reels, and in which reels begin
/// elsewhere, have changed places, are gone or are new.
struct RandomTimeline {
    explicit RandomTimeline(std::uint64_t seed);

    core::PictureRules rules;
    core::EventList oldCut;
    core::EventList newCut;
};

/// A list after some changes of that kind.
core::EventList recutOf(const core::EventList& events, const core::Framerate& framerate, std::uint64_t seed);

} // namespace cadrel::tests
