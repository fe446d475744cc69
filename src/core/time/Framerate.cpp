// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/time/Framerate.h"

#include "core/time/Timecode.h"
#include "util/Result.h"

#include <array>

namespace cadrel::core {

namespace {

struct LabelledRate {
    std::string_view label;
    std::int32_t framesPerSecond;
    bool pulledDown;
    std::int32_t dropFrame;
};

constexpr std::array<LabelledRate, 10> LabelledRates{{
    {"23.98 fps", 24, true, 0},
    {"24 fps", 24, false, 0},
    {"24.98 fps", 25, true, 0},
    {"25 fps", 25, false, 0},
    {"29.97 fps", 30, true, 0},
    {"29.97 dfps", 30, true, 1},
    {"30 fps", 30, false, 0},
    {"30 dfps", 30, false, 1},
    {"59.94 fps", 60, true, 0},
    {"60 fps", 60, false, 0},
}};

} // namespace

Framerate::Framerate(std::int32_t nominalRate, std::int32_t dropFrameState)
    : framesPerSecond(nominalRate), rate(nominalRate), dropFrame(dropFrameState)
{
    if (dropFrame != -1)
        updateLastFrame();
}

Framerate::Framerate(std::int32_t nominalRate, bool isPulledDown, std::int32_t dropFrameState)
    : framesPerSecond(nominalRate), rate(isPulledDown ? nominalRate * pullDownFactor() : nominalRate),
      dropFrame(dropFrameState), pulledDown(isPulledDown)
{
    updateLastFrame();
}

Framerate Framerate::fromLabel(std::string_view label)
{
    for (const LabelledRate& row : LabelledRates) {
        if (row.label == label)
            return {row.framesPerSecond, row.pulledDown, row.dropFrame};
    }
    return {0, false, 0};
}

double Framerate::pullDownFactor()
{
    return 0.999000999000999;
}

void Framerate::updateLastFrame()
{
    if (framesPerSecond < 0)
        throw util::Result::OutOfRange;
    lastFrame = framesPerSecond == 0 ? 0 : Timecode(23, 59, 59, framesPerSecond - 1).toFrameCount(*this);
}

} // namespace cadrel::core
