// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <csignal>

namespace cadrel::app {

/// While it lives, Ctrl-C or a request to end doesn't stop the program until the files being written are whole or gone.
/// Code that writes in pieces calls `check` between them. When this object is destroyed, the signal ends the program.
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
