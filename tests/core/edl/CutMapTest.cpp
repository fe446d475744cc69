// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/CutMap.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstddef>
#include <limits>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::CutEntry;
using core::CutMap;
using core::EventBase;
using core::EventList;
using core::Framerate;
using core::SecondsRange;
using core::Timecode;
using util::Result;

using Event = std::shared_ptr<EventBase>;
using Events = std::vector<Event>;
using Ranges = std::vector<SecondsRange>;

/// An event that stands in the programme from and to a whole second; its source starts at zero.
Event inProgramme(int dstIn, int dstOut)
{
    auto event = std::make_shared<EventBase>();
    event->setTimecodes(Timecode(0.0), Timecode(1.0), Timecode(double(dstIn)), Timecode(double(dstOut)));
    return event;
}

/// An event that uses its source from and to a whole second; it stands at the programme's start.
Event inSource(int srcIn, int srcOut)
{
    auto event = std::make_shared<EventBase>();
    event->setTimecodes(Timecode(double(srcIn)), Timecode(double(srcOut)), Timecode(0.0), Timecode(1.0));
    return event;
}

EventList listOf(const Events& events)
{
    EventList list;
    for (const auto& event : events)
        list.add(event);
    return list;
}

Events locked(const std::vector<std::weak_ptr<EventBase>>& events)
{
    Events result;
    for (const auto& event : events)
        result.push_back(event.lock());
    return result;
}

Events inOrder(const std::vector<CutEntry>& entries)
{
    Events result;
    for (const auto& entry : entries)
        result.push_back(entry.event.lock());
    return result;
}

} // namespace

TEST(CutMap, AnEmptyListGivesAnEmptyMap)
{
    const EventList list;

    const CutMap map(list, Timecode::framerate());

    EXPECT_TRUE(map.dstInOrder().empty());
    EXPECT_TRUE(map.srcInOrder().empty());
    EXPECT_EQ(map.sourceSpan(), (SecondsRange{0.0, 0.0}));
    EXPECT_EQ(map.destinationSpan(), (SecondsRange{0.0, 0.0}));
    EXPECT_TRUE(map.eventsInDestinationRange(0.0, 100.0).empty());
    EXPECT_EQ(map.uncoveredDestinationRanges({0.0, 100.0}), (Ranges{{0.0, 100.0}}));
}

TEST(CutMap, AListOfNothingButInvalidTimecodesGivesAnEmptyMap)
{
    const Event event = makeEvent("A", "00:00:00:29", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    ASSERT_TRUE(event->hasFlaw(core::EventFlaw::TimecodeInvalid));
    const EventList list = listOf({event});

    const CutMap map(list, Timecode::framerate());

    EXPECT_TRUE(map.dstInOrder().empty());
    EXPECT_TRUE(map.srcInOrder().empty());
    EXPECT_FALSE(map.contains(event));
    EXPECT_EQ(map.sourceSpan(), (SecondsRange{0.0, 0.0}));
    EXPECT_EQ(map.destinationSpan(), (SecondsRange{0.0, 0.0}));
}

TEST(CutMap, EveryOtherFlawLeavesAnEventInTheMap)
{
    const Event reversed = inProgramme(20, 10);
    const Event unreadable = inProgramme(10, 20);
    unreadable->addFlaw(core::EventFlaw::NotVideoEvent);
    const Event fresh = std::make_shared<EventBase>();
    const EventList list = listOf({reversed, unreadable, fresh});

    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(inOrder(map.dstInOrder()), (Events{fresh, unreadable, reversed}));
    EXPECT_TRUE(map.contains(reversed));
    EXPECT_TRUE(map.contains(unreadable));
    EXPECT_TRUE(map.contains(fresh));
}

TEST(CutMap, ContainsKnowsTheVeryEventAndNotItsLikes)
{
    const Event event = inProgramme(10, 20);
    const Event twin = inProgramme(10, 20);
    const EventList list = listOf({event});

    const CutMap map(list, Timecode::framerate());

    EXPECT_TRUE(map.contains(event));
    EXPECT_FALSE(map.contains(twin));
    EXPECT_FALSE(map.contains(nullptr));
}

TEST(CutMap, EachSideIsSortedByItsOwnStart)
{
    const Event a = makeEvent("A", "00:00:30:00", "00:00:31:00", "00:00:10:00", "00:00:11:00");
    const Event b = makeEvent("B", "00:00:10:00", "00:00:11:00", "00:00:20:00", "00:00:21:00");
    const Event c = makeEvent("C", "00:00:20:00", "00:00:21:00", "00:00:00:24", "00:00:02:00");
    const EventList list = listOf({a, b, c});

    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(inOrder(map.dstInOrder()), (Events{c, a, b}));
    EXPECT_EQ(inOrder(map.srcInOrder()), (Events{b, c, a}));
    EXPECT_EQ(map.dstInOrder().front().time, Timecode("00:00:00:24"));
    EXPECT_EQ(map.srcInOrder().front().time, Timecode("00:00:10:00"));
}

TEST(CutMap, EventsOfEqualStartStayInTheOrderOfTheList)
{
    const Event first = inProgramme(10, 20);
    const Event second = inProgramme(10, 15);
    const Event earlier = inProgramme(5, 6);
    const EventList list = listOf({first, second, earlier});

    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(inOrder(map.dstInOrder()), (Events{earlier, first, second}));
    EXPECT_EQ(inOrder(map.srcInOrder()), (Events{first, second, earlier}));
}

TEST(CutMap, AnEventThatStandsTwiceInTheListStandsTwiceInItsOrders)
{
    const Event twice = inProgramme(10, 20);
    const Event other = inProgramme(5, 6);
    const EventList list = listOf({twice, other, twice});

    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(inOrder(map.dstInOrder()), (Events{other, twice, twice}));
    EXPECT_TRUE(map.contains(twice));
}

TEST(CutMap, TheMapDoesNotFollowTheList)
{
    const Event event = inProgramme(10, 20);
    EventList list = listOf({event});
    const CutMap map(list, Timecode::framerate());

    list.clear();
    event->setDst(Timecode("00:01:00:00"), Timecode("00:02:00:00"));

    EXPECT_TRUE(map.contains(event));
    EXPECT_EQ(map.destinationSpan(), (SecondsRange{10.0, 20.0}));
    EXPECT_EQ(map.dstInOrder().front().time, Timecode("00:00:10:00"));
}

TEST(CutMap, TheMapKeepsItsEventsAlive)
{
    EventList list;
    list.add(inProgramme(10, 20));
    const CutMap map(list, Timecode::framerate());

    list.clear();

    EXPECT_NE(map.dstInOrder().front().event.lock(), nullptr);
    ASSERT_EQ(map.eventsInDestinationRange(0.0, 15.0).size(), 1u);
    EXPECT_NE(map.eventsInDestinationRange(0.0, 15.0).front().lock(), nullptr);
}

TEST(CutMap, SpansReachFromTheFirstToTheLastEdgeOfASide)
{
    const EventList list = listOf({makeEvent("A", "00:00:05:00", "00:00:06:00", "00:00:10:00", "00:00:40:00"),
                                   makeEvent("B", "00:00:02:00", "00:00:03:00", "00:00:20:00", "00:00:30:00")});

    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(map.sourceSpan(), (SecondsRange{2.0, 6.0}));
    EXPECT_EQ(map.destinationSpan(), (SecondsRange{10.0, 40.0}));
}

TEST(CutMap, SecondsAreThoseOfTheGivenRate)
{
    const EventList list = listOf({makeEvent("A", "00:00:00:12", "00:00:01:00", "00:00:00:06", "00:00:02:00")});

    const CutMap map(list, Framerate(24, 0));

    EXPECT_EQ(map.sourceSpan(), (SecondsRange{0.5, 1.0}));
    EXPECT_EQ(map.destinationSpan(), (SecondsRange{0.25, 2.0}));
}

TEST(CutMap, BuildingUnderARateThatTheTimecodesDoNotFitFails)
{
    const TestProject project(Framerate(30, 0));
    const EventList list = listOf({makeEvent("A", "00:00:00:27", "00:00:01:00", "00:00:00:00", "00:00:01:00")});

    EXPECT_EQ(thrownBy([&] { CutMap(list, Framerate(25, 0)); }), Result::FrameOutOfRate);
}

TEST(CutMapEventsInRange, ARangeInsideAnEventAnswersThatEvent)
{
    const Event event = inProgramme(0, 30);
    const EventList list = listOf({event});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(locked(map.eventsInDestinationRange(10.0, 20.0)), (Events{event}));
}

TEST(CutMapEventsInRange, BothBoundsBelongToTheRange)
{
    const Event before = inProgramme(0, 10);
    const Event behind = inProgramme(20, 30);
    const EventList list = listOf({before, behind});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(locked(map.eventsInDestinationRange(10.0, 20.0)), (Events{before, behind}));
    EXPECT_TRUE(map.eventsInDestinationRange(10.04, 19.96).empty());
}

TEST(CutMapEventsInRange, AnEmptyOrReversedRangeAnswersNothing)
{
    const EventList list = listOf({inProgramme(0, 30), inProgramme(10, 20)});
    const CutMap map(list, Timecode::framerate());

    EXPECT_TRUE(map.eventsInDestinationRange(10.0, 10.0).empty());
    EXPECT_TRUE(map.eventsInDestinationRange(15.0, 15.0).empty());
    EXPECT_TRUE(map.eventsInDestinationRange(20.0, 10.0).empty());
    EXPECT_TRUE(map.eventsInSourceRange(0.0, 0.0).empty());
}

TEST(CutMapEventsInRange, NoNumberAsABoundAnswersNothing)
{
    const EventList list = listOf({inProgramme(0, 30)});
    const CutMap map(list, Timecode::framerate());
    constexpr double NoNumber = std::numeric_limits<double>::quiet_NaN();

    EXPECT_TRUE(map.eventsInDestinationRange(NoNumber, 20.0).empty());
    EXPECT_TRUE(map.eventsInDestinationRange(10.0, NoNumber).empty());
}

TEST(CutMapEventsInRange, AnEventWithBothEdgesInTheRangeStandsOnce)
{
    const Event a = inProgramme(10, 12);
    const Event b = inProgramme(14, 16);
    const EventList list = listOf({b, a});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(locked(map.eventsInDestinationRange(0.0, 100.0)), (Events{a, b}));
}

TEST(CutMapEventsInRange, AnEventInterleavedWithAnotherStandsTwice)
{
    const Event a = inProgramme(10, 20);
    const Event b = inProgramme(15, 25);
    const EventList list = listOf({a, b});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(locked(map.eventsInDestinationRange(0.0, 100.0)), (Events{a, b, a, b}));
}

TEST(CutMapEventsInRange, EdgesAtOneInstantStandInTheOrderOfTheList)
{
    const Event before = inProgramme(10, 20);
    const Event behind = inProgramme(20, 30);
    const EventList forward = listOf({before, behind});
    const EventList backward = listOf({behind, before});
    const CutMap forwardMap(forward, Timecode::framerate());
    const CutMap backwardMap(backward, Timecode::framerate());

    EXPECT_EQ(locked(forwardMap.eventsInDestinationRange(15.0, 25.0)), (Events{before, behind}));
    EXPECT_EQ(locked(backwardMap.eventsInDestinationRange(15.0, 25.0)), (Events{behind, before}));
}

TEST(CutMapEventsInRange, BetweenTheEdgesOfTwoDifferentEventsNothingIsAnswered)
{
    const EventList list = listOf({inProgramme(0, 30), inProgramme(5, 40)});
    const CutMap map(list, Timecode::framerate());

    // The edges around the range are the second event's start and the first event's end.
    EXPECT_TRUE(map.eventsInDestinationRange(10.0, 20.0).empty());
}

TEST(CutMapEventsInRange, OfNestedEventsOnlyTheInnermostIsAroundARange)
{
    const Event outer = inProgramme(0, 30);
    const Event inner = inProgramme(5, 25);
    const EventList list = listOf({outer, inner});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(locked(map.eventsInDestinationRange(10.0, 20.0)), (Events{inner}));
}

TEST(CutMapEventsInRange, AnEventAroundTheRangeIsLeftOutWhenAnotherHasAnEdgeInIt)
{
    const Event outer = inProgramme(0, 30);
    const Event inner = inProgramme(12, 18);
    const EventList list = listOf({outer, inner});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(locked(map.eventsInDestinationRange(10.0, 20.0)), (Events{inner}));
    EXPECT_EQ(map.uncoveredDestinationRanges({10.0, 20.0}), (Ranges{{10.0, 12.0}, {18.0, 20.0}}));
}

TEST(CutMapEventsInRange, OutsideAllEventsNothingIsAnswered)
{
    const EventList list = listOf({inProgramme(10, 20)});
    const CutMap map(list, Timecode::framerate());

    EXPECT_TRUE(map.eventsInDestinationRange(0.0, 9.0).empty());
    EXPECT_TRUE(map.eventsInDestinationRange(21.0, 30.0).empty());
}

TEST(CutMapEventsInRange, TheSourceSideAnswersByItsOwnEdges)
{
    const Event a = inSource(10, 20);
    const Event b = inSource(30, 60);
    const EventList list = listOf({b, a});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(locked(map.eventsInSourceRange(5.0, 30.0)), (Events{a, b}));
    EXPECT_EQ(locked(map.eventsInSourceRange(40.0, 50.0)), (Events{b}));
    EXPECT_TRUE(map.eventsInSourceRange(21.0, 29.0).empty());
}

TEST(CutMapUncoveredRanges, AnEventThatOnlyTouchesTheRangeCoversNothing)
{
    const Event event = inProgramme(20, 30);
    const EventList list = listOf({event});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(locked(map.eventsInDestinationRange(10.0, 20.0)), (Events{event}));
    EXPECT_EQ(map.uncoveredDestinationRanges({10.0, 20.0}), (Ranges{{10.0, 20.0}}));
}

TEST(CutMapUncoveredRanges, AnEventInTheMiddleLeavesAPieceOnEachSide)
{
    const EventList list = listOf({inProgramme(10, 20)});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(map.uncoveredDestinationRanges({0.0, 30.0}), (Ranges{{0.0, 10.0}, {20.0, 30.0}}));
}

TEST(CutMapUncoveredRanges, AnEventOfNoLengthCoversNothingAndSplitsNothing)
{
    const Event empty = inProgramme(10, 10);
    const EventList list = listOf({empty});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(locked(map.eventsInDestinationRange(0.0, 30.0)), (Events{empty}));
    EXPECT_EQ(map.uncoveredDestinationRanges({0.0, 30.0}), (Ranges{{0.0, 30.0}}));
}

TEST(CutMapUncoveredRanges, AnEventAcrossAnEdgeOfTheRangeLeavesTheRest)
{
    const EventList list = listOf({inProgramme(10, 20)});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(map.uncoveredDestinationRanges({15.0, 30.0}), (Ranges{{20.0, 30.0}}));
    EXPECT_EQ(map.uncoveredDestinationRanges({0.0, 15.0}), (Ranges{{0.0, 10.0}}));
}

TEST(CutMapUncoveredRanges, AnEventOverTheWholeRangeLeavesNothing)
{
    const EventList list = listOf({inProgramme(10, 20)});
    const CutMap map(list, Timecode::framerate());

    EXPECT_TRUE(map.uncoveredDestinationRanges({10.0, 20.0}).empty());
    EXPECT_TRUE(map.uncoveredDestinationRanges({12.0, 18.0}).empty());
}

TEST(CutMapUncoveredRanges, EachEventIsTakenFromWhatTheOthersLeft)
{
    const EventList list = listOf({inProgramme(40, 50), inProgramme(10, 20), inProgramme(15, 25)});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(map.uncoveredDestinationRanges({0.0, 60.0}), (Ranges{{0.0, 10.0}, {25.0, 40.0}, {50.0, 60.0}}));
}

TEST(CutMapUncoveredRanges, AnEventThatEndsBeforeItStartsFails)
{
    const EventList list = listOf({inProgramme(20, 10)});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(thrownBy([&] { map.uncoveredDestinationRanges({0.0, 30.0}); }), Result::InvalidArgument);
    EXPECT_EQ(map.uncoveredDestinationRanges({21.0, 30.0}), (Ranges{{21.0, 30.0}}));
}

TEST(CutMapUncoveredRanges, AnEmptyRangeStaysAsItIs)
{
    const EventList list = listOf({inProgramme(0, 30)});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(map.uncoveredDestinationRanges({10.0, 10.0}), (Ranges{{10.0, 10.0}}));
}

TEST(CutMapUncoveredRanges, TheSourceSideHasItsOwn)
{
    const EventList list = listOf({inSource(10, 20)});
    const CutMap map(list, Timecode::framerate());

    EXPECT_EQ(map.uncoveredSourceRanges({0.0, 30.0}), (Ranges{{0.0, 10.0}, {20.0, 30.0}}));
    EXPECT_EQ(map.uncoveredDestinationRanges({0.0, 1.0}), Ranges{});

    const EventList reversed = listOf({inSource(20, 10)});
    const CutMap reversedMap(reversed, Timecode::framerate());
    EXPECT_EQ(thrownBy([&] { reversedMap.uncoveredSourceRanges({0.0, 30.0}); }), Result::InvalidArgument);
}

TEST(CutMapInsideAnEvent, ARangeUpToBothEdgesOfAnEventIsInsideIt)
{
    const EventList list = listOf({inProgramme(10, 20)});
    const CutMap map(list, Timecode::framerate());

    EXPECT_TRUE(map.isDestinationRangeInsideAnEvent({10.0, 20.0}));
    EXPECT_TRUE(map.isDestinationRangeInsideAnEvent({12.0, 18.0}));
    EXPECT_TRUE(map.isDestinationRangeInsideAnEvent({10.0, 11.0}));
}

TEST(CutMapInsideAnEvent, ARangeThatReachesBeyondIsNotInside)
{
    const EventList list = listOf({inProgramme(10, 20), inProgramme(20, 30)});
    const CutMap map(list, Timecode::framerate());

    EXPECT_FALSE(map.isDestinationRangeInsideAnEvent({9.0, 15.0}));
    EXPECT_FALSE(map.isDestinationRangeInsideAnEvent({15.0, 25.0}));
    EXPECT_FALSE(map.isDestinationRangeInsideAnEvent({31.0, 32.0}));
    EXPECT_FALSE(map.isDestinationRangeInsideAnEvent({15.0, 15.0}));
}

namespace {

bool liesWithin(double second, const std::vector<std::pair<int, int>>& ranges)
{
    return std::any_of(ranges.begin(), ranges.end(),
                       [=](const auto& range) { return range.first < second && second < range.second; });
}

} // namespace

// The middle of each whole second stands for the second.
RC_GTEST_PROP(CutMapUncoveredRanges, WhatIsLeftOfASpanIsWhatNoEventCovers, ())
{
    const auto starts = *rc::gen::container<std::vector<int>>(rc::gen::inRange(0, 40));
    std::vector<std::pair<int, int>> covered;
    EventList list;
    for (const int start : starts) {
        const int end = start + *rc::gen::inRange(0, 8);
        covered.emplace_back(start, end);
        list.add(inProgramme(start, end));
    }
    const CutMap map(list, Timecode::framerate());

    // Every edge lies in the range, so that no event can be missed.
    const Ranges left = map.uncoveredDestinationRanges({0.0, 50.0});

    for (int second = 0; second < 50; ++second) {
        const double middle = second + 0.5;
        const auto pieces = std::count_if(left.begin(), left.end(), [=](const SecondsRange& range) {
            return range.start < middle && middle < range.end;
        });
        RC_ASSERT(pieces == (liesWithin(middle, covered) ? 0 : 1));
    }
    for (const SecondsRange& range : left)
        RC_ASSERT(range.start < range.end);
    // What parts two neighbours is an event with a length.
    for (std::size_t i = 1; i < left.size(); ++i)
        RC_ASSERT(left[i - 1].end < left[i].start);
}

RC_GTEST_PROP(CutMap, TheOrderIsThatOfAStableSort, ())
{
    EventList list;
    for (const int start : *rc::gen::container<std::vector<int>>(rc::gen::inRange(0, 10)))
        list.add(inProgramme(start, start + 1));

    const CutMap map(list, Timecode::framerate());

    Events expected = list.events();
    std::stable_sort(expected.begin(), expected.end(),
                     [](const Event& a, const Event& b) { return a->dstIn() < b->dstIn(); });
    RC_ASSERT(inOrder(map.dstInOrder()) == expected);
    RC_ASSERT(inOrder(map.srcInOrder()) == list.events());
}

} // namespace cadrel::tests
