// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/RowLayout.h"

#include "desktop/tracks/TrackIndex.h"
#include "tests/support/standin/TestHost.h"

#include <gtest/gtest.h>

using desktop::RowLayout;
using desktop::TrackIndex;
using standin::Track;
using Velmark::TypeWord;

TEST(RowLayout, HasNoRowWithoutTracks)
{
    const RowLayout rows;
    EXPECT_EQ(rows.count(), 0U);
    EXPECT_EQ(rows.height(), 0);
    EXPECT_FALSE(rows.rowAt(0));
    EXPECT_EQ(rows.firstBelow(0), 0U);
}

TEST(RowLayout, PutsEachRowUnderTheOneBefore)
{
    standin::tests::TestHost host;
    host.addTrack(TypeWord::Folder, u"Dialogue");
    host.addTrack(TypeWord::Audio, u"DIA 1");
    host.addTrack(TypeWord::Marker, u"Notes");
    const TrackIndex index(host.project);
    const RowLayout rows(index.rows(), RowLayout::Size::Medium);
    ASSERT_EQ(rows.count(), 3U);
    EXPECT_EQ(rows.top(0), 0);
    EXPECT_EQ(rows.top(1), 22);
    EXPECT_EQ(rows.top(2), 62);
    EXPECT_EQ(rows.height(), 86);
    EXPECT_EQ(rows.heightOf(1), 40);
}

TEST(RowLayout, FindsTheRowOfEachPixel)
{
    standin::tests::TestHost host;
    host.addTrack(TypeWord::Folder, u"Dialogue");
    host.addTrack(TypeWord::Audio, u"DIA 1");
    const TrackIndex index(host.project);
    const RowLayout rows(index.rows(), RowLayout::Size::Medium);
    EXPECT_FALSE(rows.rowAt(-1));
    EXPECT_EQ(rows.rowAt(0), 0U);
    EXPECT_EQ(rows.rowAt(21), 0U);
    EXPECT_EQ(rows.rowAt(22), 1U);
    EXPECT_EQ(rows.rowAt(61), 1U);
    EXPECT_FALSE(rows.rowAt(62));
    EXPECT_EQ(rows.firstBelow(-5), 0U);
    EXPECT_EQ(rows.firstBelow(62), 2U);
}

TEST(RowLayout, MakesTracksOfSoundAndPictureHigherWithEachSize)
{
    for (const Track::Kind kind : {Track::Kind::Audio, Track::Kind::Video}) {
        const int small = RowLayout::heightOf(kind, RowLayout::Size::Small);
        const int medium = RowLayout::heightOf(kind, RowLayout::Size::Medium);
        EXPECT_LT(small, medium);
        EXPECT_LT(medium, RowLayout::heightOf(kind, RowLayout::Size::Large));
    }
}
