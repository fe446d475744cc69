// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::gui {

/// A number within bounds, which is typed or changed by steps, and shown with a suffix.
class NumberEntry {
public:
    double value() const { return m_value; }
    /// Within the bounds; the minimum counts where it lies above the maximum, and for what is no number.
    void set(double value);
    /// Sets the value anew.
    void setRange(double minimum, double maximum, double step);
    /// In UTF-8.
    void setSuffix(const std::string& suffix) { m_suffix = suffix; }

    void stepUp() { set(m_value + m_step); }
    void stepDown() { set(m_value - m_step); }
    /// Reads a number. A text that is none reads as 0.
    void type(const std::string& text);

    /// The number alone, as short as it can be said.
    std::string number() const;
    std::string numberWithSuffix() const { return number() + m_suffix; }

private:
    std::string m_suffix;
    double m_value = 0.0;
    double m_step = 1.0;
    double m_minimum = 0.0;
    double m_maximum = 100.0;
};

} // namespace cadrel::gui
