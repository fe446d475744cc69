// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notes/NoteStep.h"
#include "core/notes/Programme.h"

#include <optional>
#include <vector>

namespace cadrel::core {

/// The kept stretches around a step that replaces frames; nothing where the reel begins or ends.
struct StepSurroundings {
    std::optional<KeptStretch> beforeInNew; ///< ends where the inserted frames begin
    std::optional<KeptStretch> afterInNew;
    std::optional<KeptStretch> beforeInOld; ///< ends where the removed frames begin
    std::optional<KeptStretch> afterInOld;
};

/// Tells what steps do to the shots.
class StepChanges {
public:
    StepChanges(const Programme& oldCut, const Programme& newCut) : m_oldCut(oldCut), m_newCut(newCut) {}

    /// `doubled` are the doubled stretches among the inserted frames.
    std::vector<PictureChange> ofReplacing(const NoteStep& step, const StepSurroundings& around,
                                           const std::vector<KeptStretch>& doubled) const;
    PictureChange ofMoving(FrameSpan inOld, FrameSpan inNew) const;
    /// Of kept picture that a step takes out and puts back, part of it perhaps as another version.
    std::vector<PictureChange> ofReplacedByItself(const KeptStretch& kept) const;
    /// A change for each shot of a kept stretch that bears another version than before.
    std::vector<PictureChange> ofVersions(const KeptStretch& kept) const;

private:
    PictureChange ofKept(ChangeKind kind, FrameSpan inOld, FrameSpan inNew) const;

    const Programme& m_oldCut;
    const Programme& m_newCut;
};

} // namespace cadrel::core
