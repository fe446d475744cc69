// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Timecode.h"

namespace cadrel::gui {

/// In pixels.
struct PixelSize {
    int width = 0;
    int height = 0;

    bool operator==(const PixelSize&) const = default;
};

/// Which frames the video display asks for, and how large.
struct VideoFrames {
    /// The last frame that is seen before an OUT point. A timecode at zero stays, as there is no frame before it. Throws what
    /// Timecode::toFrameCount throws.
    static core::Timecode lastBefore(const core::Timecode& out);

    /// The pixels of the screen that an area of the window covers, at least one. `scale` is how many of them make one of the
    /// window's.
    static PixelSize pixelsOf(int width, int height, double scale);
};

} // namespace cadrel::gui
