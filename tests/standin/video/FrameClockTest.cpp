// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/FrameClock.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cstdint>
#include <limits>

namespace standin::tests {

TEST(ExactRate, WholeRatesAreWhole)
{
    for (const int rate : {1, 24, 25, 30, 48, 50, 60, 120, 1000})
        EXPECT_EQ(exactRate(rate), (Ratio{rate, 1}));
}

TEST(ExactRate, PulledDownRatesAreMultiplesOf1000Over1001)
{
    EXPECT_EQ(exactRate(23.976), (Ratio{24000, 1001}));
    EXPECT_EQ(exactRate(23.98), (Ratio{24000, 1001}));
    EXPECT_EQ(exactRate(24000.0 / 1001.0), (Ratio{24000, 1001}));
    EXPECT_EQ(exactRate(29.97), (Ratio{30000, 1001}));
    EXPECT_EQ(exactRate(47.952), (Ratio{48000, 1001}));
    EXPECT_EQ(exactRate(59.94), (Ratio{60000, 1001}));
    EXPECT_EQ(exactRate(119.88), (Ratio{120000, 1001}));
}

TEST(ExactRate, OtherRatesKeepTheirMillionths)
{
    EXPECT_EQ(exactRate(12.5), (Ratio{12'500'000, 1'000'000}));
    EXPECT_EQ(exactRate(24.5), (Ratio{24'500'000, 1'000'000}));
}

TEST(FrameClock, APictureShowsAtAFrameWhenItComesBeforeTheMiddle)
{
    // 25 frames a second in milliseconds: frame 2 lasts from 80 to 120.
    const FrameClock clock({25, 1}, {1, 1000}, 0);

    EXPECT_TRUE(clock.isBeforeMiddle(99, 2));
    EXPECT_FALSE(clock.isBeforeMiddle(100, 2));
    EXPECT_FALSE(clock.isBeforeMiddle(101, 2));
    EXPECT_EQ(clock.lastTickOf(2), 99);
}

TEST(FrameClock, CountsFromTheOrigin)
{
    const FrameClock clock({25, 1}, {1, 1000}, 5000);

    EXPECT_TRUE(clock.isBeforeMiddle(5019, 0));
    EXPECT_FALSE(clock.isBeforeMiddle(5020, 0));
    EXPECT_EQ(clock.lastTickOf(0), 5019);
    EXPECT_EQ(clock.frameCount(5000), 0U);
    EXPECT_EQ(clock.frameCount(4000), 0U);
}

TEST(FrameClock, AnOriginMayBeBelowZero)
{
    const FrameClock clock({25, 1}, {1, 1000}, -80);

    EXPECT_TRUE(clock.isBeforeMiddle(19, 2));
    EXPECT_FALSE(clock.isBeforeMiddle(20, 2));
    EXPECT_EQ(clock.lastTickOf(2), 19);
    EXPECT_EQ(clock.frameCount(20), 2U);
}

TEST(FrameClock, CountsTheFramesWhoseMiddleComesBeforeTheEnd)
{
    const FrameClock clock({25, 1}, {1, 1000}, 0);

    EXPECT_EQ(clock.frameCount(20), 0U);
    EXPECT_EQ(clock.frameCount(21), 1U);
    EXPECT_EQ(clock.frameCount(40), 1U);
    EXPECT_EQ(clock.frameCount(60), 1U);
    EXPECT_EQ(clock.frameCount(61), 2U);
    EXPECT_EQ(clock.frameCount(4000), 100U);
}

TEST(FrameClock, ARoundedTimeStillBelongsToItsFrameAfterManyHours)
{
    // 23.976 in milliseconds, as some containers round it. Picture n comes at n * 1001 / 24.
    const FrameClock clock({24000, 1001}, {1, 1000}, 0);

    for (const std::int64_t n : {1LL, 2LL, 1000LL, 2'071'999LL, 2'072'000LL}) {
        const std::int64_t time = (n * 1001 + 12) / 24;
        EXPECT_TRUE(clock.isBeforeMiddle(time, static_cast<std::uint32_t>(n))) << n;
        EXPECT_FALSE(clock.isBeforeMiddle(time, static_cast<std::uint32_t>(n - 1))) << n;
    }
}

TEST(FrameClock, AFilmOfAnotherRateShowsWhatIsOnTheScreenThen)
{
    // Pictures come every 40 ms. The middle of frame 2 of a project of 30 is at 83.3 ms, that of frame 3 at 116.7.
    const FrameClock clock({30, 1}, {1, 25}, 0);

    EXPECT_TRUE(clock.isBeforeMiddle(2, 2));
    EXPECT_FALSE(clock.isBeforeMiddle(3, 2));
    EXPECT_TRUE(clock.isBeforeMiddle(2, 3));
    EXPECT_FALSE(clock.isBeforeMiddle(3, 3));
    EXPECT_EQ(clock.frameCount(100), 120U);
}

TEST(FrameClock, StandsTheGreatestNumbers)
{
    constexpr std::int64_t Most = std::numeric_limits<std::int64_t>::max();
    constexpr std::int64_t Least = std::numeric_limits<std::int64_t>::min();
    constexpr std::int64_t Part = std::numeric_limits<std::int32_t>::max();
    constexpr std::uint32_t LastFrame = std::numeric_limits<std::uint32_t>::max();
    const FrameClock coarse({Part, 1}, {Part, 1}, 0);
    const FrameClock fine({1, Part}, {1, Part}, 0);

    EXPECT_FALSE(coarse.isBeforeMiddle(Most, LastFrame));
    EXPECT_TRUE(coarse.isBeforeMiddle(Least, 0));
    EXPECT_EQ(coarse.frameCount(Most), LastFrame);
    EXPECT_EQ(coarse.frameCount(Least), 0U);
    EXPECT_EQ(coarse.lastTickOf(0), 0);
    EXPECT_EQ(fine.frameCount(1), 0U);
    EXPECT_EQ(fine.lastTickOf(LastFrame), Most);
}

RC_GTEST_PROP(FrameClock, TheLastTickIsBeforeTheMiddleAndTheNextIsNot, ())
{
    const Ratio rate =
        *rc::gen::element(Ratio{24, 1}, Ratio{25, 1}, Ratio{24000, 1001}, Ratio{30000, 1001}, Ratio{60000, 1001});
    const Ratio timeBase = *rc::gen::element(Ratio{1, 1000}, Ratio{1, 90000}, Ratio{1, 24000}, Ratio{1001, 30000},
                                             Ratio{1, 25}, Ratio{1, 12800});
    const auto origin = *rc::gen::inRange<std::int64_t>(-1'000'000'000, 1'000'000'000);
    const auto frame = *rc::gen::inRange<std::uint32_t>(0, 10'000'000);
    const FrameClock clock(rate, timeBase, origin);

    const std::int64_t last = clock.lastTickOf(frame);

    RC_ASSERT(clock.isBeforeMiddle(last, frame));
    RC_ASSERT(!clock.isBeforeMiddle(last + 1, frame));
    RC_ASSERT(clock.frameCount(last) <= frame);
}

RC_GTEST_PROP(FrameClock, AFilmOfManyFramesHasSoMany, ())
{
    const Ratio rate = *rc::gen::element(Ratio{24, 1}, Ratio{25, 1}, Ratio{24000, 1001}, Ratio{30000, 1001});
    const auto frames = *rc::gen::inRange<std::uint32_t>(1, 20'000'000);
    // One tick is one frame.
    const FrameClock clock(rate, {rate.denominator, rate.numerator}, 7);

    RC_ASSERT(clock.frameCount(7 + std::int64_t{frames}) == frames);
}

} // namespace standin::tests
