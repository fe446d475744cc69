// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/CurveColumns.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>

using desktop::CurveColumn;
using desktop::curveColumns;
using desktop::CurvePoints;
using desktop::TimeScale;
using desktop::valueOf;

namespace {

TimeScale secondForPixel(double left = 0.0)
{
    TimeScale scale;
    scale.zoomBy(scale.secondsPerPixel(), 0.0);
    scale.setLeft(left);
    return scale;
}

} // namespace

TEST(CurveColumns, AreNoneWithoutPointsAndWithoutWidth)
{
    EXPECT_TRUE(curveColumns({}, secondForPixel(), 10).empty());
    EXPECT_TRUE(curveColumns({1, {0.0}, {0.5F}}, secondForPixel(), 0).empty());
}

TEST(CurveColumns, KeepTheValueBeforeTheFirstAndAfterTheLastPoint)
{
    const auto columns = curveColumns({1, {5.0}, {0.25F}}, secondForPixel(), 10);
    ASSERT_EQ(columns.size(), 10U);
    for (const CurveColumn& column : columns) {
        EXPECT_EQ(column.low, 0.25F);
        EXPECT_EQ(column.high, 0.25F);
    }
}

TEST(CurveColumns, GoThroughAllOfAStepWithinItsColumn)
{
    const auto columns = curveColumns({1, {5.5, 5.5}, {0.0F, 1.0F}}, secondForPixel(), 10);
    EXPECT_EQ(columns[4].high, 0.0F);
    EXPECT_EQ(columns[5].low, 0.0F);
    EXPECT_EQ(columns[5].high, 1.0F);
    EXPECT_EQ(columns[6].low, 1.0F);
}

TEST(CurveColumns, RunAlongASlope)
{
    const CurvePoints curve{1, {0.0, 10.0}, {0.0F, 1.0F}};
    const auto columns = curveColumns(curve, secondForPixel(), 10);
    EXPECT_NEAR(columns[3].low, 0.3F, 1e-6F);
    EXPECT_NEAR(columns[3].high, 0.4F, 1e-6F);
    EXPECT_NEAR(valueOf(curve, 2.5), 0.25F, 1e-6F);
}

TEST(CurveColumns, ShowAPeakAmongAHundredThousandPoints)
{
    CurvePoints curve{1, {}, {}};
    for (int at = 0; at < 100000; ++at) {
        curve.times.push_back(at * 1e-3);
        curve.values.push_back(at == 50500 ? 1.0F : 0.5F);
    }
    const auto columns = curveColumns(curve, secondForPixel(), 100);
    for (std::size_t column = 0; column < columns.size(); ++column) {
        EXPECT_EQ(columns[column].high, column == 50 ? 1.0F : 0.5F);
        EXPECT_EQ(columns[column].low, 0.5F);
    }
}

RC_GTEST_PROP(CurveColumns, HoldTheCurveAtEachTimeAndGoNoFurtherThanItsPoints, ())
{
    CurvePoints curve{1, {}, {}};
    double time = -5.0;
    for (const int step : *rc::gen::nonEmpty(rc::gen::container<std::vector<int>>(rc::gen::inRange(0, 20)))) {
        time += step / 4.0;
        curve.times.push_back(time);
        curve.values.push_back(static_cast<float>(*rc::gen::inRange(0, 101)) / 100.0F);
    }
    constexpr int Width = 40;
    const TimeScale scale = secondForPixel(*rc::gen::inRange(-10, 20) / 3.0);
    const auto columns = curveColumns(curve, scale, Width);
    const auto [least, most] = std::minmax_element(curve.values.begin(), curve.values.end());
    for (int column = 0; column < Width; ++column) {
        const CurveColumn& seen = columns[static_cast<std::size_t>(column)];
        RC_ASSERT(seen.low >= *least - 1e-5F && seen.high <= *most + 1e-5F);
        for (const double share : {0.0, 0.3, 0.7, 1.0}) {
            const float value = valueOf(curve, scale.secondsAt(column + share));
            RC_ASSERT(value >= seen.low - 1e-5F && value <= seen.high + 1e-5F);
        }
        // Nothing is seen that isn't in reach of the column.
        if (column > 0)
            RC_ASSERT(seen.low <= columns[static_cast<std::size_t>(column - 1)].high + 1e-5F);
    }
}
