// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/EndSignals.h"

#include <cstddef>
#include <unistd.h>

namespace desktop {

namespace {

volatile std::sig_atomic_t lastReceived = 0;

extern "C" void rememberEndSignal(int signal)
{
    lastReceived = signal;
}

} // namespace

EndSignals::EndSignals()
{
    lastReceived = 0;
    for (std::size_t index = 0; index < Signals.size(); ++index) {
        struct sigaction action {};
        action.sa_handler = rememberEndSignal;
        // The next one finds the system's own way to end a program.
        action.sa_flags = static_cast<int>(SA_RESETHAND);
        sigemptyset(&action.sa_mask);
        sigaction(Signals[index], &action, &m_former[index]);
        // If the program was started with the signal ignored, as nohup does, it keeps ignoring it.
        if (m_former[index].sa_handler == SIG_IGN)
            sigaction(Signals[index], &m_former[index], nullptr);
    }
}

EndSignals::~EndSignals()
{
    for (std::size_t index = 0; index < Signals.size(); ++index)
        sigaction(Signals[index], &m_former[index], nullptr);
}

int EndSignals::received()
{
    return lastReceived;
}

void EndSignals::endBy(int signal)
{
    std::signal(signal, SIG_DFL);
    std::raise(signal);
    // Where that doesn't end it, as in a debugger.
    ::_exit(128 + signal);
}

} // namespace desktop
