// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/LaneBlocks.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <optional>
#include <vector>

using desktop::Columns;
using desktop::LaneBlocks;
using desktop::SpanIndex;
using desktop::TimeScale;
using Span = SpanIndex::Span;

namespace {

constexpr int Width = 100;

/// A pixel for a second, from `left` on.
TimeScale secondForPixel(double left = 0.0)
{
    TimeScale scale;
    scale.zoomBy(scale.secondsPerPixel(), 0.0);
    scale.setLeft(left);
    return scale;
}

std::vector<Columns> columnsOfBlocks(const LaneBlocks& drawn)
{
    std::vector<Columns> columns;
    for (const LaneBlocks::Block& block : drawn.blocks)
        columns.push_back(block.columns);
    return columns;
}

/// On top in each column: the index of a block, -1 for a strip, -2 for nothing.
std::vector<int> paintedWith(const LaneBlocks& drawn)
{
    std::vector<int> columns(Width, -2);
    const auto fill = [&](const Columns& part, int value) {
        for (int column = std::max(part.first, 0); column < std::min(part.end, Width); ++column)
            columns[static_cast<std::size_t>(column)] = value;
    };
    for (const LaneBlocks::Block& block : drawn.blocks)
        fill(block.columns, static_cast<int>(block.index));
    for (const Columns& strip : drawn.strips)
        fill(strip, -1);
    return columns;
}

SpanIndex someSpans()
{
    std::vector<Span> spans;
    double start = *rc::gen::inRange(-50, 10);
    for (const int step : *rc::gen::container<std::vector<int>>(rc::gen::inRange(0, 40))) {
        start += step / 8.0;
        spans.push_back({start, start + *rc::gen::inRange(0, 100) / 8.0});
    }
    return SpanIndex(std::move(spans));
}

} // namespace

TEST(LaneBlocks, HaveNothingForAnEmptyLane)
{
    const LaneBlocks drawn(SpanIndex(), secondForPixel(), Width);
    EXPECT_TRUE(drawn.blocks.empty());
    EXPECT_TRUE(drawn.strips.empty());
    EXPECT_FALSE(LaneBlocks::hit(SpanIndex(), secondForPixel(), 5, Width));
}

TEST(LaneBlocks, HaveAClipBetweenItsRoundedEdges)
{
    const LaneBlocks drawn(SpanIndex({{2.4, 10.6}, {10.6, 20.5}}), secondForPixel(), Width);
    EXPECT_EQ(columnsOfBlocks(drawn), (std::vector<Columns>{{2, 11}, {11, 21}}));
}

TEST(LaneBlocks, HaveABlockForThreeColumnsAndAStripForFewer)
{
    const LaneBlocks drawn(SpanIndex({{10, 13}, {20, 22}}), secondForPixel(), Width);
    EXPECT_EQ(columnsOfBlocks(drawn), (std::vector<Columns>{{10, 13}}));
    EXPECT_EQ(drawn.strips, (std::vector<Columns>{{20, 22}}));
}

TEST(LaneBlocks, ShowAClipWithoutLengthAndOneOfASampleAsOneColumn)
{
    const LaneBlocks drawn(SpanIndex({{10, 10}, {20, 20 + 1.0 / 48000}}), secondForPixel(), Width);
    EXPECT_EQ(drawn.strips, (std::vector<Columns>{{10, 11}, {20, 21}}));
}

TEST(LaneBlocks, JoinWhatTouchesToOneStrip)
{
    std::vector<Span> spans;
    for (int at = 0; at < 5000; ++at)
        spans.push_back({10.0 + at * 0.01, 10.0 + at * 0.01 + 0.005});
    const LaneBlocks drawn(SpanIndex(std::move(spans)), secondForPixel(), Width);
    EXPECT_EQ(drawn.strips, (std::vector<Columns>{{10, 61}}));
}

TEST(LaneBlocks, ShowNoEdgeOfAClipThatReachesPastBothSides)
{
    const LaneBlocks drawn(SpanIndex({{-1e9, 1e9}}), secondForPixel(), Width);
    EXPECT_EQ(columnsOfBlocks(drawn), (std::vector<Columns>{{-LaneBlocks::Beyond, Width + LaneBlocks::Beyond}}));
}

TEST(LaneBlocks, ShowAClipBeforeTheProjectBegins)
{
    const LaneBlocks drawn(SpanIndex({{-30, -10}}), secondForPixel(-40.0), Width);
    EXPECT_EQ(columnsOfBlocks(drawn), (std::vector<Columns>{{10, 30}}));
}

TEST(LaneBlocks, LeaveOutWhatOnlyTouchesAnEdge)
{
    const LaneBlocks drawn(SpanIndex({{-10, 0}, {100, 110}}), secondForPixel(), Width);
    EXPECT_TRUE(drawn.blocks.empty());
    EXPECT_TRUE(drawn.strips.empty());
}

TEST(LaneBlocks, HaveOnlyWhatIsSeenOfAPart)
{
    const LaneBlocks drawn(SpanIndex({{0, 10}, {20, 30}, {40, 50}}), secondForPixel(), {25, 40}, Width);
    EXPECT_EQ(columnsOfBlocks(drawn), (std::vector<Columns>{{20, 30}}));
}

TEST(LaneBlocks, AreHitWhereTheLastOfTwoThatOverlapLies)
{
    const SpanIndex spans({{0, 20}, {10, 30}, {15, 16}});
    const auto hit = [&](int column) { return LaneBlocks::hit(spans, secondForPixel(), column, Width); };
    EXPECT_EQ(hit(9), 0U);
    EXPECT_EQ(hit(10), 1U);
    EXPECT_EQ(hit(15), 2U);
    EXPECT_EQ(hit(29), 1U);
    EXPECT_EQ(hit(30), std::nullopt);
}

RC_GTEST_PROP(LaneBlocks, CoverTheColumnsOfEachClipAndNoOthers, ())
{
    const SpanIndex spans = someSpans();
    const TimeScale scale = secondForPixel(*rc::gen::inRange(-40, 40) / 4.0);
    std::vector<bool> expected(Width, false);
    for (std::size_t at = 0; at < spans.size(); ++at) {
        const Columns columns = LaneBlocks::columnsOf(spans[at], scale, Width);
        RC_ASSERT(columns.count() >= 1);
        for (int column = std::max(columns.first, 0); column < std::min(columns.end, Width); ++column)
            expected[static_cast<std::size_t>(column)] = true;
    }
    const std::vector<int> painted = paintedWith(LaneBlocks(spans, scale, Width));
    for (std::size_t column = 0; column < expected.size(); ++column)
        RC_ASSERT((painted[column] != -2) == expected[column]);
}

RC_GTEST_PROP(LaneBlocks, HaveAtMostOneStripForTwoColumns, ())
{
    const LaneBlocks drawn(someSpans(), secondForPixel(), Width);
    for (std::size_t at = 1; at < drawn.strips.size(); ++at)
        RC_ASSERT(drawn.strips[at].first > drawn.strips[at - 1].end);
}

RC_GTEST_PROP(LaneBlocks, AreHitWhereTheyAreDrawn, ())
{
    const SpanIndex spans = someSpans();
    const TimeScale scale = secondForPixel(*rc::gen::inRange(-40, 40) / 4.0);
    const std::vector<int> painted = paintedWith(LaneBlocks(spans, scale, Width));
    for (int column = 0; column < Width; ++column) {
        const std::optional<std::size_t> hit = LaneBlocks::hit(spans, scale, column, Width);
        const int shown = painted[static_cast<std::size_t>(column)];
        RC_ASSERT(hit.has_value() == (shown != -2));
        if (shown >= 0)
            RC_ASSERT(*hit == static_cast<std::size_t>(shown));
        if (shown == -1)
            RC_ASSERT(LaneBlocks::columnsOf(spans[*hit], scale, Width).count() < LaneBlocks::LeastBlock);
    }
}
