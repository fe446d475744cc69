// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/time/Framerate.h"

#include "tests/support/ThrownResult.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <string_view>

namespace cadrel::tests {
namespace {

using core::Framerate;
using util::Result;

TEST(Framerate, ADefaultValueIsUnknown)
{
    const Framerate framerate;

    EXPECT_EQ(framerate.framesPerSecond, 0);
    EXPECT_EQ(framerate.dropFrame, -1);
    EXPECT_FALSE(framerate.pulledDown);
    EXPECT_TRUE(framerate.isUnknown());
}

TEST(Framerate, IsUnknownWithoutARateOrWithoutADropFrameState)
{
    EXPECT_FALSE(Framerate(25, 0).isUnknown());
    EXPECT_FALSE(Framerate(30, 1).isUnknown());
    EXPECT_TRUE(Framerate(25, -1).isUnknown());
    EXPECT_TRUE(Framerate(30, -1).isUnknown());
    EXPECT_TRUE(Framerate(0, 0).isUnknown());
    EXPECT_TRUE(Framerate(0, 1).isUnknown());
}

TEST(Framerate, OfTwoNumbersRunsAtTheWholeRate)
{
    const Framerate framerate(30, 1);

    EXPECT_EQ(framerate.framesPerSecond, 30);
    EXPECT_EQ(framerate.rate, 30.0);
    EXPECT_EQ(framerate.dropFrame, 1);
    EXPECT_FALSE(framerate.pulledDown);
}

TEST(Framerate, PulledDownRunsAThousandAndFirstPartSlower)
{
    EXPECT_DOUBLE_EQ(Framerate::pullDownFactor(), 1000.0 / 1001.0);

    const Framerate framerate(24, true, 0);

    EXPECT_EQ(framerate.framesPerSecond, 24);
    EXPECT_TRUE(framerate.pulledDown);
    EXPECT_DOUBLE_EQ(framerate.rate, 24 * 0.999000999000999);
    EXPECT_EQ(Framerate(24, false, 0).rate, 24.0);
    EXPECT_FALSE(Framerate(24, false, 0).pulledDown);
}

TEST(Framerate, KnowsTheLastFrameOfTheDay)
{
    EXPECT_EQ(Framerate(24, 0).lastFrame, 2073599);
    EXPECT_EQ(Framerate(25, 0).lastFrame, 2159999);
    EXPECT_EQ(Framerate(30, 0).lastFrame, 2591999);
    EXPECT_EQ(Framerate(30, 1).lastFrame, 2589407);
    EXPECT_EQ(Framerate(60, 0).lastFrame, 5183999);
    EXPECT_EQ(Framerate(30, true, 1).lastFrame, 2589407);
    EXPECT_EQ(Framerate(60, true, 0).lastFrame, 5183999);
}

TEST(Framerate, HasNoLastFrameWhereItsRateIsUnknown)
{
    EXPECT_EQ(Framerate(0, 0).lastFrame, 0);
    EXPECT_EQ(Framerate(0, -1).lastFrame, 0);
    EXPECT_EQ(Framerate(25, -1).lastFrame, 0);
    EXPECT_EQ(Framerate(30, -1).lastFrame, 0);
    EXPECT_EQ(Framerate(0, true, 0).lastFrame, 0);
    EXPECT_EQ(Framerate(0, true, -1).lastFrame, 0);
}

TEST(Framerate, OfThreeArgumentsCountsTheDayAlsoInAnUnknownDropFrameState)
{
    EXPECT_EQ(Framerate(30, false, -1).lastFrame, 2589407);
    EXPECT_EQ(thrownBy([] { Framerate framerate(25, false, -1); }), Result::NotSupported);
}

TEST(Framerate, DropFrameExistsAtThirtyNominalFramesOnly)
{
    EXPECT_EQ(thrownBy([] { Framerate framerate(24, 1); }), Result::NotSupported);
    EXPECT_EQ(thrownBy([] { Framerate framerate(25, 1); }), Result::NotSupported);
    EXPECT_EQ(thrownBy([] { Framerate framerate(60, true, 1); }), Result::NotSupported);
    EXPECT_EQ(thrownBy([] { Framerate framerate(30, true, 1); }), Result::Ok);
}

TEST(Framerate, ADayOfMoreFramesThanCanBeCountedOrOfLessThanNoneFails)
{
    constexpr std::int32_t Highest = std::numeric_limits<std::int32_t>::max();
    constexpr std::int32_t Lowest = std::numeric_limits<std::int32_t>::min();

    // 86400 seconds of 24855 frames are 2147472000 frames, of one frame more 2147558400; 2147483647 can be counted.
    EXPECT_EQ(Framerate(24855, 0).lastFrame, 2147471999);
    for (const std::int32_t rate : {24856, Highest, -1, Lowest}) {
        EXPECT_EQ(thrownBy([=] { Framerate framerate(rate, 0); }), Result::OutOfRange) << rate;
        EXPECT_EQ(thrownBy([=] { Framerate framerate(rate, true, 0); }), Result::OutOfRange) << rate;
    }
}

TEST(Framerate, UpdatesTheLastFrameForChangedFields)
{
    Framerate framerate(24, 0);
    framerate.framesPerSecond = 25;

    framerate.updateLastFrame();
    EXPECT_EQ(framerate.lastFrame, 2159999);

    framerate.framesPerSecond = 0;
    framerate.updateLastFrame();
    EXPECT_EQ(framerate.lastFrame, 0);
}

TEST(Framerate, EveryLabelOfTheTableGivesItsRow)
{
    struct Row {
        std::string_view label;
        std::int32_t framesPerSecond;
        bool pulledDown;
        std::int32_t dropFrame;
        double rate;
        std::int32_t lastFrame;
    };
    const Row rows[] = {
        {"23.98 fps", 24, true, 0, 24000.0 / 1001, 2073599},
        {"24 fps", 24, false, 0, 24.0, 2073599},
        {"24.98 fps", 25, true, 0, 25000.0 / 1001, 2159999},
        {"25 fps", 25, false, 0, 25.0, 2159999},
        {"29.97 fps", 30, true, 0, 30000.0 / 1001, 2591999},
        {"29.97 dfps", 30, true, 1, 30000.0 / 1001, 2589407},
        {"30 fps", 30, false, 0, 30.0, 2591999},
        {"30 dfps", 30, false, 1, 30.0, 2589407},
        {"59.94 fps", 60, true, 0, 60000.0 / 1001, 5183999},
        {"60 fps", 60, false, 0, 60.0, 5183999},
    };
    for (const Row& row : rows) {
        const Framerate framerate = Framerate::fromLabel(row.label);
        EXPECT_EQ(framerate.framesPerSecond, row.framesPerSecond) << row.label;
        EXPECT_EQ(framerate.pulledDown, row.pulledDown) << row.label;
        EXPECT_EQ(framerate.dropFrame, row.dropFrame) << row.label;
        EXPECT_DOUBLE_EQ(framerate.rate, row.rate) << row.label;
        EXPECT_EQ(framerate.lastFrame, row.lastFrame) << row.label;
        EXPECT_FALSE(framerate.isUnknown()) << row.label;
    }
}

TEST(Framerate, AnyOtherLabelIsUnknownThroughItsRateAlone)
{
    using namespace std::string_view_literals;
    for (const std::string_view label : {""sv, "24"sv, "24 fps "sv, " 24 fps"sv, "24 FPS"sv, "24fps"sv, "23.976 fps"sv,
                                         "59.94 dfps"sv, "60 dfps"sv, "25 fps\0"sv}) {
        const Framerate framerate = Framerate::fromLabel(label);
        EXPECT_EQ(framerate.framesPerSecond, 0) << label;
        EXPECT_FALSE(framerate.pulledDown) << label;
        EXPECT_EQ(framerate.dropFrame, 0) << label;
        EXPECT_EQ(framerate.rate, 0.0) << label;
        EXPECT_EQ(framerate.lastFrame, 0) << label;
        EXPECT_TRUE(framerate.isUnknown()) << label;
    }
}

} // namespace
} // namespace cadrel::tests
