// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <chrono>
#include <functional>

namespace desktop {

/// The program's message loop. It serves all that JUCE listens to, and calls the host's idle work about every 15 ms. A box that
/// waits for the user runs it again from within; then the host isn't idle, and only what has to go on goes on. Main thread only.
class EventLoop {
public:
    /// `isWaiting` says that something that hasn't returned yet, such as a box, lets the loop turn.
    using Idle = std::function<void(bool isWaiting)>;

    void setIdle(Idle idle) { m_idle = std::move(idle); }

    /// Waits for something to do, but no longer than until the next idle work, and does it.
    void turn();
    /// Does what there is to do now.
    void turnWithoutWaiting();
    void runUntil(const std::function<bool()>& isDone);

    /// Whether a turn goes on.
    bool isTurning() const { return m_depth > 0; }

private:
    using Clock = std::chrono::steady_clock;

    void wait() const;
    void serve();

    Idle m_idle;
    Clock::time_point m_nextIdle = Clock::now();
    int m_depth = 0;
};

} // namespace desktop
