// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notes/ChangeNotes.h"
#include "core/notes/StepStretches.h"
#include "core/time/SecondsRange.h"

#include <cstddef>
#include <optional>
#include <vector>

namespace cadrel::core {

/// Tells which step of change notes a place of the sound belongs to. Times are seconds of a clock that shows the timecodes of
/// the cuts.
///
///     old cut   |---- A ----|- gone -|---- B ----|---- C ----|
///     steps                 |== 1 ===|           2              clips are cut apart at 2, and lose sound at 1
///     new cut   |---- A ----|---- B ----|- new -|---- C ----|
///     steps                 1           |== 2 ==|
class StepPlaces {
public:
    explicit StepPlaces(const ChangeNotes& notes);

    /// The number of the step to which a loss of old sound belongs, or a place where old sound is cut apart; 0 for none.
    std::size_t stepAtOld(const SecondsRange& range) const { return m_old.stepOf(range); }
    /// Likewise of a place in the new programme.
    std::size_t stepAtNew(const SecondsRange& range) const { return m_new.stepOf(range); }
    bool hasMoves() const { return !m_moves.empty(); }
    /// The number of the step that moves the picture of this time of the old programme; 0 for none.
    std::size_t moveOf(double oldTime) const;
    /// Where the picture of a step was, from number 1 on: what it takes away or moves; of an insert the frames on both sides.
    /// A step that moves a reel has none.
    const std::vector<SecondsRange>& inOld(std::size_t step) const { return m_inOld.at(step - 1); }

private:
    /// All picture that is kept, in two orders.
    struct Kept {
        std::vector<const KeptStretch*> byOld;
        std::vector<const KeptStretch*> byNew;
    };
    struct Move {
        SecondsRange inOld;
        std::size_t step;
    };

    Kept keptOf() const;
    void addReplace(const NoteEntry& entry, const KeptStretch* before, const KeptStretch* after);
    void addMove(const NoteEntry& entry, const Kept& kept);
    void addBetween(std::size_t step, const KeptStretch* before, const KeptStretch* after);
    void addEnds(StepStretches& stretches, const SecondsRange& range, std::size_t step);

    SecondsRange oldRange(const FrameSpan& span) const;
    SecondsRange newRange(const FrameSpan& span) const;
    SecondsRange oldRange(const KeptStretch& kept) const { return oldRange(FrameSpan{kept.oldStart, kept.length}); }
    SecondsRange newRange(const KeptStretch& kept) const { return newRange(FrameSpan{kept.newStart, kept.length}); }

    const ChangeNotes& m_notes;
    StepStretches m_old;
    StepStretches m_new;
    std::vector<Move> m_moves; ///< by their old places
    std::vector<std::vector<SecondsRange>> m_inOld;
};

} // namespace cadrel::core
