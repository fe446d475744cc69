// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/ProjectClock.h"

#include "core/time/Timecode.h"
#include "host/project/HostFramerate.h"
#include "standin/base/Times.h"
#include "util/Result.h"
#include "velmark/Project.h"

#include <cmath>

namespace desktop {

using cadrel::core::Framerate;
using cadrel::core::Timecode;
using cadrel::util::Result;

namespace {

constexpr std::int64_t SecondsOfDay = 24 * 3600;

Framerate rateOf(const Velmark::FrameRateInfo& info)
{
    for (const bool withDropFrame : {true, false}) {
        try {
            return cadrel::host::framerateOf({info.framesPerSecond, withDropFrame ? info.flags : 0});
        } catch (Result::Type) {
            continue;
        }
    }
    return Framerate(24, 0);
}

std::int64_t floorOf(std::int64_t number, std::int64_t divisor)
{
    return number / divisor - (number % divisor < 0 ? 1 : 0);
}

} // namespace

ProjectClock::ProjectClock() : m_framerate(24, 0)
{
    m_framerate.rate = 24.0;
}

ProjectClock::ProjectClock(const Velmark::FrameRateInfo& info, double origin)
    : m_framerate(rateOf(info)), m_origin(origin)
{
}

std::int64_t ProjectClock::frameAt(double seconds) const
{
    return static_cast<std::int64_t>(std::floor((m_origin + seconds + standin::SameInstant) * m_framerate.rate));
}

double ProjectClock::secondsOf(std::int64_t frame) const
{
    return static_cast<double>(frame) / m_framerate.rate - m_origin;
}

std::string ProjectClock::textOf(std::int64_t frame) const
{
    Timecode timecode;
    timecode.setFrameCount(static_cast<std::int32_t>(frame - dayOf(frame) * framesOfDay()), m_framerate);
    std::string text = timecode.toString();
    if (isDropFrame())
        text[text.rfind(':')] = ';';
    return text;
}

std::int64_t ProjectClock::dayOf(std::int64_t frame) const
{
    return floorOf(frame, framesOfDay());
}

std::int64_t ProjectClock::numberOf(std::int64_t frame) const
{
    const std::int64_t day = dayOf(frame);
    Timecode timecode;
    timecode.setFrameCount(static_cast<std::int32_t>(frame - day * framesOfDay()), m_framerate);
    const std::int64_t seconds = ((day * 24 + timecode.hours()) * 60 + timecode.minutes()) * 60 + timecode.seconds();
    return seconds * nominalRate() + timecode.frames();
}

std::int64_t ProjectClock::frameWith(std::int64_t number) const
{
    const std::int64_t second = floorOf(number, nominalRate());
    const std::int64_t day = floorOf(second, SecondsOfDay);
    const auto ofDay = static_cast<std::int32_t>(second - day * SecondsOfDay);
    auto frame = static_cast<std::int32_t>(number - second * nominalRate());
    const auto timecode = [&] { return Timecode(ofDay / 3600, ofDay / 60 % 60, ofDay % 60, frame); };
    // Of drop-frame, the numbers 0 and 1 of most minutes are left out.
    while (!timecode().isValid(m_framerate))
        ++frame;
    return day * framesOfDay() + timecode().toFrameCount(m_framerate);
}

bool ProjectClock::operator==(const ProjectClock& other) const
{
    return cadrel::host::areSame(m_framerate, other.m_framerate) && m_origin == other.m_origin;
}

} // namespace desktop
