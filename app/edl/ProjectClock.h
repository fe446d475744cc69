// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"

#include <string>

namespace cadrel::app {

/// What the clock of a project shows. A project may be longer than a day: the hours count on past 24, and what lies before
/// midnight has a minus.
class ProjectClock {
public:
    /// `origin` is what the clock shows at time 0, in seconds.
    ProjectClock(const core::Framerate& framerate, double origin) : m_framerate(framerate), m_origin(origin) {}

    /// The label of the rate, and in words what it stands for: "29.97 dfps (drop-frame, pulled down)".
    std::string rateInWords() const;
    std::string rateLabel() const;
    const core::Framerate& framerate() const { return m_framerate; }
    double origin() const { return m_origin; }

    /// For programs: the timecode of a time of the project to the nearest frame, and for a length.
    std::string timecode(double seconds) const { return toText(m_origin + seconds); }
    std::string length(double seconds) const { return toText(seconds); }
    /// For people: with hundredths of a frame for a time that isn't on a frame, "03:00:07:12.25", and ";" before the frames of
    /// a drop-frame rate.
    std::string exactTimecode(double seconds) const { return toExactText(m_origin + seconds); }
    std::string exactLength(double seconds) const { return toExactText(seconds); }

private:
    std::string toText(double seconds) const;
    std::string toExactText(double seconds) const;
    /// Of a count from 0 up.
    std::string frameText(double frame) const;

    core::Framerate m_framerate;
    double m_origin;
};

} // namespace cadrel::app
