#include "core/SharedStretch.h"

#include "core/EventBase.h"
#include "core/Timecode.h"
#include "util/Result.h"

#include <algorithm>

namespace cadrel::core {

using util::Result;

namespace {

constexpr double NormalSpeed = 1.0;
constexpr double FreezeSpeed = 0.0;

std::int32_t toProgrammeTime(std::int32_t sourceFrames, double speed, const Framerate& framerate)
{
    Timecode time;
    time.setSeconds(sourceFrames / framerate.rate / speed, framerate);
    return time.toFrameCount(framerate);
}

} // namespace

SharedStretch::SharedStretch(const TwinGroup& group, const EventShape& newEvent, const Framerate& framerate)
    : group_(&group), rate_(framerate.rate)
{
    const EventShape& old = group.shape;
    const std::int32_t sourceStart = std::max(old.srcIn, newEvent.srcIn);
    std::int32_t offsetOld = sourceStart - old.srcIn;
    std::int32_t offsetNew = sourceStart - newEvent.srcIn;
    length_ = std::min(old.srcOut, newEvent.srcOut) - sourceStart;

    if (EventBase::areSameSpeed(old.motionSpeed, FreezeSpeed)) {
        // The one picture stands still, so the stretch begins where the events begin.
        length_ = std::min(old.dstOut - old.dstIn, newEvent.dstOut - newEvent.dstIn);
        startAfterOldDstIn_ = 0;
        startInNew_ = newEvent.dstIn;
    } else {
        if (!EventBase::areSameSpeed(old.motionSpeed, NormalSpeed)) {
            length_ = toProgrammeTime(length_, old.motionSpeed, framerate);
            offsetOld = toProgrammeTime(offsetOld, old.motionSpeed, framerate);
            offsetNew = toProgrammeTime(offsetNew, old.motionSpeed, framerate);
        }
        startAfterOldDstIn_ = offsetOld;
        startInNew_ = newEvent.dstIn + offsetNew;
    }
    newSourceStart_ = newEvent.srcIn + offsetNew;
    newSeconds_ = newEvent.dstIn / rate_ + offsetNew / rate_;
    offsetOldSeconds_ = offsetOld / rate_;

    const std::int32_t latestStart =
        std::max({startInOld(group.placesByTime.back().dstIn), startInNew_, newSourceStart_});
    if (latestStart + length_ > framerate.lastFrame)
        throw Result::OutOfRange;
}

} // namespace cadrel::core
