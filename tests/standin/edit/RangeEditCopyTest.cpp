// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/standin/edit/RangeEditHost.h"

#include "standin/edit/EditService.h"
#include "standin/project/MediaClip.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>

using namespace Velmark;

namespace standin::tests {

namespace {

/// Less than to another instant, and more.
constexpr double Hair = 0.5 * SameInstant;
constexpr double Sliver = 2.5 * SameInstant;

struct Film : RangeEditHost {
    Node track = addTrack(TypeWord::Audio, u"DX 1");
};

struct MarkerFilm : RangeEditHost {
    Node track = addTrack(TypeWord::Marker, u"Memos");
};

} // namespace

//  |---- A ----|---- B ----|             |- A -|- B -|
//  0    4     10    14    20            50    56    60
TEST(CopyRange, CutsClipsAtTheEdgesAndTheirSourceOffsetsFollow)
{
    Film film;
    film.addClipFrom(film.track, u"A", 0, 10, 5);
    film.addClipFrom(film.track, u"B", 10, 20, 100);

    film.copyRange({film.track}, 4, 14, 50);

    EXPECT_EQ(film.eventsOf(film.track), "A 0-10 +5, B 10-20 +100, A 50-56 +9, B 56-60 +100");
}

TEST(CopyRange, CutsAClipThatHangsOverBothEdges)
{
    Film film;
    film.addClipFrom(film.track, u"A", 0, 20, 2);

    film.copyRange({film.track}, 5, 8, 30);

    EXPECT_EQ(film.eventsOf(film.track), "A 0-20 +2, A 30-33 +7");
}

TEST(CopyRange, LeavesBehindWhatOnlyTouchesTheEdges)
{
    Film film;
    film.addClip(film.track, u"before", 0, 5);
    film.addClip(film.track, u"A", 5, 10);
    film.addClip(film.track, u"behind", 10, 15);

    film.copyRange({film.track}, 5, 10, 30);

    EXPECT_EQ(film.eventsOf(film.track), "before 0-5 +0, A 5-10 +0, behind 10-15 +0, A 30-35 +0");
}

TEST(CopyRange, GapsTravelToo)
{
    Film film;
    film.addClip(film.track, u"A", 2, 3);
    film.addClip(film.track, u"B", 6, 7);

    film.copyRange({film.track}, 0, 10, 30);

    EXPECT_EQ(film.eventsOf(film.track), "A 2-3 +0, B 6-7 +0, A 32-33 +0, B 36-37 +0");
}

TEST(CopyRange, ThePiecesHaveTheMediaTheAttributesAndTheSelectionOfTheirClip)
{
    Film film;
    const auto clip = film.addClip(film.track, u"A", 0, 10);
    MediaClip& media = film.addMedia(u"/sound/a.wav", 60);
    ASSERT_EQ(query<IClipEvent>(clip)->setClip(&media, 0), ResultOk);
    clip->setAttribute("User:STR_MAReel", FVariant::string("A001"), true);
    clip->setAttribute("take", FVariant::integer(3), false);
    dynamic_cast<Node&>(*clip).setSelected(true);

    film.copyRange({film.track}, 4, 6, 30);

    const auto events = childrenOf(*film.track);
    ASSERT_EQ(events.size(), 2U);
    const auto& piece = dynamic_cast<Node&>(*events[1]);
    EXPECT_EQ(query<IClipEvent>(events[1])->getClip(), &media);
    EXPECT_EQ(piece.attributes(), dynamic_cast<Node&>(*clip).attributes());
    EXPECT_EQ(piece.attributes().size(), 2U);
    EXPECT_TRUE(events[1]->isSelected());
}

//           |-- X --| Z |----- Y -----|              |-X-|--- A ---|--- Y ---|
//          45   50   52 54  58  60   70              45  50       60        70
TEST(CopyRange, ClearsTheDestinationAndCutsWhatHangsOver)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.addClipFrom(film.track, u"X", 45, 52, 1);
    film.addClip(film.track, u"Z", 52, 54);
    film.addClipFrom(film.track, u"Y", 54, 70, 2);

    film.copyRange({film.track}, 0, 10, 50);

    EXPECT_EQ(film.eventsOf(film.track), "A 0-10 +0, X 45-50 +1, A 50-60 +0, Y 60-70 +8");
}

TEST(CopyRange, SplitsAClipThatHangsOverBothEdgesOfTheDestination)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.addClipFrom(film.track, u"X", 40, 80, 3);

    film.copyRange({film.track}, 0, 10, 50);

    EXPECT_EQ(film.eventsOf(film.track), "A 0-10 +0, X 40-50 +3, A 50-60 +0, X 60-80 +23");
}

TEST(CopyRange, AnEmptySourceEmptiesTheDestination)
{
    Film film;
    film.addClip(film.track, u"X", 40, 80);

    film.copyRange({film.track}, 0, 10, 50);

    EXPECT_EQ(film.eventsOf(film.track), "X 40-50 +0, X 60-80 +20");
}

TEST(CopyRange, LeavesWhatOnlyTouchesTheDestination)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    const auto before = film.addClip(film.track, u"before", 45, 50);
    const auto behind = film.addClip(film.track, u"behind", 60, 65);

    film.copyRange({film.track}, 0, 10, 50);

    EXPECT_EQ(film.eventsOf(film.track), "A 0-10 +0, before 45-50 +0, A 50-60 +0, behind 60-65 +0");
    EXPECT_TRUE(before->getParent());
    EXPECT_TRUE(behind->getParent());
}

//  |---- A ----|               |-A-|---- A ----|
//  0    4     10    14         0   4          14
TEST(CopyRange, ReadsTheSourceBeforeADestinationThatBeginsInIt)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);

    film.copyRange({film.track}, 0, 10, 4);

    EXPECT_EQ(film.eventsOf(film.track), "A 0-4 +0, A 4-14 +0");
}

//        |---- A ----|         |---- A ----|-A-|
//   6   10    16    20         6          16  20
TEST(CopyRange, ReadsTheSourceBeforeADestinationThatEndsInIt)
{
    Film film;
    film.addClip(film.track, u"A", 10, 20);

    film.copyRange({film.track}, 10, 20, 6);

    EXPECT_EQ(film.eventsOf(film.track), "A 6-16 +0, A 16-20 +6");
}

TEST(CopyRange, OntoItselfOnlyCuts)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);

    film.copyRange({film.track}, 2, 6, 2);

    EXPECT_EQ(film.eventsOf(film.track), "A 0-2 +0, A 2-6 +2, A 6-10 +6");
}

TEST(CopyRange, KeepsOverlapsAndTheOrderOfWhatBeginsTogether)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.addClip(film.track, u"B", 0, 6);
    film.addClip(film.track, u"C", 4, 12);

    film.copyRange({film.track}, 2, 8, 20);

    EXPECT_EQ(film.eventsOf(film.track), "A 0-10 +0, B 0-6 +0, C 4-12 +0, A 20-26 +2, B 20-24 +2, C 22-26 +0");
}

TEST(CopyRange, WhatIsCutKeepsItsPlaceAmongThoseThatBeginTogether)
{
    Film film;
    film.addClip(film.track, u"A", 0, 4);
    film.addClip(film.track, u"B", 0, 10);
    film.addClip(film.track, u"C", 0, 3);

    film.copyRange({film.track}, 20, 22, 5);

    EXPECT_EQ(film.eventsOf(film.track), "A 0-4 +0, B 0-5 +0, C 0-3 +0, B 7-10 +7");
}

//  |---- A ----|                       |- A -|-A-|
//  0    4     10      to -4            0     6  10
TEST(CopyRange, DropsWhatWouldFallBelowTheStartOfTheProject)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);

    film.copyRange({film.track}, 0, 10, -4);

    EXPECT_EQ(film.eventsOf(film.track), "A 0-6 +4, A 6-10 +6");
}

TEST(CopyRange, ADestinationWhollyBelowTheStartOfTheProjectChangesNothing)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.addVolume(film.track, {{0, 0.0f}, {5, 1.0f}});
    const std::string before = film.dump();

    film.copyRange({film.track}, 0, 10, -10);

    EXPECT_EQ(film.dump(), before);
}

TEST(CopyRange, BeforeTheStartOfTheProjectThereIsNothingToCopy)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);

    film.copyRange({film.track}, -5, 5, 20);

    EXPECT_EQ(film.eventsOf(film.track), "A 0-10 +0, A 25-30 +0");
}

TEST(CopyRange, ARangeWithoutLengthChangesNothing)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.addVolume(film.track, {{0, 0.0f}, {5, 1.0f}});
    const std::string before = film.dump();

    film.copyRange({film.track}, 5, 5 + Hair, 8);

    EXPECT_EQ(film.dump(), before);
}

TEST(CopyRange, ReadsAndClearsTheTracksOfTheListAlone)
{
    Film film;
    const auto listed = film.addTrack(TypeWord::Audio, u"FX 1");
    const auto other = film.addTrack(TypeWord::Audio, u"FX 2");
    for (const auto& track : {film.track, listed, other}) {
        film.addClip(track, u"A", 0, 10);
        film.addClip(track, u"X", 50, 60);
        film.addVolume(track, {{0, 0.0f}, {10, 1.0f}});
    }

    film.copyRange({film.track, listed}, 2, 8, 52);

    for (const auto& track : {film.track, listed}) {
        EXPECT_EQ(film.eventsOf(track), "A 0-10 +0, X 50-52 +0, A 52-58 +2, X 58-60 +8");
        EXPECT_NE(film.volumeOf(track), "0=0 10=1");
    }
    EXPECT_EQ(film.eventsOf(other), "A 0-10 +0, X 50-60 +0");
    EXPECT_EQ(film.volumeOf(other), "0=0 10=1");
}

TEST(CopyRange, ReachesATrackInAFolder)
{
    RangeEditHost film;
    const auto folder = film.addTrack(TypeWord::Folder, u"Dialogue");
    const auto track = film.addTrack(TypeWord::Audio, u"DX 1", folder.get());
    film.addClip(track, u"A", 0, 10);

    film.copyRange({track}, 0, 10, 50);

    EXPECT_EQ(film.eventsOf(track), "A 0-10 +0, A 50-60 +0");
}

TEST(CopyRange, ATrackThatIsListedTwiceIsWrittenOnce)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.addVolume(film.track, {{0, 0.0f}, {8, 1.0f}});
    RangeEditHost once;
    const auto track = once.addTrack(TypeWord::Audio, u"DX 1");
    once.addClip(track, u"A", 0, 10);
    once.addVolume(track, {{0, 0.0f}, {8, 1.0f}});

    film.copyRange({film.track, film.track}, 0, 10, 4);
    once.copyRange({track}, 0, 10, 4);

    EXPECT_EQ(film.dump(), once.dump());
}

TEST(CopyRange, IsOneStepOfTheUndoList)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.addClip(film.track, u"X", 45, 55);
    film.addVolume(film.track, {{0, 0.0f}, {8, 1.0f}, {54, 0.5f}});
    const std::string before = film.dump();
    film.copyRange({film.track}, 2, 12, 47);
    const std::string after = film.dump();

    EXPECT_TRUE(film.undo());
    EXPECT_EQ(film.dump(), before);
    EXPECT_TRUE(film.redo());
    EXPECT_EQ(film.dump(), after);
}

//  start      end
//    m1   m2   m3
TEST(CopyRange, APointMarkerAtTheStartGoesAndOneAtTheEndStaysBehind)
{
    MarkerFilm film;
    film.addPointMarker(film.track, u"m1", 10);
    film.addPointMarker(film.track, u"m2", 15);
    film.addPointMarker(film.track, u"m3", 20);

    film.copyRange({film.track}, 10, 20, 50);

    EXPECT_EQ(film.eventsOf(film.track), "m1 10, m2 15, m3 20, m1 50, m2 55");
}

TEST(CopyRange, ClearsAPointMarkerAtTheStartOfTheDestinationAndNotOneAtItsEnd)
{
    MarkerFilm film;
    film.addPointMarker(film.track, u"m1", 50);
    film.addPointMarker(film.track, u"m2", 60);

    film.copyRange({film.track}, 10, 20, 50);

    EXPECT_EQ(film.eventsOf(film.track), "m2 60");
}

TEST(CopyRange, CutsRangeMarkers)
{
    MarkerFilm film;
    film.addRangeMarker(film.track, u"scene", 5, 30);
    film.addRangeMarker(film.track, u"old", 55, 70);

    film.copyRange({film.track}, 10, 20, 50);

    EXPECT_EQ(film.eventsOf(film.track), "scene 5-30, scene 50-60, old 60-70");
}

TEST(CopyRange, ARangeMarkerWithoutLengthIsTreatedAsAPointMarker)
{
    MarkerFilm film;
    film.addRangeMarker(film.track, u"m1", 10, 10);
    film.addRangeMarker(film.track, u"m2", 20, 20);

    film.copyRange({film.track}, 10, 20, 50);

    EXPECT_EQ(film.eventsOf(film.track), "m1 10-10, m2 20-20, m1 50-50");
}

TEST(CopyRange, DropsMarkersThatWouldFallBelowTheStartOfTheProject)
{
    MarkerFilm film;
    film.addPointMarker(film.track, u"m1", 11);
    film.addPointMarker(film.track, u"m2", 12);
    film.addRangeMarker(film.track, u"scene", 10, 20);

    film.copyRange({film.track}, 10, 20, -2);

    EXPECT_EQ(film.eventsOf(film.track), "scene 0-8, m2 0, scene 10-20, m1 11, m2 12");
}

//  |--------- part ---------|                |--- part ---|
//      |-- a --|  |--- b ---|                |-a-|   |-b--|
//  0   2  5    8  10  12   18 20             50  53  55  57
TEST(CopyRange, CutsPartsWithWhatIsInThem)
{
    Film film;
    const auto part = film.addPart(film.track, u"part", 0, 20);
    film.addClipFrom(part, u"a", 2, 8, 1);
    film.addClip(part, u"b", 10, 18);

    film.copyRange({film.track}, 5, 12, 50);

    EXPECT_EQ(film.eventsOf(film.track), "part 0-20 (a 2-8 +1, b 10-18 +0), part 50-57 (a 50-53 +4, b 55-57 +0)");
}

TEST(CopyRange, CutsPartsInParts)
{
    Film film;
    const auto outer = film.addPart(film.track, u"outer", 10, 30);
    const auto inner = film.addPart(outer, u"inner", 12, 28);
    film.addClip(inner, u"a", 14, 20);

    film.copyRange({film.track}, 16, 18, 50);

    EXPECT_EQ(film.eventsOf(film.track),
              "outer 10-30 (inner 12-28 (a 14-20 +0)), outer 50-52 (inner 50-52 (a 50-52 +2))");
}

TEST(CopyRange, CutsPartsThatHangOverTheDestination)
{
    Film film;
    const auto part = film.addPart(film.track, u"part", 0, 20);
    film.addClip(part, u"a", 2, 18);

    film.copyRange({film.track}, 40, 45, 10);

    EXPECT_EQ(film.eventsOf(film.track), "part 0-10 (a 2-10 +0), part 15-20 (a 15-18 +13)");
}

TEST(CopyRange, AnEventThatReachesLessThanAnInstantIntoTheSourceIsNotThere)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.addClip(film.track, u"B", 20, 30);

    film.copyRange({film.track}, 10 - Hair, 20 + Hair, 50);

    EXPECT_EQ(film.eventsOf(film.track), "A 0-10 +0, B 20-30 +0");
}

TEST(CopyRange, AnEventThatReachesAnInstantIntoTheSourceIs)
{
    Film film;
    film.addClip(film.track, u"A", 0, 10);
    film.addClip(film.track, u"B", 20, 30);

    film.copyRange({film.track}, 10 - Sliver, 20 + Sliver, 50);

    const auto events = childrenOf(*film.track);
    ASSERT_EQ(events.size(), 4U);
    EXPECT_NEAR(events[2]->getEnd(nullptr) - events[2]->getStart(nullptr), Sliver, 1e-9);
    EXPECT_NEAR(events[3]->getEnd(nullptr) - events[3]->getStart(nullptr), Sliver, 1e-9);
}

TEST(CopyRange, AnEventThatReachesLessThanAnInstantIntoTheDestinationIsNotCut)
{
    Film film;
    const auto before = film.addClip(film.track, u"before", 40, 50 + Hair);
    const auto behind = film.addClip(film.track, u"behind", 60 - Hair, 70);
    const std::string text = film.dump();

    film.copyRange({film.track}, 0, 10, 50);

    EXPECT_EQ(film.dump(), text);
    EXPECT_TRUE(before->getParent());
    EXPECT_TRUE(behind->getParent());
}

TEST(CopyRange, AnEventThatReachesAnInstantIntoTheDestinationIsCut)
{
    Film film;
    film.addClip(film.track, u"before", 40, 50 + Sliver);
    film.addClip(film.track, u"behind", 60 - Sliver, 70);

    film.copyRange({film.track}, 0, 10, 50);

    const auto events = childrenOf(*film.track);
    ASSERT_EQ(events.size(), 2U);
    EXPECT_EQ(events[0]->getEnd(nullptr), 50.0);
    EXPECT_EQ(events[1]->getStart(nullptr), 60.0);
    EXPECT_NEAR(events[1]->getSourceOffset(nullptr), Sliver, 1e-9);
}

TEST(CopyRange, LeavesNoSliversOfWhatHangsOverTheDestinationByLessThanAnInstant)
{
    Film film;
    film.addClip(film.track, u"X", 50 - Hair, 60 + Hair);

    film.copyRange({film.track}, 0, 10, 50);

    EXPECT_EQ(film.eventsOf(film.track), "");
}

TEST(CopyRange, LeavesWhatHangsOverTheDestinationByAnInstant)
{
    Film film;
    film.addClip(film.track, u"X", 50 - Sliver, 60 + Sliver);

    film.copyRange({film.track}, 0, 10, 50);

    EXPECT_EQ(childrenOf(*film.track).size(), 2U);
}

TEST(CopyRange, MarkersLessThanAnInstantBesideTheEdgesStandAtThem)
{
    MarkerFilm film;
    film.addPointMarker(film.track, u"start", 10 - Hair);
    film.addPointMarker(film.track, u"end", 20 - Hair);

    film.copyRange({film.track}, 10, 20, 50);

    const auto markers = childrenOf(*film.track);
    ASSERT_EQ(markers.size(), 3U);
    EXPECT_EQ(markers[2]->getName(), std::u16string(u"start"));
    EXPECT_EQ(markers[2]->getStart(nullptr), 50.0);
}

TEST(CopyRange, MarkersAnInstantBesideTheEdgesDoNot)
{
    MarkerFilm film;
    film.addPointMarker(film.track, u"before", 10 - Sliver);
    film.addPointMarker(film.track, u"within", 20 - Sliver);

    film.copyRange({film.track}, 10, 20, 50);

    const auto markers = childrenOf(*film.track);
    ASSERT_EQ(markers.size(), 3U);
    EXPECT_EQ(markers[2]->getName(), std::u16string(u"within"));
    EXPECT_NEAR(markers[2]->getStart(nullptr), 60 - Sliver, 1e-9);
}

TEST(CopyRange, AnEventTooShortToBeCutGoesWithItsStart)
{
    Film film;
    film.addClip(film.track, u"click", 10 - Hair, 10 + 2 * Hair);

    film.copyRange({film.track}, 0, 10, 30);
    film.copyRange({film.track}, 10, 20, 50);

    const auto events = childrenOf(*film.track);
    ASSERT_EQ(events.size(), 2U);
    EXPECT_EQ(events[1]->getStart(nullptr), 50.0);
}

TEST(CopyRange, CostsWhatLiesInTheRangeAndNotWhatLiesOutside)
{
    const auto editsWith = [](int clipsOutside) {
        Film film;
        film.edit(u"Fill", [&] {
            for (int index = 0; index < clipsOutside; ++index)
                film.addClip(film.track, u"far", 1000 + index, 1001 + index);
            for (int index = 0; index < 10; ++index)
                film.addClip(film.track, u"near", index, index + 1);
        });
        EXPECT_EQ(film.transaction()->begin(true), ResultOk);
        const auto list = create<IObjectList>(film.context());
        list->add(film.track.get(), 0);
        EXPECT_EQ(film.editService()->copyRange(film.document(), list.get(), 0, 2, 8, 500), ResultOk);
        return film.application.edits().log().records().size();
    };

    // Six clips are inserted.
    EXPECT_EQ(editsWith(0), 6U);
    EXPECT_EQ(editsWith(5000), 6U);
}

} // namespace standin::tests
