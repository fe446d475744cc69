// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Interruption.h"

namespace cadrel::app {

namespace {

volatile std::sig_atomic_t requested = 0;

extern "C" void rememberRequest(int signal)
{
    requested = signal;
}

void waitFor(int signal, struct sigaction& former)
{
    // The signal ends a system call that waits, such as for the reader of a pipe.
    struct sigaction action {};
    action.sa_handler = rememberRequest;
    sigemptyset(&action.sa_mask);
    sigaction(signal, &action, &former);
    // If the program was started with the signal ignored, as nohup does, it keeps ignoring it.
    if (former.sa_handler == SIG_IGN)
        sigaction(signal, &former, nullptr);
}

} // namespace

Interruption::Interruption()
{
    requested = 0;
    waitFor(SIGINT, m_formerInterrupt);
    waitFor(SIGTERM, m_formerTerminate);
    waitFor(SIGHUP, m_formerHangUp);
}

Interruption::~Interruption()
{
    sigaction(SIGINT, &m_formerInterrupt, nullptr);
    sigaction(SIGTERM, &m_formerTerminate, nullptr);
    sigaction(SIGHUP, &m_formerHangUp, nullptr);
    if (requested != 0)
        std::raise(requested);
}

const volatile std::sig_atomic_t* Interruption::request()
{
    return &requested;
}

void Interruption::check()
{
    if (requested != 0)
        throw Requested{};
}

} // namespace cadrel::app
