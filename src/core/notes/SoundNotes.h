// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/SecondsRange.h"

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace cadrel::core {

class ChangeNotes;
class StepPlaces;

/// What a new cut does to a clip or a marker of the sound.
enum class SoundChangeKind {
    HeadTrimmed,
    TailTrimmed,
    Split,   ///< a part of it goes on elsewhere; what was between may be gone
    Doubled, ///< something of it stands there once more
    FellOut, ///< nothing of it is left
    Added,   ///< it wasn't there
};

// All times are seconds of the project's clock, and names are UTF-8.

struct SoundChange {
    SoundChangeKind kind{};
    std::size_t track = 0; ///< place in the list of tracks
    std::string name;
    std::string part; ///< that it lies in; empty for none
    bool isMarker = false;
    SecondsRange was;                ///< all of the clip in the old programme; of no meaning for an added one
    SecondsRange lost;               ///< what of it is gone; without a length where it is only cut apart
    std::optional<SecondsRange> now; ///< in the new programme what is doubled or added
};

/// Where automation jumps in the new programme.
struct AutomationJump {
    SecondsRange place;
    std::vector<std::string> tracks; ///< their names
};

/// A piece of a clip that stands in the new programme.
struct CarriedPiece {
    std::size_t track = 0;
    std::size_t clip = 0; ///< the pieces of one clip have the same number, and come one after the other
    SecondsRange was;
};

struct SoundScene {
    std::string name;
    SecondsRange was;
};

/// How many clips and markers became what. One that was moved and trimmed counts in both.
struct SoundCount {
    std::size_t all = 0;
    std::size_t stay = 0;
    std::size_t moved = 0;
    std::size_t trimmed = 0;
    std::size_t split = 0;
    std::size_t doubled = 0;
    std::size_t lost = 0;
    std::size_t added = 0;

    SoundCount& operator+=(const SoundCount& other);
};

/// What is known of the sound after a run.
struct SoundFacts {
    std::vector<SoundChange> changes;
    std::vector<AutomationJump> jumps;
    std::vector<CarriedPiece> carried; ///< only needed where picture has been moved
    std::vector<SoundScene> scenes;
};

/// The sound at a step.
struct StepSound {
    std::vector<std::string> scenes;
    std::vector<SoundChange> changes; ///< by track and time
    std::vector<AutomationJump> jumps;
    std::size_t movedClips = 0;      ///< that have something in the picture that the step moves
    std::vector<std::size_t> tracks; ///< on which something has changed or was moved along, in order

    bool isEmpty() const { return changes.empty() && jumps.empty() && movedClips == 0; }
    /// How many of the changes are of a kind.
    std::size_t count(SoundChangeKind kind) const;
};

/// What happened to the sound at each change of the picture. Each change of the sound stands at one step, or elsewhere.
class SoundNotes {
public:
    SoundNotes(const ChangeNotes& notes, SoundFacts facts);

    /// Of the step of that number, from 1 on.
    const StepSound& at(std::size_t step) const { return m_steps.at(step); }
    /// What happened where no picture has changed.
    const StepSound& elsewhere() const { return m_steps.front(); }

private:
    void addScenes(const StepPlaces& places, std::vector<SoundScene> scenes);
    void addCarried(const StepPlaces& places, const std::vector<CarriedPiece>& carried);
    void sortChanges();

    std::vector<StepSound> m_steps; ///< by their numbers
};

} // namespace cadrel::core
