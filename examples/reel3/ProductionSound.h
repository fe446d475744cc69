// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "examples/reel3/ProgrammeTime.h"

#include <array>
#include <string>
#include <vector>

namespace cadrel::core {
class EventList;
} // namespace cadrel::core

namespace reel3 {

/// A piece of a dialogue track.
struct DialogueClip {
    Quarters in;
    Quarters out;
    std::string name;
    std::string file; ///< below the folder of all sound
    Quarters from;
};

constexpr std::size_t DialogueTrackCount = 3;
using DialogueTracks = std::array<std::vector<DialogueClip>, DialogueTrackCount>;

/// Lays the production sound of the picture's shots as a dialogue editor does: one speaker a track and what can't be parted
/// on the third, so that each can be levelled by itself; long shots in two pieces, without the noise between the lines; and
/// each end pulled over the picture cut, by a few frames or by seconds.
///
///     picture   |-- 42A-3 Maren --|-- 42B-5 Tobias --|-- 42A-3 Maren --|
///     DIA 1   |--- 42A-3 Maren ---|           |---- 42A-3 Maren --------|
///     DIA 2                   |---- 42B-5 Tobias ------|
///
/// Where two pieces of a track want the same time they meet near the cut; what is laid by hand on the third track stays.
DialogueTracks layDialogue(const cadrel::core::EventList& picture);

} // namespace reel3
