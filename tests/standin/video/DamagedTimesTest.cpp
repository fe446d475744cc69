// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/DamagedTimes.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <optional>
#include <vector>

namespace standin::tests {

namespace {

std::vector<std::int64_t> damagedOf(const DamagedTimes& times, std::int64_t end)
{
    std::vector<std::int64_t> damaged;
    for (std::int64_t ticks = 0; ticks < end; ++ticks) {
        if (times.isAt(ticks))
            damaged.push_back(ticks);
    }
    return damaged;
}

void feedAll(DamagedTimes& times, const std::vector<std::int64_t>& pictures)
{
    for (const std::int64_t ticks : pictures)
        times.feed(ticks, false);
}

} // namespace

TEST(DamagedTimes, ThereAreNoneAtFirst)
{
    DamagedTimes times;
    times.feed(0, true);
    feedAll(times, {3, 1, 2});

    EXPECT_TRUE(damagedOf(times, 10).empty());
    EXPECT_EQ(times.firstBetween(-1, 10), std::nullopt);
}

TEST(DamagedTimes, DamageGoesOnUpToTheNextKeyPicture)
{
    DamagedTimes times;
    times.feed(0, true);
    feedAll(times, {3, 1, 2, 6});
    times.note(6);
    feedAll(times, {4, 5});
    times.feed(9, true);
    feedAll(times, {7, 8, 12, 10, 11});

    EXPECT_EQ(damagedOf(times, 13), (std::vector<std::int64_t>{4, 5, 6, 7, 8}));
    EXPECT_EQ(times.firstBetween(3, 9), 4);
    EXPECT_EQ(times.firstBetween(4, 9), std::nullopt);
    EXPECT_EQ(times.firstBetween(3, 4), std::nullopt);
}

TEST(DamagedTimes, ADamagedKeyPictureIsNoEnd)
{
    DamagedTimes times;
    times.feed(0, true);
    times.feed(1, false);
    times.note(1);
    times.feed(2, true);
    times.note(2);
    feedAll(times, {3});
    times.feed(4, true);

    EXPECT_EQ(damagedOf(times, 6), (std::vector<std::int64_t>{1, 2, 3}));
}

TEST(DamagedTimes, DamageThatIsSeenLateEndsAtAKeyPictureThatCameMeanwhile)
{
    DamagedTimes times;
    times.feed(0, true);
    feedAll(times, {1, 2});
    times.feed(3, true);
    feedAll(times, {4, 5});
    times.feed(6, true);

    times.note(1);

    EXPECT_EQ(damagedOf(times, 8), (std::vector<std::int64_t>{1, 2}));
}

} // namespace standin::tests
