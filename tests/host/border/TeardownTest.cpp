// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/border/Teardown.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>

namespace cadrel::host::tests {

TEST(Teardown, TakesTheLastBackFirst)
{
    std::string taken;
    {
        Teardown teardown;
        teardown.add([&] { taken += "first "; });
        teardown.add([&] { taken += "second "; });
        EXPECT_EQ(taken, "");
    }
    EXPECT_EQ(taken, "second first ");
}

TEST(Teardown, TakesEverythingBackOnce)
{
    int taken = 0;
    {
        Teardown teardown;
        teardown.add([&] { ++taken; });
        teardown.run();
        EXPECT_EQ(taken, 1);
        teardown.run();
    }
    EXPECT_EQ(taken, 1);
}

TEST(Teardown, GoesOverWithWhatItTakesBack)
{
    int taken = 0;
    {
        Teardown first;
        first.add([&] { ++taken; });
        const Teardown second(std::move(first));
        first.run();
        EXPECT_EQ(taken, 0);
    }
    EXPECT_EQ(taken, 1);
}

} // namespace cadrel::host::tests
