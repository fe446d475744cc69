// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/core/MemoryEngine.h"

#include "core/cut/Cut.h"
#include "core/settings/Settings.h"
#include "tests/support/core/ConformFilm.h"
#include "tests/support/core/RecordingProgress.h"

#include <gtest/gtest.h>

#include <vector>

namespace cadrel::tests {
namespace {

using core::ApplyTo;
using core::MarkerEntry;
using core::MarkerKind;
using core::SecondsRange;
using util::Result;

using Clips = std::vector<MemoryClip>;
using Markers = std::vector<MarkerEntry>;

/// Ten seconds of the kitchen move from 10 to 30; no markers.
struct KitchenFilm : ConformFilm {
    KitchenFilm()
    {
        switchMarkersOff();
        dialogue.addClip({"Kitchen", 0.0, 20.0, 0.0});
        carryOver("00:00:10:00", "00:00:20:00", "00:00:30:00", "00:00:40:00");
    }

    MemoryTrack& dialogue = engine.addTrack(L"Dialogue");
};

SecondsRange transportCycleOf(MemoryEngine& engine)
{
    SecondsRange cycle;
    EXPECT_EQ(engine.getTransportCycle(cycle.start, cycle.end), Result::Ok);
    return cycle;
}

SecondsRange projectCycleOf(MemoryEngine& engine)
{
    SecondsRange cycle;
    EXPECT_EQ(engine.getProjectCycle(cycle.start, cycle.end), Result::Ok);
    return cycle;
}

double positionOf(MemoryEngine& engine)
{
    double position = -1.0;
    EXPECT_EQ(engine.getTransportPosition(position), Result::Ok);
    return position;
}

TEST(MemoryEngine, StartsOnlyWithChangesAndTracksToApplyThemTo)
{
    ConformFilm film;
    EXPECT_EQ(film.engine.canStart(), Result::ChangeEdlEmpty);

    film.carryOver("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    EXPECT_EQ(film.engine.canStart(), Result::NoTracks);

    MemoryTrack& track = film.engine.addTrack(L"Dialogue");
    EXPECT_EQ(film.engine.canStart(), Result::Ok);

    film.model.settings().setApplyTo(ApplyTo::SelectedTracks);
    EXPECT_EQ(film.engine.canStart(), Result::NoTracksSelected);
    EXPECT_EQ(film.engine.startCadrel(), Result::NoTracksSelected);
    EXPECT_EQ(film.engine.startPreview(film.model.changeEdl(), 0, 0, 0), Result::NoTracksSelected);

    track.setSelected(true);
    EXPECT_EQ(film.engine.canStart(), Result::Ok);
}

TEST(MemoryEngine, RunsWhenItIsIdleAndOnlyOnce)
{
    KitchenFilm film;

    EXPECT_EQ(film.engine.startCadrel(), Result::Ok);
    EXPECT_EQ(film.dialogue.clips(), (Clips{{"Kitchen", 0.0, 20.0, 0.0}}));

    EXPECT_EQ(film.engine.onIdle(), Result::Ok);
    EXPECT_EQ(film.dialogue.clips(), (Clips{{"Kitchen", 30.0, 40.0, 10.0}}));

    EXPECT_EQ(film.engine.onIdle(), Result::Ok);
    EXPECT_EQ(film.dialogue.clips(), (Clips{{"Kitchen", 30.0, 40.0, 10.0}}));
}

TEST(MemoryEngine, RunsBeforeItPreviews)
{
    KitchenFilm film;
    film.engine.startPreview(film.model.changeEdl(), 0, 0, 0);
    film.engine.startCadrel();

    EXPECT_EQ(film.engine.onIdle(), Result::Ok);

    // The preview finds silence at 10 to 20 seconds, where the run has taken the kitchen away.
    EXPECT_EQ(film.dialogue.clips(), (Clips{{"Kitchen", 30.0, 40.0, 10.0}}));
    EXPECT_TRUE(film.engine.hasStretch());
    EXPECT_EQ(film.engine.projectEvents().events(), film.model.changeEdl().events());
}

TEST(MemoryEngine, OpensItsStretchAtTheFirstWholeDayBehindAllTracks)
{
    ConformFilm film;
    EXPECT_EQ(film.engine.stretchStart(), 86400.0);

    film.engine.removeVirginTerritoryMarkers();
    film.engine.addTrack(L"Dialogue").addClip({"Long", 86000.0, 86400.0, 0.0});
    EXPECT_EQ(film.engine.stretchStart(), 172800.0);
}

TEST(MemoryEngine, MeasuresADayByTheTimecodesOfTheProject)
{
    ConformFilm film(core::Framerate(30, true, 0));

    EXPECT_NEAR(film.engine.stretchStart(), 86486.4, 1e-6);
}

TEST(MemoryEngine, ChangesSelectedTracksOnlyWhereTheSettingsSaySo)
{
    KitchenFilm film;
    MemoryTrack& selected = film.engine.addTrack(L"Foley");
    selected.setSelected(true);
    selected.addClip({"Steps", 0.0, 20.0, 0.0});
    film.model.settings().setApplyTo(ApplyTo::SelectedTracks);

    EXPECT_EQ(film.conform(), Result::Ok);

    EXPECT_EQ(film.dialogue.clips(), (Clips{{"Kitchen", 0.0, 20.0, 0.0}}));
    EXPECT_EQ(selected.clips(), (Clips{{"Steps", 30.0, 40.0, 10.0}}));
}

TEST(MemoryEngine, ReplacesThePartOfTheProgrammeThatTheSettingsRestrictARunTo)
{
    KitchenFilm film;
    film.dialogue.addClip({"Street", 30.0, 50.0, 0.0});
    film.model.settings().setRestrictRange(true);
    film.model.settings().setPreserveMaterial(35.0, 45.0);
    film.engine.generateMarkers({{34.0, 34.5, "before", MarkerKind::Insert},
                                 {35.0, 35.5, "inside", MarkerKind::Insert},
                                 {45.0, 45.5, "behind", MarkerKind::Insert}});

    film.engine.processEvent(*film.engine.makeCutEvents(film.model.changeEdl().eventAt(0)));
    EXPECT_EQ(film.engine.completeCadrel(), Result::Ok);

    EXPECT_EQ(film.dialogue.clips(), (Clips{{"Kitchen", 0.0, 20.0, 0.0},
                                            {"Street", 30.0, 35.0, 0.0},
                                            {"Kitchen", 35.0, 40.0, 15.0},
                                            {"Street", 45.0, 50.0, 15.0}}));
    EXPECT_EQ(film.engine.markers(), (Markers{{35.0, 35.5, "inside", MarkerKind::Insert}}));
}

TEST(MemoryEngine, ReplacesTheMarkersOfAnEarlierRun)
{
    KitchenFilm film;
    film.model.settings().setCreateInsertMarkers(true);
    film.model.newEdl().add(makeEvent("FIRST", "00:00:00:00", "00:00:10:00", "00:00:50:00", "00:01:00:00"));
    film.conform();
    film.model.newEdl().clear();
    film.model.newEdl().add(makeEvent("SECOND", "00:00:00:00", "00:00:10:00", "00:00:50:00", "00:01:00:00"));

    film.conform();

    EXPECT_EQ(film.engine.markers(), (Markers{{50.0, 60.0, "Insert: SECOND", MarkerKind::Insert}}));
}

TEST(MemoryEngine, RefusesMarkersWithoutATrackAndKeepsThoseBefore)
{
    ConformFilm film;
    const MarkerEntry overlap{1.0, 2.0, "Overlap", MarkerKind::Overlap};

    EXPECT_EQ(film.engine.generateMarkers({overlap, {1.0, 2.0, "Memo", 6}, overlap}), Result::InvalidArgument);
    EXPECT_EQ(film.engine.generateMarkers({{1.0, 2.0, "None", 0}}), Result::InvalidArgument);

    EXPECT_EQ(film.engine.stretchMarkers(), Markers{overlap});
}

TEST(MemoryEngine, TakesACancelledRunBackWhole)
{
    KitchenFilm film;
    film.dialogue.addPoint(7, 5.0, 0.5);
    film.carryOver("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    RecordingProgress progress(1);
    film.engine.setProgress(&progress);

    EXPECT_EQ(film.conform(), Result::Cancelled);

    EXPECT_EQ(film.dialogue.clips(), (Clips{{"Kitchen", 0.0, 20.0, 0.0}}));
    EXPECT_EQ(film.dialogue.points(7), (std::vector<MemoryPoint>{{5.0, 0.5}}));
    EXPECT_FALSE(film.engine.hasStretch());
}

TEST(MemoryEngine, ShowsTheProgressOfARunUnderItsTitleAndLetsItBeCancelled)
{
    KitchenFilm film;
    film.model.settings().setCreateOverlapMarkers(true);
    film.carryOver("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    film.engine.addTrack(L"Foley");
    RecordingProgress progress;
    film.engine.setProgress(&progress);

    EXPECT_EQ(film.conform(), Result::Ok);

    // Two events on two tracks, and a step for each event to find overlaps, of which there is one less.
    EXPECT_EQ(progress.calls.front(), L"start Processing Project 6 can cancel");
    EXPECT_EQ(progress.texts, std::vector<std::wstring>{L"Overlap Markers"});
    EXPECT_EQ(progress.steps(), 5U);
    EXPECT_EQ(progress.calls.back(), L"finish");
}

TEST(MemoryEngine, ShowsTheProgressOfAPreviewUnderItsTitle)
{
    KitchenFilm film;
    RecordingProgress progress;
    film.engine.setProgress(&progress);
    film.engine.startPreview(film.model.changeEdl(), 0, 0, 0);

    EXPECT_EQ(film.engine.onIdle(), Result::Ok);

    EXPECT_EQ(progress.calls.front(), L"start Project Preview 1");
    EXPECT_EQ(progress.steps(), 1U);
    EXPECT_EQ(progress.calls.back(), L"finish");
}

TEST(MemoryEngine, LeavesOutWhatWouldStandBeforeTheProgrammeAndWhatRunsBackwards)
{
    KitchenFilm film;
    const auto cut = film.engine.makeCutEvents(film.model.changeEdl().eventAt(0));
    cut->cutEvents()[0]->setDstIn(-4.0);
    const auto backwards = film.engine.makeCutEvents(film.model.changeEdl().eventAt(0));
    backwards->cutEvents()[0]->setSrcOut(9.0);

    EXPECT_EQ(film.engine.processEvent(*cut), Result::Ok);
    EXPECT_EQ(film.engine.processEvent(*backwards), Result::Ok);

    EXPECT_EQ(film.dialogue.clips(), (Clips{{"Kitchen", 0.0, 20.0, 0.0}, {"Kitchen", 86400.0, 86406.0, 14.0}}));
}

TEST(MemoryEngine, KeepsAPreviewUntilTheNextOneTakesItsPlace)
{
    KitchenFilm film;
    core::EventList other;
    other.add(makeEvent("CHANGE", "00:00:00:00", "00:00:05:00", "00:00:01:00", "00:00:06:00"));
    film.engine.startPreview(film.model.changeEdl(), 0, 0, 0);
    film.engine.onIdle();
    film.engine.startPreview(other, 0, 0, 0);

    film.engine.onIdle();

    EXPECT_EQ(film.dialogue.clips(), (Clips{{"Kitchen", 0.0, 20.0, 0.0}, {"Kitchen", 86401.0, 86406.0, 0.0}}));
    EXPECT_EQ(film.engine.projectEvents().events(), other.events());
}

TEST(MemoryEngine, CyclesOverThePreviewedEventsWithoutTheirNeighbours)
{
    KitchenFilm film;
    film.carryOver("00:00:02:00", "00:00:05:00", "00:00:50:00", "00:00:53:00");
    film.carryOver("00:00:00:00", "00:00:02:00", "00:00:45:00", "00:00:47:00");
    film.carryOver("00:01:00:00", "00:01:10:00", "00:01:00:00", "00:01:10:00");

    film.engine.startPreview(film.model.changeEdl(), 1, 1, 1);
    EXPECT_EQ(film.engine.onIdle(), Result::Ok);
    EXPECT_EQ(transportCycleOf(film.engine), (SecondsRange{86445.0, 86453.0}));
    EXPECT_EQ(projectCycleOf(film.engine), (SecondsRange{86445.0, 86453.0}));
    EXPECT_EQ(positionOf(film.engine), 86445.0);

    EXPECT_EQ(film.engine.cycleToEvents(film.model.changeEdl(), 1, 1, 0), Result::Ok);
    EXPECT_EQ(transportCycleOf(film.engine), (SecondsRange{0.0, 5.0}));
    EXPECT_EQ(positionOf(film.engine), 0.0);
}

TEST(MemoryEngine, RefusesToCycleToMoreNeighboursThanEvents)
{
    KitchenFilm film;

    EXPECT_EQ(film.engine.cycleToEvents(film.model.changeEdl(), 1, 1, 0), Result::InvalidArgument);
    EXPECT_EQ(film.engine.cycleToEvents(film.model.changeEdl(), 2, 0, 0), Result::InvalidArgument);
    EXPECT_EQ(film.engine.cycleToEvents(core::EventList(), 2, 0, 0), Result::Ok);
}

TEST(MemoryEngine, KeepsItsCycleWhereNoEventHasAPlace)
{
    ConformFilm film;
    film.carryOverNothing();
    film.engine.setTransportCycle(1.0, 2.0);

    EXPECT_EQ(film.engine.cycleToEvents(film.model.changeEdl(), 0, 0, 0), Result::Ok);

    EXPECT_EQ(transportCycleOf(film.engine), (SecondsRange{1.0, 2.0}));
}

TEST(MemoryEngine, KeepsCyclesAndPositionAndRefusesCyclesThatRunBackwards)
{
    ConformFilm film;

    EXPECT_EQ(film.engine.setProjectCycle(1.0, 2.0), Result::Ok);
    EXPECT_EQ(film.engine.setTransportCycle(3.0, 4.0), Result::Ok);
    EXPECT_EQ(film.engine.setTransportPosition(5.0), Result::Ok);
    EXPECT_EQ(film.engine.setProjectCycle(2.0, 1.0), Result::InvalidArgument);
    EXPECT_EQ(film.engine.setTransportCycle(4.0, 3.0), Result::InvalidArgument);

    EXPECT_EQ(projectCycleOf(film.engine), (SecondsRange{1.0, 2.0}));
    EXPECT_EQ(transportCycleOf(film.engine), (SecondsRange{3.0, 4.0}));
    EXPECT_EQ(positionOf(film.engine), 5.0);
}

TEST(MemoryEngine, ReturnsToWhereItStoodWhenThePreviewIsSwitchedOff)
{
    KitchenFilm film;
    film.engine.setProjectCycle(1.0, 2.0);
    film.engine.setTransportCycle(3.0, 4.0);
    film.engine.setTransportPosition(5.0);

    film.engine.setPreviewActive(true);
    film.engine.startPreview(film.model.changeEdl(), 0, 0, 1);
    film.engine.onIdle();
    EXPECT_TRUE(film.engine.isPreviewActive());
    EXPECT_EQ(positionOf(film.engine), 86430.0);

    film.engine.setPreviewActive(false);
    EXPECT_FALSE(film.engine.isPreviewActive());
    EXPECT_EQ(projectCycleOf(film.engine), (SecondsRange{1.0, 2.0}));
    EXPECT_EQ(transportCycleOf(film.engine), (SecondsRange{3.0, 4.0}));
    EXPECT_EQ(positionOf(film.engine), 5.0);
    EXPECT_EQ(film.dialogue.clips(), (Clips{{"Kitchen", 0.0, 20.0, 0.0}}));
    EXPECT_TRUE(film.engine.projectEvents().isEmpty());
}

TEST(MemoryEngine, TakesAPreviewBack)
{
    KitchenFilm film;
    film.engine.startPreview(film.model.changeEdl(), 0, 0, 0);
    film.engine.onIdle();

    EXPECT_EQ(film.engine.endPreview(), Result::Ok);

    EXPECT_EQ(film.dialogue.clips(), (Clips{{"Kitchen", 0.0, 20.0, 0.0}}));
    EXPECT_FALSE(film.engine.hasStretch());
    EXPECT_TRUE(film.engine.projectEvents().isEmpty());
}

TEST(MemoryEngine, TellsTheAlgorithmsOfTheProject)
{
    ConformFilm film;

    const core::CadrelRunState runState = film.engine.getRunState();
    const core::CadrelPreviewState previewState = film.engine.getPreviewState();

    EXPECT_EQ(runState.oldEvents, &film.model.oldEdl());
    EXPECT_EQ(runState.newEvents, &film.model.newEdl());
    EXPECT_EQ(runState.framerate.framesPerSecond, 25);
    EXPECT_EQ(runState.settings, &film.model.settings());
    EXPECT_EQ(runState.previewOffset, 86400.0);
    EXPECT_EQ(previewState.framerate.framesPerSecond, 25);
    EXPECT_EQ(previewState.settings, &film.model.settings());
}

TEST(MemoryEngine, HasNoFileNoVideosAndItsOriginAtZero)
{
    ConformFilm film;

    EXPECT_EQ(film.engine.getProjectName(), L"");
    EXPECT_EQ(film.engine.getMediaPool(), nullptr);
    EXPECT_EQ(film.engine.getTimeOrigin(), 0.0);
}

} // namespace
} // namespace cadrel::tests
