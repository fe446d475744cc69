// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <utility>

namespace cadrel::core {

/// When a change of an option is told to the listeners of its settings.
enum class Notifies { Always, OnChange, Never };

/// One option of the settings, which is read like a getter: `settings.matchBy()`. The settings alone change it.
template <typename T>
class Option {
public:
    explicit Option(T usual, Notifies notifies = Notifies::Always)
        : m_value(usual), m_usual(std::move(usual)), m_notifies(notifies)
    {
    }

    const T& operator()() const { return m_value; }
    /// The value in new settings.
    const T& usual() const { return m_usual; }
    bool isUsual() const { return m_value == m_usual; }

private:
    friend class Settings;

    /// Returns whether this is to be told.
    bool store(const T& value)
    {
        const bool tells = m_notifies == Notifies::Always || (m_notifies == Notifies::OnChange && !(value == m_value));
        m_value = value;
        return tells;
    }

    T m_value;
    T m_usual;
    Notifies m_notifies;
};

} // namespace cadrel::core
