// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/EventReach.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <utility>
#include <vector>

namespace cadrel::host {

using core::SecondsRange;

TEST(EventReach, OfNoEventsReachesNowhere)
{
    EXPECT_FALSE(EventReach({}).reachesInto({0.0, 1e6}));
}

TEST(EventReach, AnEventReachesIntoWhatItOverlapsAndNotIntoWhatItTouches)
{
    const EventReach reach({{10.0, 20.0}});

    EXPECT_FALSE(reach.reachesInto({0.0, 10.0}));
    EXPECT_TRUE(reach.reachesInto({0.0, 10.0 + core::SameInstant * 2}));
    EXPECT_TRUE(reach.reachesInto({12.0, 13.0}));
    EXPECT_TRUE(reach.reachesInto({0.0, 30.0}));
    EXPECT_TRUE(reach.reachesInto({20.0 - core::SameInstant * 2, 30.0}));
    EXPECT_FALSE(reach.reachesInto({20.0, 30.0}));
}

TEST(EventReach, TimesWithinAnInstantAreOne)
{
    constexpr double Hair = core::SameInstant / 2;
    const EventReach reach({{10.0, 20.0}});

    EXPECT_FALSE(reach.reachesInto({0.0, 10.0 + Hair}));
    EXPECT_FALSE(reach.reachesInto({20.0 - Hair, 30.0}));
}

TEST(EventReach, AnEventWithoutLengthLiesInTheStretchThatBeginsWithIt)
{
    const EventReach reach({{5.0, 5.0}});

    EXPECT_FALSE(reach.reachesInto({0.0, 5.0}));
    EXPECT_TRUE(reach.reachesInto({5.0, 6.0}));
    EXPECT_TRUE(reach.reachesInto({4.0, 6.0}));
    EXPECT_FALSE(reach.reachesInto({6.0, 7.0}));
}

TEST(EventReach, ALongEventIsSeenUnderThoseThatBeginAndEndWithinIt)
{
    const EventReach reach({{40.0, 41.0}, {3.0, 4.0}, {2.0, 30.0}, {5.0, 5.0}});

    EXPECT_TRUE(reach.reachesInto({29.0, 31.0}));
    EXPECT_FALSE(reach.reachesInto({30.0, 40.0}));
    EXPECT_TRUE(reach.reachesInto({40.0, 50.0}));
}

RC_GTEST_PROP(EventReachLaw, GivesTheAnswersOfAWalk, ())
{
    const auto number = rc::gen::inRange(0, 20);
    std::vector<SecondsRange> events;
    for (const auto& [a, b] : *rc::gen::container<std::vector<std::pair<int, int>>>(rc::gen::pair(number, number)))
        events.push_back({std::min(a, b) / 8.0, std::max(a, b) / 8.0});
    const EventReach reach(events);

    for (int start = 0; start < 20; ++start) {
        for (int end = start + 1; end <= 20; ++end) {
            const SecondsRange stretch{start / 8.0, end / 8.0};
            const bool isReached = std::ranges::any_of(events, [&stretch](const SecondsRange& event) {
                return event.start < stretch.end && (event.start >= stretch.start || event.end > stretch.start);
            });
            RC_ASSERT(reach.reachesInto(stretch) == isReached);
        }
    }
}

} // namespace cadrel::host
