// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/XConnection.h"

#include "tests/support/x11/VirtualScreen.h"

#include <gtest/gtest.h>

#include <atomic>
#include <thread>
#include <vector>

using cadrel::host::XConnection;

TEST(XConnectionThreads, AreAnsweredWhileConnectionsComeAndGo)
{
    const cadrel::tests::VirtualScreen screen;
    const XConnection kept;
    ASSERT_TRUE(kept.isOpen());
    std::atomic<bool> isDone = false;
    std::atomic<int> wrongAnswers = 0;

    std::vector<std::thread> threads;
    for (int count = 0; count < 4; ++count) {
        threads.emplace_back([&] {
            while (!isDone) {
                if (!XConnection::isOurs(kept.display()) || XConnection::isOurs(nullptr))
                    ++wrongAnswers;
            }
        });
    }
    for (int round = 0; round < 100; ++round) {
        const XConnection one;
        const XConnection another;
        ASSERT_TRUE(XConnection::isOurs(another.display()));
    }
    isDone = true;
    for (std::thread& thread : threads)
        thread.join();

    EXPECT_EQ(wrongAnswers, 0);
}
