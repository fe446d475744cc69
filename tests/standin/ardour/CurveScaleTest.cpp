// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/CurveScale.h"

#include "standin/project/FileFault.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cmath>
#include <limits>

namespace standin::tests {

namespace {

TEST(CurveScale, PutsTheGainOfOneWhereAFaderHasIt)
{
    const CurveScale scale("Exponential", {1.0});
    EXPECT_NEAR(scale.toShare(1.0), std::pow(192.0 / 198.0, 8.0), 1e-15);
    EXPECT_NEAR(scale.toShare(2.0), 1.0, 1e-15);
    EXPECT_NEAR(scale.toShare(0.5), std::pow(186.0 / 198.0, 8.0), 1e-15);
    EXPECT_EQ(scale.toShare(0.0), 0.0);
}

TEST(CurveScale, GivesTheGainOfAShare)
{
    const CurveScale scale("Exponential", {1.0});
    EXPECT_NEAR(scale.toValue(1.0), 2.0, 1e-12);
    EXPECT_EQ(scale.toValue(0.0), 0.0);
    EXPECT_NEAR(scale.toValue(std::pow(186.0 / 198.0, 8.0)), 0.5, 1e-12);
}

TEST(CurveScale, HasRoomForAGainAboveTheFadersEnd)
{
    const CurveScale scale("Exponential", {1.0, 4.0});
    EXPECT_NEAR(scale.toShare(4.0), 1.0, 1e-15);
    EXPECT_LT(scale.toShare(2.0), 1.0);
    EXPECT_EQ(scale.toValue(scale.toShare(4.0)), 4.0);
}

TEST(CurveScale, IsStraightBetweenLeastAndLargestOfALinearList)
{
    const CurveScale scale("Linear", {-20.0, 60.0, 0.0});
    EXPECT_EQ(scale.toShare(-20.0), 0.0);
    EXPECT_EQ(scale.toShare(60.0), 1.0);
    EXPECT_EQ(scale.toShare(20.0), 0.5);
    EXPECT_EQ(scale.toValue(0.5), 20.0);
}

TEST(CurveScale, IsGeometricOnALogarithmicList)
{
    const CurveScale scale("Logarithmic", {20.0, 2000.0});
    EXPECT_NEAR(scale.toShare(200.0), 0.5, 1e-15);
    EXPECT_NEAR(scale.toValue(0.5), 200.0, 1e-9);
}

TEST(CurveScale, NeverGivesZeroOnALogarithmicList)
{
    const CurveScale scale("Logarithmic", {0.0, 20.0, 2000.0});
    EXPECT_EQ(scale.toShare(0.0), 0.0);
    EXPECT_GT(scale.toValue(0.0), -1.0);
    EXPECT_GT(scale.toValue(1e-12), 0.0);
    EXPECT_GT(CurveScale("Logarithmic", {0.0}).toValue(0.5), 0.0);
}

TEST(CurveScale, HoldsOnADiscreteListAlone)
{
    EXPECT_TRUE(CurveScale("Discrete", {0.0, 1.0}).holds());
    EXPECT_FALSE(CurveScale("Linear", {0.0, 1.0}).holds());
    EXPECT_FALSE(CurveScale("Curved", {0.0, 1.0}).holds());
}

TEST(CurveScale, FindsAHeldValueThatCameBackAsThirtyTwoBits)
{
    const CurveScale scale("Discrete", {0.0, 1.0, 3.0});
    EXPECT_EQ(scale.toValue(static_cast<float>(1.0 / 3.0)), 1.0);
}

TEST(CurveScale, HasAPlaceForAListOfOneValue)
{
    const CurveScale scale("Linear", {7.0, 7.0});
    EXPECT_EQ(scale.toValue(scale.toShare(7.0)), 7.0);
    EXPECT_GE(scale.toShare(7.0), 0.0);
}

TEST(CurveScale, RefusesWhatIsNoValue)
{
    EXPECT_THROW(CurveScale("Linear", {std::numeric_limits<double>::infinity()}), FileFault);
    EXPECT_THROW(CurveScale("Linear", {std::numeric_limits<double>::quiet_NaN()}), FileFault);
    EXPECT_THROW(CurveScale("Exponential", {-0.1}), FileFault);
}

RC_GTEST_PROP(CurveScaleLaw, GivesEachOfTheListsValuesBackExactly, ())
{
    const std::string style = *rc::gen::element<std::string>("Exponential", "Linear", "Discrete");
    const auto numbers = *rc::gen::nonEmpty(rc::gen::container<std::vector<int>>(rc::gen::inRange(1, 2000)));
    std::vector<double> values;
    for (const int number : numbers)
        values.push_back(number / 1000.0);
    const CurveScale scale(style, values);
    for (const double value : values) {
        RC_ASSERT(scale.toShare(value) >= 0.0 && scale.toShare(value) <= 1.0);
        RC_ASSERT(scale.toValue(scale.toShare(value)) == value);
    }
}

} // namespace

} // namespace standin::tests
