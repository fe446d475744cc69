// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/picture/FrameRange.h"

#include "tests/core/picture/Film.h"

#include <gtest/gtest.h>

namespace cadrel::tests {

using core::FrameRanges;
using core::joinedWithin;
using core::united;
using core::within;
using core::without;

using Lines = std::vector<std::string>;

TEST(FrameRange, RangesCloserThanTheDistanceAreJoinedInAnyOrder)
{
    EXPECT_EQ(linesOf(joinedWithin(3, {{20, 25}, {0, 10}, {12, 17}, {5, 5}})), (Lines{"0..17", "20..25"}));
}

TEST(FrameRange, RangesThatTouchOrOverlapAreUnited)
{
    EXPECT_EQ(linesOf(united({{0, 10}, {10, 12}, {11, 20}, {21, 22}, {2, 3}})), (Lines{"0..20", "21..22"}));
}

TEST(FrameRange, WhatIsTakenOutLeavesThePiecesAroundIt)
{
    const FrameRanges ranges{{0, 10}, {20, 30}, {40, 50}};

    EXPECT_EQ(linesOf(without(ranges, {{3, 5}, {8, 22}, {29, 30}, {40, 50}})), (Lines{"0..3", "5..8", "22..29"}));
    EXPECT_EQ(without(ranges, {}), ranges);
}

TEST(FrameRange, WhatLiesWithinBoundsIsCutAtThem)
{
    const FrameRanges ranges{{0, 10}, {20, 30}, {40, 50}};

    EXPECT_EQ(linesOf(within({5, 41}, ranges)), (Lines{"5..10", "20..30", "40..41"}));
    EXPECT_EQ(linesOf(within({10, 20}, ranges)), Lines());
}

TEST(FrameRange, TheLengthOfRangesIsWithoutTheGapsBetweenThem)
{
    EXPECT_EQ(lengthOf(FrameRanges{{0, 10}, {20, 30}, {40, 41}}), 21);
    EXPECT_EQ(lengthOf(FrameRanges()), 0);
}

} // namespace cadrel::tests
