// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/detect/OverlapDetectAlgorithm.h"

#include "tests/support/ThrownResult.h"
#include "tests/support/core/CutFilm.h"
#include "tests/support/core/RecordingProgress.h"
#include "util/StringUtil.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cstddef>
#include <cstdint>
#include <iterator>
#include <map>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::MarkerEntry;
using core::OverlapDetectAlgorithm;
using core::SecondsRange;
using util::Result;

using Entries = std::vector<MarkerEntry>;

// Two ranges of 10 seconds want 2 seconds of the same place:
//
//  source 100 to 110   200|--------------|210          at 108 the first holds what comes to 208
//  source 300 to 310             208|--------------|218  at 302 the second holds what comes to 210
struct OverlapFilm : CutFilm {
    using CutFilm::CutFilm;

    void carryBoth()
    {
        addCut({cutEvent(dialogue, {100.0, 110.0}, {200.0, 210.0})});
        addCut({cutEvent(dialogue, {300.0, 310.0}, {208.0, 218.0})});
    }
    Entries detect(core::ProgressHandlerBase* progress = nullptr) const
    {
        return detectBy(OverlapDetectAlgorithm(), progress);
    }

    MemoryTrack& dialogue = addTrack(L"Dialogue");
};

MarkerEntry overlapInDialogue(double start, double end)
{
    return {start, end, "Overlap in Dialogue ", 5};
}

/// One clip under all that any test takes from a track.
void fill(MemoryTrack& track)
{
    addClip(track, 0.0, 10000.0);
}

TEST(OverlapDetectAlgorithm, StretchThatTwoRangesFillWithMaterialIsAnOverlap)
{
    OverlapFilm film;
    fill(film.dialogue);
    film.carryBoth();

    EXPECT_EQ(film.detect(), Entries{overlapInDialogue(208.0, 210.0)});
}

TEST(OverlapDetectAlgorithm, EmptyTrackSpaceOverlapsNothing)
{
    OverlapFilm film;
    film.carryBoth();

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(OverlapDetectAlgorithm, BothRangesNeedMaterialForAnOverlap)
{
    OverlapFilm firstAlone;
    addClip(firstAlone.dialogue, 100.0, 110.0);
    firstAlone.carryBoth();
    EXPECT_EQ(firstAlone.detect(), Entries{});

    OverlapFilm secondAlone;
    addClip(secondAlone.dialogue, 300.0, 310.0);
    secondAlone.carryBoth();
    EXPECT_EQ(secondAlone.detect(), Entries{});

    OverlapFilm both;
    addClip(both.dialogue, 100.0, 110.0);
    addClip(both.dialogue, 300.0, 310.0);
    both.carryBoth();
    EXPECT_EQ(both.detect().size(), 1U);
}

TEST(OverlapDetectAlgorithm, MaterialOfTheFirstRangeIsLookedForWhereTheOverlapBegins)
{
    const auto countWithClip = [](double start, double end) {
        OverlapFilm film;
        addClip(film.dialogue, 300.0, 310.0);
        addClip(film.dialogue, start, end);
        film.carryBoth();
        return film.detect().size();
    };

    EXPECT_EQ(countWithClip(100.0, 107.96), 0U);
    EXPECT_EQ(countWithClip(100.0, 108.0), 1U);
    EXPECT_EQ(countWithClip(108.0, 110.0), 1U);
    EXPECT_EQ(countWithClip(108.04, 110.0), 0U);
}

TEST(OverlapDetectAlgorithm, MaterialOfTheSecondRangeIsLookedForWhereTheOverlapEnds)
{
    const auto countWithClip = [](double start, double end) {
        OverlapFilm film;
        addClip(film.dialogue, 100.0, 110.0);
        addClip(film.dialogue, start, end);
        film.carryBoth();
        return film.detect().size();
    };

    EXPECT_EQ(countWithClip(300.0, 301.96), 0U);
    EXPECT_EQ(countWithClip(300.0, 302.0), 1U);
    EXPECT_EQ(countWithClip(302.0, 310.0), 1U);
    EXPECT_EQ(countWithClip(302.04, 310.0), 0U);
}

TEST(OverlapDetectAlgorithm, RangesThatTouchDoNotOverlapAndOneFrameMoreDoes)
{
    const auto entriesForStart = [](double start) {
        OverlapFilm film;
        fill(film.dialogue);
        film.addCut({cutEvent(film.dialogue, {100.0, 110.0}, {200.0, 210.0})});
        film.addCut({cutEvent(film.dialogue, {300.0, 310.0}, {start, start + 10.0})});
        return film.detect();
    };

    EXPECT_EQ(entriesForStart(210.04), Entries{});
    EXPECT_EQ(entriesForStart(210.0), Entries{});
    EXPECT_EQ(entriesForStart(209.96), Entries{overlapInDialogue(209.96, 210.0)});
}

TEST(OverlapDetectAlgorithm, TracksOfAPairShareOneEntryThatHoldsAllTheirOverlaps)
{
    //  Dialogue   200|----------|210        and   208|---------|218
    //  Music      200|------------|211      and  207|----------|218
    //  Effects    200|----------|210        and         210|---|218
    //  Voices     200|---------|209         and   208|---------|218
    OverlapFilm film;
    MemoryTrack& music = film.addTrack(L"Music");
    MemoryTrack& effects = film.addTrack(L"Effects");
    MemoryTrack& voices = film.addTrack(L"Voices");
    for (MemoryTrack& track : film.tracks())
        fill(track);
    film.addCut({cutEvent(film.dialogue, {100.0, 110.0}, {200.0, 210.0}),
                 cutEvent(music, {100.0, 111.0}, {200.0, 211.0}), cutEvent(effects, {100.0, 110.0}, {200.0, 210.0}),
                 cutEvent(voices, {100.0, 109.0}, {200.0, 209.0})});
    film.addCut({cutEvent(film.dialogue, {300.0, 310.0}, {208.0, 218.0}),
                 cutEvent(music, {299.0, 310.0}, {207.0, 218.0}), cutEvent(effects, {302.0, 310.0}, {210.0, 218.0}),
                 cutEvent(voices, {300.0, 310.0}, {208.0, 218.0})});

    EXPECT_EQ(film.detect(), (Entries{{207.0, 211.0, "Overlap in Dialogue Music Voices ", 5}}));
}

TEST(OverlapDetectAlgorithm, TrackIsNamedAfterTheRangeThatStandsFirst)
{
    OverlapFilm film;
    MemoryTrack& other = film.addTrack(L"Other");
    fill(film.dialogue);
    fill(other);
    film.addCut({cutEvent(film.dialogue, {100.0, 110.0}, {200.0, 210.0})});
    film.addCut({cutEvent(other, {300.0, 310.0}, {208.0, 218.0})});

    EXPECT_EQ(film.detect(), Entries{overlapInDialogue(208.0, 210.0)});
}

TEST(OverlapDetectAlgorithm, NamesOfTracksAreWrittenInUtf8)
{
    OverlapFilm film;
    MemoryTrack& effects = film.addTrack(L"Ger\u00E4usche");
    fill(effects);
    film.addCut({cutEvent(effects, {100.0, 110.0}, {200.0, 210.0})});
    film.addCut({cutEvent(effects, {300.0, 310.0}, {208.0, 218.0})});

    EXPECT_EQ(film.detect().at(0).name, "Overlap in Ger\xC3\xA4usche ");
}

TEST(OverlapDetectAlgorithm, TracksAreWalkedAsFarAsBothCutsHaveThem)
{
    OverlapFilm film;
    MemoryTrack& music = film.addTrack(L"Music");
    fill(film.dialogue);
    fill(music);
    film.addCut(
        {cutEvent(film.dialogue, {100.0, 110.0}, {200.0, 210.0}), cutEvent(music, {100.0, 110.0}, {200.0, 210.0})});
    film.addCut({cutEvent(film.dialogue, {300.0, 310.0}, {208.0, 218.0})});
    film.addCut(
        {cutEvent(film.dialogue, {300.0, 310.0}, {216.0, 226.0}), cutEvent(music, {300.0, 310.0}, {216.0, 226.0})});

    EXPECT_EQ(film.detect(), (Entries{overlapInDialogue(208.0, 210.0), overlapInDialogue(216.0, 218.0)}));
}

TEST(OverlapDetectAlgorithm, NeighboursAreThoseOfTheProgrammeAndNotOfTheList)
{
    OverlapFilm film;
    fill(film.dialogue);
    film.addCut({cutEvent(film.dialogue, {500.0, 510.0}, {400.0, 410.0})});
    film.addCut({cutEvent(film.dialogue, {300.0, 310.0}, {208.0, 218.0})});
    film.addCut({cutEvent(film.dialogue, {700.0, 710.0}, {600.0, 610.0})});
    film.addCut({cutEvent(film.dialogue, {100.0, 110.0}, {200.0, 210.0})});

    EXPECT_EQ(film.detect(), Entries{overlapInDialogue(208.0, 210.0)});
}

TEST(OverlapDetectAlgorithm, OnlyNeighboursAreCompared)
{
    //  first    200|------------------------|230
    //  second         210|--|212
    //  third                    220|-----|225      overlaps the first, but stands beside the second
    OverlapFilm film;
    fill(film.dialogue);
    film.addCut({cutEvent(film.dialogue, {100.0, 130.0}, {200.0, 230.0})});
    film.addCut({cutEvent(film.dialogue, {300.0, 302.0}, {210.0, 212.0})});
    film.addCut({cutEvent(film.dialogue, {500.0, 505.0}, {220.0, 225.0})});

    EXPECT_EQ(film.detect(), Entries{overlapInDialogue(210.0, 230.0)});
}

TEST(OverlapDetectAlgorithm, OfTwoCutsAtOneStartTheLaterOfTheListIsComparedAlone)
{
    OverlapFilm film;
    fill(film.dialogue);
    film.addCut({cutEvent(film.dialogue, {100.0, 110.0}, {200.0, 210.0})});
    film.addCut({cutEvent(film.dialogue, {300.0, 305.0}, {200.0, 205.0})});
    film.addCut({cutEvent(film.dialogue, {500.0, 510.0}, {206.0, 216.0})});

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(OverlapDetectAlgorithm, OverlapThatEndsBeforeZeroIsMarkedUpToZero)
{
    OverlapFilm film;
    fill(film.dialogue);
    film.addCut({cutEvent(film.dialogue, {100.0, 110.0}, {-20.0, -10.0})});
    film.addCut({cutEvent(film.dialogue, {300.0, 310.0}, {-12.0, -2.0})});

    EXPECT_EQ(film.detect(), Entries{overlapInDialogue(-12.0, 0.0)});
}

TEST(OverlapDetectAlgorithm, ReportsAStepForEachPairAndMayBeCancelledAfterEach)
{
    OverlapFilm film;
    MemoryTrack& music = film.addTrack(L"Music");
    for (const double start : {200.0, 300.0, 400.0}) {
        film.addCut({cutEvent(film.dialogue, {100.0, 110.0}, {start, start + 10.0}),
                     cutEvent(music, {100.0, 110.0}, {start, start + 10.0})});
    }
    RecordingProgress progress;
    EXPECT_EQ(film.detect(&progress), Entries{});
    EXPECT_EQ(progress.steps(), 2U);

    for (const std::size_t pairs : {1U, 2U}) {
        RecordingProgress cancelled(pairs);
        EXPECT_EQ(thrownBy([&] { film.detect(&cancelled); }), Result::Cancelled);
        EXPECT_EQ(cancelled.steps(), pairs);
    }
}

TEST(OverlapDetectAlgorithm, FindsTheSameWithAProgressAndWithout)
{
    OverlapFilm film;
    fill(film.dialogue);
    film.carryBoth();
    RecordingProgress progress;

    EXPECT_EQ(film.detect(&progress), film.detect(nullptr));
}

TEST(OverlapDetectAlgorithm, StopsAsSoonAsTheUserCancels)
{
    OverlapFilm film;
    fill(film.dialogue);
    film.carryBoth();
    film.addCut({cutEvent(film.dialogue, {500.0, 510.0}, {400.0, 410.0})});
    RecordingProgress progress(1);

    EXPECT_EQ(thrownBy([&] { film.detect(&progress); }), Result::Cancelled);
    EXPECT_EQ(progress.steps(), 1U);
}

TEST(OverlapDetectAlgorithm, WithoutTwoCutsThereIsNothingToReport)
{
    OverlapFilm film;
    fill(film.dialogue);
    RecordingProgress cancelled(0);

    EXPECT_EQ(film.detect(&cancelled), Entries{});
    film.addCut({cutEvent(film.dialogue, {100.0, 110.0}, {200.0, 210.0})});
    EXPECT_EQ(film.detect(&cancelled), Entries{});
    EXPECT_EQ(cancelled.steps(), 0U);
}

TEST(OverlapDetectAlgorithm, CutWithoutCutEventsIsOutOfRange)
{
    OverlapFilm film;
    film.addCut({});

    EXPECT_EQ(thrownBy([&] { film.detect(); }), Result::OutOfRange);
}

TEST(OverlapDetectAlgorithm, NamingAMarkerNeedsAStringConverter)
{
    OverlapFilm film;
    fill(film.dialogue);
    film.carryBoth();
    util::StringUtil::setConverter(nullptr);

    EXPECT_EQ(thrownBy([&] { film.detect(); }), Result::NotAvailable);
}

TEST(OverlapDetectAlgorithm, EstimatesAStepForEachEvent)
{
    EXPECT_EQ(OverlapDetectAlgorithm().estimateSteps(0, 64), 0U);
    EXPECT_EQ(OverlapDetectAlgorithm().estimateSteps(1000, 64), 1000U);
}

RC_GTEST_PROP(OverlapDetectAlgorithm, OnAFullTrackEveryNeighbourThatStartsTooEarlyIsAnOverlap, ())
{
    OverlapFilm film;
    fill(film.dialogue);
    std::map<double, double> endByStart;
    const auto starts = *rc::gen::container<std::vector<std::int32_t>>(rc::gen::inRange(0, 200));
    for (const double start : starts) {
        const double length = *rc::gen::inRange(0, 12);
        film.addCut({cutEvent(film.dialogue, {1000.0, 1000.0 + length}, {start, start + length})});
        endByStart[start] = start + length;
    }

    Entries expected;
    for (auto current = endByStart.begin(); current != endByStart.end(); ++current) {
        const bool overlaps = current != endByStart.begin() && std::prev(current)->second > current->first;
        if (overlaps)
            expected.push_back(overlapInDialogue(current->first, std::prev(current)->second));
    }
    RecordingProgress progress;

    RC_ASSERT(film.detect(&progress) == expected);
    RC_ASSERT(progress.steps() == (endByStart.empty() ? 0U : endByStart.size() - 1));
}

} // namespace
} // namespace cadrel::tests
