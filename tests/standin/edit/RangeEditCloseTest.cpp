// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/standin/edit/RangeEditHost.h"

#include <gtest/gtest.h>

using namespace Velmark;

namespace standin::tests {

namespace {

struct Film : RangeEditHost {
    Node track = addTrack(TypeWord::Audio, u"DX 1");
};

} // namespace

//  |- A -|- A -|- A -|         |------- A -------|
//  0     2     6    10         0                10
TEST(CloseRange, JoinsWhatCopyRangeHasSplit)
{
    Film film;
    film.addClipFrom(film.track, u"A", 0, 10, 1);
    film.copyRange({film.track}, 2, 6, 2);
    ASSERT_EQ(film.eventsOf(film.track), "A 0-2 +1, A 2-6 +3, A 6-10 +7");

    EXPECT_TRUE(film.closeRange({film.track}, 0, 10));

    EXPECT_EQ(film.eventsOf(film.track), "A 0-10 +1");
}

TEST(CloseRange, SaysWhenThereIsNothingToJoin)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    const std::string before = film.dump();

    EXPECT_FALSE(film.closeRange({film.track}, 0, 10));

    EXPECT_EQ(film.dump(), before);
}

TEST(CloseRange, LeavesCutsThatTheUserMade)
{
    Film film;
    film.addClipFrom(film.track, u"A", 0, 5, 0);
    film.addClipFrom(film.track, u"A", 5, 10, 5);

    EXPECT_FALSE(film.closeRange({film.track}, 0, 10));
    film.copyRange({film.track}, 0, 10, 20);
    EXPECT_FALSE(film.closeRange({film.track}, 0, 30));

    EXPECT_EQ(film.eventsOf(film.track), "A 0-5 +0, A 5-10 +5, A 20-25 +0, A 25-30 +5");
}

TEST(CloseRange, JoinsPiecesThatWereMovedSideBySide)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.copyRange({film.track}, 4, 10, 54);
    film.copyRange({film.track}, 0, 4, 50);

    EXPECT_TRUE(film.closeRange({film.track}, 40, 70));

    EXPECT_EQ(film.eventsOf(film.track), "A 0-10 +0, A 50-60 +0");
}

TEST(CloseRange, LeavesPiecesThatStandInAnotherOrder)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.copyRange({film.track}, 4, 10, 50);
    film.copyRange({film.track}, 0, 4, 56);

    EXPECT_FALSE(film.closeRange({film.track}, 40, 70));

    EXPECT_EQ(film.eventsOf(film.track), "A 0-10 +0, A 50-56 +4, A 56-60 +0");
}

TEST(CloseRange, LeavesPiecesWithAGapBetweenThem)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.deleteRange(4, 6);

    EXPECT_FALSE(film.closeRange({film.track}, 0, 10));

    EXPECT_EQ(film.eventsOf(film.track), "A 0-4 +0, A 6-10 +6");
}

TEST(CloseRange, LeavesPiecesWhoseSourceDoesNotRunOn)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.deleteRange(4, 6);
    const auto right = childrenOf(*film.track)[1];

    ASSERT_EQ(right->setStart(nullptr, 0, 4), ResultOk);

    EXPECT_FALSE(film.closeRange({film.track}, 0, 10));
    EXPECT_EQ(film.eventsOf(film.track), "A 0-4 +0, A 4-8 +6");
}

TEST(CloseRange, LeavesPiecesWithDifferentAttributes)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10)->setAttribute("take", FVariant::integer(1), true);
    film.copyRange({film.track}, 4, 10, 4);
    const auto right = childrenOf(*film.track)[1];

    right->setAttribute("take", FVariant::integer(2), true);
    EXPECT_FALSE(film.closeRange({film.track}, 0, 10));

    right->setAttribute("take", FVariant::integer(1), true);
    EXPECT_TRUE(film.closeRange({film.track}, 0, 10));
}

TEST(CloseRange, LeavesPiecesOfWhichOneWasRenamed)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.copyRange({film.track}, 4, 10, 4);

    childrenOf(*film.track)[1]->setName(nullptr, text(u"B").get(), 0);

    EXPECT_FALSE(film.closeRange({film.track}, 0, 10));
}

TEST(CloseRange, JoinsOnlyWhereTheCutLiesInTheRangeOrAtItsEdges)
{
    Film film;
    film.addClip(film.track, u"A", 0, 12);
    film.copyRange({film.track}, 4, 8, 4);

    EXPECT_FALSE(film.closeRange({film.track}, 5, 7));
    EXPECT_TRUE(film.closeRange({film.track}, 4, 7));
    EXPECT_EQ(film.eventsOf(film.track), "A 0-8 +0, A 8-12 +8");
    EXPECT_TRUE(film.closeRange({film.track}, 0, 8));
    EXPECT_EQ(film.eventsOf(film.track), "A 0-12 +0");
}

TEST(CloseRange, JoinsOnTheTracksOfTheListAlone)
{
    Film film;
    const auto other = film.addTrack(TypeWord::Audio, u"DX 2");
    film.addClip(film.track, u"A", 0, 10);
    film.addClip(other, u"A", 0, 10);
    film.copyRange({film.track, other}, 4, 8, 4);

    EXPECT_TRUE(film.closeRange({film.track}, 0, 10));

    EXPECT_EQ(film.eventsOf(film.track), "A 0-10 +0");
    EXPECT_EQ(film.eventsOf(other), "A 0-4 +0, A 4-8 +4, A 8-10 +8");
}

//  |----- A -----|             each is split at 4 and at 6
//      |------ B ------|
//      |- C -|
//  0   3  5     10     12
TEST(CloseRange, FindsTheContinuationAmongOverlappingEvents)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.addClip(film.track, u"B", 3, 12);
    film.addClip(film.track, u"C", 3, 5);
    const std::string before = film.dump();
    film.copyRange({film.track}, 4, 6, 4);
    ASSERT_EQ(childrenOf(*film.track).size(), 8U);

    EXPECT_TRUE(film.closeRange({film.track}, 0, 12));

    EXPECT_EQ(film.dump(), before);
}

TEST(CloseRange, JoinsPartsAndWhatIsInThem)
{
    Film film;
    const auto part = film.addPart(film.track, u"part", 0, 20);
    film.addClip(part, u"a", 2, 8);
    film.addClip(part, u"b", 5, 18);
    const auto inner = film.addPart(part, u"inner", 6, 14);
    film.addClip(inner, u"c", 7, 13);
    const std::string before = film.eventsOf(film.track);
    film.copyRange({film.track}, 7.5, 12, 7.5);
    ASSERT_EQ(childrenOf(*film.track).size(), 3U);

    EXPECT_TRUE(film.closeRange({film.track}, 0, 20));

    EXPECT_EQ(film.eventsOf(film.track), before);
}

TEST(CloseRange, LeavesCutsThatTheUserMadeInAPart)
{
    Film film;
    const auto part = film.addPart(film.track, u"part", 0, 20);
    film.addClipFrom(part, u"a", 2, 8, 0);
    film.addClipFrom(part, u"a", 8, 12, 6);
    film.copyRange({film.track}, 8, 20, 8);

    EXPECT_TRUE(film.closeRange({film.track}, 0, 20));

    EXPECT_EQ(film.eventsOf(film.track), "part 0-20 (a 2-8 +0, a 8-12 +6)");
}

TEST(CloseRange, JoinsRangeMarkersAndNeverPointMarkers)
{
    RangeEditHost film;
    const auto track = film.addTrack(TypeWord::Marker, u"Memos");
    film.addRangeMarker(track, u"scene", 0, 20);
    const auto memo = film.addPointMarker(track, u"memo", 10);
    film.copyRange({track}, 10, 15, 50);
    film.copyRange({track}, 10, 15, 10);
    ASSERT_EQ(childrenOf(*track)[2]->setStart(nullptr, 0, 50), ResultOk);
    ASSERT_EQ(film.eventsOf(track), "scene 0-10, scene 10-15, scene 15-20, scene 50-55, memo 50, memo 50");

    EXPECT_TRUE(film.closeRange({track}, 0, 60));

    EXPECT_EQ(film.eventsOf(track), "scene 0-20, scene 50-55, memo 50, memo 50");
}

TEST(CloseRange, JoinsInSpiteOfRounding)
{
    Film film;
    film.addClip(film.track, u"A", 100.0 / 23.976, 1000.0 / 23.976);
    film.copyRange({film.track}, 101.0 / 23.976, 333.0 / 23.976, 86400.0 + 101.0 / 23.976);
    film.copyRange({film.track}, 333.0 / 23.976, 999.0 / 23.976, 86400.0 + 333.0 / 23.976);
    film.deleteRange(0, 50);

    EXPECT_TRUE(film.closeRange({film.track}, 86400, 86500));

    const auto events = childrenOf(*film.track);
    ASSERT_EQ(events.size(), 1U);
    EXPECT_NEAR(events[0]->getStart(nullptr), 86400.0 + 101.0 / 23.976, 1e-9);
    EXPECT_NEAR(events[0]->getEnd(nullptr), 86400.0 + 999.0 / 23.976, 1e-9);
    EXPECT_NEAR(events[0]->getSourceOffset(nullptr), 1.0 / 23.976, 1e-9);
}

TEST(CloseRange, AFilmThatWasTakenApartAndPutTogetherAgainIsAsBefore)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.addClip(film.track, u"B", 10, 15);
    film.addVolume(film.track, {{0, 0.0f}, {8, 1.0f}, {15, 0.5f}});
    const std::string before = film.dump();

    film.copyRange({film.track}, 4, 12, 104);
    film.copyRange({film.track}, 12, 20, 112);
    film.copyRange({film.track}, 0, 4, 100);
    film.deleteRange(0, 20);
    film.copyRange({film.track}, 100, 120, 0);
    film.deleteRange(100, 120);
    EXPECT_TRUE(film.closeRange({film.track}, 0, 20));

    EXPECT_EQ(film.dump(), before);
}

TEST(CloseRange, CanBeUndone)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    const auto part = film.addPart(film.track, u"part", 10, 20);
    film.addClip(part, u"a", 10, 20);
    film.copyRange({film.track}, 4, 14, 4);
    const std::string before = film.dump();
    film.closeRange({film.track}, 0, 20);
    const std::string after = film.dump();

    EXPECT_TRUE(film.undo());
    EXPECT_EQ(film.dump(), before);
    EXPECT_TRUE(film.redo());
    EXPECT_EQ(film.dump(), after);
}

} // namespace standin::tests
