// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace standin {

/// How Ardour's values of an automation list lie on a scale from 0 to 1 on which the curve runs straight between its points.
///
///     Exponential    ((6 log2 g + 192) / 198)^8, the travel of a fader for the gain g
///     Logarithmic    the logarithm, between that of the least and of the largest value of the list
///     all others     the value, between the least and the largest of the list
class CurveScale {
public:
    /// `style` is the list's "interpolation-style", `values` are those of its points. Throws FileFault for a value that isn't
    /// finite, and for one below 0 on a scale that has none.
    CurveScale(std::string_view style, const std::vector<double>& values);

    /// Whether the curve stays at a value until the next point.
    bool holds() const { return m_shape == Shape::Hold; }

    double toShare(double value) const;
    /// Exactly the value again for a share that toShare has given for one of the list's.
    double toValue(double share) const;

private:
    enum class Shape { Hold, Straight, Logarithmic, Fader };

    double onScale(double value) const;
    double fromScale(double place) const;

    Shape m_shape;
    double m_least = 0.0;
    double m_range = 1.0;
    double m_leastValue = 0.0;         ///< above 0, on a logarithmic scale
    std::map<double, double> m_values; ///< by their shares
};

} // namespace standin
