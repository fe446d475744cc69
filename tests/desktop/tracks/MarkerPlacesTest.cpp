// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/MarkerPlaces.h"

#include <gtest/gtest.h>

using desktop::Columns;
using desktop::markerPlaces;
using desktop::SpanIndex;
using desktop::TimeScale;

namespace {

TimeScale secondForPixel()
{
    TimeScale scale;
    scale.zoomBy(scale.secondsPerPixel(), 0.0);
    return scale;
}

} // namespace

TEST(MarkerPlaces, HaveRoomUpToTheNextMarkerAndToTheEdge)
{
    const auto places = markerPlaces(SpanIndex({{10, 10}, {40, 60}}), secondForPixel(), 100);
    ASSERT_EQ(places.size(), 2U);
    EXPECT_EQ(places[0].columns, (Columns{10, 11}));
    EXPECT_EQ(places[0].room, 30);
    EXPECT_EQ(places[1].columns, (Columns{40, 60}));
    EXPECT_EQ(places[1].room, 60);
}

TEST(MarkerPlaces, AreOneForTenThousandMarkersOnOnePixel)
{
    std::vector<SpanIndex::Span> spans;
    for (int at = 0; at < 10000; ++at)
        spans.push_back({50.0 + at * 1e-5, 50.0 + at * 1e-5});
    const auto places = markerPlaces(SpanIndex(std::move(spans)), secondForPixel(), 100);
    ASSERT_EQ(places.size(), 1U);
    EXPECT_EQ(places[0].index, 9999U);
    EXPECT_EQ(places[0].room, 50);
}

TEST(MarkerPlaces, KeepALongRangeUnderAShortOneThatBeginsWithIt)
{
    const auto places = markerPlaces(SpanIndex({{10, 90}, {10, 20}}), secondForPixel(), 100);
    ASSERT_EQ(places.size(), 2U);
    EXPECT_EQ(places[0].columns, (Columns{10, 90}));
    EXPECT_EQ(places[0].room, 0);
    EXPECT_EQ(places[1].columns, (Columns{10, 20}));
}

TEST(MarkerPlaces, KeepEachRangeThatBeginsBeforeTheView)
{
    const auto places = markerPlaces(SpanIndex({{-500, 90}, {-100, 20}, {-60, -50}}), secondForPixel(), 100);
    ASSERT_EQ(places.size(), 2U);
    EXPECT_EQ(places[0].columns.end, 90);
    EXPECT_EQ(places[1].columns.end, 20);
}

TEST(MarkerPlaces, LeaveOutWhatBeginsAtTheEdgeOrAfterIt)
{
    EXPECT_TRUE(markerPlaces(SpanIndex({{100, 110}, {200, 200}}), secondForPixel(), 100).empty());
    EXPECT_EQ(markerPlaces(SpanIndex({{99, 110}}), secondForPixel(), 100).size(), 1U);
}
