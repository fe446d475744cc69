// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notes/PictureRules.h"
#include "core/picture/TextNumbers.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

namespace cadrel::core {

class EventBase;
class EventList;

/// Consecutive frames of one event: of its transition, or of the rest of it. Or a gap between two events.
///
/// Frame i of a run shows frame `source` + i x `sourceStep` of its material. Two frames are the same picture when their
/// material is the same, the steps are the same speed, and they show the same frame.
struct ShownRun {
    static constexpr std::int32_t NoEvent = -1;

    std::int32_t start;    ///< in the frames of the programme
    std::int32_t length;   ///< in frames, at least 1
    std::int32_t material; ///< numbered for both programmes; freezes, transitions and flawed events are materials too
    std::int32_t version;  ///< equal for equal names with their VFX versions
    std::int32_t name;     ///< equal for equal names without them, at whatever speed and in which direction it plays
    double source;
    double sourceStep;
    std::int32_t event; ///< place in the list, or NoEvent for a gap
    bool isTransition;
    std::int32_t eventFrame = 0;  ///< which frame of the event the first one is
    std::int32_t eventLength = 0; ///< frames of the whole event

    std::int32_t end() const { return start + length; }
    bool isGap() const { return event == NoEvent; }
};

/// A stretch of programme that moves together when something is inserted or deleted. A new one begins after a minute
/// without picture, so that a reel that starts on its own hour keeps its start whatever happens to the one before it.
struct Reel {
    std::int32_t timecodeStart; ///< the frame count of the timecode of its first frame
    std::int32_t start;         ///< in the frames of the programme
    std::int32_t length;

    std::int32_t end() const { return start + length; }
};

/// Why an event isn't shown as it is written.
enum class PictureDoubt {
    NoPicture, ///< audio, or no place in the programme that can be read; it is passed over
    Flawed,    ///< it has flaws; it is the same picture only as an event that is written in the same way
    Reversed,  ///< SRC OUT lies before SRC IN; likewise
    Nameless,  ///< its name tells nothing of its material: empty or "AX"
    Covered,   ///< another event stands on top of a part of it
};

struct DoubtfulEvent {
    PictureDoubt doubt;
    std::int32_t event; ///< place in the list
};

/// What is seen of an event list: the reels one after another, each a row of frames without an end between. The frames
/// are counted from the first frame of the first reel; what lies between reels has no frames. Where events overlap, the
/// one that starts later is seen, of two that start together the later one in the list.
///
///     events     |---- 1 ----|   |------- 3 -------|             |-- 4 --|
///                                   |- 2 -|
///     runs       |-----------|gap|--|-----|--------|             |-------|
///     reels      |----------- reel 1 --------------|             |reel 2-|
class Programme {
public:
    /// `numbers` gives the names of both programmes their numbers; the list outlives the programme.
    Programme(const EventList& events, const PictureRules& rules, TextNumbers& numbers);

    const EventList& events() const { return *m_events; }
    /// In order, without a frame between two runs.
    const std::vector<ShownRun>& runs() const { return m_runs; }
    const std::vector<Reel>& reels() const { return m_reels; }
    const std::vector<DoubtfulEvent>& doubts() const { return m_doubts; }
    std::int32_t length() const { return m_runs.empty() ? 0 : m_runs.back().end(); }

    /// The places of the run and the reel that hold a frame.
    std::size_t runAt(std::int32_t frame) const;
    std::size_t reelAt(std::int32_t frame) const;
    /// The frame count of a frame's timecode. The end of a reel is taken for the frame after its last.
    std::int32_t timecodeOf(std::int32_t frame, std::size_t reel) const;
    /// Null for a gap.
    const EventBase* eventOf(const ShownRun& run) const;

private:
    const EventList* m_events;
    std::vector<ShownRun> m_runs;
    std::vector<Reel> m_reels;
    std::vector<DoubtfulEvent> m_doubts;
};

} // namespace cadrel::core
