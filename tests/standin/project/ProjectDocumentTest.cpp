// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/standin/TestHost.h"

#include "standin/project/MediaClip.h"
#include "standin/project/Track.h"
#include "velmark/Automation.h"
#include "velmark/Events.h"
#include "velmark/Media.h"
#include "velmark/Tracks.h"
#include "velmark/Transport.h"

#include <gtest/gtest.h>

#include <limits>
#include <string>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

/// Where a file path was left by getPath.
std::u16string pathOf(IFilePath& path)
{
    char16_t buffer[IFilePath::Capacity] = {};
    return path.getPath(buffer) == ResultOk ? buffer : u"none";
}

} // namespace

TEST(ProjectDocument, IsARootNodeAndAClockToo)
{
    TestHost host;

    EXPECT_EQ(query<IProjectNode>(host.document()), host.root());
    EXPECT_TRUE(query<ITimeBase>(host.document()));
    EXPECT_EQ(query<IProjectDocument>(host.root()), host.document());
}

TEST(ProjectDocument, EndsAtTheLaterOfItsSetEndAndItsLastContent)
{
    TestHost host;
    EXPECT_EQ(host.root()->getEnd(nullptr), 0.0);
    const auto folder = host.addTrack(TypeWord::Folder, u"FX");
    const auto track = host.addTrack(TypeWord::Audio, u"FX 1", folder.get());
    const auto late = host.addClip(track, u"a", 10.0, 50.0);
    host.addClip(track, u"b", 20.0, 30.0);
    EXPECT_EQ(host.root()->getEnd(nullptr), 50.0);

    EXPECT_EQ(host.document()->setProjectEnd(40.0), ResultOk);
    EXPECT_EQ(host.root()->getEnd(nullptr), 50.0);

    late->setEnd(nullptr, 0, 25.0);
    EXPECT_EQ(host.root()->getEnd(nullptr), 40.0);
}

TEST(ProjectDocument, RefusesAnEndThatIsNoTime)
{
    TestHost host;
    host.document()->setProjectEnd(40.0);

    for (const double end :
         {std::numeric_limits<double>::quiet_NaN(), std::numeric_limits<double>::infinity(), -1.0, 1.1e9})
        EXPECT_NE(host.document()->setProjectEnd(end), ResultOk) << end;

    EXPECT_EQ(host.root()->getEnd(nullptr), 40.0);
}

TEST(ProjectDocument, HasNoFileBeforeItWasStored)
{
    TestHost host;

    EXPECT_FALSE(Counted<IFilePath>::adopt(host.document()->getProjectFile(host.document())));
}

TEST(ProjectDocument, KnowsItsOwnFileAlone)
{
    TestHost host;
    host.project.setPath(u"/films/reel3.stage");
    Project& other = host.application.createProject();

    const auto file = Counted<IFilePath>::adopt(host.document()->getProjectFile(host.document()));

    ASSERT_TRUE(file);
    EXPECT_EQ(pathOf(*file), u"/films/reel3.stage");
    EXPECT_FALSE(Counted<IFilePath>::adopt(host.document()->getProjectFile(&other)));
    EXPECT_FALSE(Counted<IFilePath>::adopt(host.document()->getProjectFile(nullptr)));
}

TEST(ProjectDocument, TheDefaultMarkerTrackIsTheFirstThatIsInNoFolder)
{
    TestHost host;
    EXPECT_EQ(host.document()->getDefaultMarkerTrack(), nullptr);
    const auto folder = host.addTrack(TypeWord::Folder, u"Markers");
    host.addTrack(TypeWord::Marker, u"hidden", folder.get());
    EXPECT_EQ(host.document()->getDefaultMarkerTrack(), nullptr);

    host.addTrack(TypeWord::Audio, u"DX 1");
    const auto first = host.addTrack(TypeWord::Marker, u"Memos");
    host.addTrack(TypeWord::Marker, u"Scenes");

    EXPECT_EQ(query<IProjectNode>(host.document()->getDefaultMarkerTrack()), first);
}

TEST(ProjectDocument, LocatorsKeepTheirTimes)
{
    TestHost host;
    ILocators* const locators = host.document()->getLocators();
    IParameter* const left = locators->getParameter(ParameterName::LeftTime);
    IParameter* const right = locators->getParameter(ParameterName::RightTime);
    ASSERT_TRUE(left && right);

    EXPECT_EQ(left->setValue(IParameter::Flag::Notify, 12.5), ResultOk);
    EXPECT_EQ(right->setValue(IParameter::Flag::Notify, -3.0), ResultOk);

    EXPECT_EQ(left->getValue(), 12.5);
    EXPECT_EQ(right->getValue(), -3.0);
    EXPECT_EQ(locators->getParameter(ParameterName::LeftTime), left);
}

TEST(ProjectDocument, LocatorsHaveNoOtherParameterAndTakeNothingButTimes)
{
    TestHost host;
    ILocators* const locators = host.document()->getLocators();
    IParameter* const left = locators->getParameter(ParameterName::LeftTime);
    left->setValue(0, 1.0);

    EXPECT_EQ(locators->getParameter(nullptr), nullptr);
    EXPECT_EQ(locators->getParameter("cycleLeftTime"), nullptr);
    EXPECT_NE(left->setValue(0, std::numeric_limits<double>::quiet_NaN()), ResultOk);
    EXPECT_NE(left->setValue(0, -std::numeric_limits<double>::infinity()), ResultOk);
    EXPECT_EQ(left->getValue(), 1.0);
}

TEST(ProjectDocument, TheContainerIsWhatTimesAreCountedIn)
{
    TestHost host;
    const auto track = host.addTrack(TypeWord::Audio, u"FX");
    const auto part = host.addPart(track, u"storm", 10.0, 20.0);
    const auto clip = host.addClip(part, u"thunder", 11.0, 12.0);
    const auto point = host.addPoint(track, Envelope::Curve::Volume, 1.0, 0.5f);
    const auto curve = host.curveOf(track, Envelope::Curve::Volume);
    const auto containerOf = [&](FUnknown* object) {
        return query<IProjectNode>(Counted<FUnknown>::adopt(host.document()->getContainer(object)));
    };

    EXPECT_EQ(containerOf(nullptr), host.root());
    EXPECT_EQ(containerOf(host.root()), host.root());
    EXPECT_EQ(containerOf(track.get()), track);
    EXPECT_EQ(containerOf(part.get()), part);
    EXPECT_EQ(containerOf(clip.get()), part);
    EXPECT_EQ(containerOf(curve.get()), curve);
    EXPECT_EQ(containerOf(point.get()), curve);
}

TEST(ProjectDocument, WhatIsNowhereInTheProjectHasNoContainer)
{
    TestHost host;
    Project& other = host.application.createProject();
    const auto clip = create<IClipEvent>(host.context());
    std::vector<std::string> calls;
    const auto foreign = makeCounted<Recorder>(calls);

    EXPECT_EQ(host.document()->getContainer(static_cast<IProjectNode*>(&other)), nullptr);
    EXPECT_EQ(host.document()->getContainer(clip.get()), nullptr);
    EXPECT_EQ(host.document()->getContainer(static_cast<FObject*>(foreign.get())), nullptr);
    EXPECT_EQ(host.document()->getContainer(static_cast<IProjectNode*>(&host.addMedia(u"/a.wav", 1.0))), nullptr);
}

TEST(ProjectDocument, MakesTracksOfEveryKindWithTheInterfacesOfTheirKind)
{
    TestHost host;

    for (const char* const word : {"audio", "video", "marker", "ruler", "folder"}) {
        const auto track = Counted<FUnknown>::adopt(host.document()->createTrack(word));
        ASSERT_TRUE(track) << word;
        EXPECT_TRUE(query<ITrackNode>(track)) << word;
        const auto node = query<IProjectNode>(track);
        EXPECT_TRUE(node->isType("track")) << word;
        for (const char* const other : {"audio", "video", "marker", "ruler", "folder"})
            EXPECT_EQ(node->isType(other), other == word) << word << " as " << other;
        EXPECT_EQ(static_cast<bool>(query<IMarkerTrack>(track)), word == std::string("marker"));
    }
}

TEST(ProjectDocument, MakesNoTrackOfAnUnknownKind)
{
    TestHost host;

    for (const char* const word : {"track", "part", "range", "", "AUDIO"})
        EXPECT_EQ(host.document()->createTrack(word), nullptr) << word;
    EXPECT_EQ(host.document()->createTrack(nullptr), nullptr);
}

TEST(ProjectDocument, TellsItsClock)
{
    TestHost host;
    host.project.setFrameRate({25.0, FrameRateInfo::Flag::PulledDown});
    host.project.setTimeOrigin(3600.0);
    const auto clock = query<ITimeBase>(host.document());

    FrameRateInfo info;
    EXPECT_EQ(clock->getFrameRate(info), ResultOk);

    EXPECT_EQ(info.framesPerSecond, 25.0);
    EXPECT_EQ(info.flags, FrameRateInfo::Flag::PulledDown);
    EXPECT_EQ(clock->getTimeOrigin(), 3600.0);
}

TEST(ProjectDocument, StorageListenersAreToldUntilTheyAreRemoved)
{
    TestHost host;
    std::vector<std::string> calls;
    const auto a = makeCounted<Recorder>(calls, "a ");
    const auto b = makeCounted<Recorder>(calls, "b ");
    EXPECT_EQ(host.document()->addStorageNotification(a.get()), ResultOk);
    EXPECT_EQ(host.document()->addStorageNotification(b.get()), ResultOk);

    host.project.announceStoring();
    EXPECT_EQ(host.document()->removeStorageNotification(a.get()), ResultOk);
    host.project.announceStoring();

    EXPECT_EQ(calls, (std::vector<std::string>{"a storing", "b storing", "b storing"}));
    EXPECT_EQ(a->refCount(), 1);
    host.document()->removeStorageNotification(b.get());
}

TEST(ProjectDocument, AStorageListenerIsThereOnceAndNotNull)
{
    TestHost host;
    std::vector<std::string> calls;
    const auto listener = makeCounted<Recorder>(calls);
    host.document()->addStorageNotification(listener.get());

    EXPECT_NE(host.document()->addStorageNotification(listener.get()), ResultOk);
    EXPECT_NE(host.document()->addStorageNotification(nullptr), ResultOk);
    EXPECT_EQ(host.document()->removeStorageNotification(listener.get()), ResultOk);
    EXPECT_NE(host.document()->removeStorageNotification(listener.get()), ResultOk);
    EXPECT_NE(host.document()->removeStorageNotification(nullptr), ResultOk);
}

TEST(ProjectDocument, TellsWhetherAllListenersHaveStoredWhatTheyHave)
{
    TestHost host;
    std::vector<std::string> calls;
    const auto good = makeCounted<Recorder>(calls, "good ");
    const auto bad = makeCounted<Recorder>(calls, "bad ");
    bad->answer = ResultFalse;
    EXPECT_TRUE(host.project.announceStoring());
    host.document()->addStorageNotification(bad.get());
    host.document()->addStorageNotification(good.get());

    EXPECT_FALSE(host.project.announceStoring());
    EXPECT_EQ(calls, (std::vector<std::string>{"bad storing", "good storing"}));
    host.document()->removeStorageNotification(bad.get());
    EXPECT_TRUE(host.project.announceStoring());
    host.document()->removeStorageNotification(good.get());
}

TEST(ProjectDocument, CountsTheChangesThatNoUndoTakesBack)
{
    TestHost host;
    const auto count = [&] { return host.project.link()->unrecordedChanges(); };
    const TestHost::Node track = host.addTrack(TypeWord::Audio, u"DX 1");
    auto& ours = dynamic_cast<Track&>(*track);
    const std::uint64_t before = count();

    host.edit(u"Lock", [&] { ours.setLocked(true); });
    host.undo();
    host.redo();
    EXPECT_EQ(count(), before);
    ours.setLocked(true);
    ours.setSelected(false);
    EXPECT_EQ(count(), before);

    ours.setLocked(false);
    EXPECT_EQ(count(), before + 1);
    ours.setSelected(true);
    EXPECT_EQ(count(), before + 2);
    ours.remove();
    EXPECT_EQ(count(), before + 3);
    ours.setName(u"FX 1");
    EXPECT_EQ(count(), before + 4);
}

TEST(ProjectDocument, CountsNoChangeOfItsOwnValuesButEachOfItsPool)
{
    TestHost host;
    const auto count = [&] { return host.project.link()->unrecordedChanges(); };
    const std::uint64_t before = count();

    host.project.setName(u"Reel 3");
    host.project.setProjectEnd(5.0);
    host.project.setSelected(true);
    EXPECT_EQ(count(), before);
    MediaClip& clip = host.addMedia(u"/fx/door.wav", 2.0);
    const std::uint64_t added = count();
    EXPECT_GT(added, before);
    host.edit(u"Name", [&] { clip.setName(u"Door"); });
    EXPECT_GT(count(), added);
}

TEST(ProjectDocument, AStorageListenerThatAnotherRemovesIsNotToldAnyMore)
{
    TestHost host;
    std::vector<std::string> calls;
    const auto first = makeCounted<Recorder>(calls, "first ");
    const auto second = makeCounted<Recorder>(calls, "second ");
    host.document()->addStorageNotification(first.get());
    host.document()->addStorageNotification(second.get());
    first->whenCalled = [&](const std::string&) { host.document()->removeStorageNotification(second.get()); };

    host.project.announceStoring();

    EXPECT_EQ(calls, std::vector<std::string>{"first storing"});
    host.document()->removeStorageNotification(first.get());
}

TEST(ProjectDocument, AllTracksAreListedFromTopToBottom)
{
    TestHost host;
    const auto dialogue = host.addTrack(TypeWord::Folder, u"Dialogue");
    host.addTrack(TypeWord::Audio, u"Music");
    const auto inner = host.addTrack(TypeWord::Folder, u"Boom", dialogue.get());
    host.addTrack(TypeWord::Audio, u"DX 1", inner.get());
    host.addTrack(TypeWord::Audio, u"DX 2", dialogue.get());

    std::vector<std::u16string> names;
    for (const Track* const track : host.project.allTracks())
        names.push_back(track->name());

    EXPECT_EQ(names, (std::vector<std::u16string>{u"Dialogue", u"Boom", u"DX 1", u"DX 2", u"Music"}));
}

} // namespace standin::tests
