// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/project/ProjectContent.h"
#include "core/notes/SoundNotes.h"

#include <cstddef>
#include <map>
#include <string>
#include <vector>

namespace cadrel::core {
class ProgrammeShift;
} // namespace cadrel::core

namespace cadrel::app {

/// A clip or a marker with its place at one moment. For a part, each of its clips is listed.
struct Placement {
    enum class Kind { Clip, Point, Range };

    Kind kind = Kind::Clip;
    const standin::MediaClip* clip = nullptr; ///< what a clip plays; may be null
    std::u16string name;
    std::u16string part; ///< the name of the part that it lies in; empty for none
    double start = 0.0;  ///< seconds of the project
    double end = 0.0;    ///< likewise
    double offset = 0.0; ///< how far into its clip it begins, in seconds

    double length() const { return end - start; }
    bool isMarker() const { return kind != Kind::Clip; }
    bool operator==(const Placement&) const = default;
};

/// What lay on each track once, in the order of time.
using ProjectState = std::map<const standin::Track*, std::vector<Placement>>;

ProjectState stateOf(const standin::Project& project);

/// A piece of a former clip or marker, or all of it, at its new place.
struct Piece {
    Placement now;
    double from = 0.0;  ///< how far into the former one it begins, in seconds
    double shift = 0.0; ///< how much later it is than it was
};

/// What became of one clip or marker.
struct Fate {
    Placement before;
    std::vector<Piece> pieces; ///< in the order of time; none when nothing of it is left
    double lostAtStart = 0.0;  ///< seconds that no piece has, here and below
    double lostAtEnd = 0.0;
    double lostBetween = 0.0;
    bool isMoved = false;
    bool isSplit = false;   ///< into pieces that follow one another in it
    bool isDoubled = false; ///< something of it stands there more than once

    bool isLost() const { return pieces.empty(); }
    bool isTrimmed() const { return !isLost() && (lostAtStart > 0.0 || lostAtEnd > 0.0 || lostBetween > 0.0); }
    bool stays() const { return !isLost() && !isMoved && !isSplit && !isDoubled && !isTrimmed(); }
};

/// One thing that happened to a clip or marker.
struct FateChange {
    core::SoundChangeKind kind{};
    double from = 0.0;            ///< seconds into the former clip, where what is gone begins
    double to = 0.0;              ///< likewise, where it ends
    const Piece* piece = nullptr; ///< what is doubled; null for the rest
};

/// All that happened to it, but for moves; in the order of the former clip. Empty for what only moved or stays.
std::vector<FateChange> changesOf(const Fate& fate);

struct TrackComparison {
    const standin::Track* track;
    std::vector<Fate> fates;      ///< of all that lay on it
    std::vector<Placement> added; ///< what is new on the track
};

/// Compares the tracks of a project, from top to bottom and without folders, with what was on them. A clip may have
/// come from any place that played the same stretch of the same media; `shift` says which one it should be.
std::vector<TrackComparison> compare(const ProjectState& before, const standin::Project& after,
                                     const core::ProgrammeShift& shift);

} // namespace cadrel::app
