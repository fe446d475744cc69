// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/Project.h"

#include "host/border/HostFailure.h"
#include "standin/project/Track.h"
#include "tests/host/project/AlteredDocument.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/host/FakeProject.h"
#include "tests/support/host/TrackHost.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <set>
#include <string>
#include <utility>
#include <vector>

using namespace Velmark;
using cadrel::tests::thrownBy;
using cadrel::util::Result;
using standin::tests::childrenOf;
using standin::tests::namesOf;

namespace cadrel::host {

using tests::AlteredDocument;
using tests::FakeNode;
using tests::FakeProject;
using tests::TrackHost;

namespace {

using Names = std::vector<std::u16string>;

std::wstring nameOf(const std::vector<Track>& tracks)
{
    std::wstring names;
    for (const Track& track : tracks)
        names += track.getName() + L" ";
    return names;
}

/// Texts in another language.
class Shouting : public cadrel::tests::PlainConverter {
public:
    std::wstring translate(const std::wstring& text) const override { return text + L"!"; }
};

/// A track of a bad host that tells whether it is locked, and may refuse it.
class LockTrack : public FakeNode {
public:
    LockTrack(std::set<std::string> kinds, std::int32_t videoRole) : m_videoRole(videoRole)
    {
        words = std::move(kinds);
    }

    bool isLocked = false;

    int32 setFlag(const char*, bool flag) override
    {
        if (setterResult == ResultOk)
            isLocked = flag;
        return setterResult;
    }
    int32 getFlag(const char*) override { return isLocked ? ResultOk : ResultFalse; }
    int32 getAttribute(const char* key, FVariant& value) override
    {
        if (std::string(key) == AttributeKey::LockState) {
            value = FVariant::integer(m_lockState);
            return ResultOk;
        }
        if (m_videoRole == 0 || std::string(key) != AttributeKey::VideoType)
            return ResultFalse;
        value = FVariant::integer(m_videoRole);
        return ResultOk;
    }
    int32 setAttribute(const char* key, const FVariant& value, bool) override
    {
        if (setterResult == ResultOk && std::string(key) == AttributeKey::LockState)
            m_lockState = value.asInteger();
        return setterResult;
    }

private:
    std::int32_t m_videoRole;
    std::int64_t m_lockState = 0;
};

/// With a clock that begins at 0 and with one that begins at 01:00:00:00.
class ProjectTracksTest : public testing::TestWithParam<double> {
protected:
    void createMarkerTracks() { createMarkerTracks(host.adapter); }
    void createMarkerTracks(Project& project)
    {
        host.edit(u"Markers", [&] { project.createMarkerTracks(*host.transaction()); });
    }
    void createVideoTracks(Project& project)
    {
        host.edit(u"Videos", [&] { project.createVideoTracks(*host.transaction()); });
    }
    static void addVideo(Project& project)
    {
        project.model().videoList().add(
            core::VideoList::Entry("/video/reel.mov", core::Timecode("01:00:00:00"), core::Timecode("00:20:00:00")),
            false);
    }

    /// The track of that name, wherever it is; null without one.
    TrackHost::Node find(const char16_t* name)
    {
        for (const auto& track : host.adapter.allTracks()) {
            if (const auto node = query<IProjectNode>(track); std::u16string(node->getName()) == name)
                return node;
        }
        return nullptr;
    }
    Track trackNamed(const char16_t* name) { return host.handle(find(name)); }

    cadrel::tests::TestProject timecodes;
    TrackHost host{GetParam()};
};

INSTANTIATE_TEST_SUITE_P(Origins, ProjectTracksTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(ProjectTracksTest, GathersTheTracksDepthFirst)
{
    host.addTrack(TypeWord::Audio, u"1");
    const auto folder = host.addTrack(TypeWord::Folder, u"2");
    const auto inner = host.addTrack(TypeWord::Folder, u"2.1", folder.get());
    host.addTrack(TypeWord::Video, u"2.1.1", inner.get());
    host.addTrack(TypeWord::Marker, u"2.2", folder.get());
    host.addTrack(TypeWord::Ruler, u"3");

    EXPECT_EQ(nameOf(host.adapter.tracksOfType(TypeWord::Track)), L"1 2 2.1 2.1.1 2.2 3 ");
    EXPECT_EQ(host.adapter.allTracks().size(), 6U);
}

TEST_P(ProjectTracksTest, FindsTheTracksOfAKind)
{
    host.addTrack(TypeWord::Audio, u"FX");
    const auto folder = host.addTrack(TypeWord::Folder, u"Spots");
    host.addTrack(TypeWord::Marker, u"Cues", folder.get());
    host.addTrack(TypeWord::Audio, u"Music");

    EXPECT_EQ(nameOf(host.adapter.tracksOfType(TypeWord::Audio)), L"FX Music ");
    EXPECT_EQ(nameOf(host.adapter.tracksOfType(TypeWord::Marker)), L"Cues ");
    EXPECT_EQ(nameOf(host.adapter.tracksOfType(TypeWord::Video)), L"");
}

TEST_P(ProjectTracksTest, ARunMayChangeAllButFoldersAndRulers)
{
    const auto folder = host.addTrack(TypeWord::Folder, u"Folder");
    for (const char* word : {TypeWord::Audio, TypeWord::Video, TypeWord::Marker, TypeWord::Ruler})
        host.addTrack(word, std::u16string(word, word + std::char_traits<char>::length(word)).c_str(), folder.get());

    EXPECT_EQ(nameOf(host.adapter.cadrelTracks()), L"audio video marker ");
}

TEST_P(ProjectTracksTest, TellsWhichTracksAreThere)
{
    const auto track = query<ITrackNode>(host.addTrack(TypeWord::Audio, u"FX"));
    EXPECT_TRUE(host.adapter.isTrackAlive(track.get()));

    host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), track.get())); });

    EXPECT_FALSE(host.adapter.isTrackAlive(track.get()));
    EXPECT_FALSE(host.adapter.isTrackAlive(nullptr));
}

TEST_P(ProjectTracksTest, TheCacheGathersTheTracksOnce)
{
    host.addTrack(TypeWord::Audio, u"FX");
    host.adapter.setUseTrackCache(true);
    EXPECT_EQ(host.adapter.allTracks().size(), 1U);

    host.addTrack(TypeWord::Audio, u"Music");
    EXPECT_EQ(host.adapter.allTracks().size(), 1U);

    host.adapter.setUseTrackCache(true);
    EXPECT_EQ(host.adapter.allTracks().size(), 2U) << "switched on anew";

    host.addTrack(TypeWord::Audio, u"Foley");
    host.adapter.setUseTrackCache(false);
    EXPECT_EQ(host.adapter.allTracks().size(), 3U);
}

TEST_P(ProjectTracksTest, TheCacheOfAProjectWithoutTracksIsFilledOnce)
{
    host.adapter.setUseTrackCache(true);
    EXPECT_TRUE(host.adapter.allTracks().empty());

    host.addTrack(TypeWord::Audio, u"FX");

    EXPECT_TRUE(host.adapter.allTracks().empty());
}

TEST_P(ProjectTracksTest, TheCacheKnowsTheTracksThatTheSystemMakes)
{
    host.adapter.setUseTrackCache(true);
    host.adapter.allTracks();

    createMarkerTracks();

    EXPECT_EQ(host.adapter.allTracks().size(), 8U);
    EXPECT_EQ(host.adapter.tracksOfType(TypeWord::Marker).size(), 7U);
}

TEST_P(ProjectTracksTest, MakesAFolderWithATrackForEachKindOfMarker)
{
    host.addTrack(TypeWord::Audio, u"FX");

    createMarkerTracks();

    EXPECT_EQ(namesOf(*host.root()), (Names{u"FX", u"Cadrel Markers"}));
    EXPECT_EQ(namesOf(*find(u"Cadrel Markers")),
              (Names{u"Destination", u"Insert", u"Dissolve/Wipe", u"Automation Warning", u"Audio Snippet", u"Overlap",
                     u"Memos"}));
    EXPECT_TRUE(trackNamed(u"Cadrel Markers").isFolder());
    EXPECT_EQ(trackNamed(u"Cadrel Markers").role(), TrackRole::Markers);
    EXPECT_EQ(trackNamed(u"Destination").role(), TrackRole::Destination);
    EXPECT_EQ(trackNamed(u"Insert").role(), TrackRole::Insert);
    EXPECT_EQ(trackNamed(u"Dissolve/Wipe").role(), TrackRole::DissolveWipe);
    EXPECT_EQ(trackNamed(u"Automation Warning").role(), TrackRole::AutomationWarning);
    EXPECT_EQ(trackNamed(u"Audio Snippet").role(), TrackRole::AudioSnippet);
    EXPECT_EQ(trackNamed(u"Overlap").role(), TrackRole::Overlap);
    EXPECT_EQ(trackNamed(u"Memos").role(), TrackRole::Memos);
    for (const auto& track : host.adapter.allTracks()) {
        const Track handle(&host.adapter, track.get());
        EXPECT_TRUE(handle.isMarker() || handle.isFolder() || handle.isAudio());
    }
}

TEST_P(ProjectTracksTest, MakesTheTracksOfTheMarkersThatAreSwitchedOnAndAlwaysTheMemos)
{
    core::Settings& settings = host.adapter.model().settings();
    settings.setCreateDestinationMarkers(false);
    settings.setCreateInsertMarkers(false);
    settings.setCreateDissolveWipeMarkers(false);
    settings.setCreateAutomationWarningMarkers(false);
    settings.setCreateAudioSnippetMarkers(false);
    settings.setCreateOverlapMarkers(false);
    createMarkerTracks();
    EXPECT_EQ(namesOf(*find(u"Cadrel Markers")), Names{u"Memos"});

    settings.setCreateDestinationMarkers(true);
    createMarkerTracks();
    EXPECT_EQ(namesOf(*find(u"Cadrel Markers")), (Names{u"Memos", u"Destination"}));

    settings.setCreateInsertMarkers(true);
    createMarkerTracks();
    EXPECT_EQ(namesOf(*find(u"Cadrel Markers")).back(), u"Insert");

    settings.setCreateDissolveWipeMarkers(true);
    createMarkerTracks();
    EXPECT_EQ(namesOf(*find(u"Cadrel Markers")).back(), u"Dissolve/Wipe");

    settings.setCreateAutomationWarningMarkers(true);
    createMarkerTracks();
    EXPECT_EQ(namesOf(*find(u"Cadrel Markers")).back(), u"Automation Warning");

    settings.setCreateAudioSnippetMarkers(true);
    createMarkerTracks();
    EXPECT_EQ(namesOf(*find(u"Cadrel Markers")).back(), u"Audio Snippet");

    settings.setCreateOverlapMarkers(true);
    createMarkerTracks();
    EXPECT_EQ(namesOf(*find(u"Cadrel Markers")).back(), u"Overlap");
}

TEST_P(ProjectTracksTest, MakesTheTracksOnce)
{
    createMarkerTracks();
    const std::string once = host.dump();

    createMarkerTracks();

    EXPECT_EQ(host.dump(), once);
}

TEST_P(ProjectTracksTest, FindsItsTracksAgainByTheirRoles)
{
    createMarkerTracks();
    trackNamed(u"Insert").setName(L"What is new");
    const std::string before = host.dump();
    Project reopened(host.context(), host.document());

    createMarkerTracks(reopened);

    EXPECT_EQ(host.dump(), before);
}

TEST_P(ProjectTracksTest, MakesATrackAnewThatTheUserHasRemoved)
{
    createMarkerTracks();
    host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), find(u"Insert").get())); });
    EXPECT_EQ(find(u"Insert"), nullptr);

    createMarkerTracks();

    EXPECT_EQ(trackNamed(u"Insert").role(), TrackRole::Insert);
}

TEST_P(ProjectTracksTest, BringsTracksBackIntoTheFolder)
{
    createMarkerTracks();
    const auto elsewhere = host.addTrack(TypeWord::Folder, u"Elsewhere");
    host.edit(u"Move", [&] {
        IEditTransaction& transaction = *host.transaction();
        requireOk(transaction.move(host.root(), host.root(), find(u"Insert").get()));
        requireOk(transaction.move(host.root(), elsewhere.get(), find(u"Memos").get()));
    });

    createMarkerTracks();

    EXPECT_TRUE(namesOf(*elsewhere).empty());
    EXPECT_EQ(namesOf(*host.root()), (Names{u"Cadrel Markers", u"Elsewhere"}));
    EXPECT_EQ(namesOf(*find(u"Cadrel Markers")).size(), 7U);
}

TEST_P(ProjectTracksTest, TracksOfOthersAreLeftAlone)
{
    const auto cues = host.addTrack(TypeWord::Marker, u"Insert");
    const auto folder = host.addTrack(TypeWord::Folder, u"Cadrel Markers");

    createMarkerTracks();

    EXPECT_EQ(cues->getParent(), host.root());
    EXPECT_TRUE(namesOf(*folder).empty());
    EXPECT_EQ(host.adapter.tracksOfType(TypeWord::Marker).size(), 8U);
}

TEST_P(ProjectTracksTest, ATrackIsNamedInTheLanguageInWhichItWasMade)
{
    core::Settings& settings = host.adapter.model().settings();
    settings.setCreateOverlapMarkers(false);
    createMarkerTracks();

    const Shouting shouting;
    util::StringUtil::setConverter(&shouting);
    settings.setCreateOverlapMarkers(true);
    createMarkerTracks();

    EXPECT_EQ(namesOf(*find(u"Cadrel Markers")),
              (Names{u"Destination", u"Insert", u"Dissolve/Wipe", u"Automation Warning", u"Audio Snippet", u"Memos",
                     u"Overlap!"}));
}

TEST_P(ProjectTracksTest, TakesTheMarkerTrackThatTheHostHasReady)
{
    const auto ready = makeCounted<standin::MarkerTrack>();
    const auto document = makeCounted<AlteredDocument>(host.document());
    document->defaultMarkerTrack = ready.get();
    Project project(host.context(), document.get());
    project.setUseTrackCache(true);
    project.allTracks();

    createMarkerTracks(project);

    const IProjectNode& node = *ready;
    EXPECT_EQ(childrenOf(*find(u"Cadrel Markers")).front().get(), &node);
    EXPECT_EQ(trackNamed(u"Destination").role(), TrackRole::Destination);
    EXPECT_EQ(project.tracksOfType(TypeWord::Marker).size(), 7U);
}

TEST_P(ProjectTracksTest, LeavesTheUsersDefaultMarkerTrackAlone)
{
    host.addTrack(TypeWord::Marker, u"Cues");
    ASSERT_NE(host.document()->getDefaultMarkerTrack(), nullptr);

    createMarkerTracks();

    EXPECT_EQ(namesOf(*host.root()), (Names{u"Cues", u"Cadrel Markers"}));
    EXPECT_EQ(namesOf(*find(u"Cadrel Markers")).size(), 7U);
}

TEST_P(ProjectTracksTest, GivesEveryMemoOfTheRealProgrammeAnIdOfItsOwn)
{
    createMarkerTracks();
    host.adapter.computePreviewOffset();
    const auto memos = find(u"Memos");
    const auto known = host.addPointMarker(memos, u"known", 10.0);
    const auto unknown = host.addPointMarker(memos, u"unknown", 20.0);
    const auto copied = host.addPointMarker(memos, u"copied", 30.0);
    const auto last = host.addPointMarker(memos, u"last", 86399.5 - host.origin);
    const auto inPreview = host.addPointMarker(memos, u"copy", 86400.5 - host.origin);
    Track handle = host.handle(memos);
    HostEvent(handle, known).setUserId(4);
    HostEvent(handle, copied).setUserId(4);

    createMarkerTracks();

    EXPECT_EQ(HostEvent(handle, known).getUserId(), 4);
    EXPECT_EQ(HostEvent(handle, unknown).getUserId(), 5);
    EXPECT_EQ(HostEvent(handle, copied).getUserId(), 6);
    EXPECT_EQ(HostEvent(handle, last).getUserId(), 7);
    EXPECT_EQ(HostEvent(handle, inPreview).getUserId(), -1);
}

TEST_P(ProjectTracksTest, FailsWhereTheHostMakesNoTrack)
{
    const auto document = makeCounted<AlteredDocument>(host.document());
    Project project(host.context(), document.get());
    IEditTransaction& transaction = *host.transaction();

    document->makesTracks = false;
    EXPECT_EQ(thrownBy([&] { project.createMarkerTracks(transaction); }), Result::HostObjectMissing);
    document->makesTracks = true;
    document->hasContainers = false;
    EXPECT_EQ(thrownBy([&] { project.createMarkerTracks(transaction); }), Result::HostObjectMissing);
    document->hasContainers = true;
    EXPECT_EQ(thrownBy([&] { project.createMarkerTracks(transaction); }), Result::HostCallFailed)
        << "No transaction is open.";
    EXPECT_TRUE(childrenOf(*host.root()).empty());

    createMarkerTracks(project);
    EXPECT_EQ(project.allTracks().size(), 8U);
}

TEST_P(ProjectTracksTest, MakesNoVideoTrackWithoutNewVideos)
{
    createVideoTracks(host.adapter);

    EXPECT_TRUE(host.adapter.allTracks().empty());
}

TEST_P(ProjectTracksTest, MakesATrackForTheNewVideosOnce)
{
    addVideo(host.adapter);

    createVideoTracks(host.adapter);
    createVideoTracks(host.adapter);

    EXPECT_EQ(namesOf(*host.root()), Names{u"New Video"});
    EXPECT_EQ(trackNamed(u"New Video").role(), TrackRole::NewVideo);
    EXPECT_TRUE(trackNamed(u"New Video").isVideo());
}

TEST_P(ProjectTracksTest, AVideoTrackIsThatOfTheNewPictureByItsRoleAlone)
{
    addVideo(host.adapter);
    host.addTrack(TypeWord::Video, u"Picture");
    host.addTrack(TypeWord::Video, u"Conform");
    const auto old = host.addTrack(TypeWord::Video, u"Old");
    host.handle(old).setRole(TrackRole::OldVideo);

    createVideoTracks(host.adapter);

    EXPECT_EQ(namesOf(*host.root()), (Names{u"Picture", u"Conform", u"Old", u"New Video"}));
    EXPECT_EQ(trackNamed(u"Picture").role(), -1);
    EXPECT_EQ(trackNamed(u"Conform").role(), -1);
    EXPECT_EQ(trackNamed(u"Old").role(), TrackRole::OldVideo);
}

TEST_P(ProjectTracksTest, ATrackOfTheUsersOwnVideoCountsAsThatOfTheNewPicture)
{
    addVideo(host.adapter);
    const auto own = host.addTrack(TypeWord::Video, u"Temp VFX");
    host.handle(own).setRole(TrackRole::NewVideo | TrackRole::OwnVideo);

    createVideoTracks(host.adapter);

    EXPECT_EQ(namesOf(*host.root()), Names{u"Temp VFX"});
}

TEST_P(ProjectTracksTest, LocksWhatARunWouldChangeAndItsOwnTracksButTheMemos)
{
    const auto fx = host.addTrack(TypeWord::Audio, u"FX");
    const auto music = host.addTrack(TypeWord::Audio, u"Music");
    const auto folder = host.addTrack(TypeWord::Folder, u"Folder");
    const auto ruler = host.addTrack(TypeWord::Ruler, u"Ruler");
    addVideo(host.adapter);
    createVideoTracks(host.adapter);
    createMarkerTracks();

    host.adapter.collectLockTracks();
    host.adapter.setTracksLocked(true);
    for (const char16_t* name : {u"FX", u"Music", u"New Video", u"Destination", u"Insert", u"Dissolve/Wipe",
                                 u"Automation Warning", u"Audio Snippet", u"Overlap"}) {
        EXPECT_TRUE(trackNamed(name).hostLocked());
        EXPECT_TRUE(trackNamed(name).hasLockState());
    }
    for (const char16_t* name : {u"Folder", u"Ruler", u"Memos", u"Cadrel Markers"})
        EXPECT_FALSE(trackNamed(name).hostLocked());

    host.adapter.setTracksLocked(false);
    for (const auto& track : host.adapter.allTracks()) {
        EXPECT_FALSE(Track(&host.adapter, track.get()).hostLocked());
        EXPECT_FALSE(Track(&host.adapter, track.get()).hasLockState());
    }
}

TEST_P(ProjectTracksTest, LeavesTracksAloneThatTheUserHasLocked)
{
    const auto fx = host.addTrack(TypeWord::Audio, u"FX");
    requireOk(query<ITrackNode>(fx)->setFlag(TrackFlag::Lock, true));

    host.adapter.collectLockTracks();
    host.adapter.setTracksLocked(true);
    EXPECT_FALSE(host.handle(fx).hasLockState());

    host.adapter.setTracksLocked(false);
    EXPECT_TRUE(host.handle(fx).hostLocked());
}

TEST_P(ProjectTracksTest, LeavesItsOwnTracksAloneThatTheUserHasLocked)
{
    addVideo(host.adapter);
    createVideoTracks(host.adapter);
    createMarkerTracks();
    for (const char16_t* name : {u"New Video", u"Insert"})
        requireOk(query<ITrackNode>(find(name))->setFlag(TrackFlag::Lock, true));

    host.adapter.setTracksLocked(false);
    for (const char16_t* name : {u"New Video", u"Insert"})
        EXPECT_TRUE(trackNamed(name).hostLocked());

    host.adapter.setTracksLocked(true);
    EXPECT_TRUE(trackNamed(u"Overlap").hasLockState());
    for (const char16_t* name : {u"New Video", u"Insert"})
        EXPECT_FALSE(trackNamed(name).hasLockState()) << "It is the user's lock.";

    host.adapter.setTracksLocked(false);
    EXPECT_FALSE(trackNamed(u"Overlap").hostLocked());
    for (const char16_t* name : {u"New Video", u"Insert"})
        EXPECT_TRUE(trackNamed(name).hostLocked());
}

TEST_P(ProjectTracksTest, LeavesAVideoTrackAloneThatHasNoRole)
{
    const auto own = host.addTrack(TypeWord::Video, u"Picture");
    const auto second = host.addTrack(TypeWord::Video, u"Conform");
    requireOk(query<ITrackNode>(second)->setFlag(TrackFlag::Lock, true));

    host.adapter.setTracksLocked(true);
    EXPECT_FALSE(host.handle(own).hostLocked());

    host.adapter.setTracksLocked(false);
    EXPECT_TRUE(host.handle(second).hostLocked());
}

TEST_P(ProjectTracksTest, TakesItsOwnMarkBackWhereTheUserHasUnlocked)
{
    const auto fx = host.addTrack(TypeWord::Audio, u"FX");
    host.adapter.collectLockTracks();
    host.adapter.setTracksLocked(true);
    requireOk(query<ITrackNode>(fx)->setFlag(TrackFlag::Lock, false));

    host.adapter.setTracksLocked(false);

    EXPECT_FALSE(host.handle(fx).hasLockState());
}

TEST_P(ProjectTracksTest, LocksOnlySelectedTracksWhereARunChangesOnlyThose)
{
    host.adapter.model().settings().setApplyTo(core::ApplyTo::SelectedTracks);
    const auto fx = host.addTrack(TypeWord::Audio, u"FX");
    const auto music = host.addTrack(TypeWord::Audio, u"Music");
    dynamic_cast<standin::Track&>(*music).setSelected(true);

    host.adapter.collectLockTracks();
    host.adapter.setTracksLocked(true);

    EXPECT_FALSE(host.handle(fx).hostLocked());
    EXPECT_TRUE(host.handle(music).hostLocked());
}

TEST_P(ProjectTracksTest, CollectsTheTracksAnewEachTime)
{
    const auto fx = host.addTrack(TypeWord::Audio, u"FX");
    host.adapter.collectLockTracks();
    requireOk(query<ITrackNode>(fx)->setFlag(TrackFlag::Lock, true));

    host.adapter.collectLockTracks();
    host.adapter.setTracksLocked(false);

    EXPECT_TRUE(host.handle(fx).hostLocked());
}

TEST_P(ProjectTracksTest, ForgetsTheTracksThatItReleases)
{
    const auto fx = host.addTrack(TypeWord::Audio, u"FX");
    host.adapter.collectLockTracks();

    host.adapter.releaseLockTracks();
    host.adapter.setTracksLocked(true);

    EXPECT_FALSE(host.handle(fx).hostLocked());
}

TEST_P(ProjectTracksTest, FindsItsOwnTracksBeforeItLocksThem)
{
    addVideo(host.adapter);
    createVideoTracks(host.adapter);
    createMarkerTracks();
    Project reopened(host.context(), host.document());

    reopened.setTracksLocked(true);

    EXPECT_TRUE(trackNamed(u"Insert").hostLocked());
    EXPECT_TRUE(trackNamed(u"New Video").hostLocked());
    EXPECT_FALSE(trackNamed(u"Memos").hostLocked());
}

TEST_P(ProjectTracksTest, AMissingTrackDoesNotKeepTheOthersFromBeingUnlocked)
{
    const auto fx = host.addTrack(TypeWord::Audio, u"FX");
    const auto music = host.addTrack(TypeWord::Audio, u"Music");
    host.adapter.collectLockTracks();
    host.adapter.setTracksLocked(true);
    host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), fx.get())); });

    host.adapter.setTracksLocked(false);

    EXPECT_FALSE(host.handle(music).hostLocked());
}

TEST_P(ProjectTracksTest, ATrackThatRefusesDoesNotKeepTheOthersFromBeingLocked)
{
    const std::set<std::string> audio{TypeWord::Track, TypeWord::Audio};
    const auto first = makeCounted<LockTrack>(audio, 0);
    const auto refusing = makeCounted<LockTrack>(audio, 0);
    const auto last = makeCounted<LockTrack>(audio, 0);
    const auto document = makeCounted<FakeProject>(GetParam());
    document->children = {first, refusing, last};
    Project project(host.context(), document.get());
    project.collectLockTracks();
    refusing->setterResult = ResultFalse;

    EXPECT_EQ(thrownBy([&] { project.setTracksLocked(true); }), Result::HostCallFailed);
    EXPECT_TRUE(first->isLocked);
    EXPECT_FALSE(refusing->isLocked);
    EXPECT_TRUE(last->isLocked);

    refusing->setterResult = ResultOk;
    project.setTracksLocked(true);
    refusing->setterResult = ResultFalse;
    EXPECT_EQ(thrownBy([&] { project.setTracksLocked(false); }), Result::HostCallFailed);
    EXPECT_FALSE(first->isLocked);
    EXPECT_TRUE(refusing->isLocked);
    EXPECT_FALSE(last->isLocked);
}

TEST_P(ProjectTracksTest, AMarkerTrackThatCannotBeReadDoesNotKeepThePictureFromBeingLocked)
{
    // It says that it is one of markers, and not that it is a track.
    const auto unreadable = makeCounted<LockTrack>(std::set<std::string>{TypeWord::Marker}, 0);
    const auto video =
        makeCounted<LockTrack>(std::set<std::string>{TypeWord::Track, TypeWord::Video}, TrackRole::NewVideo);
    const auto document = makeCounted<FakeProject>(GetParam());
    document->children = {unreadable, video};
    Project project(host.context(), document.get());

    EXPECT_EQ(thrownBy([&] { project.setTracksLocked(true); }), Result::NotSupported);

    EXPECT_TRUE(video->isLocked);
}

TEST_P(ProjectTracksTest, AllTracksHaveToBeUsableAsSuch)
{
    const auto document = FakeProject::withoutUsableTrack();
    Project project(host.context(), document.get());

    EXPECT_EQ(thrownBy([&] { project.allTracks(); }), Result::HostObjectMissing);
}

} // namespace cadrel::host
