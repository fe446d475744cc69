#include "app/project/ProjectClock.h"

#include "app/edl/ProjectFramerate.h"
#include "core/Timecode.h"
#include "host/HostFramerate.h"

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

ProjectClock::ProjectClock(const Velmark::FrameRateInfo& rate, double origin)
    : framerate_(host::framerateOf(rate)), origin_(origin)
{
}

std::string ProjectClock::rateLabel() const
{
    // Of a rate between the usual ones the number itself.
    if (framerate_.rate != framerate_.framesPerSecond && !framerate_.pulledDown) {
        std::array<char, 32> text{};
        std::snprintf(text.data(), text.size(), "%.6g fps", framerate_.rate);
        return text.data();
    }
    return ProjectFramerate::labelOf(framerate_);
}

std::string ProjectClock::rateInWords() const
{
    std::string words;
    if (framerate_.dropFrame == 1)
        words = "drop-frame";
    if (framerate_.pulledDown)
        words += words.empty() ? "pulled down" : ", pulled down";
    return rateLabel() + (words.empty() ? "" : " (" + words + ")");
}

std::string ProjectClock::toText(double seconds) const
{
    const double frame = std::floor(seconds * framerate_.rate + 0.5);
    return signOf(frame) + frameText(std::abs(frame));
}

std::string ProjectClock::toExactText(double seconds) const
{
    const double subframes = std::floor(std::abs(seconds) * framerate_.rate * SubframesOfAFrame + 0.5);
    const double frame = std::floor(subframes / SubframesOfAFrame);
    std::string text = signOf(std::copysign(subframes, seconds));
    text += frameText(frame);
    const int rest = static_cast<int>(subframes - frame * SubframesOfAFrame);
    if (rest != 0) {
        text += rest < 10 ? ".0" : ".";
        text += std::to_string(rest);
    }
    return text;
}

std::string ProjectClock::frameText(double frame) const
{
    const double framesOfADay = framerate_.lastFrame + 1.0;
    const double day = std::floor(frame / framesOfADay);
    Timecode timecode;
    timecode.setFrameCount(static_cast<std::int32_t>(frame - day * framesOfADay), framerate_);
    return Timecode(timecode.hours() + static_cast<std::int32_t>(24.0 * day), timecode.minutes(), timecode.seconds(),
                    timecode.frames())
        .toString();
}

} // namespace cadrel::app
