// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/change/ChangeCandidate.h"
#include "core/change/GenerationFailure.h"
#include "core/change/MaterialIndex.h"
#include "core/time/Framerate.h"

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

namespace cadrel::core {

class EventBase;

/// Finds, for one new event after the other, the stretches of the old programme that show the same material. If several
/// overlap in the source, it decides which one survives.
///
///     source        |------------ new event ------------|
///     old events       |---- A ----|  |--- B ---|
///     candidates       |---- A ----|  |--- B ---|           of overlapping ones, one survives
class CandidateSearch {
public:
    explicit CandidateSearch(const Framerate& framerate) : m_framerate(framerate) {}

    /// Adds the valid event at `index` of the old list under the name that it is compared by. The events come in the
    /// order of the list. Throws what Timecode::toFrameCount throws for a timecode that isn't valid at the rate.
    void addOldEvent(const std::string& name, const EventBase& event, std::size_t index);
    /// Call it after all events have been added and before the first search.
    void finish() { m_index.finish(); }

    /// The candidates that survive for a valid new event, in the order of the old events. `lastDisplacement` is that of
    /// the previous placement, in seconds: among candidates of the same length, the one whose displacement is nearest
    /// to it survives. When candidates leave the day, even ones that wouldn't survive, `onFailure` gets the index of one of
    /// their old events. Either Result::OutOfRange is thrown then, or they are left out.
    std::vector<ChangeCandidate> survivingCandidates(const std::string& name, const EventBase& newEvent,
                                                     double lastDisplacement,
                                                     const std::function<FailureAnswer(std::size_t)>& onFailure) const;

private:
    Framerate m_framerate;
    MaterialIndex m_index;
};

} // namespace cadrel::core
