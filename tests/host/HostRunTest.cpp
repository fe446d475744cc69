// SPDX-License-Identifier: GPL-3.0-or-later

// A run from its request to the undo list, on the tracks of a project.

#include "core/cut/Cut.h"
#include "core/notify/ChangeContext.h"
#include "core/protect/RunRecord.h"
#include "host/Host.h"
#include "host/border/HostFailure.h"
#include "host/project/Project.h"
#include "host/track/TrackRole.h"
#include "host/undo/RunNoteStep.h"
#include "standin/project/AutomationPoint.h"
#include "standin/project/Track.h"
#include "standin/services/IdleManager.h"
#include "tests/host/project/AlteredEdits.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/host/AdaptedHost.h"
#include "tests/support/host/UnmarkedPoint.h"
#include "tests/support/host/WatchedProgress.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Attributes.h"
#include "velmark/Transport.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <functional>
#include <limits>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using core::ChangeContext;
using util::Result;

using Texts = std::vector<std::string>;
using Tracks = std::vector<std::wstring>;
using Entries = AdaptedHost::Entries;

/// What the listeners are told that has to do with runs.
class ActionListener : public core::ChangeContextListenerInterface {
public:
    std::vector<std::int32_t> actions;
    std::vector<Result::Type> results;
    std::vector<bool> dropped;

    void onChange(const ChangeContext& context) override
    {
        const auto* action = dynamic_cast<const core::ActionChangeContext*>(&context);
        if (!action)
            return;
        actions.push_back(action->action);
        results.push_back(action->result);
        dropped.push_back(action->isDropped);
    }
};

using Results = std::vector<Result::Type>;

/// A transport that tells when it is stopped.
class StoppedTransport : public Implements<StoppedTransport, FObject, ITransportControl> {
public:
    static constexpr const char* ClassName = "StoppedTransport";

    int stops = 0;
    int32 answer = ResultOk;

    IParameter* getParameter(const char*) override { return nullptr; }
    double getPosition() override { return 0.0; }
    int32 setPosition(double) override { return ResultOk; }
    int32 stop() override
    {
        ++stops;
        return answer;
    }
};

/// Knows one word of another language.
class GermanTranslations : public Implements<GermanTranslations, FObject, ITranslationService> {
public:
    static constexpr const char* ClassName = "GermanTranslations";

    int32 addTable(BundleHandle, const char*, const char*) override { return ResultOk; }
    const char16_t* translate(const char16_t* text) override
    {
        return std::u16string_view(text) == u"Apply Cadrel" ? u"Cadrel anwenden" : text;
    }
};

/// Actions of a host that carries out none.
class RefusingActions : public Implements<RefusingActions, FObject, IActionManager> {
public:
    static constexpr const char* ClassName = "RefusingActions";

    int32 addHandler(IActionHandler*) override { return ResultFalse; }
    int32 removeHandler(IActionHandler*) override { return ResultFalse; }
    int32 invoke(const char*, const char*, int32) override { return ResultFalse; }
};

/// Alerts whose user does something before he goes on.
class WatchedAlerts : public Implements<WatchedAlerts, FObject, IAlertService> {
public:
    static constexpr const char* ClassName = "WatchedAlerts";

    std::function<void()> whenShown;

    int32 show(const char16_t*, const char16_t*, const char16_t*, const char16_t*) override
    {
        whenShown();
        return 1;
    }
};

/// A film of two clips of ten seconds that change places.
class HostRunTest : public AtEachOrigin {
protected:
    HostRunTest()
    {
        host.addSound(track, u"one", 0.0, 10.0);
        host.addSound(track, u"two", 10.0, 20.0);
        host.switchMarkersOff();
        host.carryOver("01:00:00:00", "01:00:10:00", "01:00:10:00", "01:00:20:00");
        host.carryOver("01:00:10:00", "01:00:20:00", "01:00:00:00", "01:00:10:00");
        host.adapter().addListener(&heard);
        entriesBefore = host.undoNames();
    }
    ~HostRunTest() override { host.adapter().removeListener(&heard); }

    core::EventList listOfFirst()
    {
        core::EventList list;
        list.add(host.model().changeEdl().eventAt(0));
        return list;
    }
    Entries entriesBeforeAnd(std::initializer_list<std::u16string> names) const
    {
        Entries entries = entriesBefore;
        entries.insert(entries.end(), names);
        return entries;
    }
    /// The progress that the runs from now on have.
    Counted<WatchedProgress> watch()
    {
        auto progress = makeCounted<WatchedProgress>();
        host.altered.replace(IProgressService::iid, progress);
        return progress;
    }
    /// The tracks that a run would change, as the adapter sees them.
    Tracks candidates()
    {
        const auto cut = host.adapter().makeCutEvents(host.model().changeEdl().eventAt(0));
        Tracks names;
        for (const auto& cutEvent : cut->cutEvents())
            names.push_back(cutEvent->getTrackName());
        return names;
    }
    /// Requests a run, so that the preview offset is there: the bytes that it begins with.
    std::string requestRun()
    {
        EXPECT_EQ(host.adapter().startCadrel(), Result::Ok);
        return host.bytes();
    }

    AdaptedHost host{GetParam()};
    ActionListener heard;
    AdaptedHost::Node track = host.addTrack(TypeWord::Audio, u"DX");
    Entries entriesBefore;
};

INSTANTIATE_TEST_SUITE_P(Origins, HostRunTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(HostRunTest, CarriesTheMaterialOver)
{
    host.conform();

    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
    EXPECT_EQ(heard.actions, std::vector<std::int32_t>{1});
    EXPECT_EQ(heard.results, Results{Result::Ok});
    EXPECT_EQ(heard.dropped, std::vector<bool>{false});
    EXPECT_FALSE(host.isEditOpen());
}

TEST_P(HostRunTest, IsOneEntryThatUndoAndRedoTakeToTheSameBytes)
{
    host.settings().setCreateDestinationMarkers(true);
    host.settings().setCreateInsertMarkers(true);
    const std::string before = requestRun();

    host.idle();
    const std::string after = host.bytes();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel"}));
    ASSERT_NE(before, after);
    for (int round = 0; round < 2; ++round) {
        ASSERT_TRUE(host.undo());
        EXPECT_EQ(host.bytes(), before);
        ASSERT_TRUE(host.redo());
        EXPECT_EQ(host.bytes(), after);
    }
}

TEST_P(HostRunTest, RunsOncePerRequest)
{
    host.conform();
    host.idle();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel"}));
    EXPECT_EQ(heard.actions.size(), 1U);
}

TEST_P(HostRunTest, CanBeMadeAgain)
{
    host.conform();
    host.conform();

    // Changed places twice.
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel", u"Apply Cadrel"}));
}

TEST_P(HostRunTest, IsNotedInTheModelAndItsUndoTakesTheNoteBack)
{
    host.conform();
    const auto isDone = [this] {
        const auto noted = core::RunRecord::find(host.model());
        return noted && noted->haveCarriedOut(host.model().changeEdl(), true);
    };

    EXPECT_TRUE(isDone());
    ASSERT_TRUE(host.undo());
    EXPECT_FALSE(isDone());
    ASSERT_TRUE(host.redo());
    EXPECT_TRUE(isDone());
}

TEST_P(HostRunTest, ItsUndoTakesTheNoteBackAlsoWhereTheHostRefusesTheStepOfTheModel)
{
    const auto edits = makeCounted<AlteredEdits>(host.context());
    int refused = 0;
    edits->addsStep = [&](IEditStep* step) {
        const bool isOfTheModel = dynamic_cast<DataModelEditStep*>(step) != nullptr;
        refused += isOfTheModel ? 1 : 0;
        return !isOfTheModel;
    };
    host.altered.replace(IEditService::iid, edits);
    host.conform();
    ASSERT_EQ(refused, 1);
    ASSERT_EQ(host.undoNames().back(), u"Apply Cadrel");
    ASSERT_TRUE(core::RunRecord::find(host.model()));

    for (int round = 0; round < 2; ++round) {
        ASSERT_TRUE(host.undo());
        EXPECT_FALSE(core::RunRecord::find(host.model()));
        EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
        ASSERT_TRUE(host.redo());
        EXPECT_TRUE(core::RunRecord::find(host.model()));
    }
}

TEST_P(HostRunTest, SaysThatItIsIncompleteWhereItsNoteCannotFollowTheUndoList)
{
    const auto edits = makeCounted<AlteredEdits>(host.context());
    edits->addsStep = [](IEditStep* step) { return dynamic_cast<RunNoteStep*>(step) == nullptr; };
    host.altered.replace(IEditService::iid, edits);

    host.conform();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel (incomplete)"}));
    EXPECT_EQ(heard.results, Results{Result::HostCallFailed});
    EXPECT_FALSE(core::RunRecord::find(host.model()));
}

TEST_P(HostRunTest, IsNotedForWhatTheUserLetsChangeAndNotForTheBoundsOfItsRequest)
{
    host.settings().setRestrictRange(true);
    host.settings().setPreserveMaterial(AdaptedHost::onClock(0.0), AdaptedHost::onClock(12.0));
    ASSERT_EQ(host.adapter().startCadrelWithin({AdaptedHost::onClock(5.0), AdaptedHost::onClock(10.0)}), Result::Ok);
    host.idle();

    const auto noted = core::RunRecord::find(host.model());
    ASSERT_TRUE(noted);
    const auto isDoneFrom = [&](double start, double end) {
        const core::FrameRange range{static_cast<std::int32_t>(25 * AdaptedHost::onClock(start)),
                                     static_cast<std::int32_t>(25 * AdaptedHost::onClock(end))};
        return noted->haveCarriedOut(host.model().changeEdl(), true, range);
    };
    EXPECT_TRUE(isDoneFrom(0.0, 5.0));
    EXPECT_TRUE(isDoneFrom(11.0, 12.0));
    EXPECT_FALSE(isDoneFrom(12.0, 20.0));
}

TEST_P(HostRunTest, IsNotNotedWhenItFails)
{
    requestRun();
    host.altered.hide(ClassId::ObjectList);
    host.idle();

    ASSERT_EQ(heard.results, Results{Result::HostObjectMissing});
    EXPECT_FALSE(core::RunRecord::find(host.model()));
}

TEST_P(HostRunTest, IsNotNotedWhenTheUserCancelsIt)
{
    const auto progress = watch();
    progress->whenCalled = [&] {
        if (host.isEditOpen())
            progress->cancel();
    };
    host.conform();

    ASSERT_EQ(heard.results, Results{Result::Cancelled});
    EXPECT_FALSE(core::RunRecord::find(host.model()));
}

TEST_P(HostRunTest, ANoteThatCannotBeReadDoesNotKeepItFromBeingDoneAndStaysAsItIs)
{
    host.model().setProperty(core::PropertyKey::DoneRuns, core::Variant("no bytes of runs"));
    host.conform();

    EXPECT_EQ(heard.results, Results{Result::Ok});
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel"}));
    core::Variant note;
    ASSERT_EQ(host.model().getProperty(core::PropertyKey::DoneRuns, note), Result::Ok);
    EXPECT_EQ(note.toText(), "no bytes of runs");
}

TEST_P(HostRunTest, APreviewIsNoRun)
{
    host.preview(host.model().changeEdl());

    ASSERT_EQ(heard.results, Results{Result::Ok});
    EXPECT_FALSE(core::RunRecord::find(host.model()));
}

//     film           0         10         20         30
//     first run      |--- 2 ---|---- 1 ---|            markers of its own on "Destination"
//     second run     |--- 2 ---|---- 1 ---|            and not a second time
TEST_P(HostRunTest, PutsItsMarkersInThePlaceOfThoseOfAnEarlierRun)
{
    host.settings().setCreateDestinationMarkers(true);
    const Texts once{"Event: 2 - A001  0-10", "Event: 1 - A001  10-20"};
    host.conform();
    const auto destinations = host.trackNamed(u"Destination");
    const auto memos = host.trackNamed(u"Memos");
    host.addPointMarker(memos, u"memo", host.inHost(5.0));
    const std::string before = host.dump();

    host.conform();

    EXPECT_EQ(host.contentOf(destinations), once);
    EXPECT_EQ(host.contentOf(memos), Texts{"memo 15-15"});
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.dump(), before);

    // What a preview holds locked is the system's own.
    host.adapter().setPreviewActive(true);
    host.preview(host.model().changeEdl());
    ASSERT_EQ(query<ITrackNode>(destinations)->getFlag(TrackFlag::Lock), ResultOk);
    host.conform();
    EXPECT_EQ(host.contentOf(destinations), once);
    host.adapter().setPreviewActive(false);

    host.settings().setCreateDestinationMarkers(false);
    host.conform();
    EXPECT_EQ(host.contentOf(destinations), Texts());
}

TEST_P(HostRunTest, LeavesTheMarkersOfAnEarlierRunOnATrackThatTheUserHasLocked)
{
    host.settings().setCreateDestinationMarkers(true);
    host.conform();
    const auto destinations = host.trackNamed(u"Destination");
    const Texts once = host.contentOf(destinations);
    query<ITrackNode>(destinations)->setFlag(TrackFlag::Lock, true);
    host.model().changeEdl().clear();
    host.carryOver("01:00:00:00", "01:00:20:00", "01:00:00:00", "01:00:20:00");

    host.conform();

    EXPECT_EQ(host.contentOf(destinations), once);
}

TEST_P(HostRunTest, APreviewShowsItsOwnMarkersAlone)
{
    host.settings().setCreateDestinationMarkers(true);
    host.conform();
    const auto destinations = host.trackNamed(u"Destination");
    ASSERT_EQ(host.contentOf(destinations).size(), 2U);

    host.adapter().setPreviewActive(true);
    host.preview(host.model().changeEdl());
    EXPECT_EQ(host.contentOf(destinations).size(), 4U);

    host.adapter().setPreviewActive(false);
    EXPECT_EQ(host.contentOf(destinations), (Texts{"Event: 2 - A001  0-10", "Event: 1 - A001  10-20"}));
}

TEST_P(HostRunTest, MakesTheTracksOfTheMarkersThatAreOn)
{
    host.settings().setCreateDestinationMarkers(true);
    host.settings().setCreateOverlapMarkers(true);

    host.conform();

    const auto folder = host.trackNamed(u"Cadrel Markers");
    ASSERT_TRUE(folder);
    EXPECT_EQ(standin::tests::namesOf(*folder), (Entries{u"Destination", u"Overlap", u"Memos"}));
    EXPECT_EQ(host.contentOf(host.trackNamed(u"Destination")),
              (Texts{"Event: 2 - A001  0-10", "Event: 1 - A001  10-20"}));
}

TEST_P(HostRunTest, BringsTheMarkersToTheNewProgramme)
{
    host.settings().setCreateInsertMarkers(true);
    const auto shot = cadrel::tests::makeEvent("B002", "02:00:00:00", "02:00:05:00", "01:00:20:00", "01:00:25:00", 3);
    host.model().newEdl().add(shot);
    const auto progress = watch();

    host.conform();

    EXPECT_EQ(std::ranges::count(progress->calls, "setRange 1"), 1) << "A stage of one marker.";
    // What no change event covers is new: the whole of the one new shot.
    const Texts inserts = host.contentOf(host.trackNamed(u"Insert"));
    ASSERT_EQ(inserts.size(), 1U);
    EXPECT_TRUE(inserts.front().ends_with(" 20-25")) << inserts.front();
}

TEST_P(HostRunTest, JoinsWhatTheCutsHaveLeftOfAClip)
{
    // Nothing moves here, but the clip goes over in two pieces.
    host.model().changeEdl().clear();
    host.carryOver("01:00:00:00", "01:00:05:00", "01:00:00:00", "01:00:05:00");
    host.carryOver("01:00:05:00", "01:00:20:00", "01:00:05:00", "01:00:20:00");

    host.conform();

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
}

TEST_P(HostRunTest, ChangesTheSelectedTracksAlone)
{
    const auto other = host.addTrack(TypeWord::Audio, u"FX");
    host.addSound(other, u"door", 0.0, 2.0);
    dynamic_cast<standin::Node&>(*track).setSelected(true);
    host.settings().setApplyTo(core::ApplyTo::SelectedTracks);

    host.conform();

    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
    EXPECT_EQ(host.contentOf(other), Texts{"door 0-2"});
}

TEST_P(HostRunTest, JoinsNothingOnATrackThatTakesNoPart)
{
    const auto other = host.addTrack(TypeWord::Audio, u"FX");
    host.addSound(other, u"door", 0.0, 10.0);
    // Written over itself it is in two pieces.
    host.edit(u"Split", [&] {
        const auto tracks = create<IObjectList>(host.context());
        tracks->add(other.get(), 0);
        host.editService()->copyRange(host.document(), tracks.get(), 0, host.inHost(0.0), host.inHost(5.0),
                                      host.inHost(0.0));
    });
    const Texts pieces{"door 0-5", "door 5-10"};
    ASSERT_EQ(host.contentOf(other), pieces);
    dynamic_cast<standin::Node&>(*track).setSelected(true);
    host.settings().setApplyTo(core::ApplyTo::SelectedTracks);

    host.conform();
    EXPECT_EQ(host.contentOf(other), pieces);

    // They are two that it would join.
    host.model().changeEdl().clear();
    host.carryOver("01:00:00:00", "01:00:20:00", "01:00:00:00", "01:00:20:00");
    host.settings().setApplyTo(core::ApplyTo::AllTracks);
    host.conform();
    EXPECT_EQ(host.contentOf(other), Texts{"door 0-10"});
}

TEST_P(HostRunTest, FindsThePlaceOfThePreviewAgainThatWasLostSinceItsRequest)
{
    requestRun();
    host.model().removeProperty(core::PropertyKey::PreviewOffset);

    host.idle();

    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
}

TEST_P(HostRunTest, ChangesOnlyTheRangeToWhichItIsRestricted)
{
    host.addSound(track, u"three", 30.0, 40.0);
    host.settings().setRestrictRange(true);
    host.settings().setPreserveMaterial(host.onClock(0.0), host.onClock(10.0));

    host.conform();

    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "two 10-20", "three 30-40"}));
}

//     film       0       5         10         20
//     before     |------ 1 --------|---- 2 ----|
//     bounds             |---------|
//     after      |-- 1 --|--- 2 ---|---- 2 ----|
TEST_P(HostRunTest, ChangesNothingOutsideOfTheBoundsOfItsRequest)
{
    const bool wasRestricted = host.settings().restrictRange();
    ASSERT_EQ(host.adapter().startCadrelWithin({AdaptedHost::onClock(5.0), AdaptedHost::onClock(10.0)}), Result::Ok);
    host.idle();

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-5", "two 5-10", "two 10-20"}));
    EXPECT_EQ(heard.results, Results{Result::Ok});
    EXPECT_EQ(host.settings().restrictRange(), wasRestricted);
}

TEST_P(HostRunTest, HasTheBoundsOfItsOwnRequestAlone)
{
    ASSERT_EQ(host.adapter().startCadrelWithin({AdaptedHost::onClock(5.0), AdaptedHost::onClock(10.0)}), Result::Ok);
    ASSERT_EQ(host.adapter().startCadrel(), Result::Ok);
    host.idle();

    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
}

//     film         0         10         20
//     before       |--- 1 ---|--- 2 ---|
//     its list               |--- 1 ---|
//     after        |--- 1 ---|--- 1 ---|
TEST_P(HostRunTest, IsOneEntryOfTheUndoListTogetherWithTheListOfItsRequest)
{
    const auto listed = [this] {
        Texts texts;
        for (const auto& event : host.model().changeEdl().events())
            texts.push_back(event->srcIn().toString() + " " + event->dstIn().toString());
        return texts;
    };
    const Texts before = listed();
    ASSERT_EQ(before.size(), 2U);
    const core::EventList first(listOfFirst());
    ASSERT_EQ(host.adapter().startCadrelWithin({AdaptedHost::onClock(10.0), AdaptedHost::onClock(20.0)}, first),
              Result::Ok);
    EXPECT_EQ(listed(), before) << "It changes with the run.";
    host.idle();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel"}));
    for (int round = 0; round < 2; ++round) {
        EXPECT_EQ(listed(), Texts{"01:00:00:00 01:00:10:00"});
        EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "one 10-20"}));
        ASSERT_TRUE(host.undo());
        EXPECT_EQ(listed(), before);
        EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
        ASSERT_TRUE(host.redo());
    }
}

TEST_P(HostRunTest, LeavesTheListAsItIsWhenItIsCancelledOrItsRequestIsDropped)
{
    const std::string before = requestRun();
    const auto request = [this] {
        return host.adapter().startCadrelWithin({AdaptedHost::onClock(10.0), AdaptedHost::onClock(20.0)},
                                                listOfFirst());
    };
    ASSERT_EQ(request(), Result::Ok);
    host.adapter().setPreviewActive(false);
    host.idle();
    EXPECT_EQ(host.model().changeEdl().size(), 2U);
    EXPECT_EQ(host.undoNames(), entriesBefore);
    EXPECT_EQ(heard.dropped, std::vector{true});

    const auto progress = watch();
    progress->whenCalled = [&] {
        if (host.isEditOpen())
            progress->cancel();
    };
    ASSERT_EQ(request(), Result::Ok);
    host.idle();
    EXPECT_EQ(heard.results.back(), Result::Cancelled);
    EXPECT_EQ(host.model().changeEdl().size(), 2U);
    EXPECT_EQ(host.undoNames(), entriesBefore);
    EXPECT_EQ(host.bytes(), before);
}

TEST_P(HostRunTest, HasTheListOfItsOwnRequestAlone)
{
    ASSERT_EQ(host.adapter().startCadrelWithin({AdaptedHost::onClock(10.0), AdaptedHost::onClock(20.0)}, listOfFirst()),
              Result::Ok);
    ASSERT_EQ(host.adapter().startCadrel(), Result::Ok);
    host.idle();

    EXPECT_EQ(host.model().changeEdl().size(), 2U);
    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
}

TEST_P(HostRunTest, TakesItsListBackWithTheUndoOfWhatItHasDoneBeforeItFailed)
{
    ASSERT_EQ(host.adapter().startCadrelWithin({AdaptedHost::onClock(10.0), AdaptedHost::onClock(20.0)}, listOfFirst()),
              Result::Ok);
    host.altered.hide(ClassId::ObjectList);
    host.idle();

    ASSERT_EQ(heard.results, Results{Result::HostObjectMissing});
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel (incomplete)"}));
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.model().changeEdl().size(), 2U);
}

TEST_P(HostRunTest, TellsWhatStandsOnTheTracksThatItChanges)
{
    const auto other = host.addTrack(TypeWord::Audio, u"FX");
    host.addSound(other, u"three", 30.0, 40.0);
    const auto locked = host.addTrack(TypeWord::Audio, u"MX");
    host.addSound(locked, u"four", 50.0, 60.0);
    query<ITrackNode>(locked)->setFlag(TrackFlag::Lock, true);
    using Material = std::vector<core::SecondsRange>;
    const auto material = [this] {
        Material found = host.adapter().getMaterial();
        std::ranges::sort(found, {}, &core::SecondsRange::start);
        return found;
    };
    const auto onFilm = [](double start, double end) {
        return core::SecondsRange{AdaptedHost::onClock(start), AdaptedHost::onClock(end)};
    };

    EXPECT_EQ(material(), (Material{onFilm(0, 10), onFilm(10, 20), onFilm(30, 40)}));
    host.settings().setApplyTo(core::ApplyTo::SelectedTracks);
    EXPECT_EQ(material(), Material());
}

TEST_P(HostRunTest, TellsOfEveryKindOfThingThatARunTakesAway)
{
    host.addPart(track, u"part", host.inHost(30.0), host.inHost(35.0));
    const auto picture = host.addTrack(TypeWord::Video, u"VIDEO");
    host.addClip(picture, u"shot", host.inHost(40.0), host.inHost(45.0));
    const auto markers = host.addTrack(TypeWord::Marker, u"Notes");
    host.addPointMarker(markers, u"note", host.inHost(50.0));
    host.addRangeMarker(markers, u"scene", host.inHost(52.0), host.inHost(58.0));
    host.addPoint(track, standin::Envelope::Curve::Volume, host.inHost(60.0), 0.5F);

    auto material = host.adapter().getMaterial();
    std::ranges::sort(material, {}, &core::SecondsRange::start);
    ASSERT_EQ(material.size(), 7U);
    const std::vector<std::pair<double, double>> expected{{0, 10},  {10, 20}, {30, 35}, {40, 45},
                                                          {50, 50}, {52, 58}, {60, 60}};
    for (std::size_t index = 0; index < expected.size(); ++index) {
        EXPECT_DOUBLE_EQ(material[index].start, AdaptedHost::onClock(expected[index].first)) << index;
        EXPECT_DOUBLE_EQ(material[index].end, AdaptedHost::onClock(expected[index].second)) << index;
    }
}

TEST_P(HostRunTest, LeavesNoAutomationBehindInThePreview)
{
    // The second half of the film goes far behind its end, and no event makes the project end there.
    host.addPoint(track, standin::Envelope::Curve::Volume, host.inHost(2.0), 0.25F);
    host.addPoint(track, standin::Envelope::Curve::Volume, host.inHost(18.0), 0.75F);
    host.model().changeEdl().clear();
    host.carryOver("01:00:00:00", "01:00:10:00", "01:00:00:00", "01:00:10:00");
    host.carryOver("01:00:10:00", "01:00:20:00", "01:30:00:00", "01:30:10:00");
    host.settings().setRestrictRange(true);
    host.settings().setPreserveMaterial(host.onClock(0.0), host.onClock(10.0));

    host.conform();

    // What is carried over runs as what was there, on into what stays.
    const auto points = standin::tests::childrenOf(*host.curveOf(track, standin::Envelope::Curve::Volume));
    ASSERT_EQ(points.size(), 2U);
    EXPECT_EQ(points[0]->getStart(nullptr), host.inHost(2.0));
    EXPECT_EQ(query<IAutomationPoint>(points[0])->getValue(), 0.25F);
    EXPECT_EQ(points[1]->getStart(nullptr), host.inHost(18.0));
    EXPECT_EQ(query<IAutomationPoint>(points[1])->getValue(), 0.75F);
}

TEST(HostRunRange, LosesNothingWhereItsBoundsReachPastTheDayThatTimecodesName)
{
    for (const double after : {86400.0, 86400.04, 86486.36, std::numeric_limits<double>::infinity()}) {
        SCOPED_TRACE(after);
        AdaptedHost host(0.0);
        const auto track = host.addTrack(TypeWord::Audio, u"DX");
        host.addClip(track, u"one", 0.0, 10.0);
        host.addClip(track, u"two", 10.0, 20.0);
        host.switchMarkersOff();
        host.carryOver("00:00:00:00", "00:00:10:00", "00:00:10:00", "00:00:20:00");
        host.carryOver("00:00:10:00", "00:00:20:00", "00:00:00:00", "00:00:10:00");
        host.settings().setRestrictRange(true);
        host.settings().setPreserveMaterial(0.0, after);

        host.conform();

        EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
        // This film stands an hour before the others.
        EXPECT_EQ(host.contentOf(track), (Texts{"two -3600--3590", "one -3590--3580"}));
    }
}

TEST_P(HostRunTest, IsRefusedWhereTheStoredBoundsAreNoNumbersOrTheWrongWayRound)
{
    constexpr double NoNumber = std::numeric_limits<double>::quiet_NaN();
    host.settings().setRestrictRange(true);
    for (const auto& [before, after] : {std::pair(0.0, NoNumber), std::pair(NoNumber, 86400.0),
                                        std::pair(NoNumber, NoNumber), std::pair(86400.0, 0.0)}) {
        SCOPED_TRACE(std::to_string(before) + " to " + std::to_string(after));
        host.settings().set(&core::Settings::preserveMaterialBefore, before);
        host.settings().set(&core::Settings::preserveMaterialAfter, after);

        EXPECT_EQ(host.adapter().startCadrel(), Result::CorruptData);
        EXPECT_EQ(host.adapter().startCadrelWithin({host.onClock(0.0), host.onClock(20.0)}), Result::CorruptData);
        host.idle();

        EXPECT_EQ(host.undoNames(), entriesBefore);
        EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
        EXPECT_FALSE(core::RunRecord::find(host.model()));
    }
    EXPECT_EQ(heard.results, Results{});

    host.settings().setRestrictRange(false);
    host.conform();
    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
}

TEST_P(HostRunTest, ReplacesNothingBetweenBoundsPastAllTimesAndIsNotedForNone)
{
    constexpr double Infinity = std::numeric_limits<double>::infinity();
    host.settings().setRestrictRange(true);
    for (const double bound : {Infinity, -Infinity}) {
        host.settings().set(&core::Settings::preserveMaterialBefore, bound);
        host.settings().set(&core::Settings::preserveMaterialAfter, bound);

        host.conform();

        EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
        EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
        const auto noted = core::RunRecord::find(host.model());
        EXPECT_FALSE(noted && noted->haveCarriedOut(host.model().changeEdl(), true));
    }
}

TEST(HostRunRange, LeavesNothingBehindThatWouldStandPastTheDayThatTimecodesName)
{
    AdaptedHost host(86340.0);
    const auto track = host.addTrack(TypeWord::Audio, u"DX");
    host.addClip(track, u"one", 0.0, 30.0);
    host.switchMarkersOff();
    // Ten seconds of the source come after the end of the day.
    host.carryOver("23:59:00:00", "23:59:20:00", "23:59:50:00", "23:59:59:24");

    host.conform();

    EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
    // The clock begins 82740 s after the other films.
    EXPECT_EQ(host.contentOf(track), (Texts{"one 82790-82800"}));
    EXPECT_NE(track->hasAttribute(AttributeKey::Preview), ResultOk);
    EXPECT_NE(track->hasAttribute(AttributeKey::PreviewEvents), ResultOk);
}

TEST_P(HostRunTest, AddsNoPointsToTheCurvesThatCountAsTheUsers)
{
    constexpr auto volume = standin::Envelope::Curve::Volume;
    using Points = std::vector<std::pair<double, float>>;
    const auto set = [this](const Points& points) {
        Points inHost;
        for (const auto& [time, value] : points)
            inHost.emplace_back(host.inHost(time), value);
        return inHost;
    };
    const Points before = set({{2.0, 0.5F}, {5.0, 0.8F}, {18.0, 0.8F}, {19.0, 0.0F}});
    for (const auto& [time, value] : before)
        host.addPoint(track, volume, time, value);
    // The host knows which ones it has put at the edges of what was copied.
    const auto users = [&] {
        Points found;
        for (const AdaptedHost::Node& child : standin::tests::childrenOf(*host.curveOf(track, volume))) {
            auto& point = dynamic_cast<standin::AutomationPoint&>(*child);
            if (!point.isHolding())
                found.emplace_back(point.start(), point.getValue());
        }
        return found;
    };

    for (int round = 0; round < 3; ++round) {
        host.conform();
        EXPECT_EQ(users(), set({{8.0, 0.8F}, {9.0, 0.0F}, {12.0, 0.5F}, {15.0, 0.8F}}));
        host.conform();
        EXPECT_EQ(users(), before);
    }
}

TEST_P(HostRunTest, StoresTheUsersBoundsWhenItIsSavedWhileARunWithinOthersGoesOn)
{
    host.settings().setPreserveMaterial(3.0, 4.0);
    const auto progress = watch();
    progress->whenCalled = [&] {
        if (progress->calls.back().find("Event: 1") != std::string::npos)
            host.project.announceStoring();
    };
    ASSERT_EQ(host.adapter().startCadrelWithin({host.onClock(0.0), host.onClock(20.0)}), Result::Ok);

    host.idle();
    host.adapter().removeListener(&heard);
    host.disconnect();
    host.connect();

    EXPECT_FALSE(host.settings().restrictRange());
    EXPECT_EQ(host.settings().preserveMaterialBefore(), 3.0);
    EXPECT_EQ(host.settings().preserveMaterialAfter(), 4.0);
}

TEST_P(HostRunTest, MakesTheMemosAnewThatTheUserRemovesWhileItsAlertIsUp)
{
    host.model().videoList().add(
        core::VideoList::Entry("/picture/reel3_v12.mov", core::Timecode("01:00:00:00"), core::Timecode("00:00:20:00")),
        false);
    host.project.setTimeOrigin(3606.0);
    host.idle();
    const auto alerts = makeCounted<WatchedAlerts>();
    int shown = 0;
    alerts->whenShown = [&] {
        if (++shown > 1)
            return;
        const AdaptedHost::Node memos = host.trackNamed(u"Memos");
        host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(memos->getParent(), memos.get())); });
    };
    host.altered.unhide(IAlertService::iid);
    host.altered.replace(IAlertService::iid, alerts);
    host.conform();
    ASSERT_GE(shown, 1);
    ASSERT_FALSE(host.trackNamed(u"Memos"));

    host.conform();

    EXPECT_EQ(heard.results, (Results{Result::Ok, Result::Ok}));
    EXPECT_TRUE(host.trackNamed(u"Memos"));
}

TEST_P(HostRunTest, MakesTheMemosAnewThatTheUserRemovesWhileItsProgressCloses)
{
    const auto progress = watch();
    bool hasRemoved = false;
    progress->whenCalled = [&] {
        if (progress->calls.back() != "end" || std::exchange(hasRemoved, true))
            return;
        const AdaptedHost::Node memos = host.trackNamed(u"Memos");
        host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(memos->getParent(), memos.get())); });
    };
    host.conform();
    ASSERT_TRUE(hasRemoved);
    ASSERT_FALSE(host.trackNamed(u"Memos"));

    host.conform();

    EXPECT_EQ(heard.results, (Results{Result::Ok, Result::Ok}));
    EXPECT_TRUE(host.trackNamed(u"Memos"));
}

TEST_P(HostRunTest, HoldsTheAutomationWhereTheHostsPointsTakeNoMarks)
{
    constexpr auto volume = standin::Envelope::Curve::Volume;
    using Points = std::vector<std::pair<double, float>>;
    for (const auto& [time, value] : {std::pair(2.0, 0.5F), std::pair(8.0, 0.5F), std::pair(8.0, 1.0F)})
        host.addPoint(track, volume, host.inHost(time), value);
    const Entries before = host.undoNames();
    // From 10 s to 12 s there is nothing, and what the curve has come to at 10 s is held.
    host.model().changeEdl().clear();
    host.carryOver("01:00:00:00", "01:00:05:00", "01:00:05:00", "01:00:10:00");
    host.carryOver("01:00:10:00", "01:00:20:00", "01:00:12:00", "01:00:22:00");
    host.altered.makeInstead(ClassId::AutomationPoint, [] { return makeCounted<UnmarkedPoint>(); });

    host.conform();

    EXPECT_EQ(heard.results, Results{Result::Ok});
    EXPECT_EQ(host.undoNames().size(), before.size() + 1);
    Points found;
    for (const AdaptedHost::Node& child : standin::tests::childrenOf(*host.curveOf(track, volume)))
        found.emplace_back(child->getStart(nullptr) - host.inHost(0.0), query<IAutomationPoint>(child)->getValue());
    ASSERT_GE(found.size(), 3U);
    EXPECT_EQ(found[found.size() - 2], (std::pair{12.0, 0.5F}));
    EXPECT_EQ(found.back(), (std::pair{12.0, 1.0F}));
}

TEST_P(HostRunTest, LeavesOutWhatHasNoTimecodes)
{
    host.carryOver("25:00:00:00", "26:00:00:00", "25:00:00:00", "26:00:00:00");

    host.conform();

    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
    EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
}

TEST_P(HostRunTest, CarriesTheRestOverWhereADestinationIsReversed)
{
    const core::Settings defaults;
    host.settings().setCreateDestinationMarkers(defaults.createDestinationMarkers());
    host.settings().setCreateInsertMarkers(true);
    host.carryOver("01:00:00:00", "01:00:05:00", "01:00:40:00", "01:00:35:00");
    host.model().newEdl().add(
        cadrel::tests::makeEvent("B002", "02:00:00:00", "02:00:15:00", "01:00:30:00", "01:00:45:00", 3));

    host.conform();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel"}));
    const Texts inserts = host.contentOf(host.trackNamed(u"Insert"));
    ASSERT_EQ(inserts.size(), 1U);
    EXPECT_TRUE(inserts.front().ends_with(" 30-45")) << inserts.front();
    const Texts content = host.contentOf(track);
    ASSERT_GE(content.size(), 2U);
    EXPECT_EQ(content[0], "two 0-10");
    EXPECT_EQ(content[1], "one 10-20");
    EXPECT_EQ(host.contentOf(host.trackNamed(u"Destination")),
              (Texts{"Event: 2 - A001  0-10", "Event: 1 - A001  10-20", "Event: 3 - A001  35-40"}));
}

TEST_P(HostRunTest, WritesTheNewPictureAtItsPlace)
{
    host.model().videoList().add(
        core::VideoList::Entry("/picture/reel3_v12.mov", core::Timecode("01:00:05:00"), core::Timecode("00:00:04:00")),
        false);

    host.conform();

    const auto video = host.trackNamed(u"New Video");
    ASSERT_TRUE(video);
    const auto events = standin::tests::childrenOf(*video);
    ASSERT_EQ(events.size(), 1U);
    EXPECT_DOUBLE_EQ(events[0]->getStart(nullptr), host.inHost(5.0));
    EXPECT_DOUBLE_EQ(events[0]->getEnd(nullptr), host.inHost(9.0));
}

TEST_P(HostRunTest, TellsThatTheNewPictureIsNotWrittenOnATrackThatTheUserHasLocked)
{
    host.model().videoList().add(
        core::VideoList::Entry("/picture/reel3_v12.mov", core::Timecode("01:00:00:00"), core::Timecode("00:00:20:00")),
        false);
    host.conform();
    EXPECT_TRUE(host.alerts->messages.empty());
    query<ITrackNode>(host.trackNamed(u"New Video"))->setFlag(TrackFlag::Lock, true);

    host.conform();

    const Entries told{u"The track of the new video is locked. The new video hasn't been written."};
    EXPECT_EQ(host.alerts->messages, told);
    EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
    host.preview(host.model().changeEdl());
    EXPECT_EQ(host.alerts->messages.size(), 2U);
}

TEST_P(HostRunTest, LetsTheAutomationRunStraightOverWhatNothingCovers)
{
    host.model().changeEdl().clear();
    host.carryOver("01:00:00:00", "01:00:05:00", "01:00:00:00", "01:00:05:00");
    host.carryOver("01:00:10:00", "01:00:15:00", "01:00:10:00", "01:00:15:00");
    host.addPoint(track, standin::Envelope::Curve::Volume, host.inHost(1.0), 0.25F);
    host.addPoint(track, standin::Envelope::Curve::Volume, host.inHost(12.0), 0.75F);
    host.settings().setCreateVirginTerritories(true);
    const auto progress = watch();

    host.conform();

    EXPECT_EQ(std::ranges::count(progress->calls, "Processing Project - Virgin Territories"), 1);
    const auto& curve = dynamic_cast<standin::Envelope&>(*host.curveOf(track, standin::Envelope::Curve::Volume));
    // On the old line at 5 s and at 10 s, and straight between them.
    const auto onLine = [](double time) { return 0.25 + 0.5 * (time - 1.0) / 11.0; };
    for (const double time : {4.0, 5.0, 7.5, 10.0, 11.0})
        EXPECT_NEAR(curve.valueBehind(host.inHost(time)).value_or(-1.0), onLine(time), 1e-6) << time;
}

//     old film    0.5 -------10------15 0.25 -------28\30 0.0         a fade-out at its end
//     new film    5-- 0.5 --15  ..gap..  20-- 0.25 --28 ..gap.. 40-- the fade --42
TEST_P(HostRunTest, HoldsTheAutomationOverWhatNothingCovers)
{
    constexpr auto volume = standin::Envelope::Curve::Volume;
    host.model().changeEdl().clear();
    host.carryOver("01:00:28:00", "01:00:30:00", "01:00:40:00", "01:00:42:00");
    host.carryOver("01:00:00:00", "01:00:10:00", "01:00:05:00", "01:00:15:00");
    host.carryOver("01:00:20:00", "01:00:28:00", "01:00:20:00", "01:00:28:00");
    for (const auto& [time, value] : {std::pair(2.0, 0.75F), std::pair(8.0, 0.5F), std::pair(11.0, 0.5F),
                                      std::pair(15.0, 0.25F), std::pair(28.0, 0.25F), std::pair(30.0, 0.0F)})
        host.addPoint(track, volume, host.inHost(time), value);
    const auto untouched = host.addTrack(TypeWord::Audio, u"Guide");
    host.addPoint(untouched, volume, host.inHost(8.0), 0.5F);
    host.addPoint(untouched, volume, host.inHost(9.0), 0.0F);
    query<ITrackNode>(untouched)->setFlag(TrackFlag::Lock, true);
    host.settings().setCreateAutomationWarningMarkers(true);
    const std::string before = requestRun();

    host.idle();

    const auto& curve = dynamic_cast<standin::Envelope&>(*host.curveOf(track, volume));
    for (const auto& [time, value] :
         {std::pair(-3000.0, 0.75), std::pair(4.9, 0.75), std::pair(6.0, 0.75), std::pair(10.0, 0.625),
          std::pair(14.9, 0.5), std::pair(15.1, 0.5), std::pair(19.9, 0.5), std::pair(20.1, 0.25),
          std::pair(28.1, 0.25), std::pair(39.9, 0.25), std::pair(41.0, 0.125), std::pair(42.1, 0.0),
          std::pair(90000.0, 0.0)}) {
        if (host.inHost(time) >= 0.0) {
            EXPECT_NEAR(curve.valueBehind(host.inHost(time)).value_or(-1.0), value, 1e-6) << time;
        }
    }
    EXPECT_EQ(standin::tests::childrenOf(*host.curveOf(untouched, volume)).size(), 2U);
    EXPECT_EQ(host.contentOf(host.trackNamed(u"Automation Warning")), Texts{"Automation warning in DX  20-20"});
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.bytes(), before);
}

TEST_P(HostRunTest, AMuteAtTheEndOfTheReelDoesNotReachBackIntoAnInsertOfAPreview)
{
    constexpr auto volume = standin::Envelope::Curve::Volume;
    host.model().changeEdl().clear();
    host.carryOver("01:00:00:00", "01:00:05:00", "01:00:00:00", "01:00:05:00");
    host.carryOver("01:00:05:00", "01:00:10:00", "01:00:08:00", "01:00:13:00");
    host.addPoint(track, volume, host.inHost(1.0), 0.5F);
    host.addPoint(track, volume, host.inHost(19.0), 0.5F);
    host.addPoint(track, volume, host.inHost(19.0), 0.0F);
    host.adapter().setPreviewActive(true);

    host.preview(host.model().changeEdl());

    const double offset = host.adapter().getRunState().previewOffset;
    const auto& curve = dynamic_cast<standin::Envelope&>(*host.curveOf(track, volume));
    for (const double time : {-1.0, 1.0, 5.5, 7.5, 9.0})
        EXPECT_NEAR(curve.valueBehind(offset + host.inHost(time)).value_or(-1.0), 0.5, 1e-6) << time;
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(standin::tests::childrenOf(*host.curveOf(track, volume)).size(), 3U);
}

TEST_P(HostRunTest, APreviewHoldsTheAutomationAfterItsEndAsARunDoes)
{
    constexpr auto volume = standin::Envelope::Curve::Volume;
    host.model().changeEdl().clear();
    host.carryOver("01:00:00:00", "01:00:05:00", "01:00:00:00", "01:00:05:00");
    host.addPoint(track, volume, host.inHost(1.0), 0.5F);
    host.addPoint(track, volume, host.inHost(19.0), 0.5F);
    host.addPoint(track, volume, host.inHost(19.0), 0.0F);
    const auto& curve = dynamic_cast<standin::Envelope&>(*host.curveOf(track, volume));
    const auto isHeld = [&](double place) {
        for (const double time : {4.0, 5.5, 19.5, 30.0, 3600.0})
            EXPECT_NEAR(curve.valueBehind(place + host.inHost(time)).value_or(-1.0), 0.5, 1e-6) << time;
    };
    const auto points = [&] { return standin::tests::childrenOf(*host.curveOf(track, volume)).size(); };
    host.adapter().setPreviewActive(true);

    host.preview(host.model().changeEdl());
    isHeld(host.adapter().getRunState().previewOffset);
    host.adapter().setPreviewActive(false);
    EXPECT_EQ(points(), 3U) << "Nothing of it stays.";

    host.conform();
    isHeld(0.0);
}

TEST_P(HostRunTest, KeepsTheAutomationThatALaterEventBringsBetweenTwo)
{
    host.model().changeEdl().clear();
    host.carryOver("01:00:00:00", "01:00:05:00", "01:00:00:00", "01:00:05:00");
    host.carryOver("01:00:10:00", "01:00:15:00", "01:00:10:00", "01:00:15:00");
    host.carryOver("01:00:05:00", "01:00:10:00", "01:00:05:00", "01:00:10:00");
    constexpr auto volume = standin::Envelope::Curve::Volume;
    host.addPoint(track, volume, host.inHost(6.0), 0.25F);
    host.addPoint(track, volume, host.inHost(7.0), 0.75F);
    host.addPoint(track, volume, host.inHost(8.0), 0.25F);
    host.settings().setCreateVirginTerritories(true);

    host.conform();

    const auto& curve = dynamic_cast<standin::Envelope&>(*host.curveOf(track, volume));
    for (const auto& [time, value] : {std::pair(5.5, 0.25), std::pair(6.5, 0.5), std::pair(7.0, 0.75)})
        EXPECT_NEAR(curve.valueBehind(host.inHost(time)).value_or(-1.0), value, 1e-6) << time;
}

// The frame around a run.

TEST_P(HostRunTest, ShowsHowFarItIs)
{
    const auto progress = watch();
    host.settings().setCreateOverlapMarkers(true);
    bool wasBlocked = true;
    progress->whenCalled = [&] {
        if (progress->calls.back() != "begin" && progress->calls.back() != "end")
            wasBlocked = wasBlocked && host.application.idleManager().isBlocked();
    };

    host.conform();

    EXPECT_TRUE(progress->canCancel());
    EXPECT_TRUE(wasBlocked) << "Idle calls are blocked while it goes on.";
    EXPECT_FALSE(host.application.idleManager().isBlocked());
    Texts texts = progress->calls;
    std::erase_if(texts, [](const std::string& call) { return call.starts_with("tick"); });
    // 2 events on the one track, a step more for the run, and 2 of the detection.
    EXPECT_EQ(texts, (Texts{"begin", "setStatus", "setRange 5", "Processing Project", "show",
                            "Processing Project - Event: 1 - A001 ", "Processing Project - Event: 2 - A001 ",
                            "Processing Project - Overlap Markers", "Processing Project - Generate Markers",
                            "setRange 0", "Processing Project - Completing", "end"}));
}

TEST_P(HostRunTest, SeesTheTracksThatAreMadeAfterIt)
{
    host.conform();
    EXPECT_EQ(candidates(), (Tracks{L"DX", L"Memos"}));

    host.addTrack(TypeWord::Audio, u"FX");

    EXPECT_EQ(candidates(), (Tracks{L"DX", L"Memos", L"FX"}));
}

TEST_P(HostRunTest, StopsTheTransportFirst)
{
    host.adapter().removeListener(&heard);
    host.project.announceStoring();
    host.disconnect();
    const auto transport = makeCounted<StoppedTransport>();
    host.altered.replace(ITransportControl::iid, transport);
    host.connect();
    host.adapter().addListener(&heard);

    host.conform();
    EXPECT_EQ(transport->stops, 1);

    transport->answer = ResultFalse;
    host.conform();
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel"})) << "Nothing is run into a transport that runs.";
}

TEST_P(HostRunTest, DoesNotHearOfItsOwnEdits)
{
    const auto progress = watch();
    core::EventBase& event = host.carryOver("01:00:00:24", "01:00:10:00", "01:00:30:00", "01:00:39:01");
    progress->whenCalled = [&] {
        if (!host.isEditOpen())
            return;
        host.project.setFrameRate({24.0, 0});
        EXPECT_EQ(host.adapter().update(host.document(), 0), ResultOk);
        EXPECT_EQ(host.adapter().projectEdited(host.document(), nullptr), ResultOk);
        EXPECT_FALSE(event.hasFlaw(core::EventFlaw::TimecodeInvalid)) << "It looks at the new rate after the run.";
        host.project.setFrameRate({25.0, 0});
    };

    host.conform();

    EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
    EXPECT_GT(progress->calls.size(), 5U);
}

TEST_P(HostRunTest, BeginsNoSecondRunWithinARun)
{
    const auto progress = watch();
    progress->whenCalled = [&] { host.adapter().onIdle(); };

    host.conform();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel"}));
    EXPECT_EQ(heard.actions.size(), 1U);
}

TEST_P(HostRunTest, RunsBeforeItPreviewsWhenBothAreRequested)
{
    host.adapter().startPreview(host.model().changeEdl(), 0, 0, 0);
    host.adapter().startCadrel();

    host.idle();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel", u"Preview"}));
    EXPECT_EQ(heard.actions, (std::vector<std::int32_t>{1, 0}));
}

// Cancelled runs.

TEST_P(HostRunTest, LeavesEverythingAsItWasWhereverItIsCancelled)
{
    host.settings().setCreateDestinationMarkers(true);
    host.settings().setCreateOverlapMarkers(true);
    host.settings().setCreateAudioSnippetMarkers(true);
    host.settings().setCreateAutomationWarningMarkers(true);
    host.model().videoList().add(
        core::VideoList::Entry("/picture/reel3_v12.mov", core::Timecode("01:00:05:00"), core::Timecode("00:00:04:00")),
        false);
    const std::string before = requestRun();
    const auto progress = watch();
    host.idle();
    const std::string after = host.bytes();
    const std::size_t callCount = progress->calls.size();
    ASSERT_TRUE(host.undo());
    ASSERT_EQ(host.bytes(), before);

    std::size_t takenBack = 0;
    std::size_t lastTakenBack = 0;
    for (std::size_t call = 1; call <= callCount; ++call) {
        progress->calls.clear();
        // The handler forgets what was cancelled before it has shown its window.
        progress->whenCalled = [&] {
            if (progress->calls.size() == call)
                progress->cancel();
        };
        host.conform();

        EXPECT_FALSE(host.isEditOpen());
        EXPECT_FALSE(host.application.idleManager().isBlocked());
        const bool isTakenBack = host.undoNames() == entriesBefore;
        EXPECT_EQ(heard.results.back(), isTakenBack ? Result::Cancelled : Result::Ok);
        EXPECT_FALSE(heard.dropped.back());
        EXPECT_EQ(host.bytes(), isTakenBack ? before : after) << "cancelled in call " << call;
        if (isTakenBack) {
            ++takenBack;
            lastTakenBack = call;
        } else {
            EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel"}));
            ASSERT_TRUE(host.undo());
        }
        ASSERT_EQ(host.bytes(), before);
    }

    EXPECT_GT(takenBack, 5U);
    EXPECT_LT(lastTakenBack, callCount) << "Behind the last question it is too late.";
    EXPECT_EQ(heard.actions.size(), 1U + callCount) << "Cancelled or not, it is told that a run has ended.";
}

TEST_P(HostRunTest, DoesNothingMoreOnceItIsCancelled)
{
    host.model().videoList().add(
        core::VideoList::Entry("/picture/reel3_v12.mov", core::Timecode("01:00:05:00"), core::Timecode("00:00:04:00")),
        false);
    const auto progress = watch();
    progress->whenCalled = [&] {
        if (progress->calls.back().find("Event: 1") != std::string::npos)
            progress->cancel();
    };
    host.conform();
    ASSERT_EQ(host.undoNames(), entriesBefore);

    ASSERT_TRUE(host.redo());

    EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel (incomplete)");
    EXPECT_FALSE(host.trackNamed(u"New Video")) << "The first event was carried over, and that was all.";
}

TEST_P(HostRunTest, IsCompleteWhereTheNewVideoBeginsBeforeATimeOriginThatHasMoved)
{
    host.model().videoList().add(
        core::VideoList::Entry("/picture/reel3_v12.mov", core::Timecode("01:00:00:00"), core::Timecode("00:00:20:00")),
        false);
    host.project.setTimeOrigin(3606.0);
    host.idle();

    host.conform();

    EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
    const auto events = standin::tests::childrenOf(*host.trackNamed(u"New Video"));
    ASSERT_EQ(events.size(), 1U);
    EXPECT_EQ(events[0]->getStart(nullptr), 0.0);
    EXPECT_EQ(events[0]->getEnd(nullptr), 14.0);
    EXPECT_EQ(events[0]->getSourceOffset(nullptr), 6.0);
    const std::u16string told =
        u"The new video begins before the project does. What would stand there hasn't been written.";
    EXPECT_EQ(std::ranges::count(host.alerts->messages, told), 1);
}

TEST_P(HostRunTest, TellsThatTheNewPictureIsNotWrittenWhereItWouldStandBeforeTheProject)
{
    host.project.setTimeOrigin(3600.0);
    host.idle();
    core::VideoList& videos = host.model().videoList();
    const auto setVideo = [&](const char* start) {
        videos.clear();
        videos.add(
            core::VideoList::Entry("/picture/reel3_v12.mov", core::Timecode(start), core::Timecode("00:00:20:00")),
            false);
    };
    setVideo("01:00:00:00");
    host.conform();
    ASSERT_TRUE(host.alerts->messages.empty());
    const auto video = host.trackNamed(u"New Video");
    ASSERT_EQ(standin::tests::childrenOf(*video).size(), 1U);
    setVideo("00:59:40:00");

    host.conform();

    const std::u16string told = u"The new video ends before the project begins. The new video hasn't been written.";
    EXPECT_EQ(host.alerts->messages, Entries{told});
    EXPECT_EQ(standin::tests::childrenOf(*video).size(), 2U) << "Its halves have changed places, as on all tracks.";
    host.adapter().setPreviewActive(true);
    host.preview(host.model().changeEdl());
    EXPECT_EQ(host.alerts->messages, (Entries{told, told}));
    host.adapter().setPreviewActive(false);
    EXPECT_EQ(standin::tests::childrenOf(*video).size(), 2U);
}

// The project begins at 01:00:04:00, and an event brings what stands from 6 s to 16 s of the host to 01:00:00:00.
TEST_P(HostRunTest, TellsWhatWouldStandBeforeTheProjectBegins)
{
    query<ITrackNode>(track)->setFlag(TrackFlag::Lock, true);
    const auto other = host.addTrack(TypeWord::Audio, u"FX");
    host.project.setTimeOrigin(3604.0);
    host.idle();
    constexpr double Frame = 1.0 / 25.0;
    struct Case {
        double start;
        double end;
        double from; ///< which stretch may change; all where it is empty
        double to;
        bool isTold;
    };
    for (const Case& at :
         {Case{5.0, 6.0, 0.0, 0.0, false}, Case{5.0, 6.0 + Frame, 0.0, 0.0, true}, Case{7.0, 8.0, 0.0, 0.0, true},
          Case{10.0 - Frame, 12.0, 0.0, 0.0, true}, Case{10.0, 12.0, 0.0, 0.0, false}, Case{0.0, 20.0, 0.0, 0.0, true},
          Case{7.0, 8.0, 3602.0, 3700.0, false}, Case{7.0, 8.0, 3602.0 - Frame, 3700.0, true},
          Case{7.0, 8.0, 3590.0, 3601.0, false}, Case{7.0, 8.0, 3590.0, 3601.0 + Frame, true},
          Case{7.0, 8.0, 3604.0, 3700.0, false}}) {
        SCOPED_TRACE(at.start + at.from);
        const auto clip = host.addClip(other, u"steps", at.start, at.end);
        host.settings().setRestrictRange(at.from < at.to);
        if (at.from < at.to)
            host.settings().setPreserveMaterial(at.from, at.to);
        host.alerts->messages.clear();

        host.conform();

        const Entries told{u"Left out, as it would stand before the project or its day begins: material of event 2."};
        EXPECT_EQ(host.alerts->messages, at.isTold ? told : Entries());
        EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
        ASSERT_TRUE(host.undo());
        host.edit(u"Remove", [&] { host.transaction()->remove(other.get(), clip.get()); });
    }
}

TEST_P(HostRunTest, TellsOfHowManyEventsSomethingWouldStandBeforeTheProjectBegins)
{
    host.carryOver("01:00:10:00", "01:00:20:00", "00:59:00:00", "00:59:10:00");
    host.carryOver("01:00:10:00", "01:00:20:00", "02:00:00:00", "02:00:10:00");
    const auto memos = host.addTrack(TypeWord::Marker, u"Memos");
    requireOk(memos->setAttribute(AttributeKey::MarkerType, FVariant::integer(TrackRole::Memos), true));
    host.project.setTimeOrigin(3604.0);
    host.idle();
    host.addPointMarker(memos, u"louder", 7.0);

    host.conform();
    const Entries told{
        u"Left out, as it would stand before the project or its day begins: material of 2 events, first of event 2."};
    EXPECT_EQ(host.alerts->messages, told);

    ASSERT_TRUE(host.undo());
    host.project.setTimeOrigin(0.0);
    host.idle();
    host.conform();
    EXPECT_EQ(host.alerts->messages, told) << "There is room for all of it, and nothing is told again.";
}

TEST_P(HostRunTest, EmptiesNoTrackThatTheUserSelectsOrUnlocksMeanwhile)
{
    const auto other = host.addTrack(TypeWord::Audio, u"FX");
    host.addSound(other, u"bed", 0.0, 20.0);
    auto& chosen = dynamic_cast<standin::Track&>(*track);
    auto& left = dynamic_cast<standin::Track&>(*other);
    chosen.setSelected(true);
    const auto progress = watch();
    progress->whenCalled = [&] {
        if (progress->calls.back().find("Event: 1") == std::string::npos)
            return;
        left.setSelected(true);
        left.setLocked(false);
    };
    for (const bool isLocked : {false, true}) {
        SCOPED_TRACE(isLocked);
        host.settings().setApplyTo(isLocked ? core::ApplyTo::AllTracks : core::ApplyTo::SelectedTracks);
        left.setSelected(false);
        left.setLocked(isLocked);

        host.conform();

        EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel");
        EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
        EXPECT_EQ(host.contentOf(other), Texts{"bed 0-20"});
        ASSERT_TRUE(host.undo());
    }
}

TEST_P(HostRunTest, SeesNoTrackAnyMoreThatItsUndoTakesAway)
{
    Tracks seen;
    Texts calls;
    const auto dependent = makeCounted<standin::tests::Recorder>(calls);
    dependent->whenCalled = [&](const std::string&) { seen = candidates(); };
    const auto dependencies = service<IDependencyManager>(host.context());
    ASSERT_EQ(dependencies->addDependent(host.document(), dependent.get()), ResultOk);
    const auto progress = watch();
    progress->whenCalled = [&] {
        if (progress->calls.back().find("Event: 1") != std::string::npos)
            progress->cancel();
    };

    host.conform();

    ASSERT_EQ(host.undoNames(), entriesBefore);
    EXPECT_EQ(calls, (Texts{"update", "update"})) << "The commit, and the undo.";
    EXPECT_EQ(seen, Tracks{L"DX"});
    dependencies->removeDependent(host.document(), dependent.get());
}

TEST_P(HostRunTest, TakesTheChangesOfTheModelBackWithTheRun)
{
    // What stands in the model when the run begins comes back, and no more than that.
    const auto progress = watch();
    progress->whenCalled = [&] {
        if (host.isEditOpen())
            host.model().setProperty(core::PropertyKey::LastEdlFolder, core::Variant("/edl"));
        if (progress->calls.back().find("Event: 1") != std::string::npos)
            progress->cancel();
    };

    host.conform();

    EXPECT_FALSE(host.model().hasProperty(core::PropertyKey::LastEdlFolder));
}

TEST_P(HostRunTest, SaysThatItIsIncompleteWhereItIsCancelledAndCannotBeTakenBack)
{
    const std::string before = requestRun();
    const auto progress = watch();
    progress->whenCalled = [&] {
        if (progress->calls.back().find("Event: 1") != std::string::npos)
            progress->cancel();
    };
    host.altered.hide(IActionManager::iid);

    host.idle();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel (incomplete)"}));
    EXPECT_EQ(heard.results, Results{Result::HostObjectMissing});
    EXPECT_FALSE(host.isEditOpen());
    EXPECT_FALSE(host.application.idleManager().isBlocked());
    EXPECT_EQ(progress->calls.back(), "end");
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.bytes(), before);
}

TEST_P(HostRunTest, TellsThatItIsIncompleteWhereTheHostRefusesToTakeItBack)
{
    const std::string before = requestRun();
    const auto progress = watch();
    progress->whenCalled = [&] {
        if (progress->calls.back().find("Event: 1") != std::string::npos)
            progress->cancel();
    };
    host.altered.replace(IActionManager::iid, makeCounted<RefusingActions>());

    host.idle();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel (incomplete)"}));
    EXPECT_EQ(heard.results, Results{Result::HostCallFailed});
    EXPECT_FALSE(host.isEditOpen());
    EXPECT_FALSE(host.application.idleManager().isBlocked());
    EXPECT_EQ(progress->calls.back(), "end");
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.bytes(), before);
}

// Runs that fail.

TEST_P(HostRunTest, KeepsWhatItHasDoneWhenItFails)
{
    const std::string before = requestRun();
    host.altered.hide(ClassId::ObjectList);

    host.idle();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel (incomplete)"}));
    EXPECT_FALSE(host.isEditOpen());
    EXPECT_FALSE(host.application.idleManager().isBlocked());
    EXPECT_TRUE(host.trackNamed(u"Memos"));
    EXPECT_EQ(heard.actions, std::vector<std::int32_t>{1});
    EXPECT_EQ(heard.results, Results{Result::HostObjectMissing});
    EXPECT_EQ(heard.dropped, std::vector<bool>{false});
    EXPECT_TRUE(host.alerts->messages.empty());
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.bytes(), before);
}

TEST_P(HostRunTest, CanBeMadeAfterOneThatFailed)
{
    requestRun();
    AlteredContext& altered = host.altered;
    altered.hide(IEditService::iid);
    host.idle();
    EXPECT_EQ(host.undoNames(), entriesBefore) << "Without a transaction nothing was done.";

    altered.unhide(IEditService::iid);
    host.conform();

    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
}

TEST_P(HostRunTest, LeavesATransactionAloneThatAnotherHasOpen)
{
    const std::string before = requestRun();
    ASSERT_EQ(host.transaction()->begin(true), ResultOk);

    host.adapter().onIdle();

    EXPECT_TRUE(host.isEditOpen());
    EXPECT_EQ(heard.actions, std::vector<std::int32_t>{1});
    EXPECT_EQ(heard.results, Results{Result::HostCallFailed});
    ASSERT_EQ(host.transaction()->commit(host.document(), u"Other"), ResultOk);
    EXPECT_EQ(host.undoNames(), entriesBefore);
    EXPECT_EQ(host.bytes(), before);
}

TEST_P(HostRunTest, DoesNothingWhereThereIsNoProgress)
{
    const std::string before = requestRun();
    host.altered.hide(IProgressService::iid);

    host.idle();

    EXPECT_EQ(host.undoNames(), entriesBefore);
    EXPECT_EQ(host.bytes(), before);
    EXPECT_FALSE(host.application.idleManager().isBlocked());
}

TEST_P(HostRunTest, RunsWhereIdleCallsCannotBeBlocked)
{
    requestRun();
    host.altered.hide(IIdleManager::iid);

    host.idle();

    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
}

TEST_P(HostRunTest, IsForgottenWhenTheProjectChanges)
{
    requestRun();
    standin::Project& other = host.application.createProject();
    host.application.activateProject(&other);
    host.application.activateProject(&host.project);

    host.idle();

    EXPECT_EQ(host.undoNames(), entriesBefore);
    EXPECT_EQ(other.undoList().size(), 0U);
}

TEST_P(HostRunTest, ARequestIsToldAsDroppedWhenTheProjectChanges)
{
    requestRun();
    ASSERT_EQ(host.adapter().startPreview(host.model().changeEdl(), 0, 0, 0), Result::Ok);
    EXPECT_TRUE(heard.actions.empty());

    host.application.activateProject(&host.project);
    EXPECT_TRUE(heard.actions.empty()) << "It is the same project.";
    host.application.activateProject(&host.application.createProject());

    EXPECT_EQ(heard.actions, (std::vector<std::int32_t>{1, 0}));
    EXPECT_EQ(heard.results, (Results{Result::Cancelled, Result::Cancelled}));
    EXPECT_EQ(heard.dropped, (std::vector<bool>{true, true}));

    host.application.activateProject(&host.project);
    host.idle();
    EXPECT_EQ(heard.actions.size(), 2U) << "Once is enough.";
}

TEST_P(HostRunTest, ARequestIsToldAsDroppedWhenThePreviewEnds)
{
    requestRun();
    host.adapter().endPreview();
    EXPECT_EQ(heard.actions, std::vector<std::int32_t>{1});
    EXPECT_EQ(heard.dropped, std::vector<bool>{true});

    ASSERT_EQ(host.adapter().startPreview(host.model().changeEdl(), 0, 0, 0), Result::Ok);
    host.adapter().setPreviewActive(false);
    EXPECT_EQ(heard.actions, (std::vector<std::int32_t>{1, 0}));
    EXPECT_EQ(heard.dropped, (std::vector<bool>{true, true}));

    host.adapter().endPreview();
    host.adapter().setPreviewActive(false);
    host.idle();
    EXPECT_EQ(heard.actions.size(), 2U);
}

TEST_P(HostRunTest, WhatIsBeingCarriedOutIsToldOnceThoughThePreviewEndsMeanwhile)
{
    const auto progress = watch();
    progress->whenCalled = [&] {
        if (progress->calls.back() == "show")
            host.adapter().setPreviewActive(false);
    };

    host.conform();

    EXPECT_EQ(heard.actions, std::vector<std::int32_t>{1});
    EXPECT_EQ(heard.dropped, std::vector<bool>{false});
}

TEST_P(HostRunTest, APreviewTellsHowItEnded)
{
    ASSERT_EQ(host.adapter().startPreview(host.model().changeEdl(), 0, 0, 0), Result::Ok);
    host.idle();
    ASSERT_EQ(host.adapter().startPreview(host.model().changeEdl(), 0, 0, 0), Result::Ok);
    host.altered.hide(ClassId::ObjectList);
    host.idle();

    EXPECT_EQ(heard.actions, (std::vector<std::int32_t>{0, 0}));
    EXPECT_EQ(heard.results, (Results{Result::Ok, Result::HostObjectMissing}));
}

TEST_P(HostRunTest, RunsOnTheActiveOfTwoProjects)
{
    standin::Project& other = host.application.createProject();
    host.application.activateProject(&other);
    host.application.activateProject(&host.project);

    host.conform();

    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
    EXPECT_EQ(other.undoList().size(), 0U);
}

TEST_P(HostRunTest, TranslatesTheNameOfItsEntry)
{
    host.altered.replace(ITranslationService::iid, makeCounted<GermanTranslations>());

    host.conform();

    EXPECT_EQ(host.undoNames().back(), u"Cadrel anwenden");
}

} // namespace cadrel::host::tests
