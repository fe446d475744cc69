// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"
#include "core/notes/ChangeNotes.h"
#include "core/notes/KeptStretches.h"
#include "core/notes/StepChanges.h"
#include "core/notes/StepMaker.h"
#include "tests/core/notes/NotesPlayer.h"
#include "tests/core/notes/RandomRecut.h"
#include "tests/support/TreePaths.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <filesystem>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using namespace core;

/// The steps from one list to the other, with the trims joined that cancel out within `simplify` frames.
StepList stepsBetween(const EventList& oldCut, const EventList& newCut, const PictureRules& rules, int simplify = 0)
{
    TextNumbers numbers;
    const Programme oldProgramme(oldCut, rules, numbers);
    const Programme newProgramme(newCut, rules, numbers);
    StepList list =
        makeSteps(oldProgramme, newProgramme, findKeptStretches(oldProgramme, newProgramme), rules.framerate);
    for (auto& rows : list.rows)
        joinTrims(rows, simplify, StepChanges(oldProgramme, newProgramme));
    return list;
}

std::size_t countSteps(const StepList& list)
{
    std::size_t count = 0;
    for (const auto& rows : list.rows)
        count += static_cast<std::size_t>(std::count_if(
            rows.begin(), rows.end(), [](const NoteRow& row) { return std::holds_alternative<NoteStep>(row); }));
    return count;
}

/// Whether the picture of a move between reels stands at its other end, or, of a place that it has gone from, is in the other
/// reel by then.
bool isToldRightly(const MoveEnd& end, const std::vector<NoteStep>& movesSoFar, const NotesPlayer& player)
{
    const auto move = std::find_if(movesSoFar.begin(), movesSoFar.end(), [&end](const NoteStep& step) {
        return step.changes.front().inOld == end.move.inOld;
    });
    if (move == movesSoFar.end() || end.move.inNew != move->changes.front().inNew)
        return false;
    if (!end.isTarget)
        return move->from.reel == end.place.reel && move->place.reel == end.otherReel;
    return move->place.reel == end.place.reel && move->from.reel == end.otherReel &&
           player.showsAt(end.place, end.move.inNew->start);
}

/// Carries all steps out. Empty when that gives the new cut, and when each step is told about; else what is wrong.
std::string playAll(const EventList& oldCut, const EventList& newCut, const PictureRules& rules, const StepList& list)
{
    NotesPlayer player(oldCut, newCut, rules, list.reels);
    std::vector<NoteStep> moves; // between reels
    std::size_t ends = 0;
    for (const auto& rows : list.rows) {
        for (const NoteRow& row : rows) {
            if (const auto* const end = std::get_if<MoveEnd>(&row)) {
                ++ends;
                if (!isToldRightly(*end, moves, player))
                    return "the other end of a move is wrong";
            }
            const auto* const step = std::get_if<NoteStep>(&row);
            if (step == nullptr)
                continue;
            if (step->action == StepAction::Move && step->from.reel != step->place.reel)
                moves.push_back(*step);
            if (step->changes.empty())
                return "a step tells of no change";
            if (step->action == StepAction::Replace && !player.isDoneBefore(step->place))
                return "what lies before a step isn't done";
            std::size_t doubled = 0;
            for (const PictureChange& change : step->changes) {
                if (change.kind == ChangeKind::Doubled &&
                    !player.showsAt(step->doubledFrom.at(doubled++), change.inNew->start))
                    return "what is doubled stands elsewhere";
            }
            player.carryOut(*step);
        }
    }
    return ends == moves.size() ? player.difference() : "a move between reels has no other end, or two";
}

/// One event for each reel, of so many frames at a frame of the day.
EventList reelsOf(const std::vector<std::pair<int, int>>& startsAndLengths)
{
    EventList events;
    for (const auto& [start, length] : startsAndLengths) {
        auto event = std::make_shared<EventBase>();
        event->setRollName(std::string("R").append(std::to_string(events.size())));
        event->setTimecodes(Timecode(0), Timecode(length), Timecode(start), Timecode(start + length));
        events.add(event);
    }
    return events;
}

/// Moves all of a reel from one frame of the day to another.
NoteStep shiftOf(std::size_t reel, int from, int to)
{
    NoteStep step;
    step.action = StepAction::MoveReel;
    step.from = {reel, 0, from};
    step.place = {reel, 0, to};
    step.changes.resize(1);
    step.changes[0].frames = to - from;
    return step;
}

TEST(NotesPlayer, RefusesAStepThatLaysOneReelOnAnother)
{
    const TestProject project(Framerate(25, 0));
    const EventList cut = reelsOf({{90000, 100}, {92000, 100}});
    const PictureRules rules{project.framerate, MatchBy::RollName, {}};
    NoteStep insert;
    insert.place = {0, 100, 90000};
    insert.inserted = {0, 1};
    const NoteStep shift = shiftOf(0, 90000, 91900);
    NotesPlayer player(cut, cut, rules, {{0, 0}, {1, 1}});

    EXPECT_NO_THROW(player.carryOut(shift));
    insert.place.reelStart = 91900;
    EXPECT_THROW(player.carryOut(insert), std::logic_error);
}

TEST(NotesPlayer, RefusesToMoveAReelWithoutPicture)
{
    const TestProject project(Framerate(25, 0));
    const PictureRules rules{project.framerate, MatchBy::RollName, {}};
    NoteStep empty;
    empty.place = {0, 0, 90000};
    const NoteStep shift = shiftOf(0, 90000, 91900);
    for (const int left : {0, 1}) {
        NotesPlayer player(reelsOf({{90000, 100}}), reelsOf({{90000, 100}}), rules, {{0, 0}});
        empty.removed = 100 - left;
        player.carryOut(empty);
        if (left == 0)
            EXPECT_THROW(player.carryOut(shift), std::logic_error);
        else
            EXPECT_NO_THROW(player.carryOut(shift));
    }
}

RC_GTEST_PROP(NotesLaw, TheStepsTurnTheOldCutIntoTheNewOne, ())
{
    const auto seed = *genRecutSeed();
    const RandomRecut film(seed);
    const TestProject project(film.rules.framerate);

    const StepList list = stepsBetween(film.oldCut, film.newCut, film.rules);

    const std::string wrong = playAll(film.oldCut, film.newCut, film.rules, list);
    RC_LOG() << wrong;
    RC_ASSERT(wrong.empty());
}

RC_GTEST_PROP(NotesLaw, JoinedTrimsTurnTheOldCutIntoTheNewOneToo, ())
{
    const auto seed = *genRecutSeed();
    const int simplify = *rc::gen::inRange(1, 400);
    const RandomRecut film(seed);
    const TestProject project(film.rules.framerate);

    const StepList list = stepsBetween(film.oldCut, film.newCut, film.rules, simplify);

    const std::string wrong = playAll(film.oldCut, film.newCut, film.rules, list);
    RC_LOG() << wrong;
    RC_ASSERT(wrong.empty());
    RC_ASSERT(countSteps(list) <= countSteps(stepsBetween(film.oldCut, film.newCut, film.rules)));
}

RC_GTEST_PROP(NotesLaw, OnOneTimelineNoReelLiesOnAnotherAtAnyMoment, ())
{
    const RandomTimeline film(*rc::gen::arbitrary<std::uint64_t>());
    const TestProject project(film.rules.framerate);

    const std::string wrong =
        playAll(film.oldCut, film.newCut, film.rules, stepsBetween(film.oldCut, film.newCut, film.rules));

    RC_LOG() << wrong;
    RC_ASSERT(wrong.empty());
}

std::size_t countMovesOfReels(const StepList& list)
{
    std::size_t count = 0;
    for (const auto& rows : list.rows)
        count += static_cast<std::size_t>(std::count_if(rows.begin(), rows.end(), [](const NoteRow& row) {
            const auto* const step = std::get_if<NoteStep>(&row);
            return step != nullptr && step->action == StepAction::MoveReel;
        }));
    return count;
}

/// Carries the steps out with each reel moved right before its own steps, and only if it has picture that begins elsewhere in
/// the new cut. How many reels are moved then; nothing where one reel lies on another.
std::optional<std::size_t> movesOnTheirTurns(const RandomTimeline& film, const StepList& list)
{
    NotesPlayer player(film.oldCut, film.newCut, film.rules, list.reels);
    const std::vector<SeenReel> newReels = framesOf(film.newCut, film.rules);
    const auto goalOf = [&](std::size_t reel, int otherwise) {
        const auto& newReel = list.reels[reel].newReel;
        return newReel ? newReels.at(*newReel).start : otherwise;
    };
    std::size_t moves = 0;
    try {
        for (std::size_t reel = 0; reel < list.reels.size(); ++reel) {
            const int goal = goalOf(reel, -1);
            const int start = player.timecodeAt({reel, 0, goal});
            if (goal >= 0 && start != goal) {
                player.carryOut(shiftOf(reel, start, goal));
                ++moves;
            }
            for (const NoteRow& row : list.rows[reel]) {
                const auto* const step = std::get_if<NoteStep>(&row);
                if (step == nullptr || step->action == StepAction::MoveReel)
                    continue;
                NoteStep onItsTurn = *step;
                onItsTurn.place.reelStart = goalOf(step->place.reel, step->place.reelStart);
                player.carryOut(onItsTurn);
            }
        }
    } catch (const std::logic_error&) {
        return std::nullopt;
    }
    return moves;
}

RC_GTEST_PROP(NotesLaw, NoReelIsMovedNeedlessly, ())
{
    const RandomTimeline film(*rc::gen::arbitrary<std::uint64_t>());
    const TestProject project(film.rules.framerate);

    const StepList list = stepsBetween(film.oldCut, film.newCut, film.rules);

    const auto moves = movesOnTheirTurns(film, list);
    RC_CLASSIFY(!moves, "reels in each other's way");
    RC_CLASSIFY(moves == 0U, "no reel moves");
    if (moves)
        RC_ASSERT(countMovesOfReels(list) == *moves);
}

RC_GTEST_PROP(NotesLaw, OnOneTimelineTheOffsetsEndInTheChangeOfLength, ())
{
    const RandomTimeline film(*rc::gen::arbitrary<std::uint64_t>());
    const TestProject project(film.rules.framerate);

    const ChangeNotes notes(film.oldCut, film.newCut, film.rules);

    for (const ReelNotes& reel : notes.reels())
        RC_ASSERT(reel.entries.empty() || reel.entries.back().runningOffset == reel.after - reel.before);
}

RC_GTEST_PROP(NotesLaw, ACutHasNoStepsToItself, ())
{
    const auto seed = *genRecutSeed();
    const RandomRecut film(seed);
    const TestProject project(film.rules.framerate);

    RC_ASSERT(countSteps(stepsBetween(film.oldCut, film.oldCut, film.rules)) == 0U);
    RC_ASSERT(countSteps(stepsBetween(film.newCut, film.newCut, film.rules)) == 0U);
}

RC_GTEST_PROP(NotesLaw, TheTotalsAreThoseOfTheSteps, ())
{
    const auto seed = *genRecutSeed();
    const int simplify = *rc::gen::inRange(0, 400);
    const RandomRecut film(seed);
    const TestProject project(film.rules.framerate);

    const ChangeNotes notes(film.oldCut, film.newCut, film.rules, simplify);

    NoteTotals sum;
    for (const ReelNotes& reel : notes.reels()) {
        for (const NoteEntry& entry : reel.entries) {
            if (const NoteStep* const step = entry.step()) {
                ++sum.steps;
                sum.lifted += step->removed;
                sum.inserted += step->action == StepAction::Replace ? step->inserted.length : 0;
                sum.moved += step->moved;
            }
        }
    }
    RC_ASSERT(notes.totals().steps == sum.steps);
    RC_ASSERT(notes.totals().lifted == sum.lifted);
    RC_ASSERT(notes.totals().inserted + notes.totals().doubled == sum.inserted);
    RC_ASSERT(notes.totals().moved == sum.moved);
}

RC_GTEST_PROP(NotesLaw, TheOffsetsEndInTheChangeOfLength, ())
{
    const auto seed = *genRecutSeed();
    const int simplify = *rc::gen::inRange(0, 400);
    const RandomRecut film(seed);
    const TestProject project(film.rules.framerate);

    const ChangeNotes notes(film.oldCut, film.newCut, film.rules, simplify);

    const NoteTotals& totals = notes.totals();
    RC_ASSERT(totals.kept + totals.lifted == totals.before);
    RC_ASSERT(totals.kept + totals.doubled + totals.inserted == totals.after);
    for (const ReelNotes& reel : notes.reels()) {
        if (!reel.entries.empty())
            RC_ASSERT(reel.entries.back().runningOffset == reel.after - reel.before);
    }
}

/// A timecode that isn't that of the place at its step, or nothing.
std::string wrongTimecode(const NotesPlayer& player, const NoteEntry& entry)
{
    std::vector<WorkPlace> places;
    if (const MoveEnd* const end = entry.moveEnd())
        places = {end->place};
    if (const NoteStep* const step = entry.step()) {
        places = step->doubledFrom;
        if (step->action != StepAction::MoveReel)
            places.push_back(step->place);
        if (step->action == StepAction::Move || step->action == StepAction::MoveReel)
            places.push_back(step->from);
    }
    for (const WorkPlace& place : places) {
        if (place.timecode() != player.timecodeAt(place))
            return "reel " + std::to_string(place.reel) + ", frame " + std::to_string(place.frame) + " is at " +
                   std::to_string(player.timecodeAt(place)) + " and not " + std::to_string(place.timecode());
    }
    return {};
}

template <typename Film>
void lookAtTimecodes(const Film& film)
{
    const TestProject project(film.rules.framerate);
    const ChangeNotes notes(film.oldCut, film.newCut, film.rules);
    std::vector<ReelChange> reels;
    for (const ReelNotes& reel : notes.reels())
        reels.push_back(reel.pair);
    NotesPlayer player(film.oldCut, film.newCut, film.rules, reels);

    for (std::size_t reel = 0; reel < reels.size(); ++reel) {
        for (const NoteEntry& entry : notes.reels()[reel].entries) {
            const std::string wrong = wrongTimecode(player, entry);
            RC_LOG() << wrong;
            RC_ASSERT(wrong.empty());
            if (entry.step() != nullptr)
                player.carryOut(*entry.step());
        }
    }
    RC_ASSERT(player.difference().empty());
}

RC_GTEST_PROP(NotesLaw, TheTimecodesAreThoseOfTheProgrammeSoFar, ())
{
    lookAtTimecodes(RandomRecut(*genRecutSeed()));
    lookAtTimecodes(RandomTimeline(*rc::gen::arbitrary<std::uint64_t>()));
}

/// The EDLs of the tree.
std::vector<std::string> edlsOfTheTree()
{
    std::vector<std::string> files;
    for (const char* const folder : {"tests/data/edl", "examples/reel3"}) {
        for (const auto& entry : std::filesystem::directory_iterator(treePath(folder))) {
            if (entry.path().extension() == ".edl" || entry.path().extension() == ".txt")
                files.push_back(entry.path().string());
        }
    }
    std::sort(files.begin(), files.end());
    return files;
}

EventList loaded(const std::string& file)
{
    EventList events;
    events.load(std::filesystem::path(file).wstring(), false);
    return events;
}

/// The rules at the rate of the project.
PictureRules plainRules(const TestProject& project)
{
    return {project.framerate, MatchBy::RollName, {}};
}

TEST(NotesOfRealEdls, NoEdlHasAStepToItself)
{
    const auto files = edlsOfTheTree();
    ASSERT_GT(files.size(), 30U);

    for (const std::string& file : files) {
        const TestProject project(Framerate(30, 0));
        const EventList events = loaded(file);

        EXPECT_EQ(countSteps(stepsBetween(events, events, plainRules(project))), 0U) << file;
    }
}

TEST(NotesOfRealEdls, EachEdlBecomesEachOther)
{
    const TestProject project(Framerate(30, 0));
    const PictureRules rules = plainRules(project);
    std::vector<EventList> lists;
    for (const std::string& file : edlsOfTheTree())
        lists.push_back(loaded(file));

    for (std::size_t from = 0; from < lists.size(); ++from) {
        for (std::size_t to = 0; to < lists.size(); ++to)
            EXPECT_EQ(playAll(lists[from], lists[to], rules, stepsBetween(lists[from], lists[to], rules)), "")
                << edlsOfTheTree()[from] << " to " << edlsOfTheTree()[to];
    }
}

TEST(NotesOfRealEdls, EachEdlBecomesARecutOfItself)
{
    const TestProject project(Framerate(30, 0));
    const PictureRules rules = plainRules(project);
    for (const std::string& file : edlsOfTheTree()) {
        const EventList events = loaded(file);
        for (std::uint64_t seed = 1; seed <= 5; ++seed) {
            const EventList recut = recutOf(events, rules.framerate, seed);

            for (const int simplify : {0, 100})
                EXPECT_EQ(playAll(events, recut, rules, stepsBetween(events, recut, rules, simplify)), "")
                    << file << ", " << seed << ", " << simplify;
        }
    }
}

/// The example of two reels at its own rate, by the names of its clips.
class NotesOfTwoReels : public testing::Test {
protected:
    const TestProject project{Framerate(24, 0)};
    const PictureRules rules{project.framerate, MatchBy::ClipName, {}};
    const EventList oldCut = loaded(treePath("examples/tworeels/old.edl"));
    const EventList newCut = loaded(treePath("examples/tworeels/new.edl"));
};

TEST_F(NotesOfTwoReels, EachCutBecomesTheOther)
{
    const StepList there = stepsBetween(oldCut, newCut, rules);

    EXPECT_EQ(playAll(oldCut, newCut, rules, there), "");
    EXPECT_EQ(playAll(newCut, oldCut, rules, stepsBetween(newCut, oldCut, rules)), "");
    // GULL comes in, and DOOR loses its start; else nothing has changed in either reel.
    ASSERT_EQ(there.rows.size(), 2U);
    EXPECT_EQ(there.rows[0].size(), 3U);
    EXPECT_EQ(there.rows[1].size(), 3U);
    EXPECT_EQ(countSteps(there), 2U);
}

TEST_F(NotesOfTwoReels, EachCutBecomesARecutOfItself)
{
    for (const EventList* const cut : {&oldCut, &newCut}) {
        EXPECT_EQ(countSteps(stepsBetween(*cut, *cut, rules)), 0U);
        for (std::uint64_t seed = 1; seed <= 50; ++seed) {
            const EventList recut = recutOf(*cut, rules.framerate, seed);
            for (const int simplify : {0, 100})
                EXPECT_EQ(playAll(*cut, recut, rules, stepsBetween(*cut, recut, rules, simplify)), "")
                    << seed << ", " << simplify;
        }
    }
}

} // namespace
} // namespace cadrel::tests
