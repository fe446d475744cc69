// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/keep/CarriedStretches.h"
#include "core/picture/FrameRange.h"
#include "core/time/SecondsRange.h"

#include <cstdint>
#include <optional>
#include <vector>

namespace cadrel::core {

/// An event of the list that is carried out: neighbours that move alike, joined.
struct KeptEvent {
    FrameRange destination;
    std::int32_t shift = 0;
    std::vector<CarriedStretch> parts; ///< ascending, without gaps; all with the shift of the event

    FrameRange source() const { return destination.shiftedBy(-shift); }
    bool holds(CarriedFrom from) const;
};

/// What keeps a plan from being carried out without further ado.
struct KeepRefusal {
    enum Reason {
        UnequalReels,    ///< the reels of the two cuts can't be paired; see `oldReels` and `newReels`
        OutsideOfDay,    ///< `material` would have to move, and it stands, or came to stand, where no timecode is
        MaterialInTheWay ///< `material` stands where grown picture goes, or on the way there
    };

    Reason reason = UnequalReels;
    FrameRanges oldReels;
    FrameRanges newReels;
    FrameRanges material; ///< in frames of the old programme; may reach out of the day

    /// How much of `material` there is, in frames.
    std::int32_t amount() const { return lengthOf(material); }
};

/// What a run has to do.
struct KeepPlan {
    /// What the user has to decide before anything is written. The rest tells what is done if he goes on all the same: what
    /// stands around reels that can't be paired stays where it is, and material in the way goes.
    std::vector<KeepRefusal> questions;
    /// Why nothing can be written at all.
    std::optional<KeepRefusal> refusal;
    /// The list to carry out, ascending by destination. It can be empty although there is a hull: what stands there
    /// goes then.
    std::vector<KeptEvent> events;
    /// What stays at its place outside of the hull, and so needs no event.
    std::vector<KeptEvent> untouched;
    /// The stretch that the run has to be restricted to. Nothing: there is nothing to do, and no run.
    std::optional<FrameRange> hull;
    /// Something would have to change, but all of it stands where the user lets nothing change.
    bool isHeldBack = false;
    /// The material in the old cut's black that goes, since it finds no room in the new one's; with a given list all that it
    /// carries nowhere. In the old programme.
    FrameRanges lost;

    bool needsRun() const { return hull.has_value(); }
};

} // namespace cadrel::core
