// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notes/NoteStep.h"
#include "core/notes/Programme.h"

#include <vector>

namespace cadrel::core {

class StepChanges;

/// The way from the old to the new cut.
struct StepList {
    std::vector<ReelChange> reels;
    std::vector<std::vector<NoteRow>> rows; ///< of each pair of reels
    bool isOverfull = false;                ///< the day has no free place for a reel that would be in another's way
};

/// Makes as few steps as possible that keep all picture of `kept`: between two kept stretches one, whatever is deleted and
/// inserted there, and one for each block that is moved. What is deleted within a moved block moves along first. Reels are moved
/// as a whole where they begin at another timecode, or are in each other's way.
StepList makeSteps(const Programme& oldCut, const Programme& newCut, const std::vector<KeptStretch>& kept,
                   const Framerate& framerate);

/// Joins steps that only trim and whose trims cancel out within `frames` frames into one step without a change of length,
/// which replaces what lies between them, too, and says so. A `frames` of 0 joins none.
void joinTrims(std::vector<NoteRow>& rows, std::int32_t frames, const StepChanges& changes);

} // namespace cadrel::core
