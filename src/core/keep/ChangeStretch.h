// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/picture/FrameRange.h"
#include "core/time/Framerate.h"

#include <optional>
#include <vector>

namespace cadrel::core {

class EventBase;
class EventList;

/// What an event of a change EDL carries, in frames.
struct ChangeStretch {
    FrameRange destination;
    std::int32_t shift = 0; ///< from the old place to the new one

    FrameRange source() const { return destination.shiftedBy(-shift); }
};

/// Nothing for an event whose timecodes don't exist at the rate, or that carries nothing. Where both sides differ in
/// length, the SRC decides.
std::optional<ChangeStretch> changeStretchOf(const EventBase& event, const Framerate& framerate);

/// What a change EDL carries, without healing, ascending by destination.
std::vector<ChangeStretch> unhealedStretches(const EventList& changeEvents, const Framerate& framerate);

/// The stretches with those joined that touch and have one shift.
std::vector<ChangeStretch> joinedByShift(const std::vector<ChangeStretch>& stretches);

} // namespace cadrel::core
