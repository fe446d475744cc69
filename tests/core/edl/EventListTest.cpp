// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventList.h"

#include "core/edl/HealedEvent.h"
#include "core/serialize/ByteArchive.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::ChangeContext;
using core::EventBase;
using core::EventList;
using core::Framerate;
using core::HealedEvent;
using core::Timecode;
using core::TimecodeRange;
using util::Result;

using Events = std::vector<std::shared_ptr<EventBase>>;
using Kinds = std::vector<std::int32_t>;

constexpr std::size_t Huge = std::numeric_limits<std::size_t>::max();

/// An event that needs no project.
std::shared_ptr<EventBase> named(const std::string& roll)
{
    auto event = std::make_shared<EventBase>();
    event->setRollName(roll);
    return event;
}

/// A second of source A at a place of the programme.
std::shared_ptr<EventBase> playing(const char* dstIn, const char* dstOut)
{
    return makeEvent("A", "00:10:00:00", "00:10:01:00", dstIn, dstOut);
}

void fill(EventList& list, const Events& events)
{
    for (const auto& event : events)
        list.add(event);
}

EventList listOf(const Events& events)
{
    EventList list;
    fill(list, events);
    return list;
}

std::string rollsOf(const EventList& list)
{
    std::string rolls;
    for (const auto& event : list.events())
        rolls += event->rollName();
    return rolls;
}

/// A list of kind 1 with the events A, B and C, and what is heard of it.
class ThreeEvents : public testing::Test {
protected:
    ThreeEvents()
    {
        fill(list, {a, b, c});
        list.addListener(&listener);
    }

    /// Whether a change of the event reaches the list's listener exactly once.
    bool isHeard(const std::shared_ptr<EventBase>& event) { return timesHeard(event) == 1; }

    std::size_t timesHeard(const std::shared_ptr<EventBase>& event)
    {
        listener.forget();
        event->setClipName("changed");
        return listener.types.size();
    }

    const std::shared_ptr<EventBase> a = named("A");
    const std::shared_ptr<EventBase> b = named("B");
    const std::shared_ptr<EventBase> c = named("C");
    EventList list{core::ListKind::New};
    RecordingListener listener;
};

TEST(EventList, ANewListIsEmptyAndOfTheGivenKind)
{
    EXPECT_TRUE(EventList(0).isEmpty());
    EXPECT_EQ(EventList(0).size(), 0U);
    EXPECT_EQ(EventList(0).listKind(), 0);
    EXPECT_EQ(EventList(1).listKind(), 1);
    EXPECT_EQ(EventList().listKind(), 2);
}

TEST_F(ThreeEvents, StandInTheOrderOfTheirArrival)
{
    EXPECT_EQ(list.size(), 3U);
    EXPECT_FALSE(list.isEmpty());
    EXPECT_EQ(list.events(), (Events{a, b, c}));
    EXPECT_EQ(list.eventAt(1), b);
    EXPECT_EQ(&list.at(2), c.get());
}

TEST_F(ThreeEvents, AreContainedAsTheVeryObjects)
{
    EXPECT_TRUE(list.contains(b));
    EXPECT_FALSE(list.contains(std::make_shared<EventBase>(*b)));
    EXPECT_FALSE(EventList().contains(b));
}

TEST(EventList, CountsFlawedEvents)
{
    const auto good = playing("00:00:00:00", "00:00:01:00");
    const auto reversed = playing("00:00:02:00", "00:00:01:00");
    const auto badFrame = playing("00:00:00:00", "00:00:00:25");
    const auto unset = named("A");

    EXPECT_EQ(EventList().countInvalid(), 0U);
    EXPECT_EQ(EventList().countInvalidTimecodes(), 0U);
    const EventList list = listOf({good, reversed, badFrame, unset, badFrame});
    EXPECT_EQ(list.countInvalid(), 4U);
    EXPECT_EQ(list.countInvalidTimecodes(), 2U);
}

TEST(EventList, IsReadableWhenAnEventHasNoneOfTheFlawsOneToTen)
{
    const auto flawed = [](std::int32_t flaw) {
        const auto event = named("A");
        event->addFlaw(flaw);
        return event;
    };

    EXPECT_FALSE(EventList().hasReadableEvent());
    EXPECT_FALSE(listOf({flawed(1), flawed(4), flawed(10)}).hasReadableEvent());
    EXPECT_TRUE(listOf({flawed(4), flawed(11)}).hasReadableEvent());
    EXPECT_TRUE(listOf({flawed(12)}).hasReadableEvent());
    EXPECT_TRUE(listOf({flawed(4), named("A")}).hasReadableEvent());
}

TEST_F(ThreeEvents, AreSharedWithACopyWhichIsOfKindTwoAndHasNoListeners)
{
    EventList copy(list);

    EXPECT_EQ(copy.listKind(), 2);
    EXPECT_EQ(copy.events(), list.events());
    copy.add(named("D"));
    EXPECT_TRUE(listener.types.empty());
    EXPECT_EQ(list.size(), 3U);
}

TEST_F(ThreeEvents, AreHeardByACopyToo)
{
    EventList copy(list);
    RecordingListener ofCopy;
    copy.addListener(&ofCopy);

    a->setRollName("X");

    EXPECT_EQ(ofCopy.listKinds, Kinds{2});
    EXPECT_EQ(listener.listKinds, Kinds{1});
}

TEST_F(ThreeEvents, OutliveACopyThatListenedToThem)
{
    {
        const EventList copy(list);
    }

    EXPECT_TRUE(isHeard(a));
}

TEST_F(ThreeEvents, MoveTheListeningWhenTheyAreReplacedByAssignment)
{
    const auto d = named("D");
    const EventList other = listOf({d, b});

    list = other;

    EXPECT_EQ(listener.types, Kinds{ChangeContext::EventListChanged});
    EXPECT_EQ(listener.listKinds, Kinds{1});
    EXPECT_EQ(list.listKind(), 1);
    EXPECT_EQ(list.events(), (Events{d, b}));
    EXPECT_TRUE(isHeard(d));
    EXPECT_TRUE(isHeard(b));
    EXPECT_EQ(timesHeard(a), 0U);
}

TEST_F(ThreeEvents, MayBeReplacedByTheMembersOfAHealedEventThatTheListAloneHolds)
{
    const auto first = playing("00:00:01:00", "00:00:02:00");
    const auto second = playing("00:00:02:00", "00:00:03:00");
    auto holder = std::make_shared<HealedEvent>();
    holder->addEvent(first);
    holder->addEvent(second);
    const std::weak_ptr<HealedEvent> watch = holder;
    const HealedEvent& healed = *holder;
    list.add(std::move(holder));
    listener.forget();

    list = healed.healedEvents();

    EXPECT_TRUE(watch.expired());
    EXPECT_EQ(list.events(), (Events{first, second}));
    EXPECT_EQ(listener.listKinds, Kinds{1});
    EXPECT_TRUE(isHeard(first));
    EXPECT_TRUE(isHeard(second));
    EXPECT_EQ(timesHeard(a), 0U);
}

TEST_F(ThreeEvents, StayOnSelfAssignmentWithoutANotification)
{
    const EventList& itself = list;

    list = itself;

    EXPECT_TRUE(listener.types.empty());
    EXPECT_EQ(list.events(), (Events{a, b, c}));
    EXPECT_TRUE(isHeard(a));
}

TEST_F(ThreeEvents, DoNotReachAListThatIsGone)
{
    {
        EventList gone = listOf({a, b});
    }

    EXPECT_TRUE(isHeard(a));
    EXPECT_TRUE(isHeard(b));
}

TEST_F(ThreeEvents, AreReannouncedAsOneChangeOfTheListWithItsKind)
{
    b->setRollName("X");

    EXPECT_EQ(listener.types, Kinds{ChangeContext::EventListChanged});
    EXPECT_EQ(listener.listKinds, Kinds{1});
}

TEST_F(ThreeEvents, AreNotHeardWhileTheListDoesNotListen)
{
    list.setListening(false);
    EXPECT_EQ(timesHeard(a), 0U);
    EXPECT_EQ(timesHeard(c), 0U);

    list.setListening(true);
    EXPECT_TRUE(listener.types.empty());
    EXPECT_TRUE(isHeard(a));
    EXPECT_TRUE(isHeard(c));
}

TEST_F(ThreeEvents, AreHeardOnceAlsoWhenTheListBeganToListenTwice)
{
    list.setListening(true);
    list.setListening(true);

    EXPECT_TRUE(isHeard(a));
}

TEST_F(ThreeEvents, AnswerNoContextButThatOfAnEvent)
{
    list.onChange(core::EventListChangeContext(0));
    for (const std::int32_t type : {0, 1, 4, 5, 6})
        list.onChange(ChangeContext(type));
    EXPECT_TRUE(listener.types.empty());

    list.onChange(ChangeContext(ChangeContext::EventChanged));
    EXPECT_EQ(listener.types, Kinds{ChangeContext::EventListChanged});
    EXPECT_EQ(listener.listKinds, Kinds{1});
}

TEST(EventList, AListThatIsHeardByAListIsNotTakenForAnEvent)
{
    EventList inner(0);
    EventList outer(1);
    RecordingListener listener;
    outer.addListener(&listener);
    inner.addListener(&outer);

    inner.add(named("A"));

    EXPECT_TRUE(listener.types.empty());
    inner.removeListener(&outer);
}

TEST_F(ThreeEvents, GrowByOneWithOneNotification)
{
    const auto d = named("D");

    list.add(d);

    EXPECT_EQ(listener.types, Kinds{ChangeContext::EventListChanged});
    EXPECT_EQ(listener.listKinds, Kinds{1});
    EXPECT_EQ(list.events(), (Events{a, b, c, d}));
    EXPECT_TRUE(isHeard(d));
}

TEST_F(ThreeEvents, MayHoldTheSameEventTwiceAndHearItOnce)
{
    list.add(a);

    EXPECT_EQ(list.events(), (Events{a, b, c, a}));
    EXPECT_TRUE(isHeard(a));
}

TEST_F(ThreeEvents, AreAddedByReferenceToTheirOwnPlace)
{
    for (int i = 0; i < 20; ++i)
        list.add(list.events().front());

    EXPECT_EQ(list.size(), 23U);
    EXPECT_EQ(list.eventAt(22), a);
    EXPECT_TRUE(isHeard(a));
}

TEST_F(ThreeEvents, AreNotJoinedByNone)
{
    EXPECT_EQ(thrownBy([&] { list.add(nullptr); }), Result::InvalidArgument);

    EXPECT_EQ(list.events(), (Events{a, b, c}));
    EXPECT_TRUE(listener.types.empty());
    EXPECT_TRUE(isHeard(c));
}

TEST_F(ThreeEvents, AreJoinedByAllOfAnotherList)
{
    const auto d = named("D");
    const auto e = named("E");
    const EventList other = listOf({d, e});

    list.append(other);

    EXPECT_EQ(listener.types, Kinds{ChangeContext::EventListChanged});
    EXPECT_EQ(list.events(), (Events{a, b, c, d, e}));
    EXPECT_EQ(other.events(), (Events{d, e}));
    EXPECT_TRUE(isHeard(e));
    EXPECT_TRUE(isHeard(a));
}

TEST_F(ThreeEvents, StandTwiceAfterTheListIsAppendedToItself)
{
    list.append(list);

    EXPECT_EQ(list.events(), (Events{a, b, c, a, b, c}));
    EXPECT_EQ(listener.types, Kinds{ChangeContext::EventListChanged});
    EXPECT_TRUE(isHeard(a));
}

TEST_F(ThreeEvents, AreJoinedByAPartOfAnotherList)
{
    const EventList other = listOf({named("D"), named("E"), named("F")});

    list.append(other, 1, 2);

    EXPECT_EQ(rollsOf(list), "ABCEF");
    EXPECT_EQ(listener.types, Kinds{ChangeContext::EventListChanged});
    EXPECT_TRUE(isHeard(list.eventAt(4)));
}

TEST_F(ThreeEvents, AreJoinedByAPartOfThemselves)
{
    list.append(list, 1, 2);
    EXPECT_EQ(list.events(), (Events{a, b, c, b, c}));

    list.append(list, 0, 5);
    EXPECT_EQ(list.events(), (Events{a, b, c, b, c, a, b, c, b, c}));
}

TEST_F(ThreeEvents, AreNotTouchedByAppendingNothingFromAnywhere)
{
    const EventList other = listOf({named("D"), named("E"), named("F")});

    list.append(other, 0, 0);
    list.append(other, 3, 0);
    list.append(other, 4, 0);
    list.append(other, Huge, 0);

    EXPECT_TRUE(listener.types.empty());
    EXPECT_EQ(list.size(), 3U);
    EXPECT_TRUE(isHeard(a));
}

TEST_F(ThreeEvents, AreNotTouchedByAppendingPastTheEndOfTheOther)
{
    const EventList other = listOf({named("D"), named("E"), named("F")});

    EXPECT_EQ(thrownBy([&] { list.append(other, 3, 1); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { list.append(other, 2, 2); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { list.append(other, 0, 4); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { list.append(other, Huge, 1); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { list.append(other, 1, Huge); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { list.append(other, Huge, 3); }), Result::OutOfRange);

    EXPECT_EQ(list.events(), (Events{a, b, c}));
    EXPECT_TRUE(listener.types.empty());
}

TEST_F(ThreeEvents, TakeTheLastOfAnother)
{
    const EventList other = listOf({named("D"), named("E"), named("F")});

    list.append(other, 2, 1);

    EXPECT_EQ(rollsOf(list), "ABCF");
}

TEST_F(ThreeEvents, AreAnnouncedAgainWhenAnEmptyListIsAppended)
{
    list.append(EventList());

    EXPECT_EQ(listener.types.size(), 1U);
    EXPECT_EQ(list.size(), 3U);
}

TEST_F(ThreeEvents, LoseTheOneInTheMiddle)
{
    list.erase(1, 1);

    EXPECT_EQ(list.events(), (Events{a, c}));
    EXPECT_EQ(listener.types, Kinds{ChangeContext::EventListChanged});
    EXPECT_EQ(timesHeard(b), 0U);
    EXPECT_TRUE(isHeard(a));
    EXPECT_TRUE(isHeard(c));
}

TEST_F(ThreeEvents, CanAllBeErased)
{
    list.erase(0, 3);

    EXPECT_TRUE(list.isEmpty());
    EXPECT_EQ(timesHeard(a), 0U);
}

TEST_F(ThreeEvents, AreNotTouchedByErasingNothingOrPastTheEnd)
{
    list.erase(0, 0);
    list.erase(3, 0);
    list.erase(Huge, 0);
    EXPECT_TRUE(listener.types.empty());

    EXPECT_EQ(thrownBy([&] { list.erase(3, 1); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { list.erase(2, 2); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { list.erase(1, Huge); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { list.erase(Huge, 2); }), Result::OutOfRange);
    EXPECT_EQ(list.events(), (Events{a, b, c}));
    EXPECT_TRUE(listener.types.empty());
}

TEST_F(ThreeEvents, StillHearAnEventOfWhichOneOfTwoEntriesIsErased)
{
    list.add(a);

    list.erase(0, 1);

    EXPECT_EQ(list.events(), (Events{b, c, a}));
    EXPECT_TRUE(isHeard(a));
}

TEST_F(ThreeEvents, LoseThoseThatTheOtherListHolds)
{
    const EventList other = listOf({c, named("D"), a});

    list.remove(other);

    EXPECT_EQ(list.events(), Events{b});
    EXPECT_EQ(listener.types, Kinds{ChangeContext::EventListChanged});
    EXPECT_EQ(other.size(), 3U);
    EXPECT_TRUE(isHeard(b));
    EXPECT_EQ(timesHeard(a), 0U);
}

TEST_F(ThreeEvents, LoseBothEntriesOfAnEvent)
{
    list.add(a);
    ASSERT_EQ(list.size(), 4U);

    list.remove(listOf({a}));

    EXPECT_EQ(list.events(), (Events{b, c}));
}

TEST_F(ThreeEvents, AreKeptWhenOnlyTheirCopiesAreRemoved)
{
    EventList copies;
    copies.copyFrom(list);

    list.remove(copies);

    EXPECT_EQ(list.events(), (Events{a, b, c}));
    EXPECT_EQ(listener.types.size(), 1U);
}

TEST_F(ThreeEvents, AreAllGoneAfterTheListIsRemovedFromItself)
{
    list.remove(list);

    EXPECT_TRUE(list.isEmpty());
    EXPECT_EQ(listener.types, Kinds{ChangeContext::EventListChanged});
    EXPECT_EQ(timesHeard(a), 0U);
}

RC_GTEST_PROP(EventList, RemovingKeepsTheOrderOfTheRest, ())
{
    Events pool;
    for (int i = 0; i < 8; ++i)
        pool.push_back(named("A"));
    const auto picks = rc::gen::container<std::vector<std::size_t>>(rc::gen::inRange<std::size_t>(0, pool.size()));
    EventList list;
    EventList other;
    Events expected;
    const auto others = *picks;
    for (const std::size_t pick : others)
        other.add(pool[pick]);
    for (const std::size_t pick : *picks) {
        list.add(pool[pick]);
        if (std::find(others.begin(), others.end(), pick) == others.end())
            expected.push_back(pool[pick]);
    }

    list.remove(other);

    RC_ASSERT(list.events() == expected);
}

TEST_F(ThreeEvents, AreAllClearedWithOneNotification)
{
    list.clear();

    EXPECT_TRUE(list.isEmpty());
    EXPECT_EQ(listener.types, Kinds{ChangeContext::EventListChanged});
    EXPECT_EQ(timesHeard(a), 0U);
}

TEST(EventList, ClearingAnEmptyListNotifiesToo)
{
    EventList list(0);
    RecordingListener listener;
    list.addListener(&listener);

    list.clear();

    EXPECT_EQ(listener.listKinds, Kinds{0});
}

TEST_F(ThreeEvents, AreReplacedByCopiesInTwoNotifications)
{
    const auto d = named("D");
    d->setComment("note");
    d->addFlaw(4);

    list.copyFrom(listOf({d}));

    EXPECT_EQ(listener.listKinds, (Kinds{1, 1}));
    ASSERT_EQ(list.size(), 1U);
    EXPECT_NE(list.eventAt(0), d);
    EXPECT_EQ(list.at(0).rollName(), "D");
    EXPECT_EQ(list.at(0).comment(), "note");
    EXPECT_EQ(list.at(0).flaws(), (std::vector<std::int32_t>{0, 4}));
    EXPECT_TRUE(isHeard(list.eventAt(0)));
    EXPECT_EQ(timesHeard(d), 0U);
    EXPECT_EQ(timesHeard(a), 0U);
}

TEST_F(ThreeEvents, BecomeTheirOwnCopiesWhenTheListIsCopiedFromItself)
{
    list.copyFrom(list);

    EXPECT_EQ(rollsOf(list), "ABC");
    EXPECT_EQ(listener.listKinds, (Kinds{1, 1}));
    EXPECT_FALSE(list.contains(a));
    EXPECT_FALSE(list.contains(b));
    EXPECT_FALSE(list.contains(c));
    EXPECT_TRUE(isHeard(list.eventAt(2)));
}

TEST(EventList, TheCopyOfAHealedEventKeepsItsKindAndLosesItsMembers)
{
    const auto healed = std::make_shared<HealedEvent>();
    healed->addEvent(playing("00:00:00:00", "00:00:01:00"));
    EventList list;

    list.copyFrom(listOf({healed}));

    ASSERT_EQ(list.size(), 1U);
    EXPECT_EQ(list.at(0).eventKind(), 1);
    EXPECT_EQ(dynamic_cast<HealedEvent*>(&list.at(0)), nullptr);
    EXPECT_EQ(timecodesOf(list.at(0)), timecodesOf(*healed));
}

TEST(EventList, TheRangeGoesFromTheEarliestStartToTheLatestEndOnEachSide)
{
    const EventList list = listOf({makeEvent("A", "00:00:30:00", "00:00:40:00", "01:00:10:00", "01:00:20:00"),
                                   makeEvent("A", "00:00:10:00", "00:00:50:00", "01:00:05:00", "01:00:45:00"),
                                   makeEvent("A", "00:00:20:00", "00:00:21:00", "01:00:50:00", "01:00:51:00")});

    const TimecodeRange source = list.sourceRange();
    const TimecodeRange destination = list.destinationRange();

    EXPECT_EQ(source.start.toString(), "00:00:10:00");
    EXPECT_EQ(source.end.toString(), "00:00:50:00");
    EXPECT_EQ(destination.start.toString(), "01:00:05:00");
    EXPECT_EQ(destination.end.toString(), "01:00:51:00");
}

TEST(EventList, AnInvalidEventDoesNotCountForTheRange)
{
    const auto notVideo = playing("00:00:01:00", "00:00:50:00");
    notVideo->addFlaw(4);
    const EventList list =
        listOf({notVideo, playing("00:00:20:00", "00:00:10:00"), playing("00:00:30:00", "00:00:31:00")});

    EXPECT_EQ(list.destinationRange().start.toString(), "00:00:30:00");
    EXPECT_EQ(list.destinationRange().end.toString(), "00:00:31:00");
}

TEST(EventList, WithInvalidEventsAloneTheRangeIsEmptyAtZero)
{
    const EventList list = listOf({playing("00:00:20:00", "00:00:10:00"), named("A")});

    for (const TimecodeRange& range : {list.sourceRange(), list.destinationRange()}) {
        EXPECT_EQ(range.start.toString(), "00:00:00:00");
        EXPECT_EQ(range.end.toString(), "00:00:00:00");
        EXPECT_TRUE(range.start.isInitialized());
    }
}

TEST(EventList, TheRangeReachesTheEndsOfTheDay)
{
    const TimecodeRange last = listOf({playing("23:59:59:24", "23:59:59:24")}).destinationRange();
    const TimecodeRange first = listOf({playing("00:00:00:00", "00:00:00:00")}).destinationRange();
    const TimecodeRange day = listOf({playing("00:00:00:00", "23:59:59:24")}).destinationRange();

    EXPECT_EQ(last.start.toString(), "23:59:59:24");
    EXPECT_EQ(last.end.toString(), "23:59:59:24");
    EXPECT_EQ(first.start.toString(), "00:00:00:00");
    EXPECT_EQ(first.end.toString(), "00:00:00:00");
    EXPECT_EQ(day.start.toString(), "00:00:00:00");
    EXPECT_EQ(day.end.toString(), "23:59:59:24");
}

TEST(EventList, AnEmptyListHasNoRange)
{
    EXPECT_EQ(thrownBy([] { EventList().sourceRange(); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([] { EventList().destinationRange(); }), Result::NotAvailable);
}

TEST(EventList, ShiftingTheDestinationMovesBothEndsOfItsEventsAndLeavesTheSource)
{
    EventList list(core::ListKind::Old);
    fill(list, {playing("00:00:10:00", "00:00:11:00"), playing("00:00:20:00", "00:00:22:00")});
    RecordingListener listener;
    list.addListener(&listener);

    list.shiftDestination(Timecode("01:00:00:05"), true);

    EXPECT_EQ(timecodesOf(list.at(0)), "00:10:00:00 00:10:01:00 01:00:10:05 01:00:11:05");
    EXPECT_EQ(timecodesOf(list.at(1)), "00:10:00:00 00:10:01:00 01:00:20:05 01:00:22:05");
    EXPECT_EQ(list.at(1).motionSpeed(), 0.5);
    EXPECT_EQ(listener.listKinds, Kinds{0});

    list.shiftDestination(Timecode("01:00:00:05"), false);
    EXPECT_EQ(timecodesOf(list.at(0)), "00:10:00:00 00:10:01:00 00:00:10:00 00:00:11:00");
    EXPECT_EQ(listener.listKinds, (Kinds{0, 0}));
}

TEST(EventList, ShiftingTheSourceLeavesTheDestination)
{
    EventList list = listOf({makeEvent("A", "01:00:00:00", "01:00:01:00", "00:00:10:00", "00:00:11:00")});

    list.shiftSource(Timecode("00:30:00:00"), true);
    EXPECT_EQ(timecodesOf(list.at(0)), "01:30:00:00 01:30:01:00 00:00:10:00 00:00:11:00");

    list.shiftSource(Timecode("01:30:00:00"), false);
    EXPECT_EQ(timecodesOf(list.at(0)), "00:00:00:00 00:00:01:00 00:00:10:00 00:00:11:00");
}

TEST(EventList, ShiftsBackwardByExactlyTheFirstStartAndNotByAFrameMore)
{
    EventList list = listOf({playing("00:00:20:00", "00:00:21:00"), playing("00:00:10:00", "00:00:11:00")});
    RecordingListener listener;
    list.addListener(&listener);

    EXPECT_EQ(thrownBy([&] { list.shiftDestination(Timecode("00:00:10:01"), false); }), Result::OutOfRange);
    EXPECT_EQ(timecodesOf(list.at(0)), "00:10:00:00 00:10:01:00 00:00:20:00 00:00:21:00");
    EXPECT_EQ(timecodesOf(list.at(1)), "00:10:00:00 00:10:01:00 00:00:10:00 00:00:11:00");
    EXPECT_TRUE(listener.types.empty());

    list.shiftDestination(Timecode("00:00:10:00"), false);
    EXPECT_EQ(timecodesOf(list.at(0)), "00:10:00:00 00:10:01:00 00:00:10:00 00:00:11:00");
    EXPECT_EQ(timecodesOf(list.at(1)), "00:10:00:00 00:10:01:00 00:00:00:00 00:00:01:00");
}

TEST(EventList, ShiftsForwardUpToTheLastFrameOfTheDayAndNotByAFrameMore)
{
    EventList list = listOf({playing("23:00:00:00", "23:59:59:20"), playing("22:00:00:00", "22:00:01:00")});

    EXPECT_EQ(thrownBy([&] { list.shiftDestination(Timecode("00:00:00:05"), true); }), Result::OutOfRange);
    EXPECT_EQ(list.at(0).dstOut().toString(), "23:59:59:20");
    EXPECT_EQ(list.at(1).dstIn().toString(), "22:00:00:00");

    list.shiftDestination(Timecode("00:00:00:04"), true);
    EXPECT_EQ(timecodesOf(list.at(0)), "00:10:00:00 00:10:01:00 23:00:00:04 23:59:59:24");
    EXPECT_EQ(timecodesOf(list.at(1)), "00:10:00:00 00:10:01:00 22:00:00:04 22:00:01:04");
}

TEST(EventList, ShiftingCountsDropFramesAsFrames)
{
    const TestProject project(Framerate(30, 1));
    EventList list = listOf({playing("00:00:59:00", "00:00:59:29")});

    list.shiftDestination(Timecode("00:00:00:01"), true);

    EXPECT_EQ(timecodesOf(list.at(0)), "00:10:00:00 00:10:01:00 00:00:59:01 00:01:00:02");
}

TEST(EventList, InvalidEventsStayWhereTheyAreInAShift)
{
    const auto notVideo = playing("00:00:05:00", "00:00:06:00");
    notVideo->addFlaw(4);
    EventList list = listOf({notVideo, playing("00:00:20:00", "00:00:21:00")});

    list.shiftDestination(Timecode("00:00:20:00"), false);

    EXPECT_EQ(notVideo->dstIn().toString(), "00:00:05:00");
    EXPECT_EQ(list.at(1).dstIn().toString(), "00:00:00:00");
}

TEST(EventList, ShiftingAnEmptyListDoesNothing)
{
    EventList list;

    EXPECT_EQ(thrownBy([&] { list.shiftSource(Timecode("23:00:00:00"), false); }), Result::Ok);
    EXPECT_EQ(thrownBy([&] { list.shiftDestination(Timecode("23:00:00:00"), true); }), Result::Ok);
    EXPECT_TRUE(list.isEmpty());
}

TEST(EventList, AShiftThatFailsHalfwayKeepsWhatItMovedAndLeavesTheListDeaf)
{
    TestProject project(Framerate(30, 0));
    const auto first = playing("00:00:10:00", "00:00:11:00");
    const auto second = playing("00:00:20:00", "00:00:20:29");
    const auto third = playing("00:00:30:00", "00:00:31:00");
    EventList list = listOf({first, second, third});
    RecordingListener listener;
    list.addListener(&listener);
    project.framerate = Framerate(25, 0);

    EXPECT_EQ(thrownBy([&] { list.shiftDestination(Timecode("00:00:01:00"), true); }), Result::FrameOutOfRate);

    EXPECT_EQ(timecodesOf(*first), "00:10:00:00 00:10:01:00 00:00:11:00 00:00:12:00");
    EXPECT_EQ(timecodesOf(*second), "00:10:00:00 00:10:01:00 00:00:20:00 00:00:20:29");
    EXPECT_EQ(timecodesOf(*third), "00:10:00:00 00:10:01:00 00:00:30:00 00:00:31:00");
    for (const auto& event : {first, second, third})
        event->setRollName("not heard");
    EXPECT_TRUE(listener.types.empty());

    list.setListening(true);
    first->setRollName("heard");
    EXPECT_EQ(listener.types.size(), 1U);
}

TEST_F(ThreeEvents, GiveWayToWhatAReadingHasReadWhenItBreaksOff)
{
    core::serialize::ByteArchive whole;
    whole << listOf({playing("00:00:01:00", "00:00:02:00"), playing("00:00:02:00", "00:00:03:00")});
    core::serialize::ByteArchive brokenOff;
    brokenOff.assign(whole.data(), whole.size() - 1);

    EXPECT_EQ(thrownBy([&] { brokenOff >> list; }), Result::EndOfData);

    EXPECT_TRUE(listener.types.empty());
    EXPECT_FALSE(list.contains(a));
    EXPECT_EQ(timesHeard(a), 0U);
    ASSERT_EQ(list.size(), 1U);
    EXPECT_TRUE(isHeard(list.eventAt(0)));
}

TEST(EventList, HearsItsEventsAfterAShift)
{
    EventList list = listOf({playing("00:00:10:00", "00:00:11:00")});
    list.shiftDestination(Timecode("00:00:01:00"), true);
    RecordingListener listener;
    list.addListener(&listener);

    list.at(0).setRollName("B");

    EXPECT_EQ(listener.types.size(), 1U);
}

RC_GTEST_PROP(EventList, AShiftMovesEachEventByTheFramesOfItsOffset, ())
{
    const TestProject project(Framerate::fromLabel("29.97 dfps"));
    const auto place = rc::gen::inRange<std::int32_t>(0, 100000);
    const std::int32_t offset = *place;
    std::vector<std::int32_t> starts = *rc::gen::container<std::vector<std::int32_t>>(place);
    EventList list;
    for (const std::int32_t start : starts) {
        const auto event = std::make_shared<EventBase>();
        event->setTimecodes(Timecode(start), Timecode(start + 50), Timecode(2 * start), Timecode(2 * start + 25));
        list.add(event);
    }

    list.shiftSource(Timecode(offset), true);

    for (std::size_t i = 0; i < starts.size(); ++i) {
        RC_ASSERT(list.at(i).srcIn().toFrameCount() == starts[i] + offset);
        RC_ASSERT(list.at(i).srcOut().toFrameCount() == starts[i] + 50 + offset);
        RC_ASSERT(list.at(i).dstIn().toFrameCount() == 2 * starts[i]);
    }
}

class Merging : public testing::Test {
protected:
    const std::shared_ptr<EventBase> one = playing("00:00:01:00", "00:00:02:00");
    const std::shared_ptr<EventBase> two = playing("00:00:02:00", "00:00:03:00");
    const std::shared_ptr<EventBase> three = playing("00:00:03:00", "00:00:04:00");

    static std::shared_ptr<EventBase> copyOf(const std::shared_ptr<EventBase>& event)
    {
        return std::make_shared<EventBase>(*event);
    }
};

TEST_F(Merging, AnIdenticalListKeepsTheVeryObjectsInTheOrderOfTheOther)
{
    EventList list(core::ListKind::New);
    fill(list, {one, two, three});
    RecordingListener listener;
    list.addListener(&listener);

    list.mergeFrom(listOf({copyOf(three), copyOf(one), copyOf(two)}));

    EXPECT_EQ(list.events(), (Events{three, one, two}));
    EXPECT_EQ(list.listKind(), 1);
    EXPECT_EQ(listener.listKinds, (Kinds{1, 1}));
}

TEST_F(Merging, KeptEventsComeFirstAndAddedOnesBehindThem)
{
    EventList list = listOf({one, two});
    const auto sameAsTwo = copyOf(two);
    const auto four = playing("00:00:04:00", "00:00:05:00");
    const EventList other = listOf({three, sameAsTwo, four});

    list.mergeFrom(other);

    EXPECT_EQ(list.events(), (Events{two, three, four}));
    EXPECT_EQ(other.events(), (Events{three, sameAsTwo, four}));
}

TEST_F(Merging, AnEventMatchesOnceAndTheFirstRemainingIsTaken)
{
    const auto second = copyOf(one);
    EventList list = listOf({one, two, second});
    const auto third = copyOf(one);

    list.mergeFrom(listOf({copyOf(one), copyOf(one), third}));

    EXPECT_EQ(list.events(), (Events{one, second, third}));
}

TEST_F(Merging, OnlyTheTimecodesDecide)
{
    EventList list = listOf({one});
    const auto renamed = copyOf(one);
    renamed->setRollName("other roll");
    const auto longer = playing("00:00:01:00", "00:00:02:01");

    list.mergeFrom(listOf({renamed, longer}));

    EXPECT_EQ(list.events(), (Events{one, longer}));
}

TEST_F(Merging, TheListWithItselfKeepsAllInTheirOrder)
{
    EventList list = listOf({two, one, two});

    list.mergeFrom(list);

    EXPECT_EQ(list.events(), (Events{two, one, two}));
}

TEST_F(Merging, WithAnEmptyListNothingIsLeft)
{
    EventList list = listOf({one});
    RecordingListener listener;
    list.addListener(&listener);

    list.mergeFrom(EventList());
    EXPECT_TRUE(list.isEmpty());
    EXPECT_EQ(listener.types.size(), 2U);

    list.mergeFrom(listOf({two}));
    EXPECT_EQ(list.events(), Events{two});
}

TEST_F(Merging, TheListHearsKeptAndAddedEventsAndNoneThatWent)
{
    EventList list = listOf({one, two});
    list.mergeFrom(listOf({copyOf(one), three}));
    RecordingListener listener;
    list.addListener(&listener);

    two->setRollName("gone");
    EXPECT_TRUE(listener.types.empty());
    one->setRollName("kept");
    three->setRollName("added");
    EXPECT_EQ(listener.types.size(), 2U);
}

/// The steps of a merge, one by one.
Events mergedByScanning(Events own, const Events& others)
{
    Events kept;
    Events added;
    for (const auto& event : others) {
        const auto match = std::find_if(own.begin(), own.end(), [&](const auto& candidate) {
            return candidate != nullptr && candidate->hasSameTimecodes(*event);
        });
        if (match == own.end()) {
            added.push_back(event);
        } else {
            kept.push_back(*match);
            match->reset();
        }
    }
    kept.insert(kept.end(), added.begin(), added.end());
    return kept;
}

RC_GTEST_PROP(EventList, MergingGivesWhatAScanGives, ())
{
    const auto makeEvents = [] {
        Events events;
        const auto places = *rc::gen::container<std::vector<int>>(rc::gen::inRange(0, 4));
        for (const int place : places) {
            events.push_back(std::make_shared<EventBase>());
            events.back()->setTimecodes(Timecode(place % 2), Timecode(10), Timecode(place), Timecode(10));
        }
        return events;
    };
    const Events own = makeEvents();
    const Events others = makeEvents();
    EventList list = listOf(own);

    list.mergeFrom(listOf(others));

    RC_ASSERT(list.events() == mergedByScanning(own, others));
}

} // namespace
} // namespace cadrel::tests
