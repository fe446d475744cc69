// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/core/MemoryTrack.h"

#include "tests/support/ThrownResult.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

namespace cadrel::tests {
namespace {

using core::AutomationState;
using core::CutEventSpans;
using core::SecondsRange;
using util::Result;

constexpr std::int32_t Volume = 7;

void expectState(const AutomationState& state, double leftTime, double leftValue, double rightTime, double rightValue)
{
    EXPECT_EQ(state.leftTime, leftTime);
    EXPECT_EQ(state.leftValue, leftValue);
    EXPECT_EQ(state.rightTime, rightTime);
    EXPECT_EQ(state.rightValue, rightValue);
}

/// A from 10 to 20, B from 20 to 30, C from 40 to 50.
MemoryTrack makeTrack()
{
    MemoryTrack track(L"Dialogue");
    track.addClip({"A", 10.0, 20.0, 100.0});
    track.addClip({"B", 20.0, 30.0, 200.0});
    track.addClip({"C", 40.0, 50.0, 300.0});
    return track;
}

TEST(MemoryTrack, CutsWhatHangsOverAnAddedClip)
{
    MemoryTrack track = makeTrack();

    track.addClip({"D", 15.0, 25.0, 0.0});

    EXPECT_EQ(
        track.clips(),
        (std::vector<MemoryClip>{
            {"A", 10.0, 15.0, 100.0}, {"D", 15.0, 25.0, 0.0}, {"B", 25.0, 30.0, 205.0}, {"C", 40.0, 50.0, 300.0}}));
}

TEST(MemoryTrack, KeepsBothEndsOfAClipThatSurroundsAnAddedOne)
{
    MemoryTrack track(L"Dialogue");
    track.addClip({"A", 10.0, 20.0, 100.0});

    track.addClip({"D", 12.0, 13.0, 0.0});

    EXPECT_EQ(track.clips(),
              (std::vector<MemoryClip>{{"A", 10.0, 12.0, 100.0}, {"D", 12.0, 13.0, 0.0}, {"A", 13.0, 20.0, 103.0}}));
}

TEST(MemoryTrack, KeepsNoClipShorterThanAnInstant)
{
    MemoryTrack track = makeTrack();

    track.addClip({"D", 10.000001, 19.999999, 0.0});
    track.addClip({"E", 60.0, 60.000001, 0.0});

    EXPECT_EQ(track.clips(),
              (std::vector<MemoryClip>{
                  {"D", 10.000001, 19.999999, 0.0}, {"B", 20.0, 30.0, 200.0}, {"C", 40.0, 50.0, 300.0}}));
}

TEST(MemoryTrack, RefusesAClipBeforeItsStartAndOneThatRunsBackwards)
{
    MemoryTrack track(L"Dialogue");

    EXPECT_EQ(thrownBy([&] { track.addClip({"A", -1.0, 2.0, 0.0}); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([&] { track.addClip({"A", 2.0, 1.0, 0.0}); }), Result::InvalidArgument);
}

TEST(MemoryTrack, CopiesThePartsOfClipsThatStandInTheRangeAndTheGapsBetweenThem)
{
    MemoryTrack track = makeTrack();
    track.addClip({"Overwritten", 100.0, 200.0, 0.0});

    track.copyRange(25.0, 45.0, 105.0);

    EXPECT_EQ(track.clips(), (std::vector<MemoryClip>{{"A", 10.0, 20.0, 100.0},
                                                      {"B", 20.0, 30.0, 200.0},
                                                      {"C", 40.0, 50.0, 300.0},
                                                      {"Overwritten", 100.0, 105.0, 0.0},
                                                      {"B", 105.0, 110.0, 205.0},
                                                      {"C", 120.0, 125.0, 300.0},
                                                      {"Overwritten", 125.0, 200.0, 25.0}}));
}

TEST(MemoryTrack, CopiesARangeOverItself)
{
    MemoryTrack track(L"Dialogue");
    track.addClip({"A", 0.0, 10.0, 0.0});

    track.copyRange(0.0, 10.0, 4.0);

    EXPECT_EQ(track.clips(), (std::vector<MemoryClip>{{"A", 0.0, 4.0, 0.0}, {"A", 4.0, 14.0, 0.0}}));
}

TEST(MemoryTrack, RefusesToCopyBackwardsAndToBeforeItsStart)
{
    MemoryTrack track = makeTrack();

    EXPECT_EQ(thrownBy([&] { track.copyRange(2.0, 1.0, 5.0); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([&] { track.copyRange(1.0, 2.0, -5.0); }), Result::InvalidArgument);
}

TEST(MemoryTrack, CopiesTheCourseOfACurveAndKeepsTheOneAround)
{
    MemoryTrack track(L"Dialogue");
    track.addPoint(Volume, 0.0, 0.0);
    track.addPoint(Volume, 10.0, 1.0);
    track.addPoint(Volume, 20.0, 0.0);

    track.copyRange(5.0, 12.5, 100.0);

    EXPECT_EQ(track.points(Volume), (std::vector<MemoryPoint>{{0.0, 0.0},
                                                              {10.0, 1.0},
                                                              {20.0, 0.0},
                                                              {100.0, 0.0},
                                                              {100.0, 0.5},
                                                              {105.0, 1.0},
                                                              {107.5, 0.75},
                                                              {107.5, 0.0}}));
}

TEST(MemoryTrack, KeepsTheJumpBetweenTwoRangesThatAreCopiedSideBySideInEitherOrder)
{
    const std::vector<MemoryPoint> expected{{0.0, 0.25},   {10.0, 0.25},  {10.0, 0.75},  {100.0, 0.75},
                                            {105.0, 0.75}, {105.0, 0.25}, {110.0, 0.25}, {110.0, 0.75}};
    MemoryTrack track(L"Dialogue");
    for (const MemoryPoint& point : {expected[0], expected[1], expected[2]})
        track.addPoint(Volume, point.time, point.value);
    MemoryTrack other = track;

    track.copyRange(15.0, 20.0, 100.0);
    track.copyRange(2.0, 7.0, 105.0);
    other.copyRange(2.0, 7.0, 105.0);
    other.copyRange(15.0, 20.0, 100.0);

    EXPECT_EQ(track.points(Volume), expected);
    EXPECT_EQ(other.points(Volume), expected);
}

TEST(MemoryTrack, RemovesAllThatStandsFromATimeOn)
{
    MemoryTrack track = makeTrack();
    track.addPoint(Volume, 14.0, 0.5);
    track.addPoint(Volume, 15.0, 1.0);

    track.removeFrom(15.0);

    EXPECT_EQ(track.clips(), (std::vector<MemoryClip>{{"A", 10.0, 15.0, 100.0}}));
    EXPECT_EQ(track.points(Volume), (std::vector<MemoryPoint>{{14.0, 0.5}}));
}

TEST(MemoryTrack, EndsWithItsLastClipOrPoint)
{
    MemoryTrack track(L"Dialogue");
    EXPECT_EQ(track.end(), 0.0);

    track.addClip({"A", 10.0, 20.0, 0.0});
    EXPECT_EQ(track.end(), 20.0);

    track.addPoint(Volume, 25.0, 1.0);
    EXPECT_EQ(track.end(), 25.0);
}

TEST(MemoryTrack, SoundsUpToAndWithoutTheEndOfAClip)
{
    const MemoryTrack track = makeTrack();

    EXPECT_EQ(track.clipAt(9.99), std::nullopt);
    EXPECT_EQ(track.clipAt(10.0)->material, "A");
    EXPECT_EQ(track.clipAt(20.0)->material, "B");
    EXPECT_EQ(track.clipAt(30.0), std::nullopt);
}

TEST(MemoryTrack, FindsTheClipsAroundATime)
{
    const MemoryTrack track = makeTrack();

    const CutEventSpans inside = track.spansAround(25.0);
    const CutEventSpans between = track.spansAround(35.0);

    EXPECT_EQ(inside.before, (SecondsRange{10.0, 20.0}));
    EXPECT_EQ(inside.across, (SecondsRange{20.0, 30.0}));
    EXPECT_EQ(inside.after, (SecondsRange{40.0, 50.0}));
    EXPECT_EQ(between.before, (SecondsRange{20.0, 30.0}));
    EXPECT_EQ(between.across, (SecondsRange{0.0, 0.0}));
    EXPECT_EQ(between.after, (SecondsRange{40.0, 50.0}));
}

TEST(MemoryTrack, CountsBothBoundsOfAClipAsInside)
{
    const MemoryTrack track = makeTrack();

    const CutEventSpans atStart = track.spansAround(40.0);
    const CutEventSpans atEnd = track.spansAround(50.0);

    EXPECT_EQ(atStart.before, (SecondsRange{20.0, 30.0}));
    EXPECT_EQ(atStart.across, (SecondsRange{40.0, 50.0}));
    EXPECT_EQ(atStart.after, (SecondsRange{0.0, 0.0}));
    EXPECT_EQ(atEnd.across, (SecondsRange{40.0, 50.0}));
}

TEST(MemoryTrack, LetsTheLaterOfTwoClipsThatTouchLieAcrossTheTime)
{
    const CutEventSpans spans = makeTrack().spansAround(20.0);

    EXPECT_EQ(spans.before, (SecondsRange{0.0, 0.0}));
    EXPECT_EQ(spans.across, (SecondsRange{20.0, 30.0}));
    EXPECT_EQ(spans.after, (SecondsRange{40.0, 50.0}));
}

TEST(MemoryTrack, FindsThePointsOfACurveAroundATime)
{
    MemoryTrack track(L"Dialogue");
    track.addPoint(Volume, 10.0, 0.1);
    track.addPoint(Volume, 20.0, 0.2);
    track.addPoint(Volume, 20.0, 0.3);
    track.addPoint(Volume, 30.0, 0.4);

    expectState(track.spansAround(5.0).automation.at(Volume), -1.0, -1.0, 10.0, 0.1);
    expectState(track.spansAround(10.0).automation.at(Volume), 10.0, 0.1, 20.0, 0.2);
    expectState(track.spansAround(20.0).automation.at(Volume), 20.0, 0.3, 30.0, 0.4);
    expectState(track.spansAround(45.0).automation.at(Volume), 30.0, 0.4, 45.0, 0.4);
    EXPECT_EQ(track.spansAround(45.0).automation.size(), 1U);
}

TEST(MemoryCutEvent, TellsOfItsTrack)
{
    MemoryTrack track = makeTrack();
    MemoryCutEvent cutEvent(track, 1.0, 2.0, 3.0, 4.0);

    EXPECT_EQ(cutEvent.update(45.0).across, (SecondsRange{40.0, 50.0}));
    EXPECT_EQ(cutEvent.getTrackName(), L"Dialogue");
    EXPECT_TRUE(cutEvent.isAudio());
    EXPECT_EQ(cutEvent.srcIn(), 1.0);
    EXPECT_EQ(cutEvent.srcOut(), 2.0);
    EXPECT_EQ(cutEvent.dstIn(), 3.0);
    EXPECT_EQ(cutEvent.dstOut(), 4.0);
}

} // namespace
} // namespace cadrel::tests
