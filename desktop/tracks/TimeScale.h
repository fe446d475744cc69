// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace desktop {

/// Where the times of a project stand on a row of pixels. Times are seconds of the project, pixels count from the left edge of
/// the row. Both are of double precision, so that a day after the programme a sample still has a place of its own.
class TimeScale {
public:
    /// In seconds for a pixel: a sample has two pixels, and thirty years fit on a screen.
    static constexpr double Finest = 1.0e-5;
    static constexpr double Coarsest = 2.0e6;

    double left() const { return m_left; }
    double secondsPerPixel() const { return m_secondsPerPixel; }

    double pixelAt(double seconds) const { return (seconds - m_left) / m_secondsPerPixel; }
    double secondsAt(double pixel) const { return m_left + pixel * m_secondsPerPixel; }

    /// What isn't a time, and what lies beyond all time, is brought to the nearest that is.
    void setLeft(double seconds);
    /// The time at that pixel stays where it is. A factor above 1 shows less time; any but a positive number changes nothing.
    void zoomBy(double factor, double aroundPixel);
    /// The stretch fills `width` pixels but for a small margin on either side. One without length is a second long.
    void fit(double start, double end, double width);

    bool operator==(const TimeScale&) const = default;

private:
    double m_left = 0.0;
    double m_secondsPerPixel = 0.1;
};

} // namespace desktop
