// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/PastRuns.h"

#include "tests/core/keep/KeepFilm.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <optional>

namespace cadrel::tests {
namespace {

using core::EventList;
using core::PastRuns;

/// Films are written at one frame a second.
class PastRunsTest : public testing::Test {
protected:
    void carryOver(const Film& from, const Film& to) { m_runs.add(from.list(), to.list(), EventList()); }
    void carryOut(const EventList& changes) { m_runs.add(EventList(), EventList(), changes); }
    std::optional<std::int32_t> differenceTo(const Film& film) const { return m_runs.firstDifference(film.list()); }

    TestProject m_project{FrameASecond};
    PastRuns m_runs{{0, {}, FrameASecond}};
};

Film reelAt(std::int32_t start)
{
    return Film().at(start).shot("A", 0, 100).shot("B", 0, 50);
}

/// Moves the ten seconds from 00:10:00:00 on by `shift` seconds.
EventList tenSecondsMovedTo(const char* dstIn, const char* dstOut)
{
    EventList changes;
    changes.add(makeEvent("A", "00:10:00:00", "00:10:10:00", dstIn, dstOut));
    return changes;
}

} // namespace

TEST_F(PastRunsTest, WithoutRunsThereIsNoDifference)
{
    carryOver(Film(), Film());

    EXPECT_TRUE(m_runs.isEmpty());
    EXPECT_EQ(differenceTo(reelAt(1000)), std::nullopt);
}

TEST_F(PastRunsTest, TheCutThatTheSoundStandsInHasNoDifference)
{
    carryOver(reelAt(1000), reelAt(1000).shot("C", 0, 10));

    EXPECT_EQ(differenceTo(reelAt(1000).shot("C", 0, 10)), std::nullopt);
}

// From 60 seconds on black parts two reels, and nothing is compared there.
TEST_F(PastRunsTest, WithinAReelBlackIsAPictureOfItsOwnAndBetweenReelsItIsNone)
{
    const Film parted = Film().at(1000).shot("A", 0, 100).black(60).shot("B", 0, 50);
    const Film together = Film().at(1000).shot("A", 0, 100).black(59).shot("B", 0, 50);
    const Film between = Film().at(1110).shot("X", 0, 30);

    carryOver(parted, parted);
    EXPECT_EQ(differenceTo(between), std::nullopt);
    carryOver(together, together);
    EXPECT_EQ(differenceTo(between), 1110);
}

TEST_F(PastRunsTest, APartOfTheReelIsEnough)
{
    carryOver(reelAt(1000).shot("C", 0, 10), reelAt(1000));

    EXPECT_EQ(differenceTo(Film().at(1020).shot("A", 20, 80)), std::nullopt);
    EXPECT_EQ(differenceTo(Film().at(1020).shot("A", 21, 80)), 1020);
}

TEST_F(PastRunsTest, TheCutThatARunBeganWithDiffersWhereTheReelNowEnds)
{
    carryOver(reelAt(1000).shot("C", 0, 10), reelAt(1000));
    EXPECT_EQ(differenceTo(reelAt(1000).shot("C", 0, 10)), 1150);

    carryOver(reelAt(2000), reelAt(2000).shot("C", 0, 10));
    EXPECT_EQ(differenceTo(reelAt(2000)), 2150);
}

TEST_F(PastRunsTest, ALaterRunHidesAnEarlierOneAtItsOwnTimeAlone)
{
    carryOver(reelAt(1000).append(reelAt(2000), 1500), reelAt(1000).append(reelAt(2000), 1500));
    carryOver(reelAt(1000), Film().at(1000).shot("X", 0, 150));

    EXPECT_EQ(m_runs.size(), 2U);
    EXPECT_EQ(differenceTo(Film().at(1000).shot("X", 0, 150)), std::nullopt);
    EXPECT_EQ(differenceTo(reelAt(1000)), 1000);
    EXPECT_EQ(differenceTo(Film().at(1650).shot("X", 0, 150)), 1650);

    carryOver(reelAt(1000).append(reelAt(2000), 1500), reelAt(1000).append(reelAt(2000), 1500));
    EXPECT_EQ(m_runs.size(), 1U);
}

TEST_F(PastRunsTest, WhereAGivenChangeEdlWasCarriedOutNoCutIsKnown)
{
    carryOver(reelAt(600), reelAt(600));
    carryOut(tenSecondsMovedTo("00:10:05:00", "00:10:15:00")); // frames 600 to 615

    EXPECT_EQ(differenceTo(Film().at(600).shot("X", 0, 15)), std::nullopt);
    EXPECT_EQ(differenceTo(Film().at(600).shot("X", 0, 16)), 615);
}

TEST_F(PastRunsTest, AChangeEdlIsCarriedOutOnceUntilALaterRunHidesIt)
{
    const EventList changes = tenSecondsMovedTo("00:10:05:00", "00:10:15:00");
    EXPECT_FALSE(m_runs.haveCarriedOut(changes, true));

    carryOut(changes);
    EXPECT_TRUE(m_runs.haveCarriedOut(changes, true));
    EXPECT_FALSE(m_runs.haveCarriedOut(tenSecondsMovedTo("00:10:04:00", "00:10:14:00"), true));

    carryOut(tenSecondsMovedTo("00:10:14:00", "00:10:24:00"));
    EXPECT_FALSE(m_runs.haveCarriedOut(changes, true));
}

TEST_F(PastRunsTest, AChangeEdlThatMovesNothingMayBeCarriedOutAgain)
{
    const EventList changes = tenSecondsMovedTo("00:10:00:00", "00:10:10:00");
    carryOut(changes);

    EXPECT_FALSE(m_runs.haveCarriedOut(changes, true));
}

TEST_F(PastRunsTest, StretchesThatGoOnAlikeCountAsOne)
{
    EventList halves;
    halves.add(makeEvent("B", "00:10:06:00", "00:10:10:00", "00:10:11:00", "00:10:15:00"));
    halves.add(makeEvent("A", "00:10:00:00", "00:10:06:00", "00:10:05:00", "00:10:11:00"));
    carryOut(halves);

    EXPECT_TRUE(m_runs.haveCarriedOut(tenSecondsMovedTo("00:10:05:00", "00:10:15:00"), true));
}

TEST_F(PastRunsTest, OutsideOfWhatARunCouldChangeTheSoundStandsInItsOldCut)
{
    const Film before = reelAt(1000);
    const Film after = Film().at(1000).shot("X", 0, 100).shot("Y", 0, 50);
    m_runs.add(before.list(), after.list(), EventList(), {1000, 1100});

    // The first half stands in the new cut, and the second in the old one.
    EXPECT_EQ(m_runs.firstDifference(before.list()), 1000);
    EXPECT_EQ(m_runs.firstDifference(after.list()), 1100);
    EXPECT_EQ(m_runs.firstDifference(Film().at(1000).shot("X", 0, 100).shot("B", 0, 50).list()), std::nullopt);
    // The rest of the same change doesn't ask for the first half.
    EXPECT_EQ(m_runs.firstDifference(before.list(), {{1100, 1150}}), std::nullopt);
    EXPECT_EQ(m_runs.firstDifference(before.list(), {{1099, 1150}}), 1099);

    m_runs.add(before.list(), after.list(), EventList(), {1100, 1150});
    EXPECT_EQ(m_runs.firstDifference(after.list()), std::nullopt);
    EXPECT_EQ(m_runs.firstDifference(before.list()), 1100);
}

TEST_F(PastRunsTest, AChangeEdlMayBeCarriedOutWhereNoRunCouldChangeAnything)
{
    const EventList changes = tenSecondsMovedTo("00:10:05:00", "00:10:15:00"); // frames 600 to 615
    m_runs.add(EventList(), EventList(), changes, {600, 608});

    EXPECT_TRUE(m_runs.haveCarriedOut(changes, true));
    EXPECT_TRUE(m_runs.haveCarriedOut(changes, true, {607, 615}));
    EXPECT_FALSE(m_runs.haveCarriedOut(changes, true, {608, 615}));
}

TEST_F(PastRunsTest, OfAFilmThatGetsShorterTheLastRunAloneIsKept)
{
    for (std::int32_t length = 50; length > 40; --length)
        carryOver(Film().at(1000).shot("A", 0, length), Film().at(1000).shot("A", 0, length - 1));

    EXPECT_EQ(m_runs.size(), 1U);
    EXPECT_EQ(differenceTo(Film().at(1000).shot("A", 0, 40)), std::nullopt);
    EXPECT_EQ(differenceTo(Film().at(1000).shot("A", 0, 41)), 1040);
}

TEST_F(PastRunsTest, ARestrictedRunIsKeptUntilWhatItHasLeftIsHidden)
{
    m_runs.add(reelAt(1000).list(), reelAt(1000).list(), EventList(), {1000, 1100});
    m_runs.add(reelAt(1000).list(), reelAt(1000).list(), EventList(), {1000, 1149});
    EXPECT_EQ(m_runs.size(), 2U);

    m_runs.add(reelAt(1000).list(), reelAt(1000).list(), EventList(), {1000, 1150});
    EXPECT_EQ(m_runs.size(), 1U);
}

TEST_F(PastRunsTest, BytesOfAnotherVersionAreNoRuns)
{
    carryOver(reelAt(1000), reelAt(1000));
    std::string bytes = m_runs.toBytes();
    ++bytes.front();

    PastRuns read({0, {}, FrameASecond});

    EXPECT_FALSE(read.read(bytes));
    EXPECT_TRUE(read.isEmpty());
}

TEST_F(PastRunsTest, RunsReadBackFromTheirBytesSayTheSame)
{
    carryOver(reelAt(1000), reelAt(1000).shot("C", 0, 10));
    carryOut(tenSecondsMovedTo("00:10:05:00", "00:10:15:00"));
    m_runs.add(reelAt(3000).list(), Film().at(3000).shot("X", 0, 150).list(), EventList(), {3000, 3050});

    PastRuns read({0, {}, FrameASecond});

    EXPECT_TRUE(read.read(m_runs.toBytes()));
    EXPECT_EQ(read.size(), 3U);
    EXPECT_EQ(read.firstDifference(reelAt(1000).list()), 1150);
    EXPECT_EQ(read.firstDifference(reelAt(3000).list()), 3000);
    EXPECT_EQ(read.firstDifference(Film().at(3000).shot("X", 0, 150).list()), 3050);
    EXPECT_TRUE(read.haveCarriedOut(tenSecondsMovedTo("00:10:05:00", "00:10:15:00"), true));
    EXPECT_EQ(read.toBytes(), m_runs.toBytes());
}

TEST_F(PastRunsTest, BytesThatAreDamagedAreNoRuns)
{
    carryOver(reelAt(1000), reelAt(1000));
    const std::string bytes = m_runs.toBytes();

    for (std::size_t length = 0; length < bytes.size(); ++length) {
        PastRuns read({0, {}, FrameASecond});
        EXPECT_FALSE(read.read(bytes.substr(0, length))) << length;
        EXPECT_TRUE(read.isEmpty()) << length;
    }
}

} // namespace cadrel::tests
