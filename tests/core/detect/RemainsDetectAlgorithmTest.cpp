// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/detect/RemainsDetectAlgorithm.h"

#include "tests/support/ThrownResult.h"
#include "tests/support/core/CutFilm.h"
#include "tests/support/core/RecordingProgress.h"
#include "util/StringUtil.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cstddef>
#include <cstdint>
#include <limits>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::Framerate;
using core::MarkerEntry;
using core::RemainsDetectAlgorithm;
using core::SameInstant;
using core::SecondsRange;
using util::Result;

using Entries = std::vector<MarkerEntry>;

// At 25 fps a frame lasts 0.04 seconds and the threshold of 5 frames 0.2 seconds. Most ranges come from 100 to 110
// seconds and go to 200 to 210 seconds.
struct RemainsFilm : CutFilm {
    using CutFilm::CutFilm;

    void carry(SecondsRange source, SecondsRange destination) { addCut({cutEvent(dialogue, source, destination)}); }
    void carryTenSeconds() { carry({100.0, 110.0}, {200.0, 210.0}); }
    Entries detect(core::ProgressHandlerBase* progress = nullptr, std::int32_t threshold = 5) const
    {
        return detectBy(RemainsDetectAlgorithm(threshold), progress);
    }

    MemoryTrack& dialogue = addTrack(L"Dialogue");
};

MarkerEntry snippetInDialogue(double start, double end)
{
    return {start, end, "Audio snippet in Dialogue", 4};
}

TEST(RemainsDetectAlgorithm, EndOfAClipAtTheStartOfARangeIsARemainder)
{
    //  clip      |-------|
    //  range          100|3 frames|----------------------110
    RemainsFilm film;
    addClip(film.dialogue, 90.0, 100.12);
    film.carryTenSeconds();

    expectEntries(film.detect(), {snippetInDialogue(200.0, 200.12)});
}

TEST(RemainsDetectAlgorithm, StartOfAClipAtTheEndOfARangeIsARemainder)
{
    //  clip                                   |-------|
    //  range     100--------------------------|3 frames|110
    RemainsFilm film;
    addClip(film.dialogue, 109.88, 120.0);
    film.carryTenSeconds();

    expectEntries(film.detect(), {snippetInDialogue(209.88, 210.0)});
}

TEST(RemainsDetectAlgorithm, RemainderAtTheStartComesBeforeTheOneAtTheEnd)
{
    RemainsFilm film;
    addClip(film.dialogue, 109.88, 120.0);
    addClip(film.dialogue, 90.0, 100.04);
    film.carryTenSeconds();

    expectEntries(film.detect(), {snippetInDialogue(200.0, 200.04), snippetInDialogue(209.88, 210.0)});
}

TEST(RemainsDetectAlgorithm, PieceOfExactlyTheThresholdIsARemainderAndOneFrameMoreIsNot)
{
    for (const auto& [frames, isRemainder] : {std::pair(4, true), std::pair(5, true), std::pair(6, false)}) {
        RemainsFilm atStart;
        addClip(atStart.dialogue, 90.0, 100.0 + frames * 0.04);
        atStart.carryTenSeconds();
        EXPECT_EQ(atStart.detect().size(), isRemainder ? 1U : 0U) << frames;

        RemainsFilm atEnd;
        addClip(atEnd.dialogue, 110.0 - frames * 0.04, 120.0);
        atEnd.carryTenSeconds();
        EXPECT_EQ(atEnd.detect().size(), isRemainder ? 1U : 0U) << frames;
    }
}

TEST(RemainsDetectAlgorithm, FiveFramesAreARemainderAtEveryRateAndSixAreNot)
{
    for (const Framerate& rate : {Framerate(24, 0), Framerate(25, 0), Framerate(30, true, 1)}) {
        RemainsFilm film(rate);
        addClip(film.dialogue, 90.0, 100.0 + 5.0 / rate.rate);
        addClip(film.dialogue, 110.0 - 6.0 / rate.rate, 120.0);
        film.carryTenSeconds();

        expectEntries(film.detect(), {snippetInDialogue(200.0, 200.0 + 5.0 / rate.rate)});
    }
}

TEST(RemainsDetectAlgorithm, PieceMayPassTheThresholdByLessThanAnInstant)
{
    // An instant is 1/384000 = 2.604e-6 seconds.
    RemainsFilm justWithin;
    addClip(justWithin.dialogue, 90.0, 100.2 + 2.5e-6);
    justWithin.carryTenSeconds();
    EXPECT_EQ(justWithin.detect().size(), 1U);

    RemainsFilm justBeyond;
    addClip(justBeyond.dialogue, 90.0, 100.2 + 2.7e-6);
    justBeyond.carryTenSeconds();
    EXPECT_EQ(justBeyond.detect().size(), 0U);
}

TEST(RemainsDetectAlgorithm, PieceOfOneInstantOrLessIsNoRemainder)
{
    const auto countOf = [](double length) {
        RemainsFilm film;
        addClip(film.dialogue, 0.0, length);
        film.carry({0.0, 10.0}, {200.0, 210.0});
        return film.detect().size();
    };

    EXPECT_EQ(countOf(SameInstant), 0U);
    EXPECT_EQ(countOf(SameInstant + 1e-12), 1U);

    RemainsFilm belowAnInstant;
    addClip(belowAnInstant.dialogue, 90.0, 100.0 + 2.5e-6);
    addClip(belowAnInstant.dialogue, 110.0 - 2.5e-6, 120.0);
    belowAnInstant.carryTenSeconds();
    EXPECT_EQ(belowAnInstant.detect(), Entries{});
}

TEST(RemainsDetectAlgorithm, ClipsThatOnlyTouchTheRangeLeaveNothingInIt)
{
    RemainsFilm film;
    addClip(film.dialogue, 90.0, 100.0);
    addClip(film.dialogue, 110.0, 120.0);
    film.carryTenSeconds();

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(RemainsDetectAlgorithm, ShortClipThatStandsFreeInsideTheRangeIsNoRemainder)
{
    RemainsFilm film;
    addClip(film.dialogue, 100.04, 100.08);
    addClip(film.dialogue, 109.88, 109.96);
    film.carryTenSeconds();

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(RemainsDetectAlgorithm, ShortClipThatBeginsAtTheVeryStartIsARemainderToo)
{
    RemainsFilm film;
    addClip(film.dialogue, 100.0, 100.12);
    film.carryTenSeconds();

    expectEntries(film.detect(), {snippetInDialogue(200.0, 200.12)});
}

TEST(RemainsDetectAlgorithm, EmptyTrackHasNoRemainders)
{
    RemainsFilm film;
    film.carryTenSeconds();

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(RemainsDetectAlgorithm, RangeThatHoldsOneShortClipWholeGetsASingleEntry)
{
    RemainsFilm film;
    addClip(film.dialogue, 100.0, 100.12);
    film.carry({100.0, 100.12}, {200.0, 200.12});

    expectEntries(film.detect(), {snippetInDialogue(200.0, 200.12)});
}

TEST(RemainsDetectAlgorithm, ShortRangeInsideALongClipGetsASingleEntryForTheRange)
{
    // Only what lies inside the range is measured: 4 frames of a clip of 20 seconds.
    RemainsFilm film;
    addClip(film.dialogue, 90.0, 110.0);
    film.carry({100.0, 100.16}, {200.0, 200.16});

    expectEntries(film.detect(), {snippetInDialogue(200.0, 200.16)});
}

TEST(RemainsDetectAlgorithm, TwoClipsInAShortRangeGetAnEntryEach)
{
    //  clips     --------------|      |-------------
    //  range              100|2 frames|1|2 frames|100.2
    RemainsFilm film;
    addClip(film.dialogue, 90.0, 100.08);
    addClip(film.dialogue, 100.12, 110.0);
    film.carry({100.0, 100.2}, {200.0, 200.2});

    expectEntries(film.detect(), {snippetInDialogue(200.0, 200.08), snippetInDialogue(200.12, 200.2)});
}

TEST(RemainsDetectAlgorithm, EntriesAreTheSameWhenBothTheirEndsDifferByLessThanAnInstant)
{
    // The clip fills the 3 frames of the source; in a destination that is a little longer the entry at the start and
    // the one at the end lie so much apart.
    const auto countOf = [](double difference) {
        RemainsFilm film;
        addClip(film.dialogue, 100.0, 100.12);
        film.carry({100.0, 100.12}, {200.0, 200.12 + difference});
        return film.detect().size();
    };

    EXPECT_EQ(countOf(2.5e-6), 1U);
    EXPECT_EQ(countOf(2.7e-6), 2U);
    EXPECT_EQ(countOf(-2.5e-6), 1U);
    EXPECT_EQ(countOf(-2.7e-6), 2U);
}

TEST(RemainsDetectAlgorithm, EntriesThatShareOneEndAloneAreBothKept)
{
    // Two clips touch in a range of 5 frames, 2 of which are the first one's and 3 the second one's.
    const auto detectIn = [](double dstOut) {
        RemainsFilm film;
        addClip(film.dialogue, 90.0, 100.08);
        addClip(film.dialogue, 100.08, 110.0);
        film.carry({100.0, 100.2}, {200.0, dstOut});
        return film.detect();
    };

    expectEntries(detectIn(200.2), {snippetInDialogue(200.0, 200.08), snippetInDialogue(200.08, 200.2)});
    expectEntries(detectIn(200.12), {snippetInDialogue(200.0, 200.08), snippetInDialogue(200.0, 200.12)});
    expectEntries(detectIn(200.08), {snippetInDialogue(200.0, 200.08), snippetInDialogue(199.96, 200.08)});
}

TEST(RemainsDetectAlgorithm, RangeWithoutLengthHasNoRemainders)
{
    RemainsFilm film;
    addClip(film.dialogue, 90.0, 110.0);
    film.carry({100.0, 100.0}, {200.0, 200.0});

    EXPECT_EQ(film.detect(), Entries{});
}

TEST(RemainsDetectAlgorithm, OnlyAudioTracksAreLookedAtAndAllAreReported)
{
    RemainsFilm film;
    MemoryTrack& picture = film.addTrack(L"Picture", false);
    MemoryTrack& music = film.addTrack(L"Music");
    for (MemoryTrack* track : {&picture, &music}) {
        addClip(*track, 90.0, 100.12);
        addClip(*track, 109.88, 120.0);
    }
    film.addCut({cutEvent(picture, {100.0, 110.0}, {200.0, 210.0}), cutEvent(music, {100.0, 110.0}, {200.0, 210.0})});
    RecordingProgress progress;

    const Entries entries = film.detect(&progress);

    expectEntries(entries,
                  {{200.0, 200.12, "Audio snippet in Music", 4}, {209.88, 210.0, "Audio snippet in Music", 4}});
    EXPECT_EQ(progress.steps(), 2U);
}

TEST(RemainsDetectAlgorithm, CutsAreLookedAtInTheOrderOfTheProgrammeAndTracksInTheirOwn)
{
    RemainsFilm film;
    MemoryTrack& music = film.addTrack(L"Music");
    addClip(film.dialogue, 90.0, 100.12);
    addClip(music, 90.0, 100.08);
    film.addCut(
        {cutEvent(film.dialogue, {100.0, 110.0}, {300.0, 310.0}), cutEvent(music, {100.0, 110.0}, {300.0, 310.0})});
    film.addCut(
        {cutEvent(film.dialogue, {100.0, 110.0}, {200.0, 210.0}), cutEvent(music, {100.0, 110.0}, {200.0, 210.0})});

    expectEntries(film.detect(), {{200.0, 200.12, "Audio snippet in Dialogue", 4},
                                  {200.0, 200.08, "Audio snippet in Music", 4},
                                  {300.0, 300.12, "Audio snippet in Dialogue", 4},
                                  {300.0, 300.08, "Audio snippet in Music", 4}});
}

TEST(RemainsDetectAlgorithm, OfTwoCutsAtOneStartTheLaterOfTheListIsLookedAtAlone)
{
    RemainsFilm film;
    addClip(film.dialogue, 90.0, 100.12);
    film.carryTenSeconds();
    film.carry({99.96, 109.96}, {200.0, 210.0});
    RecordingProgress progress;

    // From 99.96 to the clip's end at 100.12 there are 4 frames.
    expectEntries(film.detect(&progress), {snippetInDialogue(200.0, 200.16)});
    EXPECT_EQ(progress.steps(), 1U);
}

TEST(RemainsDetectAlgorithm, NameOfTheTrackIsWrittenInUtf8)
{
    RemainsFilm film;
    MemoryTrack& effects = film.addTrack(L"Ger\u00E4usche");
    addClip(effects, 90.0, 100.12);
    film.addCut({cutEvent(effects, {100.0, 110.0}, {200.0, 210.0})});

    EXPECT_EQ(film.detect().at(0).name, "Audio snippet in Ger\xC3\xA4usche");
}

TEST(RemainsDetectAlgorithm, ThresholdIsTheOneGivenAndNotThatOfTheSettings)
{
    RemainsFilm film;
    film.settings().setRemainsThreshold(0);
    addClip(film.dialogue, 90.0, 100.12);
    film.carryTenSeconds();

    EXPECT_EQ(film.detect(nullptr, 3).size(), 1U);
    EXPECT_EQ(film.detect(nullptr, 2).size(), 0U);
}

TEST(RemainsDetectAlgorithm, NoPieceIsShortEnoughForAThresholdOfZeroOrLess)
{
    RemainsFilm film;
    addClip(film.dialogue, 90.0, 100.04);
    film.carryTenSeconds();

    EXPECT_EQ(film.detect(nullptr, 0), Entries{});
    EXPECT_EQ(film.detect(nullptr, -1), Entries{});
    EXPECT_EQ(film.detect(nullptr, std::numeric_limits<std::int32_t>::min()), Entries{});
}

TEST(RemainsDetectAlgorithm, EveryPieceIsShortEnoughForTheGreatestThreshold)
{
    RemainsFilm film;
    addClip(film.dialogue, 90.0, 105.0);
    film.carryTenSeconds();

    expectEntries(film.detect(nullptr, std::numeric_limits<std::int32_t>::max()), {snippetInDialogue(200.0, 205.0)});
}

TEST(RemainsDetectAlgorithm, ReportsAStepForEachCutEventAndMayBeCancelledAfterEach)
{
    RemainsFilm film;
    MemoryTrack& picture = film.addTrack(L"Picture", false);
    addClip(film.dialogue, 90.0, 100.12);
    for (const double start : {200.0, 300.0}) {
        film.addCut({cutEvent(film.dialogue, {100.0, 110.0}, {start, start + 10.0}),
                     cutEvent(picture, {100.0, 110.0}, {start, start + 10.0})});
    }
    RecordingProgress progress;

    EXPECT_EQ(film.detect(&progress).size(), 2U);
    EXPECT_EQ(progress.steps(), 4U);
    EXPECT_EQ(RemainsDetectAlgorithm(5).estimateSteps(2, 2), progress.steps());

    for (const std::size_t cutEvents : {1U, 2U, 3U, 4U}) {
        RecordingProgress cancelled(cutEvents);
        EXPECT_EQ(thrownBy([&] { film.detect(&cancelled); }), Result::Cancelled);
        EXPECT_EQ(cancelled.steps(), cutEvents);
    }
}

TEST(RemainsDetectAlgorithm, StopsAsSoonAsTheUserCancels)
{
    RemainsFilm film;
    addClip(film.dialogue, 90.0, 100.12);
    for (const double start : {200.0, 300.0, 400.0})
        film.carry({100.0, 110.0}, {start, start + 10.0});
    RecordingProgress progress(2);

    EXPECT_EQ(thrownBy([&] { film.detect(&progress); }), Result::Cancelled);
    EXPECT_EQ(progress.steps(), 2U);
}

TEST(RemainsDetectAlgorithm, WithoutCutsThereIsNothingToReport)
{
    RemainsFilm film;
    RecordingProgress cancelled(0);

    EXPECT_EQ(film.detect(&cancelled), Entries{});
    EXPECT_EQ(cancelled.steps(), 0U);
}

TEST(RemainsDetectAlgorithm, CutWithoutCutEventsIsOutOfRange)
{
    RemainsFilm film;
    film.addCut({});

    EXPECT_EQ(thrownBy([&] { film.detect(); }), Result::OutOfRange);
}

TEST(RemainsDetectAlgorithm, NamingAMarkerNeedsAStringConverter)
{
    RemainsFilm film;
    addClip(film.dialogue, 90.0, 100.12);
    film.carryTenSeconds();
    util::StringUtil::setConverter(nullptr);

    EXPECT_EQ(thrownBy([&] { film.detect(); }), Result::NotAvailable);
}

TEST(RemainsDetectAlgorithm, EstimatesAStepForEachEventOnEachTrack)
{
    EXPECT_EQ(RemainsDetectAlgorithm(5).estimateSteps(0, 64), 0U);
    EXPECT_EQ(RemainsDetectAlgorithm(5).estimateSteps(1000, 64), 64000U);
    EXPECT_EQ(RemainsDetectAlgorithm(5).estimateSteps(3000000000, 4), 12000000000U);
}

/// At 32 fps all frames are exact in floats.
struct FrameGrid {
    /// Clips from lengths in frames that alternate: gap, clip, gap...
    explicit FrameGrid(const std::vector<std::pair<std::int32_t, std::int32_t>>& gapsAndClips, MemoryTrack& track)
    {
        for (const auto& [gap, length] : gapsAndClips) {
            clipOfFrame.insert(clipOfFrame.end(), static_cast<std::size_t>(gap), NoClip);
            const auto start = clipOfFrame.size();
            clipOfFrame.insert(clipOfFrame.end(), static_cast<std::size_t>(length), static_cast<std::int32_t>(start));
            addClip(track, static_cast<double>(start) / 32.0, static_cast<double>(clipOfFrame.size()) / 32.0);
        }
    }
    std::int32_t clipAt(std::int32_t frame) const
    {
        const auto index = static_cast<std::size_t>(frame);
        return index < clipOfFrame.size() ? clipOfFrame[index] : NoClip;
    }

    static constexpr std::int32_t NoClip = -1;
    std::vector<std::int32_t> clipOfFrame; ///< the first frame of the clip that sounds in it
};

RC_GTEST_PROP(RemainsDetectAlgorithm, RemaindersAreTheShortRunsOfOneClipAtTheEdgesOfARange, ())
{
    RemainsFilm film(Framerate(32, 0));
    const FrameGrid grid(*rc::gen::container<std::vector<std::pair<std::int32_t, std::int32_t>>>(
                             rc::gen::pair(rc::gen::inRange(0, 6), rc::gen::inRange(1, 10))),
                         film.dialogue);
    const auto in = *rc::gen::inRange(0, 60);
    const auto length = *rc::gen::inRange(1, 30);
    const auto out = in + length;
    const auto threshold = *rc::gen::inRange(0, 12);
    film.carry({in / 32.0, out / 32.0}, {1000.0, 1000.0 + length / 32.0});

    std::int32_t atStart = 0;
    while (atStart < length && grid.clipAt(in) != FrameGrid::NoClip && grid.clipAt(in + atStart) == grid.clipAt(in))
        ++atStart;
    // Of two clips that touch at the end of the range the later one counts, and nothing of that lies inside.
    const bool nextTouches = grid.clipAt(out) == out;
    std::int32_t atEnd = 0;
    while (atEnd < length && !nextTouches && grid.clipAt(out - 1) != FrameGrid::NoClip &&
           grid.clipAt(out - 1 - atEnd) == grid.clipAt(out - 1))
        ++atEnd;
    Entries expected;
    if (atStart > 0 && atStart <= threshold)
        expected.push_back(snippetInDialogue(1000.0, 1000.0 + atStart / 32.0));
    const bool fillsTheRange = atStart == length;
    if (atEnd > 0 && atEnd <= threshold && !fillsTheRange)
        expected.push_back(snippetInDialogue(1000.0 + (length - atEnd) / 32.0, 1000.0 + length / 32.0));

    RC_ASSERT(film.detect(nullptr, threshold) == expected);
}

} // namespace
} // namespace cadrel::tests
