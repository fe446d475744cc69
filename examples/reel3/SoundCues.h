// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <vector>

namespace reel3 {

/// A recording laid by hand. Times are "HH:MM:SS:FF" of the programme and lengths "SS:FF", each with an optional ".25"
/// after it for a quarter of a frame, at 24 frames a second.
struct Cue {
    const char* in;
    const char* length;
    const char* name;
    const char* file; ///< without ".wav", in the folder of the track
    const char* from; ///< how far into the file
};

/// Cues that are moved as one; theirs and those of inner groups count from its start, as "SS:FF".
struct Group {
    const char* in;
    const char* length;
    const char* name;
    std::vector<Cue> cues;
    std::vector<Group> groups;
};

struct CueTrack {
    const char* name;
    const char* folder; ///< of the project, and of the files
    std::vector<Cue> cues;
    std::vector<Group> groups;
};

/// All tracks but those of the dialogue, from top to bottom.
const std::vector<CueTrack>& cueTracks();

/// What is laid by hand on the third dialogue track, below the production sound: post-synchronised lines and room tone.
const std::vector<Cue>& dialogueCues();

} // namespace reel3
