// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Timecode.h"

#include <cstdint>

namespace cadrel::gui {

/// By how much the timecodes of files are moved.
struct EdlOffset {
    core::Timecode amount = core::Timecode::minTimecode();
    bool isForward = true; ///< towards the end of the day

    /// In frames at the project's rate, below 0 towards the start of the day.
    std::int32_t frames() const { return isForward ? amount.toFrameCount() : -amount.toFrameCount(); }
    bool isNone() const { return amount == core::Timecode::minTimecode(); }

    bool operator==(const EdlOffset& other) const { return amount == other.amount && isForward == other.isForward; }
};

} // namespace cadrel::gui
