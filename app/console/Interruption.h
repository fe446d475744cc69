// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <csignal>

namespace cadrel::app {

/// While it lives, Ctrl-C and a request to end wait until the files being written are whole or gone: what is written
/// piece by piece asks `check` between the pieces, and the end of this object lets the program end by the signal.
class Interruption {
public:
    /// Thrown by `check`.
    struct Requested {};

    Interruption();
    Interruption(const Interruption&) = delete;
    Interruption& operator=(const Interruption&) = delete;
    ~Interruption();

    /// Nonzero from when the user wants to end.
    static const volatile std::sig_atomic_t* request();
    /// Throws Requested when the user wants to end.
    static void check();

private:
    struct sigaction m_formerInterrupt {};
    struct sigaction m_formerTerminate {};
    struct sigaction m_formerHangUp {};
};

} // namespace cadrel::app
