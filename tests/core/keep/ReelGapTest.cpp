// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/ReelGap.h"

#include "tests/core/picture/Film.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::FrameRange;
using core::FrameRanges;
using core::ReelGap;

using Lines = std::vector<std::string>;

constexpr std::int32_t PartingGap = 60;

ReelGap::Parts partsOf(const std::vector<FrameRange>& pieces, bool keepsLength = false)
{
    ReelGap gap({100, 1000}, true, true, PartingGap);
    for (const FrameRange& piece : pieces)
        gap.add(piece);
    return gap.parts(keepsLength);
}

/// Which way the frames of the gap go: "end", "start" or "stay", with a star for what a clip that spans has left.
Lines waysOf(const ReelGap::Parts& parts)
{
    Lines lines;
    const auto add = [&lines](const char* way, const FrameRange& range) {
        if (!range.isEmpty())
            lines.push_back(way + lineOf(range));
    };
    add("end ", parts.withEnd);
    add("end* ", parts.spanningWithEnd);
    for (const FrameRange& range : parts.staying)
        add("stay ", range);
    for (const FrameRange& range : parts.spanningStaying)
        add("stay* ", range);
    add("start* ", parts.spanningWithStart);
    add("start ", parts.withStart);
    return lines;
}

} // namespace

TEST(ReelGap, WithoutMaterialNothingGoesAnywhere)
{
    EXPECT_EQ(waysOf(partsOf({})), Lines());
    EXPECT_EQ(waysOf(partsOf({{50, 100}, {1000, 1010}})), Lines());
}

TEST(ReelGap, EachBlockGoesWithTheReelThatItTouchesAndOthersStay)
{
    EXPECT_EQ(waysOf(partsOf({{990, 995}, {500, 510}, {159, 170}})),
              (Lines{"end 100..170", "stay 500..510", "start 990..1000"}));
    EXPECT_EQ(waysOf(partsOf({{160, 170}, {930, 940}})), (Lines{"stay 160..170", "stay 930..940"}));
    EXPECT_EQ(waysOf(partsOf({{930, 941}})), (Lines{"start 930..1000"}));
}

TEST(ReelGap, AClipThatSpansLeavesTheBlocksAloneAndGoesWithTheReelBefore)
{
    EXPECT_EQ(waysOf(partsOf({{50, 1050}})), (Lines{"end* 100..1000"}));
    EXPECT_EQ(waysOf(partsOf({{990, 995}, {50, 1050}, {110, 120}})),
              (Lines{"end 100..120", "end* 120..990", "start 990..1000"}));
    // Less than 60 frames from both reels is enough, however the clip lies.
    EXPECT_EQ(waysOf(partsOf({{159, 941}, {990, 995}})), (Lines{"end* 100..941", "start 990..1000"}));
    EXPECT_EQ(waysOf(partsOf({{160, 941}, {990, 995}})), (Lines{"start 160..1000"}));
    EXPECT_EQ(waysOf(partsOf({{159, 940}, {990, 995}})), (Lines{"end 100..995"}));
}

TEST(ReelGap, AClipThatSpansStaysFromTheFirstBlockThatStaysToTheLast)
{
    EXPECT_EQ(waysOf(partsOf({{50, 1050}, {400, 410}, {600, 610}, {990, 995}})),
              (Lines{"end* 100..400", "stay 400..410", "stay 600..610", "stay* 410..600", "start* 610..990",
                     "start 990..1000"}));
}

TEST(ReelGap, ClipsThatRunOutOfTheirReelGoWithItUpToTheOneOfTheOther)
{
    EXPECT_EQ(waysOf(partsOf({{50, 500}, {500, 1050}})), (Lines{"end* 100..500", "start* 500..1000"}));
    EXPECT_EQ(waysOf(partsOf({{50, 500}, {480, 1050}, {110, 120}, {990, 995}})),
              (Lines{"end 100..120", "end* 120..500", "start* 500..990", "start 990..1000"}));
}

TEST(ReelGap, AClipThatRunsOutOfItsReelStaysFromTheBlockOnThatStays)
{
    EXPECT_EQ(waysOf(partsOf({{50, 800}, {400, 410}})), (Lines{"end* 100..400", "stay 400..410", "stay* 410..800"}));
    EXPECT_EQ(waysOf(partsOf({{300, 1050}, {400, 410}})),
              (Lines{"stay 400..410", "stay* 300..400", "start* 410..1000"}));
}

TEST(ReelGap, WhatJoinsReelsThatMoveAlikeTakesTheWholeGapAlong)
{
    EXPECT_EQ(waysOf(partsOf({{150, 950}}, true)), (Lines{"end 100..1000"}));
    EXPECT_EQ(waysOf(partsOf({{150, 160}}, true)), (Lines{"end 100..160"}));
    EXPECT_EQ(waysOf(partsOf({{50, 1050}, {400, 410}}, true)),
              (Lines{"end* 100..400", "stay 400..410", "start* 410..1000"}));
}

TEST(ReelGap, BesideOneReelAClipThatRunsOutOfItJoinsNothing)
{
    ReelGap gap({100, 1000}, true, false, PartingGap);
    for (const FrameRange& piece : FrameRanges{{50, 900}, {110, 120}, {400, 410}, {990, 1000}})
        gap.add(piece);

    EXPECT_EQ(waysOf(gap.parts(false)),
              (Lines{"end 100..120", "end* 120..400", "stay 400..410", "stay 990..1000", "stay* 410..900"}));
}

} // namespace cadrel::tests
