// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/KeepPlanner.h"

#include "core/edl/HealedEvent.h"
#include "core/keep/KeptChangeList.h"
#include "core/settings/Settings.h"
#include "tests/core/keep/KeepFilm.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

namespace cadrel::tests {
namespace {

using core::EventList;
using core::FrameRange;
using core::KeepContext;
using core::KeepPlan;
using core::KeepPlanner;
using core::KeepRefusal;
using core::SecondsRange;

using Lines = std::vector<std::string>;

/// Films are written at one frame a second.
class KeepPlannerTest : public testing::Test {
protected:
    static KeepContext contextWith(const std::vector<SecondsRange>& material = {})
    {
        KeepContext context;
        context.framerate = FrameASecond;
        context.material = material;
        return context;
    }

    TestProject m_project{FrameASecond};
};

Film filmOfAAndB()
{
    return Film().at(1000).shot("A", 0, 100).shot("B", 0, 50);
}

} // namespace

TEST_F(KeepPlannerTest, TheSameCutNeedsNoRunWhateverStandsAroundIt)
{
    const KeepPlan plan =
        planFor(filmOfAAndB(), filmOfAAndB(), {{990, 1002}, {1140, 1170}, {5000, 5100}, {1050, 1060}});

    EXPECT_EQ(hullOf(plan), "none");
    EXPECT_FALSE(plan.needsRun());
    EXPECT_TRUE(plan.questions.empty());
    EXPECT_FALSE(plan.refusal);
    EXPECT_EQ(linesOf(plan.events), Lines());
    EXPECT_EQ(linesOf(plan.lost), Lines());
}

TEST_F(KeepPlannerTest, WhatLiesBeforeALiftStaysAndAllAfterItMovesUpWithTheTail)
{
    const Film before = Film().at(1000).shot("A", 0, 100).shot("X", 0, 30).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, filmOfAAndB(), {{1180, 1185}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1130..1185 to 1100..1155: cut black"}));
    EXPECT_EQ(linesOf(plan.untouched), (Lines{"1000..1100 to 1000..1100: unchanged"}));
    EXPECT_EQ(hullOf(plan), "1100..1185");
    EXPECT_EQ(linesOf(plan.lost), Lines());
}

TEST_F(KeepPlannerTest, WhatLiesBeforeAnInsertStaysAndAllAfterItMovesBack)
{
    const Film after = Film().at(1000).shot("A", 0, 100).shot("X", 0, 10).shot("B", 0, 50);

    const KeepPlan plan = planFor(filmOfAAndB(), after);

    EXPECT_EQ(linesOf(plan.events), (Lines{"1100..1150 to 1110..1160: cut"}));
    EXPECT_EQ(hullOf(plan), "1100..1160");
}

TEST_F(KeepPlannerTest, AShotTrimmedAtItsHeadMovesUpByTheTrim)
{
    const Film after = Film().at(1000).shot("A", 0, 100).shot("B", 5, 45);

    const KeepPlan plan = planFor(filmOfAAndB(), after);

    EXPECT_EQ(linesOf(plan.events), (Lines{"1105..1150 to 1100..1145: cut"}));
    EXPECT_EQ(hullOf(plan), "1100..1150");
}

TEST_F(KeepPlannerTest, AShotReplacedInItsPlaceLeavesAHullWithoutEvents)
{
    const Film before = Film().at(1000).shot("A", 0, 100).shot("X", 0, 30).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 100).shot("Y", 0, 30).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after);

    EXPECT_EQ(linesOf(plan.events), Lines());
    EXPECT_EQ(hullOf(plan), "1100..1130");
}

TEST_F(KeepPlannerTest, NewPictureBehindTheLastShotIsInTheHull)
{
    const Film after = filmOfAAndB().shot("C", 0, 20);

    const KeepPlan plan = planFor(filmOfAAndB(), after);

    EXPECT_EQ(linesOf(plan.events), Lines());
    EXPECT_EQ(hullOf(plan), "1150..1170");
}

TEST_F(KeepPlannerTest, WhatIsEqualAtTheSameTimeStaysThoughTheChangeEdlSendsItOntoItsTwin)
{
    const Film film = Film().at(1000).shot("A", 0, 50).shot("A", 0, 50);
    EventList changes;
    changes.add(makeEvent("A", "00:16:40:00", "00:17:30:00", "00:17:30:00", "00:18:20:00"));

    const KeepPlan plan = KeepPlanner(contextWith()).plan(film.list(), film.list(), changes);

    EXPECT_EQ(hullOf(plan), "none");
}

TEST_F(KeepPlannerTest, AfterOneChangeAShotDoesNotGoToItsTwinEither)
{
    const Film before = Film().at(1000).shot("A", 0, 50).shot("B", 0, 10).shot("A", 0, 50);
    const Film after = Film().at(1000).shot("X", 0, 5).shot("A", 0, 50).shot("B", 0, 10).shot("A", 0, 50);
    EventList changes; // the second A from the place of the first
    changes.add(makeEvent("A", "00:16:40:00", "00:17:30:00", "00:17:45:00", "00:18:35:00"));

    const KeepPlan plan = KeepPlanner(contextWith()).plan(before.list(), after.list(), changes);

    EXPECT_EQ(linesOf(plan.events), (Lines{"1000..1110 to 1005..1115: cut"}));
}

//  old    |--- A ---|- F -|-- B --|
//  new    |X|--- A ---|- F -|- B -|
// The second A shows at frame 1120 what the first one, moved by 30, shows there in the new cut.
TEST_F(KeepPlannerTest, AfterOneChangeNoFrameStaysWhereItsTwinHappenedToStand)
{
    const Film before = Film().at(1000).shot("X", 0, 70).shot("A", 0, 30).shot("B", 0, 20).shot("A", 20, 40);
    const Film after = before.withInsertBefore(1, "N", 30);

    const KeepPlan plan = planFor(before, after);

    EXPECT_EQ(linesOf(plan.events), (Lines{"1070..1160 to 1100..1190: cut"}));
    EXPECT_EQ(hullOf(plan), "1070..1190");
}

TEST_F(KeepPlannerTest, BetweenTwoChangesNoFrameStaysWhereItsTwinHappenedToStandEither)
{
    const Film before =
        Film().at(1000).shot("X", 0, 70).shot("A", 0, 30).shot("B", 0, 20).shot("A", 20, 40).shot("C", 0, 60);
    const Film after = before.withInsertBefore(4, "M", 10).withInsertBefore(1, "N", 30);

    const KeepPlan plan = planFor(before, after);

    EXPECT_EQ(linesOf(plan.events), (Lines{"1070..1160 to 1100..1190: cut", "1160..1220 to 1200..1260: cut"}));
}

TEST_F(KeepPlannerTest, WhatIsEqualAtTheSameTimeStaysUnlessTheChangeEdlCarriesALongerStretch)
{
    const Film before =
        Film().at(1000).shot("S", 0, 5).shot("A", 0, 10).shot("T", 0, 5).shot("A", 0, 11).shot("U", 0, 5);
    const auto planWith = [&](std::int32_t length, const char* srcOut, const char* dstOut) {
        const Film after = Film().at(1000).shot("V", 0, 5).shot("A", 0, length).shot("W", 0, 31 - length);
        EventList changes;
        changes.add(makeEvent("A", "00:17:00:00", srcOut, "00:16:45:00", dstOut));
        return KeepPlanner(contextWith()).plan(before.list(), after.list(), changes);
    };

    EXPECT_EQ(linesOf(planWith(10, "00:17:10:00", "00:16:55:00").untouched), Lines());
    EXPECT_EQ(linesOf(planWith(10, "00:17:10:00", "00:16:55:00").events),
              (Lines{"1005..1015 to 1005..1015: unchanged"}));
    EXPECT_EQ(linesOf(planWith(11, "00:17:11:00", "00:16:56:00").events), (Lines{"1020..1031 to 1005..1016: cut"}));
}

TEST_F(KeepPlannerTest, AFreezeGoesOnWithTheShotBeforeIt)
{
    const Film before = Film().at(1000).shot("A", 0, 100).freeze("F", 7, 20).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("X", 0, 10).shot("A", 0, 100).freeze("F", 7, 20).shot("B", 0, 45);

    const KeepPlan plan = planFor(before, after);

    EXPECT_EQ(linesOf(plan.events), (Lines{"1000..1165 to 1010..1175: cut hole cut"}));
}

TEST_F(KeepPlannerTest, AFlawedEventGoesOnWithTheShotBeforeIt)
{
    const Film before = Film().at(1000).shot("A", 0, 100).shot("C", 7, 20).flawed().shot("B", 0, 50);
    const Film after = Film().at(1000).shot("X", 0, 10).shot("A", 0, 100).shot("C", 7, 20).flawed().shot("B", 0, 45);

    const KeepPlan plan = planFor(before, after);

    EXPECT_EQ(linesOf(plan.events), (Lines{"1000..1165 to 1010..1175: cut hole cut"}));
}

// The change EDL takes 0.995 for the normal speed, and 199 frames of source for 199 frames of programme.
TEST_F(KeepPlannerTest, TheLastFrameOfAShotThatIsALittleSlowGoesOnWithIt)
{
    const Film before = Film().at(1000).retimed("A", 0, 199, 200).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("X", 0, 10).retimed("A", 0, 199, 200).shot("B", 0, 45);

    const KeepPlan plan = planFor(before, after);

    EXPECT_EQ(linesOf(plan.events), (Lines{"1000..1245 to 1010..1255: cut hole cut"}));
}

TEST_F(KeepPlannerTest, AHoleWhoseLeftNeighbourDidNotSurviveGoesOnWithTheRightOne)
{
    const Film before = Film().at(1000).shot("A", 0, 100).freeze("F", 7, 20).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("Y", 0, 110).freeze("F", 7, 20).shot("B", 0, 45);

    const KeepPlan plan = planFor(before, after);

    EXPECT_EQ(linesOf(plan.events), (Lines{"1100..1165 to 1110..1175: hole cut"}));
}

TEST_F(KeepPlannerTest, AHoleOfWhichNoNeighbourSurvivedStaysEmpty)
{
    const Film before = Film().at(1000).shot("A", 0, 100).freeze("F", 7, 20).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("Y", 0, 110).freeze("F", 7, 20).shot("Z", 0, 45);

    const KeepPlan plan = planFor(before, after);

    EXPECT_EQ(linesOf(plan.events), Lines());
    EXPECT_EQ(hullOf(plan), "1000..1175");
}

TEST_F(KeepPlannerTest, AFreezeThatHasMovedDoesNotStayWhereItOverlapsItself)
{
    const Film before = Film().at(1000).shot("A", 0, 50).freeze("F", 7, 100).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 50).shot("X", 0, 10).freeze("F", 7, 100).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after);

    EXPECT_EQ(linesOf(plan.events), (Lines{"1050..1200 to 1060..1210: cut"}));
}

TEST_F(KeepPlannerTest, AFilmOfFreezesOnlyIsKeptThoughTheChangeEdlIsEmpty)
{
    const Film film = Film().at(1000).freeze("F", 7, 20).freeze("G", 7, 20);

    ASSERT_TRUE(generatedChanges(film.list(), film.list(), 0, core::HealMode::Normal, FrameASecond).isEmpty());
    EXPECT_EQ(hullOf(planFor(film, film, {{1000, 1050}})), "none");
}

TEST_F(KeepPlannerTest, AnInsertIntoAFilmOfFreezesMovesThoseAfterIt)
{
    const Film before = Film().at(1000).freeze("F", 7, 20).freeze("G", 7, 20);
    const Film after = Film().at(1000).freeze("F", 7, 20).shot("X", 0, 5).freeze("G", 7, 20);

    const KeepPlan plan = planFor(before, after);

    EXPECT_EQ(linesOf(plan.events), (Lines{"1020..1040 to 1025..1045: cut"}));
    EXPECT_EQ(hullOf(plan), "1020..1045");
}

TEST_F(KeepPlannerTest, NoEventReachesBeyondTheFilmOverTheWholeDay)
{
    const Film before = filmOfAAndB().black(10).shot("C", 0, 20);
    const Film after = filmOfAAndB().black(10).shot("C", 1, 19);

    const KeepPlan plan = planFor(before, after, {{10, 80000}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1161..80000 to 1160..79999: cut black"}));
    EXPECT_EQ(hullOf(plan), "1160..80000");
}

TEST_F(KeepPlannerTest, BlackWhereAShotWasLiftedIsNotCoveredWhateverWasHealed)
{
    const Film before = Film().at(1000).shot("A", 0, 100).shot("X", 0, 30).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 100).black(30).shot("B", 0, 50);

    for (const std::int32_t mode : {0, 1, 2, 3}) {
        const EventList changes = generatedChanges(before.list(), after.list(), 0, mode, FrameASecond);
        const KeepPlan plan = KeepPlanner(contextWith()).plan(before.list(), after.list(), changes);

        EXPECT_EQ(linesOf(plan.events), Lines()) << mode;
        EXPECT_EQ(hullOf(plan), "1100..1130") << mode;
    }
}

TEST_F(KeepPlannerTest, AShotThatWasHealedOverGoesAlongWithItsNeighbours)
{
    const Film before = Film().at(1000).shot("A", 0, 100).shot("X", 0, 30).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 100).shot("Y", 0, 30).shot("B", 0, 50);
    const EventList changes =
        generatedChanges(before.list(), after.list(), 0, core::HealMode::GapsWithInserts, FrameASecond);

    const KeepPlan plan = KeepPlanner(contextWith()).plan(before.list(), after.list(), changes);

    EXPECT_EQ(hullOf(plan), "none");
}

TEST_F(KeepPlannerTest, NeighboursThatMoveAlikeAreJoinedThoughNothingWasHealed)
{
    const Film after = Film().at(1010).shot("A", 0, 100).shot("B", 0, 50);
    const EventList changes =
        generatedChanges(filmOfAAndB().list(), after.list(), 0, core::HealMode::None, FrameASecond);

    const KeepPlan plan = KeepPlanner(contextWith()).plan(filmOfAAndB().list(), after.list(), changes);

    ASSERT_EQ(linesOf(plan.events), (Lines{"1000..1150 to 1010..1160: cut"}));
    EXPECT_EQ(plan.events.front().parts.size(), 2U);
}

TEST_F(KeepPlannerTest, BlackBetweenTwoShotsGoesAlongWithThem)
{
    const Film before = Film().at(1000).shot("A", 0, 100).black(10).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("X", 0, 10).shot("A", 0, 100).black(10).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after, {{1103, 1105}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1000..1160 to 1010..1170: cut black cut"}));
}

TEST_F(KeepPlannerTest, LengthenedBlackIsClaimedFromOneSideOnly)
{
    const Film before = Film().at(1000).shot("A", 0, 100).black(10).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 100).black(20).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after, {{1100, 1110}});

    EXPECT_EQ(linesOf(plan.untouched), (Lines{"1000..1110 to 1000..1110: unchanged black"}));
    EXPECT_EQ(linesOf(plan.events), (Lines{"1110..1160 to 1120..1170: cut"}));
    EXPECT_EQ(linesOf(plan.lost), Lines());
}

TEST_F(KeepPlannerTest, ShortenedBlackKeepsWhatHasRoomAfterTheShotBeforeIt)
{
    const Film before = Film().at(1000).shot("A", 0, 100).black(10).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 100).black(4).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after, {{1100, 1110}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1110..1160 to 1104..1154: cut"}));
    EXPECT_EQ(linesOf(plan.lost), (Lines{"1104..1110"}));
}

TEST_F(KeepPlannerTest, AnInsertBeforeBlackMovesTheBlack)
{
    const Film before = Film().at(1000).shot("A", 0, 100).black(10).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 100).shot("X", 0, 4).black(10).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after, {{1100, 1110}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1100..1160 to 1104..1164: black cut"}));
}

TEST_F(KeepPlannerTest, ABlockLessThan60SecondsBehindAReelFollowsItsEnd)
{
    const Film before = Film().at(1000).shot("A", 0, 100);
    const Film after = Film().at(1000).shot("A", 0, 90);

    const KeepPlan below = planFor(before, after, {{1159, 1162}});
    const KeepPlan at = planFor(before, after, {{1160, 1162}});
    const KeepPlan above = planFor(before, after, {{1161, 1162}});

    EXPECT_EQ(linesOf(below.events), (Lines{"1100..1162 to 1090..1152: black"}));
    EXPECT_EQ(linesOf(at.events), Lines());
    EXPECT_EQ(hullOf(at), "1090..1100");
    EXPECT_EQ(linesOf(above.events), Lines());
}

TEST_F(KeepPlannerTest, ABlockLessThan60SecondsBeforeAReelFollowsItsStart)
{
    const Film before = Film().at(1000).shot("A", 0, 100);
    const Film after = Film().at(1010).shot("A", 0, 100);

    const KeepPlan below = planFor(before, after, {{939, 941}});
    const KeepPlan at = planFor(before, after, {{939, 940}});
    const KeepPlan above = planFor(before, after, {{938, 939}});

    EXPECT_EQ(linesOf(below.events), (Lines{"939..1100 to 949..1110: black cut"}));
    EXPECT_EQ(linesOf(at.events), (Lines{"1000..1100 to 1010..1110: cut"}));
    EXPECT_EQ(linesOf(above.events), (Lines{"1000..1100 to 1010..1110: cut"}));
}

TEST_F(KeepPlannerTest, MaterialLessThan60SecondsApartIsOneBlock)
{
    const Film before = Film().at(1000).shot("A", 0, 100);
    const Film after = Film().at(1000).shot("A", 0, 90);

    const KeepPlan below = planFor(before, after, {{1150, 1160}, {1219, 1220}});
    const KeepPlan at = planFor(before, after, {{1150, 1160}, {1220, 1221}});

    EXPECT_EQ(linesOf(below.events), (Lines{"1100..1220 to 1090..1210: black"}));
    EXPECT_EQ(linesOf(at.events), (Lines{"1100..1160 to 1090..1150: black"}));
}

TEST_F(KeepPlannerTest, AnotherReelThatNoCutSpeaksOfStays)
{
    const Film before = Film().at(1000).shot("A", 0, 100);
    const Film after = Film().at(1000).shot("A", 0, 90);

    const KeepPlan plan = planFor(before, after, {{1100, 1105}, {5000, 6000}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1100..1105 to 1090..1095: black"}));
    EXPECT_EQ(hullOf(plan), "1090..1105");
    EXPECT_EQ(linesOf(plan.untouched),
              (Lines{"1000..1090 to 1000..1090: unchanged", "5000..6000 to 5000..6000: black"}));
}

//  old    |-- A --|     block     |-- B --|      gap of 80 frames
//  new    |- A -|     block   |-- B --|          gap of 70 frames
TEST_F(KeepPlannerTest, ABlockInAGapThatChangedItsLengthGoesWithTheReelBeforeIt)
{
    const Film before = Film().at(1000).shot("A", 0, 100).black(80).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 90).black(70).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after, {{1130, 1140}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1100..1140 to 1090..1130: black", "1180..1230 to 1160..1210: cut"}));
    EXPECT_EQ(linesOf(plan.lost), Lines());
}

TEST_F(KeepPlannerTest, ABlockThatFillsAGapThatGotShorterLosesWhatHasNoRoom)
{
    const Film before = Film().at(1000).shot("A", 0, 100).black(80).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 90).black(70).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after, {{1090, 1190}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1100..1170 to 1090..1160: black", "1180..1230 to 1160..1210: cut"}));
    EXPECT_EQ(linesOf(plan.lost), (Lines{"1170..1180"}));
}

TEST_F(KeepPlannerTest, ABlockInAGapThatKeptItsLengthGoesWhole)
{
    const Film before = Film().at(1000).shot("A", 0, 100).black(80).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 90).black(80).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after, {{1130, 1140}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1100..1230 to 1090..1220: black cut"}));
}

TEST_F(KeepPlannerTest, TailAndPopOfTwoReelsFollowEachItsOwn)
{
    const Film before = Film().at(1000).shot("A", 0, 100).black(200).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 90).black(230).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after, {{1100, 1110}, {1200, 1210}, {1298, 1299}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1100..1110 to 1090..1100: black", "1200..1210 to 1200..1210: black",
                                           "1298..1350 to 1318..1370: black cut"}));
}

namespace {

/// Two reels; the first gets four frames longer.
const Film TwoReels = Film().at(1000).shot("A", 0, 100).at(3000).shot("B", 0, 50);
const Film FirstReelGrown = Film().at(1000).shot("X", 0, 4).shot("A", 0, 100).at(3000).shot("B", 0, 50);

} // namespace

//  old    |- A -| tail                  leader pop |-- B --|
//            |------------- clip -----------------------|
//  new    |-- A --| tail                leader pop |-- B --|
TEST_F(KeepPlannerTest, TailAndPopOfTwoReelsFollowEachItsOwnThoughAClipSpansTheGap)
{
    for (const SecondsRange& clip : {SecondsRange{1050, 3025}, SecondsRange{1100, 3000}, SecondsRange{1105, 2990}}) {
        const KeepPlan plan = planFor(TwoReels, FirstReelGrown, {{2998, 2999}, clip, {1102, 1103}, {2985, 2997}});

        EXPECT_EQ(linesOf(plan.events), (Lines{"1000..2981 to 1004..2985: cut black"}));
        EXPECT_EQ(linesOf(plan.untouched), (Lines{"2985..3050 to 2985..3050: black unchanged"}));
        EXPECT_EQ(linesOf(plan.lost), (Lines{"2981..2985"}));
    }
}

TEST_F(KeepPlannerTest, WhereTheGapGetsLongerTheClipThatSpansItIsPartedBeforeTheLeader)
{
    const KeepPlan plan = planFor(FirstReelGrown, TwoReels, {{1000, 3050}, {2985, 2997}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1004..2985 to 1000..2981: cut black"}));
    EXPECT_EQ(linesOf(plan.untouched), (Lines{"2985..3050 to 2985..3050: black unchanged"}));
    EXPECT_EQ(linesOf(plan.lost), Lines());
}

TEST_F(KeepPlannerTest, WhereBothReelsMoveAlikeTheClipThatSpansTheGapIsNotCut)
{
    const Film after = Film().at(1010).append(TwoReels, 1000);

    const KeepPlan plan = planFor(TwoReels, after, {{1050, 3025}, {1102, 1103}, {2985, 2997}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1000..3050 to 1010..3060: cut black cut"}));
}

// One clip of each reel, say of the old video, and the second begins where the first ends.
TEST_F(KeepPlannerTest, OfClipsThatFillTheGapTogetherEachGoesWithItsOwnReel)
{
    const KeepPlan plan = planFor(TwoReels, FirstReelGrown, {{1000, 2500}, {2500, 3050}, {1102, 1103}, {2985, 2997}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1000..2500 to 1004..2504: cut black"}));
    EXPECT_EQ(linesOf(plan.untouched), (Lines{"2504..3050 to 2504..3050: black unchanged"}));
    EXPECT_EQ(linesOf(plan.lost), (Lines{"2500..2504"}));
}

//  old    |- A -|         sound         |-- B --|
//           |------------- clip ------------|
TEST_F(KeepPlannerTest, WhatStandsAwayFromBothReelsStaysThoughAClipSpansTheGap)
{
    const KeepPlan plan = planFor(TwoReels, FirstReelGrown, {{1050, 3025}, {2000, 2010}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1000..1996 to 1004..2000: cut black"}));
    EXPECT_EQ(linesOf(plan.untouched), (Lines{"2000..3050 to 2000..3050: black unchanged"}));
    EXPECT_EQ(linesOf(plan.lost), (Lines{"1996..2000"}));
}

TEST_F(KeepPlannerTest, AnotherReelThatNoCutSpeaksOfStaysThoughAClipRunsOverBoth)
{
    const Film before = Film().at(1000).shot("A", 0, 100);
    const Film after = Film().at(1000).shot("A", 0, 90);

    const KeepPlan plan = planFor(before, after, {{1000, 7000}, {5000, 6000}, {1101, 1102}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1100..5000 to 1090..4990: black"}));
    EXPECT_EQ(linesOf(plan.untouched),
              (Lines{"1000..1090 to 1000..1090: unchanged", "5000..7000 to 5000..7000: black"}));
    EXPECT_EQ(linesOf(plan.lost), Lines());
}

TEST_F(KeepPlannerTest, AReelBeforeThatNoCutSpeaksOfStaysThoughAClipRunsOverBoth)
{
    const Film before = Film().at(5000).shot("A", 0, 100);
    const Film after = Film().at(5010).shot("A", 0, 100);

    const KeepPlan plan = planFor(before, after, {{1000, 5100}, {2000, 3000}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"3000..5100 to 3010..5110: black cut"}));
    EXPECT_EQ(linesOf(plan.untouched), (Lines{"1000..3000 to 1000..3000: black"}));
    EXPECT_EQ(linesOf(plan.lost), Lines());
}

TEST_F(KeepPlannerTest, FromAReelOnAClipSpansOnceItRunsOnFor60SecondsUnderItsPicture)
{
    const Film before = Film().at(1000).shot("A", 0, 100);
    const Film after = Film().at(1000).shot("A", 0, 90);
    const auto eventsWith = [&](double start, double end) {
        return linesOf(planFor(before, after, {SecondsRange{start, end}, {1218, 1220}}).events);
    };

    // A clip of 59 seconds is a tail, and what stands less than 60 seconds after it goes along.
    EXPECT_EQ(eventsWith(1099, 1159), (Lines{"1100..1220 to 1090..1210: black"}));
    EXPECT_EQ(eventsWith(1099, 1160), (Lines{"1100..1160 to 1090..1150: black"}));
    EXPECT_EQ(eventsWith(1100, 1160), (Lines{"1100..1220 to 1090..1210: black"}));
}

TEST_F(KeepPlannerTest, WhatStaysDoesNotWinOverPictureThatHasGrown)
{
    const Film before = Film().at(1000).shot("A", 0, 100);
    const Film after = Film().at(1000).shot("A", 0, 110);

    const KeepPlan plan = planFor(before, after, {{1100, 1105}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1100..1105 to 1110..1115: black"}));
    EXPECT_EQ(hullOf(plan), "1100..1115");
    EXPECT_EQ(linesOf(plan.lost), Lines());
}

TEST_F(KeepPlannerTest, WhatStaysUnderPictureThatHasGrownIsToldAsLost)
{
    const Film before = Film().at(1000).shot("A", 0, 100);
    const Film after = Film().at(1000).shot("A", 0, 175);

    const KeepPlan plan = planFor(before, after, {{1170, 1180}});

    EXPECT_EQ(linesOf(plan.lost), (Lines{"1170..1175"}));
    EXPECT_EQ(hullOf(plan), "1100..1175");
}

TEST_F(KeepPlannerTest, OfSeveralLayersThatOneDecidesUnderWhichTheWholePictureIsTheSame)
{
    Film before = Film().at(1000).shot("A", 0, 100).at(1040).shot("T", 0, 20);
    before.at(1100).shot("B", 0, 50).shot("T", 0, 20);
    Film after = Film().at(1000).shot("X", 0, 10).shot("A", 0, 100).at(1050).shot("T", 0, 20);
    after.at(1110).shot("B", 0, 45).shot("T", 0, 20);

    const KeepPlan plan = planFor(before, after);

    EXPECT_EQ(linesOf(plan.events), (Lines{"1000..1145 to 1010..1155: cut", "1150..1170 to 1155..1175: cut"}));
}

TEST_F(KeepPlannerTest, LayersThatMoveApartClaimNoFrameTwice)
{
    const Film before = Film().at(1000).shot("A", 0, 100).at(1040).shot("T", 0, 20);
    const Film after = Film().at(1010).shot("A", 0, 100).at(1040).shot("T", 0, 20);

    const KeepPlan plan = planFor(before, after);

    std::int32_t end = 0;
    for (const core::KeptEvent& event : plan.events) {
        EXPECT_GE(event.destination.start, end);
        end = event.destination.end;
    }
    EXPECT_EQ(end, 1110);
}

TEST_F(KeepPlannerTest, UnequalNumbersOfReelsAreAQuestion)
{
    const Film before = Film().at(1000).shot("A", 0, 100).black(60).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 100).black(59).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after);

    ASSERT_EQ(plan.questions.size(), 1U);
    EXPECT_EQ(plan.questions.front().reason, KeepRefusal::UnequalReels);
    EXPECT_EQ(linesOf(plan.questions.front().oldReels), (Lines{"1000..1100", "1160..1210"}));
    EXPECT_EQ(linesOf(plan.questions.front().newReels), (Lines{"1000..1209"}));
    EXPECT_FALSE(plan.refusal);
}

TEST_F(KeepPlannerTest, WhereReelsCannotBePairedBlackStaysInItsPlace)
{
    const Film before = Film().at(1000).shot("A", 0, 100).black(60).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 100).black(59).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after, {{1100, 1110}, {1210, 1215}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1160..1210 to 1159..1209: cut"}));
    EXPECT_EQ(linesOf(plan.lost), Lines());
}

TEST_F(KeepPlannerTest, MaterialPastTheDayThatWouldHaveToMoveIsRefused)
{
    const Film before = Film().at(86000).shot("A", 0, 300);
    const Film after = Film().at(86000).shot("A", 0, 310);

    const KeepPlan plan = planFor(before, after, {{86300, 86500}});

    ASSERT_TRUE(plan.refusal);
    EXPECT_EQ(plan.refusal->reason, KeepRefusal::OutsideOfDay);
    EXPECT_EQ(linesOf(plan.refusal->material), (Lines{"86389..86500"}));
    EXPECT_EQ(plan.refusal->amount(), 111);
}

TEST_F(KeepPlannerTest, MaterialBeforeMidnightThatWouldHaveToMoveIsRefused)
{
    const Film before = Film().at(10).shot("A", 0, 100);
    const Film after = Film().at(12).shot("A", 0, 100);

    const KeepPlan plan = planFor(before, after, {{-5, 10}});

    ASSERT_TRUE(plan.refusal);
    EXPECT_EQ(linesOf(plan.refusal->material), (Lines{"-5..0"}));
}

TEST_F(KeepPlannerTest, MaterialPastTheDayThatStaysIsNoMatter)
{
    const Film before = Film().at(86000).shot("A", 0, 300);
    const Film after = Film().at(86000).shot("X", 0, 10).shot("A", 10, 290);

    const KeepPlan plan = planFor(before, after, {{86300, 86500}});

    EXPECT_FALSE(plan.refusal);
    EXPECT_EQ(hullOf(plan), "86000..86010");
}

// Locked tracks don't move, so the caller leaves out what stands on them.
TEST_F(KeepPlannerTest, WhatTheCallerLeavesOutDoesNotCount)
{
    const Film before = Film().at(1000).shot("A", 0, 100);
    const Film after = Film().at(1000).shot("A", 0, 90);

    const KeepPlan plan = planFor(before, after);

    EXPECT_EQ(linesOf(plan.events), Lines());
    EXPECT_EQ(hullOf(plan), "1090..1100");
}

TEST_F(KeepPlannerTest, TheHullIsCutWithWhatMayChangeAtMost)
{
    const Film after = Film().at(1000).shot("A", 0, 100).shot("X", 0, 10).shot("B", 0, 50);
    KeepContext context = contextWith();
    const EventList changes =
        generatedChanges(filmOfAAndB().list(), after.list(), 0, core::HealMode::Normal, FrameASecond);

    context.preserve = SecondsRange{1000, 1120};
    EXPECT_EQ(hullOf(KeepPlanner(context).plan(filmOfAAndB().list(), after.list(), changes)), "1100..1120");
    context.preserve = SecondsRange{1000, 1100};
    EXPECT_EQ(hullOf(KeepPlanner(context).plan(filmOfAAndB().list(), after.list(), changes)), "none");
}

TEST_F(KeepPlannerTest, MaterialThatEndsBeforeItStartsIsRefused)
{
    EXPECT_EQ(thrownBy([] { planFor(filmOfAAndB(), filmOfAAndB(), {{10, 9}}); }), util::Result::InvalidArgument);
}

TEST_F(KeepPlannerTest, AGivenChangeEdlIsTakenAsItIsWithinTheHullOfBothSides)
{
    EventList changes;
    changes.add(makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:30:00", "00:00:40:00"));
    changes.add(makeEvent("B", "00:01:00:00", "00:01:10:00", "00:00:20:00", "00:00:30:00"));

    const KeepPlan plan = KeepPlanner(contextWith({{0, 5}, {20, 70}, {100, 110}})).planGiven(changes);

    EXPECT_TRUE(plan.questions.empty());
    EXPECT_EQ(linesOf(plan.events), (Lines{"60..70 to 20..30: cut", "10..20 to 30..40: cut"}));
    EXPECT_EQ(hullOf(plan), "10..70");
}

//  SRC    |-- 1 --|      |-- 2 --|
//  DST    |-- 1 --|-- 2 --|
TEST_F(KeepPlannerTest, WhatStandsInAGapOfTheSourcesOfAGivenChangeEdlIsToldAsLostAndNotInTheWay)
{
    EventList changes;
    changes.add(makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:10:00", "00:00:20:00"));
    changes.add(makeEvent("C", "00:00:30:00", "00:00:40:00", "00:00:20:00", "00:00:30:00"));

    const KeepPlan plan = KeepPlanner(contextWith({{0, 22}, {25, 28}, {29, 50}})).planGiven(changes);

    EXPECT_TRUE(plan.questions.empty());
    EXPECT_EQ(linesOf(plan.lost), (Lines{"20..30"})); // told once, from the first to the last
    EXPECT_EQ(linesOf(KeepPlanner(contextWith({{0, 20}, {25, 28}, {30, 50}})).planGiven(changes).lost),
              (Lines{"25..28"}));
    EXPECT_EQ(linesOf(KeepPlanner(contextWith({{0, 20}, {30, 50}})).planGiven(changes).lost), Lines());
}

//  SRC    |-- 1 --|
//  DST                    |-- 1 --|
TEST_F(KeepPlannerTest, WhatStandsBetweenTheOldAndTheNewPlaceOfAGivenChangeEdlIsInTheWay)
{
    EventList changes;
    changes.add(makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:40:00", "00:00:50:00"));
    const auto planWith = [&](const SecondsRange& material) {
        return KeepPlanner(contextWith({{10, 20}, material})).planGiven(changes);
    };

    ASSERT_EQ(planWith({20, 21}).questions.size(), 1U);
    EXPECT_EQ(planWith({20, 21}).questions.front().reason, KeepRefusal::MaterialInTheWay);
    EXPECT_EQ(planWith({20, 21}).questions.front().amount(), 1);
    EXPECT_EQ(linesOf(planWith({25, 45}).lost), (Lines{"25..45"}));
    EXPECT_FALSE(planWith({49, 60}).questions.empty());
    EXPECT_TRUE(planWith({50, 60}).questions.empty());
    EXPECT_TRUE(planWith({5, 10}).questions.empty());
}

TEST_F(KeepPlannerTest, MaterialInTheWayOfAGivenChangeEdlIsAQuestionWithItsAmount)
{
    EventList changes;
    changes.add(makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:15:00", "00:00:25:00"));

    const KeepPlan plan = KeepPlanner(contextWith({{12, 22}, {24, 90}})).planGiven(changes);

    ASSERT_EQ(plan.questions.size(), 1U);
    EXPECT_EQ(plan.questions.front().reason, KeepRefusal::MaterialInTheWay);
    EXPECT_EQ(plan.questions.front().amount(), 3);
    EXPECT_FALSE(plan.refusal);
    EXPECT_EQ(linesOf(plan.lost), (Lines{"20..22", "24..25"}));
    EXPECT_EQ(hullOf(plan), "10..25");
}

//  old    |-- A --|- BL -|-- B --|
//  new    |-- A --|-- B --|- BL -|
TEST_F(KeepPlannerTest, SoundInBlackThatFindsNoRoomBesideItsPictureGoesWhereTheChangeEdlSendsTheBlack)
{
    const Film before = Film().at(1000).shot("A", 0, 100).shot("BL", 0, 20).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 100).shot("B", 0, 50).shot("BL", 0, 20);

    const KeepPlan plan = planFor(before, after, {{1000, 1170}});

    EXPECT_EQ(linesOf(plan.lost), Lines());
    EXPECT_EQ(linesOf(plan.events), (Lines{"1120..1170 to 1100..1150: cut", "1100..1120 to 1150..1170: black"}));
}

//  old    |-- A --|-- X --|  sound  |-- B --|
//  new    |-- A --|  sound  |-- B --|
TEST_F(KeepPlannerTest, SoundInBlackBehindALiftedShotGoesAlongWithTheShotAfterIt)
{
    const Film before = Film().at(1000).shot("A", 0, 100).shot("X", 0, 30).black(10).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 100).black(10).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after, {{1130, 1140}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1130..1190 to 1100..1160: black cut"}));
    EXPECT_EQ(hullOf(plan), "1100..1190");
    EXPECT_EQ(linesOf(plan.lost), Lines());
}

//  old           |-- A --|- X -| sound |------- Y -------|-- B --|
//  new   (here)  |-- A --|-- B --|
TEST_F(KeepPlannerTest, SoundInTheBlackOfALiftedSceneDoesNotGoInFrontOfTheReel)
{
    const Film before = Film().at(1000).shot("A", 0, 100).shot("X", 0, 30).black(10).shot("Y", 0, 140).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, filmOfAAndB(), {{1130, 1140}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1280..1330 to 1100..1150: cut"}));
    EXPECT_EQ(linesOf(plan.lost), (Lines{"1130..1140"}));
}

//  old   |-- A --|- X -| sound |- Y -|-- B --|
//  new   |-- A --|-- B --|     (here)
TEST_F(KeepPlannerTest, SoundInTheBlackOfALiftedSceneDoesNotStayBehindTheReel)
{
    const Film before = Film().at(1000).shot("A", 0, 100).shot("X", 0, 60).black(10).shot("Y", 0, 10).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, filmOfAAndB(), {{1160, 1170}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1180..1230 to 1100..1150: cut"}));
    EXPECT_EQ(linesOf(plan.lost), (Lines{"1160..1170"}));
}

//  old   |-- A --|- X -| sound |- Y -|- B -| other |- C -|
//  new   |-- A --|- B -| other |- C -|
TEST_F(KeepPlannerTest, SoundInTheBlackOfALiftedSceneDoesNotTakeTheRoomOfThatAfterIt)
{
    const Film rest = Film().at(1100).shot("B", 0, 30).black(10).shot("C", 0, 20);
    const Film before =
        Film().at(1000).shot("A", 0, 100).shot("X", 0, 30).black(10).shot("Y", 0, 10).append(rest, 1100);
    const Film after = Film().at(1000).shot("A", 0, 100).append(rest, 1100);

    const KeepPlan plan = planFor(before, after, {{1130, 1140}, {1180, 1190}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1150..1210 to 1100..1160: cut black cut"}));
    EXPECT_EQ(linesOf(plan.lost), (Lines{"1130..1140"}));
}

//  old   |-- A --|- X -| sound |- Y -|-- B --|
//  new   |-- A --|- P -| sound |- Q -|-- B --|
TEST_F(KeepPlannerTest, SoundInBlackBetweenTwoShotsThatWereReplacedStays)
{
    const Film before = Film().at(1000).shot("A", 0, 100).shot("X", 0, 30).black(10).shot("Y", 0, 10).shot("B", 0, 50);
    const Film after = Film().at(1000).shot("A", 0, 100).shot("P", 0, 30).black(10).shot("Q", 0, 10).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after, {{1130, 1140}});

    EXPECT_EQ(linesOf(plan.lost), Lines());
    EXPECT_EQ(linesOf(plan.events), (Lines{"1130..1140 to 1130..1140: black"}));
}

TEST_F(KeepPlannerTest, WhatWouldStayIsLostWhereNewPictureIsPushedOverIt)
{
    const Film after = filmOfAAndB().shot("C", 0, 71);

    // The reel ends at 1150; from 1210 on material doesn't belong to it any more.
    EXPECT_EQ(linesOf(planFor(filmOfAAndB(), after, {{1210, 1230}}).lost), (Lines{"1210..1221"}));
    EXPECT_EQ(linesOf(planFor(filmOfAAndB(), after, {{1221, 1230}}).lost), Lines());
}

TEST_F(KeepPlannerTest, WhatTheUserPreservesCanLeaveNothingToDoThoughThePictureHasChanged)
{
    const Film after = Film().at(1000).shot("A", 0, 100).shot("X", 0, 10).shot("B", 0, 50);
    KeepContext context = contextWith();
    const auto planWith = [&](const SecondsRange& preserve) {
        context.preserve = preserve;
        return KeepPlanner(context).plan(filmOfAAndB().list(), after.list(), EventList());
    };

    EXPECT_TRUE(planWith({0, 1100}).isHeldBack);
    EXPECT_EQ(hullOf(planWith({0, 1100})), "none");
    EXPECT_FALSE(planWith({0, 1101}).isHeldBack);
    context.preserve.reset();
    EXPECT_FALSE(KeepPlanner(context).plan(after.list(), after.list(), EventList()).isHeldBack);
}

TEST_F(KeepPlannerTest, BlackOfWhichMoreFindsRoomBesideItsPictureDoesNotFollowTheChangeEdl)
{
    // All black has the same source, so that the change EDL can send it anywhere.
    const Film before =
        Film().at(1000).shot("A", 0, 100).shot("BL", 0, 20).shot("B", 0, 50).shot("BL", 0, 20).shot("C", 0, 50);
    const Film after = Film().at(1005).append(before, 1000);

    const KeepPlan plan = planFor(before, after, {{1000, 1240}});

    EXPECT_EQ(linesOf(plan.events), (Lines{"1000..1240 to 1005..1245: cut black cut black cut"}));
}

TEST_F(KeepPlannerTest, AGivenChangeEdlWithoutAUsableEventNeedsNoRun)
{
    EventList changes;
    changes.add(makeEvent("A", "00:00:10:00", "00:00:10:00", "00:00:15:00", "00:00:15:00"));

    EXPECT_EQ(hullOf(KeepPlanner(contextWith()).planGiven(changes)), "none");
}

TEST_F(KeepPlannerTest, TheListToCarryOutHasTheJoinedEventsAndTheirParts)
{
    const Film before = Film().at(1000).shot("A", 0, 100).black(10).shot("B", 0, 50);
    const Film after = Film().at(1010).shot("A", 0, 100).black(10).shot("B", 0, 50);

    const KeepPlan plan = planFor(before, after);
    const EventList list = keptChangeList(plan, after.list(), core::MatchBy::RollName, FrameASecond);

    ASSERT_EQ(list.size(), 1U);
    EXPECT_EQ(timecodesOf(list.at(0)), "00:16:40:00 00:19:20:00 00:16:50:00 00:19:30:00");
    EXPECT_EQ(list.at(0).rollName(), "Healed Event 001");
    EXPECT_EQ(list.at(0).eventNumber(), 1U);
    EXPECT_TRUE(list.at(0).isValid());
    const auto* healed = dynamic_cast<const core::HealedEvent*>(&list.at(0));
    ASSERT_NE(healed, nullptr);
    ASSERT_EQ(healed->healedEvents().size(), 3U);
    EXPECT_EQ(healed->healedEvents().at(0).rollName(), "A");
    EXPECT_EQ(healed->healedEvents().at(1).rollName(), "Black");
    EXPECT_EQ(timecodesOf(healed->healedEvents().at(1)), "00:18:20:00 00:18:30:00 00:18:30:00 00:18:40:00");
    EXPECT_EQ(healed->healedEvents().at(2).rollName(), "B");
}

TEST_F(KeepPlannerTest, AnEventOfOneShotBearsItsName)
{
    const Film after = Film().at(1000).shot("A", 0, 100).shot("X", 0, 10).shot("B", 0, 50);

    const EventList list =
        keptChangeList(planFor(filmOfAAndB(), after), after.list(), core::MatchBy::RollName, FrameASecond);

    ASSERT_EQ(list.size(), 1U);
    EXPECT_EQ(list.at(0).rollName(), "B");
    EXPECT_EQ(list.at(0).eventKind(), core::EventKind::Plain);
}

TEST_F(KeepPlannerTest, TheHullIsGivenInSeconds)
{
    KeepPlan plan;
    plan.hull = FrameRange{48, 72};

    EXPECT_EQ(hullSeconds(plan, core::Framerate(24, 0)), (SecondsRange{2.0, 3.0}));
}

} // namespace cadrel::tests
