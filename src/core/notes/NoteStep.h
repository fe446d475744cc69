// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notes/KeptStretches.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <variant>
#include <vector>

namespace cadrel::core {

class EventBase;

/// Frames of a programme: `length` of them from `start`.
struct FrameSpan {
    std::int32_t start = 0;
    std::int32_t length = 0;

    std::int32_t end() const { return start + length; }
    bool operator==(const FrameSpan&) const = default;
};

/// What happens to the picture.
enum class ChangeKind {
    HeadTrimmed,       ///< a shot begins later, or earlier with `frames` above 0
    TailTrimmed,       ///< a shot ends earlier, or later with `frames` above 0
    Lifted,            ///< a shot or a part of it is gone
    Inserted,          ///< new picture
    Replaced,          ///< new picture in the place and length of old picture
    Moved,             ///< the same picture at another place
    Doubled,           ///< picture that stands once in the old cut stands here once more
    Retimed,           ///< a shot at another speed
    VersionChanged,    ///< another version of a VFX shot
    TransitionAdded,   ///< a dissolve or wipe where a cut was
    TransitionRemoved, ///< a cut where a dissolve or wipe was
    TransitionChanged, ///< a dissolve or wipe of another length, type or place
    Unchanged,         ///< kept picture between joined trims, which their step replaces by itself
    ReelMoved,         ///< a reel begins at another timecode
};

struct PictureChange {
    ChangeKind kind{};
    std::int32_t frames = 0; ///< of a trim, signed by what the shot wins; of a reel, by how much later it begins;
                             ///< else how long the picture is now
    const EventBase* oldShot = nullptr; ///< in the old cut; null where there is none
    const EventBase* newShot = nullptr; ///< in the new cut; null where there is none
    std::optional<FrameSpan> inOld;     ///< where it stood, in the frames of the old programme
    std::optional<FrameSpan> inNew;     ///< where it stands
    std::int32_t shots = 1;             ///< of moved, doubled and unchanged picture: how many shots
    bool isPart = false;                ///< of a lift: the rest of the shot stays somewhere
    bool hasOldTransition = false;      ///< the dissolve or wipe of the old shot goes with it
    bool hasNewTransition = false;      ///< the new shot brings its dissolve or wipe
    bool isOutOfTheWay = false; ///< of a reel: it goes to a free place, where it waits for its own steps; of moved
                                ///< picture: it goes into a reel that stands at such a place
};

/// Where frames are in the programme as it is when all steps before have been carried out.
struct WorkPlace {
    std::size_t reel = 0;       ///< place in the list of reels
    std::int32_t frame = 0;     ///< from the first frame of the reel
    std::int32_t reelStart = 0; ///< the frame count of the timecode of that first frame then

    std::int32_t timecode() const { return reelStart + frame; }

    bool operator==(const WorkPlace&) const = default;
};

enum class StepAction {
    Replace,  ///< delete `removed` frames at `place`, then insert `inserted` there; one of them may be empty
    Move,     ///< take `moved` frames out at `from` and insert them at `place`, which is counted without them
    Relabel,  ///< the frames at `place` stay and are replaced by `inserted`, which show another version of them
    MoveReel, ///< all of the reel of `place` is moved from the timecode of `from` to that of `place`
};

/// One step of the way from the old cut to the new one. Steps are in the order of the new programme. Before the place of
/// a step that replaces, all is as it is in the new cut. A reel that begins elsewhere is moved by its first step, or by one
/// of an earlier reel, in whose way it would be.
struct NoteStep {
    StepAction action = StepAction::Replace;
    WorkPlace place;
    std::int32_t removed = 0;             ///< frames
    std::vector<FrameSpan> removedFrames; ///< the same in the old programme
    FrameSpan inserted;                   ///< in the new programme
    WorkPlace from;
    std::int32_t moved = 0;             ///< frames
    std::vector<WorkPlace> doubledFrom; ///< of each change of the kind Doubled, where the picture is as well
    std::vector<PictureChange> changes; ///< at least one
    std::size_t joined = 1;             ///< of so many steps this one is made, new versions not counted

    /// What the reel of `place` wins or loses where it is no move within the reel.
    std::int32_t lengthChange() const { return action == StepAction::Replace ? inserted.length - removed : 0; }
};

/// The other end of a move between reels. The move is a step of the reel that comes first; this stands in the other one.
struct MoveEnd {
    WorkPlace place;           ///< where the picture stands, or where it was
    bool isTarget = false;     ///< it has come to here; else it has gone from here
    std::size_t otherReel = 0; ///< place in the list of reels
    PictureChange move;        ///< that of the step
    std::size_t step = 0;      ///< its number; 0 until the steps are numbered
};

/// The steps of a reel, the stretches that are kept between them, and the other ends of moves. A kept stretch stands before
/// the steps that change the version of a shot in it.
using NoteRow = std::variant<KeptStretch, NoteStep, MoveEnd>;

/// A reel of the old cut with that which it has become. One of them is missing where a reel is new or gone.
struct ReelChange {
    std::optional<std::size_t> oldReel;
    std::optional<std::size_t> newReel;
};

} // namespace cadrel::core
