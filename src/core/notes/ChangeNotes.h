// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/notes/NoteStep.h"
#include "core/notes/PictureRules.h"
#include "core/notes/Programme.h"
#include "core/picture/TextNumbers.h"
#include "core/time/Timecode.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

namespace cadrel::core {

/// Frames, and steps. Kept and lifted picture make the old length; kept, doubled and inserted picture the new one. What lies
/// between joined trims counts as lifted and inserted, since their step replaces it.
struct NoteTotals {
    std::int32_t before = 0; ///< length in the old cut
    std::int32_t after = 0;
    std::int32_t kept = 0;
    std::int32_t lifted = 0;
    std::int32_t inserted = 0;
    std::int32_t doubled = 0;
    std::int32_t moved = 0; ///< by all moves
    std::size_t steps = 0;
};

struct NoteEntry {
    NoteRow row;
    std::size_t number = 0;         ///< of a step, from 1 through all reels; 0 for any other row
    std::int32_t lengthChange = 0;  ///< what the reel wins by the step; a move between reels counts for both
    std::int32_t runningOffset = 0; ///< the sum of these changes with this one; of any other row that before it

    const NoteStep* step() const { return std::get_if<NoteStep>(&row); }
    const KeptStretch* kept() const { return std::get_if<KeptStretch>(&row); }
    const MoveEnd* moveEnd() const { return std::get_if<MoveEnd>(&row); }
};

struct ReelNotes {
    ReelChange pair;
    std::int32_t before = 0;
    std::int32_t after = 0;
    std::size_t movedBy = 0;    ///< the step of an earlier reel that has moved all of it to its new place; 0 for none
    std::size_t asideSince = 0; ///< the step of an earlier reel since which it has stood at a free place; 0 for none
    std::vector<NoteEntry> entries;

    /// Whether all of its picture stands where it stood.
    bool isUnchanged() const;
};

/// How the change EDL was healed.
struct HealingNotes {
    std::size_t events = 0;      ///< healed events
    std::size_t members = 0;     ///< what they stand for
    std::size_t bridgedGaps = 0; ///< gaps between members, which the healed events cover
};

/// What has changed between two cuts of a film, as steps that turn the old cut into the new one by hand, reel by reel.
class ChangeNotes {
public:
    static constexpr std::size_t LargestCount = 10;

    /// The lists outlive the notes. Trims that cancel out within `simplify` frames are joined; 0 joins none.
    ChangeNotes(const EventList& oldEvents, const EventList& newEvents, const PictureRules& rules,
                std::int32_t simplify = 0);

    const Programme& oldCut() const { return m_oldCut; }
    const Programme& newCut() const { return m_newCut; }
    const Framerate& framerate() const { return m_framerate; }
    const std::vector<ReelNotes>& reels() const { return m_reels; }
    const NoteTotals& totals() const { return m_totals; }
    /// The steps that change the most frames, the largest first.
    std::vector<const NoteEntry*> largestSteps() const;
    /// Whether one reel lies on another for a moment where all are on one timeline, since the day has no free place.
    bool isOverfull() const { return m_isOverfull; }
    /// How many steps were joined into others.
    std::size_t joinedSteps() const;

    /// The frame count of the timecode of a frame of the old or the new programme.
    std::int32_t oldTimecode(std::int32_t frame) const;
    std::int32_t newTimecode(std::int32_t frame) const;
    /// Where the source of inserted, replaced or retimed picture begins; of a part of a shot, where that of the part does. Of
    /// a reversed shot it is the earliest, as SRC IN is. Nothing for other changes and for a gap.
    std::optional<Timecode> sourceOf(const PictureChange& change) const;

private:
    void number();
    static void tellWhoMoved(ReelNotes& reel, const NoteEntry& entry);
    void count();

    Framerate m_framerate;
    TextNumbers m_numbers;
    Programme m_oldCut;
    Programme m_newCut;
    std::vector<ReelNotes> m_reels;
    NoteTotals m_totals;
    bool m_isOverfull = false;
};

HealingNotes notesOfHealing(const EventList& changeEdl);

/// How much picture a step changes, in frames.
std::int32_t extentOf(const NoteStep& step);

/// How many shots a step changes besides that of `named`, which is one of its changes. A shot counts once, whatever happens
/// to it; gaps and unchanged picture don't count.
std::size_t otherShots(const NoteStep& step, const PictureChange& named);

} // namespace cadrel::core
