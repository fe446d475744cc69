// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/detect/InsertDetectAlgorithm.h"

#include "tests/support/core/CutFilm.h"
#include "tests/support/core/RecordingProgress.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstdint>
#include <memory>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::EventFlaw;
using core::Framerate;
using core::InsertDetectAlgorithm;
using core::MarkerEntry;

using Entries = std::vector<MarkerEntry>;

// Programmes start at 01:00:00:00, which is 3600 seconds.
struct InsertFilm : CutFilm {
    using CutFilm::CutFilm;

    core::EventBase& addNew(const char* dstIn, const char* dstOut)
    {
        auto event = makeEvent("A012", "10:00:00:00", "10:00:01:00", dstIn, dstOut);
        event->setClipName("SC 12 T3");
        newEvents().add(event);
        return *event;
    }
    Entries detect(core::ProgressHandlerBase* progress = nullptr) const
    {
        return detectBy(InsertDetectAlgorithm(), progress);
    }
};

MarkerEntry insertOfA012(double start, double end)
{
    return {start, end, "Insert: A012", 1};
}

TEST(InsertDetectAlgorithm, NewEventThatIsFullyCoveredIsNoInsert)
{
    InsertFilm film;
    film.addNew("01:00:10:00", "01:00:20:00");
    film.carryOver("01:00:10:00", "01:00:20:00");

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(InsertDetectAlgorithm, NewEventThatLiesDeepInsideAChangeEventIsNoInsert)
{
    InsertFilm film;
    film.addNew("01:00:10:00", "01:00:20:00");
    film.carryOver("01:00:00:00", "01:00:30:00");

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(InsertDetectAlgorithm, HoleInTheMiddleOfANewEventIsOneInsert)
{
    //  new programme     |----------- A012 -----------|
    //  carried over    |---------|          |-----------|
    //  insert                    |----------|
    InsertFilm film;
    film.addNew("01:00:10:00", "01:00:40:00");
    film.carryOver("01:00:05:00", "01:00:20:00");
    film.carryOver("01:00:30:00", "01:00:45:00");

    EXPECT_EQ(film.detect(), Entries{insertOfA012(3620.0, 3630.0)});
}

TEST(InsertDetectAlgorithm, BothEndsThatNothingCoversAreInserts)
{
    InsertFilm film;
    film.addNew("01:00:00:00", "01:00:30:00");
    film.carryOver("01:00:10:00", "01:00:20:00");

    EXPECT_EQ(film.detect(), (Entries{insertOfA012(3600.0, 3610.0), insertOfA012(3620.0, 3630.0)}));
}

TEST(InsertDetectAlgorithm, NewEventIsAnInsertAsAWholeWithoutAnyCut)
{
    InsertFilm film;
    film.addNew("01:00:00:00", "01:00:30:00");

    EXPECT_EQ(film.detect(), Entries{insertOfA012(3600.0, 3630.0)});
}

TEST(InsertDetectAlgorithm, ChangeEventsThatOnlyTouchANewEventCoverNothingOfIt)
{
    InsertFilm film;
    film.addNew("01:00:10:00", "01:00:20:00");
    film.carryOver("01:00:00:00", "01:00:10:00");
    film.carryOver("01:00:20:00", "01:00:30:00");

    EXPECT_EQ(film.detect(), Entries{insertOfA012(3610.0, 3620.0)});
}

TEST(InsertDetectAlgorithm, OneUncoveredFrameIsAnInsert)
{
    // A frame lasts 0.04 seconds.
    InsertFilm atStart;
    atStart.addNew("01:00:10:00", "01:00:20:00");
    atStart.carryOver("01:00:10:01", "01:00:20:00");
    EXPECT_EQ(atStart.detect(), Entries{insertOfA012(3610.0, 3610.04)});

    InsertFilm atEnd;
    atEnd.addNew("01:00:10:00", "01:00:20:00");
    atEnd.carryOver("01:00:10:00", "01:00:19:24");
    EXPECT_EQ(atEnd.detect(), Entries{insertOfA012(3619.96, 3620.0)});
}

TEST(InsertDetectAlgorithm, ChangeEventsCoverTogetherWhatNoneCoversAlone)
{
    InsertFilm film;
    film.addNew("01:00:00:00", "01:00:30:00");
    film.carryOver("01:00:18:00", "01:00:30:00");
    film.carryOver("01:00:00:00", "01:00:10:00");
    film.carryOver("01:00:10:00", "01:00:20:00");

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(InsertDetectAlgorithm, NewEventsAreLookedAtInTheOrderOfTheirList)
{
    InsertFilm film;
    film.addNew("01:00:40:00", "01:00:50:00");
    film.addNew("01:00:00:00", "01:00:10:00");
    film.newEvents().add(film.newEvents().eventAt(0));

    const Entries expected{insertOfA012(3640.0, 3650.0), insertOfA012(3600.0, 3610.0), insertOfA012(3640.0, 3650.0)};
    EXPECT_EQ(film.detect(), expected);
}

TEST(InsertDetectAlgorithm, InsertIsNamedAfterTheRollWhenEventsMatchByRoll)
{
    InsertFilm film;
    film.settings().setMatchBy(0);
    film.addNew("01:00:00:00", "01:00:10:00");

    EXPECT_EQ(film.detect().at(0).name, "Insert: A012");
}

TEST(InsertDetectAlgorithm, InsertIsNamedAfterTheClipWhenEventsMatchByAnythingElse)
{
    InsertFilm film;
    film.addNew("01:00:00:00", "01:00:10:00");

    for (const std::int32_t matchBy : {1, 2, -1}) {
        film.settings().setMatchBy(matchBy);
        EXPECT_EQ(film.detect().at(0).name, "Insert: SC 12 T3") << matchBy;
    }
}

TEST(InsertDetectAlgorithm, InsertOfANamelessEventHasAnEmptyName)
{
    InsertFilm film;
    film.addNew("01:00:00:00", "01:00:10:00").setRollName("");

    EXPECT_EQ(film.detect().at(0).name, "Insert: ");
}

TEST(InsertDetectAlgorithm, FlawedEventsWithGoodTimecodesTakePartOnBothSides)
{
    InsertFilm film;
    film.addNew("01:00:00:00", "01:00:30:00").addFlaw(EventFlaw::NotVideoEvent);
    film.carryOver("01:00:10:00", "01:00:20:00").addFlaw(EventFlaw::FreeText);

    EXPECT_EQ(film.detect(), (Entries{insertOfA012(3600.0, 3610.0), insertOfA012(3620.0, 3630.0)}));
}

TEST(InsertDetectAlgorithm, ChangeEventWithoutValidTimecodesCoversNothing)
{
    InsertFilm film;
    film.addNew("01:00:00:00", "01:00:10:00");
    ASSERT_TRUE(film.carryOver("01:00:00:00", "01:00:70:00").hasFlaw(EventFlaw::TimecodeInvalid));

    EXPECT_EQ(film.detect(), Entries{insertOfA012(3600.0, 3610.0)});
}

TEST(InsertDetectAlgorithm, NewEventOfNoLengthIsNoInsert)
{
    InsertFilm film;
    film.addNew("01:00:10:00", "01:00:10:00");
    film.addNew("01:00:20:00", "01:00:20:01");

    EXPECT_EQ(film.detect(), Entries{insertOfA012(3620.0, 3620.04)});
}

TEST(InsertDetectAlgorithm, NewEventShorterThanAnInstantIsNoInsertAndOneAsLongIs)
{
    // A frame lasts a millionth of a second more than 1/384000 s, then exactly that, then a millionth less.
    const auto insertsAt = [](double frame) {
        Framerate rate(25, 0);
        InsertFilm film(rate);
        film.addNew("00:00:00:00", "00:00:00:01");
        film.project.framerate.rate = 1.0 / frame;
        return film.detect().size();
    };

    EXPECT_EQ(insertsAt(core::SameInstant + 1e-6), 1U);
    EXPECT_EQ(insertsAt(core::SameInstant), 1U);
    EXPECT_EQ(insertsAt(core::SameInstant - 1e-6), 0U);
}

TEST(InsertDetectAlgorithm, NewEventWhosePlaceCannotBeToldIsPassedOver)
{
    for (const std::int32_t flaw : {EventFlaw::DstInUnreadable, EventFlaw::DstOutUnreadable}) {
        InsertFilm film;
        film.addNew("01:00:00:00", "01:00:10:00").addFlaw(flaw);
        film.addNew("01:00:20:00", "01:00:30:00");

        EXPECT_EQ(film.detect(), Entries{insertOfA012(3620.0, 3630.0)}) << flaw;
    }
}

TEST(InsertDetectAlgorithm, NewEventWithAnyOtherFlawIsAnInsert)
{
    for (std::int32_t flaw = EventFlaw::TimecodeUninitialized; flaw <= EventFlaw::SrcOutUnreadable; ++flaw) {
        InsertFilm film;
        film.addNew("01:00:00:00", "01:00:10:00").addFlaw(flaw);

        EXPECT_EQ(film.detect(), Entries{insertOfA012(3600.0, 3610.0)}) << flaw;
    }
}

TEST(InsertDetectAlgorithm, NewEventWhoseSourceAloneIsReversedOrNoTimeIsAnInsert)
{
    const auto insertsWithSource = [](const char* srcIn, const char* srcOut) {
        InsertFilm film;
        film.newEvents().add(makeEvent("A012", srcIn, srcOut, "01:00:00:00", "01:00:10:00"));
        return film.detect();
    };

    EXPECT_EQ(insertsWithSource("10:00:01:00", "10:00:00:24"), Entries{insertOfA012(3600.0, 3610.0)});
    EXPECT_EQ(insertsWithSource("10:00:00:00", "10:00:70:00"), Entries{insertOfA012(3600.0, 3610.0)});
    EXPECT_EQ(insertsWithSource("10:00:00:25", "10:00:01:00"), Entries{insertOfA012(3600.0, 3610.0)});
}

TEST(InsertDetectAlgorithm, NewEventsThatEndBeforeTheyStartOrLieAtNoTimeArePassedOver)
{
    InsertFilm film;
    film.addNew("01:00:10:00", "01:00:09:24");
    film.addNew("01:00:00:00", "01:00:10:26");
    film.addNew("01:00:00:00", "01:00:70:00");
    film.addNew("01:00:20:00", "01:00:30:00");

    EXPECT_EQ(film.detect(), Entries{insertOfA012(3620.0, 3630.0)});
}

TEST(InsertDetectAlgorithm, ChangeEventThatEndsBeforeItStartsCoversNothing)
{
    InsertFilm film;
    film.addNew("01:00:00:00", "01:00:30:00");
    film.carryOver("01:00:20:00", "01:00:10:00");
    film.carryOver("01:00:05:00", "01:00:06:00");
    film.carryOver("01:00:25:00", "01:00:24:24");

    EXPECT_EQ(film.detect(), (Entries{insertOfA012(3600.0, 3605.0), insertOfA012(3606.0, 3630.0)}));
}

TEST(InsertDetectAlgorithm, ChangeEventWhoseSourceAloneIsReversedCoversItsPlace)
{
    InsertFilm film;
    film.addNew("01:00:00:00", "01:00:30:00");
    film.carryOver("01:00:10:00", "01:00:20:00")
        .setTimecodes(core::Timecode(1, 0, 5, 0), core::Timecode(1, 0, 0, 0), core::Timecode(1, 0, 10, 0),
                      core::Timecode(1, 0, 20, 0));

    EXPECT_EQ(film.detect(), (Entries{insertOfA012(3600.0, 3610.0), insertOfA012(3620.0, 3630.0)}));
}

TEST(InsertDetectAlgorithm, TimesAreSecondsOfTheRealRateInDropFrame)
{
    // 00:01:00;02 is the frame behind 00:00:59;29, number 1800 of the day: 1800 x 1001 / 30000 = 60.06 seconds. The
    // frame before it starts at 1799 x 1001 / 30000 = 60.0266333... seconds.
    InsertFilm film(Framerate(30, true, 1));
    film.addNew("00:00:59:29", "00:02:00:02");
    film.carryOver("00:01:00:02", "00:02:00:02");

    expectEntries(film.detect(), {insertOfA012(1799 * 1001.0 / 30000.0, 60.06)});
}

TEST(InsertDetectAlgorithm, ReportsThreeStepsAndIsNotStoppedByACancel)
{
    InsertFilm film;
    film.addNew("01:00:00:00", "01:00:10:00");
    film.addNew("01:00:10:00", "01:00:20:00");
    RecordingProgress cancelled(0);

    const Entries entries = film.detect(&cancelled);

    EXPECT_EQ(entries.size(), 2U);
    EXPECT_EQ(cancelled.steps(), 3U);
}

TEST(InsertDetectAlgorithm, NothingNewIsNoInsertAndStillThreeSteps)
{
    InsertFilm film;
    film.carryOver("01:00:00:00", "01:00:10:00");
    RecordingProgress progress;

    EXPECT_EQ(film.detect(&progress), Entries{});
    EXPECT_EQ(progress.steps(), 3U);
}

TEST(InsertDetectAlgorithm, EstimatesThreeStepsForAnyFilm)
{
    EXPECT_EQ(InsertDetectAlgorithm().estimateSteps(0, 0), 3U);
    EXPECT_EQ(InsertDetectAlgorithm().estimateSteps(1000, 64), 3U);
}

/// Stretches of a programme in frames that neither touch nor overlap, from lengths that alternate: gap, stretch, gap...
std::vector<std::pair<std::int32_t, std::int32_t>> stretchesOf(const std::vector<std::int32_t>& lengths)
{
    std::vector<std::pair<std::int32_t, std::int32_t>> stretches;
    std::int32_t frame = 0;
    for (std::size_t i = 0; i + 1 < lengths.size(); i += 2) {
        const std::int32_t start = frame + lengths[i];
        frame = start + lengths[i + 1];
        stretches.emplace_back(start, frame);
    }
    return stretches;
}

RC_GTEST_PROP(InsertDetectAlgorithm, InsertsAreTheLongestRunsOfFramesThatNoChangeEventCovers, ())
{
    InsertFilm film;
    const auto lengths = *rc::gen::container<std::vector<std::int32_t>>(rc::gen::inRange(1, 40));
    std::vector<bool> isCovered(4000);
    for (const auto& [start, end] : stretchesOf(lengths)) {
        RC_PRE(end <= 4000);
        film.cuts.add(std::make_shared<core::Cut>(eventAtFrames(start, end), core::Cut::CutEvents{}));
        std::fill(isCovered.begin() + start, isCovered.begin() + end, true);
    }
    const auto in = *rc::gen::inRange(0, 600);
    const auto out = in + *rc::gen::inRange(1, 600);
    film.newEvents().add(eventAtFrames(in, out));

    Entries expected;
    for (std::int32_t frame = in; frame < out; ++frame) {
        if (isCovered[static_cast<std::size_t>(frame)])
            continue;
        const bool goesOn = frame > in && !isCovered[static_cast<std::size_t>(frame) - 1];
        if (!goesOn)
            expected.push_back({frame / 25.0, 0.0, "Insert: ROLL", 1});
        expected.back().end = (frame + 1) / 25.0;
    }

    RC_ASSERT(film.detect() == expected);
}

} // namespace
} // namespace cadrel::tests
