// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/ChangeNotes.h"
#include "core/edl/EventBase.h"
#include "core/notes/StayingBlocks.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <memory>
#include <numeric>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using namespace core;

constexpr int Hour = 90000; // frames at 25 frames a second

/// A shot in frames; the next stands right after it.
struct Shot {
    std::string roll;
    int srcIn = 0;
    int length = 0;
    int srcLength = -1; ///< -1: the length
    int dissolve = 0;   ///< frames
    std::string clip = {};
};

std::shared_ptr<EventBase> eventOf(const Shot& shot, int dstIn, unsigned number)
{
    auto event = std::make_shared<EventBase>();
    event->setRollName(shot.roll);
    event->setClipName(shot.clip);
    event->setEventNumber(number);
    const int srcLength = shot.srcLength < 0 ? shot.length : shot.srcLength;
    event->setTimecodes(Timecode(shot.srcIn), Timecode(shot.srcIn + srcLength), Timecode(dstIn),
                        Timecode(dstIn + shot.length));
    if (shot.dissolve > 0) {
        event->setTransitionType(TransitionType::Dissolve);
        event->setTransitionDuration(shot.dissolve);
    }
    return event;
}

EventList reelOf(const std::vector<Shot>& shots, int start = Hour)
{
    EventList events;
    for (const Shot& shot : shots) {
        events.add(eventOf(shot, start, static_cast<unsigned>(events.size()) + 1));
        start += shot.length;
    }
    return events;
}

std::string rollOf(std::size_t number)
{
    return std::string("R").append(std::to_string(number));
}

/// The notes of two cuts at 25 frames a second.
class Notes {
public:
    Notes(EventList oldList, EventList newList, int simplify = 0, const std::string& vfxPrefix = {})
        : Notes(std::move(oldList), std::move(newList), rulesOf(vfxPrefix), simplify)
    {
    }

    Notes(EventList oldList, EventList newList, const PictureRules& rules, int simplify = 0)
        : oldCut(std::move(oldList)), newCut(std::move(newList)), notes(oldCut, newCut, rules, simplify)
    {
    }

    std::vector<NoteStep> steps() const
    {
        std::vector<NoteStep> found;
        for (const ReelNotes& reel : notes.reels()) {
            for (const NoteEntry& entry : reel.entries) {
                if (entry.step() != nullptr)
                    found.push_back(*entry.step());
            }
        }
        return found;
    }

    static PictureRules rulesOf(const std::string& vfxPrefix)
    {
        PictureRules rules{Framerate(25, 0), MatchBy::RollName, {}};
        if (!vfxPrefix.empty())
            rules.versions.compile({{vfxPrefix, ""}});
        return rules;
    }

    const EventList oldCut;
    const EventList newCut;
    const ChangeNotes notes;
};

/// "delete 5 at 10: TailTrimmed -5" of each step.
std::string textOf(const PictureChange& change)
{
    static const char* const Words[] = {"head",           "tail",       "lifted",    "inserted",  "replaced",
                                        "moved",          "doubled",    "retimed",   "version",   "transition in",
                                        "transition out", "transition", "unchanged", "reel later"};
    return std::string(Words[static_cast<int>(change.kind)]) + " " + std::to_string(change.frames);
}

std::string textOf(const NoteStep& step)
{
    std::string text;
    switch (step.action) {
    case StepAction::Replace:
        text.append("-").append(std::to_string(step.removed));
        text.append(" +").append(std::to_string(step.inserted.length));
        break;
    case StepAction::Move:
        text = std::to_string(step.moved) + " from " + std::to_string(step.from.frame);
        break;
    case StepAction::Relabel:
        text = std::to_string(step.inserted.length) + " again";
        break;
    case StepAction::MoveReel:
        text = "reel";
        break;
    }
    text.append(" at ").append(std::to_string(step.place.frame)).append(":");
    for (const PictureChange& change : step.changes)
        text.append(" ").append(textOf(change)).append(";");
    return text;
}

std::vector<std::string> textOf(const std::vector<NoteStep>& steps)
{
    std::vector<std::string> texts;
    for (const NoteStep& step : steps)
        texts.push_back(textOf(step));
    return texts;
}

using Texts = std::vector<std::string>;

class ChangeNotesTest : public testing::Test {
    const TestProject m_project;
};

TEST_F(ChangeNotesTest, AShortenedTailIsOneStepThere)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 50}}), reelOf({{"A", 0, 80}, {"B", 0, 50}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-20 +0 at 80: tail -20;"});
}

TEST_F(ChangeNotesTest, ALengthenedHeadIsOneStepThere)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 30, 50}}), reelOf({{"A", 0, 100}, {"B", 20, 60}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-0 +10 at 100: head 10;"});
}

TEST_F(ChangeNotesTest, ARolledCutIsOneStepWithoutAChangeOfLength)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 30, 50}}), reelOf({{"A", 0, 109}, {"B", 39, 41}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-9 +9 at 100: tail 9; head -9;"});
    EXPECT_EQ(film.steps()[0].lengthChange(), 0);
}

TEST_F(ChangeNotesTest, AShotReplacedByOneOfEqualLengthIsOneChange)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 50}, {"C", 0, 10}}),
                     reelOf({{"A", 0, 100}, {"X", 0, 50}, {"C", 0, 10}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-50 +50 at 100: replaced 50;"});
}

TEST_F(ChangeNotesTest, AShotReplacedByALongerOneIsALiftAndAnInsertInOneStep)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 50}, {"C", 0, 10}}),
                     reelOf({{"A", 0, 100}, {"X", 0, 51}, {"C", 0, 10}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-50 +51 at 100: lifted 50; inserted 51;"});
}

TEST_F(ChangeNotesTest, AShotCutIntoAnotherIsOneInsert)
{
    const Notes film(reelOf({{"A", 0, 100}}), reelOf({{"A", 0, 40}, {"X", 0, 25}, {"A", 40, 60}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-0 +25 at 40: inserted 25;"});
}

TEST_F(ChangeNotesTest, APartOutOfTheMiddleOfAShotIsALift)
{
    const Notes film(reelOf({{"A", 0, 100}}), reelOf({{"A", 0, 40}, {"A", 60, 40}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-20 +0 at 40: lifted 20;"});
    EXPECT_TRUE(film.steps()[0].changes[0].isPart);
}

TEST_F(ChangeNotesTest, AnAddEditIsNoStep)
{
    const Notes film(reelOf({{"A", 0, 100}}), reelOf({{"A", 0, 40}, {"A", 40, 60}}));

    EXPECT_TRUE(film.steps().empty());
}

TEST_F(ChangeNotesTest, AShotThatMovesForwardIsOneStepWithItsNewPlaceFirst)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 50}, {"C", 0, 30}}),
                     reelOf({{"A", 0, 100}, {"C", 0, 30}, {"B", 0, 50}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"30 from 150 at 100: moved 30;"});
}

TEST_F(ChangeNotesTest, ALongerShotStaysAndTheShorterMovesBehindIt)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 30}, {"C", 0, 50}}),
                     reelOf({{"A", 0, 100}, {"C", 0, 50}, {"B", 0, 30}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"30 from 100 at 150: moved 30;"});
}

TEST_F(ChangeNotesTest, ASceneMovesAsOneAndIsTrimmedAtItsNewPlace)
{
    const Notes film(reelOf({{"A", 0, 500}, {"B", 0, 50}, {"C", 0, 50}, {"D", 0, 50}}),
                     reelOf({{"B", 0, 50}, {"C", 0, 40}, {"D", 0, 50}, {"A", 0, 500}}));

    EXPECT_EQ(textOf(film.steps()), (Texts{"150 from 500 at 0: moved 150;", "-10 +0 at 90: tail -10;"}));
}

TEST_F(ChangeNotesTest, AShotMovesOutFromBetweenShotsThatGoInOneStepAndTheyGoInAnother)
{
    const Notes film(reelOf({{"A", 0, 100}, {"X", 0, 8}, {"B", 0, 30}, {"Y", 0, 9}, {"C", 0, 50}}),
                     reelOf({{"A", 0, 100}, {"C", 0, 50}, {"B", 0, 30}}));

    EXPECT_EQ(textOf(film.steps()), (Texts{"30 from 108 at 167: moved 30;", "-17 +0 at 100: lifted 8; lifted 9;"}));
}

TEST_F(ChangeNotesTest, WhatGoesBeforeAShotThatMovesOutGoesFirst)
{
    const Notes film(reelOf({{"A", 0, 100}, {"X", 0, 8}, {"B", 0, 30}, {"C", 0, 50}}),
                     reelOf({{"A", 0, 100}, {"C", 0, 50}, {"B", 0, 30}}));

    EXPECT_EQ(textOf(film.steps()), (Texts{"-8 +0 at 100: lifted 8;", "30 from 100 at 150: moved 30;"}));
}

TEST_F(ChangeNotesTest, OldShotsGoInTheStepThatInsertsNewOnes)
{
    const Notes film(reelOf({{"A", 0, 100}, {"X", 0, 8}, {"C", 0, 50}, {"B", 0, 30}}),
                     reelOf({{"A", 0, 100}, {"B", 0, 30}, {"N", 0, 9}, {"C", 0, 50}}));

    EXPECT_EQ(textOf(film.steps()), (Texts{"30 from 158 at 100: moved 30;", "-8 +9 at 130: lifted 8; inserted 9;"}));
}

TEST_F(ChangeNotesTest, ADoubledShotTellsWhereItStandsAsWell)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 50}}), reelOf({{"A", 0, 100}, {"B", 0, 50}, {"A", 20, 30}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-0 +30 at 150: doubled 30;"});
    ASSERT_EQ(film.steps()[0].doubledFrom.size(), 1U);
    EXPECT_EQ(film.steps()[0].doubledFrom[0], (WorkPlace{0, 20, Hour}));
}

TEST_F(ChangeNotesTest, AnotherSpeedIsARetime)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 50}, {"C", 0, 10}}),
                     reelOf({{"A", 0, 100}, {"B", 0, 25, 50}, {"C", 0, 10}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-50 +25 at 100: retimed 25;"});
}

PictureRules byClip()
{
    return {Framerate(25, 0), MatchBy::ClipName, {}};
}

TEST_F(ChangeNotesTest, AnotherClipOfTheSameRollAtAnotherSpeedIsALiftAndAnInsertWhereClipsAreMatched)
{
    const EventList oldCut =
        reelOf({{"AX", 0, 100, -1, 0, "ONE"}, {"AX", 500, 50, -1, 0, "TWO"}, {"AX", 900, 10, -1, 0, "END"}});
    const EventList newCut =
        reelOf({{"AX", 0, 100, -1, 0, "ONE"}, {"AX", 500, 25, 50, 0, "NEW"}, {"AX", 900, 10, -1, 0, "END"}});
    const Notes film(oldCut, newCut, byClip());

    EXPECT_EQ(textOf(film.steps()), Texts{"-50 +25 at 100: lifted 50; inserted 25;"});
    EXPECT_EQ(textOf(Notes(oldCut, newCut).steps()), Texts{"-50 +25 at 100: retimed 25;"});
}

TEST_F(ChangeNotesTest, TheSameClipOfAnotherRollAtAnotherSpeedIsARetimeWhereClipsAreMatched)
{
    const EventList oldCut =
        reelOf({{"R1", 0, 100, -1, 0, "ONE"}, {"R2", 0, 50, -1, 0, "TWO"}, {"R3", 0, 10, -1, 0, "END"}});
    const EventList newCut =
        reelOf({{"R1", 0, 100, -1, 0, "ONE"}, {"R9", 0, 25, 50, 0, "TWO"}, {"R3", 0, 10, -1, 0, "END"}});
    const Notes film(oldCut, newCut, byClip());

    EXPECT_EQ(textOf(film.steps()), Texts{"-50 +25 at 100: retimed 25;"});
    EXPECT_EQ(textOf(Notes(oldCut, newCut).steps()), Texts{"-50 +25 at 100: lifted 50; inserted 25;"});
}

TEST_F(ChangeNotesTest, AnotherSpeedOfANewVersionIsARetime)
{
    const EventList oldCut = reelOf({{"A", 0, 100}, {"VFX_1", 0, 50}, {"C", 0, 10}});
    const EventList newCut = reelOf({{"A", 0, 100}, {"VFX_2", 0, 25, 50}, {"C", 0, 10}});

    EXPECT_EQ(textOf(Notes(oldCut, newCut, 0, "VFX_").steps()), Texts{"-50 +25 at 100: retimed 25;"});
    EXPECT_EQ(textOf(Notes(oldCut, newCut).steps()), Texts{"-50 +25 at 100: lifted 50; inserted 25;"});
}

/// The reel with one of its shots played backwards.
EventList withReversed(EventList reel, std::size_t shot)
{
    reel.at(shot).setReversed(true);
    return reel;
}

TEST_F(ChangeNotesTest, AShotThatIsPlayedBackwardsNowIsARetime)
{
    const std::vector<Shot> shots{{"A", 0, 100}, {"B", 0, 50}, {"C", 0, 10}};
    const Notes film(reelOf(shots), withReversed(reelOf(shots), 1));

    EXPECT_EQ(textOf(film.steps()), Texts{"-50 +50 at 100: retimed 50;"});
    EXPECT_TRUE(Notes(withReversed(reelOf(shots), 1), withReversed(reelOf(shots), 1)).steps().empty());
}

TEST_F(ChangeNotesTest, AReversedShotIsTrimmedAtItsHeadWhereItsSourceEndsEarlier)
{
    const Notes film(withReversed(reelOf({{"A", 0, 100}, {"B", 0, 50}, {"C", 0, 10}}), 1),
                     withReversed(reelOf({{"A", 0, 100}, {"B", 0, 40}, {"C", 0, 10}}), 1));

    EXPECT_EQ(textOf(film.steps()), Texts{"-10 +0 at 100: head -10;"});
}

TEST_F(ChangeNotesTest, AnotherVersionOfAVfxShotIsAStepThatMovesNothing)
{
    const Notes film(reelOf({{"A", 0, 100}, {"VFX_1", 0, 50}}), reelOf({{"A", 0, 100}, {"VFX_2", 0, 50}}), 0, "VFX_");

    EXPECT_EQ(textOf(film.steps()), Texts{"50 again at 100: version 50;"});
}

TEST_F(ChangeNotesTest, ADissolveInThePlaceOfACutIsOneChange)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 50}}), reelOf({{"A", 0, 100}, {"B", 0, 50, -1, 12}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-12 +12 at 100: transition in 12;"});
}

TEST_F(ChangeNotesTest, AShorterDissolveAtTheSameCentreIsOneChange)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 90, -1, 48}}), reelOf({{"A", 0, 112}, {"B", 12, 78, -1, 24}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-48 +48 at 100: transition 24;"});
}

TEST_F(ChangeNotesTest, TheShotsOfANewDissolveMeetInItsMiddle)
{
    // A loses 40 frames and is followed by a dissolve of 12, which B begins 6 frames earlier for.
    const Notes film(reelOf({{"A", 0, 100}, {"B", 20, 50}}), reelOf({{"A", 0, 54}, {"B", 14, 56, -1, 12}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-52 +12 at 54: transition in 12; tail -40;"});
}

/// A cut between two shots at `cut`, or a dissolve into the second one that begins there.
EventList rolledTo(int cut, int dissolve)
{
    return reelOf({{"A", 0, cut}, {"B", cut, 200 - cut, -1, dissolve}});
}

TEST_F(ChangeNotesTest, ADissolveThatDoesNotReachTheOldCutTellsTheRollToo)
{
    const auto changes = [](int cut, int oldDissolve, int newDissolve) {
        return textOf(Notes(rolledTo(100, oldDissolve), rolledTo(cut, newDissolve)).steps());
    };

    // Of 16 frames, its middle is 8 frames after its start.
    EXPECT_EQ(changes(100, 0, 16), Texts{"-16 +16 at 100: transition in 16;"});
    EXPECT_EQ(changes(101, 0, 16), Texts{"-17 +17 at 100: transition in 16; tail 9; head -9;"});
    EXPECT_EQ(changes(150, 0, 16), Texts{"-66 +66 at 100: transition in 16; tail 58; head -58;"});
    EXPECT_EQ(changes(84, 0, 16), Texts{"-16 +16 at 84: transition in 16;"});
    EXPECT_EQ(changes(83, 0, 16), Texts{"-17 +17 at 83: transition in 16; tail -9; head 9;"});
    // Of 15 it is 7 frames after it.
    EXPECT_EQ(changes(85, 0, 15), Texts{"-15 +15 at 85: transition in 15;"});
    EXPECT_EQ(changes(84, 0, 15), Texts{"-16 +16 at 84: transition in 15; tail -9; head 9;"});
}

TEST_F(ChangeNotesTest, ADissolveThatGoesOrChangesItsLengthTellsARollThatIsLongerThanItsHalf)
{
    const auto changes = [](int cut, int oldDissolve, int newDissolve) {
        return textOf(Notes(rolledTo(100, oldDissolve), rolledTo(cut, newDissolve)).steps());
    };

    EXPECT_EQ(changes(116, 16, 0), Texts{"-16 +16 at 100: transition out 0;"});
    EXPECT_EQ(changes(117, 16, 0), Texts{"-17 +17 at 100: transition out 0; tail 9; head -9;"});
    // From 108 to 116, and one more.
    EXPECT_EQ(changes(112, 16, 8), Texts{"-20 +20 at 100: transition 8;"});
    EXPECT_EQ(changes(113, 16, 8), Texts{"-21 +21 at 100: transition 8; tail 9; head -9;"});
}

TEST_F(ChangeNotesTest, AFreezeWithADissolveThatChangesItsLengthIsATrim)
{
    for (const int srcLength : {0, 1}) {
        const auto cut = [srcLength](int length) {
            return reelOf({{"A", 0, 100}, {"F", 7, length, srcLength, 16}, {"B", 0, 50}});
        };

        EXPECT_EQ(textOf(Notes(cut(60), cut(40)).steps()), Texts{"-20 +0 at 140: tail -20;"}) << srcLength;
        EXPECT_EQ(textOf(Notes(cut(17), cut(48)).steps()), Texts{"-0 +31 at 117: tail 31;"}) << srcLength;
    }
    // A shot that runs isn't the freeze of its first frame.
    EXPECT_EQ(
        textOf(
            Notes(reelOf({{"A", 0, 100}, {"F", 7, 60, 1, 16}}), reelOf({{"A", 0, 100}, {"F", 7, 60, -1, 16}})).steps())
            .size(),
        1U);
}

TEST_F(ChangeNotesTest, AShortShotAtASpeedOfItsOwnThatIsTrimmedKeepsItsSpeed)
{
    const auto trimmed = [](const Shot& was, const Shot& is) {
        return textOf(
            Notes(reelOf({{"A", 0, 100}, was, {"B", 0, 50}}), reelOf({{"A", 0, 100}, is, {"B", 0, 50}})).steps());
    };

    // The source is cut at whole frames: 11.5 are 12.
    EXPECT_EQ(trimmed({"S", 0, 24, 12}, {"S", 0, 23, 12}), Texts{"-1 +0 at 123: tail -1;"});
    EXPECT_EQ(trimmed({"S", 0, 48, 12}, {"S", 0, 46, 12}), Texts{"-2 +0 at 146: tail -2;"});
    EXPECT_EQ(trimmed({"S", 0, 20, 30}, {"S", 0, 19, 29}), Texts{"-1 +0 at 119: tail -1;"});
    // Its end stays, so that its head is what is trimmed.
    EXPECT_EQ(trimmed({"S", 0, 24, 12}, {"S", 1, 23, 11}), Texts{"-1 +0 at 100: head -1;"});
    EXPECT_EQ(trimmed({"S", 0, 24, 12, 8}, {"S", 0, 23, 12, 8}), Texts{"-1 +0 at 123: tail -1;"});
    // A whole frame more is another speed.
    EXPECT_EQ(trimmed({"S", 0, 24, 12}, {"S", 0, 24, 13}), Texts{"-24 +24 at 100: retimed 24;"});
    EXPECT_EQ(trimmed({"S", 0, 24, 24}, {"S", 0, 23, 24}), Texts{"-24 +23 at 100: retimed 23;"});
}

TEST_F(ChangeNotesTest, AShotThatComesOrGoesHasItsHalfOfTheTransitionAfterIt)
{
    // 60 frames of N come before the dissolve, and 8 within its first half; C loses these 8.
    EXPECT_EQ(textOf(Notes(reelOf({{"A", 0, 100}, {"C", 20, 80}}),
                           reelOf({{"A", 0, 100}, {"N", 0, 60}, {"C", 20, 80, -1, 16}}))
                         .steps()),
              Texts{"-16 +76 at 100: transition in 16; inserted 68; head -8;"});
    EXPECT_EQ(textOf(Notes(reelOf({{"A", 0, 100}, {"N", 0, 60}, {"C", 20, 80, -1, 16}}),
                           reelOf({{"A", 0, 100}, {"C", 20, 80}}))
                         .steps()),
              Texts{"-76 +16 at 100: transition out 0; lifted 68; head 8;"});
    // 100 frames give way to 108.
    EXPECT_EQ(textOf(Notes(reelOf({{"A", 0, 50}, {"B", 0, 100}, {"C", 20, 80}}),
                           reelOf({{"A", 0, 50}, {"N", 0, 100}, {"C", 20, 80, -1, 16}}))
                         .steps()),
              Texts{"-116 +116 at 50: transition in 16; lifted 100; inserted 108; head -8;"});
}

TEST_F(ChangeNotesTest, AFreezeOfASourceFrameThatGetsLongerIsATrim)
{
    const Notes film(reelOf({{"A", 7, 17, 1}, {"B", 0, 50}}), reelOf({{"A", 7, 48, 1}, {"B", 0, 50}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-0 +31 at 17: tail 31;"});
}

TEST_F(ChangeNotesTest, AFreezeOfNoSourceFramesIsTheSameFreeze)
{
    const Notes film(reelOf({{"A", 7, 17, 1}, {"B", 0, 50}}), reelOf({{"A", 7, 17, 0}, {"B", 0, 50}}));

    EXPECT_TRUE(film.steps().empty());
}

TEST_F(ChangeNotesTest, TwoSourceFramesAreNoFreeze)
{
    const Notes film(reelOf({{"A", 7, 17, 2}, {"B", 0, 50}}), reelOf({{"A", 7, 48, 2}, {"B", 0, 50}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-17 +48 at 0: retimed 48;"});
}

TEST_F(ChangeNotesTest, ASourceFrameThatIsSeenOnceIsNoFreeze)
{
    // Frame 7 alone, and then frames 7 and 8.
    const Notes film(reelOf({{"A", 7, 1}, {"B", 0, 50}}), reelOf({{"A", 7, 2}, {"B", 0, 50}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-0 +1 at 1: tail 1;"});
}

TEST_F(ChangeNotesTest, AFreezeOfAnotherFrameIsNoRetime)
{
    const Notes film(reelOf({{"A", 7, 17, 1}, {"B", 0, 50}}), reelOf({{"A", 8, 20, 1}, {"B", 0, 50}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-17 +20 at 0: lifted 17; inserted 20;"});
}

TEST_F(ChangeNotesTest, AShotThatFreezesNowIsARetime)
{
    const Notes film(reelOf({{"A", 7, 17}, {"B", 0, 50}}), reelOf({{"A", 7, 17, 1}, {"B", 0, 50}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-17 +17 at 0: retimed 17;"});
}

TEST_F(ChangeNotesTest, AFreezeIsKeptAndItsEndIsTrimmed)
{
    const Notes film(reelOf({{"A", 0, 100, 0}, {"B", 0, 50}}), reelOf({{"A", 0, 72, 0}, {"B", 0, 50}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-28 +0 at 72: tail -28;"});
}

TEST_F(ChangeNotesTest, TheSecondUseOfAShotStaysTheSecondAlsoWhereItHasBecomeLonger)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 50}, {"A", 50, 30}, {"C", 0, 50}}),
                     reelOf({{"A", 0, 100}, {"B", 0, 50}, {"A", 50, 40}, {"C", 0, 50}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-0 +10 at 180: tail 10;"});
}

/// The frames of the source that new picture begins with.
std::vector<int> sourcesOf(const Notes& film)
{
    std::vector<int> sources;
    for (const NoteStep& step : film.steps()) {
        for (const PictureChange& change : step.changes) {
            if (const auto source = film.notes.sourceOf(change))
                sources.push_back(source->toFrameCount());
        }
    }
    return sources;
}

TEST_F(ChangeNotesTest, TheSourceOfAPartOfAShotIsThatOfThePart)
{
    // 40 frames of A come once more, and the 20 after them are new.
    EXPECT_EQ(sourcesOf(Notes(reelOf({{"A", 500, 40}}), reelOf({{"A", 500, 40}, {"A", 500, 60}}))),
              std::vector<int>{540});
    EXPECT_EQ(sourcesOf(Notes(reelOf({{"A", 500, 40}}), reelOf({{"A", 500, 40}, {"B", 700, 60}}))),
              std::vector<int>{700});
}

TEST_F(ChangeNotesTest, TheSourceOfAPartGoesOnAtTheSpeedOfTheShot)
{
    // B plays at half speed; its first 40 frames show 20 of the source.
    const Notes film(reelOf({{"B", 500, 40, 20}}), reelOf({{"B", 500, 40, 20}, {"B", 500, 60, 30}}));

    EXPECT_EQ(sourcesOf(film), std::vector<int>{520});
}

TEST_F(ChangeNotesTest, TheSourceOfAReversedPartIsItsEarliestFrame)
{
    EventList oldCut = reelOf({{"A", 500, 40}});
    EventList newCut = reelOf({{"A", 500, 40}, {"A", 480, 60}});
    for (const EventList* const list : {&oldCut, &newCut}) {
        for (const auto& event : list->events())
            event->setReversed(true);
    }

    // The second A plays from 540 down to 480; what is new of it are the frames from 500 down.
    EXPECT_EQ(sourcesOf(Notes(std::move(oldCut), std::move(newCut))), std::vector<int>{480});
}

TEST_F(ChangeNotesTest, OnlyNewPictureHasASource)
{
    EXPECT_EQ(sourcesOf(Notes(reelOf({{"A", 0, 100}, {"B", 0, 50}}), reelOf({{"A", 0, 80}, {"B", 0, 50}}))),
              std::vector<int>());
}

TEST_F(ChangeNotesTest, TrimsThatCancelOutWithinSoManyFramesAreOneStep)
{
    const EventList oldCut = reelOf({{"A", 0, 100}, {"B", 0, 40}, {"C", 10, 50}});
    const EventList newCut = reelOf({{"A", 0, 95}, {"B", 0, 40}, {"C", 5, 55}});

    EXPECT_EQ(Notes(oldCut, newCut, 39).steps().size(), 2U);
    const Notes film(oldCut, newCut, 40);
    EXPECT_EQ(textOf(film.steps()), Texts{"-45 +45 at 95: tail -5; unchanged 40; head 5;"});
    EXPECT_EQ(film.notes.joinedSteps(), 2U);
}

TEST_F(ChangeNotesTest, TrimsAroundANewVersionAreOneStepThatTellsTheVersion)
{
    const EventList oldCut = reelOf({{"A", 0, 100}, {"VFX_1", 0, 40}, {"C", 10, 50}});
    const EventList newCut = reelOf({{"A", 0, 95}, {"VFX_2", 0, 40}, {"C", 5, 55}});

    EXPECT_EQ(Notes(oldCut, newCut, 39, "VFX_").steps().size(), 3U);
    const Notes film(oldCut, newCut, 40, "VFX_");
    EXPECT_EQ(textOf(film.steps()), Texts{"-45 +45 at 95: tail -5; version 40; head 5;"});
    EXPECT_EQ(film.notes.joinedSteps(), 2U);
    EXPECT_EQ(film.steps()[0].changes[1].inOld, (FrameSpan{100, 40}));
    EXPECT_EQ(film.steps()[0].changes[1].inNew, (FrameSpan{95, 40}));
}

TEST_F(ChangeNotesTest, AJoinedStepTellsUnchangedShotsAroundANewVersion)
{
    const Notes film(
        reelOf({{"A", 0, 100}, {"B", 0, 20}, {"VFX_1", 0, 40}, {"D", 0, 8}, {"VFX_3", 90, 7}, {"C", 10, 50}}),
        reelOf({{"A", 0, 95}, {"B", 0, 20}, {"VFX_2", 0, 40}, {"D", 0, 8}, {"VFX_4", 90, 7}, {"C", 5, 55}}), 75,
        "VFX_");

    EXPECT_EQ(textOf(film.steps()),
              Texts{"-80 +80 at 95: tail -5; unchanged 20; version 40; unchanged 8; version 7; head 5;"});
    EXPECT_EQ(film.steps()[0].changes[3].inOld, (FrameSpan{160, 8}));
    EXPECT_EQ(film.steps()[0].changes[3].inNew, (FrameSpan{155, 8}));
}

TEST_F(ChangeNotesTest, ANewVersionAfterTheLastOfTheTrimsStaysAStep)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 40}, {"VFX_1", 10, 50}}),
                     reelOf({{"A", 0, 95}, {"B", 0, 40}, {"VFX_2", 5, 55}}), 40, "VFX_");

    EXPECT_EQ(textOf(film.steps()),
              (Texts{"-45 +45 at 95: tail -5; unchanged 40; head 5;", "50 again at 140: version 50;"}));
}

/// How many shots the step changes besides that of its change number `named`.
std::size_t othersOf(const NoteStep& step, std::size_t named)
{
    return otherShots(step, step.changes.at(named));
}

TEST_F(ChangeNotesTest, UnchangedShotsDontCountAsChanged)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 40}, {"C", 10, 50}}),
                     reelOf({{"A", 0, 95}, {"B", 0, 40}, {"C", 5, 55}}), 40);

    ASSERT_EQ(textOf(film.steps()), Texts{"-45 +45 at 95: tail -5; unchanged 40; head 5;"});
    EXPECT_EQ(othersOf(film.steps()[0], 0), 1U);
    EXPECT_EQ(othersOf(film.steps()[0], 2), 1U);
}

TEST_F(ChangeNotesTest, AShotThatWinsATransitionAndFramesIsOneShot)
{
    // The dissolve into B lies 6 frames on both sides of the old cut, and B begins 10 frames earlier than for it alone.
    const Notes film(reelOf({{"A", 0, 100}, {"B", 20, 50}}), reelOf({{"A", 0, 94}, {"B", 4, 66, -1, 12}}));

    ASSERT_EQ(textOf(film.steps()), Texts{"-6 +16 at 94: transition in 12; head 10;"});
    EXPECT_EQ(othersOf(film.steps()[0], 0), 0U);
    EXPECT_EQ(othersOf(film.steps()[0], 1), 0U);
}

TEST_F(ChangeNotesTest, AGapIsNoShot)
{
    EventList oldCut = reelOf({{"A", 0, 100}});
    oldCut.append(reelOf({{"B", 0, 50}}, Hour + 110));
    const Notes film(oldCut, reelOf({{"A", 0, 100}, {"B", 5, 45}}));

    ASSERT_EQ(textOf(film.steps()), Texts{"-15 +0 at 100: lifted 10; head -5;"});
    EXPECT_EQ(othersOf(film.steps()[0], 0), 1U);
    EXPECT_EQ(othersOf(film.steps()[0], 1), 0U);
}

TEST_F(ChangeNotesTest, ShotsThatGoAndShotsThatComeAreCountedEach)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 50}, {"C", 0, 20}, {"D", 0, 10}}),
                     reelOf({{"A", 0, 100}, {"X", 0, 51}, {"D", 0, 10}}));

    ASSERT_EQ(textOf(film.steps()), Texts{"-70 +51 at 100: lifted 50; lifted 20; inserted 51;"});
    for (const std::size_t named : {0U, 1U, 2U})
        EXPECT_EQ(othersOf(film.steps()[0], named), 2U);
}

TEST_F(ChangeNotesTest, AJoinedStepNamesWhatItReplacesByItself)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 40}, {"C", 7, 10}, {"D", 10, 50}}),
                     reelOf({{"A", 0, 95}, {"B", 0, 40}, {"C", 7, 10}, {"D", 5, 55}}), 50);

    const PictureChange unchanged = film.steps().at(0).changes.at(1);
    EXPECT_EQ(unchanged.kind, ChangeKind::Unchanged);
    EXPECT_EQ(unchanged.shots, 2);
    EXPECT_EQ(unchanged.oldShot->rollName(), "B");
    EXPECT_EQ(unchanged.newShot->rollName(), "B");
    EXPECT_EQ(unchanged.inOld, (FrameSpan{100, 50}));
    EXPECT_EQ(unchanged.inNew, (FrameSpan{95, 50}));
}

TEST_F(ChangeNotesTest, TheTotalsOfJoinedTrimsAreThoseOfTheirStep)
{
    const EventList oldCut = reelOf({{"A", 0, 100}, {"B", 0, 40}, {"C", 10, 50}});
    const EventList newCut = reelOf({{"A", 0, 95}, {"B", 0, 40}, {"C", 5, 55}});
    const NoteTotals apart = Notes(oldCut, newCut, 39).notes.totals();
    const NoteTotals joined = Notes(oldCut, newCut, 40).notes.totals();

    EXPECT_EQ(apart.kept, 185);
    EXPECT_EQ(apart.lifted, 5);
    EXPECT_EQ(apart.inserted, 5);
    EXPECT_EQ(joined.kept, 145);
    EXPECT_EQ(joined.lifted, 45);
    EXPECT_EQ(joined.inserted, 45);
    EXPECT_EQ(joined.steps, 1U);
}

TEST_F(ChangeNotesTest, TrimsThatLeaveAFrameAreNotJoined)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 40}, {"C", 10, 50}}),
                     reelOf({{"A", 0, 95}, {"B", 0, 40}, {"C", 6, 54}}), 1000);

    EXPECT_EQ(film.steps().size(), 2U);
}

TEST_F(ChangeNotesTest, AChangeInOneReelLeavesTheNextWhereItIs)
{
    EventList oldCut = reelOf({{"A", 0, 100}});
    oldCut.append(reelOf({{"B", 0, 100}, {"C", 0, 50}}, 2 * Hour));
    EventList newCut = reelOf({{"A", 0, 90}});
    newCut.append(reelOf({{"B", 0, 100}, {"X", 0, 7}, {"C", 0, 50}}, 2 * Hour));
    const Notes film(oldCut, newCut);

    ASSERT_EQ(film.notes.reels().size(), 2U);
    EXPECT_EQ(textOf(film.steps()), (Texts{"-10 +0 at 90: tail -10;", "-0 +7 at 100: inserted 7;"}));
    EXPECT_EQ(film.steps()[1].place.timecode(), 2 * Hour + 100);
    EXPECT_EQ(film.notes.reels()[1].entries.front().runningOffset, 0);
}

TEST_F(ChangeNotesTest, AMinuteWithoutPictureBeginsAReelAndAFrameLessDoesNot)
{
    EventList apart = reelOf({{"A", 0, 100}});
    apart.append(reelOf({{"B", 0, 100}}, Hour + 100 + 60 * 25));
    EventList together = reelOf({{"A", 0, 100}});
    together.append(reelOf({{"B", 0, 100}}, Hour + 100 + 60 * 25 - 1));

    EXPECT_EQ(Notes(apart, apart).notes.reels().size(), 2U);
    EXPECT_EQ(Notes(together, together).notes.reels().size(), 1U);
}

TEST_F(ChangeNotesTest, AShotThatGoesToAnotherReelIsTakenOutOfItsOwn)
{
    EventList oldCut = reelOf({{"A", 0, 100}, {"M", 0, 20}});
    oldCut.append(reelOf({{"B", 0, 100}}, 2 * Hour));
    EventList newCut = reelOf({{"A", 0, 100}});
    newCut.append(reelOf({{"B", 0, 100}, {"M", 0, 20}}, 2 * Hour));
    const Notes film(oldCut, newCut);

    const auto steps = film.steps();
    ASSERT_EQ(steps.size(), 1U);
    EXPECT_EQ(steps[0].from, (WorkPlace{0, 100, Hour}));
    EXPECT_EQ(steps[0].place, (WorkPlace{1, 100, 2 * Hour}));
    EXPECT_EQ(film.notes.reels()[0].entries.back().runningOffset, -20);
    EXPECT_EQ(film.notes.reels()[1].entries.back().runningOffset, 20);

    // The other reel tells of it, too.
    ASSERT_EQ(film.notes.reels()[1].entries.size(), 3U);
    const NoteEntry& entry = film.notes.reels()[1].entries[1];
    const MoveEnd* const end = entry.moveEnd();
    ASSERT_NE(end, nullptr);
    EXPECT_EQ(end->place, (WorkPlace{1, 100, 2 * Hour}));
    EXPECT_TRUE(end->isTarget);
    EXPECT_EQ(end->otherReel, 0U);
    EXPECT_EQ(end->step, 1U);
    EXPECT_EQ(end->move.frames, 20);
    EXPECT_EQ(entry.number, 0U);
    EXPECT_EQ(entry.lengthChange, 0);
    EXPECT_EQ(entry.runningOffset, 20);
}

TEST_F(ChangeNotesTest, AReelThatGivesAShotToAnEarlierOneTellsOfIt)
{
    EventList oldCut = reelOf({{"A", 0, 100}});
    oldCut.append(reelOf({{"B", 0, 100}, {"M", 0, 20}, {"C", 0, 50}}, 2 * Hour));
    EventList newCut = reelOf({{"A", 0, 100}, {"M", 0, 20}});
    newCut.append(reelOf({{"B", 0, 100}, {"C", 0, 50}}, 2 * Hour));
    const Notes film(oldCut, newCut);

    ASSERT_EQ(textOf(film.steps()), Texts{"20 from 100 at 100: moved 20;"});
    ASSERT_EQ(film.notes.reels()[1].entries.size(), 3U);
    const MoveEnd* const end = film.notes.reels()[1].entries[1].moveEnd();
    ASSERT_NE(end, nullptr);
    EXPECT_EQ(end->place, (WorkPlace{1, 100, 2 * Hour}));
    EXPECT_FALSE(end->isTarget);
    EXPECT_EQ(end->otherReel, 0U);
    EXPECT_EQ(end->step, 1U);
    EXPECT_EQ(film.notes.reels()[1].entries[0].runningOffset, -20);
    EXPECT_FALSE(film.notes.reels()[0].isUnchanged());
    EXPECT_FALSE(film.notes.reels()[1].isUnchanged());
}

TEST_F(ChangeNotesTest, AReelThatGivesAsMuchAsItGetsHasChanged)
{
    EventList oldCut = reelOf({{"A", 0, 100}, {"M", 0, 20}});
    oldCut.append(reelOf({{"N", 0, 20}, {"B", 0, 100}}, 2 * Hour));
    EventList newCut = reelOf({{"A", 0, 100}, {"N", 0, 20}});
    newCut.append(reelOf({{"M", 0, 20}, {"B", 0, 100}}, 2 * Hour));
    const Notes film(oldCut, newCut);

    const ReelNotes& other = film.notes.reels()[1];
    EXPECT_EQ(other.before, other.after);
    EXPECT_TRUE(std::none_of(other.entries.begin(), other.entries.end(),
                             [](const NoteEntry& entry) { return entry.step() != nullptr; }));
    EXPECT_FALSE(other.isUnchanged());
    EXPECT_TRUE(Notes(oldCut, oldCut).notes.reels()[1].isUnchanged());
}

TEST_F(ChangeNotesTest, AMoveWithinAReelHasNoOtherEnd)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 30}, {"C", 0, 50}}),
                     reelOf({{"A", 0, 100}, {"C", 0, 50}, {"B", 0, 30}}));

    ASSERT_EQ(film.steps().size(), 1U);
    for (const NoteEntry& entry : film.notes.reels()[0].entries)
        EXPECT_EQ(entry.moveEnd(), nullptr);
}

TEST_F(ChangeNotesTest, TheTotalsAreThoseOfTheSteps)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 30}, {"C", 0, 50}, {"D", 0, 8}}),
                     reelOf({{"A", 0, 100}, {"C", 0, 50}, {"B", 0, 30}, {"X", 0, 9}, {"A", 10, 5}}));
    const NoteTotals& totals = film.notes.totals();

    EXPECT_EQ(totals.before, 188);
    EXPECT_EQ(totals.after, 194);
    EXPECT_EQ(totals.kept, 180);
    EXPECT_EQ(totals.lifted, 8);
    EXPECT_EQ(totals.inserted, 9);
    EXPECT_EQ(totals.doubled, 5);
    EXPECT_EQ(totals.moved, 30);
    EXPECT_EQ(totals.steps, 2U);
}

TEST_F(ChangeNotesTest, TheTenLargestStepsComeWithTheLargestFirst)
{
    std::vector<Shot> oldShots;
    std::vector<Shot> newShots;
    for (int shot = 0; shot < 12; ++shot) {
        const std::string roll = rollOf(static_cast<std::size_t>(shot));
        oldShots.push_back({roll, 0, 100});
        newShots.push_back({roll, 0, 99 - shot});
    }
    const Notes film(reelOf(oldShots), reelOf(newShots));

    std::vector<std::int32_t> extents;
    for (const NoteEntry* const entry : film.notes.largestSteps())
        extents.push_back(extentOf(*entry->step()));

    EXPECT_EQ(extents, (std::vector<std::int32_t>{12, 11, 10, 9, 8, 7, 6, 5, 4, 3}));
}

TEST_F(ChangeNotesTest, WhatCantBeTrustedIsDoubted)
{
    EventList oldCut = reelOf({{"A", 0, 100}, {"", 0, 10}, {"B", 0, 10}, {"C", 0, 10}, {"D", 0, 10}});
    oldCut.at(2).setSrc(Timecode(50), Timecode(40));
    oldCut.at(3).addFlaw(EventFlaw::NotVideoEvent);
    oldCut.at(4).addFlaw(EventFlaw::RollNameInvalid);
    oldCut.add(eventOf({"E", 0, 5}, Hour + 10, 9));
    const Notes film(oldCut, oldCut);

    std::vector<std::pair<PictureDoubt, std::int32_t>> doubts;
    for (const DoubtfulEvent& doubtful : film.notes.oldCut().doubts())
        doubts.emplace_back(doubtful.doubt, doubtful.event);

    using enum PictureDoubt;
    const decltype(doubts) expected{{Covered, 0}, {Nameless, 1}, {Reversed, 2}, {NoPicture, 3}, {Flawed, 4}};
    EXPECT_EQ(doubts, expected);
    EXPECT_TRUE(film.steps().empty());
}

TEST_F(ChangeNotesTest, ATimecodeThatDoesNotExistIsNoReversedEvent)
{
    EventList cut = reelOf({{"A", 0, 100}, {"B", 0, 50}});
    cut.at(1).addFlaw(EventFlaw::TimecodeInvalid);
    cut.at(1).addFlaw(EventFlaw::TimecodeRangeInvalid);
    const Notes film(cut, cut);

    ASSERT_EQ(film.notes.oldCut().doubts().size(), 1U);
    EXPECT_EQ(film.notes.oldCut().doubts()[0].doubt, PictureDoubt::Flawed);
}

TEST_F(ChangeNotesTest, AReelThatBeginsElsewhereIsMovedThereFirst)
{
    // Leader comes before A, so that A stays where it was.
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 50}}), reelOf({{"L", 0, 200}, {"A", 0, 100}}, Hour - 200));

    EXPECT_EQ(textOf(film.steps()),
              (Texts{"reel at 0: reel later -200;", "-0 +200 at 0: inserted 200;", "-50 +0 at 300: lifted 50;"}));
    EXPECT_EQ(film.steps()[2].place.timecode(), Hour + 100);
    EXPECT_FALSE(film.notes.reels()[0].isUnchanged());
    EXPECT_EQ(film.notes.totals().moved, 0);
    EXPECT_EQ(film.notes.reels()[0].entries[0].number, 1U);
    EXPECT_EQ(film.notes.reels()[0].entries[0].runningOffset, 0);
}

TEST_F(ChangeNotesTest, AReelThatOnlyBeginsElsewhereHasOneStep)
{
    const std::vector<Shot> shots{{"A", 0, 100}, {"B", 0, 50}};

    EXPECT_EQ(textOf(Notes(reelOf(shots), reelOf(shots, 10 * Hour)).steps()),
              Texts{"reel at 0: reel later " + std::to_string(9 * Hour) + ";"});
}

TEST_F(ChangeNotesTest, AMoveFromALaterReelIsCountedFromItsOldStart)
{
    EventList oldCut = reelOf({{"A", 0, 100}});
    oldCut.append(reelOf({{"B", 0, 100}, {"M", 0, 20}, {"C", 0, 50}}, 2 * Hour));
    EventList newCut = reelOf({{"A", 0, 100}, {"M", 0, 20}}, Hour + 7);
    newCut.append(reelOf({{"B", 0, 100}, {"C", 0, 50}}, 3 * Hour));
    const Notes film(oldCut, newCut);

    ASSERT_EQ(textOf(film.steps()), (Texts{"reel at 0: reel later 7;", "20 from 100 at 100: moved 20;",
                                           "reel at 0: reel later " + std::to_string(Hour) + ";"}));
    EXPECT_EQ(film.steps()[1].from.timecode(), 2 * Hour + 100);
    EXPECT_EQ(film.steps()[1].place.timecode(), Hour + 107);
    EXPECT_EQ(film.notes.reels()[1].entries[2].moveEnd()->place.timecode(), 3 * Hour + 100);
}

constexpr int Minute = 1500;

/// "reel 2 to 125" of each step that moves a reel, in minutes, with a "~" where it is out of the way; a "." for any other one.
Texts movesOf(const Notes& film)
{
    Texts texts;
    for (const NoteStep& step : film.steps()) {
        if (step.action != StepAction::MoveReel)
            texts.emplace_back(".");
        else
            texts.push_back("reel " + std::to_string(step.place.reel + 1) + " to " +
                            std::to_string(step.place.timecode() / Minute) +
                            (step.changes.front().isOutOfTheWay ? "~" : ""));
    }
    return texts;
}

/// Reels that begin at these minutes.
EventList timelineOf(const std::vector<std::pair<int, std::vector<Shot>>>& reels)
{
    EventList film;
    for (const auto& [minute, shots] : reels)
        film.append(reelOf(shots, minute * Minute));
    return film;
}

TEST_F(ChangeNotesTest, ReelsThatGoLaterGoFromTheLastBeforeOneThatGrowsReachesThem)
{
    const std::vector<Shot> second{{"B", 0, 18 * Minute}};
    const std::vector<Shot> third{{"C", 0, 18 * Minute}};
    const Notes film(timelineOf({{60, {{"A", 0, 18 * Minute}}}, {80, second}, {100, third}}),
                     timelineOf({{60, {{"A", 0, 9 * Minute}, {"N", 0, 3 * Minute}, {"A", 9 * Minute, 9 * Minute}}},
                                 {85, second},
                                 {105, third}}));

    EXPECT_EQ(movesOf(film), (Texts{"reel 3 to 105", "reel 2 to 85", "."}));
    EXPECT_EQ(film.notes.reels()[0].entries.size(), 5U);
    EXPECT_EQ(film.notes.reels()[1].movedBy, 2U);
    EXPECT_EQ(film.notes.reels()[2].movedBy, 1U);
    EXPECT_FALSE(film.notes.reels()[1].isUnchanged());
}

TEST_F(ChangeNotesTest, AReelThatGoesEarlierWaitsUntilTheOneBeforeItHasShrunk)
{
    const std::vector<Shot> second{{"B", 0, 18 * Minute}};
    const Notes film(timelineOf({{60, {{"A", 0, 18 * Minute}}}, {80, second}}),
                     timelineOf({{60, {{"A", 0, 10 * Minute}}}, {72, second}}));

    EXPECT_EQ(movesOf(film), (Texts{".", "reel 2 to 72"}));
    EXPECT_EQ(film.notes.reels()[1].movedBy, 0U);
}

TEST_F(ChangeNotesTest, ReelsThatChangePlacesGoOverAFreeOne)
{
    const std::vector<Shot> first{{"A", 0, 4 * Minute}};
    const std::vector<Shot> second{{"B", 0, 6 * Minute}};
    const Notes film(timelineOf({{60, first}, {70, second}}), timelineOf({{60, second}, {70, first}}));

    // The last one ends at 76 minutes.
    EXPECT_EQ(movesOf(film), (Texts{"reel 2 to 80~", "reel 1 to 60", "reel 2 to 70"}));
    EXPECT_EQ(film.notes.reels()[0].asideSince, 0U);
    EXPECT_EQ(film.notes.reels()[1].asideSince, 1U);
    EXPECT_EQ(film.notes.reels()[1].movedBy, 0U);
}

TEST_F(ChangeNotesTest, AReelWaitsElsewhereWhileTheOneBeforeItIsLongerForAMoment)
{
    const std::vector<Shot> second{{"B", 0, 5 * Minute}};
    const std::vector<Shot> was{{"A", 0, 5 * Minute}, {"X", 0, 3 * Minute}};
    const std::vector<Shot> is{{"N", 0, 3 * Minute}, {"A", 0, 5 * Minute}};
    const Notes film(timelineOf({{60, was}, {70, second}}), timelineOf({{60, is}, {70, second}}));

    EXPECT_EQ(movesOf(film), (Texts{"reel 2 to 80~", ".", ".", "reel 2 to 70"}));
    // At 71 minutes it isn't in the way: reel 1 has 11 minutes between its steps.
    EXPECT_EQ(movesOf(Notes(timelineOf({{60, was}, {71, second}}), timelineOf({{60, is}, {71, second}}))),
              (Texts{".", "."}));
}

TEST_F(ChangeNotesTest, AReelOntoWhoseOldPlaceAnEarlierOneGoesIsMovedFirst)
{
    const std::vector<Shot> first{{"A", 0, 2 * Minute}};
    const std::vector<Shot> second{{"B", 0, 2 * Minute}};
    const Notes film(timelineOf({{60, first}, {70, second}}), timelineOf({{70, first}, {80, second}}));

    EXPECT_EQ(movesOf(film), (Texts{"reel 2 to 80", "reel 1 to 70"}));
    EXPECT_EQ(film.steps()[0].from.timecode(), 70 * Minute);
    EXPECT_EQ(film.notes.reels()[0].entries[0].number, 1U);
    EXPECT_EQ(film.notes.reels()[0].entries[1].number, 2U);
}

TEST_F(ChangeNotesTest, AReelThatIsGoneIsTakenOutBeforeALaterOneComesToItsPlace)
{
    const std::vector<Shot> last{{"C", 0, 2 * Minute}};
    const Notes film(timelineOf({{60, {{"A", 0, Minute}}}, {70, {{"B", 0, Minute}}}, {80, last}}),
                     timelineOf({{60, {{"A", 0, Minute}}}, {70, last}}));

    EXPECT_EQ(movesOf(film), (Texts{".", "reel 3 to 70"}));
}

TEST_F(ChangeNotesTest, AReelThatHasLostAllOfItsPictureIsNotMoved)
{
    const std::vector<Shot> second{{"B", 0, 8 * Minute}};
    const Notes film(timelineOf({{60, {{"A", 0, 9 * Minute}}}, {100, second}, {120, {{"C", 0, 9 * Minute}}}}),
                     timelineOf({{60, {{"A", 0, 9 * Minute}, {"C", 0, 9 * Minute}}}, {120, second}}));
    const Notes refilled(timelineOf({{60, {{"A", 0, 9 * Minute}}}, {120, {{"C", 0, 9 * Minute}}}}),
                         timelineOf({{60, {{"A", 0, 9 * Minute}, {"C", 0, 9 * Minute}}}, {130, second}}));

    EXPECT_EQ(movesOf(film), (Texts{".", "reel 2 to 120"}));
    EXPECT_EQ(movesOf(refilled), (Texts{".", "."}));
    EXPECT_EQ(refilled.steps()[1].place.timecode(), 130 * Minute);
}

TEST_F(ChangeNotesTest, ReelsThatBecomeOneAreNotMovedOutOfItsWay)
{
    const Shot a{"A", 0, 20 * Minute};
    const Shot b{"B", 0, 20 * Minute};
    const Shot c{"C", 0, 20 * Minute};
    const Notes apart(timelineOf({{60, {a}}, {90, {b}}, {120, {c}}}), timelineOf({{60, {a, b, c}}}));

    // With both, reel 1 ends where reel 3 began.
    EXPECT_EQ(movesOf(apart), (Texts{".", "."}));
}

TEST_F(ChangeNotesTest, TheSecondHalfOfAReelBecomesAReelInOneStep)
{
    const Shot a{"A", 0, 18 * Minute};
    const Shot b{"B", 0, 18 * Minute};
    const Notes film(timelineOf({{60, {a, b}}}), timelineOf({{60, {a}}, {80, {b}}}));

    EXPECT_EQ(movesOf(film), Texts{"."});
    EXPECT_FALSE(film.steps()[0].changes.front().isOutOfTheWay);
    EXPECT_EQ(film.notes.reels()[1].asideSince, 0U);
}

TEST_F(ChangeNotesTest, ANewReelWhosePlaceIsTakenGetsItsPictureAtAFreeOneAndSaysSo)
{
    const Shot a{"A", 0, 20 * Minute};
    const Shot b{"B", 0, 20 * Minute};
    const Shot c{"C", 0, 20 * Minute};
    const Notes film(timelineOf({{60, {a, b, c}}}), timelineOf({{60, {a}}, {90, {b}}, {130, {c}}}));

    // C reaches to 100 minutes when B is taken out, and the last reel ends at 150.
    EXPECT_EQ(movesOf(film), (Texts{".", ".", "reel 2 to 90"}));
    EXPECT_EQ(film.steps()[0].place.timecode(), 160 * Minute);
    EXPECT_TRUE(film.steps()[0].changes.front().isOutOfTheWay);
    EXPECT_EQ(film.steps()[1].place.timecode(), 130 * Minute);
    EXPECT_FALSE(film.steps()[1].changes.front().isOutOfTheWay);
    EXPECT_EQ(film.notes.reels()[1].asideSince, 1U);
    EXPECT_EQ(film.notes.reels()[2].asideSince, 0U);
    EXPECT_FALSE(film.notes.isOverfull());
}

/// A film of reels of one shot, each at its hour.
EventList reelsOf(const std::vector<std::pair<std::string, int>>& rollsAndHours)
{
    EventList film;
    for (const auto& [roll, hour] : rollsAndHours)
        film.append(reelOf({{roll, 0, 100}}, hour * Hour));
    return film;
}

/// "1 to 1", "gone 2", "new 3" of each pair of reels, counted from 1.
Texts pairsOf(const Notes& film)
{
    Texts texts;
    for (const ReelNotes& reel : film.notes.reels()) {
        const auto& [oldReel, newReel] = reel.pair;
        texts.push_back(!newReel   ? "gone " + std::to_string(*oldReel + 1)
                        : !oldReel ? "new " + std::to_string(*newReel + 1)
                                   : std::to_string(*oldReel + 1) + " to " + std::to_string(*newReel + 1));
    }
    return texts;
}

TEST_F(ChangeNotesTest, AReelThatIsGoneAndANewOneAtAnotherPlaceAreNoPair)
{
    EXPECT_EQ(pairsOf(Notes(reelsOf({{"A", 1}, {"X", 2}, {"B", 3}}), reelsOf({{"A", 1}, {"B", 3}, {"Y", 4}}))),
              (Texts{"1 to 1", "gone 2", "3 to 2", "new 3"}));
}

TEST_F(ChangeNotesTest, ReelsWithoutCommonPictureThatBeginAtTheSameTimeAreAPair)
{
    EXPECT_EQ(pairsOf(Notes(reelsOf({{"A", 1}, {"X", 2}}), reelsOf({{"Y", 2}, {"A", 3}}))),
              (Texts{"2 to 1", "1 to 2"}));
}

TEST_F(ChangeNotesTest, ReelsWithoutCommonPictureBetweenTheSameReelsArePairs)
{
    EXPECT_EQ(pairsOf(Notes(reelsOf({{"A", 1}, {"X", 2}, {"W", 4}, {"B", 6}}),
                            reelsOf({{"A", 1}, {"Y", 3}, {"Z", 5}, {"B", 6}}))),
              (Texts{"1 to 1", "2 to 2", "3 to 3", "4 to 4"}));
    // One more between them.
    EXPECT_EQ(
        pairsOf(Notes(reelsOf({{"A", 1}, {"X", 2}, {"B", 6}}), reelsOf({{"A", 1}, {"Y", 3}, {"Z", 5}, {"B", 6}}))),
        (Texts{"1 to 1", "gone 2", "new 2", "new 3", "3 to 4"}));
    EXPECT_EQ(pairsOf(Notes(reelsOf({{"X", 1}}), reelsOf({{"Y", 2}}))), Texts{"1 to 1"});
}

/// Shots with frames without picture between them; a roll of "" is a gap.
EventList withGaps(const std::vector<Shot>& shots)
{
    EventList events;
    int start = Hour;
    for (const Shot& shot : shots) {
        if (!shot.roll.empty())
            events.add(eventOf(shot, start, static_cast<unsigned>(events.size()) + 1));
        start += shot.length;
    }
    return events;
}

TEST_F(ChangeNotesTest, AGapWithinASceneMovesAlong)
{
    const Notes film(
        withGaps({{"A", 0, 500}, {"B", 0, 50}, {"", 0, 24}, {"C", 0, 50}, {"", 0, 12}, {"D", 0, 50}, {"E", 0, 300}}),
        withGaps({{"B", 0, 50}, {"", 0, 24}, {"C", 0, 50}, {"", 0, 12}, {"D", 0, 50}, {"A", 0, 500}, {"E", 0, 300}}));

    ASSERT_EQ(textOf(film.steps()), Texts{"186 from 500 at 0: moved 186;"});
    EXPECT_EQ(film.steps()[0].changes[0].shots, 3);
    EXPECT_EQ(film.notes.totals().lifted, 0);
}

TEST_F(ChangeNotesTest, AGapBeforeOrAfterAShotMovesAlong)
{
    EXPECT_EQ(textOf(Notes(withGaps({{"A", 0, 500}, {"B", 0, 90}, {"", 0, 24}, {"C", 0, 50}, {"D", 0, 80}}),
                           withGaps({{"A", 0, 500}, {"", 0, 24}, {"C", 0, 50}, {"B", 0, 90}, {"D", 0, 80}}))
                         .steps()),
              Texts{"74 from 590 at 500: moved 74;"});
    EXPECT_EQ(textOf(Notes(withGaps({{"A", 0, 500}, {"B", 0, 90}, {"C", 0, 50}, {"", 0, 24}, {"D", 0, 80}}),
                           withGaps({{"A", 0, 500}, {"C", 0, 50}, {"", 0, 24}, {"B", 0, 90}, {"D", 0, 80}}))
                         .steps()),
              Texts{"74 from 590 at 500: moved 74;"});
}

TEST_F(ChangeNotesTest, AGapOfAnotherLengthIsReplacedAtItsNewPlace)
{
    const Notes film(withGaps({{"A", 0, 500}, {"B", 0, 50}, {"", 0, 24}, {"C", 0, 50}, {"E", 0, 300}}),
                     withGaps({{"B", 0, 50}, {"", 0, 23}, {"C", 0, 50}, {"A", 0, 500}, {"E", 0, 300}}));

    EXPECT_EQ(textOf(film.steps()), (Texts{"124 from 500 at 0: moved 124;", "-24 +23 at 50: lifted 24; inserted 23;"}));
    EXPECT_EQ(film.steps()[0].changes[0].shots, 2);
}

TEST_F(ChangeNotesTest, DoubledPictureTellsHowManyShotsItIs)
{
    const Notes film(
        reelOf({{"A", 0, 100}, {"B", 0, 50}, {"C", 0, 40}, {"D", 0, 9}}),
        reelOf({{"A", 0, 100}, {"B", 0, 50}, {"C", 0, 40}, {"D", 0, 9}, {"A", 0, 100}, {"B", 0, 50}, {"C", 0, 40}}));

    ASSERT_EQ(textOf(film.steps()), Texts{"-0 +190 at 199: doubled 190;"});
    EXPECT_EQ(film.steps()[0].changes[0].shots, 3);
}

TEST_F(ChangeNotesTest, ADoubledShotOfAnotherVersionIsAChangeOfItsOwn)
{
    const Notes film(reelOf({{"A", 0, 100}, {"VFX_1", 0, 50}, {"C", 0, 40}, {"D", 0, 9}}),
                     reelOf({{"A", 0, 100},
                             {"VFX_1", 0, 50},
                             {"C", 0, 40},
                             {"D", 0, 9},
                             {"A", 0, 100},
                             {"VFX_2", 0, 50},
                             {"C", 0, 40}}),
                     0, "VFX_");

    ASSERT_EQ(textOf(film.steps()), Texts{"-0 +190 at 199: doubled 100; doubled 50; doubled 40;"});
    const auto doubledFrom = film.steps()[0].doubledFrom;
    EXPECT_EQ(doubledFrom, (std::vector<WorkPlace>{{0, 0, Hour}, {0, 100, Hour}, {0, 150, Hour}}));
    EXPECT_EQ(film.steps()[0].changes[1].oldShot->rollName(), "VFX_1");
    EXPECT_EQ(film.steps()[0].changes[1].newShot->rollName(), "VFX_2");
}

/// The transitions of a step's changes: "old", "new" or "old new" of each.
Texts transitionsOf(const Notes& film)
{
    Texts texts;
    for (const NoteStep& step : film.steps()) {
        for (const PictureChange& change : step.changes)
            texts.push_back(std::string(change.hasOldTransition ? "old" : "") + (change.hasNewTransition ? "new" : ""));
    }
    return texts;
}

TEST_F(ChangeNotesTest, AShotThatComesOrGoesWithItsDissolveTellsOfIt)
{
    const std::vector<Shot> without{{"A", 0, 100}, {"B", 0, 50}};
    const std::vector<Shot> with{{"A", 0, 100}, {"X", 0, 60, -1, 16}, {"B", 0, 50}};
    const Notes in(reelOf(without), reelOf(with));
    const Notes out(reelOf(with), reelOf(without));

    EXPECT_EQ(textOf(in.steps()), Texts{"-0 +60 at 100: inserted 60;"});
    EXPECT_EQ(transitionsOf(in), Texts{"new"});
    EXPECT_EQ(textOf(out.steps()), Texts{"-60 +0 at 100: lifted 60;"});
    EXPECT_EQ(transitionsOf(out), Texts{"old"});
}

TEST_F(ChangeNotesTest, AShotReplacedWithItsDissolveTellsOfBoth)
{
    const std::vector<Shot> cut{{"A", 0, 100}, {"X", 0, 60}, {"B", 0, 50}};
    const std::vector<Shot> dissolve{{"A", 0, 100}, {"Y", 0, 60, -1, 16}, {"B", 0, 50}};
    const std::vector<Shot> longer{{"A", 0, 100}, {"Z", 0, 60, -1, 24}, {"B", 0, 50}};

    EXPECT_EQ(transitionsOf(Notes(reelOf(cut), reelOf(dissolve))), Texts{"new"});
    EXPECT_EQ(transitionsOf(Notes(reelOf(dissolve), reelOf(cut))), Texts{"old"});
    EXPECT_EQ(transitionsOf(Notes(reelOf(dissolve), reelOf(longer))), Texts{"oldnew"});
    EXPECT_EQ(textOf(Notes(reelOf(dissolve), reelOf(longer)).steps()), Texts{"-60 +60 at 100: replaced 60;"});
}

TEST_F(ChangeNotesTest, ADissolveThatIsRemovedIsThatOfTheShotThatHadIt)
{
    // C came out of B by a dissolve, and goes after D with a cut.
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 90}, {"C", 0, 80, -1, 16}, {"D", 0, 500}}),
                     reelOf({{"A", 0, 100}, {"B", 0, 90}, {"D", 0, 500}, {"C", 0, 80}}));

    // B ends 8 frames earlier and C begins 8 frames later than in the middle of the dissolve, and then 16 earlier.
    ASSERT_EQ(textOf(film.steps()), (Texts{"-16 +0 at 190: transition out 0; tail -8; head -8;",
                                           "64 from 190 at 690: moved 64;", "-0 +16 at 690: head 16;"}));
    const auto changes = film.steps()[0].changes;
    EXPECT_EQ(changes[0].oldShot->rollName(), "C");
    EXPECT_EQ(changes[0].newShot->rollName(), "C");
    EXPECT_EQ(changes[1].newShot->rollName(), "B");
    EXPECT_EQ(changes[2].oldShot->rollName(), "C");
}

TEST_F(ChangeNotesTest, AShotThatIsNotInADissolveIsNotTrimmedByIt)
{
    // B goes, out of which C came by a dissolve. 8 of its frames were in the first half of that.
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 90}, {"C", 0, 80, -1, 16}, {"D", 0, 50}}),
                     reelOf({{"A", 0, 100}, {"C", 16, 64}, {"D", 0, 50}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-106 +0 at 100: transition out 0; lifted 98; head -8;"});
}

TEST_F(ChangeNotesTest, ADissolveOfTheSameLengthAtALaterPlaceTellsTheTrims)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 90, -1, 24}}), reelOf({{"A", 0, 112}, {"B", 12, 78, -1, 24}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-36 +36 at 100: transition 24; tail 12; head -12;"});
}

TEST_F(ChangeNotesTest, ADissolveOfOneLineIsComparedWithItsOutgoingShot)
{
    const Notes film(reelOf({{"A", 0, 100}, {"B", 0, 90, -1, 24}}), reelOf({{"C", 0, 100}, {"B", 0, 90, -1, 24}}));

    EXPECT_EQ(film.notes.totals().kept, 66);
    EXPECT_EQ(textOf(film.steps()), Texts{"-124 +124 at 0: transition 24; replaced 112;"});
}

TEST_F(ChangeNotesTest, TwoEmptyListsHaveNothingToTell)
{
    const Notes film{EventList(), EventList()};

    EXPECT_TRUE(film.notes.reels().empty());
    EXPECT_TRUE(film.notes.largestSteps().empty());
}

TEST_F(ChangeNotesTest, AnEmptyCutBecomesAFilmInOneInsert)
{
    const Notes film(EventList(), reelOf({{"A", 0, 100}, {"B", 0, 50}}));

    EXPECT_EQ(textOf(film.steps()), Texts{"-0 +150 at 0: inserted 100; inserted 50;"});
}

/// The fewest moves that bring shots in this order, looked for in all choices of what stays; of those the fewest frames.
std::pair<int, int> fewestMoves(const std::vector<std::size_t>& order, const std::vector<int>& lengths)
{
    std::pair<int, int> fewest{1000, 0};
    for (unsigned choice = 0; choice < 1U << order.size(); ++choice) {
        std::pair<int, int> moves{0, 0};
        std::size_t next = 0;
        bool rises = true;
        for (std::size_t place = 0; place < order.size(); ++place) {
            if ((choice >> place & 1U) == 0) {
                ++moves.first;
                moves.second += lengths[order[place]];
                continue;
            }
            rises = rises && order[place] >= next;
            next = order[place];
        }
        if (rises)
            fewest = std::min(fewest, moves);
    }
    return fewest;
}

RC_GTEST_PROP(ChangeNotesLaw, NoChoiceOfWhatStaysHasFewerMovesOrFrames, ())
{
    const auto count = *rc::gen::inRange<std::size_t>(1, 8);
    const auto lengths = *rc::gen::container<std::vector<int>>(count, rc::gen::inRange(1, 20));
    std::vector<std::size_t> order(count);
    std::iota(order.begin(), order.end(), std::size_t{0});
    for (std::size_t place = count - 1; place > 0; --place)
        std::swap(order[place], order[*rc::gen::inRange<std::size_t>(0, place + 1)]);
    // Neighbours that stay together are one shot here, since they move as one.
    for (std::size_t place = 1; place < count; ++place)
        RC_PRE(order[place] != order[place - 1] + 1);
    const TestProject project;
    std::vector<Shot> oldShots;
    std::vector<Shot> newShots;
    for (std::size_t shot = 0; shot < count; ++shot)
        oldShots.push_back({rollOf(shot), 0, lengths[shot]});
    for (const std::size_t shot : order)
        newShots.push_back(oldShots[shot]);

    const Notes film(reelOf(oldShots), reelOf(newShots));

    const auto [moves, frames] = fewestMoves(order, lengths);
    RC_ASSERT(film.notes.totals().steps == static_cast<std::size_t>(moves));
    RC_ASSERT(film.notes.totals().moved == frames);
}

} // namespace
} // namespace cadrel::tests
