// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/input/NumberEntry.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <locale>
#include <sstream>

namespace cadrel::gui {

namespace {

/// The number of a text that from_chars finds too large or too small: the largest, the least or nearly 0.
double extremeOf(const std::string& text)
{
    std::istringstream stream(text);
    stream.imbue(std::locale::classic());
    double number = 0.0;
    stream >> number;
    return number;
}

/// Long enough for any number without an exponent.
using Digits = std::array<char, 400>;

/// The number without what lies after the 15 digits of the scale, which a binary number can't hold.
double rounded(double number, double scale)
{
    constexpr int DigitCount = 15;
    if (!std::isfinite(number) || scale == 0.0)
        return number;
    const int decimals = DigitCount - 1 - static_cast<int>(std::floor(std::log10(scale)));
    if (decimals < 0)
        return number;
    Digits digits{};
    const auto [end, failure] =
        std::to_chars(digits.data(), digits.data() + digits.size(), number, std::chars_format::fixed, decimals);
    if (failure == std::errc())
        std::from_chars(digits.data(), end, number);
    return number;
}

} // namespace

void NumberEntry::set(double value)
{
    m_value = std::isnan(value) ? m_minimum : value;
    if (m_value > m_maximum)
        m_value = m_maximum;
    if (m_value < m_minimum)
        m_value = m_minimum;
    // There is no -0.
    m_value += 0.0;
    m_start = m_value;
    m_steps = 0.0;
}

void NumberEntry::step(double count)
{
    const double start = m_start;
    const double steps = m_steps + count;
    const double way = steps * m_step;
    const double reached = rounded(start + way, std::max(std::abs(start), std::abs(way)));
    set(reached);
    if (m_value == reached) {
        m_start = start;
        m_steps = steps;
    }
}

void NumberEntry::setRange(double minimum, double maximum, double step)
{
    m_minimum = minimum;
    m_maximum = maximum;
    m_step = step;
    set(m_value);
}

void NumberEntry::type(const std::string& text)
{
    double number = 0.0;
    const char* const end = text.data() + text.size();
    const auto [stop, failure] = std::from_chars(text.data(), end, number);
    if (failure == std::errc::result_out_of_range)
        set(extremeOf(text));
    else
        set(failure == std::errc() && stop == end && std::isfinite(number) ? number : 0.0);
}

std::string NumberEntry::number() const
{
    Digits digits{};
    const auto [end, failure] =
        std::to_chars(digits.data(), digits.data() + digits.size(), m_value, std::chars_format::fixed);
    return failure == std::errc() ? std::string(digits.data(), end) : std::string();
}

} // namespace cadrel::gui
