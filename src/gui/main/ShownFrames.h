// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Timecode.h"

#include <memory>
#include <optional>
#include <vector>

namespace cadrel::core {
class EventBase;
} // namespace cadrel::core

namespace cadrel::gui {

/// Which frames of the old and the new picture the video preview shows for the selected change events.
struct ShownFrames {
    core::Timecode oldTime;
    core::Timecode newTime;
    bool isLast = false; ///< the frames before the times, which are OUT points

    /// Those of the one event that is selected; nothing for any other number, and where its timecodes don't exist.
    static std::optional<ShownFrames> of(const std::vector<std::shared_ptr<core::EventBase>>& selected, bool isAtOut);
};

} // namespace cadrel::gui
