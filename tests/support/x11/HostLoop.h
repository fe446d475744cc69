// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <functional>

namespace cadrel::tests {

/// The loop of a host, of which a test makes as many turns as it needs. The test says what one does.
class HostLoop {
protected:
    ~HostLoop() = default;

    /// What comes in each turn: the windows of the host are served, and what it carries has its idle time.
    virtual void work() = 0;

    /// As far apart as a host's are.
    void turn(int times = 1);
    /// Until the condition holds; false when it doesn't within ten seconds.
    bool turnUntil(const std::function<bool()>& condition);
};

} // namespace cadrel::tests
