// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/ApplyNotes.h"
#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/settings/Settings.h"
#include "host/track/TrackRole.h"
#include "standin/project/MediaClip.h"
#include "standin/project/Track.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

namespace cadrel::app {
namespace {

using core::SecondsRange;
using core::SoundChange;
using core::SoundChangeKind;
using core::StepSound;
using core::Timecode;
using host::TrackRole;
using standin::Track;
using Velmark::TypeWord;
using Texts = std::vector<std::string>;

constexpr int Rate = 25;
constexpr double Hour = 3600.0;

/// A shot of so many seconds; the next stands right after it.
struct Shot {
    const char* roll;
    int srcIn;
    int length;
};

void fill(core::EventList& cut, const std::vector<Shot>& shots)
{
    int start = 3600 * Rate;
    for (const auto& [roll, srcIn, length] : shots) {
        auto event = std::make_shared<core::EventBase>();
        event->setRollName(roll);
        event->setEventNumber(static_cast<unsigned>(cut.size()) + 1);
        event->setTimecodes(Timecode(srcIn * Rate), Timecode((srcIn + length) * Rate), Timecode(start),
                            Timecode(start + length * Rate));
        cut.add(event);
        start += length * Rate;
    }
}

Placement clip(const char16_t* name, double start, double end)
{
    Placement placement;
    placement.name = name;
    placement.start = start;
    placement.end = end;
    return placement;
}

Placement marker(Placement::Kind kind, const std::u16string& name, double start, double end)
{
    Placement placement{kind, nullptr, name, {}, start, end, 0.0};
    return placement;
}

/// What lay there, with the stretches of it that are left: from where in it to where, and how much later they are now.
struct Left {
    double from;
    double to;
    double shift;
};

Fate fate(const Placement& before, const std::vector<Left>& left)
{
    Fate fate{before, {}, 0.0, 0.0, 0.0, false, false, false};
    for (const auto& [from, to, shift] : left) {
        Piece piece{before, from, shift};
        piece.now.start = before.start + from + shift;
        piece.now.end = before.start + to + shift;
        fate.pieces.push_back(piece);
        fate.isMoved = fate.isMoved || shift != 0.0;
    }
    if (!left.empty()) {
        fate.lostAtStart = left.front().from;
        fate.lostAtEnd = before.length() - left.back().to;
    }
    fate.isSplit = left.size() > 1;
    return fate;
}

/// A run of two cuts at 25 frames a second, from 01:00:00:00. The project's clock begins there.
///
///     old cut   |-- A 10 --|-- B 10 --|-- C 10 --|
///     new cut   |-- A 10 --|- B 8 -|-- C 10 --|          one step: B has lost 18 to 20
class SoundOfARun : public testing::Test {
protected:
    SoundOfARun() : m_origin(m_host.setClock(Hour)), facts(model)
    {
        facts.timeOrigin = m_origin;
        facts.cuts = Cuts();
        fill(model.oldEdl(), {{"A", 100, 10}, {"B", 200, 10}, {"C", 300, 10}});
        fill(model.newEdl(), {{"A", 100, 10}, {"B", 200, 8}, {"C", 300, 10}});
    }

    /// A track with what became of what lay on it.
    TrackComparison& track(const char* kind, const char16_t* name, std::vector<Fate> fates = {},
                           Velmark::IProjectNode* folder = nullptr)
    {
        m_nodes.push_back(m_host.addTrack(kind, name, folder));
        auto& laid = dynamic_cast<Track&>(*m_nodes.back());
        return facts.tracks.emplace_back(TrackComparison{&laid, std::move(fates), {}});
    }

    /// A marker track of the runs, with a range that this run has made.
    void marked(TrackRole::Type role, const std::u16string& name, double start, double end)
    {
        TrackComparison& made = track(TypeWord::Marker, u"made");
        m_nodes.back()->setAttribute(Velmark::AttributeKey::MarkerType, Velmark::FVariant::integer(role), true);
        made.added.push_back(marker(Placement::Kind::Range, name, start, end));
    }

    /// The notes of the run; they live as long as the test.
    const NotesDocument& notes(const NotesLayout& layout = {})
    {
        facts.settings.emplace(model.settings(), GivenSettings(), true,
                               [](double seconds) { return std::to_string(seconds); });
        m_notes = std::make_unique<ApplyNotes>(facts, m_clock, layout);
        return m_notes->document();
    }
    const StepSound& step(std::size_t number) { return notes().sound->notes.at(number); }
    Texts remarks() { return notes().sound->remarks; }

private:
    const tests::TestProject m_project{core::Framerate(Rate, 0)};
    standin::tests::TestHost m_host;
    const double m_origin;
    std::vector<standin::tests::TestHost::Node> m_nodes;
    const ProjectClock m_clock{core::Framerate(Rate, 0), Hour};
    std::unique_ptr<ApplyNotes> m_notes;

protected:
    standin::tests::TestHost& host() { return m_host; }
    const standin::tests::TestHost::Node& lastTrack() const { return m_nodes.back(); }

    core::DataModel model;
    ApplyFacts facts;
};

TEST_F(SoundOfARun, IsToldInTheTimesOfTheClock)
{
    track(TypeWord::Audio, u"DIA", {fate(clip(u"line", 15, 25), {{0, 3, 0}, {5, 10, -2}})});

    ASSERT_EQ(step(1).changes.size(), 1U);
    const SoundChange change = step(1).changes[0];
    EXPECT_EQ(change.kind, SoundChangeKind::Split);
    EXPECT_EQ(change.track, 0U);
    EXPECT_EQ(change.name, "line");
    EXPECT_FALSE(change.isMarker);
    EXPECT_EQ(change.was, (SecondsRange{Hour + 15, Hour + 25}));
    EXPECT_EQ(change.lost, (SecondsRange{Hour + 18, Hour + 20}));
    EXPECT_FALSE(change.now);
    EXPECT_TRUE(notes().sound->notes.elsewhere().isEmpty());
}

TEST_F(SoundOfARun, WhatStaysOrOnlyMovesIsNotToldAtAStep)
{
    track(TypeWord::Audio, u"DIA",
          {fate(clip(u"stays", 1, 5), {{0, 4, 0}}), fate(clip(u"moves", 22, 25), {{0, 3, -2}})});

    EXPECT_TRUE(step(1).isEmpty());
    EXPECT_TRUE(notes().sound->notes.elsewhere().isEmpty());
    EXPECT_EQ(notes().sound->clips.all, 2U);
    EXPECT_EQ(notes().sound->clips.stay, 1U);
    EXPECT_EQ(notes().sound->clips.moved, 1U);
}

TEST_F(SoundOfARun, WhatIsNewIsToldWhereItStandsNow)
{
    track(TypeWord::Audio, u"DIA").added.push_back(clip(u"fill", 17, 19));

    ASSERT_EQ(step(1).changes.size(), 1U);
    EXPECT_EQ(step(1).changes[0].kind, SoundChangeKind::Added);
    EXPECT_EQ(step(1).changes[0].now, (SecondsRange{Hour + 17, Hour + 19}));
}

TEST_F(SoundOfARun, AClipWithoutANameHasThatOfItsMedia)
{
    const standin::MediaClip& media = host().addMedia(u"boom.wav", 100.0);
    Placement nameless = clip(u"", 18, 20);
    nameless.clip = &media;
    Placement named = clip(u"line", 18.5, 19.5);
    named.clip = &media;
    track(TypeWord::Audio, u"DIA", {fate(nameless, {}), fate(named, {}), fate(clip(u"", 19, 20), {})});

    ASSERT_EQ(step(1).changes.size(), 3U);
    EXPECT_EQ(step(1).changes[0].name, "boom");
    EXPECT_EQ(step(1).changes[1].name, "line");
    EXPECT_EQ(step(1).changes[2].name, "");
}

TEST_F(SoundOfARun, APartAndAMarkerAreToldAsSuch)
{
    Placement inPart = clip(u"door", 18, 19);
    inPart.part = u"foley";
    track(TypeWord::Audio, u"FX", {fate(inPart, {})});
    track(TypeWord::Marker, u"Notes", {fate(marker(Placement::Kind::Point, u"too loud", 19, 19), {})});

    ASSERT_EQ(step(1).changes.size(), 2U);
    EXPECT_EQ(step(1).changes[0].part, "foley");
    EXPECT_TRUE(step(1).changes[1].isMarker);
    EXPECT_EQ(step(1).changes[1].track, 1U);
    EXPECT_EQ(notes().sound->clips.lost, 1U);
    EXPECT_EQ(notes().sound->markers.lost, 1U);
}

TEST_F(SoundOfARun, ClipsThatAreMovedAlongAreCountedWherePictureMoves)
{
    // B is shorter than A, so that it is B that moves.
    model.oldEdl().clear();
    model.newEdl().clear();
    fill(model.oldEdl(), {{"A", 100, 10}, {"B", 200, 5}, {"C", 300, 10}});
    fill(model.newEdl(), {{"B", 200, 5}, {"A", 100, 10}, {"C", 300, 10}});
    track(TypeWord::Audio, u"DIA", {fate(clip(u"in A", 1, 5), {{0, 4, 5}}), fate(clip(u"end", 16, 18), {{0, 2, 0}})});
    track(TypeWord::Audio, u"FX",
          {fate(clip(u"in B", 11, 12), {{0, 1, -10}}), fate(clip(u"too", 13, 14), {{0, 1, -10}})});

    ASSERT_EQ(notes().notes.totals().steps, 1U);
    EXPECT_EQ(step(1).movedClips, 2U);
    EXPECT_EQ(step(1).tracks, std::vector<std::size_t>{1});
}

/// A marker track with a range for each of these stretches, which stay.
std::vector<Fate> ranges(const std::vector<std::pair<double, double>>& stretches)
{
    std::vector<Fate> fates;
    for (const auto& [start, end] : stretches)
        fates.push_back(
            fate(marker(Placement::Kind::Range,
                        u"scene " + std::u16string(1, static_cast<char16_t>(u'1' + fates.size())), start, end),
                 {{0, end - start, 0}}));
    return fates;
}

TEST_F(SoundOfARun, ScenesTakeHalfOfTheOldCut)
{
    constexpr double Frame = 1.0 / Rate;
    TrackComparison& scenes = track(TypeWord::Marker, u"Scenes", ranges({{0, 10}, {18, 23 - Frame}}));

    EXPECT_EQ(notes().sound->scenes, std::nullopt);
    scenes.fates = ranges({{0, 10}, {18, 23}});
    EXPECT_EQ(notes().sound->scenes, "Scenes");
    EXPECT_EQ(step(1).scenes, Texts{"scene 2"});
    EXPECT_EQ(notes().sound->markers.all, 0U);
}

TEST_F(SoundOfARun, ScenesAreOfTheTrackThatTakesTheMost)
{
    track(TypeWord::Marker, u"Reels", ranges({{0, 20}}));
    track(TypeWord::Marker, u"Scenes", ranges({{0, 12}, {12, 30}}));
    track(TypeWord::Marker, u"Takes", ranges({{0, 25}}));

    EXPECT_EQ(notes().sound->scenes, "Scenes");
    EXPECT_EQ(notes().sound->markers.all, 2U);
}

TEST_F(SoundOfARun, ScenesAreNoPointsAndNoneOfTheRunsOwnTracks)
{
    std::vector<Fate> points;
    for (const double time : {0.0, 10.0, 20.0})
        points.push_back(fate(marker(Placement::Kind::Point, u"cue", time, time), {{0, 0, 0}}));
    track(TypeWord::Marker, u"Cues", points);
    track(TypeWord::Marker, u"Memos", ranges({{0, 30}}));
    lastTrack()->setAttribute(Velmark::AttributeKey::MarkerType, Velmark::FVariant::integer(TrackRole::Memos), true);

    EXPECT_EQ(notes().sound->scenes, std::nullopt);
}

TEST_F(SoundOfARun, AutomationJumpsNameTheirTracksOneByOne)
{
    track(TypeWord::Audio, u"FX");
    track(TypeWord::Audio, u"FX 1");
    track(TypeWord::Audio, u"DIA 1, boom");
    marked(TrackRole::AutomationWarning, u"Automation warning in FX 1 DIA 1, boom FX ", 18, 18);

    ASSERT_EQ(step(1).jumps.size(), 1U);
    EXPECT_EQ(step(1).jumps[0].place, (SecondsRange{Hour + 18, Hour + 18}));
    EXPECT_EQ(step(1).jumps[0].tracks, (Texts{"FX 1", "DIA 1, boom", "FX"}));
}

TEST_F(SoundOfARun, AJumpIsNeverSplitInTheMiddleOfAName)
{
    // "FX 1" can't be meant, since "2" is no track.
    track(TypeWord::Audio, u"FX");
    track(TypeWord::Audio, u"FX 1");
    track(TypeWord::Audio, u"1 2");
    marked(TrackRole::AutomationWarning, u"Automation warning in FX 1 2 ", 18, 18);
    EXPECT_EQ(step(1).jumps.at(0).tracks, (Texts{"FX", "1 2"}));

    // A track that isn't there any more leaves the whole text.
    facts.tracks.back().added[0].name = u"Automation warning in FX gone ";
    EXPECT_EQ(step(1).jumps.at(0).tracks, Texts{"FX gone"});
    // The user has given the marker another name.
    facts.tracks.back().added[0].name = u"listen";
    EXPECT_EQ(step(1).jumps.at(0).tracks, Texts{"listen"});
}

TEST_F(SoundOfARun, OnlyAutomationWarningsAreJumps)
{
    marked(TrackRole::Insert, u"Insert B", 18, 19);

    EXPECT_TRUE(step(1).isEmpty());
    EXPECT_TRUE(notes().sound->tracks.empty());
}

TEST_F(SoundOfARun, TracksHaveTheirKindsAndTheFoldersAroundThem)
{
    const auto folder = host().addTrack(TypeWord::Folder, u"Dialogue");
    track(TypeWord::Audio, u"DIA 1", {fate(clip(u"line", 1, 2), {{0, 1, 0}})}, folder.get());
    track(TypeWord::Audio, u"empty");
    track(TypeWord::Marker, u"Notes", ranges({{1, 2}}));

    const std::vector<SoundTrack>& tracks = notes().sound->tracks;
    ASSERT_EQ(tracks.size(), 2U);
    EXPECT_EQ(tracks[0].name, "DIA 1");
    EXPECT_EQ(tracks[0].kind, "audio");
    EXPECT_EQ(tracks[0].folders, Texts{"Dialogue"});
    EXPECT_EQ(tracks[1].name, "Notes");
    EXPECT_EQ(tracks[1].kind, "marker");
    EXPECT_TRUE(tracks[1].folders.empty());
}

TEST_F(SoundOfARun, RemarksTellWhatTheRunHasLeftOut)
{
    EXPECT_EQ(remarks(), Texts());
    EXPECT_TRUE(notes().sound->isWatchingAutomation);

    facts.isRunNeeded = false;
    model.settings().setRestrictRange(true);
    model.settings().setPreserveMaterial(Hour + 5, Hour + 20.5);
    model.settings().setApplyTo(core::ApplyTo::SelectedTracks);
    model.settings().setCreateAutomationWarningMarkers(false);

    EXPECT_EQ(remarks(),
              (Texts{"No track had to change, so the sound is as it was",
                     "Only the sound between 01:00:05:00 and 01:00:20:12.50 was carried over",
                     "Only the selected tracks were carried over", "Nobody has looked for jumps of the automation"}));
    EXPECT_FALSE(notes().sound->isWatchingAutomation);
}

TEST_F(SoundOfARun, TheNotesAreThoseOfBothCutsAsTheyAreToBeLaidOut)
{
    const NotesDocument& document = notes({.simplify = 12, .showsFeet = true, .isLetter = false});

    EXPECT_EQ(document.notes.totals().before, 30 * Rate);
    EXPECT_EQ(document.notes.totals().after, 28 * Rate);
    EXPECT_EQ(document.rate, "25 fps");
    EXPECT_TRUE(document.layout.showsFeet);
    EXPECT_EQ(document.settings.toJson().at("simplify").at("value"), 12);
}

} // namespace
} // namespace cadrel::app
