// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/HostFramerate.h"

#include "util/Result.h"
#include "velmark/Project.h"

#include <cmath>
#include <cstdint>

namespace cadrel::host {

using Flag = Velmark::FrameRateInfo::Flag;

core::Framerate framerateOf(const Velmark::FrameRateInfo& info)
{
    constexpr double Fastest = 1000.0;
    if (!(info.framesPerSecond >= 1.0 && info.framesPerSecond <= Fastest))
        throw util::Result::NotSupported;
    core::Framerate framerate(static_cast<std::int32_t>(std::lround(info.framesPerSecond)),
                              (info.flags & Flag::DropFrame) != 0 ? 1 : 0);
    framerate.rate = info.framesPerSecond;
    framerate.pulledDown = (info.flags & Flag::PulledDown) != 0;
    return framerate;
}

bool areSame(const core::Framerate& one, const core::Framerate& other)
{
    return one.rate == other.rate && one.dropFrame == other.dropFrame && one.pulledDown == other.pulledDown;
}

} // namespace cadrel::host
