// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Timecode.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace cadrel::core {
class EventList;
} // namespace cadrel::core

namespace cadrel::app {

/// A stretch of the new programme that no change event covers: new picture without old sound.
struct Insert {
    std::int32_t start;    ///< frame count
    std::int32_t end;      ///< frame count of the frame after it
    std::string shot;      ///< the clip name, or else the roll name, of the event that it begins in
    std::size_t moreShots; ///< events that begin further on in it

    std::int32_t frames() const { return end - start; }
};

/// How much of the new programme the change list carries over, counted in frames. The programme is what the picture
/// events with readable times fill, even if something else is wrong with them, because they need sound too. A healed
/// event carries over what its members carry over; an insert between its members stays an insert.
///
///     new programme   |---- A ----|---- B ----|  |--- C ---|
///     change list     |-- 1 --|       |-- 2 --|
///     inserts                 |-- A --|          |--- C ---|
struct Coverage {
    Coverage(const core::EventList& newEvents, const core::EventList& changeEvents, const core::Framerate& framerate);

    std::int32_t insertedFrames() const { return programmeFrames - coveredFrames; }
    /// In tenths of a percent, rounded down, so that 1000 means all of it.
    std::int32_t permille() const;

    std::int32_t programmeFrames = 0;
    std::int32_t coveredFrames = 0;
    std::vector<Insert> inserts; ///< in time order
};

} // namespace cadrel::app
