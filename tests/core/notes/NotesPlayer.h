// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/notes/NoteStep.h"
#include "core/notes/PictureRules.h"

#include <cstdint>
#include <string>
#include <vector>

namespace cadrel::tests {

/// What is seen in one frame of a programme.
struct SeenFrame {
    std::string what;    ///< the material with its version, and what else tells it from others
    double source = 0.0; ///< the frame of the material
    double speed = 1.0;
    int shotLength = 0; ///< frames of its event
    int shotFrame = 0;  ///< which of them it is

    /// Retimed shots may lie a frame apart, and what two speeds that count as one make over the length of a shot. Speeds count
    /// as one, too, where the source of the shorter shot is less than a frame off at the speed of the longer one; both run at
    /// that then.
    bool looksLike(const SeenFrame& other) const;
};

struct SeenReel {
    int start = 0; ///< the frame count of the timecode of its first frame
    std::vector<SeenFrame> frames;
};

/// The frames of a programme, reel by reel. It is painted event by event and frame by frame.
std::vector<SeenReel> framesOf(const core::EventList& events, const core::PictureRules& rules);

/// Carries steps out on the frames of the old cut as an assistant does it by hand, on one timeline for all reels, and looks up
/// what has to be inserted in the new cut.
class NotesPlayer {
public:
    NotesPlayer(const core::EventList& oldCut, const core::EventList& newCut, const core::PictureRules& rules,
                const std::vector<core::ReelChange>& reels);

    /// Throws std::logic_error where the step can't be carried out, or one reel lies on another after it.
    void carryOut(const core::NoteStep& step);
    /// Empty when all reels are and begin as in the new cut, else where they differ first. One that is gone begins nowhere.
    std::string difference() const;
    /// Whether the frames before a place are already those of the new cut.
    bool isDoneBefore(const core::WorkPlace& place) const;
    /// Whether the frames at a place look like those of the new cut from `newStart` on, whatever their version.
    bool showsAt(const core::WorkPlace& place, int newStart) const;
    /// The frame count of the timecode at which a place stands now. An empty reel begins where its first frames are put.
    int timecodeAt(const core::WorkPlace& place) const;

private:
    void carryOutAlone(const core::NoteStep& step);
    std::string overlap() const;

    std::vector<SeenReel> m_goal; ///< by pairs of reels; empty for one that goes
    std::vector<SeenReel> m_reels;
    std::vector<SeenFrame> m_newFrames;
};

} // namespace cadrel::tests
