// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/console/Failure.h"

#include <cstddef>
#include <set>
#include <string>

namespace cadrel::app {

/// Standard error: messages, a line each. On a terminal there is also a progress line, which the next message replaces.
class Terminal {
public:
    Terminal();
    Terminal(const Terminal&) = delete;
    Terminal& operator=(const Terminal&) = delete;
    ~Terminal();

    /// Whether standard error is a terminal.
    bool showsProgress() const { return m_showsProgress; }
    /// How many columns of it a line may take without wrapping.
    static std::size_t lineLength();
    /// Shows what is being done, on a terminal only.
    void showProgress(const std::string& what);
    void clearProgress();

    /// A warning that has been given is not repeated.
    void warn(const Failure& failure);
    void report(const Failure& failure);
    void report(const UsageError& error);

    /// Whether standard output is a terminal whose user hasn't asked for plain text.
    static bool wantsColour();

private:
    void writeLine(const std::string& text);

    bool m_showsProgress;
    bool m_progressShown = false;
    std::set<std::string> m_warnings;
};

} // namespace cadrel::app
