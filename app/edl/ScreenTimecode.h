// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"

#include <string>

namespace cadrel::app {

/// A timecode as people read it: drop-frame shows in a ";" before the frames.
inline std::string onScreen(std::string timecode, const core::Framerate& framerate)
{
    const std::size_t colon = timecode.rfind(':');
    if (framerate.dropFrame == 1 && colon != std::string::npos)
        timecode[colon] = ';';
    return timecode;
}

} // namespace cadrel::app
