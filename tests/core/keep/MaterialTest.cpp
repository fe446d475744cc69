// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/Material.h"

#include "tests/core/picture/Film.h"
#include "tests/support/ThrownResult.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <limits>

namespace cadrel::tests {

using core::Framerate;
using core::framesOfMaterial;

using Lines = std::vector<std::string>;

TEST(Material, EveryFrameThatItReachesIntoHoldsIt)
{
    const Framerate framerate(24, 0);

    EXPECT_EQ(linesOf(framesOfMaterial({{1.0, 2.0}}, framerate)), (Lines{"24..48"}));
    EXPECT_EQ(linesOf(framesOfMaterial({{0.99, 2.01}}, framerate)), (Lines{"23..49"}));
    EXPECT_EQ(linesOf(framesOfMaterial({{1.0 - 1e-6, 2.0 + 1e-6}}, framerate)), (Lines{"24..48"}));
    EXPECT_EQ(linesOf(framesOfMaterial({{-0.01, 0.01}}, framerate)), (Lines{"-1..1"}));
}

TEST(Material, AnInstantStandsOnOneFrame)
{
    EXPECT_EQ(linesOf(framesOfMaterial({{1.0, 1.0}, {3.02, 3.02}}, Framerate(24, 0))), (Lines{"24..25", "72..73"}));
}

TEST(Material, OneByOneTheyKeepTheirOrderAndOverlap)
{
    const std::vector<core::SecondsRange> material{{5.0, 8.0}, {1.0, 6.0}, {7.0, 7.0}};

    const std::vector<core::FrameRange> expected{{5, 8}, {1, 6}, {7, 8}};
    EXPECT_EQ(core::framesOfEach(material, FrameASecond), expected);
    EXPECT_EQ(linesOf(framesOfMaterial(material, FrameASecond)), (Lines{"1..8"}));
}

TEST(Material, WhatIsNoStretchOfTimeIsRefused)
{
    const double none = std::numeric_limits<double>::quiet_NaN();

    EXPECT_EQ(thrownBy([] { framesOfMaterial({{2.0, 1.0}}, FrameASecond); }), util::Result::InvalidArgument);
    EXPECT_EQ(thrownBy([&] { framesOfMaterial({{none, 1.0}}, FrameASecond); }), util::Result::InvalidArgument);
    EXPECT_EQ(thrownBy([] { framesOfMaterial({{-1e300, 1e300}}, FrameASecond); }), util::Result::Ok);
}

} // namespace cadrel::tests
