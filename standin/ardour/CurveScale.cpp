// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/CurveScale.h"

#include "standin/project/FileFault.h"

#include <algorithm>
#include <cmath>

namespace standin {

namespace {

/// What Ardour takes for the least gain that isn't silence.
constexpr double LeastGain = 1e-7;

double faderOf(double gain)
{
    if (gain <= LeastGain)
        return 0.0;
    return std::pow(std::max((6.0 * std::log2(gain) + 192.0) / 198.0, 0.0), 8.0);
}

double gainOf(double fader)
{
    return fader <= 0.0 ? 0.0 : std::exp2((198.0 * std::pow(fader, 1.0 / 8.0) - 192.0) / 6.0);
}

} // namespace

CurveScale::CurveScale(std::string_view style, const std::vector<double>& values)
    : m_shape(style == "Discrete"      ? Shape::Hold
              : style == "Logarithmic" ? Shape::Logarithmic
              : style == "Exponential" ? Shape::Fader
                                       : Shape::Straight)
{
    for (const double value : values) {
        if (!std::isfinite(value) || std::abs(value) > 1e30)
            throw FileFault("an automation list has a value that is no number");
        if (m_shape == Shape::Fader && value < 0.0)
            throw FileFault("an automation list of gain has a value below 0");
    }
    if (m_shape == Shape::Logarithmic) {
        for (const double value : values) {
            if (value > 0.0 && (m_leastValue == 0.0 || value < m_leastValue))
                m_leastValue = value;
        }
        if (m_leastValue == 0.0)
            m_leastValue = LeastGain;
    }
    double largest = 1.0;
    if (m_shape == Shape::Fader) {
        for (const double value : values)
            largest = std::max(largest, onScale(value));
    } else if (!values.empty()) {
        const auto [least, most] = std::ranges::minmax(values);
        m_least = onScale(least);
        largest = onScale(most);
    }
    m_range = largest > m_least ? largest - m_least : 1.0;
    for (const double value : values)
        m_values.emplace(toShare(value), value);
}

double CurveScale::onScale(double value) const
{
    switch (m_shape) {
    case Shape::Logarithmic:
        return std::log(std::max(value, m_leastValue));
    case Shape::Fader:
        return faderOf(value);
    default:
        return value;
    }
}

double CurveScale::fromScale(double place) const
{
    switch (m_shape) {
    case Shape::Logarithmic:
        return std::exp(place);
    case Shape::Fader:
        return gainOf(place);
    default:
        return place;
    }
}

double CurveScale::toShare(double value) const
{
    return std::clamp((onScale(value) - m_least) / m_range, 0.0, 1.0);
}

double CurveScale::toValue(double share) const
{
    const auto found = m_values.find(share);
    if (found != m_values.end())
        return found->second;
    // What came back through the contract is a 32-bit number.
    const auto held = m_values.lower_bound(share - 1e-7);
    if (m_shape == Shape::Hold && held != m_values.end() && held->first <= share + 1e-7)
        return held->second;
    return fromScale(m_least + share * m_range);
}

} // namespace standin
