// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/TimeScale.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cmath>
#include <limits>

using desktop::TimeScale;

TEST(TimeScale, FitsAStretchWithAHundredthOfTheWidthOnEitherSide)
{
    TimeScale scale;
    scale.fit(100.0, 198.0, 1000.0);
    EXPECT_NEAR(scale.secondsPerPixel(), 0.1, 1e-12);
    EXPECT_NEAR(scale.pixelAt(100.0), 10.0, 1e-9);
    EXPECT_NEAR(scale.pixelAt(198.0), 990.0, 1e-9);
}

TEST(TimeScale, FitsAStretchWithoutLengthAsOneSecond)
{
    TimeScale scale;
    scale.fit(5.0, 5.0, 100.0);
    EXPECT_NEAR(scale.pixelAt(6.0) - scale.pixelAt(5.0), 98.0, 1e-9);
}

TEST(TimeScale, FitsIntoNoWidth)
{
    TimeScale scale;
    scale.fit(0.0, 10.0, 0.0);
    EXPECT_TRUE(std::isfinite(scale.left()));
    EXPECT_GT(scale.secondsPerPixel(), 0.0);
}

TEST(TimeScale, KeepsItsPlaceForAFactorThatIsNone)
{
    TimeScale scale;
    scale.fit(0.0, 10.0, 100.0);
    const TimeScale before = scale;
    for (const double factor : {0.0, -1.0, std::numeric_limits<double>::quiet_NaN()})
        scale.zoomBy(factor, 50.0);
    scale.setLeft(std::numeric_limits<double>::quiet_NaN());
    EXPECT_EQ(scale, before);
}

TEST(TimeScale, ComesNoCloserThanTheFinestAndGoesNoFurtherThanTheCoarsest)
{
    TimeScale scale;
    scale.zoomBy(1e30, 0.0);
    EXPECT_EQ(scale.secondsPerPixel(), TimeScale::Finest);
    scale.zoomBy(1e-30, 0.0);
    EXPECT_EQ(scale.secondsPerPixel(), TimeScale::Coarsest);
    scale.setLeft(std::numeric_limits<double>::infinity());
    EXPECT_EQ(scale.left(), 1e9);
    scale.setLeft(-1e10);
    EXPECT_EQ(scale.left(), -1e9);
}

TEST(TimeScale, TellsTwoSamplesApartADayAfterTheProgramme)
{
    TimeScale scale;
    scale.zoomBy(1e30, 0.0);
    const double place = 2.0 * 86400.0;
    scale.setLeft(place);
    // Of 48000 a second, at a hundred-thousandth of a second for a pixel.
    EXPECT_NEAR(scale.pixelAt(place + 1.0 / 48000.0), 100000.0 / 48000.0, 1e-4);
}

RC_GTEST_PROP(TimeScale, GivesEachPixelTheTimeThatStandsAtIt, ())
{
    TimeScale scale;
    const double left = *rc::gen::inRange(-1000000, 3 * 86400 * 1000) / 1000.0;
    scale.zoomBy(std::pow(2.0, *rc::gen::inRange(-13, 13)), 0.0);
    scale.setLeft(left);
    const double pixel = *rc::gen::inRange(-100, 5000) / 4.0;
    // A time of days is held to about 3e-11 s, which is far less than a pixel at any zoom.
    RC_ASSERT(std::abs(scale.pixelAt(scale.secondsAt(pixel)) - pixel) < 1e-4);
}

RC_GTEST_PROP(TimeScale, KeepsTheTimeAroundWhichItIsZoomed, ())
{
    TimeScale scale;
    scale.setLeft(*rc::gen::inRange(0, 90000));
    const double pixel = *rc::gen::inRange(0, 2000);
    const double time = scale.secondsAt(pixel);
    scale.zoomBy(std::pow(2.0, *rc::gen::inRange(-12, 13)), pixel);
    RC_ASSERT(std::abs(scale.pixelAt(time) - pixel) < 1e-3);
}
