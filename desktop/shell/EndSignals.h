// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <array>
#include <csignal>

namespace desktop {

/// While it lives, a signal that asks the program to end, as when the user logs out, is only remembered, so that unsaved work
/// can be written first. A second one of the same kind ends the program at once. One object at a time.
class EndSignals {
public:
    EndSignals();
    EndSignals(const EndSignals&) = delete;
    EndSignals& operator=(const EndSignals&) = delete;
    ~EndSignals();

    /// The signal that has come; 0 for none.
    static int received();
    /// Ends the program as the signal would have done, without destructors.
    [[noreturn]] static void endBy(int signal);

private:
    static constexpr std::array Signals{SIGTERM, SIGHUP, SIGINT};

    std::array<struct sigaction, Signals.size()> m_former{};
};

} // namespace desktop
