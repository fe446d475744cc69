// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/picture/PictureLine.h"

#include "core/edl/EventBase.h"
#include "core/picture/PictureComparison.h"
#include "core/picture/PictureNames.h"
#include "core/settings/MatchBy.h"
#include "tests/core/picture/Film.h"
#include "tests/support/core/EdlReading.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

namespace cadrel::tests {
namespace {

using core::EventFlaw;
using core::EventList;
using core::FrameRange;
using core::Framerate;
using core::MatchBy;
using core::PictureComparison;
using core::PictureLine;
using core::PictureNames;
using core::PicturePiece;
using core::PictureRun;
using core::TransitionType;
using core::VfxPatternEntry;

using Lines = std::vector<std::string>;

constexpr FrameRange WholeDay{0, 86399};

/// The runs as "100..150 x2", with the number of layers.
Lines runsOf(const EventList& events, const Framerate& framerate = FrameASecond)
{
    PictureNames names(MatchBy::RollName, {});
    const PictureLine line(events, names, framerate);
    Lines lines;
    for (const PictureRun& run : line.runs())
        lines.push_back(linesOf(core::FrameRanges{run.frames}).front() + " x" + std::to_string(run.layerCount));
    // No name is needed to tell where there is a picture.
    EXPECT_EQ(core::litFrames(events, framerate), line.lit());
    return lines;
}

/// Where two cuts are equal.
Lines equalOf(const EventList& oldEvents, const EventList& newEvents, std::int32_t shift = 0,
              const std::vector<VfxPatternEntry>& rows = {}, std::int32_t matchBy = MatchBy::RollName)
{
    PictureNames names(matchBy, rows);
    const PictureLine oldLine(oldEvents, names, FrameASecond);
    const PictureLine newLine(newEvents, names, FrameASecond);
    core::FrameRanges equal;
    for (const PicturePiece& piece : PictureComparison(oldLine, newLine).equalUnder(shift, WholeDay))
        equal.push_back(piece.frames);
    return linesOf(core::united(equal));
}

Lines equalOf(const Film& oldFilm, const Film& newFilm, std::int32_t shift = 0)
{
    return equalOf(oldFilm.list(), newFilm.list(), shift);
}

class PictureLineTest : public testing::Test {
protected:
    TestProject m_project{FrameASecond};
};

} // namespace

TEST_F(PictureLineTest, AReversedShotIsEqualToAReversedOneThatShowsTheSameFrames)
{
    const auto reversed = [](EventList events) {
        events.at(0).setReversed(true);
        return events;
    };
    const EventList forwards = Film().at(100).shot("A", 0, 50).list();

    EXPECT_EQ(equalOf(forwards, reversed(Film().at(100).shot("A", 0, 50).list())), Lines{});
    EXPECT_EQ(
        equalOf(reversed(Film().at(100).shot("A", 0, 50).list()), reversed(Film().at(100).shot("A", 0, 50).list())),
        Lines{"100..150"});
    // Both begin with the last frame of the source.
    EXPECT_EQ(
        equalOf(reversed(Film().at(100).shot("A", 0, 50).list()), reversed(Film().at(100).shot("A", 10, 40).list())),
        Lines{"100..140"});
    // An event list may also tell the way of a reversed shot by its SRC.
    EXPECT_EQ(
        equalOf(Film().at(100).retimed("A", 50, -50, 50).list(), reversed(Film().at(100).shot("A", 0, 50).list())),
        Lines{"100..150"});
}

TEST_F(PictureLineTest, LayersStandTogetherWhereTheyOverlap)
{
    const Film film = Film().at(100).shot("A", 0, 50).shot("B", 0, 50).at(140).shot("T", 0, 20);

    EXPECT_EQ(runsOf(film.list()), (Lines{"100..140 x1", "140..150 x2", "150..160 x2", "160..200 x1"}));
}

TEST_F(PictureLineTest, AShotThatIsCutWithoutAChangeIsOneRun)
{
    EXPECT_EQ(runsOf(Film().at(100).shot("A", 0, 50).shot("A", 50, 10).list()), (Lines{"100..160 x1"}));
    EXPECT_EQ(runsOf(Film().at(100).freeze("A", 7, 50).freeze("A", 7, 10).list()), (Lines{"100..160 x1"}));
    EXPECT_EQ(runsOf(Film().at(100).shot("A", 0, 50).shot("A", 51, 10).list()).size(), 2U);
}

TEST_F(PictureLineTest, OneEventThatStandsTwiceIsOneLayer)
{
    EXPECT_EQ(runsOf(Film().at(100).shot("A", 0, 50).at(100).shot("A", 0, 50).list()), (Lines{"100..150 x1"}));
}

TEST_F(PictureLineTest, TheRollsBLAndBLACKAreBlack)
{
    EXPECT_EQ(runsOf(Film().at(100).shot("BL", 0, 50).shot("black", 0, 50).shot("BLA", 0, 50).list()),
              (Lines{"200..250 x1"}));
}

TEST_F(PictureLineTest, SoundIsNoPicture)
{
    const EventList events = Film().at(100).shot("A", 0, 50).list();
    events.at(0).addFlaw(EventFlaw::NotVideoEvent);

    EXPECT_EQ(runsOf(events), Lines());
}

TEST_F(PictureLineTest, AnEventWithoutAUsableDstIsLeftOut)
{
    EventList events = Film().at(100).shot("A", 0, 50).shot("B", 0, 50).shot("C", 0, 50).list();
    events.at(0).addFlaw(EventFlaw::DstOutUnreadable);
    events.at(1).setDst(core::Timecode(200), core::Timecode(150));
    events.at(2).setDst(core::Timecode(250), core::Timecode(250));

    EXPECT_EQ(runsOf(events), Lines());
}

TEST_F(PictureLineTest, AnEventWithAnyOtherFlawIsPicture)
{
    const EventList events = Film().at(100).shot("A", 0, 50).list();
    events.at(0).addFlaw(EventFlaw::EventNumberNotNumeric);

    EXPECT_EQ(runsOf(events), (Lines{"100..150 x1"}));
}

TEST_F(PictureLineTest, LayersBeyondTheMostAreCounted)
{
    Film film;
    Film oneMore;
    for (int layer = 0; layer < 70; ++layer) {
        film.at(100).shot(std::string("R").append(std::to_string(100 + layer)), 0, 10);
        oneMore.at(100).shot(std::string("R").append(std::to_string(100 + layer)), 0, 10);
    }
    oneMore.at(100).shot("R999", 0, 10);

    EXPECT_EQ(runsOf(film.list()), (Lines{"100..110 x64"}));
    EXPECT_EQ(equalOf(film, film), (Lines{"100..110"}));
    EXPECT_EQ(equalOf(film, oneMore), Lines());
}

TEST_F(PictureLineTest, EqualMeansTheSameSourceFrameOfTheSameRoll)
{
    const Film film = Film().at(100).shot("A", 10, 50);

    EXPECT_EQ(equalOf(film, Film().at(110).shot("A", 20, 20)), (Lines{"110..130"}));
    EXPECT_EQ(equalOf(film, Film().at(110).shot("A", 21, 20)), Lines());
    EXPECT_EQ(equalOf(film, Film().at(110).shot("A", 21, 20), -1), (Lines{"110..130"}));
    EXPECT_EQ(equalOf(film, Film().at(100).shot("B", 10, 50)), Lines());
}

TEST_F(PictureLineTest, AShotThatRunsBackwardsIsNotTheSameForwards)
{
    const Film backwards = Film().at(100).retimed("A", 60, -50, 50);

    EXPECT_EQ(equalOf(backwards, backwards), (Lines{"100..150"}));
    EXPECT_EQ(equalOf(backwards, Film().at(100).shot("A", 10, 50)), Lines());
}

TEST_F(PictureLineTest, ASlowShotIsNotEqualToItselfAFrameLater)
{
    const Film slow = Film().at(100).retimed("A", 0, 25, 100);

    EXPECT_EQ(equalOf(slow, Film().at(101).retimed("A", 0, 25, 100)), Lines());
    EXPECT_EQ(equalOf(slow, Film().at(101).retimed("A", 0, 25, 100), 1), (Lines{"101..201"}));
}

// 50 of 100 frames at half speed, and 26 of 51: after 26 frames the source frames are more than a quarter apart.
TEST_F(PictureLineTest, SpeedsThatRoundingSetApartAreEqualWhereTheirFramesAre)
{
    const Film old = Film().at(100).retimed("A", 0, 50, 100);
    const Film trimmed = Film().at(100).retimed("A", 0, 26, 51);

    EXPECT_EQ(equalOf(old, trimmed), (Lines{"100..126"}));
}

TEST_F(PictureLineTest, AStillHasToBeginOrEndAtTheSameFrame)
{
    const Film still = Film().at(100).freeze("A", 7, 50);

    EXPECT_EQ(equalOf(still, Film().at(100).freeze("A", 7, 30)), (Lines{"100..130"}));
    EXPECT_EQ(equalOf(still, Film().at(120).freeze("A", 7, 30)), (Lines{"120..150"}));
    EXPECT_EQ(equalOf(still, Film().at(110).freeze("A", 7, 50)), Lines());
    EXPECT_EQ(equalOf(still, Film().at(110).freeze("A", 7, 50), 10), (Lines{"110..160"}));
    EXPECT_EQ(equalOf(still, Film().at(100).freeze("A", 8, 50)), Lines());
}

TEST_F(PictureLineTest, APictureWithALayerMoreIsAnother)
{
    const Film plain = Film().at(100).shot("A", 0, 50);
    const Film titled = Film().at(100).shot("A", 0, 50).at(120).shot("T", 0, 10);

    EXPECT_EQ(equalOf(plain, titled), (Lines{"100..120", "130..150"}));
}

TEST_F(PictureLineTest, ATransitionIsPartOfThePictureWhileItLasts)
{
    const EventList cut = Film().at(100).shot("A", 0, 50).shot("B", 0, 50).list();
    const EventList dissolve = Film().at(100).shot("A", 0, 50).shot("B", 0, 50).list();
    dissolve.at(1).setTransitionType(TransitionType::Dissolve);
    dissolve.at(1).setTransitionDuration(12);

    EXPECT_EQ(equalOf(dissolve, dissolve), (Lines{"100..200"}));
    EXPECT_EQ(equalOf(cut, dissolve), (Lines{"100..150", "162..200"}));
}

TEST_F(PictureLineTest, ATransitionFromAnotherShotIsAnother)
{
    const auto dissolveFrom = [](const std::string& roll, std::int32_t srcIn) {
        EventList events = Film().at(150).shot(roll, srcIn, 0).at(150).shot("B", 0, 50).list();
        events.at(1).setEventNumber(1);
        events.at(1).setTransitionType(TransitionType::Dissolve);
        events.at(1).setTransitionDuration(12);
        return events;
    };

    EXPECT_EQ(equalOf(dissolveFrom("A", 30), dissolveFrom("A", 30)), (Lines{"150..200"}));
    EXPECT_EQ(equalOf(dissolveFrom("A", 30), dissolveFrom("C", 30)), (Lines{"162..200"}));
    EXPECT_EQ(equalOf(dissolveFrom("A", 30), dissolveFrom("A", 31)), (Lines{"162..200"}));
}

TEST_F(PictureLineTest, VersionsOfAVfxShotAreOnePicture)
{
    const std::vector<VfxPatternEntry> rows{{"VFX_v", "_comp", true}};
    const EventList third = Film().at(100).shot("VFX_v003_comp", 0, 50).list();
    const EventList fourth = Film().at(100).shot("VFX_v004_comp", 0, 50).list();

    EXPECT_EQ(equalOf(third, fourth, 0, rows), (Lines{"100..150"}));
    EXPECT_EQ(equalOf(third, fourth), Lines());
}

TEST_F(PictureLineTest, ClipNamesDecideWhenTheSettingSaysSo)
{
    const EventList one = Film().at(100).shot("A", 0, 50).list();
    const EventList other = Film().at(100).shot("B", 0, 50).list();
    one.at(0).setClipName("clip");
    other.at(0).setClipName("clip");

    EXPECT_EQ(equalOf(one, other, 0, {}, MatchBy::ClipName), (Lines{"100..150"}));
    EXPECT_EQ(equalOf(one, other), Lines());
}

TEST_F(PictureLineTest, AnUnreadableSourceCountsAsItsText)
{
    const EdlReading one("001  A V C xx:00:00:00 00:00:10:00 00:01:40:00 00:01:50:00\n");
    const EdlReading same("001  A V C xx:00:00:00 00:00:10:00 00:01:40:00 00:01:50:00\n");
    const EdlReading other("001  A V C yy:00:00:00 00:00:10:00 00:01:40:00 00:01:50:00\n");

    EXPECT_EQ(equalOf(one.events, same.events), (Lines{"100..110"}));
    EXPECT_EQ(equalOf(one.events, other.events), Lines());
}

TEST_F(PictureLineTest, ARollNameThatCannotBeTakenCountsAsItsText)
{
    const EdlReading one("001  A+1 V C 00:00:00:00 00:00:10:00 00:01:40:00 00:01:50:00\n");
    const EdlReading other("001  A+2 V C 00:00:00:00 00:00:10:00 00:01:40:00 00:01:50:00\n");

    ASSERT_TRUE(one.events.at(0).hasFlaw(EventFlaw::RollNameInvalid));
    EXPECT_EQ(equalOf(one.events, one.events), (Lines{"100..110"}));
    EXPECT_EQ(equalOf(one.events, other.events), Lines());
}

TEST_F(PictureLineTest, BlackDoesNotDifferFromBlack)
{
    PictureNames names(MatchBy::RollName, {});
    const PictureLine oldLine(Film().at(100).shot("A", 0, 50).black(20).shot("B", 0, 30).list(), names, FrameASecond);
    const PictureLine newLine(Film().at(100).shot("A", 0, 40).black(30).shot("C", 0, 30).list(), names, FrameASecond);

    EXPECT_EQ(linesOf(PictureComparison(oldLine, newLine).differencesUnder(0, {0, 190})),
              (Lines{"140..150", "170..190"}));
}

} // namespace cadrel::tests
