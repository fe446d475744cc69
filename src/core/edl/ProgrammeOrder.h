// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <memory>
#include <vector>

namespace cadrel::core {

class EventBase;
struct Framerate;

/// One of a row of events, with its timecodes as frame counts.
struct PlacedEvent {
    std::uint32_t index; ///< in the row
    std::int32_t srcIn;
    std::int32_t srcOut;
    std::int32_t dstIn;
    std::int32_t dstOut;
};

/// The events in the order of DST IN, without those with EventFlaw::TimecodeInvalid; equal times in the order in which they
/// were. Throws what Timecode::toFrameCount throws under `framerate`.
std::vector<PlacedEvent> inProgrammeOrder(const std::vector<std::shared_ptr<EventBase>>& events,
                                          const Framerate& framerate);

} // namespace cadrel::core
