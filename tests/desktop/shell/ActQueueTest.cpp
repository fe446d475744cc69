// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/ActQueue.h"

#include "util/Result.h"

#include <gtest/gtest.h>

#include <new>
#include <stdexcept>
#include <string>
#include <vector>

namespace desktop::tests {

namespace {

using Texts = std::vector<std::string>;

class ActQueueTest : public testing::Test {
protected:
    void run()
    {
        queue.run([this](const std::string& fault) { told.push_back(fault); });
    }

    ActQueue queue;
    Texts told;
    Texts done;
};

} // namespace

TEST_F(ActQueueTest, DoesEachActOnceInItsOrder)
{
    queue.add([&] { done.emplace_back("a"); });
    queue.add([&] { done.emplace_back("b"); });
    run();
    run();
    EXPECT_EQ(done, (Texts{"a", "b"}));
    EXPECT_EQ(told, Texts());
}

TEST_F(ActQueueTest, LeavesWhatComesMeanwhileForTheNextTime)
{
    queue.add([&] { queue.add([&] { done.emplace_back("later"); }); });
    run();
    EXPECT_EQ(done, Texts());
    run();
    EXPECT_EQ(done, Texts{"later"});
}

TEST_F(ActQueueTest, TellsWhatAnActHasThrownAndDoesTheNext)
{
    queue.add([] { throw std::runtime_error("reel3.stage: is in the way"); });
    queue.add([] { throw std::bad_alloc(); });
    queue.add([] { throw cadrel::util::Result::Type(cadrel::util::Result::OutOfRange); });
    queue.add([] { throw 7.0; });
    queue.add([&] { done.emplace_back("last"); });
    run();
    EXPECT_EQ(told, (Texts{"That has failed: reel3.stage: is in the way", "There isn't enough memory for that.",
                           "That has failed: failure " + std::to_string(cadrel::util::Result::OutOfRange),
                           "That has failed, and nothing tells why."}));
    EXPECT_EQ(done, Texts{"last"});
}

} // namespace desktop::tests
