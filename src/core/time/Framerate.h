// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <string_view>

namespace cadrel::core {

/// A nominal and a real frame rate with its drop-frame state. A value with `framesPerSecond` 0 or `dropFrame` -1 is
/// unknown.
struct Framerate {
    Framerate() = default;
    /// `rate` is the whole nominal number. Throws Result::NotSupported for drop-frame at a nominal rate other than 30.
    Framerate(std::int32_t nominalRate, std::int32_t dropFrameState);
    /// `rate` is the nominal number times the pull-down factor when pulled down. Throws Result::NotSupported for
    /// drop-frame, or an unknown drop-frame state, at a nominal rate other than 30, and Result::OutOfRange for a rate
    /// at which a day's frames can't be counted.
    Framerate(std::int32_t nominalRate, bool isPulledDown, std::int32_t dropFrameState);

    /// The rate of a label such as "29.97 dfps"; the whole label has to match. Any other label gives a rate with
    /// `framesPerSecond` 0 and `dropFrame` 0.
    static Framerate fromLabel(std::string_view label);

    /// 1000/1001.
    static double pullDownFactor();

    bool isUnknown() const { return framesPerSecond == 0 || dropFrame == -1; }

    /// Computes `lastFrame` anew from the other fields; 0 without a nominal rate. Throws as the constructor from three
    /// numbers.
    void updateLastFrame();

    std::int32_t framesPerSecond = 0; ///< nominal whole rate; 0 is unknown
    double rate = 0.0;                ///< real frames per second, the divisor for seconds
    std::int32_t dropFrame = -1;      ///< -1 unknown, 0 non-drop, 1 drop-frame
    bool pulledDown = false;          ///< `rate` is the nominal rate times the pull-down factor
    std::int32_t lastFrame = 0;       ///< frame count of 23:59:59:(framesPerSecond - 1)
};

} // namespace cadrel::core
