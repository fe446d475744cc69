// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/ProjectClock.h"

#include "app/edl/ProjectFramerate.h"
#include "app/edl/ScreenTimecode.h"
#include "core/time/Timecode.h"

#include <array>
#include <cmath>
#include <cstdint>
#include <cstdio>

namespace cadrel::app {

using core::Timecode;

namespace {

constexpr double SubframesOfAFrame = 100.0;

std::string signOf(double frame)
{
    return frame < 0.0 ? "-" : "";
}

} // namespace

std::string ProjectClock::rateLabel() const
{
    // A rate between the usual ones is shown as a number.
    if (m_framerate.rate != m_framerate.framesPerSecond && !m_framerate.pulledDown) {
        std::array<char, 32> text{};
        std::snprintf(text.data(), text.size(), "%.6g fps", m_framerate.rate);
        return text.data();
    }
    return ProjectFramerate::labelOf(m_framerate);
}

std::string ProjectClock::rateInWords() const
{
    std::string words;
    if (m_framerate.dropFrame == 1)
        words = "drop-frame";
    if (m_framerate.pulledDown)
        words += words.empty() ? "pulled down" : ", pulled down";
    return rateLabel() + (words.empty() ? "" : " (" + words + ")");
}

std::string ProjectClock::toText(double seconds) const
{
    const double frame = std::floor(seconds * m_framerate.rate + 0.5);
    return signOf(frame) + frameText(std::abs(frame));
}

std::string ProjectClock::toExactText(double seconds) const
{
    const double subframes = std::floor(std::abs(seconds) * m_framerate.rate * SubframesOfAFrame + 0.5);
    const double frame = std::floor(subframes / SubframesOfAFrame);
    std::string text = signOf(std::copysign(subframes, seconds));
    text += onScreen(frameText(frame), m_framerate);
    const int rest = static_cast<int>(subframes - frame * SubframesOfAFrame);
    if (rest != 0) {
        text += rest < 10 ? ".0" : ".";
        text += std::to_string(rest);
    }
    return text;
}

std::string ProjectClock::frameText(double frame) const
{
    const double framesOfADay = m_framerate.lastFrame + 1.0;
    const double day = std::floor(frame / framesOfADay);
    Timecode timecode;
    timecode.setFrameCount(static_cast<std::int32_t>(frame - day * framesOfADay), m_framerate);
    return Timecode(timecode.hours() + static_cast<std::int32_t>(24.0 * day), timecode.minutes(), timecode.seconds(),
                    timecode.frames())
        .toString();
}

} // namespace cadrel::app
