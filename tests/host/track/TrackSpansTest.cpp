// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/TrackSpans.h"

#include "host/border/HostFailure.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstddef>
#include <optional>
#include <utility>
#include <vector>

namespace cadrel::host {

using core::CutEventSpans;
using core::SecondsRange;
using util::Result;

namespace {

constexpr SecondsRange None;

struct Around {
    SecondsRange before;
    SecondsRange across;
    SecondsRange after;

    bool operator==(const Around&) const = default;
};

Around around(const TrackSpans& spans, double time)
{
    const CutEventSpans found = spans.around(time);
    return {found.before, found.across, found.after};
}

/// The same answer by a walk over the events; nothing where it fails. For times of which no two are closer than an
/// instant without being equal.
std::optional<Around> walk(const std::vector<SecondsRange>& events, double time)
{
    Around found;
    double lastStart = 0.0;
    double lastEnd = 0.0;
    for (const SecondsRange& event : events) {
        if (event.start <= lastEnd) {
            if (event.end <= lastEnd)
                continue;
            if (event.start < lastStart)
                return std::nullopt;
        }
        if (event.start > event.end)
            return std::nullopt;
        lastStart = event.start;
        if (time > event.end) {
            if (found.before.start == found.before.end || event.end > found.before.end)
                found.before = event;
        } else if (time < event.start) {
            found.after = event;
            break;
        } else {
            found.across = event;
        }
        lastEnd = event.end;
    }
    return found;
}

std::optional<Around> indexed(const std::vector<SecondsRange>& events, double time)
{
    try {
        return around(TrackSpans(events), time);
    } catch (Result::Type failure) {
        RC_ASSERT(failure == Result::InvalidArgument);
        return std::nullopt;
    }
}

} // namespace

TEST(TrackSpans, AnEmptyTrackHasNothingAroundAnyTime)
{
    EXPECT_EQ(around(TrackSpans(), 5.0), (Around{None, None, None}));
    EXPECT_EQ(around(TrackSpans(std::vector<SecondsRange>()), 5.0), (Around{None, None, None}));
}

TEST(TrackSpans, FindsTheNeighboursOfATime)
{
    const TrackSpans spans({{1.0, 2.0}, {3.0, 4.0}, {5.0, 6.0}, {7.0, 8.0}});

    EXPECT_EQ(around(spans, 0.5), (Around{None, None, {1.0, 2.0}}));
    EXPECT_EQ(around(spans, 3.5), (Around{{1.0, 2.0}, {3.0, 4.0}, {5.0, 6.0}}));
    EXPECT_EQ(around(spans, 4.5), (Around{{3.0, 4.0}, None, {5.0, 6.0}}));
    EXPECT_EQ(around(spans, 9.0), (Around{{7.0, 8.0}, None, None}));
}

TEST(TrackSpans, BothBoundsOfASpanAreAcross)
{
    const TrackSpans spans({{1.0, 2.0}, {3.0, 4.0}});

    EXPECT_EQ(around(spans, 1.0), (Around{None, {1.0, 2.0}, {3.0, 4.0}}));
    EXPECT_EQ(around(spans, 2.0), (Around{None, {1.0, 2.0}, {3.0, 4.0}}));
    EXPECT_EQ(around(spans, 4.0), (Around{{1.0, 2.0}, {3.0, 4.0}, None}));
}

TEST(TrackSpans, OfTwoThatMeetTheLaterIsAcross)
{
    const TrackSpans spans({{1.0, 2.0}, {2.0, 3.0}, {3.0, 4.0}});

    EXPECT_EQ(around(spans, 2.0), (Around{None, {2.0, 3.0}, {3.0, 4.0}}));
    EXPECT_EQ(around(spans, 3.0), (Around{{1.0, 2.0}, {3.0, 4.0}, None}));
}

TEST(TrackSpans, OfTwoThatOverlapTheLaterIsAcross)
{
    const TrackSpans spans({{1.0, 5.0}, {3.0, 8.0}});

    EXPECT_EQ(around(spans, 2.0), (Around{None, {1.0, 5.0}, {3.0, 8.0}}));
    EXPECT_EQ(around(spans, 4.0), (Around{None, {3.0, 8.0}, None}));
    EXPECT_EQ(around(spans, 6.0), (Around{{1.0, 5.0}, {3.0, 8.0}, None}));
}

TEST(TrackSpans, WhatLiesInsideAnEarlierOneIsNotSeen)
{
    const TrackSpans spans({{1.0, 10.0}, {2.0, 3.0}, {2.0, 10.0}, {4.0, 12.0}, {12.0, 12.0}});

    EXPECT_EQ(around(spans, 2.5), (Around{None, {1.0, 10.0}, {4.0, 12.0}}));
    EXPECT_EQ(around(spans, 12.0), (Around{{1.0, 10.0}, {4.0, 12.0}, None}));
}

TEST(TrackSpans, WhatEndsAnInstantBehindAnEarlierOneLiesInsideOfIt)
{
    constexpr double Hair = core::SameInstant / 2;
    const TrackSpans spans({{1.0, 10.0}, {2.0, 10.0 + Hair}, {10.0 + Hair, 11.0}});

    EXPECT_EQ(around(spans, 5.0), (Around{None, {1.0, 10.0}, {10.0 + Hair, 11.0}}));
}

TEST(TrackSpans, TimesWithinAnInstantOfABoundAreAtIt)
{
    constexpr double Hair = core::SameInstant / 2;
    const TrackSpans spans({{1.0, 2.0}, {2.0, 3.0}, {4.0, 5.0}});

    EXPECT_EQ(around(spans, 2.0 - Hair), (Around{None, {2.0, 3.0}, {4.0, 5.0}}));
    EXPECT_EQ(around(spans, 2.0 + Hair), (Around{None, {2.0, 3.0}, {4.0, 5.0}}));
    EXPECT_EQ(around(spans, 3.0 + Hair), (Around{{1.0, 2.0}, {2.0, 3.0}, {4.0, 5.0}}));
    EXPECT_EQ(around(spans, 3.0 + 2 * core::SameInstant), (Around{{2.0, 3.0}, None, {4.0, 5.0}}));
    EXPECT_EQ(around(spans, 4.0 - Hair), (Around{{2.0, 3.0}, {4.0, 5.0}, None}));
}

TEST(TrackSpans, AnEventWithoutLengthIsFoundWhereItStands)
{
    const TrackSpans spans({{1.0, 1.0}, {3.0, 3.0}, {5.0, 5.0}});

    EXPECT_EQ(around(spans, 3.0), (Around{{1.0, 1.0}, {3.0, 3.0}, {5.0, 5.0}}));
    EXPECT_EQ(around(spans, 4.0), (Around{{3.0, 3.0}, None, {5.0, 5.0}}));
}

TEST(TrackSpans, AnEventThatStartsTooEarlyForTheOrderFailsWhereTheWalkReachesIt)
{
    const TrackSpans spans({{1.0, 2.0}, {4.0, 6.0}, {3.0, 8.0}, {9.0, 10.0}});

    EXPECT_EQ(around(spans, 1.5), (Around{None, {1.0, 2.0}, {4.0, 6.0}}));
    EXPECT_EQ(resultOf([&] { spans.around(4.0); }), Result::InvalidArgument);
    EXPECT_EQ(resultOf([&] { spans.around(9.5); }), Result::InvalidArgument);
}

TEST(TrackSpans, AnEventThatIsReversedFailsWhereTheWalkReachesIt)
{
    const TrackSpans spans({{1.0, 2.0}, {5.0, 4.0}, {6.0, 7.0}});

    EXPECT_EQ(around(spans, 0.0), (Around{None, None, {1.0, 2.0}}));
    EXPECT_EQ(resultOf([&] { spans.around(1.5); }), Result::InvalidArgument);
    EXPECT_EQ(around(TrackSpans({{1.0, 9.0}, {5.0, 4.0}}), 5.0), (Around{None, {1.0, 9.0}, None}));
}

RC_GTEST_PROP(TrackSpansLaw, GivesTheAnswersOfAWalk, ())
{
    const auto number = rc::gen::inRange(0, 40);
    const auto events = *rc::gen::container<std::vector<std::pair<int, int>>>(rc::gen::pair(number, number));
    // Half of the tracks are in order, as good hosts have them.
    std::vector<SecondsRange> spans;
    for (const auto& [a, b] : events)
        spans.push_back({std::min(a, b) / 8.0, std::max(a, b) / 8.0});
    if (*rc::gen::arbitrary<bool>()) {
        std::stable_sort(spans.begin(), spans.end(),
                         [](const SecondsRange& a, const SecondsRange& b) { return a.start < b.start; });
    } else if (!spans.empty()) {
        SecondsRange& one = spans[*rc::gen::inRange<std::size_t>(0, spans.size())];
        std::swap(one.start, one.end);
    }

    for (int time = -1; time <= 41; ++time)
        RC_ASSERT(indexed(spans, time / 8.0) == walk(spans, time / 8.0));
}

} // namespace cadrel::host
