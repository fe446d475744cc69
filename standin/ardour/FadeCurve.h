// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <vector>

namespace pugi {
class xml_node;
} // namespace pugi

namespace standin {

class SessionClock;

/// The curve of a fade as Ardour plays it, over samples from where the fade begins. A list that is "Curved" is a constrained
/// cubic spline (C. J. C. Kruger, "Constrained Cubic Spline Interpolation for Chemical Engineering Applications"); any other
/// runs straight between its points.
class FadeCurve {
public:
    /// One that is 1 everywhere.
    FadeCurve() = default;
    /// The quarter of a sine or, falling, of a cosine over so many samples: one of constant power.
    static FadeCurve constantPower(std::int64_t length, bool isRising);
    /// Of an AutomationList. Throws FileFault.
    FadeCurve(const pugi::xml_node& list, const SessionClock& clock);

    /// Before the first point its value, after the last one that.
    double at(double sample) const;
    /// Where the points stand.
    std::vector<double> times() const;

private:
    struct Point {
        double sample;
        double value;
        double slope; ///< of a curved one
    };

    void bend();

    std::vector<Point> m_points;
    bool m_isCurved = false;
};

} // namespace standin
