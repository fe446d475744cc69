// SPDX-License-Identifier: GPL-3.0-or-later

// Runs from end to end: the film goes in as clips and curves on tracks and comes out conformed, with its markers.

#include "core/cut/MarkerEntry.h"
#include "tests/support/core/ConformFilm.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

namespace cadrel::tests {
namespace {

using core::EventList;
using core::MarkerEntry;
using core::MarkerKind;
using core::Settings;
using core::TransitionType;
using util::Result;

using Markers = std::vector<MarkerEntry>;

constexpr std::int32_t Volume = 7;

/// Times go through a stretch a day away, which costs them their last digits.
constexpr double Rounding = 1e-9;

void expectClips(const MemoryTrack& track, const std::vector<MemoryClip>& expected)
{
    const std::vector<MemoryClip> clips = track.clips();
    ASSERT_EQ(clips.size(), expected.size());
    for (std::size_t i = 0; i < clips.size(); ++i) {
        EXPECT_EQ(clips[i].material, expected[i].material);
        EXPECT_NEAR(clips[i].start, expected[i].start, Rounding);
        EXPECT_NEAR(clips[i].end, expected[i].end, Rounding);
        EXPECT_NEAR(clips[i].offset, expected[i].offset, Rounding);
    }
}

/// A film that looks for one kind of spot alone.
struct FilmWith : ConformFilm {
    explicit FilmWith(void (Settings::*switchOn)(bool))
    {
        switchMarkersOff();
        (model.settings().*switchOn)(true);
    }
};

TEST(ConformRun, SwapsTwoScenesOnEveryTrack)
{
    ConformFilm film;
    MemoryTrack& dialogue = film.engine.addTrack(L"Dialogue");
    dialogue.addClip({"Kitchen", 1.0, 9.5, 100.0});
    dialogue.addClip({"Street", 10.25, 20.0, 200.0});
    MemoryTrack& music = film.engine.addTrack(L"Music");
    music.addClip({"Theme", 0.0, 20.0, 0.0});
    film.carryOver("00:00:10:00", "00:00:20:00", "00:00:00:00", "00:00:10:00");
    film.carryOver("00:00:00:00", "00:00:10:00", "00:00:10:00", "00:00:20:00");

    EXPECT_EQ(film.conform(), Result::Ok);

    expectClips(dialogue, {{"Street", 0.25, 10.0, 200.0}, {"Kitchen", 11.0, 19.5, 100.0}});
    expectClips(music, {{"Theme", 0.0, 10.0, 10.0}, {"Theme", 10.0, 20.0, 0.0}});
}

TEST(ConformRun, TakesTheAutomationAlong)
{
    ConformFilm film;
    MemoryTrack& dialogue = film.engine.addTrack(L"Dialogue");
    dialogue.addPoint(Volume, 4.0, 0.25);
    dialogue.addPoint(Volume, 6.0, 0.75);
    film.carryOver("00:00:05:00", "00:00:10:00", "00:00:00:00", "00:00:05:00");
    film.carryOver("00:00:00:00", "00:00:05:00", "00:00:05:00", "00:00:10:00");

    EXPECT_EQ(film.conform(), Result::Ok);

    // The ramp is cut in its middle, at 0.5: it goes on from there at 0, and comes there at 10.
    EXPECT_EQ(dialogue.spansAround(0.0).automation.at(Volume).leftValue, 0.5);
    EXPECT_NEAR(dialogue.spansAround(0.5).automation.at(Volume).rightTime, 1.0, Rounding);
    EXPECT_EQ(dialogue.spansAround(0.5).automation.at(Volume).rightValue, 0.75);
    EXPECT_EQ(dialogue.spansAround(3.0).automation.at(Volume).leftValue, 0.75);
    EXPECT_EQ(dialogue.spansAround(3.0).automation.at(Volume).rightValue, 0.75);
    EXPECT_EQ(dialogue.spansAround(7.0).automation.at(Volume).leftValue, 0.25);
    EXPECT_EQ(dialogue.spansAround(7.0).automation.at(Volume).rightValue, 0.25);
    EXPECT_EQ(dialogue.spansAround(9.5).automation.at(Volume).leftValue, 0.25);
    EXPECT_EQ(dialogue.spansAround(9.5).automation.at(Volume).rightValue, 0.5);
}

TEST(ConformRun, KeepsNothingThatNoChangeEventCarriesOver)
{
    ConformFilm film;
    MemoryTrack& dialogue = film.engine.addTrack(L"Dialogue");
    dialogue.addClip({"Kitchen", 0.0, 60.0, 0.0});
    film.carryOver("00:00:10:00", "00:00:20:00", "00:00:30:00", "00:00:40:00");

    EXPECT_EQ(film.conform(), Result::Ok);

    expectClips(dialogue, {{"Kitchen", 30.0, 40.0, 10.0}});
}

TEST(ConformRun, LetsTheLaterEventOfTheListWinWhereTwoOverlap)
{
    ConformFilm film;
    MemoryTrack& dialogue = film.engine.addTrack(L"Dialogue");
    dialogue.addClip({"Kitchen", 0.0, 10.0, 0.0});
    dialogue.addClip({"Street", 10.0, 20.0, 0.0});
    film.carryOver("00:00:10:00", "00:00:20:00", "00:00:06:00", "00:00:16:00");
    film.carryOver("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");

    EXPECT_EQ(film.conform(), Result::Ok);

    expectClips(dialogue, {{"Kitchen", 0.0, 10.0, 0.0}, {"Street", 10.0, 16.0, 4.0}});
}

TEST(ConformRun, TakesAShortPieceBehindARangeAlongAndLetsTheNextRangeGiveWay)
{
    ConformFilm film;
    film.model.settings().setIncludeOverhangingAudioEvents(true);
    MemoryTrack& dialogue = film.engine.addTrack(L"Dialogue");
    dialogue.addClip({"Kitchen", 5.0, 10.08, 0.0});
    dialogue.addClip({"Street", 19.0, 31.0, 100.0});
    film.carryOver("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    film.carryOver("00:00:20:00", "00:00:30:00", "00:00:10:00", "00:00:20:00");

    EXPECT_EQ(film.conform(), Result::Ok);

    expectClips(dialogue, {{"Kitchen", 5.0, 10.08, 0.0}, {"Street", 10.08, 20.0, 101.08}});
}

TEST(ConformRun, LeavesAPreviewBehindTheProgrammeAndTheProgrammeAsItWas)
{
    ConformFilm film;
    film.switchMarkersOff();
    film.model.settings().setCreateAudioSnippetMarkers(true);
    MemoryTrack& dialogue = film.engine.addTrack(L"Dialogue");
    dialogue.addClip({"Kitchen", 0.0, 10.12, 0.0});
    film.carryOver("00:00:10:00", "00:00:20:00", "00:00:30:00", "00:00:40:00");
    film.engine.startPreview(film.model.changeEdl(), 0, 0, 0);

    EXPECT_EQ(film.engine.onIdle(), Result::Ok);

    expectClips(dialogue, {{"Kitchen", 0.0, 10.12, 0.0}, {"Kitchen", 86430.0, 86430.12, 10.0}});
    EXPECT_EQ(film.engine.markers(), Markers());
    ASSERT_EQ(film.engine.stretchMarkers().size(), 1U);
    EXPECT_EQ(film.engine.stretchMarkers()[0].start, 30.0);
}

TEST(ConformRun, MarksNewPicture)
{
    FilmWith film(&Settings::setCreateInsertMarkers);
    film.engine.addTrack(L"Dialogue");
    film.carryOver("00:00:20:00", "00:00:28:00", "00:00:00:00", "00:00:08:00");
    film.carryOver("00:00:30:00", "00:00:33:00", "00:00:12:00", "00:00:15:00");
    EventList& events = film.model.newEdl();
    events.add(makeEvent("OLDROLL", "00:00:20:00", "00:00:28:00", "00:00:00:00", "00:00:08:00"));
    events.add(makeEvent("NEWROLL", "00:00:00:00", "00:00:12:00", "00:00:08:00", "00:00:20:00"));

    EXPECT_EQ(film.conform(), Result::Ok);

    EXPECT_EQ(film.engine.markers(), (Markers{{8.0, 12.0, "Insert: NEWROLL", MarkerKind::Insert},
                                              {15.0, 20.0, "Insert: NEWROLL", MarkerKind::Insert}}));
}

TEST(ConformRun, MarksNewTransitions)
{
    FilmWith film(&Settings::setCreateDissolveWipeMarkers);
    film.engine.addTrack(L"Dialogue");
    film.carryOver("00:00:20:00", "00:00:30:00", "00:00:00:00", "00:00:10:00");
    film.carryOver("00:00:00:00", "00:00:20:00", "00:00:10:00", "00:00:30:00");
    const auto addTransition = [](EventList& events, TransitionType::Type type, const char* dstIn, const char* dstOut,
                                  std::uint32_t number) {
        const auto event = makeEvent("ROLL", dstIn, dstOut, dstIn, dstOut, number);
        event->setTransitionType(type);
        event->setTransitionDuration(25);
        events.add(event);
    };
    addTransition(film.model.oldEdl(), TransitionType::Dissolve, "00:00:28:00", "00:00:32:00", 1);
    addTransition(film.model.newEdl(), TransitionType::Dissolve, "00:00:08:00", "00:00:12:00", 1);
    addTransition(film.model.newEdl(), TransitionType::Wipe, "00:00:12:00", "00:00:15:00", 2);
    addTransition(film.model.newEdl(), TransitionType::Dissolve, "00:00:28:00", "00:00:32:00", 3);
    addTransition(film.model.newEdl(), TransitionType::Wipe, "00:00:40:00", "00:00:45:00", 4);

    EXPECT_EQ(film.conform(), Result::Ok);

    EXPECT_EQ(film.engine.markers(), (Markers{{8.0, 9.0, "D 1 ROLL", MarkerKind::DissolveWipe},
                                              {40.0, 41.0, "W 4 ROLL", MarkerKind::DissolveWipe}}));
}

TEST(ConformRun, MarksAudioSnippets)
{
    FilmWith film(&Settings::setCreateAudioSnippetMarkers);
    film.model.settings().setRemainsThreshold(25);
    film.engine.addTrack(L"Dialogue").addClip({"Kitchen", 0.0, 10.5, 0.0});
    film.engine.addTrack(L"Video", false).addClip({"Picture", 0.0, 10.5, 0.0});
    film.engine.addTrack(L"Foley").addClip({"Steps", 19.25, 40.0, 0.0});
    film.carryOver("00:00:10:00", "00:00:20:00", "00:00:30:00", "00:00:40:00");

    EXPECT_EQ(film.conform(), Result::Ok);

    EXPECT_EQ(film.engine.markers(), (Markers{{30.0, 30.5, "Audio snippet in Dialogue", MarkerKind::AudioSnippet},
                                              {39.25, 40.0, "Audio snippet in Foley", MarkerKind::AudioSnippet}}));
}

TEST(ConformRun, MarksJumpsOfTheAutomation)
{
    FilmWith film(&Settings::setCreateAutomationWarningMarkers);
    MemoryTrack& dialogue = film.engine.addTrack(L"Dialogue");
    dialogue.addPoint(Volume, 0.0, 0.2);
    dialogue.addPoint(Volume, 12.0, 0.2);
    dialogue.addPoint(Volume, 18.0, 0.8);
    MemoryTrack& music = film.engine.addTrack(L"Music");
    music.addPoint(Volume, 0.0, 0.5);
    MemoryTrack& foley = film.engine.addTrack(L"Foley");
    foley.addPoint(Volume, 0.0, 0.0);
    foley.addPoint(Volume, 20.0, 1.0);
    film.carryOver("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    film.carryOver("00:00:20:00", "00:00:30:00", "00:00:10:00", "00:00:20:00");

    EXPECT_EQ(film.conform(), Result::Ok);

    EXPECT_EQ(film.engine.markers(),
              (Markers{{10.0, 10.0, "Automation warning in Dialogue Foley ", MarkerKind::AutomationWarning}}));
}

TEST(ConformRun, MarksOverlaps)
{
    FilmWith film(&Settings::setCreateOverlapMarkers);
    film.engine.addTrack(L"Dialogue").addClip({"Kitchen", 0.0, 30.0, 0.0});
    film.engine.addTrack(L"Music").addClip({"Theme", 0.0, 10.0, 0.0});
    film.engine.addTrack(L"Foley").addClip({"Steps", 0.0, 30.0, 0.0});
    film.carryOver("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    film.carryOver("00:00:20:00", "00:00:30:00", "00:00:08:00", "00:00:18:00");

    EXPECT_EQ(film.conform(), Result::Ok);

    EXPECT_EQ(film.engine.markers(), (Markers{{8.0, 10.0, "Overlap in Dialogue Foley ", MarkerKind::Overlap}}));
}

TEST(ConformRun, WritesTheMarkersOfAllKindsInTheOrderInWhichTheyAreLookedFor)
{
    ConformFilm film;
    MemoryTrack& dialogue = film.engine.addTrack(L"Dialogue");
    dialogue.addClip({"Kitchen", 0.0, 10.12, 0.0});
    dialogue.addClip({"Street", 20.0, 42.0, 0.0});
    dialogue.addPoint(Volume, 10.0, 0.2);
    dialogue.addPoint(Volume, 30.0, 0.8);
    film.carryOver("00:00:10:00", "00:00:30:00", "00:00:00:00", "00:00:20:00");
    film.carryOver("00:00:00:00", "00:00:10:00", "00:00:20:00", "00:00:30:00");
    film.carryOver("00:00:30:00", "00:00:40:00", "00:00:28:00", "00:00:38:00");
    const auto dissolve = makeEvent("NEWROLL", "00:00:00:00", "00:00:06:00", "00:00:36:00", "00:00:42:00", 5);
    dissolve->setTransitionType(TransitionType::Dissolve);
    dissolve->setTransitionDuration(50);
    film.model.newEdl().add(dissolve);

    EXPECT_EQ(film.conform(), Result::Ok);

    const Markers markers = film.engine.markers();
    ASSERT_EQ(markers.size(), 6U);
    EXPECT_EQ(markers[0], (MarkerEntry{38.0, 42.0, "Insert: NEWROLL", MarkerKind::Insert}));
    EXPECT_EQ(markers[1], (MarkerEntry{36.0, 38.0, "D 5 NEWROLL", MarkerKind::DissolveWipe}));
    EXPECT_EQ(markers[2].start, 0.0);
    EXPECT_NEAR(markers[2].end, 0.12, Rounding);
    EXPECT_EQ(markers[2].name, "Audio snippet in Dialogue");
    EXPECT_EQ(markers[2].kind, MarkerKind::AudioSnippet);
    EXPECT_EQ(markers[3], (MarkerEntry{20.0, 20.0, "Automation warning in Dialogue ", MarkerKind::AutomationWarning}));
    EXPECT_EQ(markers[4], (MarkerEntry{28.0, 28.0, "Automation warning in Dialogue ", MarkerKind::AutomationWarning}));
    EXPECT_EQ(markers[5], (MarkerEntry{28.0, 30.0, "Overlap in Dialogue ", MarkerKind::Overlap}));
}

} // namespace
} // namespace cadrel::tests
