// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/ChangeMap.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cmath>

using cadrel::core::EventList;
using cadrel::core::ListKind;
using cadrel::core::Timecode;
using cadrel::tests::makeEvent;
using desktop::ChangeMap;
using Span = ChangeMap::Span;
using State = ChangeMap::State;

namespace {

/// At 25 frames a second, with a clock that begins at one hour:
///
///     old, in seconds   |-- A 0..10 --|-- B 10..20 --|-- C 20..30 --|
///     new               |-- A 0..10 --|-- C 10..20 --|-- new 20..25 --|-- B 25..35 --|
class ChangeMapTest : public testing::Test {
protected:
    ChangeMapTest()
    {
        m_old.add(makeEvent("A", "01:00:00:00", "01:00:10:00", "01:00:00:00", "01:00:10:00"));
        m_old.add(makeEvent("B", "01:00:00:00", "01:00:10:00", "01:00:10:00", "01:00:20:00"));
        m_old.add(makeEvent("C", "01:00:00:00", "01:00:10:00", "01:00:20:00", "01:00:30:00"));
        m_new.add(makeEvent("A", "01:00:00:00", "01:00:10:00", "01:00:00:00", "01:00:10:00"));
        m_new.add(makeEvent("C", "01:00:00:00", "01:00:10:00", "01:00:10:00", "01:00:20:00"));
        m_new.add(makeEvent("N", "01:00:00:00", "01:00:05:00", "01:00:20:00", "01:00:25:00"));
        m_new.add(makeEvent("B", "01:00:00:00", "01:00:10:00", "01:00:25:00", "01:00:35:00"));
        m_change.add(makeEvent("A", "01:00:00:00", "01:00:10:00", "01:00:00:00", "01:00:10:00"));
        m_change.add(makeEvent("B", "01:00:10:00", "01:00:20:00", "01:00:25:00", "01:00:35:00"));
        m_change.add(makeEvent("C", "01:00:20:00", "01:00:30:00", "01:00:10:00", "01:00:20:00"));
    }

    ChangeMap map(State state) const { return {m_change, m_old, m_new, m_project.framerate, 3600.0, state}; }

    cadrel::tests::TestProject m_project;
    EventList m_old{ListKind::Old};
    EventList m_new{ListKind::New};
    EventList m_change;
};

void expectSpans(const std::vector<Span>& spans, const std::vector<Span>& expected)
{
    ASSERT_EQ(spans.size(), expected.size());
    for (std::size_t at = 0; at < spans.size(); ++at) {
        EXPECT_NEAR(spans[at].start, expected[at].start, 1e-9);
        EXPECT_NEAR(spans[at].end, expected[at].end, 1e-9);
    }
}

} // namespace

TEST_F(ChangeMapTest, KnowsNothingWithoutEvents)
{
    const ChangeMap map;
    EXPECT_TRUE(map.isEmpty());
    EXPECT_FALSE(map.eventOf({0.0, 1.0}, State::Carried));
    EXPECT_FALSE(map.placeOf(0));
    EXPECT_TRUE(map.formerPlaces({0.0, 1.0}).empty());
    EXPECT_TRUE(map.withoutSound().empty());
    EXPECT_TRUE(map.cuts(State::Planned).empty());
}

TEST_F(ChangeMapTest, FindsTheEventThatHasMovedAClipThere)
{
    const ChangeMap carried = map(State::Carried);
    EXPECT_EQ(carried.eventOf({12.0, 13.0}, State::Carried), 2U);
    EXPECT_EQ(carried.eventOf({26.0, 30.0}, State::Carried), 1U);
    EXPECT_FALSE(carried.eventOf({21.0, 22.0}, State::Carried));
    EXPECT_FALSE(carried.eventOf({40.0, 50.0}, State::Carried));
}

TEST_F(ChangeMapTest, FindsTheEventThatWillMoveAClipAway)
{
    const ChangeMap planned = map(State::Planned);
    EXPECT_EQ(planned.eventOf({12.0, 13.0}, State::Planned), 1U);
    EXPECT_EQ(planned.eventOf({12.0, 13.0}, State::Carried), 2U);
}

TEST_F(ChangeMapTest, TakesTheEventWithMostOfAClip)
{
    const ChangeMap carried = map(State::Carried);
    EXPECT_EQ(carried.eventOf({8.0, 11.0}, State::Carried), 0U);
    EXPECT_EQ(carried.eventOf({9.0, 12.0}, State::Carried), 2U);
    // Half and half: the first.
    EXPECT_EQ(carried.eventOf({9.0, 11.0}, State::Carried), 0U);
}

TEST_F(ChangeMapTest, TakesTheEventThatBeginsWhereAClipWithoutLengthLies)
{
    const ChangeMap carried = map(State::Carried);
    EXPECT_EQ(carried.eventOf({10.0, 10.0}, State::Carried), 2U);
    EXPECT_EQ(carried.eventOf({0.0, 0.0}, State::Carried), 0U);
    EXPECT_FALSE(carried.eventOf({20.0, 20.0}, State::Carried));
}

TEST_F(ChangeMapTest, KnowsWhereAnEventIsInTheProgrammeOnTheTracks)
{
    expectSpans({*map(State::Carried).placeOf(1)}, {{25.0, 35.0}});
    expectSpans({*map(State::Planned).placeOf(1)}, {{10.0, 20.0}});
    EXPECT_FALSE(map(State::Carried).placeOf(3));
    for (const State state : {State::Carried, State::Planned})
        EXPECT_EQ(map(state).moveOf(1), (ChangeMap::Move{10.0, 25.0}));
    EXPECT_FALSE(map(State::Carried).moveOf(3));
}

TEST_F(ChangeMapTest, KnowsWhereAClipStood)
{
    const ChangeMap carried = map(State::Carried);
    expectSpans(carried.formerPlaces({12.0, 13.0}), {{22.0, 23.0}});
    // What hasn't moved has no former place.
    expectSpans(carried.formerPlaces({2.0, 3.0}), {});
    // Both pieces of a clip that was laid over a cut since; the new picture has none.
    expectSpans(carried.formerPlaces({18.0, 27.0}), {{28.0, 30.0}, {10.0, 12.0}});
    expectSpans(carried.formerPlaces({25.0, 25.0}), {{10.0, 10.0}});
    expectSpans(map(State::Planned).formerPlaces({12.0, 13.0}), {});
}

TEST_F(ChangeMapTest, JoinsPiecesThatStoodTogether)
{
    m_change.clear();
    m_change.add(makeEvent("A", "01:00:10:00", "01:00:20:00", "01:00:00:00", "01:00:10:00"));
    m_change.add(makeEvent("A", "01:00:20:00", "01:00:30:00", "01:00:10:00", "01:00:20:00"));
    expectSpans(map(State::Carried).formerPlaces({5.0, 15.0}), {{15.0, 25.0}});
}

TEST_F(ChangeMapTest, FollowsARetimeAndAShotThatPlaysBackwards)
{
    m_change.clear();
    m_change.add(makeEvent("A", "01:00:10:00", "01:00:30:00", "01:00:00:00", "01:00:10:00"));
    auto reversed = makeEvent("B", "01:00:40:00", "01:00:50:00", "01:00:10:00", "01:00:20:00");
    reversed->setReversed(true);
    m_change.add(reversed);
    expectSpans(map(State::Carried).formerPlaces({1.0, 2.0}), {{12.0, 14.0}});
    expectSpans(map(State::Carried).formerPlaces({11.0, 13.0}), {{47.0, 49.0}});
}

TEST_F(ChangeMapTest, LeavesOutEventsThatAreNotValid)
{
    m_change.clear();
    m_change.add(makeEvent("A", "01:00:10:00", "01:00:05:00", "01:00:00:00", "01:00:10:00"));
    m_change.add(makeEvent("B", "01:00:10:00", "01:00:20:00", "01:00:00:00", "01:00:10:00"));
    EXPECT_EQ(map(State::Carried).eventOf({1.0, 2.0}, State::Carried), 1U);
    EXPECT_FALSE(map(State::Carried).placeOf(0));
}

TEST_F(ChangeMapTest, LeavesOutEventsThatDoNotExistAtTheRate)
{
    m_change.add(makeEvent("D", "01:00:30:24", "01:00:31:24", "01:00:40:24", "01:00:41:24"));
    const ChangeMap map(m_change, m_old, m_new, cadrel::core::Framerate(24, 0), 3600.0, State::Carried);
    EXPECT_EQ(map.eventOf({12.0, 13.0}, State::Carried), 2U);
    EXPECT_FALSE(map.placeOf(3));
}

TEST_F(ChangeMapTest, KnowsTheNewPictureWithoutSound)
{
    expectSpans(map(State::Carried).withoutSound(), {{20.0, 25.0}});
    EXPECT_TRUE(map(State::Planned).withoutSound().empty());
}

TEST_F(ChangeMapTest, DoesNotCountBlackAsNewPicture)
{
    m_new.add(makeEvent("BL", "00:00:00:00", "00:00:05:00", "01:00:35:00", "01:00:40:00"));
    expectSpans(map(State::Carried).withoutSound(), {{20.0, 25.0}});
}

TEST_F(ChangeMapTest, DoesNotCountPictureAsNewThatStaysInPlaceOutsideOfTheEvents)
{
    // As a run leaves the list that takes only what has to move; shot A stays.
    m_change.erase(0, 1);
    ASSERT_EQ(m_change.size(), 2U);
    expectSpans(map(State::Carried).withoutSound(), {{20.0, 25.0}});
    // A ends a frame earlier in the new cut, and begins with other frames for one second.
    m_new.clear();
    m_new.add(makeEvent("A", "01:00:05:00", "01:00:06:00", "01:00:00:00", "01:00:01:00"));
    m_new.add(makeEvent("A", "01:00:01:00", "01:00:09:24", "01:00:01:00", "01:00:09:24"));
    m_new.add(makeEvent("N", "01:00:00:00", "01:00:00:01", "01:00:09:24", "01:00:10:00"));
    expectSpans(map(State::Carried).withoutSound(), {{0.0, 1.0}, {9.96, 10.0}});
}

TEST_F(ChangeMapTest, CountsPictureThatStaysInPlaceAmidTheEventsAsWithoutSound)
{
    // The list was carried out from its first to its last event, and D isn't in it.
    m_old.add(makeEvent("D", "01:00:00:00", "01:00:10:00", "01:00:40:00", "01:00:50:00"));
    m_new.add(makeEvent("D", "01:00:00:00", "01:00:10:00", "01:00:40:00", "01:00:50:00"));
    expectSpans(map(State::Carried).withoutSound(), {{20.0, 25.0}});
    m_change.add(makeEvent("E", "01:00:50:00", "01:00:55:00", "01:00:45:00", "01:00:55:00"));
    expectSpans(map(State::Carried).withoutSound(), {{20.0, 25.0}, {40.0, 45.0}});
}

TEST_F(ChangeMapTest, HasTheCutsOfBothPictures)
{
    const ChangeMap carried = map(State::Carried);
    const std::vector<double>& before = carried.cuts(State::Planned);
    ASSERT_EQ(before.size(), 3U);
    EXPECT_NEAR(before[1], 10.0, 1e-9);
    const std::vector<double>& after = carried.cuts(State::Carried);
    ASSERT_EQ(after.size(), 4U);
    EXPECT_NEAR(after[3], 25.0, 1e-9);
}

RC_GTEST_PROP(ChangeMap, BringsEachPieceBackToWhereItsEventTookItFrom, ())
{
    const cadrel::tests::TestProject project;
    EventList change;
    EventList none;
    // Shots of the old programme in another order, with gaps.
    int at = 0;
    for (const int source : *rc::gen::unique<std::vector<int>>(rc::gen::inRange(0, 40))) {
        at += *rc::gen::inRange(0, 3);
        auto event = std::make_shared<cadrel::core::EventBase>();
        event->setTimecodes(Timecode(source * 25), Timecode(source * 25 + 25), Timecode(at * 25),
                            Timecode(at * 25 + 25));
        change.add(event);
        ++at;
    }
    const ChangeMap map(change, none, none, project.framerate, 0.0, State::Carried);
    for (std::size_t index = 0; index < change.size(); ++index) {
        const auto& event = change.at(index);
        const double present = event.dstIn().toSeconds(project.framerate);
        const double former = event.srcIn().toSeconds(project.framerate);
        const auto places = map.formerPlaces({present + 0.2, present + 0.4});
        RC_ASSERT(map.eventOf({present + 0.2, present + 0.4}, State::Carried) == index);
        if (std::abs(present - former) < 1e-6) {
            RC_ASSERT(places.empty());
            continue;
        }
        RC_ASSERT(places.size() == 1U);
        RC_ASSERT(std::abs(places[0].start - (former + 0.2)) < 1e-9);
        RC_ASSERT(std::abs(places[0].end - (former + 0.4)) < 1e-9);
    }
}
