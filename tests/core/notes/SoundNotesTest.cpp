// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/SoundNotes.h"

#include "core/edl/EventBase.h"
#include "core/notes/ChangeNotes.h"
#include "core/notes/StepPlaces.h"
#include "tests/core/notes/RandomRecut.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using namespace core;

constexpr int Rate = 25;
constexpr int Hour = 3600 * Rate;

/// So many seconds of a roll.
struct Shot {
    std::string roll;
    int srcIn;
    int length;
};

EventList cutOf(const std::vector<Shot>& shots)
{
    EventList events;
    int place = Hour;
    for (const Shot& shot : shots) {
        auto event = std::make_shared<EventBase>();
        event->setRollName(shot.roll);
        event->setTimecodes(Timecode(shot.srcIn * Rate), Timecode((shot.srcIn + shot.length) * Rate), Timecode(place),
                            Timecode(place + shot.length * Rate));
        events.add(event);
        place += shot.length * Rate;
    }
    return events;
}

/// Change notes of two small cuts that begin at 01:00:00:00.
class Recut {
public:
    Recut(const std::vector<Shot>& oldShots, const std::vector<Shot>& newShots)
        : m_oldCut(cutOf(oldShots)), m_newCut(cutOf(newShots)), notes(m_oldCut, m_newCut, {m_project.framerate, 0, {}})
    {
    }

private:
    const TestProject m_project{Framerate(Rate, 0)};
    const EventList m_oldCut;
    const EventList m_newCut;

public:
    const ChangeNotes notes;
};

/// Seconds from 01:00:00:00.
SecondsRange at(double start, double end)
{
    return {3600 + start, 3600 + end};
}

//     old   |-- A 10 --|-- B 10 --|-- C 12 --|-- D 10 --|
//     new   |-- A 10 --|- B 7 -|-- X 5 --|-- D 10 --|-- C 12 --|
const std::vector<Shot> Before{{"A", 100, 10}, {"B", 200, 10}, {"C", 300, 12}, {"D", 400, 10}};
const std::vector<Shot> After{{"A", 100, 10}, {"B", 200, 7}, {"X", 500, 5}, {"D", 400, 10}, {"C", 300, 12}};

TEST(StepPlaces, FindsTheStepThatTakesPictureAway)
{
    const Recut recut({{"A", 100, 10}, {"B", 200, 10}, {"C", 300, 10}}, {{"A", 100, 8}, {"B", 200, 10}, {"C", 303, 7}});
    const StepPlaces places(recut.notes);
    ASSERT_EQ(recut.notes.totals().steps, 2U);

    EXPECT_EQ(places.stepAtOld(at(8, 10)), 1U);
    EXPECT_EQ(places.stepAtOld(at(9, 9.5)), 1U);
    EXPECT_EQ(places.stepAtOld(at(20, 23)), 2U);
    EXPECT_EQ(places.stepAtOld(at(14, 15)), 0U);
    EXPECT_EQ(places.stepAtOld(at(11, 12)), 1U);    // a second after
    EXPECT_EQ(places.stepAtOld(at(11.02, 12)), 0U); // farther
    EXPECT_FALSE(places.hasMoves());
}

TEST(StepPlaces, FindsTheInsertThatCutsSoundApart)
{
    const Recut recut({{"A", 100, 10}, {"B", 200, 10}}, {{"A", 100, 10}, {"X", 500, 5}, {"B", 200, 10}});
    const StepPlaces places(recut.notes);

    EXPECT_EQ(places.stepAtOld(at(10, 10)), 1U);
    EXPECT_EQ(places.stepAtNew(at(12, 13)), 1U);
    EXPECT_EQ(places.stepAtNew(at(10, 10)), 1U);
    EXPECT_EQ(places.stepAtNew(at(15, 15)), 1U);
    EXPECT_EQ(places.stepAtNew(at(17, 17)), 0U);
    // The frames on both sides of it, in the old cut.
    EXPECT_EQ(places.inOld(1), (std::vector{at(9.96, 10), at(10, 10.04)}));
}

TEST(StepPlaces, FindsBothEndsOfWhatIsMovedAndItsNewPlace)
{
    const Recut recut({{"A", 100, 10}, {"B", 200, 5}, {"C", 300, 10}}, {{"B", 200, 5}, {"A", 100, 10}, {"C", 300, 10}});
    const StepPlaces places(recut.notes);
    ASSERT_EQ(recut.notes.totals().steps, 1U);

    EXPECT_TRUE(places.hasMoves());
    EXPECT_EQ(places.inOld(1), (std::vector{at(10, 15)}));
    for (const double end : {10.0, 15.0})
        EXPECT_EQ(places.stepAtOld(at(end, end)), 1U) << end;
    for (const double end : {0.0, 5.0, 15.0})
        EXPECT_EQ(places.stepAtNew(at(end, end)), 1U) << end;
    EXPECT_EQ(places.moveOf(at(9.99, 0).start), 0U);
    EXPECT_EQ(places.moveOf(at(10, 0).start), 1U);
    EXPECT_EQ(places.moveOf(at(14.99, 0).start), 1U);
    EXPECT_EQ(places.moveOf(at(15, 0).start), 0U);
}

TEST(SoundNotes, TellsEachChangeAtTheStepThatCausesIt)
{
    const Recut recut(Before, After);
    // B loses its tail and X comes in; then D moves to before C.
    ASSERT_EQ(recut.notes.totals().steps, 2U);
    SoundFacts facts;
    facts.changes = {{SoundChangeKind::Split, 1, "wind", {}, false, at(12, 28), at(17, 20), {}},
                     {SoundChangeKind::TailTrimmed, 0, "line", {}, false, at(11, 18), at(17, 18), {}},
                     {SoundChangeKind::Split, 1, "river", {}, false, at(25, 35), at(32, 32), {}},
                     {SoundChangeKind::Doubled, 0, "far away", {}, false, at(1, 2), {}, at(3, 4)},
                     {SoundChangeKind::FellOut, 0, "step", {}, false, at(18, 19), at(18, 19), {}}};
    facts.jumps = {{at(17, 17), {"FX"}}, {at(32, 32), {"DIA", "FX"}}};

    const SoundNotes sound(recut.notes, facts);

    ASSERT_EQ(sound.at(1).changes.size(), 3U);
    EXPECT_EQ(sound.at(1).changes[0].name, "line"); // by track and time
    EXPECT_EQ(sound.at(1).changes[1].name, "step");
    EXPECT_EQ(sound.at(1).changes[2].name, "wind");
    EXPECT_EQ(sound.at(1).tracks, (std::vector<std::size_t>{0, 1}));
    EXPECT_EQ(sound.at(1).count(SoundChangeKind::FellOut), 1U);
    ASSERT_EQ(sound.at(2).changes.size(), 1U);
    EXPECT_EQ(sound.at(2).changes[0].name, "river");
    ASSERT_EQ(sound.elsewhere().changes.size(), 1U);
    EXPECT_EQ(sound.elsewhere().changes[0].name, "far away");
    ASSERT_EQ(sound.at(1).jumps.size(), 1U);
    EXPECT_EQ(sound.at(1).jumps[0].tracks, std::vector<std::string>{"FX"});
    ASSERT_EQ(sound.at(2).jumps.size(), 1U);
    EXPECT_TRUE(sound.elsewhere().jumps.empty());
}

TEST(SoundNotes, CountsEachClipOnceThatAMoveTakesAlong)
{
    const Recut recut({{"A", 100, 10}, {"B", 200, 5}, {"C", 300, 10}}, {{"B", 200, 5}, {"A", 100, 10}, {"C", 300, 10}});
    SoundFacts facts;
    facts.carried = {{3, 0, at(9, 10)},  // stays
                     {3, 0, at(10, 12)}, // the same clip moves with B,
                     {3, 0, at(13, 15)}, // in two pieces
                     {5, 1, at(11, 12)},
                     {5, 2, at(15, 16)}};

    const SoundNotes sound(recut.notes, facts);

    EXPECT_EQ(sound.at(1).movedClips, 2U);
    EXPECT_EQ(sound.at(1).tracks, (std::vector<std::size_t>{3, 5}));
    EXPECT_FALSE(sound.at(1).isEmpty());
    EXPECT_TRUE(sound.elsewhere().isEmpty());
}

TEST(SoundNotes, NamesTheScenesThatHaveSomethingOfTheOldPicture)
{
    const Recut recut({{"A", 100, 10}, {"B", 200, 10}, {"C", 300, 10}, {"D", 400, 10}},
                      {{"A", 100, 8}, {"B", 200, 10}, {"C", 300, 10}, {"X", 500, 4}, {"D", 400, 10}});
    ASSERT_EQ(recut.notes.totals().steps, 2U);
    SoundFacts facts;
    facts.scenes = {
        {"4", at(30, 40)}, {"1", at(0, 8)}, {"all of the reel", at(0, 40)}, {"2", at(8, 15)}, {"3", at(15, 30)}};

    const SoundNotes sound(recut.notes, facts);

    EXPECT_EQ(sound.at(1).scenes, (std::vector<std::string>{"all of the reel", "2"}));
    EXPECT_EQ(sound.at(2).scenes, (std::vector<std::string>{"all of the reel", "3", "4"}));
    EXPECT_TRUE(sound.at(1).isEmpty());
}

TEST(SoundNotes, HasNothingToTellOfNoSound)
{
    const Recut recut(Before, After);

    const SoundNotes sound(recut.notes, {});

    for (std::size_t step = 0; step <= recut.notes.totals().steps; ++step) {
        EXPECT_TRUE(sound.at(step).isEmpty());
        EXPECT_TRUE(sound.at(step).scenes.empty());
    }
}

/// Each frame of a film that one of its steps takes away, with the number of the step. Timecodes of reels may lie on top of
/// each other, so only films of one reel are asked.
RC_GTEST_PROP(SoundNotesLaw, WhatAStepTakesAwayBelongsToIt, ())
{
    const auto seed = *genRecutSeed();
    const RandomRecut film(seed);
    const TestProject project(film.rules.framerate);
    const ChangeNotes notes(film.oldCut, film.newCut, film.rules);
    RC_PRE(notes.oldCut().reels().size() <= 1U && notes.newCut().reels().size() <= 1U);
    const StepPlaces places(notes);

    for (const ReelNotes& reel : notes.reels()) {
        for (const NoteEntry& entry : reel.entries) {
            if (entry.step() == nullptr || entry.step()->action != StepAction::Replace)
                continue;
            for (const FrameSpan& span : entry.step()->removedFrames) {
                const double start = notes.oldTimecode(span.start) / film.rules.framerate.rate;
                RC_ASSERT(places.stepAtOld({start, start + span.length / film.rules.framerate.rate}) == entry.number);
            }
            if (entry.step()->inserted.length > 0) {
                const FrameSpan& span = entry.step()->inserted;
                const double start = notes.newTimecode(span.start) / film.rules.framerate.rate;
                RC_ASSERT(places.stepAtNew({start, start + span.length / film.rules.framerate.rate}) == entry.number);
            }
        }
    }
}

RC_GTEST_PROP(SoundNotesLaw, EachChangeOfTheSoundIsToldOnce, ())
{
    const auto seed = *genRecutSeed();
    const RandomRecut film(seed);
    const TestProject project(film.rules.framerate);
    const ChangeNotes notes(film.oldCut, film.newCut, film.rules);
    SoundFacts facts;
    const auto places = *rc::gen::container<std::vector<std::pair<int, int>>>(
        rc::gen::pair(rc::gen::inRange(0, 100000), rc::gen::inRange(0, 200)));
    for (const auto& [start, length] : places) {
        const SecondsRange range{start / 10.0, (start + length) / 10.0};
        facts.changes.push_back({length % 2 == 0 ? SoundChangeKind::Split : SoundChangeKind::Doubled,
                                 0,
                                 std::to_string(facts.changes.size()),
                                 {},
                                 false,
                                 range,
                                 range,
                                 std::nullopt});
        if (length % 2 != 0)
            facts.changes.back().now = range;
    }

    const SoundNotes sound(notes, facts);

    std::vector<int> told(facts.changes.size(), 0);
    for (std::size_t step = 0; step <= notes.totals().steps; ++step) {
        for (const SoundChange& change : sound.at(step).changes)
            ++told.at(static_cast<std::size_t>(std::stoi(change.name)));
    }
    for (const int times : told)
        RC_ASSERT(times == 1);
}

} // namespace
} // namespace cadrel::tests
