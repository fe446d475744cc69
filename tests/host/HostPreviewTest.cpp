// SPDX-License-Identifier: GPL-3.0-or-later

// A preview from its request to its end, and what the user does meanwhile.

#include "core/notify/ChangeContext.h"
#include "host/Host.h"
#include "host/border/HostFailure.h"
#include "host/project/Project.h"
#include "host/track/TrackRole.h"
#include "host/undo/PreviewEventsStep.h"
#include "tests/host/PreviewedFilm.h"
#include "tests/host/project/AlteredEdits.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/host/AdaptedHost.h"
#include "tests/support/host/HostedModel.h"
#include "tests/support/host/WatchedProgress.h"
#include "velmark/Attributes.h"
#include "velmark/Tracks.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <initializer_list>
#include <limits>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::RecordingListener;
using cadrel::tests::thrownBy;
using core::ChangeContext;
using core::PropertyKey;
using util::Result;

class HostPreviewTest : public PreviewedFilm {};

INSTANTIATE_TEST_SUITE_P(Origins, HostPreviewTest, testing::Values(0.0, 3600.0));

/// A preview of a film with memos, in which the user works on them.
class HostMemoTest : public HostPreviewTest {
protected:
    HostMemoTest()
    {
        memos = host.addTrack(TypeWord::Marker, u"Memos");
        memos->setAttribute(AttributeKey::MarkerType, FVariant::integer(TrackRole::Memos), true);
        host.addRangeMarker(memos, u"hiss", host.inHost(2.0), host.inHost(4.0));
        host.addPointMarker(memos, u"click", host.inHost(6.0));
        host.addPointMarker(memos, u"far", host.inHost(30.0));
    }

    /// The memos of the film, without those of the preview.
    Texts filmMemos()
    {
        Texts content = host.contentOf(memos);
        std::erase_if(content, [&](const std::string& memo) { return isOfPreview(memo); });
        return content;
    }
    /// The memo in the preview, of that name.
    Node copyOf(std::u16string_view name)
    {
        for (const Node& child : standin::tests::childrenOf(*memos)) {
            if (name == child->getName() && child->getStart(nullptr) > host.inHost(1000.0))
                return child;
        }
        ADD_FAILURE() << "There is no such copy.";
        return nullptr;
    }
    void edit(const std::function<void()>& edits) { host.edit(u"Edit", edits); }
    /// A preview that has just been written while the user looks at where its events come from.
    void previewAtItsSource()
    {
        adapter().setPreviewActive(true);
        host.preview(firstChange(), 0, 0, false);
        host.idle();
    }
    /// A time of the film, in the preview, as the host counts it.
    double inPreview(double filmSeconds) { return Day + host.inHost(filmSeconds); }

    Node memos;

private:
    static bool isOfPreview(const std::string& memo)
    {
        const std::size_t blank = memo.rfind(' ');
        return std::stod(memo.substr(blank + 1)) > 1000.0;
    }
};

INSTANTIATE_TEST_SUITE_P(Origins, HostMemoTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(HostPreviewTest, WritesTheNewProgrammeBehindAllMaterial)
{
    previewAll();

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86410", "one 86410-86420"}));
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview"}));
    EXPECT_FALSE(host.isEditOpen());
}

TEST_P(HostPreviewTest, WritesTheChosenEventsAlone)
{
    adapter().setPreviewActive(true);

    host.preview(firstChange());

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "one 86410-86420"}));
}

TEST_P(HostPreviewTest, WritesTheEventsAsTheyWereWhenItWasRequested)
{
    adapter().setPreviewActive(true);
    ASSERT_EQ(adapter().startPreview(changes(), 0, 0, 1), Result::Ok);
    changes().at(0).setDst(core::Timecode("01:00:30:00"), core::Timecode("01:00:40:00"));

    host.idle();

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86410", "one 86410-86420"}));
}

TEST_P(HostPreviewTest, ReplacesThePreviewBefore)
{
    previewAll();

    host.preview(secondChange());

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86410"}));
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview", u"Preview"}));
}

TEST_P(HostPreviewTest, ShowsNothingForNoEvents)
{
    previewAll();

    host.preview(core::EventList());

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    EXPECT_EQ(host.undoNames().back(), u"Preview");
}

TEST_P(HostPreviewTest, IsTakenBackWholeByAnUndo)
{
    const std::string before = host.dump();
    previewAll();
    const Texts after = host.contentOf(track);

    ASSERT_TRUE(host.undo());
    EXPECT_FALSE(adapter().isPreviewActive()) << "It was off before the preview.";
    EXPECT_FALSE(isLocked(track));
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    EXPECT_FALSE(host.trackNamed(u"Cadrel Markers"));

    ASSERT_TRUE(host.redo());
    EXPECT_TRUE(adapter().isPreviewActive());
    EXPECT_EQ(host.contentOf(track), after);
}

TEST_P(HostPreviewTest, LocksTheTracksAgainWhenItIsRedone)
{
    const Node own = host.addTrack(TypeWord::Audio, u"Own");
    query<ITrackNode>(own)->setFlag(TrackFlag::Lock, true);
    host.settings().setCreateOverlapMarkers(true);
    previewAll();
    ASSERT_TRUE(host.undo());
    ASSERT_FALSE(isLocked(track));

    ASSERT_TRUE(host.redo());

    EXPECT_TRUE(isLocked(track));
    EXPECT_TRUE(isLocked(host.trackNamed(u"Overlap")));
    EXPECT_FALSE(isLocked(host.trackNamed(u"Memos")));

    adapter().setPreviewActive(false);
    EXPECT_FALSE(isLocked(track));
    EXPECT_FALSE(isLocked(host.trackNamed(u"Overlap")));
    EXPECT_TRUE(isLocked(own)) << "That is the user's lock.";
}

TEST_P(HostPreviewTest, LeavesTheTracksFreeWhenItIsRedoneWhereTheOldPlaceWasLookedAt)
{
    adapter().setPreviewActive(true);
    host.preview(changes(), 0, 0, false);
    ASSERT_TRUE(host.undo());

    ASSERT_TRUE(host.redo());

    EXPECT_TRUE(adapter().isPreviewActive());
    EXPECT_FALSE(isLocked(track));
}

TEST_P(HostPreviewTest, LocksTheTracksAgainWhenItsEndIsUndone)
{
    host.settings().setCreateOverlapMarkers(true);
    previewAll();
    adapter().setPreviewActive(false);

    ASSERT_TRUE(host.undo());
    EXPECT_TRUE(isLocked(track));
    EXPECT_TRUE(isLocked(host.trackNamed(u"Overlap")));

    ASSERT_TRUE(host.redo());
    EXPECT_FALSE(isLocked(track));
    EXPECT_FALSE(isLocked(host.trackNamed(u"Overlap")));
}

TEST_P(HostPreviewTest, LeavesItsTracksFreeOfWhichARunWasRedone)
{
    previewAll();
    host.conform();
    ASSERT_TRUE(host.undo());
    ASSERT_TRUE(host.undo());
    ASSERT_TRUE(host.redo());
    ASSERT_TRUE(isLocked(track));

    ASSERT_TRUE(host.redo());

    EXPECT_FALSE(isLocked(track));
    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
}

TEST_P(HostPreviewTest, HasUndoStepsThatOutliveTheAdapter)
{
    previewAll();
    host.disconnect();

    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    ASSERT_TRUE(host.redo());

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86410", "one 86410-86420"}));
}

TEST_P(HostPreviewTest, LeadsTheUserBackWhenItIsUndone)
{
    for (const bool atDestination : {true, false}) {
        SCOPED_TRACE(atDestination);
        adapter().setPreviewActive(true);
        host.preview(changes(), 0, 0, atDestination);
        ASSERT_NE(transportCycle(), Span(4.0, 9.0));

        ASSERT_TRUE(host.undo());

        EXPECT_EQ(transportCycle(), Span(4.0, 9.0));
        EXPECT_EQ(host.project.position().getValue(), 5.0);
        EXPECT_EQ(locators(), Span(3.0, 8.0));
    }
}

TEST_P(HostPreviewTest, LeavesThePreviewOnWhenALaterOneIsUndone)
{
    previewAll();
    host.preview(secondChange());

    ASSERT_TRUE(host.undo());

    EXPECT_TRUE(adapter().isPreviewActive());
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86410", "one 86410-86420"}));
}

TEST_P(HostPreviewTest, TellsThatItHasEnded)
{
    RecordingListener heard;
    adapter().addListener(&heard);

    previewAll();

    adapter().removeListener(&heard);
    EXPECT_EQ(heard.types,
              (std::vector<std::int32_t>{ChangeContext::PreviewStateChanged, ChangeContext::ActionFinished}));
}

TEST_P(HostPreviewTest, ShowsItsProgressWithoutAWayToCancel)
{
    const auto progress = makeCounted<WatchedProgress>();
    host.altered.replace(IProgressService::iid, progress);

    previewAll();

    EXPECT_FALSE(progress->canCancel());
    EXPECT_EQ(std::ranges::count(progress->calls, "Project Preview"), 1);
    // Two events on one track.
    EXPECT_EQ(std::ranges::count(progress->calls, "setRange 2"), 1);
    EXPECT_EQ(std::ranges::count(progress->calls, "Project Preview - Generate Markers"), 1);
    EXPECT_EQ(std::ranges::count(progress->calls, "Project Preview - Completing"), 0);
}

TEST_P(HostPreviewTest, JoinsWhatTheCutsHaveLeftOfAClip)
{
    changes().clear();
    host.carryOver("01:00:00:00", "01:00:05:00", "01:00:00:00", "01:00:05:00");
    host.carryOver("01:00:05:00", "01:00:20:00", "01:00:05:00", "01:00:20:00");

    previewAll();

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "one 86400-86410", "two 86410-86420"}));
}

TEST_P(HostPreviewTest, MakesTheTrackOfTheNewPictureBeforeThoseOfTheMarkers)
{
    host.model().videoList().add(
        core::VideoList::Entry("/picture/reel3_v12.mov", core::Timecode("01:00:05:00"), core::Timecode("00:00:04:00")),
        false);

    previewAll();

    EXPECT_EQ(standin::tests::namesOf(*host.root()), (Entries{u"DX", u"New Video", u"Cadrel Markers"}));
}

TEST_P(HostPreviewTest, WritesTheNewPictureInThePreview)
{
    host.model().videoList().add(
        core::VideoList::Entry("/picture/reel3_v12.mov", core::Timecode("01:00:05:00"), core::Timecode("00:00:04:00")),
        false);

    previewAll();

    const Node video = host.trackNamed(u"New Video");
    ASSERT_TRUE(video);
    const auto events = standin::tests::childrenOf(*video);
    ASSERT_EQ(events.size(), 1U);
    EXPECT_DOUBLE_EQ(events[0]->getStart(nullptr), Day + host.inHost(5.0));
}

TEST_P(HostPreviewTest, LeavesTheNewPictureOfTheProgrammeAsItIs)
{
    host.model().videoList().add(
        core::VideoList::Entry("/picture/reel3_v12.mov", core::Timecode("01:00:05:00"), core::Timecode("00:00:04:00")),
        false);
    previewAll();
    adapter().setPreviewActive(false);
    const Node video = host.trackNamed(u"New Video");
    host.addSound(video, u"approved", 2.0, 4.0);

    previewAll();
    EXPECT_EQ(host.contentOf(video)[0], "approved 2-4");
    EXPECT_EQ(host.contentOf(video).size(), 2U);

    adapter().setPreviewActive(false);
    EXPECT_EQ(host.contentOf(video), Texts{"approved 2-4"});
}

TEST_P(HostPreviewTest, LeavesVideoTracksAloneThatHaveNoRole)
{
    const Node picture = host.addTrack(TypeWord::Video, u"Picture");
    const Node second = host.addTrack(TypeWord::Video, u"Temp VFX");
    host.addSound(second, u"shot", 0.0, 10.0);
    query<ITrackNode>(second)->setFlag(TrackFlag::Lock, true);
    host.model().videoList().add(
        core::VideoList::Entry("/picture/reel3_v12.mov", core::Timecode("01:00:05:00"), core::Timecode("00:00:04:00")),
        false);

    previewAll();
    adapter().setPreviewActive(false);
    host.conform();

    EXPECT_EQ(host.contentOf(second), Texts{"shot 0-10"});
    EXPECT_TRUE(isLocked(second));
    EXPECT_TRUE(host.contentOf(picture).empty());
    EXPECT_EQ(host.contentOf(host.trackNamed(u"New Video")).size(), 1U);
}

TEST_P(HostPreviewTest, MovesToItsEvents)
{
    adapter().setPreviewActive(true);

    host.preview(changes(), 0, 1);

    // The second is a neighbour. The locators keep their distance of 5 s and start a tenth of it before.
    const double start = Day + host.inHost(10.0);
    EXPECT_EQ(transportCycle(), Span(start, Day + host.inHost(20.0)));
    EXPECT_EQ(host.project.position().getValue(), start);
    EXPECT_DOUBLE_EQ(locators().first, start - 0.5);
    EXPECT_DOUBLE_EQ(locators().second, start + 4.5);
}

TEST_P(HostPreviewTest, MovesToWhereItsEventsComeFrom)
{
    adapter().setPreviewActive(true);

    host.preview(changes(), 0, 1, false);

    EXPECT_EQ(transportCycle(), Span(host.inHost(0.0), host.inHost(10.0)));
    EXPECT_FALSE(isLocked(track));
}

TEST_P(HostPreviewTest, LocksTheTracksThatItShows)
{
    const Node own = host.addTrack(TypeWord::Audio, u"Own");
    query<ITrackNode>(own)->setFlag(TrackFlag::Lock, true);
    host.settings().setCreateOverlapMarkers(true);

    previewAll();

    EXPECT_TRUE(isLocked(track));
    EXPECT_TRUE(isLocked(host.trackNamed(u"Overlap")));
    EXPECT_FALSE(isLocked(host.trackNamed(u"Memos"))) << "The user goes on to write there.";

    adapter().setPreviewActive(false);

    EXPECT_FALSE(isLocked(track));
    EXPECT_FALSE(isLocked(host.trackNamed(u"Overlap")));
    EXPECT_TRUE(isLocked(own)) << "That is the user's lock.";
}

TEST_P(HostPreviewTest, LeavesTheProjectEndWhereItWas)
{
    const double end = host.project.getEnd(nullptr);
    previewAll();
    ASSERT_GT(host.project.getEnd(nullptr), Day);

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.project.getEnd(nullptr), end);
}

TEST_P(HostPreviewTest, LeavesTheProjectEndWhereItWasWhenTheProjectIsSavedInBetween)
{
    const double end = host.project.getEnd(nullptr);
    previewAll();
    ASSERT_EQ(adapter().projectStoring(host.document()), ResultOk);
    host.disconnect();
    host.connect();
    ASSERT_TRUE(adapter().isPreviewActive());

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.project.getEnd(nullptr), end);
}

TEST_P(HostPreviewTest, TakesItsRoomAlongWhenItIsUndoneAndRedone)
{
    const double end = host.project.getEnd(nullptr);
    previewAll();

    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.project.getEnd(nullptr), end);
    ASSERT_TRUE(host.redo());
    EXPECT_EQ(host.project.getEnd(nullptr), Day + host.inHost(20.0)) << "To the end of the copies.";
    adapter().setPreviewActive(false);

    EXPECT_EQ(host.project.getEnd(nullptr), end);
}

TEST_P(HostPreviewTest, LeavesTheProjectEndWhereItWasWhenTheProjectIsSavedAfterTheUndoOfItsEnd)
{
    const double end = host.project.getEnd(nullptr);
    previewAll();
    adapter().setPreviewActive(false);
    ASSERT_TRUE(host.undo());
    ASSERT_EQ(adapter().projectStoring(host.document()), ResultOk);
    host.disconnect();
    host.connect();
    ASSERT_TRUE(adapter().isPreviewActive());

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.project.getEnd(nullptr), end);
}

TEST_P(HostPreviewTest, LeavesTheProjectEndWhereItWasWhenARunBeforeItIsUndone)
{
    host.conform();
    const double end = host.project.getEnd(nullptr);
    adapter().setPreviewActive(true);
    ASSERT_GT(host.project.getEnd(nullptr), Day);

    ASSERT_TRUE(host.undo());

    EXPECT_FALSE(adapter().isPreviewActive());
    EXPECT_EQ(host.project.getEnd(nullptr), end);
}

TEST_P(HostPreviewTest, LeavesTheProjectEndWhereTheUserHasPutItSinceAnUndoHasEndedThePreview)
{
    host.conform();
    adapter().setPreviewActive(true);
    ASSERT_TRUE(host.undo());
    const double end = host.project.getEnd(nullptr) + 100.0;
    ASSERT_EQ(host.document()->setProjectEnd(end), ResultOk);

    adapter().setPreviewActive(true);
    adapter().setPreviewActive(false);

    EXPECT_EQ(host.project.getEnd(nullptr), end);
}

TEST_P(HostPreviewTest, LeavesALockAloneThatTheUserHasSetSince)
{
    const auto lock = [&] { query<ITrackNode>(track)->setFlag(TrackFlag::Lock, true); };
    const auto switchOnAndOff = [&] {
        adapter().setPreviewActive(true);
        adapter().setPreviewActive(false);
    };
    previewAll();
    adapter().setPreviewActive(false);
    lock();
    switchOnAndOff();
    EXPECT_TRUE(isLocked(track));

    query<ITrackNode>(track)->setFlag(TrackFlag::Lock, false);
    previewAll();
    ASSERT_TRUE(host.undo());
    ASSERT_FALSE(isLocked(track));
    lock();
    switchOnAndOff();
    EXPECT_TRUE(isLocked(track));
}

TEST_P(HostPreviewTest, ConformsUnderItsOwnLocks)
{
    previewAll();
    ASSERT_TRUE(isLocked(track));

    host.preview(secondChange());

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86410"}));
    EXPECT_TRUE(isLocked(track));
}

// Failures.

TEST_P(HostPreviewTest, KeepsWhatItHasDoneWhenItFails)
{
    adapter().setPreviewActive(true);
    ASSERT_EQ(adapter().startPreview(changes(), 0, 0, 1), Result::Ok);
    const Texts before = host.contentOf(track);
    host.altered.hide(ClassId::ObjectList);

    host.idle();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview (incomplete)"}));
    EXPECT_FALSE(host.isEditOpen());
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.contentOf(track), before);
    EXPECT_FALSE(adapter().isPreviewActive());
}

TEST_P(HostPreviewTest, KeepsWhatItHasDoneWhenItsEndFails)
{
    previewAll();
    // A progress or a list isn't wanted at the end, but the edit service is.
    host.altered.hide(IEditService::iid);

    EXPECT_EQ(thrownBy([&] { adapter().setPreviewActive(false); }), Result::HostObjectMissing);

    EXPECT_FALSE(adapter().isPreviewActive());
    EXPECT_FALSE(isLocked(track)) << "All else is carried out.";
    EXPECT_EQ(transportCycle(), Span(4.0, 9.0));
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview"}));
}

TEST_P(HostPreviewTest, SaysThatItIsIncompleteWhereItsEventsCannotFollowTheUndoList)
{
    const auto edits = makeCounted<AlteredEdits>(host.context());
    edits->addsStep = [](IEditStep* step) { return dynamic_cast<PreviewEventsStep*>(step) == nullptr; };
    host.altered.replace(IEditService::iid, edits);

    previewAll();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview (incomplete)"}));
    EXPECT_FALSE(host.isEditOpen());
}

TEST_P(HostPreviewTest, IsNotRequestedWhereTheModelCannotBeKept)
{
    adapter().setPreviewActive(true);
    ASSERT_EQ(adapter().startPreview(firstChange(), 0, 0, 1), Result::Ok);
    host.model().oldEdl().add(std::make_shared<UnwritableEvent>());

    EXPECT_EQ(adapter().startPreview(secondChange(), 0, 0, 1), Result::OutOfRange);
    EXPECT_TRUE(adapter().isPreviewActive());

    host.model().oldEdl().clear();
    host.idle();
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "one 86410-86420"}))
        << "The request before it stays.";
}

TEST_P(HostPreviewTest, GoesBackToWhenItWasOffAlsoWhereTheFirstRequestWasRefused)
{
    adapter().setPreviewActive(true);
    host.model().oldEdl().add(std::make_shared<UnwritableEvent>());
    ASSERT_EQ(adapter().startPreview(changes(), 0, 0, 1), Result::OutOfRange);
    host.model().oldEdl().clear();
    host.preview(changes());

    ASSERT_TRUE(host.undo());

    EXPECT_FALSE(adapter().isPreviewActive());
}

TEST_P(HostPreviewTest, GoesBackToWhenItWasOffAlsoWhereItWasRequestedTwice)
{
    const Span cycle = transportCycle();
    const Span left = locators();
    adapter().setPreviewActive(true);
    ASSERT_EQ(adapter().startPreview(firstChange(), 0, 0, 1), Result::Ok);
    host.preview(changes());
    ASSERT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview"}));

    ASSERT_TRUE(host.undo());

    EXPECT_FALSE(adapter().isPreviewActive());
    EXPECT_EQ(transportCycle(), cycle);
    EXPECT_EQ(locators(), left);
}

TEST_P(HostPreviewTest, GoesBackToWhenItWasOffAlsoWhereTheFirstBecameNoEntry)
{
    adapter().setPreviewActive(true);
    standin::EditService& edits = host.application.edits();
    ASSERT_EQ(edits.begin(true), ResultOk);
    host.preview(firstChange());
    ASSERT_EQ(edits.commit(host.document(), u"Other edit"), ResultOk);
    ASSERT_NE(host.undoNames().back(), u"Preview");
    host.preview(changes());
    ASSERT_EQ(host.undoNames().back(), u"Preview");

    ASSERT_TRUE(host.undo());

    EXPECT_FALSE(adapter().isPreviewActive());
}

TEST_P(HostPreviewTest, GoesBackToThePreviewBeforeOnceThatIsAnEntry)
{
    previewAll();
    host.preview(firstChange());

    ASSERT_TRUE(host.undo());

    EXPECT_TRUE(adapter().isPreviewActive());
}

TEST_P(HostPreviewTest, GoesBackToThePreviewThatARedoHasBroughtBackSinceItWasSwitchedOn)
{
    previewAll();
    const Texts shown = host.contentOf(track);
    ASSERT_TRUE(host.undo());
    adapter().setPreviewActive(true);
    ASSERT_TRUE(host.redo());
    ASSERT_EQ(host.contentOf(track), shown);
    host.preview(firstChange());

    ASSERT_TRUE(host.undo());

    EXPECT_EQ(host.contentOf(track), shown);
    EXPECT_TRUE(adapter().isPreviewActive());
}

TEST_P(HostPreviewTest, GoesBackToWhenItWasOffAlsoWhereAnotherChangeIsUndoneSinceItWasSwitchedOn)
{
    adapter().setPreviewActive(true);
    {
        const auto command = adapter().createCommand(L"Delete Event");
        host.model().changeEdl().remove(firstChange());
    }
    ASSERT_TRUE(host.undo());
    ASSERT_TRUE(adapter().isPreviewActive());
    host.preview(changes());

    ASSERT_TRUE(host.undo());

    EXPECT_FALSE(adapter().isPreviewActive());
}

TEST_P(HostPreviewTest, KeepsWhatItCanOfHowEverythingStood)
{
    // From a preview before, which stood elsewhere.
    host.model().setProperty(PropertyKey::TransportCycleLower, core::Variant(1.0));
    host.model().setProperty(PropertyKey::TransportCycleUpper, core::Variant(2.0));
    host.altered.hide(ITransportControl::iid);
    host.project.announceStoring();
    host.disconnect();
    host.connect();

    EXPECT_EQ(thrownBy([&] { adapter().setPreviewActive(true); }), Result::HostObjectMissing);

    EXPECT_TRUE(adapter().isPreviewActive());
    core::Variant left;
    EXPECT_EQ(host.model().getProperty(PropertyKey::ProjectCycleLeft, left), Result::Ok);
    EXPECT_EQ(left.toDouble(), 3.0);
    EXPECT_FALSE(host.model().hasProperty(PropertyKey::TransportCycleLower)) << "That would be restored at the end.";
    EXPECT_FALSE(host.model().hasProperty(PropertyKey::TransportCycleUpper));
}

TEST_P(HostPreviewTest, EndsAllTheSameWhereTheCycleCannotBeRestored)
{
    previewAll();
    host.model().setProperty(PropertyKey::TransportCycleLower, core::Variant(9.0));
    host.model().setProperty(PropertyKey::TransportCycleUpper, core::Variant(4.0));

    EXPECT_EQ(thrownBy([&] { adapter().setPreviewActive(false); }), Result::InvalidArgument);

    EXPECT_EQ(host.project.position().getValue(), 5.0);
    EXPECT_EQ(locators(), Span(3.0, 8.0));
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview", u"End Preview"}));
    EXPECT_FALSE(adapter().isPreviewActive());
}

// The switch.

TEST_P(HostPreviewTest, KeepsHowEverythingStoodBefore)
{
    adapter().setPreviewActive(true);

    const auto kept = [&](std::int32_t key) {
        core::Variant value;
        EXPECT_EQ(host.model().getProperty(key, value), Result::Ok);
        EXPECT_EQ(value.valueType(), core::Variant::Double);
        return value.toDouble();
    };
    EXPECT_TRUE(adapter().isPreviewActive());
    EXPECT_EQ(kept(PropertyKey::ProjectCycleLeft), 3.0);
    EXPECT_EQ(kept(PropertyKey::ProjectCycleRight), 8.0);
    EXPECT_EQ(kept(PropertyKey::TransportCycleLower), 4.0);
    EXPECT_EQ(kept(PropertyKey::TransportCycleUpper), 9.0);
    EXPECT_EQ(kept(PropertyKey::TransportPosition), 5.0);
    EXPECT_EQ(kept(PropertyKey::PreviewOffset), Day);
    EXPECT_EQ(host.undoNames(), entriesBefore);
}

TEST_P(HostPreviewTest, KeepsACycleThatIsTurnedRound)
{
    host.project.cycleLeft().setValue(0, 9.0);
    host.project.cycleRight().setValue(0, 4.0);

    adapter().setPreviewActive(true);
    adapter().setPreviewActive(false);

    EXPECT_EQ(transportCycle(), Span(4.0, 9.0));
}

TEST_P(HostPreviewTest, KeepsThemOnceWhenItIsSwitchedOnTwice)
{
    previewAll();

    adapter().setPreviewActive(true);
    adapter().setPreviewActive(false);

    EXPECT_EQ(locators(), Span(3.0, 8.0));
    EXPECT_EQ(transportCycle(), Span(4.0, 9.0));
}

TEST_P(HostPreviewTest, LeavesTheUsersTracksAsTheyWereWhenItEnds)
{
    previewAll();

    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    EXPECT_EQ(locators(), Span(3.0, 8.0));
    EXPECT_EQ(transportCycle(), Span(4.0, 9.0));
    EXPECT_EQ(host.project.position().getValue(), 5.0);
    EXPECT_FALSE(adapter().isPreviewActive());
    EXPECT_FALSE(hasOffset());
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview", u"End Preview"}));
}

TEST_P(HostPreviewTest, ComesBackWhenItsEndIsUndone)
{
    const double end = host.project.getEnd(nullptr);
    previewAll();
    const Texts during = host.contentOf(track);
    adapter().setPreviewActive(false);

    ASSERT_TRUE(host.undo());
    EXPECT_TRUE(adapter().isPreviewActive());
    EXPECT_TRUE(hasOffset());
    EXPECT_EQ(host.contentOf(track), during);
    EXPECT_EQ(host.project.getEnd(nullptr), Day + host.inHost(20.0)) << "To the end of the copies.";

    ASSERT_TRUE(host.redo());
    EXPECT_FALSE(adapter().isPreviewActive());
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    EXPECT_EQ(host.project.getEnd(nullptr), end);
}

TEST_P(HostPreviewTest, UnlocksTheTracksThatTheUndoOfItsEndHasLockedAgain)
{
    previewAll();
    adapter().setPreviewActive(false);
    ASSERT_TRUE(host.undo());
    ASSERT_TRUE(isLocked(track));

    adapter().setPreviewActive(false);

    EXPECT_FALSE(isLocked(track));
    host.conform();
    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
}

TEST_P(HostPreviewTest, TellsThatItIsSwitched)
{
    RecordingListener heard;
    adapter().addListener(&heard);

    adapter().setPreviewActive(true);
    EXPECT_EQ(heard.types, std::vector<std::int32_t>{ChangeContext::PreviewStateChanged});
    adapter().setPreviewActive(false);

    adapter().removeListener(&heard);
    EXPECT_EQ(std::ranges::count(heard.types, ChangeContext::PreviewStateChanged), 2);
}

TEST_P(HostPreviewTest, MakesRoomForThePreview)
{
    adapter().setPreviewActive(true);

    // A day from the offset on: nothing has changed, so that the preview is as long as the first.
    EXPECT_DOUBLE_EQ(host.root()->getEnd(nullptr), 2.0 * Day - host.origin);
}

TEST_P(HostPreviewTest, EndsWhereNothingWasKept)
{
    host.model().setPreviewActive(true);

    EXPECT_NO_THROW(adapter().setPreviewActive(false));

    EXPECT_FALSE(adapter().isPreviewActive());
    EXPECT_EQ(locators(), Span(3.0, 8.0));
    EXPECT_EQ(host.undoNames(), entriesBefore);
}

TEST_P(HostPreviewTest, RestoresEachOfTheValuesThatWasKept)
{
    previewAll();
    host.model().removeProperty(PropertyKey::TransportCycleUpper);
    host.model().removeProperty(PropertyKey::ProjectCycleLeft);
    const Span cycle = transportCycle();
    const Span left = locators();

    EXPECT_NO_THROW(adapter().setPreviewActive(false));

    EXPECT_EQ(transportCycle(), cycle) << "Half a cycle is none.";
    EXPECT_EQ(locators(), left);
    EXPECT_EQ(host.project.position().getValue(), 5.0);
}

TEST_P(HostPreviewTest, ForgetsItsRequestsWhenItIsSwitchedOff)
{
    adapter().setPreviewActive(true);
    adapter().startPreview(changes(), 0, 0, 1);
    adapter().startCadrel();

    adapter().setPreviewActive(false);
    host.idle();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"End Preview"}));
}

TEST_P(HostPreviewTest, GoesBackToAPreviewThatWasOnWhenItWasNeverSwitchedOn)
{
    // What is restored is what stood in the model, which a preview that goes on alone finds switched off.
    host.model().setPreviewActive(true);
    host.preview(changes());

    ASSERT_TRUE(host.undo());

    EXPECT_TRUE(adapter().isPreviewActive());
}

TEST_P(HostPreviewTest, GoesBackToAPreviewThatWasOnAlsoWhereItWasSwitchedOffBefore)
{
    adapter().setPreviewActive(true);
    adapter().setPreviewActive(false);
    host.model().setPreviewActive(true);
    host.preview(changes());

    ASSERT_TRUE(host.undo());

    EXPECT_TRUE(adapter().isPreviewActive());
}

TEST_P(HostPreviewTest, ReportsNoProgressOnceItIsOver)
{
    const auto edits = makeCounted<AlteredEdits>(host.context());
    host.altered.replace(IEditService::iid, edits);
    host.settings().setCreateOverlapMarkers(true);
    previewAll();
    int steps = 0;
    edits->beforeDelete = [&] {
        ++steps;
        const double time = host.onClock(1.0);
        EXPECT_NO_THROW(adapter().generateMarkers({{time, time, "overlap", core::MarkerKind::Overlap}}));
    };

    adapter().setPreviewActive(false);

    EXPECT_EQ(steps, 1);
}

// The end of the preview that leaves it switched on.

TEST_P(HostPreviewTest, CanBeEmptiedWhileItIsOn)
{
    previewAll();
    const Span cycle = transportCycle();

    EXPECT_EQ(adapter().endPreview(), Result::Ok);

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    EXPECT_TRUE(adapter().isPreviewActive());
    EXPECT_FALSE(hasOffset());
    EXPECT_EQ(transportCycle(), cycle);
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview", u"Delete Preview Range"}));
    EXPECT_EQ(adapter().endPreview(), Result::Ok) << "There is none any more.";
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview", u"Delete Preview Range"}));
}

TEST_P(HostPreviewTest, GoesBackToWhenItWasOffAlsoWhereItWasOnlyEmptied)
{
    adapter().setPreviewActive(true);

    adapter().endPreview();

    EXPECT_TRUE(adapter().isPreviewActive());
    ASSERT_EQ(host.undoNames(), entriesBeforeAnd({u"Delete Preview Range"}));
    ASSERT_TRUE(host.undo());
    EXPECT_FALSE(adapter().isPreviewActive());
}

TEST_P(HostPreviewTest, ForgetsItsRequestsWhenItIsEmptied)
{
    adapter().setPreviewActive(true);
    adapter().startPreview(changes(), 0, 0, 1);
    adapter().startCadrel();

    adapter().endPreview();
    host.idle();

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Delete Preview Range"}));
}

TEST_P(HostPreviewTest, KeepsWhatItHasDoneWhenItCannotBeEmptied)
{
    previewAll();
    const auto edits = makeCounted<AlteredEdits>(host.context());
    edits->deletes = false;
    host.altered.replace(IEditService::iid, edits);

    EXPECT_EQ(adapter().endPreview(), Result::HostCallFailed);

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview", u"Delete Preview Range (incomplete)"}));
    EXPECT_FALSE(host.isEditOpen());
}

TEST_P(HostPreviewTest, SaysThatItsEndIsIncomplete)
{
    previewAll();
    const auto edits = makeCounted<AlteredEdits>(host.context());
    edits->deletes = false;
    host.altered.replace(IEditService::iid, edits);

    EXPECT_EQ(thrownBy([&] { adapter().setPreviewActive(false); }), Result::HostCallFailed);

    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview", u"End Preview (incomplete)"}));
    EXPECT_FALSE(adapter().isPreviewActive());
}

// More than one project.

TEST_P(HostPreviewTest, IsForgottenWhenTheProjectChanges)
{
    adapter().setPreviewActive(true);
    adapter().startPreview(changes(), 0, 0, 1);
    standin::Project& other = host.application.createProject();

    host.application.activateProject(&other);
    host.idle();
    host.application.activateProject(&host.project);
    host.idle();

    EXPECT_EQ(host.undoNames(), entriesBefore);
    EXPECT_TRUE(adapter().isPreviewActive()) << "That is the project's own.";
    // Nothing is lowered around the next one any more.
    host.preview(changes());
    ASSERT_TRUE(host.undo());
    EXPECT_TRUE(adapter().isPreviewActive());
}

TEST_P(HostPreviewTest, GoesBackToAPreviewThatWasOnWhenTheProjectChangedMeanwhile)
{
    adapter().setPreviewActive(true);
    host.application.activateProject(&host.application.createProject());
    host.application.activateProject(&host.project);
    host.preview(changes());

    ASSERT_TRUE(host.undo());

    EXPECT_TRUE(adapter().isPreviewActive());
}

TEST_P(HostPreviewTest, BelongsToItsProject)
{
    previewAll();
    standin::Project& other = host.application.createProject();

    host.application.activateProject(&other);
    EXPECT_FALSE(adapter().isPreviewActive());
    adapter().setPreviewActive(true);
    adapter().setPreviewActive(false);
    host.application.activateProject(&host.project);

    EXPECT_TRUE(adapter().isPreviewActive());
    EXPECT_TRUE(isLocked(track));
    adapter().setPreviewActive(false);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    EXPECT_FALSE(isLocked(track));
}

TEST_P(HostPreviewTest, SurvivesTheCloseOfItsProject)
{
    previewAll();
    adapter().startPreview(changes(), 0, 0, 1);
    host.application.createProject();

    host.adapter().projectClosing(host.document(), 0);
    host.idle();

    EXPECT_EQ(adapter().getProjectModel(), nullptr);
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview"}));
}

TEST_P(HostPreviewTest, GoesOnAfterASaveAndALoad)
{
    previewAll();
    host.project.announceStoring();
    host.adapter().projectClosing(host.document(), 0);
    host.adapter().projectOpened(host.document());
    host.adapter().projectActivated(host.document());

    ASSERT_TRUE(adapter().isPreviewActive());
    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    EXPECT_FALSE(isLocked(track));
    EXPECT_EQ(transportCycle(), Span(4.0, 9.0));
    EXPECT_TRUE(host.alerts->messages.empty());
}

TEST_P(HostPreviewTest, LeavesNoTrackLockedThatNothingCouldUnlock)
{
    previewAll();
    host.project.announceStoring();
    ASSERT_TRUE(isLocked(track));
    host.project.setAttribute(AttributeKey::StorageChecksum, FVariant::integer(1), true);
    host.adapter().projectClosing(host.document(), 0);
    host.adapter().projectOpened(host.document());
    host.adapter().projectActivated(host.document());

    EXPECT_EQ(host.alerts->messages.size(), 1U);
    EXPECT_FALSE(adapter().isPreviewActive());
    EXPECT_FALSE(isLocked(track));
}

TEST_P(HostPreviewTest, MovesFurtherAwayWhereMaterialHasComeToReachItsPlace)
{
    constexpr double Place = Day - 3600.0;
    for (const auto& [end, place] :
         {Span(Place - 1.0 / 384000.0, Day), Span(Place, 2.0 * Day), Span(Place + 1.0 / 384000.0, 2.0 * Day)}) {
        SCOPED_TRACE(end - Place);
        host.addSound(track, u"late", Place - 10.0, end);
        host.model().setProperty(PropertyKey::PreviewOffset, core::Variant(Day));

        adapter().setPreviewActive(true);
        EXPECT_EQ(adapter().getRunState().previewOffset, place);
        adapter().setPreviewActive(false);

        host.model().setProperty(PropertyKey::PreviewOffset, core::Variant(Day));
        ASSERT_EQ(adapter().startCadrel(), Result::Ok);
        EXPECT_EQ(adapter().getRunState().previewOffset, place);
        adapter().endPreview();
    }
}

TEST_P(HostPreviewTest, ComesBackFromAPlaceThatIsNoTimeOfAProject)
{
    constexpr double Furthest = 5e8;
    constexpr double Infinity = std::numeric_limits<double>::infinity();
    constexpr double NoNumber = std::numeric_limits<double>::quiet_NaN();
    for (const auto& [stored, place] :
         {Span(Furthest, Furthest), Span(Furthest + 1.0, Day), Span(1e300, Day), Span(Infinity, Day),
          Span(-Infinity, Day), Span(-1e300, Day), Span(NoNumber, Day)}) {
        SCOPED_TRACE(stored);
        host.model().setProperty(PropertyKey::PreviewOffset, core::Variant(stored));

        adapter().setPreviewActive(true);
        EXPECT_EQ(adapter().getRunState().previewOffset, place);
        adapter().setPreviewActive(false);
    }
}

TEST_P(HostPreviewTest, EndsAlsoWhereItsStoredPlaceIsNoTimeOfAProject)
{
    const Texts film = host.contentOf(track);
    previewAll();
    host.model().setProperty(PropertyKey::PreviewOffset, core::Variant(1e300));
    host.project.announceStoring();
    host.disconnect();
    host.connect();

    previewAll();
    const Texts preview{"one 0-10", "two 10-20", "two 172800-172810", "one 172810-172820"};
    EXPECT_EQ(host.contentOf(track), preview) << "Past the one that stood there already.";
    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(track), film);
}

TEST_P(HostPreviewTest, LeavesMaterialWholeThatHasComeToReachItsPlace)
{
    host.conform();
    const Texts conformed{"two 0-10", "one 10-20", "late 82790-82830"};
    host.addSound(track, u"late", 82790.0, 82830.0);

    previewAll();
    EXPECT_EQ(host.contentOf(track),
              (Texts{"two 0-10", "one 10-20", "late 82790-82830", "one 172800-172810", "two 172810-172820"}));

    adapter().setPreviewActive(false);
    EXPECT_EQ(host.contentOf(track), conformed);
}

TEST_P(HostPreviewTest, MovesFurtherAwayWhereTheTimeOriginHasMoved)
{
    host.conform();
    host.project.setTimeOrigin(host.origin + Day);

    adapter().setPreviewActive(true);
    EXPECT_EQ(adapter().getRunState().previewOffset, 2.0 * Day);
    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
}

TEST_P(HostPreviewTest, TellsWhatWouldStandBeforeTheProjectBegins)
{
    host.project.setTimeOrigin(3604.0);
    host.idle();
    host.addClip(track, u"steps", 7.0, 8.0); // from 01:00:11:00 on, which goes to 01:00:01:00

    previewAll();

    const Entries told{u"Left out, as it would stand before the project or its day begins: material of event 2."};
    EXPECT_EQ(host.alerts->messages, told);
}

// Memos.

TEST_P(HostMemoTest, FollowWhatTheUserDoesToTheirCopies)
{
    adapter().setPreviewActive(true);
    host.preview(firstChange()); // 0 to 10 s, shown from 10 s on
    host.idle();
    const Node hiss = copyOf(u"hiss");
    const Node click = copyOf(u"click");

    edit([&] {
        click->setStart(nullptr, 0, inPreview(17.0));
        hiss->setName(nullptr, standin::tests::text(u"hum").get(), 0);
    });
    EXPECT_EQ(filmMemos(), (Texts{"hum 2-4", "click 7-7", "far 30-30"}));

    edit([&] { hiss->setEnd(nullptr, 0, inPreview(15.0)); });
    EXPECT_EQ(filmMemos(), (Texts{"hum 2-5", "click 7-7", "far 30-30"}));

    host.addPointMarker(memos, u"pop", inPreview(11.0));
    EXPECT_EQ(filmMemos(), (Texts{"pop 1-1", "hum 2-5", "click 7-7", "far 30-30"}));

    edit([&] { host.transaction()->remove(memos.get(), hiss.get()); });
    EXPECT_EQ(filmMemos(), (Texts{"pop 1-1", "click 7-7", "far 30-30"}));
}

TEST_P(HostMemoTest, StayWhenTheFirstEditIsAnotherMemoBesideThemAtTheirSource)
{
    previewAtItsSource();

    host.addPointMarker(memos, u"late", host.inHost(5.0));

    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "late 5-5", "click 6-6", "far 30-30"}));
}

TEST_P(HostMemoTest, KeepTheFirstEditThatIsMadeToThemAtTheirSource)
{
    previewAtItsSource();
    const Node hiss = standin::tests::childrenOf(*memos).front();

    edit([&] {
        hiss->setName(nullptr, standin::tests::text(u"hum").get(), 0);
        hiss->setEnd(nullptr, 0, host.inHost(5.0));
    });

    EXPECT_EQ(filmMemos(), (Texts{"hum 2-5", "click 6-6", "far 30-30"}));
}

TEST_P(HostMemoTest, AreGoneWhenTheFirstEditRemovesThemAtTheirSource)
{
    previewAtItsSource();

    edit([&] { host.transaction()->remove(memos.get(), standin::tests::childrenOf(*memos).front().get()); });

    EXPECT_EQ(filmMemos(), (Texts{"click 6-6", "far 30-30"}));
}

TEST_P(HostMemoTest, FollowTheFirstEditOfTheirCopiesAlsoWhereTheirSourceIsLookedAt)
{
    previewAtItsSource();

    edit([&] { copyOf(u"click")->setStart(nullptr, 0, inPreview(17.0)); });

    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 7-7", "far 30-30"}));
}

TEST_P(HostMemoTest, GoBackWithTheEditThatTheyFollowed)
{
    adapter().setPreviewActive(true);
    host.preview(firstChange());
    host.idle();
    const Texts before = filmMemos();

    edit([&] { copyOf(u"click")->setStart(nullptr, 0, inPreview(17.0)); });
    ASSERT_NE(filmMemos(), before);

    ASSERT_TRUE(host.undo());
    EXPECT_EQ(filmMemos(), before);
}

TEST_P(HostMemoTest, StayAsTheyAreWhileARunWorksOnThem)
{
    adapter().setPreviewActive(true);
    host.preview(changes());
    host.idle();

    host.conform();

    EXPECT_EQ(filmMemos(), (Texts{"hiss 12-14", "click 16-16"})) << "They went where the change events took them.";
    edit([&] { host.addPointMarker(memos, u"late", host.inHost(18.0)); });
    EXPECT_EQ(filmMemos(), (Texts{"hiss 12-14", "click 16-16", "late 18-18"}))
        << "There is no preview any more whose copies could be missed.";
}

TEST_P(HostMemoTest, StayWhenThePreviewEndsOrIsEmptied)
{
    adapter().setPreviewActive(true);
    host.preview(firstChange());
    host.idle();

    adapter().endPreview();
    host.addPointMarker(memos, u"late", host.inHost(18.0));
    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 6-6", "late 18-18", "far 30-30"}));

    adapter().setPreviewActive(false);
    host.addPointMarker(memos, u"later", host.inHost(19.0));
    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 6-6", "late 18-18", "later 19-19", "far 30-30"}));
}

TEST_P(HostMemoTest, FollowThePreviewThatAnUndoBroughtBack)
{
    adapter().setPreviewActive(true);
    host.preview(firstChange());
    host.preview(secondChange()); // 10 to 20 s, which has no memos
    host.idle();
    ASSERT_TRUE(host.undo());
    host.idle();

    edit([&] { copyOf(u"click")->setStart(nullptr, 0, inPreview(17.0)); });

    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 7-7", "far 30-30"}));
}

TEST_P(HostMemoTest, FollowThePreviewThatWasOnWhenTheProjectWasSaved)
{
    adapter().setPreviewActive(true);
    host.preview(firstChange());
    host.idle();
    host.project.announceStoring();
    host.disconnect();
    host.connect();

    edit([&] { copyOf(u"click")->setStart(nullptr, 0, inPreview(17.0)); });

    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 7-7", "far 30-30"}));
    EXPECT_TRUE(host.alerts->messages.empty());
}

TEST_P(HostMemoTest, FollowTheirCopiesStillWhereThePreviewCouldNotEnd)
{
    adapter().setPreviewActive(true);
    host.preview(firstChange());
    host.idle();
    ASSERT_EQ(host.contentOf(memos).size(), 5U);
    ASSERT_EQ(host.application.edits().begin(true), ResultOk);
    EXPECT_EQ(thrownBy([&] { adapter().setPreviewActive(false); }), Result::HostCallFailed);
    ASSERT_EQ(host.application.edits().commit(&host.project, u"Mix"), ResultOk);

    adapter().setPreviewActive(true);
    host.idle();
    edit([&] { copyOf(u"hiss")->setName(nullptr, standin::tests::text(u"hum").get(), 0); });
    adapter().setPreviewActive(false);

    EXPECT_EQ(host.contentOf(memos), (Texts{"hum 2-4", "click 6-6", "far 30-30"}));
}

TEST_P(HostMemoTest, FollowTheirCopiesAlsoWhereTheTimeOriginHasMovedMeanwhile)
{
    for (const double moved : {10.0, 3600.0, 0.5}) {
        SCOPED_TRACE(moved);
        adapter().setPreviewActive(true);
        host.preview(firstChange());
        host.idle();
        host.project.setTimeOrigin(host.origin + moved);

        edit([&] { copyOf(u"click")->setStart(nullptr, 0, inPreview(17.0)); });
        EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 7-7", "far 30-30"}));

        host.project.announceStoring();
        host.disconnect();
        host.connect();
        edit([&] { copyOf(u"click")->setStart(nullptr, 0, inPreview(16.0)); });
        EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 6-6", "far 30-30"}));

        host.project.setTimeOrigin(host.origin);
        adapter().setPreviewActive(false);
    }
}

TEST_P(HostMemoTest, StayWhereTheStoredEventsOfThePreviewAreDamaged)
{
    adapter().setPreviewActive(true);
    host.preview(firstChange());
    host.idle();
    host.project.announceStoring();
    FVariant stored;
    requireOk(host.root()->getAttribute(AttributeKey::Storage, stored));
    const auto list = query<IAttributeData>(stored.asObject());
    std::vector<std::uint8_t> bytes(static_cast<std::size_t>(list->getBinarySize("CaDrPreview")));
    ASSERT_GT(bytes.size(), 8U);
    requireOk(list->getBinary("CaDrPreview", bytes.data(), static_cast<int32>(bytes.size())));
    const auto reopenWith = [&](const std::vector<std::uint8_t>& damaged) {
        requireOk(list->setBinary("CaDrPreview", damaged.data(), static_cast<int32>(damaged.size()), true));
        requireOk(host.root()->setAttribute(AttributeKey::Storage, stored, true));
        host.disconnect();
        requireOk(host.root()->setAttribute(AttributeKey::Storage, stored, true));
        host.connect();
    };

    for (std::size_t size = 0; size < bytes.size(); ++size) {
        SCOPED_TRACE(size);
        reopenWith({bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(size)});
        ASSERT_TRUE(adapter().isPreviewActive());
    }
    for (std::size_t at = 0; at < bytes.size(); ++at) {
        SCOPED_TRACE(at);
        std::vector<std::uint8_t> damaged = bytes;
        damaged[at] ^= 0x80;
        reopenWith(damaged);
        ASSERT_TRUE(adapter().isPreviewActive());
    }
    edit([&] { copyOf(u"click")->setStart(nullptr, 0, inPreview(17.0)); });
    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 6-6", "far 30-30"}));
    EXPECT_TRUE(host.alerts->messages.empty());

    reopenWith(bytes);
    edit([&] { copyOf(u"click")->setStart(nullptr, 0, inPreview(18.0)); });
    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 8-8", "far 30-30"}));
}

TEST_P(HostMemoTest, StayWhenThePreviewIsUndone)
{
    adapter().setPreviewActive(true);
    host.preview(firstChange());
    host.idle();
    ASSERT_TRUE(host.undo());

    host.addPointMarker(memos, u"late", host.inHost(8.0));

    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 6-6", "late 8-8", "far 30-30"}));
}

TEST_P(HostMemoTest, TellTheHostNoFailureButTheOne)
{
    const auto refusing = makeCounted<AlteredEdits>(host.context());
    refusing->removes = false;
    int32 answer = ResultOk;
    Texts calls;
    const auto hook = makeCounted<standin::tests::Recorder>(calls);
    const auto manager = service<IProjectManager>(host.context());
    // It is called before the adapter, which therefore has the edit still to follow.
    host.project.announceStoring();
    host.disconnect();
    ASSERT_EQ(manager->addNotification(hook.get()), ResultOk);
    host.connect();
    previewAll();
    host.idle();
    hook->whenCalled = [&](const std::string& call) {
        if (call == "edited")
            answer = adapter().projectEdited(host.document(), refusing.get());
    };

    edit([&] { host.transaction()->remove(memos.get(), copyOf(u"click").get()); });

    EXPECT_EQ(answer, Result::HostObjectMissing);
    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "far 30-30"})) << "The host's own call has removed it.";
    manager->removeNotification(hook.get());
}

TEST_P(HostMemoTest, StayWhereThePreviewCannotFollowTheUndoList)
{
    const auto edits = makeCounted<AlteredEdits>(host.context());
    edits->addsStep = [](IEditStep* step) { return dynamic_cast<PreviewEventsStep*>(step) == nullptr; };
    host.altered.replace(IEditService::iid, edits);
    previewAll();
    host.idle();

    edit([&] { copyOf(u"click")->setStart(nullptr, 0, inPreview(17.0)); });

    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 6-6", "far 30-30"}));
}

TEST_P(HostMemoTest, FollowTheEventsThatAreGivenAlone)
{
    adapter().setPreviewActive(true);
    host.preview(firstChange());
    host.idle();
    const Node click = copyOf(u"click");

    EXPECT_EQ(adapter().setProjectEvents(core::EventList()), Result::Ok);

    edit([&] { click->setStart(nullptr, 0, inPreview(17.0)); });
    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 6-6", "far 30-30"}));
}

TEST_P(HostMemoTest, StayWhenAPreviewEndsOfWhichTheOffsetIsLost)
{
    adapter().setPreviewActive(true);
    host.preview(firstChange());
    host.idle();
    const Node click = copyOf(u"click");
    host.model().removeProperty(PropertyKey::PreviewOffset);

    EXPECT_EQ(adapter().endPreview(), Result::Ok);

    // The next request finds the place of a preview again.
    host.model().setProperty(PropertyKey::PreviewOffset, core::Variant(Day));
    edit([&] { click->setStart(nullptr, 0, inPreview(17.0)); });
    EXPECT_EQ(filmMemos(), (Texts{"hiss 2-4", "click 6-6", "far 30-30"}));
}

} // namespace cadrel::host::tests
