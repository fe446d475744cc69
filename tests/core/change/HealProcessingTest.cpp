// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/HealProcessing.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"
#include "core/edl/ProgrammeOrder.h"
#include "core/settings/Settings.h"
#include "core/time/Timecode.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstdint>
#include <memory>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::EventBase;
using core::EventList;
using core::HealContext;
using core::HealedEvent;
using core::HealMode;
using core::HealProcessing;
using core::MatchBy;
using core::Settings;
using core::Timecode;
using util::Result;

using Event = std::shared_ptr<EventBase>;
using Events = std::vector<Event>;

/// An event of so many frames, at a frame of the old programme and at one of the new.
Event stretch(int oldIn, int newIn, int length)
{
    const auto event = std::make_shared<EventBase>();
    event->setTimecodes(Timecode(oldIn), Timecode(oldIn + length), Timecode(newIn), Timecode(newIn + length));
    return event;
}

EventList listOf(const Events& events)
{
    EventList list;
    for (const auto& event : events)
        list.add(event);
    return list;
}

Settings settingsFor(std::int32_t healMode, std::int32_t matchBy = MatchBy::RollName)
{
    Settings settings;
    settings.setHealMode(healMode);
    settings.setMatchBy(matchBy);
    return settings;
}

std::vector<core::PlacedEvent> orderOf(const EventList& list)
{
    return core::inProgrammeOrder(list.events(), Timecode::framerate());
}

/// Heals the list and checks what the count of it was.
void heal(EventList& list, std::int32_t healMode, const Events& reference = {},
          std::int32_t matchBy = MatchBy::RollName)
{
    const EventList referenceList = listOf(reference);
    const Settings settings = settingsFor(healMode, matchBy);
    const HealContext context{&referenceList, &settings, Timecode::framerate()};
    const std::size_t expected = HealProcessing().countAfter(orderOf(list), context);
    HealProcessing().process(list, context);
    EXPECT_EQ(list.size(), expected);
}

std::size_t countHealed(const Events& events, std::int32_t healMode, const Events& reference = {})
{
    EventList list = listOf(events);
    heal(list, healMode, reference);
    return list.size();
}

const Events& membersOf(const EventBase& event)
{
    return dynamic_cast<const HealedEvent&>(event).healedEvents().events();
}

} // namespace

TEST(HealProcessing, ModeNoneLeavesTheListUntouched)
{
    const Event second = stretch(100, 100, 50);
    const Event first = stretch(50, 50, 50);
    second->setEventNumber(7);
    first->setEventNumber(3);
    EventList list = listOf({second, first});

    heal(list, HealMode::None);

    EXPECT_EQ(list.events(), (Events{second, first}));
    EXPECT_EQ(second->eventNumber(), 7u);
    EXPECT_EQ(first->eventNumber(), 3u);
}

TEST(HealProcessing, AListOfOneEventKeepsItsNumber)
{
    const Event alone = stretch(0, 0, 50);
    alone->setEventNumber(12);
    EventList list = listOf({alone});
    EventList empty;

    heal(list, HealMode::Normal);
    heal(empty, HealMode::Normal);

    EXPECT_EQ(list.events(), Events{alone});
    EXPECT_EQ(alone->eventNumber(), 12u);
    EXPECT_TRUE(empty.isEmpty());
}

TEST(HealProcessing, ThreeEventsThatTouchOnBothSidesBecomeOne)
{
    const Event a = stretch(1000, 0, 50);
    const Event b = stretch(1050, 50, 25);
    const Event c = stretch(1075, 75, 25);
    b->setVfx(true);
    EventList list = listOf({c, a, b});

    heal(list, HealMode::Normal);

    ASSERT_EQ(list.size(), 1u);
    const EventBase& healed = list.at(0);
    EXPECT_EQ(healed.eventKind(), core::EventKind::Healed);
    EXPECT_EQ(membersOf(healed), (Events{a, b, c}));
    EXPECT_EQ(healed.rollName(), "Healed Event 001");
    EXPECT_EQ(healed.clipName(), "");
    EXPECT_EQ(healed.eventNumber(), 1u);
    EXPECT_EQ(timecodesOf(healed), "00:00:40:00 00:00:44:00 00:00:00:00 00:00:04:00");
    EXPECT_TRUE(healed.vfx());
    EXPECT_TRUE(healed.isValid());
}

TEST(HealProcessing, NeighboursThatTouchOnOneSideAloneStayApart)
{
    for (const std::int32_t mode : {HealMode::Normal, HealMode::GapsWithoutInserts, HealMode::GapsWithInserts}) {
        EXPECT_EQ(countHealed({stretch(0, 0, 50), stretch(50, 51, 50)}, mode), 2u);
        EXPECT_EQ(countHealed({stretch(0, 0, 50), stretch(51, 50, 50)}, mode), 2u);
    }
}

TEST(HealProcessing, NeighboursWithUnequalGapsAreNeverJoined)
{
    for (const std::int32_t mode : {HealMode::Normal, HealMode::GapsWithoutInserts, HealMode::GapsWithInserts}) {
        EXPECT_EQ(countHealed({stretch(0, 0, 50), stretch(55, 54, 50)}, mode), 2u);
        EXPECT_EQ(countHealed({stretch(0, 0, 50), stretch(54, 55, 50)}, mode), 2u);
    }
}

TEST(HealProcessing, NeighboursThatOverlapAreNeverJoined)
{
    for (const std::int32_t mode : {HealMode::Normal, HealMode::GapsWithoutInserts, HealMode::GapsWithInserts}) {
        EXPECT_EQ(countHealed({stretch(0, 0, 50), stretch(40, 40, 50)}, mode), 2u);
        EXPECT_EQ(countHealed({stretch(0, 0, 50), stretch(40, 60, 50)}, mode), 2u);
        EXPECT_EQ(countHealed({stretch(0, 0, 50), stretch(60, 40, 50)}, mode), 2u);
        EXPECT_EQ(countHealed({stretch(500, 0, 50), stretch(100, 50, 50)}, mode), 2u);
    }
}

TEST(HealProcessing, AnEqualGapIsClosedByTheModesForGapsAlone)
{
    const Events events = {stretch(1000, 0, 50), stretch(1060, 60, 50)};

    EXPECT_EQ(countHealed(events, HealMode::Normal), 2u);
    EXPECT_EQ(countHealed(events, HealMode::GapsWithoutInserts), 1u);
    EXPECT_EQ(countHealed(events, HealMode::GapsWithInserts), 1u);
}

TEST(HealProcessing, AHealedEventSpansTheGapsOfItsMembers)
{
    EventList list = listOf({stretch(1000, 0, 50), stretch(1075, 75, 25)});

    heal(list, HealMode::GapsWithInserts);

    ASSERT_EQ(list.size(), 1u);
    EXPECT_EQ(timecodesOf(list.at(0)), "00:00:40:00 00:00:44:00 00:00:00:00 00:00:04:00");
}

//  change events   |--------|      gap      |--------|
//                  0        50              100      150
TEST(HealProcessing, AReferenceEventUpToTheGapOrFromItsEndIsNoInsert)
{
    const Events events = {stretch(0, 0, 50), stretch(100, 100, 50)};

    EXPECT_EQ(countHealed(events, HealMode::GapsWithoutInserts, {stretch(0, 0, 50)}), 1u);
    EXPECT_EQ(countHealed(events, HealMode::GapsWithoutInserts, {stretch(0, 100, 50)}), 1u);
    EXPECT_EQ(countHealed(events, HealMode::GapsWithoutInserts, {stretch(0, 20, 30), stretch(0, 100, 10)}), 1u);
    EXPECT_EQ(countHealed(events, HealMode::GapsWithoutInserts, {stretch(0, 0, 40), stretch(0, 110, 10)}), 1u);
}

TEST(HealProcessing, AReferenceEventWithinTheGapIsAnInsert)
{
    const Events events = {stretch(0, 0, 50), stretch(100, 100, 50)};
    const auto countWith = [&](const Event& reference) {
        return countHealed(events, HealMode::GapsWithoutInserts, {stretch(0, 0, 50), reference, stretch(0, 100, 50)});
    };

    EXPECT_EQ(countWith(stretch(0, 60, 20)), 2u) << "strictly inside";
    EXPECT_EQ(countWith(stretch(0, 50, 50)), 2u) << "filling it";
    EXPECT_EQ(countWith(stretch(0, 50, 20)), 2u) << "from its start";
    EXPECT_EQ(countWith(stretch(0, 80, 20)), 2u) << "up to its end";
    EXPECT_EQ(countWith(stretch(0, 40, 20)), 2u) << "across its start";
    EXPECT_EQ(countWith(stretch(0, 90, 20)), 2u) << "across its end";
}

TEST(HealProcessing, AReferenceEventThatCoversTheWholeGapIsAnInsert)
{
    const Events events = {stretch(0, 0, 50), stretch(100, 100, 50)};

    EXPECT_EQ(countHealed(events, HealMode::GapsWithoutInserts, {stretch(0, 0, 200)}), 2u);
    EXPECT_EQ(countHealed(events, HealMode::GapsWithInserts, {stretch(0, 0, 200)}), 1u);
}

TEST(HealProcessing, NeighboursThatTouchLeaveNoRoomForAnInsert)
{
    EXPECT_EQ(countHealed({stretch(0, 0, 50), stretch(50, 50, 50)}, HealMode::GapsWithoutInserts, {stretch(0, 20, 60)}),
              1u);
}

TEST(HealProcessing, WithInsertsTheyDoNotMatter)
{
    const Events events = {stretch(0, 0, 50), stretch(100, 100, 50)};

    EXPECT_EQ(countHealed(events, HealMode::GapsWithInserts, {stretch(0, 60, 20)}), 1u);
    EXPECT_EQ(countHealed(events, HealMode::GapsWithInserts, {stretch(0, 50, 50)}), 1u);
}

TEST(HealProcessing, AnUnknownModeSortsAndNumbersWithoutJoining)
{
    const Event second = stretch(50, 50, 50);
    const Event first = stretch(0, 0, 50);
    EventList list = listOf({second, first});

    heal(list, 4);

    EXPECT_EQ(list.events(), (Events{first, second}));
    EXPECT_EQ(first->eventNumber(), 1u);
    EXPECT_EQ(second->eventNumber(), 2u);
}

TEST(HealProcessing, WhenClipNamesMatchTheHealedEventHasAClipName)
{
    for (const std::int32_t matchBy : {1, 2}) {
        EventList list = listOf({stretch(0, 0, 50), stretch(50, 50, 50)});

        heal(list, HealMode::Normal, {}, matchBy);

        ASSERT_EQ(list.size(), 1u);
        EXPECT_EQ(list.at(0).rollName(), "");
        EXPECT_EQ(list.at(0).clipName(), "Healed Event 001");
    }
}

//  new programme   |--a--|--b--|  |--c--|     |--d--|--e--|--f--|
TEST(HealProcessing, HealedEventsAreCountedAndAllEventsNumbered)
{
    const Event a = stretch(0, 0, 10);
    const Event b = stretch(10, 10, 10);
    const Event c = stretch(500, 30, 10);
    const Event d = stretch(1000, 60, 10);
    const Event e = stretch(1010, 70, 10);
    const Event f = stretch(1020, 80, 10);
    EventList list = listOf({f, e, d, c, b, a});

    heal(list, HealMode::Normal);

    ASSERT_EQ(list.size(), 3u);
    EXPECT_EQ(membersOf(list.at(0)), (Events{a, b}));
    EXPECT_EQ(list.at(0).rollName(), "Healed Event 001");
    EXPECT_EQ(list.at(0).eventNumber(), 1u);
    EXPECT_EQ(list.eventAt(1), c);
    EXPECT_EQ(c->eventNumber(), 2u);
    EXPECT_EQ(membersOf(list.at(2)), (Events{d, e, f}));
    EXPECT_EQ(list.at(2).rollName(), "Healed Event 002");
    EXPECT_EQ(list.at(2).eventNumber(), 3u);
}

TEST(HealProcessing, ARunInTheMiddleIsClosedByTheEventBehindIt)
{
    const Event a = stretch(900, 0, 10);
    const Event b = stretch(10, 10, 10);
    const Event c = stretch(20, 20, 10);
    const Event d = stretch(500, 30, 10);
    EventList list = listOf({a, b, c, d});

    heal(list, HealMode::Normal);

    ASSERT_EQ(list.size(), 3u);
    EXPECT_EQ(list.eventAt(0), a);
    EXPECT_EQ(membersOf(list.at(1)), (Events{b, c}));
    EXPECT_EQ(list.eventAt(2), d);
    EXPECT_EQ(d->eventNumber(), 3u);
}

TEST(HealProcessing, EventsOfEqualStartKeepTheOrderOfTheList)
{
    const Event first = stretch(100, 50, 10);
    const Event second = stretch(0, 50, 10);
    const Event earlier = stretch(500, 0, 10);
    EventList list = listOf({first, second, earlier});

    heal(list, HealMode::Normal);

    EXPECT_EQ(list.events(), (Events{earlier, first, second}));
}

TEST(HealProcessing, EventsWithInvalidTimecodesDropOut)
{
    const Event outOfRate = makeEvent("A", "00:00:02:00", "00:00:04:00", "00:00:02:29", "00:00:04:00");
    const Event before = stretch(0, 0, 50);
    const Event behind = stretch(50, 50, 50);
    EventList list = listOf({before, outOfRate, behind});

    heal(list, HealMode::Normal);

    ASSERT_EQ(list.size(), 1u);
    EXPECT_EQ(membersOf(list.at(0)), (Events{before, behind}));
}

TEST(HealProcessing, EveryOtherFlawLeavesAnEventIn)
{
    const Event flawed = stretch(50, 50, 50);
    flawed->addFlaw(core::EventFlaw::NotVideoEvent);

    EXPECT_EQ(countHealed({stretch(0, 0, 50), flawed}, HealMode::Normal), 1u);
}

TEST(HealProcessing, ANameHasAtLeastThreeDigits)
{
    EXPECT_EQ(HealProcessing::healedEventName(1), "Healed Event 001");
    EXPECT_EQ(HealProcessing::healedEventName(42), "Healed Event 042");
    EXPECT_EQ(HealProcessing::healedEventName(1234), "Healed Event 1234");
}

TEST(HealProcessing, CountingChangesNothing)
{
    const Event second = stretch(50, 50, 50);
    const Event first = stretch(0, 0, 50);
    second->setEventNumber(7);
    first->setEventNumber(3);
    const EventList list = listOf({second, first});
    const EventList reference;
    const Settings settings = settingsFor(HealMode::Normal);

    const std::size_t count =
        HealProcessing().countAfter(orderOf(list), {&reference, &settings, Timecode::framerate()});

    EXPECT_EQ(count, 1u);
    EXPECT_EQ(list.events(), (Events{second, first}));
    EXPECT_EQ(second->eventNumber(), 7u);
    EXPECT_EQ(first->eventNumber(), 3u);
}

TEST(HealProcessing, WithoutAConverterForTheNameTheListKeepsItsEvents)
{
    const Events events = {stretch(50, 50, 50), stretch(0, 0, 50)};
    EventList list = listOf(events);
    const EventList reference;
    const Settings settings = settingsFor(HealMode::Normal);
    util::StringUtil::setConverter(nullptr);

    EXPECT_EQ(thrownBy([&] {
                  HealProcessing().process(list, {&reference, &settings, Timecode::framerate()});
              }),
              Result::NotAvailable);

    EXPECT_EQ(list.events(), events);
}

TEST(HealProcessing, ARateThatTheTimecodesDoNotFitFailsAndTheListKeepsItsEvents)
{
    TestProject project(core::Framerate(30, 0));
    const Event late = makeEvent("A", "00:00:00:00", "00:00:01:00", "00:00:01:27", "00:00:02:27");
    const Events events = {stretch(30, 30, 30), stretch(0, 0, 30)};
    const EventList fitting = listOf(events);
    const EventList unfitting = listOf({late, events.front()});
    project.framerate = core::Framerate(25, 0);
    const Settings settings = settingsFor(HealMode::GapsWithoutInserts);
    EventList list = fitting;
    EventList otherList = unfitting;

    EXPECT_EQ(thrownBy([&] {
                  HealProcessing().process(list, {&unfitting, &settings, Timecode::framerate()});
              }),
              Result::FrameOutOfRate);
    EXPECT_EQ(thrownBy([&] {
                  HealProcessing().process(otherList, {&fitting, &settings, Timecode::framerate()});
              }),
              Result::FrameOutOfRate);

    EXPECT_EQ(list.events(), fitting.events());
    EXPECT_EQ(otherList.events(), unfitting.events());
}

TEST(HealProcessing, AReversedEventBesideAnotherIsNoFailure)
{
    const Event reversed = makeEvent("A", "00:00:03:15", "00:00:02:10", "00:00:03:15", "00:00:02:10");

    EXPECT_EQ(countHealed({stretch(0, 0, 50), reversed, stretch(200, 200, 50)}, HealMode::GapsWithInserts), 1u);
    EXPECT_EQ(countHealed({stretch(0, 0, 50), stretch(100, 100, 50)}, HealMode::GapsWithoutInserts, {reversed}), 2u);
}

namespace {

struct Placed {
    int gap;
    int length;
    int shift;
};

std::ostream& operator<<(std::ostream& out, const Placed& placed)
{
    return out << placed.length << " frames behind " << placed.gap << ", " << placed.shift << " more in the old";
}

rc::Gen<std::vector<Placed>> anyRow()
{
    return rc::gen::container<std::vector<Placed>>(rc::gen::build<Placed>(
        rc::gen::set(&Placed::gap, rc::gen::element(0, 0, 1, 5)), rc::gen::set(&Placed::length, rc::gen::inRange(1, 6)),
        rc::gen::set(&Placed::shift, rc::gen::element(0, 0, 0, 3))));
}

/// A programme in its order, each event as far from its old place as the one before, or some frames more.
Events rowOf(const std::vector<Placed>& row)
{
    Events events;
    int newEnd = 0;
    int oldEnd = 1000;
    for (const Placed& placed : row) {
        events.push_back(stretch(oldEnd + placed.gap + placed.shift, newEnd + placed.gap, placed.length));
        newEnd += placed.gap + placed.length;
        oldEnd += placed.gap + placed.shift + placed.length;
    }
    return events;
}

/// Whether two neighbours need no cut between them, for a reference list without overlaps.
bool needsNoCut(const EventBase& earlier, const EventBase& later, std::int32_t mode, const Events& reference)
{
    const int oldGap = later.srcIn().toFrameCount() - earlier.srcOut().toFrameCount();
    const int newGap = later.dstIn().toFrameCount() - earlier.dstOut().toFrameCount();
    if (oldGap != newGap || (mode == HealMode::Normal && newGap != 0))
        return false;
    const bool isInsertFree = std::none_of(reference.begin(), reference.end(), [&](const Event& event) {
        return event->dstOut() > earlier.dstOut() && event->dstIn() < later.dstIn();
    });
    return newGap == 0 || mode != HealMode::GapsWithoutInserts || isInsertFree;
}

} // namespace

RC_GTEST_PROP(HealProcessing, JoinsExactlyTheNeighboursThatNeedNoCut, ())
{
    const Events row = rowOf(*anyRow());
    const Events reference = rowOf(*anyRow());
    const auto mode =
        *rc::gen::element<std::int32_t>(HealMode::Normal, HealMode::GapsWithoutInserts, HealMode::GapsWithInserts);
    RC_PRE(row.size() >= 2);
    EventList list = listOf(row);
    if (*rc::gen::arbitrary<bool>()) {
        list.clear();
        list.append(listOf(Events(row.rbegin(), row.rend())));
    }

    heal(list, mode, reference);

    std::vector<Events> runs;
    for (const Event& event : row) {
        if (runs.empty() || !needsNoCut(*runs.back().back(), *event, mode, reference))
            runs.emplace_back();
        runs.back().push_back(event);
    }
    RC_ASSERT(list.size() == runs.size());
    for (std::size_t i = 0; i < runs.size(); ++i) {
        if (runs[i].size() == 1)
            RC_ASSERT(list.eventAt(i) == runs[i].front());
        else
            RC_ASSERT(membersOf(list.at(i)) == runs[i]);
        RC_ASSERT(list.at(i).eventNumber() == i + 1);
    }
}

RC_GTEST_PROP(HealProcessing, AHealedListCoversWhatItsMembersCovered, ())
{
    EventList list = listOf(rowOf(*anyRow()));
    const auto mode = *rc::gen::inRange<std::int32_t>(HealMode::None, HealMode::GapsWithInserts + 1);
    const Events before = list.events();

    heal(list, mode);

    for (const Event& event : before) {
        const auto covers = [&](const Event& healed) {
            return !(healed->srcIn() > event->srcIn()) && healed->srcOut() >= event->srcOut() &&
                   !(healed->dstIn() > event->dstIn()) && healed->dstOut() >= event->dstOut() &&
                   event->dstIn() - healed->dstIn() == event->srcIn() - healed->srcIn();
        };
        RC_ASSERT(std::count_if(list.events().begin(), list.events().end(), covers) == 1);
    }
    if (!before.empty()) {
        RC_ASSERT(list.sourceRange().start == listOf(before).sourceRange().start);
        RC_ASSERT(list.sourceRange().end == listOf(before).sourceRange().end);
        RC_ASSERT(list.destinationRange().start == listOf(before).destinationRange().start);
        RC_ASSERT(list.destinationRange().end == listOf(before).destinationRange().end);
    }
}

} // namespace cadrel::tests
