// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/x11/HostLoop.h"

#include <chrono>
#include <thread>

namespace cadrel::tests {

void HostLoop::turn(int times)
{
    for (int count = 0; count < times; ++count) {
        work();
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
}

bool HostLoop::turnUntil(const std::function<bool()>& condition)
{
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(60);
    while (!condition()) {
        if (std::chrono::steady_clock::now() > end)
            return false;
        turn();
    }
    return true;
}

} // namespace cadrel::tests
