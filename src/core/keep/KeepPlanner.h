// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/keep/KeepPlan.h"
#include "core/settings/MatchBy.h"
#include "core/settings/VfxPatternEntry.h"
#include "core/time/Framerate.h"
#include "core/time/SecondsRange.h"

#include <cstdint>
#include <optional>
#include <vector>

namespace cadrel::core {

class EventList;

/// What a plan depends on beside the lists.
struct KeepContext {
    Framerate framerate;
    std::int32_t matchBy = MatchBy::RollName;
    std::vector<VfxPatternEntry> vfxPatterns;
    /// Where clips, markers and automation points stand on the tracks that the run changes, in seconds of the clock that
    /// the timecodes name. In any order.
    std::vector<SecondsRange> material;
    /// What a run may change at most, in the same seconds.
    std::optional<SecondsRange> preserve;
};

/// Plans a run that leaves alone everything that the recut didn't change. A change EDL says which picture
/// survives; a run of it takes everything else away, leader, pops, tails and other reels too. A plan holds more:
///
///     1 the picture of each cut, frame by frame
///     2 what is equal at the same time stays
///     3 for the rest, the change EDL
///     4 holes that the change EDL leaves go on as the picture beside them
///     5 what stands in black goes along with its reel, or stays
///     6 neighbours that move alike are joined; what doesn't move is taken off at both ends
///
/// What is left is the list to carry out and the hull to which the run is restricted. A cut onto itself leaves nothing.
class KeepPlanner {
public:
    explicit KeepPlanner(KeepContext context) : m_context(std::move(context)) {}

    /// The plan for two cuts; `changeEvents` is what was generated of them, healed or not. Changes no list. Throws
    /// Result::InvalidArgument for material that ends before it starts, or a row of VFX patterns that doesn't compile.
    KeepPlan plan(const EventList& oldEvents, const EventList& newEvents, const EventList& changeEvents) const;

    /// The plan for a change EDL that was given: its events as they are, and the hull of all its SRC and DST. Material in
    /// the hull before the first SRC or after the last one is in the way: a question. What stands in a gap between the SRC
    /// goes as the list has it, and is told as lost.
    KeepPlan planGiven(const EventList& changeEvents) const;

private:
    void restrictTo(const std::optional<FrameRange>& hull, std::vector<KeptEvent> events, KeepPlan& plan) const;

    KeepContext m_context;
};

} // namespace cadrel::core
