// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/standin/edit/RangeEditHost.h"

#include <gtest/gtest.h>

using namespace Velmark;

namespace standin::tests {

namespace {

constexpr double Hair = 0.5 * SameInstant;

} // namespace

//  |---- A ----|-B-|---- C ----|         |- A -|       |- C -|
//  0     5    10  12    15    20         0     5      15    20
TEST(DeleteRange, TakesAwayWhatIsInTheRangeAndCutsWhatHangsOver)
{
    RangeEditHost film;
    const auto track = film.addTrack(TypeWord::Audio, u"DX 1");
    film.addClipFrom(track, u"A", 0, 10, 1);
    film.addClip(track, u"B", 10, 12);
    film.addClipFrom(track, u"C", 12, 20, 2);

    film.deleteRange(5, 15);

    EXPECT_EQ(film.eventsOf(track), "A 0-5 +1, C 15-20 +5");
}

TEST(DeleteRange, SplitsWhatHangsOverBothEdges)
{
    RangeEditHost film;
    const auto track = film.addTrack(TypeWord::Audio, u"DX 1");
    const auto part = film.addPart(track, u"part", 0, 20);
    film.addClip(part, u"a", 4, 16);

    film.deleteRange(5, 15);

    EXPECT_EQ(film.eventsOf(track), "part 0-5 (a 4-5 +0), part 15-20 (a 15-16 +11)");
}

//  |------- A -------|                  |---- A ----|
//   |------ B ------|         becomes   |--- B ----|
//         |--- C ---|                   |--- C ----|      in this order
//  0     10         20                 10         20
TEST(DeleteRange, WhatIsLeftOfThoseThatHungOverItsEndStaysBeforeWhatBeginsThere)
{
    RangeEditHost film;
    const auto track = film.addTrack(TypeWord::Audio, u"DX 1");
    film.addClip(track, u"C", 10, 20);
    film.addClip(track, u"B", 1, 20);
    film.addClip(track, u"A", 0, 20);

    film.deleteRange(0, 10);
    EXPECT_EQ(film.eventsOf(track), "A 10-20 +10, B 10-20 +9, C 10-20 +0");

    ASSERT_TRUE(film.undo());
    EXPECT_EQ(film.eventsOf(track), "A 0-20 +0, B 1-20 +0, C 10-20 +0");
    ASSERT_TRUE(film.redo());
    EXPECT_EQ(film.eventsOf(track), "A 10-20 +10, B 10-20 +9, C 10-20 +0");
}

TEST(DeleteRange, BothPiecesKeepTheAttributes)
{
    RangeEditHost film;
    const auto track = film.addTrack(TypeWord::Audio, u"DX 1");
    film.addClip(track, u"A", 0, 20)->setAttribute("take", FVariant::integer(3), true);

    film.deleteRange(5, 15);

    for (const auto& piece : childrenOf(*track)) {
        FVariant value;
        EXPECT_EQ(piece->getAttribute("take", value), ResultOk);
        EXPECT_EQ(value.asInteger(), 3);
    }
}

TEST(DeleteRange, ReachesEveryTrackButRulers)
{
    RangeEditHost film;
    const auto folder = film.addTrack(TypeWord::Folder, u"Folder");
    const auto audio = film.addTrack(TypeWord::Audio, u"DX 1", folder.get());
    const auto video = film.addTrack(TypeWord::Video, u"Picture");
    const auto marker = film.addTrack(TypeWord::Marker, u"Memos");
    const auto ruler = film.addTrack(TypeWord::Ruler, u"Ruler", folder.get());
    film.addClip(audio, u"A", 0, 20);
    film.addClip(video, u"V", 0, 20);
    film.addRangeMarker(marker, u"scene", 0, 20);
    film.addRangeMarker(ruler, u"reel", 0, 20);
    film.addPointMarker(ruler, u"tick", 10);

    film.deleteRange(5, 15);

    EXPECT_EQ(film.eventsOf(audio), "A 0-5 +0, A 15-20 +15");
    EXPECT_EQ(film.eventsOf(video), "V 0-5 +0, V 15-20 +15");
    EXPECT_EQ(film.eventsOf(marker), "scene 0-5, scene 15-20");
    EXPECT_EQ(film.eventsOf(ruler), "reel 0-20, tick 10");
}

TEST(DeleteRange, APointMarkerAtTheStartGoesAndOneAtTheEndStays)
{
    RangeEditHost film;
    const auto track = film.addTrack(TypeWord::Marker, u"Memos");
    film.addPointMarker(track, u"m1", 5);
    film.addPointMarker(track, u"m2", 10);
    film.addPointMarker(track, u"m3", 15);

    film.deleteRange(5, 15);

    EXPECT_EQ(film.eventsOf(track), "m3 15");
}

TEST(DeleteRange, WhatTouchesTheEdgesStaysAsItIs)
{
    RangeEditHost film;
    const auto track = film.addTrack(TypeWord::Audio, u"DX 1");
    film.addClip(track, u"A", 0, 5 + Hair);
    film.addClip(track, u"B", 15 - Hair, 20);
    const std::string before = film.dump();

    film.deleteRange(5, 15);

    EXPECT_EQ(film.dump(), before);
}

TEST(DeleteRange, BelowTheStartOfTheProjectThereIsNothingToDelete)
{
    RangeEditHost film;
    const auto track = film.addTrack(TypeWord::Audio, u"DX 1");
    film.addClip(track, u"A", 0, 20);
    film.addVolume(track, {{10, 0.25f}, {15, 0.75f}});

    film.deleteRange(-10, 5);

    EXPECT_EQ(film.eventsOf(track), "A 5-20 +5");
    EXPECT_EQ(film.volumeOf(track), "10=0.25 15=0.75");
}

TEST(DeleteRange, ARangeWithoutLengthChangesNothing)
{
    RangeEditHost film;
    const auto track = film.addTrack(TypeWord::Audio, u"DX 1");
    film.addClip(track, u"A", 0, 20);
    film.addVolume(track, {{10, 0.25f}});
    const std::string before = film.dump();

    film.deleteRange(10, 10);

    EXPECT_EQ(film.dump(), before);
}

TEST(DeleteRange, CanBeUndone)
{
    RangeEditHost film;
    const auto track = film.addTrack(TypeWord::Audio, u"DX 1");
    film.addClip(track, u"A", 0, 20);
    film.addVolume(track, {{0, 0.0f}, {10, 1.0f}, {20, 0.25f}});
    const std::string before = film.dump();
    film.deleteRange(5, 15);
    const std::string after = film.dump();

    EXPECT_TRUE(film.undo());
    EXPECT_EQ(film.dump(), before);
    EXPECT_TRUE(film.redo());
    EXPECT_EQ(film.dump(), after);
}

TEST(CopyAll, AndPasteWriteEveryTrackButRulers)
{
    RangeEditHost film;
    const auto folder = film.addTrack(TypeWord::Folder, u"Folder");
    const auto audio = film.addTrack(TypeWord::Audio, u"DX 1", folder.get());
    const auto marker = film.addTrack(TypeWord::Marker, u"Memos");
    const auto ruler = film.addTrack(TypeWord::Ruler, u"Ruler");
    film.addClip(audio, u"A", 0, 10);
    film.addClip(audio, u"X", 45, 55);
    film.addPointMarker(marker, u"memo", 4);
    film.addPointMarker(ruler, u"tick", 4);
    film.addPointMarker(ruler, u"tock", 52);

    film.copyAllAndPaste(2, 8, 50);

    EXPECT_EQ(film.eventsOf(audio), "A 0-10 +0, X 45-50 +0, A 50-56 +2");
    EXPECT_EQ(film.eventsOf(marker), "memo 4, memo 52");
    EXPECT_EQ(film.eventsOf(ruler), "tick 4, tock 52");
}

TEST(CopyAll, TheClipboardKeepsWhatItHasReadAndCanBePastedAgain)
{
    RangeEditHost film;
    const auto track = film.addTrack(TypeWord::Audio, u"DX 1");
    film.addClip(track, u"A", 0, 10);
    Counted<FUnknown> clipboard;

    film.edit(u"Paste twice", [&] {
        EXPECT_EQ(film.transaction()->copyAll(film.document(), clipboard.out(), 2, 8, 0), ResultOk);
        EXPECT_EQ(film.transaction()->deleteRange(film.document(), 0, 0, 10), ResultOk);
        EXPECT_EQ(film.transaction()->paste(film.document(), clipboard.get(), 0, 20), ResultOk);
        EXPECT_EQ(film.transaction()->paste(film.document(), clipboard.get(), 0, 30), ResultOk);
        EXPECT_EQ(film.transaction()->paste(film.document(), clipboard.get(), 0, -3), ResultOk);
    });

    EXPECT_EQ(film.eventsOf(track), "A 0-3 +5, A 20-26 +2, A 30-36 +2");
}

TEST(CopyAll, ATrackThatHasGoneMeanwhileIsPassedOver)
{
    RangeEditHost film;
    const auto gone = film.addTrack(TypeWord::Audio, u"DX 1");
    const auto track = film.addTrack(TypeWord::Audio, u"DX 2");
    film.addClip(gone, u"A", 0, 10);
    film.addClip(track, u"B", 0, 10);
    Counted<FUnknown> clipboard;

    film.edit(u"Paste", [&] {
        EXPECT_EQ(film.transaction()->copyAll(film.document(), clipboard.out(), 2, 8, 0), ResultOk);
        EXPECT_EQ(film.transaction()->remove(film.root(), gone.get()), ResultOk);
        EXPECT_EQ(film.transaction()->paste(film.document(), clipboard.get(), 0, 20), ResultOk);
    });

    EXPECT_EQ(film.eventsOf(gone), "A 0-10 +0");
    EXPECT_EQ(film.eventsOf(track), "B 0-10 +0, B 20-26 +2");
}

TEST(CopyAll, AutomationIsPastedToo)
{
    RangeEditHost film;
    const auto track = film.addTrack(TypeWord::Audio, u"DX 1");
    film.addVolume(track, {{0, 0.0f}, {8, 1.0f}, {10, 0.0f}});

    film.copyAllAndPaste(0, 4, 20);

    EXPECT_EQ(film.volumeOf(track), "0=0 8=1 10=0 20=0 24=0.5 24=0");
}

} // namespace standin::tests
