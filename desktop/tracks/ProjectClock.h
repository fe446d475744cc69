// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"

#include <cstdint>
#include <string>

namespace Velmark {
struct FrameRateInfo;
} // namespace Velmark

namespace desktop {

/// The timecode of a project: which frame the clock shows at a time, and how it is written. Frames count from midnight of the
/// first day; those before it are below 0, and each later day begins at 00:00:00:00 again.
class ProjectClock {
public:
    /// 24 frames a second from midnight on.
    ProjectClock();
    /// `origin` is what the clock shows at time 0, in seconds. Without drop-frame where the rate can't have it.
    ProjectClock(const Velmark::FrameRateInfo& info, double origin);

    const cadrel::core::Framerate& framerate() const { return m_framerate; }
    /// How many frames a second of the display has.
    int nominalRate() const { return m_framerate.framesPerSecond; }
    bool isDropFrame() const { return m_framerate.dropFrame == 1; }
    std::int64_t framesOfDay() const { return std::int64_t{m_framerate.lastFrame} + 1; }
    /// Seconds from midnight to midnight of the clock.
    double secondsOfDay() const { return static_cast<double>(framesOfDay()) / m_framerate.rate; }
    double origin() const { return m_origin; }

    /// The frame that is shown at a time of the project. A time that is a hair before a frame counts as on it.
    std::int64_t frameAt(double seconds) const;
    /// Where a frame begins, in seconds of the project.
    double secondsOf(std::int64_t frame) const;
    /// Such as "01:00:00:12", with a ";" before the frames of drop-frame.
    std::string textOf(std::int64_t frame) const;
    /// The day of a frame, 0 for the first.
    std::int64_t dayOf(std::int64_t frame) const;

    // Numbers count what the display would show if it left out none: `nominalRate` of them a second.

    std::int64_t numberOf(std::int64_t frame) const;
    /// The frame with that number, or the next one that has one.
    std::int64_t frameWith(std::int64_t number) const;

    bool operator==(const ProjectClock& other) const;

private:
    cadrel::core::Framerate m_framerate;
    double m_origin = 0.0;
};

} // namespace desktop
