// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/ChangeStretch.h"

#include "core/edl/EventBase.h"

namespace cadrel::core {

std::optional<ChangeStretch> changeStretchOf(const EventBase& event, const Framerate& framerate)
{
    for (const Timecode* timecode : {&event.srcIn(), &event.srcOut(), &event.dstIn(), &event.dstOut()}) {
        if (!timecode->isValid(framerate))
            return std::nullopt;
    }
    const std::int32_t srcIn = event.srcIn().toFrameCount(framerate);
    const std::int32_t dstIn = event.dstIn().toFrameCount(framerate);
    const std::int32_t length = event.srcOut().toFrameCount(framerate) - srcIn;
    if (length <= 0)
        return std::nullopt;
    return ChangeStretch{{dstIn, dstIn + length}, dstIn - srcIn};
}

} // namespace cadrel::core
