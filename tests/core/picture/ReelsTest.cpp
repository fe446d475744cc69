// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/picture/Reels.h"

#include "tests/core/picture/Film.h"

#include <gtest/gtest.h>

namespace cadrel::tests {

using core::Framerate;
using core::Reels;

using Lines = std::vector<std::string>;

TEST(Reels, EventsLessThan60SecondsApartAreOneReel)
{
    EXPECT_EQ(linesOf(Reels({{0, 10}, {69, 80}}, {}, FrameASecond).ofOld()), (Lines{"0..80"}));
    EXPECT_EQ(linesOf(Reels({{0, 10}, {70, 80}}, {}, FrameASecond).ofOld()), (Lines{"0..10", "70..80"}));
    EXPECT_EQ(linesOf(Reels({{0, 10}, {71, 80}}, {}, FrameASecond).ofOld()), (Lines{"0..10", "71..80"}));
}

// 60 seconds are 1438.6 frames at 23.976 frames a second.
TEST(Reels, SixtySecondsAreRealSeconds)
{
    const Framerate pulledDown(24, true, 0);

    EXPECT_EQ(Reels({{0, 10}, {1448, 1500}}, {}, pulledDown).ofOld().size(), 1U);
    EXPECT_EQ(Reels({{0, 10}, {1449, 1500}}, {}, pulledDown).ofOld().size(), 2U);
    EXPECT_EQ(Reels({{0, 10}, {1449, 1500}}, {}, Framerate(24, 0)).ofOld().size(), 1U);
    EXPECT_EQ(Reels({{0, 10}, {1450, 1500}}, {}, Framerate(24, 0)).ofOld().size(), 2U);
}

TEST(Reels, ReelsArePairedInTheirOrder)
{
    const Reels reels({{0, 10}, {100, 110}}, {{5, 25}, {200, 240}}, FrameASecond);

    ASSERT_EQ(reels.pairs().size(), 2U);
    EXPECT_EQ(reels.pairs()[0].startShift(), 5);
    EXPECT_EQ(reels.pairs()[0].endShift(), 15);
    EXPECT_EQ(reels.pairAtNew(4), nullptr);
    EXPECT_EQ(reels.pairAtNew(5), &reels.pairs()[0]);
    EXPECT_EQ(reels.pairAtNew(25), nullptr);
    EXPECT_EQ(reels.pairAtNew(239), &reels.pairs()[1]);
}

TEST(Reels, UnequalNumbersCannotBePaired)
{
    const Reels reels({{0, 10}, {100, 110}}, {{5, 25}}, FrameASecond);

    EXPECT_FALSE(reels.canBePaired());
    EXPECT_TRUE(reels.pairs().empty());
}

} // namespace cadrel::tests
