// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/ChangeEdlGenerator.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"
#include "core/settings/Settings.h"
#include "core/time/Timecode.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::ChangeEdlGenerator;
using core::EventBase;
using core::EventList;
using core::MatchBy;
using core::Timecode;
using core::TransitionType;
using core::VfxPatternEntry;
using util::Result;

using Event = std::shared_ptr<EventBase>;
using Lines = std::vector<std::string>;

Event makeTransition(TransitionType::Type type, int frames, const Event& event)
{
    event->setTransitionType(type);
    event->setTransitionDuration(frames);
    return event;
}

Event withClip(const std::string& clip, const Event& event)
{
    event->setClipName(clip);
    return event;
}

EventList listOf(const std::vector<Event>& events)
{
    EventList list;
    for (const auto& event : events)
        list.add(event);
    return list;
}

/// Number, roll name and the four timecodes of each event.
Lines linesOf(const EventList& list)
{
    Lines lines;
    for (const auto& event : list.events())
        lines.push_back(std::to_string(event->eventNumber()) + " " + event->rollName() + " " + timecodesOf(*event));
    return lines;
}

EventList generated(const std::vector<Event>& oldEvents, const std::vector<Event>& newEvents,
                    std::int32_t matchBy = MatchBy::RollName, const std::vector<VfxPatternEntry>& vfxRows = {})
{
    ChangeEdlGenerator generator;
    generator.configure(matchBy, vfxRows);
    EventList changeEvents;
    EXPECT_EQ(generator.generate(listOf(oldEvents), listOf(newEvents), changeEvents), Result::Ok);
    return changeEvents;
}

} // namespace

TEST(ChangeEdlGenerator, IdenticalListsGiveOneEventPerValidEventInTheOrderOfTheNewProgramme)
{
    const Event unreadable = makeEvent("C", "00:03:00:00", "00:03:10:00", "01:00:40:00", "01:00:50:00");
    unreadable->addFlaw(core::EventFlaw::RollNameInvalid);
    const std::vector<Event> programme = {
        makeEvent("B", "00:02:00:00", "00:02:10:00", "01:00:20:00", "01:00:30:00", 7),
        makeEvent("A", "00:01:00:00", "00:01:20:00", "01:00:00:00", "01:00:20:00", 8),
        unreadable,
        makeEvent("D", "00:04:00:00", "00:04:05:00", "01:00:30:00", "01:00:35:00", 9),
    };

    const EventList changes = generated(programme, programme);

    EXPECT_EQ(linesOf(changes), (Lines{"1 A 01:00:00:00 01:00:20:00 01:00:00:00 01:00:20:00",
                                       "2 B 01:00:20:00 01:00:30:00 01:00:20:00 01:00:30:00",
                                       "3 D 01:00:30:00 01:00:35:00 01:00:30:00 01:00:35:00"}));
}

//  old programme   |------- A -------|
//  new programme     |----- A -------|
TEST(ChangeEdlGenerator, AClipShortenedAtItsHeadStartsLaterInTheOldProgramme)
{
    const EventList changes = generated({makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00")},
                                        {makeEvent("A", "00:01:02:00", "00:01:10:00", "01:00:00:00", "01:00:08:00")});

    EXPECT_EQ(linesOf(changes), (Lines{"1 A 01:00:02:00 01:00:10:00 01:00:00:00 01:00:08:00"}));
}

TEST(ChangeEdlGenerator, AClipLengthenedAtItsHeadStartsLaterInTheNewProgramme)
{
    const EventList changes = generated({makeEvent("A", "00:01:02:00", "00:01:10:00", "01:00:00:00", "01:00:08:00")},
                                        {makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00")});

    EXPECT_EQ(linesOf(changes), (Lines{"1 A 01:00:00:00 01:00:08:00 01:00:02:00 01:00:10:00"}));
}

//  old programme   |---- A1 ----|---- A2 ----|
//  new programme   |---- A2 ----|-- X --|---- A1 ----|
TEST(ChangeEdlGenerator, AClipCutInTwoGivesTwoEventsInTheOrderOfTheNewProgramme)
{
    const EventList changes = generated({makeEvent("A", "00:01:00:00", "00:01:20:00", "01:00:00:00", "01:00:20:00")},
                                        {makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:15:00", "01:00:25:00"),
                                         makeEvent("X", "00:01:00:00", "00:01:05:00", "01:00:10:00", "01:00:15:00"),
                                         makeEvent("A", "00:01:10:00", "00:01:20:00", "01:00:00:00", "01:00:10:00")});

    EXPECT_EQ(linesOf(changes), (Lines{"1 A 01:00:10:00 01:00:20:00 01:00:00:00 01:00:10:00",
                                       "2 A 01:00:00:00 01:00:10:00 01:00:15:00 01:00:25:00"}));
}

TEST(ChangeEdlGenerator, OneNewEventOverTwoOldOnesGivesTwoEventsInTheOrderOfTheOldList)
{
    const EventList changes = generated({makeEvent("A", "00:01:10:00", "00:01:20:00", "01:00:00:00", "01:00:10:00"),
                                         makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:30:00", "01:00:40:00")},
                                        {makeEvent("A", "00:01:00:00", "00:01:20:00", "01:00:00:00", "01:00:20:00")});

    EXPECT_EQ(linesOf(changes), (Lines{"1 A 01:00:00:00 01:00:10:00 01:00:10:00 01:00:20:00",
                                       "2 A 01:00:30:00 01:00:40:00 01:00:00:00 01:00:10:00"}));
}

TEST(ChangeEdlGenerator, RangesThatOnlyTouchDoNotMatch)
{
    const EventList changes = generated({makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00")},
                                        {makeEvent("A", "00:01:10:00", "00:01:20:00", "01:00:00:00", "01:00:10:00")});

    EXPECT_TRUE(changes.isEmpty());
}

TEST(ChangeEdlGenerator, AnEmptyRangeMatchesNothingThatLiesAroundIt)
{
    const Event empty = makeEvent("A", "00:01:05:00", "00:01:05:00", "01:00:05:00", "01:00:05:00");
    const Event around = makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00");

    EXPECT_TRUE(generated({around}, {empty}).isEmpty());
    EXPECT_TRUE(generated({empty}, {around}).isEmpty());
}

TEST(ChangeEdlGenerator, TheSameMaterialUnderAnotherNameDoesNotMatch)
{
    const EventList changes = generated({makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00")},
                                        {makeEvent("B", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00")});

    EXPECT_TRUE(changes.isEmpty());
}

TEST(ChangeEdlGenerator, OfTwoOldPlacesTheOneWithMoreOfTheMaterialWins)
{
    const Event shorter = makeEvent("A", "00:01:00:00", "00:01:05:00", "01:00:00:00", "01:00:05:00");
    const Event longer = makeEvent("A", "00:01:00:00", "00:01:10:00", "01:30:00:00", "01:30:10:00");
    const Event placed = makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00");
    const Lines fromTheLonger = {"1 A 01:30:00:00 01:30:10:00 01:00:00:00 01:00:10:00"};

    EXPECT_EQ(linesOf(generated({shorter, longer}, {placed})), fromTheLonger);
    EXPECT_EQ(linesOf(generated({longer, shorter}, {placed})), fromTheLonger);
}

TEST(ChangeEdlGenerator, OfTwoEqualPlacesTheOneThatContinuesThePlacementBeforeWins)
{
    const Event oldLead = makeEvent("B", "00:02:00:00", "00:02:10:00", "01:00:00:00", "01:00:10:00");
    const Event oldNear = makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:10:00", "01:00:20:00");
    const Event oldFar = makeEvent("A", "00:01:00:00", "00:01:10:00", "01:02:00:00", "01:02:10:00");
    // The lead moves by a minute and a half, and the material behind it by as much from its nearer place. Its farther
    // place would be closer to no displacement at all.
    const Event newLead = makeEvent("B", "00:02:00:00", "00:02:10:00", "01:01:30:00", "01:01:40:00");
    const Event placed = makeEvent("A", "00:01:00:00", "00:01:10:00", "01:01:40:00", "01:01:50:00");
    const Lines expected = {"1 B 01:00:00:00 01:00:10:00 01:01:30:00 01:01:40:00",
                            "2 A 01:00:10:00 01:00:20:00 01:01:40:00 01:01:50:00"};

    EXPECT_EQ(linesOf(generated({oldLead, oldNear, oldFar}, {newLead, placed})), expected);
    EXPECT_EQ(linesOf(generated({oldLead, oldFar, oldNear}, {newLead, placed})), expected);
    EXPECT_EQ(linesOf(generated({oldLead, oldNear, oldFar}, {placed})),
              (Lines{"1 A 01:02:00:00 01:02:10:00 01:01:40:00 01:01:50:00"}));
}

TEST(ChangeEdlGenerator, AtAnExactTieTheLaterOldEventWins)
{
    const Event before = makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00");
    const Event behind = makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:40:00", "01:00:50:00");
    const Event placed = makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:20:00", "01:00:30:00");

    EXPECT_EQ(linesOf(generated({before, behind}, {placed})),
              (Lines{"1 A 01:00:40:00 01:00:50:00 01:00:20:00 01:00:30:00"}));
    EXPECT_EQ(linesOf(generated({behind, before}, {placed})),
              (Lines{"1 A 01:00:00:00 01:00:10:00 01:00:20:00 01:00:30:00"}));
}

TEST(ChangeEdlGenerator, OfAnOldEventThatIsListedTwiceTheLaterOneStands)
{
    const auto listed = [] { return makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00"); };
    const Event between = makeEvent("A", "00:01:10:00", "00:01:20:00", "01:30:00:00", "01:30:10:00");
    const Event placedBefore = makeEvent("A", "00:01:00:00", "00:01:20:00", "00:10:00:00", "00:10:20:00");
    const Event placedBehind = makeEvent("A", "00:01:00:00", "00:01:20:00", "02:00:00:00", "02:00:20:00");

    EXPECT_EQ(linesOf(generated({listed(), between, listed()}, {placedBefore})),
              (Lines{"1 A 01:30:00:00 01:30:10:00 00:10:10:00 00:10:20:00",
                     "2 A 01:00:00:00 01:00:10:00 00:10:00:00 00:10:10:00"}));
    EXPECT_EQ(linesOf(generated({listed(), between, listed()}, {placedBehind})),
              (Lines{"1 A 01:30:00:00 01:30:10:00 02:00:10:00 02:00:20:00",
                     "2 A 01:00:00:00 01:00:10:00 02:00:00:00 02:00:10:00"}));
}

//  source of the new event   |----------------|
//  candidates                |-- 1 --|
//                                  |-- 2 ---|
//                                         |-3-|
TEST(ChangeEdlGenerator, InAChainOfOverlapsTheLongestLeavesRoomForNoneThatItTouches)
{
    const EventList changes = generated({makeEvent("A", "00:01:00:00", "00:01:08:00", "01:00:00:00", "01:00:08:00"),
                                         makeEvent("A", "00:01:06:00", "00:01:15:00", "01:01:00:00", "01:01:09:00"),
                                         makeEvent("A", "00:01:14:00", "00:01:18:00", "01:02:00:00", "01:02:04:00")},
                                        {makeEvent("A", "00:01:00:00", "00:01:18:00", "01:00:00:00", "01:00:18:00")});

    // 1 goes against 2, then 3 goes against 2.
    EXPECT_EQ(linesOf(changes), (Lines{"1 A 01:01:00:00 01:01:09:00 01:00:06:00 01:00:15:00"}));
}

//  source of the new event   |----------------|
//  candidates                |---- 1 ----|
//                                   |--2--|
//                                        |-3--|
TEST(ChangeEdlGenerator, InAChainOfOverlapsTheEndsSurviveTheShortestInTheMiddle)
{
    const EventList changes = generated({makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00"),
                                         makeEvent("A", "00:01:08:00", "00:01:12:00", "01:01:00:00", "01:01:04:00"),
                                         makeEvent("A", "00:01:10:00", "00:01:18:00", "01:02:00:00", "01:02:08:00")},
                                        {makeEvent("A", "00:01:00:00", "00:01:18:00", "01:00:00:00", "01:00:18:00")});

    EXPECT_EQ(linesOf(changes), (Lines{"1 A 01:00:00:00 01:00:10:00 01:00:00:00 01:00:10:00",
                                       "2 A 01:02:00:00 01:02:08:00 01:00:10:00 01:00:18:00"}));
}

//  old programme   |------------ A ------------|
//  new programme   |/////|---------- A --------|
TEST(ChangeEdlGenerator, UnderANewDissolveTheTimeOfTheTransitionIsMissing)
{
    const EventList changes =
        generated({makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00")},
                  {makeTransition(TransitionType::Dissolve, 25,
                                  makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00"))});

    EXPECT_EQ(linesOf(changes), (Lines{"1 A 01:00:01:00 01:00:10:00 01:00:01:00 01:00:10:00"}));
    EXPECT_EQ(changes.at(0).transitionType(), TransitionType::Cut);
}

TEST(ChangeEdlGenerator, TransitionsOfDifferentTypeOrLengthDoNotMatch)
{
    const auto placed = [](TransitionType::Type type, int frames) {
        return makeTransition(type, frames, makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00"));
    };
    const Lines bodyAlone = {"1 A 01:00:01:00 01:00:10:00 01:00:01:00 01:00:10:00"};
    const Lines shorterBody = {"1 A 01:00:02:00 01:00:10:00 01:00:02:00 01:00:10:00"};

    EXPECT_EQ(linesOf(generated({placed(TransitionType::Dissolve, 25)}, {placed(TransitionType::Wipe, 25)})),
              bodyAlone);
    EXPECT_EQ(linesOf(generated({placed(TransitionType::Dissolve, 25)}, {placed(TransitionType::Dissolve, 50)})),
              shorterBody);
}

TEST(ChangeEdlGenerator, ATransitionInOneLineKeepsItsNameAndIsNotMergedWithItsBody)
{
    const Event oldWipe = makeTransition(TransitionType::Wipe, 25,
                                         makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00"));
    const Event newWipe = makeTransition(TransitionType::Wipe, 25,
                                         makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:30:00", "01:00:40:00"));

    const EventList changes = generated({oldWipe}, {newWipe});

    EXPECT_EQ(linesOf(changes), (Lines{"1 A 01:00:00:00 01:00:01:00 01:00:30:00 01:00:31:00",
                                       "2 A 01:00:01:00 01:00:10:00 01:00:31:00 01:00:40:00"}));
    EXPECT_EQ(changes.at(0).transitionType(), TransitionType::Cut);
}

namespace {

/// A dissolve of one second from A to B in two lines of one number, at an offset in the programme.
std::vector<Event> makeDissolve(const std::string& fromRoll, const char* dstIn, const char* dstOut,
                                const char* srcOut = "00:02:10:00")
{
    return {withClip("clip " + fromRoll, makeEvent(fromRoll, "00:00:05:00", "00:00:05:00", dstIn, dstIn, 2)),
            makeTransition(TransitionType::Dissolve, 25,
                           withClip("clip B", makeEvent("B", "00:02:00:00", srcOut, dstIn, dstOut, 2)))};
}

} // namespace

TEST(ChangeEdlGenerator, TheSameDissolveOnBothSidesIsMergedIntoOneEventOfItsBody)
{
    std::vector<Event> oldEvents = makeDissolve("A", "01:00:05:00", "01:00:15:00");
    oldEvents.push_back(makeEvent("C", "00:03:00:00", "00:03:05:00", "01:00:15:00", "01:00:20:00", 3));
    std::vector<Event> newEvents = makeDissolve("A", "01:00:25:00", "01:00:35:00");
    newEvents.push_back(makeEvent("C", "00:03:00:00", "00:03:05:00", "01:00:35:00", "01:00:40:00", 3));

    const EventList changes = generated(oldEvents, newEvents);

    // The body was event 2; the number it leaves stays free.
    EXPECT_EQ(linesOf(changes), (Lines{"1 B 01:00:05:00 01:00:15:00 01:00:25:00 01:00:35:00",
                                       "3 C 01:00:15:00 01:00:20:00 01:00:35:00 01:00:40:00"}));
    EXPECT_EQ(changes.at(0).clipName(), "clip B");
    EXPECT_EQ(changes.at(0).transitionType(), TransitionType::Cut);
    EXPECT_EQ(changes.at(0).transitionDuration(), 0);
    EXPECT_TRUE(changes.at(0).isValid());
}

TEST(ChangeEdlGenerator, TheSameDissolveIsMergedByItsClipNamesToo)
{
    const EventList changes = generated(makeDissolve("A", "01:00:05:00", "01:00:15:00"),
                                        makeDissolve("A", "01:00:25:00", "01:00:35:00"), MatchBy::ClipName);

    EXPECT_EQ(linesOf(changes), (Lines{"1 B 01:00:05:00 01:00:15:00 01:00:25:00 01:00:35:00"}));
    EXPECT_EQ(changes.at(0).clipName(), "clip B");
}

TEST(ChangeEdlGenerator, ADissolveFromAnotherShotKeepsOnlyItsBody)
{
    const EventList changes =
        generated(makeDissolve("A", "01:00:05:00", "01:00:15:00"), makeDissolve("X", "01:00:25:00", "01:00:35:00"));

    EXPECT_EQ(linesOf(changes), (Lines{"1 B 01:00:06:00 01:00:15:00 01:00:26:00 01:00:35:00"}));
}

TEST(ChangeEdlGenerator, ATransitionWhoseBodyComesFromElsewhereKeepsItsOwnNameAndBecomesACut)
{
    std::vector<Event> oldEvents = makeDissolve("A", "01:00:05:00", "01:00:15:00");
    oldEvents.push_back(makeEvent("B", "00:02:00:00", "00:02:20:00", "01:00:30:00", "01:00:50:00", 3));

    const EventList changes = generated(oldEvents, makeDissolve("A", "01:00:05:00", "01:00:20:00", "00:02:15:00"));

    // Of the body's 14 seconds the dissolve's own body has 9, and the cut behind it has all.
    EXPECT_EQ(linesOf(changes), (Lines{"1 TRANS_B--A_00:00:05:00_00:00:05:00 01:00:05:00 01:00:06:00 "
                                       "01:00:05:00 01:00:06:00",
                                       "2 B 01:00:31:00 01:00:45:00 01:00:06:00 01:00:20:00"}));
    EXPECT_EQ(changes.at(0).clipName(), "TRANS_clip B--clip A_00:00:05:00_00:00:05:00");
    EXPECT_EQ(changes.at(0).transitionType(), TransitionType::Cut);
}

TEST(ChangeEdlGenerator, ATransitionLongerThanItsEventTakesAllOfIt)
{
    std::vector<Event> oldEvents = makeDissolve("A", "01:00:05:00", "01:00:15:00");
    std::vector<Event> newEvents = makeDissolve("A", "01:00:25:00", "01:00:35:00");
    oldEvents.back()->setTransitionDuration(500);
    newEvents.back()->setTransitionDuration(500);

    const EventList changes = generated(oldEvents, newEvents);

    EXPECT_EQ(linesOf(changes), (Lines{"1 TRANS_B--A_00:00:05:00_00:00:05:00 01:00:05:00 01:00:15:00 "
                                       "01:00:25:00 01:00:35:00"}));
    EXPECT_EQ(changes.at(0).transitionType(), TransitionType::Cut);
}

// The source piece is the duration divided by the speed: 1 s of the source for 2 s of the programme.
TEST(ChangeEdlGenerator, TheTransitionOfAFastEventTakesAShorterSource)
{
    const Event fast = makeTransition(TransitionType::Dissolve, 50,
                                      makeEvent("A", "00:01:00:00", "00:01:12:00", "01:00:00:00", "01:00:06:00"));
    const Event likeItsBody = makeEvent("A", "00:01:01:00", "00:01:12:00", "01:01:40:00", "01:01:44:00");

    const EventList changes = generated({fast}, {likeItsBody});

    EXPECT_EQ(linesOf(changes), (Lines{"1 A 01:00:02:00 01:00:06:00 01:01:40:00 01:01:44:00"}));
}

TEST(ChangeEdlGenerator, TheTransitionOfAFreezeFrameTakesNoSource)
{
    const Event freeze = makeTransition(TransitionType::Dissolve, 25,
                                        makeEvent("A", "00:01:00:00", "00:01:00:00", "01:00:00:00", "01:00:04:00"));

    EXPECT_TRUE(generated({freeze}, {freeze}).isEmpty());
}

TEST(ChangeEdlGenerator, OtherTransitionTypesStayWhole)
{
    const auto key = [] {
        const Event event = makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00");
        event->setTransitionType(3);
        event->setTransitionDuration(25);
        return event;
    };

    const EventList changes = generated({key()}, {key()});

    EXPECT_EQ(linesOf(changes), (Lines{"1 A 01:00:00:00 01:00:10:00 01:00:00:00 01:00:10:00"}));
    EXPECT_EQ(changes.at(0).transitionType(), TransitionType::Cut);
}

TEST(ChangeEdlGenerator, WithoutClipNamesMatchingByThemComparesEverythingByItsSource)
{
    const std::vector<Event> oldEvents = {makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00"),
                                          makeEvent("B", "00:02:00:00", "00:02:10:00", "01:00:10:00", "01:00:20:00")};

    const EventList changes = generated(
        oldEvents, {makeEvent("X", "00:02:00:00", "00:02:10:00", "01:00:00:00", "01:00:10:00")}, MatchBy::ClipName);

    EXPECT_EQ(linesOf(changes), (Lines{"1 X 01:00:10:00 01:00:20:00 01:00:00:00 01:00:10:00"}));
}

TEST(ChangeEdlGenerator, AnyOtherMatchSettingComparesRollNames)
{
    const Event oldEvent = withClip("one", makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00"));
    const Event newEvent = withClip("two", makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:05:00", "01:00:15:00"));

    EXPECT_EQ(generated({oldEvent}, {newEvent}, MatchBy::RollName).size(), 1u);
    EXPECT_EQ(generated({oldEvent}, {newEvent}, 2).size(), 1u);
    EXPECT_TRUE(generated({oldEvent}, {newEvent}, MatchBy::ClipName).isEmpty());
}

TEST(ChangeEdlGenerator, AChangeEventBearsTheNamesOfTheNewEvent)
{
    const Event oldEvent = withClip("old", makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00"));
    const Event newEvent = withClip("new", makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:05:00", "01:00:15:00"));
    newEvent->setEdlFileName("reel3_v12.edl");
    newEvent->setComment("a comment");

    const EventList changes = generated({oldEvent}, {newEvent});

    ASSERT_EQ(changes.size(), 1u);
    EXPECT_EQ(changes.at(0).clipName(), "new");
    EXPECT_EQ(changes.at(0).edlFileName(), "");
    EXPECT_EQ(changes.at(0).comment(), "");
    EXPECT_EQ(changes.at(0).eventKind(), core::EventKind::Plain);
}

TEST(ChangeEdlGenerator, AFreezeFrameHasNoSourceAndNeverMatches)
{
    const Event freeze = makeEvent("A", "00:01:00:00", "00:01:00:00", "01:00:00:00", "01:00:04:00");
    ASSERT_EQ(freeze->motionSpeed(), 0.0);

    EXPECT_TRUE(generated({freeze}, {freeze}).isEmpty());
}

TEST(ChangeEdlGenerator, ANearlyFrozenShotLastsAsLongAsTheShorterOfTheTwo)
{
    // One frame over 200, and over 125.
    const Event longer = makeEvent("A", "00:01:00:00", "00:01:00:01", "01:00:00:00", "01:00:08:00");
    const Event shorter = makeEvent("A", "00:01:00:00", "00:01:00:01", "01:00:30:00", "01:00:35:00");

    EXPECT_EQ(linesOf(generated({longer}, {shorter})), (Lines{"1 A 01:00:00:00 01:00:05:00 01:00:30:00 01:00:35:00"}));
    EXPECT_EQ(linesOf(generated({shorter}, {longer})), (Lines{"1 A 01:00:30:00 01:00:35:00 01:00:00:00 01:00:05:00"}));
}

TEST(ChangeEdlGenerator, ANearlyFrozenShotStartsAtTheStartOfBothEvents)
{
    // Two frames over 400, and the second of them over 200.
    const Event oldFreeze = makeEvent("A", "00:01:00:00", "00:01:00:02", "01:00:00:00", "01:00:16:00");
    const Event newFreeze = makeEvent("A", "00:01:00:01", "00:01:00:02", "01:00:30:00", "01:00:38:00");

    EXPECT_EQ(linesOf(generated({oldFreeze}, {newFreeze})),
              (Lines{"1 A 01:00:00:00 01:00:08:00 01:00:30:00 01:00:38:00"}));
}

// Each second of displacement counts from where the material begins, a frame into the source of the second old place.
// So both places are ten seconds less a frame away, and the later one wins the tie.
TEST(ChangeEdlGenerator, ANearlyFrozenShotIsPlacedByTheOffsetInItsSource)
{
    const Event aFrameLater = makeEvent("A", "00:01:00:01", "00:01:00:03", "01:00:10:01", "01:00:26:01");
    const Event aFrameIntoIt = makeEvent("A", "00:01:00:00", "00:01:00:03", "01:00:10:00", "01:00:34:00");
    const Event placed = makeEvent("A", "00:01:00:01", "00:01:00:03", "01:00:20:00", "01:00:36:00");

    EXPECT_EQ(linesOf(generated({aFrameLater, aFrameIntoIt}, {placed})),
              (Lines{"1 A 01:00:10:00 01:00:26:00 01:00:20:00 01:00:36:00"}));
}

TEST(ChangeEdlGenerator, TheSourceOfAFastShotIsTurnedIntoProgrammeTime)
{
    const Event oldFast = makeEvent("A", "00:01:00:00", "00:01:20:00", "01:00:00:00", "01:00:10:00");
    const Event newFast = makeEvent("A", "00:01:04:00", "00:01:20:00", "01:00:30:00", "01:00:38:00");

    EXPECT_EQ(linesOf(generated({oldFast}, {newFast})), (Lines{"1 A 01:00:02:00 01:00:10:00 01:00:30:00 01:00:38:00"}));
    EXPECT_EQ(linesOf(generated({newFast}, {oldFast})), (Lines{"1 A 01:00:30:00 01:00:38:00 01:00:02:00 01:00:10:00"}));
}

TEST(ChangeEdlGenerator, ASpeedThatCountsAsNormalLeavesTheSourceAsItIs)
{
    // 201 frames over 200 are a speed of 1.005.
    const Event oldEvent = makeEvent("A", "00:01:00:00", "00:01:08:01", "01:00:00:00", "01:00:08:00");
    const Event newEvent = makeEvent("A", "00:01:00:00", "00:01:08:01", "01:00:30:00", "01:00:38:00");

    EXPECT_EQ(linesOf(generated({oldEvent}, {newEvent})),
              (Lines{"1 A 01:00:00:00 01:00:08:01 01:00:30:00 01:00:38:01"}));
}

TEST(ChangeEdlGenerator, SpeedsMatchWhenTheyAreCloserThanAHundredth)
{
    const Event twoHundredths = makeEvent("A", "00:01:00:00", "00:01:00:02", "01:00:00:00", "01:00:04:00");
    const Event oneHundredth = makeEvent("A", "00:01:00:00", "00:01:00:01", "01:00:00:00", "01:00:04:00");
    const Event between = makeEvent("A", "00:01:00:00", "00:01:00:02", "01:00:00:00", "01:00:06:00");
    ASSERT_EQ(twoHundredths->motionSpeed(), 0.02);
    ASSERT_EQ(oneHundredth->motionSpeed(), 0.01);

    EXPECT_TRUE(generated({twoHundredths}, {oneHundredth}).isEmpty());
    EXPECT_TRUE(generated({oneHundredth}, {twoHundredths}).isEmpty());
    EXPECT_EQ(generated({twoHundredths}, {between}).size(), 1u);
    EXPECT_EQ(generated({between}, {oneHundredth}).size(), 1u);
}

TEST(ChangeEdlGenerator, VersionsOfAVfxShotAreOneNameAndAreMarked)
{
    const Event oldShot = makeEvent("SHOT_1_V003_COMP", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00");
    const Event newShot = makeEvent("SHOT_1_V012_COMP", "00:01:00:00", "00:01:10:00", "01:00:20:00", "01:00:30:00");
    const std::vector<VfxPatternEntry> rows = {VfxPatternEntry("SHOT_*_V", "_COMP", true)};

    const EventList changes = generated({oldShot}, {newShot}, MatchBy::RollName, rows);

    EXPECT_EQ(linesOf(changes), (Lines{"1 SHOT_1_V012_COMP 01:00:00:00 01:00:10:00 01:00:20:00 01:00:30:00"}));
    EXPECT_TRUE(changes.at(0).vfx());
    EXPECT_TRUE(generated({oldShot}, {newShot}).isEmpty());
}

TEST(ChangeEdlGenerator, ANameThatFitsAPatternWithoutAVersionIsNoVfxShot)
{
    const Event shot = makeEvent("SHOT_1_V_COMP", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00");
    shot->setVfx(true);
    const Event version = makeEvent("SHOT_1_V7_COMP", "00:01:00:00", "00:01:10:00", "01:00:20:00", "01:00:30:00");
    const std::vector<VfxPatternEntry> rows = {VfxPatternEntry("SHOT_*_V", "_COMP", true)};

    const EventList toTheVersion = generated({shot}, {version}, MatchBy::RollName, rows);
    const EventList fromTheVersion = generated({version}, {shot}, MatchBy::RollName, rows);

    ASSERT_EQ(toTheVersion.size(), 1u);
    EXPECT_TRUE(toTheVersion.at(0).vfx());
    ASSERT_EQ(fromTheVersion.size(), 1u);
    EXPECT_FALSE(fromTheVersion.at(0).vfx());
}

TEST(ChangeEdlGenerator, DisabledAndEmptyRowsAreNoPatterns)
{
    const Event oldShot = makeEvent("VFX_1", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00");
    const Event newShot = makeEvent("VFX_2", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00");
    const VfxPatternEntry disabled("VFX_", "", false);
    const VfxPatternEntry empty("", "", true);
    const VfxPatternEntry disabledAndWrong("A/B", "", false);

    EXPECT_TRUE(generated({oldShot}, {newShot}, MatchBy::RollName, {disabled, empty, disabledAndWrong}).isEmpty());
    EXPECT_EQ(generated({oldShot}, {newShot}, MatchBy::RollName, {empty, VfxPatternEntry("VFX_", "", true)}).size(),
              1u);
}

TEST(ChangeEdlGenerator, ConfiguringAgainForgetsTheFormerPatterns)
{
    const EventList oldEvents =
        listOf({makeEvent("VFX_1", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00")});
    const EventList newEvents =
        listOf({makeEvent("VFX_2", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00")});
    EventList changes;
    ChangeEdlGenerator generator;
    generator.configure(MatchBy::RollName, {VfxPatternEntry("VFX_", "", true)});
    generator.generate(oldEvents, newEvents, changes);
    ASSERT_EQ(changes.size(), 1u);

    generator.configure(MatchBy::RollName, {});
    generator.generate(oldEvents, newEvents, changes);

    EXPECT_TRUE(changes.isEmpty());
}

TEST(ChangeEdlGenerator, ARowWithAForbiddenCharacterFails)
{
    ChangeEdlGenerator generator;

    EXPECT_EQ(thrownBy([&] { generator.configure(MatchBy::RollName, {VfxPatternEntry("A/B", "", true)}); }),
              Result::InvalidArgument);
    EXPECT_EQ(thrownBy([&] { generator.configure(MatchBy::RollName, {VfxPatternEntry("", "A B", true)}); }),
              Result::InvalidArgument);
}

TEST(ChangeEdlGenerator, WithoutAFramerateNothingIsGenerated)
{
    const EventList programme = listOf({makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00")});
    const NoProject none;
    EventList changes;

    EXPECT_EQ(thrownBy([&] { ChangeEdlGenerator().generate(programme, programme, changes); }), Result::NotAvailable);
}

TEST(ChangeEdlGenerator, AStretchThatLeavesTheDayFails)
{
    // 201 frames of the source count as programme time, and the new programme has room for 200.
    const EventList oldEvents = listOf({makeEvent("A", "00:01:00:00", "00:01:08:01", "01:00:00:00", "01:00:08:00")});
    const EventList newEvents = listOf({makeEvent("A", "00:01:00:00", "00:01:08:01", "23:59:51:24", "23:59:59:24")});
    EventList changes;

    EXPECT_EQ(thrownBy([&] { ChangeEdlGenerator().generate(oldEvents, newEvents, changes); }), Result::OutOfRange);
}

// Which of two old places wins is decided among stretches that both exist.
TEST(ChangeEdlGenerator, AStretchThatLeavesTheDayFailsAlsoWhereAnotherOneWouldWin)
{
    const EventList twins = listOf({makeEvent("A", "00:01:00:00", "00:01:08:01", "01:00:00:00", "01:00:08:00"),
                                    makeEvent("A", "00:01:00:00", "00:01:08:01", "23:59:51:24", "23:59:59:24")});
    const EventList placed = listOf({makeEvent("A", "00:01:00:00", "00:01:08:01", "01:00:00:00", "01:00:08:00")});
    EventList changes;

    EXPECT_EQ(thrownBy([&] { ChangeEdlGenerator().generate(twins, placed, changes); }), Result::OutOfRange);
}

// At half speed the second candidate reaches from 23:59:57 for four seconds; the first, of six seconds, overlaps it.
TEST(ChangeEdlGenerator, AStretchWhoseSourceLeavesTheDayFailsAlsoWhereAnotherOneWouldWin)
{
    const Event winner = makeEvent("A", "23:59:53:00", "23:59:56:00", "01:00:00:00", "01:00:06:00");
    const Event leaver = makeEvent("A", "23:59:55:00", "23:59:57:00", "01:01:00:00", "01:01:04:00");
    const EventList placed = listOf({makeEvent("A", "23:59:53:00", "23:59:57:00", "01:00:00:00", "01:00:08:00")});
    EventList changes;

    EXPECT_EQ(ChangeEdlGenerator().generate(listOf({winner}), placed, changes), Result::Ok);
    EXPECT_EQ(changes.size(), 1u);
    EXPECT_EQ(thrownBy([&] {
                  ChangeEdlGenerator().generate(listOf({winner, leaver}), placed, changes);
              }),
              Result::OutOfRange);
}

TEST(ChangeEdlGenerator, ATransitionThatLeavesTheDayFailsForAValidEvent)
{
    const Event atTheEnd = makeTransition(TransitionType::Dissolve, 250,
                                          makeEvent("A", "23:59:59:00", "23:59:59:20", "01:00:00:00", "01:00:00:20"));
    const EventList plain = listOf({makeEvent("B", "00:01:00:00", "00:01:10:00", "01:00:10:00", "01:00:20:00")});
    EventList changes;

    EXPECT_EQ(thrownBy([&] { ChangeEdlGenerator().generate(listOf({atTheEnd}), plain, changes); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { ChangeEdlGenerator().generate(plain, listOf({atTheEnd}), changes); }), Result::OutOfRange);
}

/// The events that a generation says it failed on, which it says once.
core::GenerationFailure failureOf(const EventList& oldEvents, const EventList& newEvents)
{
    std::vector<core::GenerationFailure> failures;
    EventList changes;
    const auto listener = [&](const core::GenerationFailure& failure) {
        failures.push_back(failure);
        return core::FailureAnswer::Stop;
    };
    EXPECT_EQ(thrownBy([&] { ChangeEdlGenerator().generate(oldEvents, newEvents, changes, listener); }),
              Result::OutOfRange);
    EXPECT_EQ(failures.size(), 1U);
    return failures.empty() ? core::GenerationFailure() : failures.front();
}

TEST(ChangeEdlGenerator, AFailureTellsTheOneEventWhoseTransitionCantBeCutOut)
{
    const TestProject project;
    const Event endless = makeTransition(TransitionType::Wipe, 9999999,
                                         makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00"));
    const Event dissolve = makeTransition(TransitionType::Dissolve, 25,
                                          makeEvent("C", "00:01:00:00", "00:01:10:00", "01:00:20:00", "01:00:30:00"));
    const EventList plain = listOf({makeEvent("B", "00:01:00:00", "00:01:10:00", "01:00:10:00", "01:00:20:00")});

    const core::GenerationFailure inOld = failureOf(listOf({dissolve, endless}), plain);
    EXPECT_EQ(inOld.oldEvent, endless);
    EXPECT_EQ(inOld.newEvent, nullptr);

    const core::GenerationFailure inNew = failureOf(plain, listOf({endless, dissolve}));
    EXPECT_EQ(inNew.oldEvent, nullptr);
    EXPECT_EQ(inNew.newEvent, endless);
}

TEST(ChangeEdlGenerator, AFailureTellsTheTwoEventsThatCantBeBroughtTogether)
{
    const TestProject project;
    const Event fine = makeEvent("B", "00:01:00:00", "00:01:10:00", "00:59:00:00", "00:59:10:00");
    const Event early = makeEvent("A", "00:01:00:00", "00:01:08:01", "01:00:00:00", "01:00:08:00");
    const Event late = makeEvent("A", "00:01:00:00", "00:01:08:01", "23:59:51:24", "23:59:59:24");
    const Event invalid = makeEvent("A", "00:02:00:00", "00:01:00:00", "01:00:00:00", "01:00:08:00");

    // The invalid event takes no part, and still counts where the old event is found.
    const core::GenerationFailure lateInNew = failureOf(listOf({fine, invalid, early}), listOf({fine, late}));
    EXPECT_EQ(lateInNew.oldEvent, early);
    EXPECT_EQ(lateInNew.newEvent, late);

    const core::GenerationFailure lateInOld = failureOf(listOf({early, late, fine}), listOf({early}));
    EXPECT_EQ(lateInOld.oldEvent, late) << "of twins, the one that leaves the day";
    EXPECT_EQ(lateInOld.newEvent, early);
}

/// What a generation that passes over its failures gives.
struct Passed {
    Passed(const std::vector<Event>& oldEvents, const std::vector<Event>& newEvents)
    {
        const auto listener = [&](const core::GenerationFailure& failure) {
            failures.push_back(failure);
            return core::FailureAnswer::PassOver;
        };
        EventList changes;
        EXPECT_EQ(ChangeEdlGenerator().generate(listOf(oldEvents), listOf(newEvents), changes, listener), Result::Ok);
        lines = linesOf(changes);
    }

    std::vector<core::GenerationFailure> failures;
    Lines lines;
};

TEST(ChangeEdlGenerator, AnEventWhoseTransitionCantBeCutOutIsPassedOverWhereThatIsWanted)
{
    const TestProject project;
    const auto endless = [] {
        return makeTransition(TransitionType::Wipe, 9999999,
                              makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00"));
    };
    const Event oldEndless = endless();
    const Event newEndless = endless();
    const Event plain = makeEvent("B", "00:01:00:00", "00:01:10:00", "01:00:10:00", "01:00:20:00");

    const Passed passed({oldEndless, plain}, {newEndless, plain});

    EXPECT_EQ(passed.lines, (Lines{"1 B 01:00:10:00 01:00:20:00 01:00:10:00 01:00:20:00"}));
    ASSERT_EQ(passed.failures.size(), 2U);
    EXPECT_EQ(passed.failures[0].oldEvent, oldEndless);
    EXPECT_EQ(passed.failures[1].newEvent, newEndless);
    EXPECT_FALSE(newEndless->hasFlaw(core::EventFlaw::TransitionDurationInvalid)) << "the inputs stay as they are";
}

TEST(ChangeEdlGenerator, OfTwinsThoseThatStayWithinTheDayAreMatchedWhereTheOthersArePassedOver)
{
    const TestProject project;
    const Event early = makeEvent("A", "00:01:00:00", "00:01:08:01", "01:00:00:00", "01:00:08:00");
    const Event late = makeEvent("A", "00:01:00:00", "00:01:08:01", "23:59:51:24", "23:59:59:24");
    const Lines matched{"1 A 01:00:00:00 01:00:08:01 01:00:00:00 01:00:08:01"};

    for (const std::vector<Event>& oldEvents : {std::vector{early, late}, std::vector{late, early}}) {
        const Passed passed(oldEvents, {early});

        EXPECT_EQ(passed.lines, matched);
        ASSERT_EQ(passed.failures.size(), 1U);
        EXPECT_EQ(passed.failures[0].oldEvent, late);
        EXPECT_EQ(passed.failures[0].newEvent, early);
    }
}

TEST(ChangeEdlGenerator, AnEventThatLeavesTheDayWithAllOfItsTwinsIsPassedOver)
{
    const TestProject project;
    const Event early = makeEvent("A", "00:01:00:00", "00:01:08:01", "01:00:00:00", "01:00:08:00");
    const Event late = makeEvent("A", "00:01:00:00", "00:01:08:01", "23:59:51:24", "23:59:59:24");
    const Event fine = makeEvent("B", "00:01:00:00", "00:01:10:00", "00:59:00:00", "00:59:10:00");

    const Passed passed({early, fine}, {fine, late});

    EXPECT_EQ(passed.lines, (Lines{"1 B 00:59:00:00 00:59:10:00 00:59:00:00 00:59:10:00"}));
    EXPECT_EQ(passed.failures.size(), 1U);
}

Event reversed(const Event& event)
{
    event->setReversed(true);
    return event;
}

TEST(ChangeEdlGenerator, AReversedShotMatchesOnlyAReversedOne)
{
    const TestProject project;
    const auto shot = [] { return makeEvent("A", "10:00:00:00", "10:00:10:00", "02:00:00:00", "02:00:10:00"); };

    EXPECT_EQ(linesOf(generated({shot()}, {reversed(shot())})), Lines{});
    EXPECT_EQ(linesOf(generated({reversed(shot())}, {shot()})), Lines{});
    EXPECT_EQ(linesOf(generated({reversed(shot())}, {reversed(shot())})),
              Lines{"1 A 02:00:00:00 02:00:10:00 02:00:00:00 02:00:10:00"});
}

//  source          |10:00:00 .......... 10:00:08 .. 10:00:10|
//  old programme    <------------------------------ plays ---
//  new programme    <------------------ plays ---
TEST(ChangeEdlGenerator, AReversedShotThatBeginsLaterLosesTheEndOfItsSource)
{
    const TestProject project;
    const Event oldShot = reversed(makeEvent("A", "10:00:00:00", "10:00:10:00", "02:00:00:00", "02:00:10:00"));
    const Event newShot = reversed(makeEvent("A", "10:00:00:00", "10:00:08:00", "01:00:00:00", "01:00:08:00"));

    EXPECT_EQ(linesOf(generated({oldShot}, {newShot})), Lines{"1 A 02:00:02:00 02:00:10:00 01:00:00:00 01:00:08:00"});
}

TEST(ChangeEdlGenerator, ADissolveIntoAReversedShotIsCutOffTheEndOfItsSource)
{
    const TestProject project;
    const auto dissolve = [](const Event& event) {
        return makeTransition(TransitionType::Dissolve, 25, reversed(event));
    };
    const Event oldShot = dissolve(makeEvent("A", "10:00:00:00", "10:00:10:00", "02:00:00:00", "02:00:10:00"));
    const Event newShot = dissolve(makeEvent("A", "10:00:02:00", "10:00:10:00", "01:00:00:00", "01:00:08:00"));

    EXPECT_EQ(linesOf(generated({oldShot}, {newShot})), (Lines{"1 A 02:00:00:00 02:00:01:00 01:00:00:00 01:00:01:00",
                                                               "2 A 02:00:01:00 02:00:08:00 01:00:01:00 01:00:08:00"}));
}

TEST(ChangeEdlGenerator, AnInvalidEventWhoseTransitionCannotBeCutOutTakesNoPart)
{
    const Event atTheEnd = makeTransition(TransitionType::Dissolve, 250,
                                          makeEvent("A", "23:59:59:00", "23:59:59:20", "01:00:00:00", "01:00:00:20"));
    atTheEnd->addFlaw(core::EventFlaw::NotVideoEvent);
    const Event reversed = makeTransition(TransitionType::Wipe, 25,
                                          makeEvent("A", "00:01:10:00", "00:01:00:00", "01:00:00:00", "01:00:10:00"));
    const Event outOfRate = makeTransition(TransitionType::Dissolve, 25,
                                           makeEvent("A", "00:01:00:29", "00:01:10:00", "01:00:00:00", "01:00:10:00"));
    const Event plain = makeEvent("B", "00:01:00:00", "00:01:10:00", "01:00:10:00", "01:00:20:00");
    const std::vector<Event> programme = {atTheEnd, reversed, outOfRate, plain};

    EXPECT_EQ(linesOf(generated(programme, programme)), (Lines{"1 B 01:00:10:00 01:00:20:00 01:00:10:00 01:00:20:00"}));
}

// The piece ends within its event, so that nothing of it is out of the rate; the body keeps its SRC OUT.
TEST(ChangeEdlGenerator, ThePieceOfADissolveWhoseSourceEndIsOutOfTheRateTakesPartAndItsBodyDoesNot)
{
    const Event outOfRate = makeTransition(TransitionType::Dissolve, 25,
                                           makeEvent("A", "00:01:00:00", "00:01:10:29", "01:00:00:00", "01:00:10:00"));
    const Event intact = makeTransition(TransitionType::Dissolve, 25,
                                        makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:30:00", "01:00:40:00"));
    ASSERT_TRUE(outOfRate->hasFlaw(core::EventFlaw::TimecodeInvalid));

    EXPECT_EQ(linesOf(generated({outOfRate}, {outOfRate})),
              (Lines{"1 A 01:00:00:00 01:00:01:00 01:00:00:00 01:00:01:00"}));
    EXPECT_EQ(linesOf(generated({outOfRate}, {intact})),
              (Lines{"1 A 01:00:00:00 01:00:01:00 01:00:30:00 01:00:31:00"}));
    EXPECT_EQ(linesOf(generated({intact}, {outOfRate})),
              (Lines{"1 A 01:00:30:00 01:00:31:00 01:00:00:00 01:00:01:00"}));
    EXPECT_TRUE(outOfRate->hasFlaw(core::EventFlaw::TimecodeInvalid));
}

// The timecodes of a copy count as set, which shows as soon as the transition is cut out of it.
TEST(ChangeEdlGenerator, ADissolveWithAnUnsetTimecodeTakesPartAndACutWithOneDoesNot)
{
    const auto withoutDstIn = [] {
        const auto event = std::make_shared<EventBase>();
        event->setRollName("A");
        event->setSrc(Timecode("00:01:00:00"), Timecode("00:01:10:00"));
        event->setDstOut(Timecode("00:00:10:00"));
        return event;
    };
    const auto dissolve = [&] { return makeTransition(TransitionType::Dissolve, 25, withoutDstIn()); };
    ASSERT_EQ(dissolve()->flaws(), std::vector<std::int32_t>{core::EventFlaw::TimecodeUninitialized});

    EXPECT_EQ(linesOf(generated({dissolve()}, {dissolve()})),
              (Lines{"1 A 00:00:00:00 00:00:01:00 00:00:00:00 00:00:01:00",
                     "2 A 00:00:01:00 00:00:10:00 00:00:01:00 00:00:10:00"}));
    EXPECT_TRUE(generated({withoutDstIn()}, {withoutDstIn()}).isEmpty());
}

TEST(ChangeEdlGenerator, AnInvalidFirstLineOfADissolveStillGivesItsNameToThePiece)
{
    std::vector<Event> dissolve = makeDissolve("A", "01:00:05:00", "01:00:15:00");
    dissolve.front()->setSrcOut(Timecode("00:00:05:29"));
    ASSERT_FALSE(dissolve.front()->isValid());
    // The transition takes all of its event, and no body is left whose name the piece would take.
    dissolve.back()->setTransitionDuration(250);

    const EventList changes = generated(dissolve, dissolve);

    EXPECT_EQ(linesOf(changes), (Lines{"1 TRANS_B--A_00:00:05:29_00:00:05:29 01:00:05:00 01:00:15:00 "
                                       "01:00:05:00 01:00:15:00"}));
    ASSERT_EQ(changes.size(), 1u);
    EXPECT_EQ(changes.at(0).clipName(), "TRANS_clip B--clip A_00:00:05:29_00:00:05:29");
}

TEST(ChangeEdlGenerator, ADissolveFromAnInvalidFirstLineIsMergedWithItsBody)
{
    const auto fromUnreadable = [](const char* dstIn, const char* dstOut) {
        std::vector<Event> dissolve = makeDissolve("A", dstIn, dstOut);
        dissolve.front()->addFlaw(core::EventFlaw::NotVideoEvent);
        return dissolve;
    };

    EXPECT_EQ(
        linesOf(generated(fromUnreadable("01:00:05:00", "01:00:15:00"), fromUnreadable("01:00:25:00", "01:00:35:00"))),
        (Lines{"1 B 01:00:05:00 01:00:15:00 01:00:25:00 01:00:35:00"}));
}

TEST(ChangeEdlGenerator, NothingInCommonGivesAnEmptyListInPlaceOfTheFormer)
{
    const EventList oldEvents = listOf({makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00")});
    const EventList newEvents = listOf({makeEvent("B", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00")});
    EventList changes = listOf({makeEvent("C", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00")});

    EXPECT_EQ(ChangeEdlGenerator().generate(oldEvents, newEvents, changes), Result::Ok);
    EXPECT_TRUE(changes.isEmpty());
    EXPECT_EQ(ChangeEdlGenerator().generate(EventList(), EventList(), changes), Result::Ok);
    EXPECT_TRUE(changes.isEmpty());
}

TEST(ChangeEdlGenerator, AnInvalidEventOnEitherSideTakesNoPart)
{
    const auto placed = [] { return makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00"); };
    const Event unreadable = placed();
    unreadable->addFlaw(core::EventFlaw::SrcInUnreadable);
    const Event outOfRate = makeEvent("A", "00:01:00:00", "00:01:10:25", "01:00:00:00", "01:00:10:00");
    const Event reversed = makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:10:00", "01:00:00:00");

    for (const Event& invalid : {unreadable, outOfRate, reversed}) {
        EXPECT_TRUE(generated({invalid}, {placed()}).isEmpty());
        EXPECT_TRUE(generated({placed()}, {invalid}).isEmpty());
    }
    EXPECT_EQ(generated({placed()}, {placed()}).size(), 1u);
}

TEST(ChangeEdlGenerator, TheInputsStayAsTheyAre)
{
    const std::vector<Event> dissolve = makeDissolve("A", "01:00:05:00", "01:00:15:00");
    EventList oldEvents = listOf(dissolve);
    EventList newEvents = listOf(dissolve);
    dissolve.back()->setVfx(true);
    const Lines before = linesOf(oldEvents);
    EventList changes;

    ChangeEdlGenerator().generate(oldEvents, newEvents, changes);

    EXPECT_EQ(linesOf(oldEvents), before);
    EXPECT_EQ(linesOf(newEvents), before);
    EXPECT_EQ(dissolve.back()->transitionType(), TransitionType::Dissolve);
    EXPECT_EQ(dissolve.back()->transitionDuration(), 25);
    EXPECT_TRUE(dissolve.back()->vfx());
    ASSERT_EQ(changes.size(), 1u);
    EXPECT_FALSE(oldEvents.contains(changes.eventAt(0)));
}

TEST(ChangeEdlGenerator, AHealedEventTakesPartAsAPlainOne)
{
    const auto healed = std::make_shared<core::HealedEvent>();
    healed->addEvent(makeEvent("A", "00:01:00:00", "00:01:10:00", "01:00:00:00", "01:00:10:00"));
    healed->addEvent(makeEvent("A", "00:01:10:00", "00:01:20:00", "01:00:10:00", "01:00:20:00"));
    healed->setRollName("A");

    const EventList changes =
        generated({healed}, {makeEvent("A", "00:01:05:00", "00:01:15:00", "01:00:00:00", "01:00:10:00")});

    EXPECT_EQ(linesOf(changes), (Lines{"1 A 01:00:05:00 01:00:15:00 01:00:00:00 01:00:10:00"}));
    EXPECT_EQ(changes.at(0).eventKind(), core::EventKind::Plain);
}

} // namespace cadrel::tests
