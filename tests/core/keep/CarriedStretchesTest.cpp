// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/CarriedStretches.h"

#include "tests/core/keep/KeepFilm.h"

#include <gtest/gtest.h>

namespace cadrel::tests {

using core::CarriedFrom;
using core::CarriedStretches;

using Lines = std::vector<std::string>;

TEST(CarriedStretches, ALaterStretchGetsOnlyTheFramesThatAreFree)
{
    CarriedStretches carried;
    carried.carry({{10, 20}, 1, CarriedFrom::Cut});
    carried.carry({{30, 40}, 2, CarriedFrom::Cut});

    carried.carry({{5, 35}, 3, CarriedFrom::Hole});

    Lines lines;
    for (const core::CarriedStretch& stretch : carried.stretches())
        lines.push_back(linesOf(core::FrameRanges{stretch.destination}).front() + " " + std::to_string(stretch.shift));
    EXPECT_EQ(lines, (Lines{"5..10 3", "10..20 1", "20..30 3", "30..40 2"}));
    EXPECT_EQ(linesOf(carried.freeIn({0, 50})), (Lines{"0..5", "40..50"}));
}

TEST(CarriedStretches, TheNearestShiftIsLookedForWithinTheBounds)
{
    CarriedStretches carried;
    carried.carry({{10, 20}, 1, CarriedFrom::Cut});
    carried.carry({{30, 40}, 2, CarriedFrom::Cut});

    EXPECT_EQ(carried.shiftBefore(20, {0, 50}), 1);
    EXPECT_EQ(carried.shiftBefore(30, {19, 50}), 1);
    EXPECT_EQ(carried.shiftBefore(30, {20, 50}), std::nullopt);
    EXPECT_EQ(carried.shiftBefore(10, {0, 50}), std::nullopt);
    EXPECT_EQ(carried.shiftAfter(30, {0, 50}), 2);
    EXPECT_EQ(carried.shiftAfter(25, {0, 31}), 2);
    EXPECT_EQ(carried.shiftAfter(25, {0, 30}), std::nullopt);
    EXPECT_EQ(carried.shiftAfter(40, {0, 50}), std::nullopt);
}

} // namespace cadrel::tests
