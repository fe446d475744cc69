// SPDX-License-Identifier: GPL-3.0-or-later

// What the window and the engine ask of the adapter, one by one.

#include "core/cut/Cut.h"
#include "core/cut/CutList.h"
#include "core/model/DataModelCommandCreator.h"
#include "core/model/MediaPoolInterface.h"
#include "host/Host.h"
#include "host/project/Project.h"
#include "host/track/TrackRole.h"
#include "host/video/ProjectVideo.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/host/AdaptedHost.h"
#include "tests/support/host/FakeProject.h"
#include "velmark/Attributes.h"
#include "velmark/Tracks.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <utility>
#include <vector>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::makeEvent;
using cadrel::tests::thrownBy;
using core::ApplyTo;
using core::PropertyKey;
using util::Result;

using Span = std::pair<double, double>;

class HostOperationsTest : public AtEachOrigin {
protected:
    HostOperationsTest() { host.switchMarkersOff(); }

    Host& adapter() { return host.adapter(); }
    Span transportCycle() { return {host.project.cycleLeft().getValue(), host.project.cycleRight().getValue()}; }
    Span locators() { return {host.project.locatorLeft().getValue(), host.project.locatorRight().getValue()}; }
    void setLocators(double left, double right)
    {
        host.project.locatorLeft().setValue(0, left);
        host.project.locatorRight().setValue(0, right);
    }
    double property(std::int32_t key)
    {
        core::Variant value(-1.0);
        host.model().getProperty(key, value);
        return value.toDouble();
    }
    /// Two events of the film and one without timecodes between them: 0 to 10 s go to 20 to 30 s, 10 to 12 s to 40 to 42 s.
    void carryOverTwo()
    {
        host.carryOver("01:00:00:00", "01:00:10:00", "01:00:20:00", "01:00:30:00");
        host.carryOver("25:00:00:00", "26:00:00:00", "25:00:00:00", "26:00:00:00");
        host.carryOver("01:00:10:00", "01:00:12:00", "01:00:40:00", "01:00:42:00");
    }

    AdaptedHost host{GetParam()};
};

INSTANTIATE_TEST_SUITE_P(Origins, HostOperationsTest, testing::Values(0.0, 3600.0));

} // namespace

// Cycles, locators and positions.

TEST_P(HostOperationsTest, ReadsAndWritesTheLocatorsAsTheHostHasThem)
{
    setLocators(3.0, 8.0);
    double left = 0.0;
    double right = 0.0;

    EXPECT_EQ(adapter().getProjectCycle(left, right), Result::Ok);
    EXPECT_EQ(Span(left, right), Span(3.0, 8.0));

    EXPECT_EQ(adapter().setProjectCycle(4.0, 9.0), Result::Ok);
    EXPECT_EQ(locators(), Span(4.0, 9.0));
}

TEST_P(HostOperationsTest, ReadsAndWritesTheTransport)
{
    double left = 0.0;
    double right = 0.0;
    double position = 0.0;

    EXPECT_EQ(adapter().setTransportCycle(4.0, 9.0), Result::Ok);
    EXPECT_EQ(transportCycle(), Span(4.0, 9.0));
    EXPECT_EQ(adapter().getTransportCycle(left, right), Result::Ok);
    EXPECT_EQ(Span(left, right), Span(4.0, 9.0));

    EXPECT_EQ(adapter().setTransportPosition(5.0), Result::Ok);
    EXPECT_EQ(adapter().getTransportPosition(position), Result::Ok);
    EXPECT_EQ(position, 5.0);
    EXPECT_EQ(thrownBy([&] { adapter().setTransportCycle(9.0, 4.0); }), Result::InvalidArgument);
}

TEST_P(HostOperationsTest, MovesTheCycleToTheSourceOfTheEvents)
{
    carryOverTwo();
    setLocators(100.0, 120.0);

    EXPECT_EQ(adapter().cycleToEvents(host.model().changeEdl(), 0, 0, 0), Result::Ok);

    EXPECT_EQ(transportCycle(), Span(host.inHost(0.0), host.inHost(12.0)));
    EXPECT_EQ(host.project.position().getValue(), host.inHost(0.0));
    // They keep their distance of 20 s and start a tenth of it before the events.
    EXPECT_EQ(locators(), Span(host.inHost(-2.0), host.inHost(18.0)));
    EXPECT_EQ(property(PropertyKey::PreviewAtDestination), 0.0);
}

TEST_P(HostOperationsTest, MovesTheCycleToThePreviewOfTheEvents)
{
    carryOverTwo();
    adapter().setPreviewActive(true);

    EXPECT_EQ(adapter().cycleToEvents(host.model().changeEdl(), 0, 0, 1), Result::Ok);

    // The project is empty, so that the preview begins a day behind the start of the clock.
    const double day = 86400.0;
    EXPECT_EQ(property(PropertyKey::PreviewOffset), day);
    EXPECT_EQ(transportCycle(), Span(day + host.inHost(20.0), day + host.inHost(42.0)));
    EXPECT_EQ(host.project.position().getValue(), day + host.inHost(20.0));
    EXPECT_EQ(property(PropertyKey::PreviewAtDestination), 1.0);
}

TEST_P(HostOperationsTest, LeavesTheNeighboursOutOfTheCycle)
{
    carryOverTwo();

    adapter().cycleToEvents(host.model().changeEdl(), 1, 0, 0);
    EXPECT_EQ(transportCycle(), Span(host.inHost(10.0), host.inHost(12.0)));

    adapter().cycleToEvents(host.model().changeEdl(), 0, 2, 0);
    EXPECT_EQ(transportCycle(), Span(host.inHost(0.0), host.inHost(10.0)));
}

TEST_P(HostOperationsTest, MovesNoCycleToNothing)
{
    carryOverTwo();
    adapter().setTransportCycle(1.0, 2.0);

    EXPECT_EQ(adapter().cycleToEvents(core::EventList(), 7, 7, 1), Result::Ok);
    EXPECT_EQ(adapter().cycleToEvents(host.model().changeEdl(), 2, 2, 0), Result::InvalidArgument);
    EXPECT_EQ(adapter().cycleToEvents(host.model().changeEdl(), 1, UINT64_MAX, 0), Result::InvalidArgument)
        << "The two don't run over.";

    EXPECT_EQ(transportCycle(), Span(1.0, 2.0));
}

TEST_P(HostOperationsTest, RefusesACycleToEventsOfWhichNoneHasTimes)
{
    carryOverTwo();
    adapter().setTransportCycle(1.0, 2.0);

    EXPECT_EQ(thrownBy([&] { adapter().cycleToEvents(host.model().changeEdl(), 1, 1, 0); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([&] { adapter().cycleToEvents(host.model().changeEdl(), 3, 0, 0); }), Result::InvalidArgument)
        << "All of them are neighbours.";

    EXPECT_EQ(transportCycle(), Span(1.0, 2.0));
}

TEST_P(HostOperationsTest, RefusesACycleToAPreviewThatHasNoPlace)
{
    carryOverTwo();

    EXPECT_EQ(adapter().cycleToEvents(host.model().changeEdl(), 0, 0, 1), Result::NotAvailable);
}

TEST_P(HostOperationsTest, LocksTheTracksAtTheDestinationAndUnlocksThemAtTheSource)
{
    const auto markers = host.addTrack(TypeWord::Marker, u"Inserts");
    markers->setAttribute(AttributeKey::MarkerType, FVariant::integer(TrackRole::Insert), true);
    carryOverTwo();
    adapter().setPreviewActive(true);
    const auto isLocked = [&] { return query<ITrackNode>(markers)->getFlag(TrackFlag::Lock) == ResultOk; };

    adapter().cycleToEvents(host.model().changeEdl(), 0, 0, 1);
    EXPECT_TRUE(isLocked());

    adapter().cycleToEvents(host.model().changeEdl(), 0, 0, 0);
    EXPECT_FALSE(isLocked());
}

// What the window asks for.

TEST_P(HostOperationsTest, StartsNothingThatCannotBeDone)
{
    EXPECT_EQ(adapter().canStart(), Result::ChangeEdlEmpty);
    carryOverTwo();
    EXPECT_EQ(adapter().canStart(), Result::NoTracks);
    host.addTrack(TypeWord::Folder, u"Sound");
    host.addTrack(TypeWord::Ruler, u"Ruler");
    EXPECT_EQ(adapter().canStart(), Result::NoTracks);
    const auto track = host.addTrack(TypeWord::Audio, u"DX");
    EXPECT_EQ(adapter().canStart(), Result::Ok);
    host.settings().setApplyTo(ApplyTo::SelectedTracks);
    EXPECT_EQ(adapter().canStart(), Result::NoTracksSelected);
    dynamic_cast<standin::Node&>(*track).setSelected(true);
    EXPECT_EQ(adapter().canStart(), Result::Ok);
    host.application.activateProject(nullptr);
    EXPECT_EQ(adapter().canStart(), Result::NoProject);
}

TEST_P(HostOperationsTest, StartsNothingOnTracksThatTheUserHasLocked)
{
    const auto locked = host.addTrack(TypeWord::Audio, u"DX");
    const auto isLocked = [&](bool lock) { query<ITrackNode>(locked)->setFlag(TrackFlag::Lock, lock); };
    carryOverTwo();
    isLocked(true);
    EXPECT_EQ(adapter().canStart(), Result::NoTracks);

    host.addTrack(TypeWord::Audio, u"FX");
    EXPECT_EQ(adapter().canStart(), Result::Ok);
    dynamic_cast<standin::Node&>(*locked).setSelected(true);
    host.settings().setApplyTo(ApplyTo::SelectedTracks);
    EXPECT_EQ(adapter().canStart(), Result::NoTracksSelected);
    EXPECT_EQ(adapter().startCadrel(), Result::NoTracksSelected);

    isLocked(false);
    EXPECT_EQ(adapter().canStart(), Result::Ok);
    // What the system holds itself, it frees for a run.
    isLocked(true);
    locked->setAttribute(AttributeKey::LockState, FVariant::integer(1), true);
    EXPECT_EQ(adapter().canStart(), Result::Ok);
}

TEST_P(HostOperationsTest, StartsNothingWhereOnlyTheMarkersOfRunsCouldBeChanged)
{
    const auto locked = host.addTrack(TypeWord::Audio, u"DX");
    query<ITrackNode>(locked)->setFlag(TrackFlag::Lock, true);
    carryOverTwo();
    for (std::int32_t role = TrackRole::Destination; role < TrackRole::Memos; ++role) {
        const auto markers = host.addTrack(TypeWord::Marker, u"Markers");
        markers->setAttribute(AttributeKey::MarkerType, FVariant::integer(role), true);
        dynamic_cast<standin::Node&>(*markers).setSelected(true);
        EXPECT_EQ(adapter().canStart(), Result::NoTracks) << role;
    }

    const auto memos = host.addTrack(TypeWord::Marker, u"Memos");
    memos->setAttribute(AttributeKey::MarkerType, FVariant::integer(TrackRole::Memos), true);
    EXPECT_EQ(adapter().canStart(), Result::Ok) << "The memos are the user's.";
    host.settings().setApplyTo(ApplyTo::SelectedTracks);
    EXPECT_EQ(adapter().canStart(), Result::NoTracksSelected) << "The markers of runs are selected alone.";
}

TEST_P(HostOperationsTest, AnswersWhyAProjectCannotBeRunThatHasNoUsableTracks)
{
    const auto broken = FakeProject::withoutUsableTrack();
    adapter().projectOpened(broken.get());
    adapter().projectActivated(broken.get());
    carryOverTwo();

    EXPECT_EQ(adapter().canStart(), Result::HostObjectMissing);

    adapter().projectClosing(broken.get(), 0);
}

TEST_P(HostOperationsTest, AnswersWhyARequestIsRefused)
{
    EXPECT_EQ(adapter().startCadrel(), Result::ChangeEdlEmpty);
    EXPECT_EQ(adapter().startPreview(core::EventList(), 0, 0, 0), Result::ChangeEdlEmpty);
    EXPECT_TRUE(host.model().hasProperty(PropertyKey::PreviewOffset)) << "That is made sure of before.";

    host.idle();

    EXPECT_TRUE(host.undoNames().empty());
}

TEST_P(HostOperationsTest, OnlyRequestsWhatItIsAskedToStart)
{
    host.addTrack(TypeWord::Audio, u"DX");
    carryOverTwo();
    const AdaptedHost::Entries before = host.undoNames();

    EXPECT_EQ(adapter().startCadrel(), Result::Ok);
    EXPECT_EQ(adapter().startPreview(host.model().changeEdl(), 0, 0, 0), Result::Ok);

    EXPECT_EQ(host.undoNames(), before);
}

TEST_P(HostOperationsTest, KnowsTheFileOfTheProject)
{
    EXPECT_EQ(adapter().getProjectName(), L"") << "It was never saved.";

    host.project.setPath(u"/films/reel 3 \u00fc.stage");

    EXPECT_EQ(adapter().getProjectName(), L"/films/reel 3 \u00fc.stage");
}

TEST_P(HostOperationsTest, KnowsTheProjectsMediaAndItsClock)
{
    ASSERT_NE(adapter().getMediaPool(), nullptr);
    EXPECT_EQ(adapter().getMediaPool()->count(), 0U);
    EXPECT_EQ(adapter().getTimeOrigin(), GetParam());
    EXPECT_NE(adapter().getVideoProvider(), nullptr);
}

// Without a project.

TEST_P(HostOperationsTest, DoesNothingWithoutAProject)
{
    host.application.activateProject(nullptr);
    double value = 7.0;
    double other = 8.0;

    EXPECT_EQ(adapter().getProjectCycle(value, other), Result::Ok);
    EXPECT_EQ(adapter().setProjectCycle(1.0, 2.0), Result::Ok);
    EXPECT_EQ(adapter().getTransportCycle(value, other), Result::Ok);
    EXPECT_EQ(adapter().setTransportCycle(1.0, 2.0), Result::Ok);
    EXPECT_EQ(adapter().getTransportPosition(value), Result::Ok);
    EXPECT_EQ(adapter().setTransportPosition(1.0), Result::Ok);
    EXPECT_EQ(Span(value, other), Span(7.0, 8.0));
    EXPECT_EQ(adapter().endPreview(), Result::Ok);
    EXPECT_EQ(adapter().getProjectName(), L"");
    EXPECT_EQ(adapter().getMediaPool(), nullptr);
    EXPECT_EQ(adapter().getTimeOrigin(), 0.0);
    adapter().setPreviewActive(true);
    EXPECT_FALSE(adapter().isPreviewActive());
    EXPECT_EQ(adapter().getProjectModel(), nullptr);
}

TEST_P(HostOperationsTest, StartsNothingWithoutAProject)
{
    carryOverTwo();
    const core::EventList events(host.model().changeEdl());
    host.application.activateProject(nullptr);

    EXPECT_EQ(adapter().startCadrel(), Result::NoProject);
    EXPECT_EQ(adapter().startPreview(events, 0, 0, 0), Result::NoProject);
    EXPECT_EQ(adapter().cycleToEvents(events, 0, 0, 0), Result::NoProject);
    EXPECT_EQ(adapter().cycleToEvents(core::EventList(), 0, 0, 0), Result::Ok);
    host.idle();

    EXPECT_TRUE(host.undoNames().empty());
}

TEST_P(HostOperationsTest, HasNoStepsOfARunWithoutAProject)
{
    const auto event = makeEvent("A001", "01:00:00:00", "01:00:10:00", "01:00:20:00", "01:00:30:00");
    core::Settings settings;
    settings.setCreateVirginTerritories(true);
    host.application.activateProject(nullptr);
    core::CutList cuts;

    EXPECT_EQ(adapter().removeVirginTerritoryMarkers(), Result::NoProject);
    const std::shared_ptr<core::Cut> cut = adapter().makeCutEvents(event);
    ASSERT_NE(cut, nullptr);
    EXPECT_EQ(cut->event(), event);
    EXPECT_TRUE(cut->cutEvents().empty());
    EXPECT_EQ(adapter().processEvent(*cut), Result::NoProject);
    EXPECT_EQ(adapter().completeCadrel(), Result::Ok);
    EXPECT_EQ(adapter().generateMarkers({}), Result::Ok);
    EXPECT_EQ(adapter().getRunState().settings, nullptr);
    EXPECT_EQ(adapter().getPreviewState().settings, nullptr);
    EXPECT_EQ(adapter().applyVirginTerritories(cuts), Result::Ok);
    EXPECT_EQ(adapter().setProjectEvents(core::EventList()), Result::Ok);
    EXPECT_EQ(adapter().estimateSteps(3, settings, 4), 0U);
}

TEST_P(HostOperationsTest, EditsOnlyWithinARun)
{
    const auto event = makeEvent("A001", "01:00:00:00", "01:00:10:00", "01:00:20:00", "01:00:30:00");
    const std::shared_ptr<core::Cut> cut = adapter().makeCutEvents(event);
    core::CutList cuts;
    host.settings().setCreateVirginTerritories(true);

    EXPECT_EQ(thrownBy([&] { adapter().removeVirginTerritoryMarkers(); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([&] { adapter().processEvent(*cut); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([&] { adapter().completeCadrel(); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([&] { adapter().generateMarkers({}); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([&] { adapter().applyVirginTerritories(cuts); }), Result::NotAvailable);
}

// What the engine asks for.

TEST_P(HostOperationsTest, MakesACutEventForEachTrackOfARun)
{
    host.addTrack(TypeWord::Audio, u"DX");
    const auto locked = host.addTrack(TypeWord::Audio, u"Locked");
    query<ITrackNode>(locked)->setFlag(TrackFlag::Lock, true);
    host.addTrack(TypeWord::Marker, u"Markers");
    const auto event = makeEvent("A001", "01:00:00:00", "01:00:10:00", "01:00:20:00", "01:00:30:00");

    const std::shared_ptr<core::Cut> cut = adapter().makeCutEvents(event);

    ASSERT_EQ(cut->cutEvents().size(), 2U);
    EXPECT_EQ(cut->cutEvents()[0]->getTrackName(), L"DX");
    EXPECT_EQ(cut->cutEvents()[1]->getTrackName(), L"Markers");
    EXPECT_EQ(cut->cutEvents()[0]->srcIn(), host.onClock(0.0));
    EXPECT_EQ(cut->cutEvents()[0]->srcOut(), host.onClock(10.0));
    EXPECT_EQ(cut->cutEvents()[0]->dstIn(), host.onClock(20.0));
    EXPECT_EQ(cut->cutEvents()[0]->dstOut(), host.onClock(30.0));
}

TEST_P(HostOperationsTest, TellsTheEngineOfTheModel)
{
    adapter().setPreviewActive(true);

    const core::CadrelRunState run = adapter().getRunState();
    const core::CadrelPreviewState preview = adapter().getPreviewState();

    EXPECT_EQ(run.oldEvents, &host.model().oldEdl());
    EXPECT_EQ(run.newEvents, &host.model().newEdl());
    EXPECT_EQ(run.settings, &host.settings());
    EXPECT_EQ(run.framerate.framesPerSecond, 25);
    EXPECT_EQ(run.previewOffset, 86400.0);
    EXPECT_EQ(preview.settings, &host.settings());
    EXPECT_EQ(preview.framerate.framesPerSecond, 25);
}

TEST_P(HostOperationsTest, EstimatesAStepForEachEventOnEachTrack)
{
    host.addTrack(TypeWord::Audio, u"DX 1");
    host.addTrack(TypeWord::Audio, u"DX 2");
    const auto selected = host.addTrack(TypeWord::Audio, u"DX 3");
    dynamic_cast<standin::Node&>(*selected).setSelected(true);
    core::Settings settings(host.settings());

    EXPECT_EQ(adapter().estimateSteps(5, settings, 77), 5U * 3U);

    settings.setCreateVirginTerritories(true);
    EXPECT_EQ(adapter().estimateSteps(5, settings, 77), 2U * 5U * 3U);

    const auto locked = host.addTrack(TypeWord::Audio, u"Locked");
    dynamic_cast<standin::Node&>(*locked).setSelected(true);
    query<ITrackNode>(locked)->setFlag(TrackFlag::Lock, true);
    EXPECT_EQ(adapter().estimateSteps(5, settings, 77), 2U * 5U * 3U) << "Nothing is done there.";

    settings.setApplyTo(ApplyTo::SelectedTracks);
    EXPECT_EQ(adapter().estimateSteps(5, settings, 77), 2U * 5U);

    carryOverTwo();
    host.settings().setApplyTo(ApplyTo::AllTracks);
    ASSERT_EQ(adapter().startCadrel(), Result::Ok);
    EXPECT_EQ(adapter().estimateSteps(5, settings, 77), 2U * 6U) << "A run that is requested is a step more.";
}

TEST_P(HostOperationsTest, AddsTheStepsOfTheDetection)
{
    host.addTrack(TypeWord::Audio, u"DX 1");
    host.addTrack(TypeWord::Audio, u"DX 2");
    core::Settings settings(host.settings());
    settings.setCreateInsertMarkers(true);
    settings.setCreateOverlapMarkers(true);

    // Three steps for the inserts, and one an event for the overlaps.
    EXPECT_EQ(adapter().estimateSteps(5, settings, 0), 3U + 5U + 5U * 2U);

    // A step for each event on each of the host's tracks, whatever number is given.
    settings.setCreateAutomationWarningMarkers(true);
    EXPECT_EQ(adapter().estimateSteps(5, settings, 77), 3U + 5U + 10U + 5U * 2U);
}

// The undo scopes of the window.

TEST_P(HostOperationsTest, MakesAnUndoEntryOfAChangeOfTheModel)
{
    {
        const auto command = core::createDataModelCommand(L"Delete Change EDL");
        ASSERT_NE(command, nullptr);
        carryOverTwo();
    }

    EXPECT_EQ(host.undoNames(), AdaptedHost::Entries{u"Delete Change EDL"});
    ASSERT_TRUE(host.undo());
    EXPECT_TRUE(host.model().changeEdl().isEmpty());
}

TEST_P(HostOperationsTest, GoesOnWithoutUndoWhenThereIsNoProject)
{
    host.application.activateProject(nullptr);

    EXPECT_EQ(core::createDataModelCommand(L"Delete Change EDL"), nullptr);
}

} // namespace cadrel::host::tests
