// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"
#include "core/settings/Settings.h"
#include "core/time/Timecode.h"
#include "tests/core/change/AmpleTime.h"
#include "tests/support/SecondsOf.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::EventBase;
using core::EventKind;
using core::EventList;
using core::HealedEvent;
using core::HealMode;
using core::Timecode;
using util::Result;

using Event = std::shared_ptr<EventBase>;
using Events = std::vector<Event>;

/// An event of so many frames that stands at one frame of the new programme and ten seconds later in the old one.
Event stretch(int newIn, int length)
{
    constexpr int Behind = 250;
    const auto event = std::make_shared<EventBase>();
    event->setTimecodes(Timecode(newIn + Behind), Timecode(newIn + Behind + length), Timecode(newIn),
                        Timecode(newIn + length));
    return event;
}

std::shared_ptr<HealedEvent> healedFrom(const Events& members)
{
    const auto healed = std::make_shared<HealedEvent>();
    for (const auto& member : members)
        healed->addEvent(member);
    healed->setRollName("Healed Event 007");
    return healed;
}

EventList listOf(const Events& events)
{
    EventList list;
    for (const auto& event : events)
        list.add(event);
    return list;
}

const Events& membersOf(const EventBase& event)
{
    return dynamic_cast<const HealedEvent&>(event).healedEvents().events();
}

std::vector<std::uint32_t> numbersOf(const EventList& list)
{
    std::vector<std::uint32_t> numbers;
    for (const auto& event : list.events())
        numbers.push_back(event->eventNumber());
    return numbers;
}

const EventList NoReference;

} // namespace

//  before   |--a--|--b--|--c--|   |--d--|--e--|
//  after    |------ 001 ------|   |--d--|--e--|
TEST(EventListHeal, JoinsTheSelectionAndLeavesTheOthersApart)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(10, 10);
    const Event c = stretch(20, 10);
    const Event d = stretch(50, 10);
    const Event e = stretch(60, 10);
    EventList list = listOf({e, c, a, d, b});

    list.heal(listOf({a, b, c}), NoReference, HealMode::Normal);

    ASSERT_EQ(list.size(), 3u);
    EXPECT_EQ(membersOf(list.at(0)), (Events{a, b, c}));
    EXPECT_EQ(list.at(0).rollName(), "Healed Event 001");
    EXPECT_EQ(list.eventAt(1), d);
    EXPECT_EQ(list.eventAt(2), e);
    EXPECT_EQ(numbersOf(list), (std::vector<std::uint32_t>{1, 2, 3}));
}

TEST(EventListHeal, ModeNoneGivesBackTheMembersOfAHealedEvent)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(10, 10);
    const Event c = stretch(20, 10);
    const Event before = stretch(900, 10);
    const Event between = stretch(15, 2);
    const Event healed = healedFrom({c, a, b});
    before->setEventNumber(12);
    EventList list = listOf({before, healed, between});

    list.heal(listOf({healed}), NoReference, HealMode::None);

    EXPECT_EQ(list.events(), (Events{a, b, between, c, before}));
    EXPECT_EQ(numbersOf(list), (std::vector<std::uint32_t>{1, 2, 3, 4, 5}));
}

TEST(EventListHeal, HealedEventsAreNamedInTheOrderOfTheNewProgramme)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(10, 10);
    const Event c = stretch(50, 10);
    const Event d = stretch(60, 10);
    const Event earlierHealed = healedFrom({stretch(200, 10), stretch(210, 10)});
    EventList list = listOf({earlierHealed, d, c, b, a});

    list.heal(listOf({a, b, c, d}), NoReference, HealMode::Normal);

    ASSERT_EQ(list.size(), 3u);
    EXPECT_EQ(membersOf(list.at(0)), (Events{a, b}));
    EXPECT_EQ(list.at(0).rollName(), "Healed Event 001");
    EXPECT_EQ(membersOf(list.at(1)), (Events{c, d}));
    EXPECT_EQ(list.at(1).rollName(), "Healed Event 002");
    EXPECT_EQ(list.eventAt(2), earlierHealed);
    EXPECT_EQ(earlierHealed->rollName(), "Healed Event 003");
}

TEST(EventListHeal, AHealedEventInTheSelectionIsHealedAnew)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(10, 10);
    const Event c = stretch(20, 10);
    const Event healed = healedFrom({a, b});
    EventList list = listOf({healed, c});

    list.heal(listOf({healed, c}), NoReference, HealMode::Normal);

    ASSERT_EQ(list.size(), 1u);
    EXPECT_NE(list.eventAt(0), healed);
    EXPECT_EQ(membersOf(list.at(0)), (Events{a, b, c}));
}

//  selection   |--a--|   |--b--|
//  new EDL              |i|
TEST(EventListHeal, TheReferenceListShowsTheInserts)
{
    const Events events = {stretch(0, 10), stretch(30, 10)};
    EventList withInsert = listOf(events);
    EventList withoutInsert = listOf(events);

    withInsert.heal(listOf(events), listOf({stretch(15, 5)}), HealMode::GapsWithoutInserts);
    withoutInsert.heal(listOf(events), listOf({stretch(45, 5)}), HealMode::GapsWithoutInserts);

    EXPECT_EQ(withInsert.size(), 2u);
    EXPECT_EQ(withoutInsert.size(), 1u);
}

TEST(EventListHeal, SelectedEventsThatAreNotInTheListStayOut)
{
    const Event a = stretch(0, 10);
    const Event stranger = stretch(10, 10);
    EventList list = listOf({a});

    list.heal(listOf({a, stranger}), NoReference, HealMode::Normal);

    EXPECT_EQ(list.events(), Events{a});
}

TEST(EventListHeal, AnEmptySelectionSortsAndNumbersTheList)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(10, 10);
    EventList list = listOf({b, a});

    list.heal(EventList(), NoReference, HealMode::Normal);

    EXPECT_EQ(list.events(), (Events{a, b}));
    EXPECT_EQ(numbersOf(list), (std::vector<std::uint32_t>{1, 2}));
}

TEST(EventListHeal, TheListAsItsOwnSelectionIsHealedWhole)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(10, 10);
    EventList list = listOf({b, a});

    list.heal(list, NoReference, HealMode::Normal);

    ASSERT_EQ(list.size(), 1u);
    EXPECT_EQ(membersOf(list.at(0)), (Events{a, b}));
}

TEST(EventListHeal, SendsOneNotificationAndListensToWhatTheListHoldsNow)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(10, 10);
    const Event c = stretch(50, 10);
    EventList list = listOf({a, b, c});
    RecordingListener listener;
    list.addListener(&listener);

    list.heal(listOf({a, b}), NoReference, HealMode::Normal);
    EXPECT_EQ(listener.listKinds, std::vector<std::int32_t>{core::ListKind::Change});
    EXPECT_EQ(listener.types.size(), 1u);

    listener.forget();
    list.at(0).setClipName("healed");
    c->setClipName("c");
    EXPECT_EQ(listener.types.size(), 2u);

    listener.forget();
    a->setClipName("a member");
    EXPECT_TRUE(listener.types.empty());
    list.removeListener(&listener);
}

TEST(EventListHeal, AFailureLosesNoEvent)
{
    TestProject project(core::Framerate(30, 0));
    const Event a = stretch(0, 10);
    const Event healed = healedFrom({stretch(10, 5), stretch(15, 5)});
    const Event c = stretch(30, 10);
    const EventList reference = listOf({makeEvent("R", "00:00:00:00", "00:00:01:00", "00:00:00:27", "00:00:01:00")});
    const Events events = {c, healed, a};
    EventList list = listOf(events);
    project.framerate = core::Framerate(25, 0);

    EXPECT_EQ(thrownBy([&] { list.heal(listOf(events), reference, HealMode::GapsWithoutInserts); }),
              Result::FrameOutOfRate);

    EXPECT_EQ(list.events(), events);
    EXPECT_EQ(membersOf(*healed).size(), 2u);
}

TEST(EventListHeal, WithoutAConverterForTheNamesNoEventIsLost)
{
    const Events events = {stretch(0, 10), stretch(10, 10), healedFrom({stretch(40, 5)})};
    EventList list = listOf(events);
    util::StringUtil::setConverter(nullptr);

    EXPECT_EQ(thrownBy([&] {
                  list.heal(listOf({events[0], events[1]}), NoReference, HealMode::Normal);
              }),
              Result::NotAvailable);
    EXPECT_EQ(list.events(), events);
    EXPECT_EQ(thrownBy([&] { list.heal(listOf({events[0]}), NoReference, HealMode::Normal); }), Result::NotAvailable);
    EXPECT_EQ(list.events(), events);
}

TEST(EventListHeal, AFailureLeavesTheListListeningToItsEvents)
{
    const Events events = {stretch(0, 10), stretch(10, 10)};
    EventList list = listOf(events);
    RecordingListener listener;
    list.addListener(&listener);
    util::StringUtil::setConverter(nullptr);

    EXPECT_EQ(thrownBy([&] { list.heal(list, NoReference, HealMode::Normal); }), Result::NotAvailable);
    EXPECT_TRUE(listener.types.empty());
    for (const Event& event : events)
        event->setClipName("changed");

    EXPECT_EQ(listener.types.size(), 2u);
    list.removeListener(&listener);
}

namespace {

/// Events made at 30 frames, one of which starts in frame 27, in a project that has come down to 25.
///
///     |--a--|   |--lost--|--c--|--d--|
class HealedAtThirty {
public:
    HealedAtThirty()
    {
        project.framerate = core::Framerate(25, 0);
        for (const Event& event : {a, lost, c, d, healed})
            event->revalidate();
    }

    TestProject project{core::Framerate(30, 0)};
    const Event a = makeEvent("A", "01:00:00:00", "01:00:00:10", "00:00:00:00", "00:00:00:10");
    const Event lost = makeEvent("L", "01:00:00:27", "01:00:01:00", "00:00:00:27", "00:00:01:00");
    const Event c = makeEvent("C", "01:00:01:00", "01:00:01:10", "00:00:01:00", "00:00:01:10");
    const Event d = makeEvent("D", "01:00:01:10", "01:00:01:20", "00:00:01:10", "00:00:01:20");
    const Event healed = healedFrom({d, lost, a, c});
    EventList list = listOf({healed});
};

} // namespace

TEST(EventListHeal, ModeNoneGivesBackAlsoAMemberThatHasBecomeInvalid)
{
    HealedAtThirty at;
    ASSERT_TRUE(at.lost->hasFlaw(core::EventFlaw::TimecodeInvalid));
    ASSERT_TRUE(at.healed->isValid());
    EXPECT_TRUE(at.list.canHeal(at.list, NoReference, HealMode::None));

    at.list.heal(at.list, NoReference, HealMode::None);

    EXPECT_EQ(at.list.events(), (Events{at.a, at.lost, at.c, at.d}));
    EXPECT_EQ(numbersOf(at.list), (std::vector<std::uint32_t>{1, 2, 3, 4}));
}

TEST(EventListHeal, AMemberThatHasBecomeInvalidStaysAsItIsBesideTheOthersThatAreHealedAnew)
{
    HealedAtThirty at;
    EXPECT_TRUE(at.list.canHeal(at.list, NoReference, HealMode::Normal));

    at.list.heal(at.list, NoReference, HealMode::Normal);

    ASSERT_EQ(at.list.size(), 3u);
    EXPECT_EQ(at.list.eventAt(0), at.a);
    EXPECT_EQ(at.list.eventAt(1), at.lost);
    EXPECT_EQ(membersOf(at.list.at(2)), (Events{at.c, at.d}));
    EXPECT_EQ(at.list.at(2).rollName(), "Healed Event 001");
    EXPECT_EQ(numbersOf(at.list), (std::vector<std::uint32_t>{1, 2, 3}));
    EXPECT_EQ(timecodesOf(*at.lost), "01:00:00:27 01:00:01:00 00:00:00:27 00:00:01:00");
}

TEST(EventListCanHeal, AMemberThatHasBecomeInvalidCounts)
{
    HealedAtThirty at;
    const Event withTwo = healedFrom({at.a, at.lost});
    ASSERT_TRUE(withTwo->isValid());
    const EventList list = listOf({withTwo, at.c, at.d});

    EXPECT_TRUE(list.canHeal(listOf({withTwo}), NoReference, HealMode::None));
    EXPECT_TRUE(list.canHeal(listOf({withTwo}), NoReference, HealMode::Normal));
    // Three before, and three behind: a, the invalid one, and c joined to d.
    EXPECT_FALSE(list.canHeal(list, NoReference, HealMode::Normal));
    EXPECT_TRUE(list.canHeal(list, NoReference, HealMode::None));
}

TEST(EventListCanHeal, SaysWhetherTheNumberOfEventsWouldChange)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(10, 10);
    const Event c = stretch(30, 10);
    const EventList list = listOf({a, b, c});

    EXPECT_TRUE(list.canHeal(listOf({a, b}), NoReference, HealMode::Normal));
    EXPECT_FALSE(list.canHeal(listOf({b, c}), NoReference, HealMode::Normal));
    EXPECT_TRUE(list.canHeal(listOf({b, c}), NoReference, HealMode::GapsWithInserts));
    EXPECT_FALSE(list.canHeal(listOf({b, c}), listOf({stretch(22, 5)}), HealMode::GapsWithoutInserts));
    EXPECT_FALSE(list.canHeal(listOf({a, b}), NoReference, HealMode::None));
    EXPECT_FALSE(list.canHeal(listOf({a}), NoReference, HealMode::Normal));
}

TEST(EventListCanHeal, AHealedEventCanBeTakenApartButNotHealedTheSameWayAgain)
{
    const Event healed = healedFrom({stretch(0, 10), stretch(10, 10), stretch(20, 10)});
    const Event withGap = healedFrom({stretch(100, 10), stretch(120, 10)});
    const EventList list = listOf({healed, withGap});

    EXPECT_TRUE(list.canHeal(listOf({healed}), NoReference, HealMode::None));
    EXPECT_FALSE(list.canHeal(listOf({healed}), NoReference, HealMode::Normal));
    EXPECT_TRUE(list.canHeal(listOf({withGap}), NoReference, HealMode::Normal));
}

TEST(EventListCanHeal, AnEmptySelectionHasNothingToHeal)
{
    EXPECT_FALSE(listOf({stretch(0, 10)}).canHeal(EventList(), NoReference, HealMode::Normal));
    EXPECT_FALSE(EventList().canHeal(EventList(), NoReference, HealMode::Normal));
}

TEST(EventListCanHeal, ASelectionWithAnEventLeftOutIsRefused)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(10, 10);
    const Event c = stretch(20, 10);
    const EventList list = listOf({c, a, b});

    EXPECT_FALSE(list.canHeal(listOf({a, c}), NoReference, HealMode::GapsWithInserts));
    EXPECT_TRUE(list.canHeal(listOf({c, b, a}), NoReference, HealMode::GapsWithInserts));
}

TEST(EventListCanHeal, ASelectionThatIsNotInTheListIsRefused)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(10, 10);
    const Event stranger = stretch(10, 10);

    EXPECT_FALSE(listOf({a, b}).canHeal(listOf({a, stranger}), NoReference, HealMode::Normal));
    EXPECT_FALSE(listOf({a, b}).canHeal(listOf({stranger, b}), NoReference, HealMode::Normal));
}

//  |----a----|
//  |----b----|----c----|
TEST(EventListCanHeal, NeighboursAreFoundByTheEventWhereTwoStartTogether)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(0, 10);
    const Event c = stretch(10, 10);
    const EventList list = listOf({a, b, c});

    EXPECT_TRUE(list.canHeal(listOf({b, c}), NoReference, HealMode::Normal));
    EXPECT_FALSE(list.canHeal(listOf({a, c}), NoReference, HealMode::Normal));
    EXPECT_TRUE(list.canHeal(listOf({a, b, c}), NoReference, HealMode::Normal));
    // In whatever order they were selected.
    EXPECT_TRUE(list.canHeal(listOf({c, b, a}), NoReference, HealMode::Normal));
}

TEST(EventListCanHeal, ChangesNothingAndSendsNothing)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(10, 10);
    const Event healed = healedFrom({a, b});
    const Event c = stretch(20, 10);
    a->setEventNumber(5);
    c->setEventNumber(9);
    EventList list = listOf({c, healed});
    RecordingListener listener;
    list.addListener(&listener);

    EXPECT_TRUE(list.canHeal(listOf({c, healed}), NoReference, HealMode::Normal));

    EXPECT_EQ(list.events(), (Events{c, healed}));
    EXPECT_EQ(membersOf(*healed), (Events{a, b}));
    EXPECT_EQ(healed->rollName(), "Healed Event 007");
    EXPECT_EQ(a->eventNumber(), 5u);
    EXPECT_EQ(c->eventNumber(), 9u);
    EXPECT_TRUE(listener.types.empty());
    c->setClipName("still heard");
    EXPECT_EQ(listener.types.size(), 1u);
    list.removeListener(&listener);
}

TEST(EventListHealingSpeed, ManyHealedEventsAreHealedAnewAndTakenApartInTime)
{
    constexpr double AmpleSeconds = IsSanitized ? 30.0 : 5.0;
    constexpr int Many = 20000;
    EventList list;
    for (int i = 0; i < Many; ++i)
        list.add(healedFrom({stretch(5 * i, 2), stretch(5 * i + 2, 2)}));
    bool canHeal = true;
    bool canTakeApart = false;

    EXPECT_LT(secondsOf([&] { canHeal = list.canHeal(list, NoReference, HealMode::Normal); }), AmpleSeconds);
    EXPECT_LT(secondsOf([&] { canTakeApart = list.canHeal(list, NoReference, HealMode::None); }), AmpleSeconds);
    EXPECT_LT(secondsOf([&] { list.heal(list, NoReference, HealMode::Normal); }), AmpleSeconds);
    EXPECT_FALSE(canHeal);
    EXPECT_TRUE(canTakeApart);
    EXPECT_EQ(list.size(), std::size_t{Many});
    EXPECT_EQ(list.at(Many - 1).rollName(), "Healed Event 20000");

    EXPECT_LT(secondsOf([&] { list.heal(list, NoReference, HealMode::None); }), AmpleSeconds);
    EXPECT_EQ(list.size(), std::size_t{2 * Many});
    EXPECT_EQ(list.at(2 * Many - 1).eventNumber(), std::uint32_t{2 * Many});
}

RC_GTEST_PROP(EventListCanHeal, AgreesWithHealOnTheNumberOfEvents, ())
{
    EventList list;
    int end = 0;
    for (const int gap : *rc::gen::container<std::vector<int>>(rc::gen::element(0, 0, 3))) {
        end += gap;
        list.add(*rc::gen::inRange(0, 4) == 0 ? Event(healedFrom({stretch(end, 2), stretch(end + 2, 2)}))
                                              : stretch(end, 4));
        end += 4;
    }
    const auto first = *rc::gen::inRange<std::size_t>(0, list.size() + 1);
    EventList selection;
    selection.append(list, first, *rc::gen::inRange<std::size_t>(0, list.size() - first + 1));
    const auto mode = *rc::gen::inRange<std::int32_t>(HealMode::None, HealMode::GapsWithInserts + 1);
    const std::size_t before = list.size();

    const bool canHeal = list.canHeal(selection, NoReference, mode);
    list.heal(selection, NoReference, mode);

    RC_ASSERT(canHeal == (list.size() != before));
}

// Healing anew whatever was healed, in any mode, and taking it apart again gives the very events.
RC_GTEST_PROP(EventListHeal, HealingCanAlwaysBeUndone, ())
{
    EventList list;
    int end = 0;
    for (const int gap : *rc::gen::container<std::vector<int>>(rc::gen::element(0, 0, 3))) {
        end += gap;
        list.add(stretch(end, 4));
        end += 4;
    }
    const Events before = list.events();

    list.heal(list, NoReference, *rc::gen::inRange<std::int32_t>(HealMode::Normal, HealMode::GapsWithInserts + 1));
    list.heal(list, NoReference, *rc::gen::inRange<std::int32_t>(HealMode::Normal, HealMode::GapsWithInserts + 1));
    list.heal(list, NoReference, HealMode::None);

    RC_ASSERT(list.events() == before);
}

//  before   |--a--|     |--b--|          |--c--|
//  after    |--a--|-----b-----|          |--c--|
TEST(EventListExtend, UntilThePreviousEventTakesTheGapOnBothSides)
{
    const Event a = makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00");
    const Event b = makeEvent("B", "00:20:00:00", "00:20:05:00", "01:00:12:00", "01:00:17:00");
    const Event c = makeEvent("C", "00:30:00:00", "00:30:05:00", "01:00:30:00", "01:00:35:00");
    EventList list = listOf({c, b, a});
    ASSERT_TRUE(list.canExtendEvent(b, true));

    list.extendEvent(b, true);

    EXPECT_EQ(timecodesOf(*b), "00:19:58:00 00:20:05:00 01:00:10:00 01:00:17:00");
    EXPECT_EQ(b->motionSpeed(), 1.0);
    EXPECT_EQ(timecodesOf(*a), "00:10:00:00 00:10:10:00 01:00:00:00 01:00:10:00");
    EXPECT_EQ(list.events(), (Events{c, b, a}));
    EXPECT_FALSE(list.canExtendEvent(b, true));
}

TEST(EventListExtend, UntilTheNextEventTakesTheGapOnBothSides)
{
    const Event a = makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00");
    const Event b = makeEvent("B", "00:20:00:00", "00:20:05:00", "01:00:12:00", "01:00:17:00");
    const Event c = makeEvent("C", "00:30:00:00", "00:30:05:00", "01:00:30:00", "01:00:35:00");
    EventList list = listOf({c, b, a});
    ASSERT_TRUE(list.canExtendEvent(b, false));

    list.extendEvent(b, false);

    EXPECT_EQ(timecodesOf(*b), "00:20:00:00 00:20:18:00 01:00:12:00 01:00:30:00");
    EXPECT_EQ(b->motionSpeed(), 1.0);
    EXPECT_EQ(timecodesOf(*c), "00:30:00:00 00:30:05:00 01:00:30:00 01:00:35:00");
    EXPECT_FALSE(list.canExtendEvent(b, false));
}

TEST(EventListExtend, WithoutANeighbourNothingChanges)
{
    const Event a = stretch(100, 10);
    const Event b = stretch(150, 10);
    EventList list = listOf({a, b});
    const std::string before = timecodesOf(*a);
    const std::string behind = timecodesOf(*b);

    EXPECT_FALSE(list.canExtendEvent(a, true));
    EXPECT_FALSE(list.canExtendEvent(b, false));
    list.extendEvent(a, true);
    list.extendEvent(b, false);

    EXPECT_EQ(timecodesOf(*a), before);
    EXPECT_EQ(timecodesOf(*b), behind);
}

TEST(EventListExtend, AnEventThatIsNotInTheListStaysAsItIs)
{
    const Event stranger = stretch(150, 10);
    EventList list = listOf({stretch(0, 10), stretch(200, 10)});
    const std::string before = timecodesOf(*stranger);

    for (const bool previous : {true, false}) {
        EXPECT_FALSE(list.canExtendEvent(stranger, previous));
        EXPECT_FALSE(list.canExtendEvent(nullptr, previous));
        list.extendEvent(stranger, previous);
    }

    EXPECT_EQ(timecodesOf(*stranger), before);
}

TEST(EventListExtend, AnEventWithInvalidTimecodesHasNoNeighbours)
{
    const Event outOfRate = makeEvent("A", "00:00:20:29", "00:00:21:00", "00:00:05:00", "00:00:06:00");
    EventList list = listOf({stretch(0, 10), outOfRate, stretch(200, 10)});
    const std::string before = timecodesOf(*outOfRate);

    for (const bool previous : {true, false}) {
        EXPECT_FALSE(list.canExtendEvent(outOfRate, previous));
        list.extendEvent(outOfRate, previous);
    }

    EXPECT_EQ(timecodesOf(*outOfRate), before);
}

TEST(EventListExtend, EventsThatTouchCanNotBeExtended)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(10, 10);
    EventList list = listOf({a, b});
    const std::string before = timecodesOf(*b);

    EXPECT_FALSE(list.canExtendEvent(b, true));
    EXPECT_FALSE(list.canExtendEvent(a, false));
    list.extendEvent(b, true);

    EXPECT_EQ(timecodesOf(*b), before);
}

TEST(EventListExtend, AnOverlapFailsAndLeavesTheEvent)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(5, 10);
    EventList list = listOf({a, b});
    const std::string before = timecodesOf(*b);

    EXPECT_FALSE(list.canExtendEvent(b, true));
    EXPECT_FALSE(list.canExtendEvent(a, false));
    EXPECT_EQ(thrownBy([&] { list.extendEvent(b, true); }), Result::OutOfRange);

    EXPECT_EQ(timecodesOf(*b), before);
}

TEST(EventListExtend, ASourceThatWouldStartBeforeTheDayFailsAndLeavesTheEvent)
{
    const Event a = makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00");
    const Event b = makeEvent("B", "00:00:01:24", "00:00:06:24", "01:00:12:00", "01:00:17:00");
    EventList list = listOf({a, b});

    EXPECT_TRUE(list.canExtendEvent(b, true));
    EXPECT_EQ(thrownBy([&] { list.extendEvent(b, true); }), Result::OutOfRange);

    EXPECT_EQ(timecodesOf(*b), "00:00:01:24 00:00:06:24 01:00:12:00 01:00:17:00");
    EXPECT_TRUE(b->isValid());
}

TEST(EventListExtend, ASourceThatWouldEndBehindTheDayFailsAndLeavesTheEvent)
{
    const Event a = makeEvent("A", "23:59:50:00", "23:59:58:01", "01:00:00:00", "01:00:08:01");
    const Event b = makeEvent("B", "00:10:00:00", "00:10:10:00", "01:00:10:00", "01:00:20:00");
    EventList list = listOf({a, b});

    EXPECT_EQ(thrownBy([&] { list.extendEvent(a, false); }), Result::OutOfRange);

    EXPECT_EQ(timecodesOf(*a), "23:59:50:00 23:59:58:01 01:00:00:00 01:00:08:01");
}

TEST(EventListExtend, AskingNeverFails)
{
    TestProject project(core::Framerate(30, 0));
    const Event a = makeEvent("A", "00:00:00:27", "00:00:01:00", "00:00:00:00", "00:00:01:00");
    const Event b = makeEvent("B", "00:00:02:00", "00:00:03:00", "00:00:02:00", "00:00:03:00");
    const EventList list = listOf({a, b});
    project.framerate = core::Framerate(25, 0);

    for (const Event& event : {a, b}) {
        EXPECT_FALSE(list.canExtendEvent(event, true));
        EXPECT_FALSE(list.canExtendEvent(event, false));
    }
}

TEST(EventListExtend, SendsOneNotificationAndListensAgain)
{
    const Event a = stretch(0, 10);
    const Event b = stretch(50, 10);
    EventList list = listOf({a, b});
    RecordingListener listener;
    list.addListener(&listener);

    list.extendEvent(b, true);
    EXPECT_EQ(listener.listKinds, std::vector<std::int32_t>{core::ListKind::Change});
    EXPECT_EQ(listener.types.size(), 1u);

    listener.forget();
    b->setClipName("heard");
    EXPECT_EQ(listener.types.size(), 1u);
    list.removeListener(&listener);
}

TEST(EventListExtend, AFailureLeavesTheListListeningToItsEvents)
{
    const Events events = {stretch(0, 10), stretch(5, 10)};
    EventList list = listOf(events);
    RecordingListener listener;
    list.addListener(&listener);

    EXPECT_EQ(thrownBy([&] { list.extendEvent(events[1], true); }), Result::OutOfRange);
    EXPECT_TRUE(listener.types.empty());
    for (const Event& event : events)
        event->setClipName("changed");

    EXPECT_EQ(listener.types.size(), 2u);
    list.removeListener(&listener);
}

} // namespace cadrel::tests
