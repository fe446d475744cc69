// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/SharedStretch.h"

#include "core/edl/EventBase.h"
#include "core/time/Timecode.h"
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
    : m_group(&group), m_rate(framerate.rate)
{
    const EventShape& old = group.shape;
    const std::int32_t sourceStart = std::max(old.srcIn, newEvent.srcIn);
    std::int32_t offsetOld = sourceStart - old.srcIn;
    std::int32_t offsetNew = sourceStart - newEvent.srcIn;
    m_length = std::min(old.srcOut, newEvent.srcOut) - sourceStart;

    if (EventBase::areSameSpeed(old.motionSpeed, FreezeSpeed)) {
        // A freeze frame shows one picture, so the stretch begins where the events begin.
        m_length = std::min(old.dstOut - old.dstIn, newEvent.dstOut - newEvent.dstIn);
        m_startAfterOldDstIn = 0;
        m_startInNew = newEvent.dstIn;
    } else {
        if (!EventBase::areSameSpeed(old.motionSpeed, NormalSpeed)) {
            m_length = toProgrammeTime(m_length, old.motionSpeed, framerate);
            offsetOld = toProgrammeTime(offsetOld, old.motionSpeed, framerate);
            offsetNew = toProgrammeTime(offsetNew, old.motionSpeed, framerate);
        }
        m_startAfterOldDstIn = offsetOld;
        m_startInNew = newEvent.dstIn + offsetNew;
    }
    m_newSourceStart = newEvent.srcIn + offsetNew;
    m_newSeconds = newEvent.dstIn / m_rate + offsetNew / m_rate;
    m_offsetOldSeconds = offsetOld / m_rate;

    const std::int32_t latestStart =
        std::max({startInOld(group.placesByTime.back().dstIn), m_startInNew, m_newSourceStart});
    if (latestStart + m_length > framerate.lastFrame)
        throw Result::OutOfRange;
}

} // namespace cadrel::core
