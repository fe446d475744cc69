// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/PictureShape.h"

#include <gtest/gtest.h>

namespace standin::tests {

TEST(FittedSize, FillsTheWidthOrTheHeight)
{
    EXPECT_EQ(fittedSize({1920, 1080}, {1, 1}, {}, {320, 320}), (PictureSize{320, 180}));
    EXPECT_EQ(fittedSize({1920, 1080}, {1, 1}, {}, {1000, 90}), (PictureSize{160, 90}));
    EXPECT_EQ(fittedSize({160, 90}, {1, 1}, {}, {1920, 1080}), (PictureSize{1920, 1080}));
}

TEST(FittedSize, HeedsTheShapeOfThePixels)
{
    // 720 by 576 with pixels of 16:15 is 4:3, with pixels of 64:45 it is 16:9.
    EXPECT_EQ(fittedSize({720, 576}, {16, 15}, {}, {400, 400}), (PictureSize{400, 300}));
    EXPECT_EQ(fittedSize({720, 576}, {64, 45}, {}, {320, 320}), (PictureSize{320, 180}));
}

TEST(FittedSize, ATurnedPictureStandsUpright)
{
    EXPECT_EQ(fittedSize({1920, 1080}, {1, 1}, {1, false}, {320, 320}), (PictureSize{180, 320}));
    EXPECT_EQ(fittedSize({1920, 1080}, {1, 1}, {2, false}, {320, 320}), (PictureSize{320, 180}));
    EXPECT_EQ(fittedSize({720, 576}, {64, 45}, {3, false}, {320, 320}), (PictureSize{180, 320}));
}

TEST(FittedSize, NoSideIsBelowOne)
{
    EXPECT_EQ(fittedSize({8192, 1}, {1, 1}, {}, {100, 100}), (PictureSize{100, 1}));
    EXPECT_EQ(fittedSize({16, 16}, {1, 2'000'000'000}, {}, {100, 100}), (PictureSize{1, 100}));
    EXPECT_EQ(fittedSize({1920, 1080}, {1, 1}, {}, {1, 1}), (PictureSize{1, 1}));
}

TEST(OrientationOf, FindsTheQuarterTurn)
{
    EXPECT_EQ(orientationOf(1, 0, 0, 1), (Orientation{0, false}));
    EXPECT_EQ(orientationOf(0, 1, -1, 0), (Orientation{1, false}));
    EXPECT_EQ(orientationOf(-1, 0, 0, -1), (Orientation{2, false}));
    EXPECT_EQ(orientationOf(0, -1, 1, 0), (Orientation{3, false}));
}

TEST(OrientationOf, FindsTheMirror)
{
    // Left to right; and upside down, which is the same and half a turn.
    EXPECT_EQ(orientationOf(-1, 0, 0, 1), (Orientation{0, true}));
    EXPECT_EQ(orientationOf(1, 0, 0, -1), (Orientation{2, true}));
}

TEST(OrientationOf, TakesTheNearestQuarterTurn)
{
    EXPECT_EQ(orientationOf(0.9, 0.1, -0.1, 0.9), (Orientation{0, false}));
    EXPECT_EQ(orientationOf(0.1, 0.9, -0.9, 0.1), (Orientation{1, false}));
    EXPECT_EQ(orientationOf(0, 0, 0, 0), (Orientation{0, false}));
}

} // namespace standin::tests
