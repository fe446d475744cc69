// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/Track.h"

#include "host/border/HostFailure.h"
#include "host/track/AutomationCurve.h"
#include "host/track/TrackIndex.h"
#include "host/track/TrackRole.h"
#include "standin/project/Track.h"
#include "tests/support/TempFolder.h"
#include "tests/support/host/FakeProject.h"
#include "tests/support/host/TrackHost.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>

#include <array>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

using tests::FakeNode;
using tests::FakeProject;
using tests::TrackHost;
using util::Result;

namespace {

/// With a clock that begins at 0 and with one that begins at 01:00:00:00.
class TrackTest : public testing::TestWithParam<double> {
protected:
    void remove(const TrackHost::Node& track)
    {
        host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), track.get())); });
    }

    TrackHost host{GetParam()};
};

INSTANTIATE_TEST_SUITE_P(Origins, TrackTest, testing::Values(0.0, 3600.0));

FVariant attributeOf(const TrackHost::Node& node, const char* key)
{
    FVariant value;
    node->getAttribute(key, value);
    return value;
}

bool isPersistent(const TrackHost::Node& node, const char* key)
{
    return dynamic_cast<const standin::Node&>(*node).attributes().at(key).isPersistent;
}

} // namespace

TEST_P(TrackTest, AnEmptyHandleAnswersWithNothing)
{
    for (const Track& track : {Track(), Track(&host.adapter, nullptr),
                               Track(nullptr, query<ITrackNode>(host.addTrack(TypeWord::Audio, u"FX")).get())}) {
        EXPECT_FALSE(track.isAlive());
        EXPECT_FALSE(track.isAudio() || track.isMarker() || track.isVideo() || track.isFolder());
        EXPECT_FALSE(track.isSelected());
        EXPECT_FALSE(track.hasChanged());
        EXPECT_FALSE(track.hostLocked());
        EXPECT_FALSE(track.hasLockState());
        EXPECT_EQ(track.getName(), L"");
        EXPECT_EQ(track.role(), -1);
        EXPECT_FALSE(track.hasRole(TrackRole::Memos, -1));
        EXPECT_EQ(track.timeOrigin(), 0.0);
        EXPECT_TRUE(track.eventsInRange(0.0, 100.0).empty());
        EXPECT_TRUE(track.eventsInRange(100.0, 0.0).empty());
        EXPECT_TRUE(track.clipEvents().empty());
        EXPECT_FALSE(track.eventAt(10.0, Track::Direction::Forward));
        EXPECT_EQ(track.nextUserId(), 1);
        EXPECT_TRUE(track.prepareVirginRange().empty());
    }
}

TEST_P(TrackTest, AnEmptyHandleChangesNothing)
{
    Track track;
    std::vector<AutomationCurve> noCurves;

    EXPECT_EQ(resultOf([&] { track.setName(L"FX"); }), Result::NotAvailable);
    EXPECT_EQ(resultOf([&] { track.setRole(TrackRole::Memos); }), Result::NotAvailable);
    EXPECT_EQ(resultOf([&] { track.setLock(true); }), Result::NotAvailable);
    EXPECT_EQ(resultOf([&] { track.removeAll(*host.transaction()); }), Result::NotAvailable);
    EXPECT_EQ(resultOf([&] { track.removeRange(*host.transaction(), 0.0, 1.0); }), Result::NotAvailable);
    EXPECT_EQ(resultOf([&] { track.container(); }), Result::NotAvailable);
    EXPECT_EQ(resultOf([&] { track.readIndex(); }), Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { track.assignIds(0.0, 100.0); }), Result::Ok);
    EXPECT_EQ(resultOf([&] { track.assignOwnIds(0.0, 100.0); }), Result::Ok);
    EXPECT_EQ(resultOf([&] { track.fillAutomationGap(*host.transaction(), noCurves, 0.0, 1.0); }), Result::Ok);
}

TEST_P(TrackTest, AHandleDiesWhenTheRemovalOfItsTrackIsToldAndOnlyThen)
{
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    const Track track = host.handle(node);
    const Track copy = track;
    EXPECT_TRUE(track.isAlive());

    ASSERT_EQ(host.transaction()->begin(true), ResultOk);
    ASSERT_EQ(host.transaction()->remove(host.root(), node.get()), ResultOk);
    EXPECT_TRUE(track.isAlive());
    EXPECT_TRUE(copy.isAlive());
    ASSERT_EQ(host.transaction()->commit(host.document(), u"Remove"), ResultOk);

    EXPECT_FALSE(track.isAlive());
    EXPECT_FALSE(copy.isAlive());
    EXPECT_EQ(track.node(), nullptr);
    EXPECT_EQ(track.getName(), L"");
    EXPECT_EQ(track.role(), -1);
    EXPECT_EQ(track.timeOrigin(), 0.0);
}

TEST_P(TrackTest, ADeadHandleStaysDeadWhenItsTrackComesBack)
{
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    const Track track = host.handle(node);
    remove(node);
    ASSERT_FALSE(track.isAlive());

    ASSERT_TRUE(host.undo());

    EXPECT_FALSE(track.isAlive());
    EXPECT_TRUE(host.handle(node).isAlive());
}

TEST_P(TrackTest, AHandleThatNobodyAskedMeanwhileLivesOnWithATrackThatHasComeBack)
{
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    const Track track = host.handle(node);

    remove(node);
    ASSERT_TRUE(host.undo());

    EXPECT_TRUE(track.isAlive());
}

TEST_P(TrackTest, AHandleDiesWithTheUndoOfItsTracksInsertion)
{
    const Track track = host.handle(host.addTrack(TypeWord::Audio, u"FX"));

    ASSERT_TRUE(host.undo());

    EXPECT_FALSE(track.isAlive());
}

TEST_P(TrackTest, AHandleLivesOnWhenItsTrackMovesIntoAFolderAndDiesWithTheFolder)
{
    const auto folder = host.addTrack(TypeWord::Folder, u"Sound");
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    const Track track = host.handle(node);

    host.edit(u"Move", [&] { requireOk(host.transaction()->move(host.root(), folder.get(), node.get())); });
    EXPECT_TRUE(track.isAlive());

    remove(folder);
    EXPECT_FALSE(track.isAlive());
}

TEST_P(TrackTest, AHandleThatWasFoundAliveIsNotLookedForAgainBeforeTheNextChange)
{
    const auto folder = host.addTrack(TypeWord::Folder, u"Sound");
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    const Track track = host.handle(node);
    host.edit(u"Move", [&] { requireOk(host.transaction()->move(host.root(), folder.get(), node.get())); });
    EXPECT_TRUE(track.isAlive());

    host.edit(u"Remove", [&] {
        requireOk(host.transaction()->remove(folder.get(), node.get()));
        EXPECT_TRUE(track.isAlive());
    });

    EXPECT_FALSE(track.isAlive());
}

TEST_P(TrackTest, ARemovalThatNobodyAskedForIsNotForgottenWithTheNextChange)
{
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    const Track track = host.handle(node);
    remove(node);

    host.addTrack(TypeWord::Audio, u"Foley");

    EXPECT_FALSE(track.isAlive());
}

TEST_P(TrackTest, CopiesOfAHandleThatNobodyAskedAfterTheRemovalAreDeadToo)
{
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    const Track track = host.handle(node);
    Track assigned;
    remove(node);

    const Track copy = track;
    assigned = track;

    EXPECT_FALSE(copy.isAlive());
    EXPECT_FALSE(assigned.isAlive());
}

TEST_P(TrackTest, AnnouncedChangesAreNotedLikeThoseThatAreThrough)
{
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    Track track = host.handle(node);
    bool wasAlive = true;
    host.teller.whenTold = [&] {
        track = host.handle(node);
        track.projectChanging(host.adapter);
        wasAlive = track.isAlive();
    };

    remove(node);

    EXPECT_FALSE(wasAlive);
}

TEST_P(TrackTest, OtherChangesLeaveAHandleAlive)
{
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    const Track track = host.handle(node);

    host.addClip(node, u"door", 1.0, 2.0);
    remove(host.addTrack(TypeWord::Audio, u"Foley"));

    EXPECT_TRUE(track.isAlive());
}

TEST_P(TrackTest, HandlesAreEqualWhenTheirTracksAre)
{
    const auto fx = host.addTrack(TypeWord::Audio, u"FX");
    const auto foley = host.addTrack(TypeWord::Audio, u"Foley");

    EXPECT_EQ(host.handle(fx), host.handle(fx));
    EXPECT_NE(host.handle(fx), host.handle(foley));
    EXPECT_NE(host.handle(fx), Track());
    EXPECT_EQ(Track(&host.adapter, nullptr), Track());
}

TEST_P(TrackTest, AnAssignedHandleListensToTheProjectThatItComesFrom)
{
    standin::Project& otherProject = host.application.createProject();
    const auto otherNode = query<ITrackNode>(Counted<FUnknown>::adopt(otherProject.createTrack(TypeWord::Audio)));
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    Track track;

    {
        Project other(host.context(), &otherProject);
        track = Track(&other, otherNode.get());
        track = host.handle(node);
    }
    EXPECT_TRUE(track.isAlive());
    remove(node);

    EXPECT_FALSE(track.isAlive());
}

TEST_P(TrackTest, AnAssignedHandleNoLongerListensToItsFormerProject)
{
    const auto project = makeCounted<FakeProject>(GetParam());
    const auto formerProject = makeCounted<FakeProject>(GetParam());
    Project adapter(host.context(), project.get());
    Project former(host.context(), formerProject.get());
    const auto node = makeCounted<FakeNode>();
    node->flags = ChangeFlag::Removed;
    Track track(&former, makeCounted<FakeNode>().get());

    track = Track(&adapter, node.get());
    former.onProjectChanged();
    EXPECT_TRUE(track.isAlive());
    adapter.onProjectChanged();

    EXPECT_FALSE(track.isAlive());
}

TEST_P(TrackTest, AHandleAssignedToItselfStaysWhatItWas)
{
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    Track track = host.handle(node);
    const Track& same = track;

    track = same;
    EXPECT_TRUE(track.isAlive());
    remove(node);

    EXPECT_FALSE(track.isAlive());
}

TEST_P(TrackTest, HandlesGiveTheirReferencesBack)
{
    const auto project = makeCounted<FakeProject>(GetParam());
    const auto node = makeCounted<FakeNode>();
    project->children.push_back(node);
    {
        Project adapter(host.context(), project.get());
        const Track track(&adapter, node.get());
        const Track copy = track;
        EXPECT_TRUE(copy.isAlive());
    }

    EXPECT_EQ(node->refCount(), 2);
}

TEST_P(TrackTest, ATrackWhoseFlagsCannotBeAskedIsLookedFor)
{
    const auto project = makeCounted<FakeProject>(GetParam());
    Project adapter(host.context(), project.get());
    const auto lost = makeCounted<FakeNode>();
    const auto found = makeCounted<FakeNode>();
    project->children.push_back(found);
    const Track lostTrack(&adapter, lost.get());
    const Track foundTrack(&adapter, found.get());
    EXPECT_TRUE(lostTrack.isAlive());

    adapter.onProjectChanged();
    EXPECT_TRUE(lostTrack.isAlive());

    lost->isNode = false;
    found->isNode = false;
    EXPECT_EQ(resultOf([&] { foundTrack.getName(); }), Result::HostObjectMissing);
    adapter.onProjectChanged();
    EXPECT_FALSE(lostTrack.isAlive());
    EXPECT_TRUE(foundTrack.isAlive());
}

TEST_P(TrackTest, KnowsTheKindOfItsTrack)
{
    const auto kinds = [this](const char* word) {
        const Track track = host.handle(host.addTrack(word, u"track"));
        return std::array{track.isAudio(), track.isMarker(), track.isVideo(), track.isFolder()};
    };

    EXPECT_EQ(kinds(TypeWord::Audio), (std::array{true, false, false, false}));
    EXPECT_EQ(kinds(TypeWord::Marker), (std::array{false, true, false, false}));
    EXPECT_EQ(kinds(TypeWord::Video), (std::array{false, false, true, false}));
    EXPECT_EQ(kinds(TypeWord::Folder), (std::array{false, false, false, true}));
    EXPECT_EQ(kinds(TypeWord::Ruler), (std::array{false, false, false, false}));
}

TEST_P(TrackTest, IsOfAKindOnlyIfItIsATrackToo)
{
    const auto project = makeCounted<FakeProject>(GetParam());
    Project adapter(host.context(), project.get());
    const auto node = makeCounted<FakeNode>();
    const Track track(&adapter, node.get());

    node->words = {TypeWord::Audio, TypeWord::Marker, TypeWord::Video, TypeWord::Folder};
    EXPECT_FALSE(track.isAudio() || track.isMarker() || track.isVideo() || track.isFolder());
    node->words.insert(TypeWord::Track);
    EXPECT_TRUE(track.isAudio() && track.isMarker() && track.isVideo() && track.isFolder());
}

TEST_P(TrackTest, TellsWhetherItIsSelected)
{
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    const Track track = host.handle(node);

    EXPECT_FALSE(track.isSelected());
    dynamic_cast<standin::Track&>(*node).setSelected(true);
    EXPECT_TRUE(track.isSelected());
}

TEST_P(TrackTest, HasChangedWhileAChangeOfItsContentIsTold)
{
    const auto fx = host.addTrack(TypeWord::Audio, u"FX");
    const auto foley = host.addTrack(TypeWord::Audio, u"Foley");
    std::vector<bool> changed;
    host.teller.whenTold = [&] {
        changed.push_back(host.handle(fx).hasChanged());
        changed.push_back(host.handle(foley).hasChanged());
    };

    host.addClip(fx, u"door", 1.0, 2.0);

    EXPECT_EQ(changed, (std::vector{true, false}));
    EXPECT_FALSE(host.handle(fx).hasChanged());
}

TEST_P(TrackTest, ReadsAndWritesItsName)
{
    const auto node = host.addTrack(TypeWord::Audio, u"FX \u00c4 \U0001F50A");
    Track track = host.handle(node);

    EXPECT_EQ(track.getName(), L"FX \u00c4 \U0001F50A");
    track.setName(L"Ge\u00e4usche \U0001F50A");
    EXPECT_EQ(std::u16string(node->getName()), u"Ge\u00e4usche \U0001F50A");
    track.setName(L"");
    EXPECT_EQ(track.getName(), L"");
}

TEST_P(TrackTest, ReportsWhatTheHostRefuses)
{
    const auto project = makeCounted<FakeProject>(GetParam());
    Project adapter(host.context(), project.get());
    const auto node = makeCounted<FakeNode>();
    node->words = {TypeWord::Track, TypeWord::Marker};
    Track track(&adapter, node.get());

    node->setterResult = ResultFalse;
    EXPECT_EQ(resultOf([&] { track.setName(L"Memos"); }), Result::HostCallFailed);
    EXPECT_EQ(resultOf([&] { track.setRole(TrackRole::Memos); }), Result::HostCallFailed);
    EXPECT_EQ(resultOf([&] { track.setLock(true); }), Result::HostCallFailed);
    node->setterResult = ResultOk;
    EXPECT_EQ(resultOf([&] { track.setName(L"Memos"); }), Result::Ok);
    EXPECT_EQ(resultOf([&] { track.setRole(TrackRole::Memos); }), Result::Ok);
    EXPECT_EQ(resultOf([&] { track.setLock(true); }), Result::Ok);
}

TEST_P(TrackTest, MissesAContainerThatTheHostHasNot)
{
    const auto project = makeCounted<FakeProject>(GetParam());
    project->hasContainers = false;
    Project adapter(host.context(), project.get());
    const auto node = makeCounted<FakeNode>();
    node->children.push_back(makeCounted<FakeNode>(1.0, 2.0));
    Track track(&adapter, node.get());
    const HostEvent event(track, node->children.front());

    EXPECT_EQ(resultOf([&] { track.eventsInRange(0.0, 10.0); }), Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { track.setName(L"FX"); }), Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { track.eventSpan(event); }), Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { track.readIndex(); }), Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { track.removeAll(*host.transaction()); }), Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { event.getStart(); }), Result::HostObjectMissing);
}

TEST_P(TrackTest, KeepsItsRoleUnderTheKeyOfItsKind)
{
    const auto check = [this](const char* word, const char* key, std::int32_t role) {
        const auto node = host.addTrack(word, u"track");
        Track track = host.handle(node);
        EXPECT_EQ(track.role(), -1);

        track.setRole(role);

        EXPECT_EQ(attributeOf(node, key).asInteger(), role);
        EXPECT_TRUE(isPersistent(node, key));
        EXPECT_EQ(track.role(), role);
    };

    check(TypeWord::Marker, "Cadrel:MarkerType", 7);
    check(TypeWord::Video, "Cadrel:VideoType", 266);
    check(TypeWord::Folder, "Cadrel:FolderType", 9);
}

TEST_P(TrackTest, HasNoRoleWhereNoIntegerIsStored)
{
    const auto node = host.addTrack(TypeWord::Marker, u"Memos");
    const Track track = host.handle(node);

    ASSERT_EQ(node->setAttribute(AttributeKey::MarkerType, FVariant::string("7"), true), ResultOk);

    EXPECT_EQ(track.role(), -1);
    EXPECT_FALSE(track.hasRole(0, -1));
    EXPECT_FALSE(track.hasRole(0, 0));
}

TEST_P(TrackTest, RefusesRolesOnTracksOfOtherKinds)
{
    for (const char* word : {TypeWord::Audio, TypeWord::Ruler}) {
        Track track = host.handle(host.addTrack(word, u"track"));

        EXPECT_EQ(resultOf([&] { track.role(); }), Result::NotSupported);
        EXPECT_EQ(resultOf([&] { track.setRole(TrackRole::Memos); }), Result::NotSupported);
        EXPECT_EQ(resultOf([&] { track.hasRole(TrackRole::Memos, -1); }), Result::NotSupported);
    }
}

TEST_P(TrackTest, ComparesItsRoleInTheBitsOfAMask)
{
    Track track = host.handle(host.addTrack(TypeWord::Video, u"Picture"));
    EXPECT_FALSE(track.hasRole(0, 0));

    track.setRole(266); // 256 + 10
    EXPECT_TRUE(track.hasRole(256, 65280));
    EXPECT_TRUE(track.hasRole(266, -1));
    EXPECT_FALSE(track.hasRole(10, -1));
    EXPECT_TRUE(track.hasRole(10, 255));
    EXPECT_TRUE(track.hasRole(522, 255)); // 512 + 10
    EXPECT_FALSE(track.hasRole(8, 255));

    track.setRole(10);
    EXPECT_FALSE(track.hasRole(256, 65280));
    EXPECT_TRUE(track.hasRole(10, -1));
}

TEST_P(TrackTest, LocksAndUnlocksItsTrackAndSaysThatItDid)
{
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    Track track = host.handle(node);
    EXPECT_FALSE(track.hostLocked());
    EXPECT_FALSE(track.hasLockState());

    track.setLock(true);
    EXPECT_TRUE(track.hostLocked());
    EXPECT_TRUE(track.hasLockState());
    EXPECT_EQ(attributeOf(node, "Cadrel:LockState").asInteger(), 1);
    EXPECT_TRUE(isPersistent(node, "Cadrel:LockState"));

    track.setLock(false);
    EXPECT_FALSE(track.hostLocked());
    EXPECT_FALSE(track.hasLockState());
    EXPECT_EQ(attributeOf(node, "Cadrel:LockState").type(), FVariant::Type::Integer);
    EXPECT_EQ(attributeOf(node, "Cadrel:LockState").asInteger(), 0);
}

TEST_P(TrackTest, HoldsATrackThatTheUserHadLockedFromThenOnAlsoAfterALoad)
{
    const cadrel::tests::TempFolder folder;
    const auto file = folder.path() / "locked.stage";
    const auto node = host.addTrack(TypeWord::Audio, u"FX");
    dynamic_cast<standin::Track&>(*node).setLocked(true);
    Track track = host.handle(node);
    EXPECT_TRUE(track.hostLocked());
    EXPECT_FALSE(track.hasLockState());

    track.setLock(true);
    host.application.saveProject(host.project, file);
    standin::Project& loaded = host.application.openProject(file);

    Project adapter(host.context(), &loaded);
    const Track loadedTrack(&adapter, loaded.allTracks().at(0));
    EXPECT_TRUE(loadedTrack.hostLocked());
    EXPECT_TRUE(loadedTrack.hasLockState());
}

TEST_P(TrackTest, TakesTheTimeOriginFromItsProject)
{
    EXPECT_EQ(host.handle(host.addTrack(TypeWord::Audio, u"FX")).timeOrigin(), GetParam());
}

} // namespace cadrel::host
