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

    /// Several steps in a row are added as one, so that nothing is lost by rounding: three steps of 0.1 lead to 0.3, three of a
    /// third to 1, with 15 digits.
    void stepUp() { step(1.0); }
    void stepDown() { step(-1.0); }
    /// Reads a number. A text that is none reads as 0.
    void type(const std::string& text);

    /// The number alone, as short as it can be said.
    std::string number() const;
    std::string numberWithSuffix() const { return number() + m_suffix; }

private:
    void step(double count);

    std::string m_suffix;
    double m_value = 0.0;
    double m_start = 0.0; ///< where the steps began
    double m_steps = 0.0; ///< how many there were
    double m_step = 1.0;
    double m_minimum = 0.0;
    double m_maximum = 100.0;
};

} // namespace cadrel::gui
