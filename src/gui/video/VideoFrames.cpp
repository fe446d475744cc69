// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/video/VideoFrames.h"

#include <algorithm>
#include <cmath>
#include <cstdint>

namespace cadrel::gui {

using core::Timecode;

namespace {

int scaled(int length, double scale)
{
    return static_cast<int>(std::max(std::lround(length * scale), 1L));
}

} // namespace

Timecode VideoFrames::lastBefore(const Timecode& out)
{
    const std::int32_t frames = out.toFrameCount();
    return frames < 1 ? out : Timecode(frames - 1);
}

PixelSize VideoFrames::pixelsOf(int width, int height, double scale)
{
    return {scaled(width, scale), scaled(height, scale)};
}

} // namespace cadrel::gui
