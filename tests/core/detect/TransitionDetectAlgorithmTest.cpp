// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/detect/TransitionDetectAlgorithm.h"

#include "tests/support/core/CutFilm.h"
#include "tests/support/core/RecordingProgress.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstdint>
#include <limits>
#include <memory>
#include <vector>

namespace cadrel::tests {
namespace {

using core::EventBase;
using core::EventFlaw;
using core::Framerate;
using core::MarkerEntry;
using core::TransitionDetectAlgorithm;
using core::TransitionType;

using Entries = std::vector<MarkerEntry>;

// Programmes start at 01:00:00:00, which is 3600 seconds.
struct TransitionFilm : CutFilm {
    using CutFilm::CutFilm;

    static std::shared_ptr<EventBase> transition(std::int32_t type, const char* dstIn, const char* dstOut)
    {
        auto event = makeEvent("A012", "10:00:00:00", "10:00:01:00", dstIn, dstOut, 7);
        event->setClipName("SC 12 T3");
        event->setTransitionType(type);
        event->setTransitionDuration(25);
        return event;
    }
    EventBase& addOld(std::int32_t type, const char* dstIn, const char* dstOut)
    {
        oldEvents().add(transition(type, dstIn, dstOut));
        return oldEvents().at(oldEvents().size() - 1);
    }
    EventBase& addNew(std::int32_t type, const char* dstIn, const char* dstOut)
    {
        newEvents().add(transition(type, dstIn, dstOut));
        return newEvents().at(newEvents().size() - 1);
    }
    Entries detect(core::ProgressHandlerBase* progress = nullptr) const
    {
        return detectBy(TransitionDetectAlgorithm(), progress);
    }
};

TEST(TransitionDetectAlgorithm, NewDissolveIsMarkedForTheTimeOfItsTransition)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");

    EXPECT_EQ(film.detect(), (Entries{{3610.0, 3611.0, "D 7 A012", 2}}));
}

TEST(TransitionDetectAlgorithm, NewWipeIsMarkedWithItsLetter)
{
    TransitionFilm film;
    film.addNew(TransitionType::Wipe, "01:00:10:00", "01:00:20:00");

    EXPECT_EQ(film.detect(), (Entries{{3610.0, 3611.0, "W 7 A012", 2}}));
}

TEST(TransitionDetectAlgorithm, CutsAndUnknownTransitionsAreNotMarked)
{
    TransitionFilm film;
    for (const std::int32_t type : {0, 3, -1})
        film.addNew(type, "01:00:10:00", "01:00:20:00");

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(TransitionDetectAlgorithm, TransitionMayLastLongerThanItsEventOrNoTimeAtAll)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:11:00").setTransitionDuration(50);
    film.addNew(TransitionType::Dissolve, "01:00:20:00", "01:00:30:00").setTransitionDuration(1);
    film.addNew(TransitionType::Dissolve, "01:00:40:00", "01:00:50:00").setTransitionDuration(0);

    const Entries expected{
        {3610.0, 3612.0, "D 7 A012", 2}, {3620.0, 3620.04, "D 7 A012", 2}, {3640.0, 3640.0, "D 7 A012", 2}};
    EXPECT_EQ(film.detect(), expected);
}

TEST(TransitionDetectAlgorithm, TransitionThatStoodAtTheSamePlaceIsNotMarked)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    film.addOld(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(TransitionDetectAlgorithm, OldWipeAnswersForANewDissolveAndTheOtherWayRound)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    film.addNew(TransitionType::Wipe, "01:00:30:00", "01:00:40:00");
    film.addOld(TransitionType::Dissolve, "01:00:30:00", "01:00:40:00");
    film.addOld(TransitionType::Wipe, "01:00:10:00", "01:00:20:00");

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(TransitionDetectAlgorithm, OldCutAtTheSamePlaceAnswersForNothing)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    film.addOld(TransitionType::Cut, "01:00:10:00", "01:00:20:00");
    film.addOld(3, "01:00:10:00", "01:00:20:00");

    EXPECT_EQ(film.detect().size(), 1U);
}

TEST(TransitionDetectAlgorithm, OldTransitionOneFrameAwayAtEitherEndAnswersForNothing)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    film.addOld(TransitionType::Dissolve, "01:00:09:24", "01:00:20:00");
    film.addOld(TransitionType::Dissolve, "01:00:10:01", "01:00:20:00");
    film.addOld(TransitionType::Dissolve, "01:00:10:00", "01:00:19:24");
    film.addOld(TransitionType::Dissolve, "01:00:10:00", "01:00:20:01");

    EXPECT_EQ(film.detect().size(), 1U);
}

TEST(TransitionDetectAlgorithm, OneOldTransitionAnswersForAllNewOnesAtItsPlace)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    film.addNew(TransitionType::Wipe, "01:00:10:00", "01:00:20:00");
    film.addOld(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(TransitionDetectAlgorithm, OldTransitionAnswersWhateverItsNamesNumberAndDuration)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    EventBase& old = film.addOld(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    old.setRollName("B001");
    old.setEventNumber(8);
    old.setTransitionDuration(50);

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(TransitionDetectAlgorithm, TransitionInsideAChangeEventIsNotMarked)
{
    TransitionFilm deepInside;
    deepInside.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    deepInside.carryOver("01:00:00:00", "01:00:30:00");
    EXPECT_EQ(deepInside.detect(), Entries{});

    TransitionFilm exactly;
    exactly.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    exactly.carryOver("01:00:10:00", "01:00:20:00");
    EXPECT_EQ(exactly.detect(), Entries{});
}

TEST(TransitionDetectAlgorithm, TransitionThatReachesOneFrameOutOfAChangeEventIsMarked)
{
    TransitionFilm before;
    before.addNew(TransitionType::Dissolve, "01:00:09:24", "01:00:20:00");
    before.carryOver("01:00:10:00", "01:00:20:00");
    EXPECT_EQ(before.detect(), (Entries{{3609.96, 3610.96, "D 7 A012", 2}}));

    TransitionFilm behind;
    behind.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:01");
    behind.carryOver("01:00:10:00", "01:00:20:00");
    EXPECT_EQ(behind.detect(), (Entries{{3610.0, 3611.0, "D 7 A012", 2}}));
}

TEST(TransitionDetectAlgorithm, TransitionAcrossTwoChangeEventsThatTouchIsMarked)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    film.carryOver("01:00:00:00", "01:00:15:00");
    film.carryOver("01:00:15:00", "01:00:30:00");

    EXPECT_EQ(film.detect().size(), 1U);
}

TEST(TransitionDetectAlgorithm, TheWholeEventHasToLieInsideAndNotItsTransitionAlone)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    film.carryOver("01:00:05:00", "01:00:15:00");

    EXPECT_EQ(film.detect().size(), 1U);
}

TEST(TransitionDetectAlgorithm, TransitionOfNoLengthLiesInsideNothing)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:10:00");
    film.carryOver("01:00:00:00", "01:00:30:00");

    EXPECT_EQ(film.detect(), (Entries{{3610.0, 3611.0, "D 7 A012", 2}}));
}

TEST(TransitionDetectAlgorithm, TransitionWhosePlaceCannotBeToldIsPassedOver)
{
    for (const std::int32_t flaw : {EventFlaw::DstInUnreadable, EventFlaw::DstOutUnreadable}) {
        TransitionFilm film;
        film.addNew(TransitionType::Wipe, "01:00:00:00", "01:00:10:00").addFlaw(flaw);
        film.addNew(TransitionType::Dissolve, "01:00:20:00", "01:00:30:00");

        EXPECT_EQ(film.detect(), (Entries{{3620.0, 3621.0, "D 7 A012", 2}})) << flaw;
    }
}

TEST(TransitionDetectAlgorithm, TransitionWithAnyOtherFlawIsMarked)
{
    for (std::int32_t flaw = EventFlaw::TimecodeUninitialized; flaw <= EventFlaw::SrcOutUnreadable; ++flaw) {
        TransitionFilm film;
        film.addNew(TransitionType::Dissolve, "01:00:20:00", "01:00:30:00").addFlaw(flaw);

        EXPECT_EQ(film.detect(), (Entries{{3620.0, 3621.0, "D 7 A012", 2}})) << flaw;
    }
}

TEST(TransitionDetectAlgorithm, TransitionWhoseSourceAloneIsReversedOrNoTimeIsMarked)
{
    for (const char* srcOut : {"09:59:59:24", "10:00:70:00"}) {
        TransitionFilm film;
        auto event = makeEvent("A012", "10:00:00:00", srcOut, "01:00:10:00", "01:00:20:00", 7);
        event->setTransitionType(TransitionType::Dissolve);
        event->setTransitionDuration(25);
        film.newEvents().add(event);

        EXPECT_EQ(film.detect(), (Entries{{3610.0, 3611.0, "D 7 A012", 2}})) << srcOut;
    }
}

TEST(TransitionDetectAlgorithm, TransitionsThatEndBeforeTheyStartOrLieAtNoTimeArePassedOver)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:20:00", "01:00:10:00");
    film.addNew(TransitionType::Dissolve, "01:00:00:00", "01:00:10:26");
    film.addNew(TransitionType::Dissolve, "01:00:70:00", "01:00:80:00");
    film.carryOver("01:00:00:00", "01:00:30:00");

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(TransitionDetectAlgorithm, MarkersStandInTheOrderOfTheNewList)
{
    TransitionFilm film;
    film.addNew(TransitionType::Wipe, "01:00:40:00", "01:00:50:00").setEventNumber(3);
    film.addNew(TransitionType::Dissolve, "01:00:20:00", "01:00:30:00").setEventNumber(2);
    film.addNew(TransitionType::Dissolve, "01:00:00:00", "01:00:10:00").setEventNumber(1);
    film.addOld(TransitionType::Dissolve, "01:00:20:00", "01:00:30:00");

    EXPECT_EQ(film.detect(), (Entries{{3640.0, 3641.0, "W 3 A012", 2}, {3600.0, 3601.0, "D 1 A012", 2}}));
}

TEST(TransitionDetectAlgorithm, MarkerIsNamedAfterTheClipUnlessEventsMatchByRoll)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");

    film.settings().setMatchBy(0);
    EXPECT_EQ(film.detect().at(0).name, "D 7 A012");
    for (const std::int32_t matchBy : {1, 2, -1}) {
        film.settings().setMatchBy(matchBy);
        EXPECT_EQ(film.detect().at(0).name, "D 7 SC 12 T3") << matchBy;
    }
}

TEST(TransitionDetectAlgorithm, EventNumberIsPlainDecimal)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00").setEventNumber(0);
    film.addNew(TransitionType::Wipe, "01:00:10:00", "01:00:20:00")
        .setEventNumber(std::numeric_limits<std::uint32_t>::max());

    const Entries entries = film.detect();

    ASSERT_EQ(entries.size(), 2U);
    EXPECT_EQ(entries[0].name, "D 0 A012");
    EXPECT_EQ(entries[1].name, "W 4294967295 A012");
}

TEST(TransitionDetectAlgorithm, TransitionWhoseDurationIsNoTimeOfTheDayIsPassedOver)
{
    const auto isMarked = [](std::int32_t duration) {
        TransitionFilm film;
        film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00").setTransitionDuration(duration);
        return !film.detect().empty();
    };

    EXPECT_FALSE(isMarked(std::numeric_limits<std::int32_t>::min()));
    EXPECT_FALSE(isMarked(-1));
    EXPECT_TRUE(isMarked(0));
    EXPECT_TRUE(isMarked(1));
    // A day at 25 fps has 24 x 3600 x 25 = 2160000 frames.
    EXPECT_TRUE(isMarked(2159999));
    EXPECT_FALSE(isMarked(2160000));
    EXPECT_FALSE(isMarked(2160001));
    EXPECT_FALSE(isMarked(std::numeric_limits<std::int32_t>::max()));
}

TEST(TransitionDetectAlgorithm, TransitionAfterOneWithoutAPossibleDurationIsMarked)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00").setTransitionDuration(-5);
    film.addNew(TransitionType::Wipe, "01:00:20:00", "01:00:30:00");

    EXPECT_EQ(film.detect(), (Entries{{3620.0, 3621.0, "W 7 A012", 2}}));
}

TEST(TransitionDetectAlgorithm, DurationOfATransitionThatIsNotMarkedDoesNotMatter)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00").setTransitionDuration(-1);
    film.carryOver("01:00:10:00", "01:00:20:00");

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(TransitionDetectAlgorithm, ChangeEventWithoutValidTimecodesHoldsNothing)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    ASSERT_TRUE(film.carryOver("01:00:00:00", "01:00:70:00").hasFlaw(EventFlaw::TimecodeInvalid));

    EXPECT_EQ(film.detect().size(), 1U);
}

TEST(TransitionDetectAlgorithm, TimesAreSecondsOfTheRealRateInDropFrame)
{
    // 00:01:00;02 is frame 1800 of the day, at 1800 x 1001 / 30000 = 60.06 seconds; 24 frames last 24 x 1001 / 30000 =
    // 0.8008 seconds. 2000 frames, across the numbers left out at 00:01:00, last 2000 x 1001 / 30000 = 66.73333...
    TransitionFilm film(Framerate(30, true, 1));
    film.addNew(TransitionType::Dissolve, "00:01:00:02", "00:02:00:02").setTransitionDuration(24);
    film.addNew(TransitionType::Wipe, "00:01:00:02", "00:02:00:02").setTransitionDuration(2000);

    expectEntries(film.detect(), {{60.06, 60.8608, "D 7 A012", 2}, {60.06, 60.06 + 200.2 / 3.0, "W 7 A012", 2}});
}

TEST(TransitionDetectAlgorithm, ReportsThreeStepsAndIsNotStoppedByACancel)
{
    TransitionFilm film;
    film.addNew(TransitionType::Dissolve, "01:00:10:00", "01:00:20:00");
    film.addNew(TransitionType::Wipe, "01:00:30:00", "01:00:40:00");
    RecordingProgress cancelled(0);

    const Entries entries = film.detect(&cancelled);

    EXPECT_EQ(entries.size(), 2U);
    EXPECT_EQ(cancelled.steps(), 3U);
}

TEST(TransitionDetectAlgorithm, EmptyListsGiveNoMarkersAndStillThreeSteps)
{
    TransitionFilm film;
    RecordingProgress progress;

    EXPECT_EQ(film.detect(&progress), Entries{});
    EXPECT_EQ(progress.steps(), 3U);
}

TEST(TransitionDetectAlgorithm, EstimatesThreeStepsForAnyFilm)
{
    EXPECT_EQ(TransitionDetectAlgorithm().estimateSteps(0, 0), 3U);
    EXPECT_EQ(TransitionDetectAlgorithm().estimateSteps(1000, 64), 3U);
}

/// A transition of any type in the first second of the programme, so that places often meet.
rc::Gen<std::shared_ptr<EventBase>> anyTransition()
{
    return rc::gen::exec([] {
        const auto in = *rc::gen::inRange(0, 25);
        auto event = eventAtFrames(in, in + *rc::gen::inRange(1, 25));
        event->setTransitionType(*rc::gen::inRange(0, 4));
        event->setTransitionDuration(*rc::gen::inRange(0, 10));
        return event;
    });
}

RC_GTEST_PROP(TransitionDetectAlgorithm, MarksAllNewTransitionsWithoutAnOldPlaceAndOutsideOfChangeEvents, ())
{
    TransitionFilm film;
    for (const auto& event : *rc::gen::container<std::vector<std::shared_ptr<EventBase>>>(anyTransition()))
        film.oldEvents().add(event);
    for (const auto& event : *rc::gen::container<std::vector<std::shared_ptr<EventBase>>>(anyTransition()))
        film.newEvents().add(event);
    // Change events that touch, so that places meet their bounds from either side.
    std::int32_t frame = 0;
    for (const std::int32_t length : *rc::gen::container<std::vector<std::int32_t>>(rc::gen::inRange(5, 30))) {
        film.cuts.add(std::make_shared<core::Cut>(eventAtFrames(frame, frame + length), core::Cut::CutEvents{}));
        frame += length;
    }

    const auto isTransition = [](const EventBase& event) {
        return event.transitionType() == 1 || event.transitionType() == 2;
    };
    Entries expected;
    for (const auto& event : film.newEvents().events()) {
        const auto stoodThere = [&](const auto& old) {
            return isTransition(*old) && old->dstIn() == event->dstIn() && old->dstOut() == event->dstOut();
        };
        const auto holdsIt = [&](const auto& change) {
            return event->dstIn() >= change->dstIn() && change->dstOut() >= event->dstOut();
        };
        const auto& old = film.oldEvents().events();
        const auto& changes = film.cuts.events().events();
        if (!isTransition(*event) || std::any_of(old.begin(), old.end(), stoodThere) ||
            std::any_of(changes.begin(), changes.end(), holdsIt))
            continue;
        const double start = event->dstIn().toFrameCount() / 25.0;
        const double length = event->transitionDuration() / 25.0;
        expected.push_back({start, start + length, event->transitionType() == 1 ? "D 0 ROLL" : "W 0 ROLL", 2});
    }

    RC_ASSERT(film.detect() == expected);
}

} // namespace
} // namespace cadrel::tests
