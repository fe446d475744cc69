// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/video/VideoSourceTrack.h"

#include "core/model/VideoList.h"
#include "host/border/HostFailure.h"
#include "host/video/PoolVideoSource.h"
#include "host/video/VideoTrackHandler.h"
#include "tests/host/project/AlteredEdits.h"
#include "tests/support/host/AlteredContext.h"
#include "tests/support/host/VideoHost.h"
#include "velmark/ClassId.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

using core::Timecode;
using core::VideoList;
using tests::VideoHost;
using util::Result;
using Mode = gui::VideoTrackHandlerBase::Mode;

namespace {

/// What stands on a track: from when to when in seconds of the host, and which video.
struct Written {
    double start = 0.0;
    double end = 0.0;
    const IMediaClip* clip = nullptr;

    bool operator==(const Written&) const = default;
};

/// A list of two videos, from ten seconds after the beginning of the project's clock on and right behind the first. With a
/// clock that begins at 0 and with one that begins at 01:00:00:00.
class VideoSourceTrackTest : public testing::TestWithParam<double> {
protected:
    VideoSourceTrackTest()
    {
        list.add(VideoList::Entry("/picture/reel3_v12.mov", Timecode(host.clock(10.0)), Timecode(0, 0, 4, 0)), false);
        list.add(VideoList::Entry("/picture/reel4_v12.mov", Timecode(host.clock(14.0)), Timecode(0, 0, 2, 0)), false);
        source.setMediaPool(&host.adapter.mediaPool());
        source.setVideoList(&list);
        handler.rebuild(&host.adapter);
    }
    ~VideoSourceTrackTest() override { source.setVideoList(nullptr); }

    VideoWriting write()
    {
        VideoWriting writing{};
        host.edit(u"Write", [&] { writing = writer.writeVideoEvents(*host.transaction()); });
        return writing;
    }
    std::vector<Written> written(const VideoHost::Node& track)
    {
        std::vector<Written> events;
        for (const auto& child : standin::tests::childrenOf(*track))
            events.push_back(
                {child->getStart(nullptr), child->getEnd(nullptr), query<IClipEvent>(child.get())->getClip()});
        return events;
    }

    VideoHost host{GetParam()};
    const VideoHost::Node oldTrack = host.addVideoTrack(u"old", TrackRole::OldVideo);
    const VideoHost::Node newTrack = host.addVideoTrack(u"new", TrackRole::NewVideo);
    standin::MediaClip& reel3 = host.addVideo(u"/picture/reel3_v12.mov", 4.0);
    standin::MediaClip& reel4 = host.addVideo(u"/picture/reel4_v12.mov", 2.0);
    VideoList list;
    PoolVideoSource source;
    VideoTrackHandler handler;
    VideoSourceTrack writer{host.context(), source, handler, Mode::New};
};

INSTANTIATE_TEST_SUITE_P(Origins, VideoSourceTrackTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(VideoSourceTrackTest, WritesEachVideoOfTheListWhereItStands)
{
    EXPECT_EQ(write(), VideoWriting::Done);

    EXPECT_EQ(written(newTrack), (std::vector<Written>{{10.0, 14.0, &reel3}, {14.0, 16.0, &reel4}}));
    EXPECT_TRUE(written(oldTrack).empty());
}

TEST_P(VideoSourceTrackTest, WritesThemLaterByItsOffset)
{
    writer.setOffset(86400.0);

    write();

    EXPECT_EQ(written(newTrack), (std::vector<Written>{{86410.0, 86414.0, &reel3}, {86414.0, 86416.0, &reel4}}));
}

TEST_P(VideoSourceTrackTest, ReplacesWhatStoodOnTheTrack)
{
    host.addVideoEvent(newTrack, reel4, 0.0, 2.0);
    host.addPart(newTrack, u"part", 100.0, 200.0);
    host.addVideoEvent(oldTrack, reel4, 0.0, 2.0);
    const std::string before = host.dump();

    write();
    EXPECT_EQ(written(newTrack), (std::vector<Written>{{10.0, 14.0, &reel3}, {14.0, 16.0, &reel4}}));
    EXPECT_EQ(written(oldTrack), (std::vector<Written>{{0.0, 2.0, &reel4}}));

    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.dump(), before);
}

TEST_P(VideoSourceTrackTest, WithAnOffsetReplacesOnlyWhatStartsThereOrLater)
{
    // Half a minute later than the clock's beginning; the video is written ten seconds after that, and the time origin.
    writer.setOffset(host.clock(30.0));
    host.addVideoEvent(newTrack, reel4, 0.0, 2.0);
    host.addVideoEvent(newTrack, reel4, 27.96, 29.96);
    host.addVideoEvent(newTrack, reel4, 29.96, 31.96);
    host.addVideoEvent(newTrack, reel4, 40.0, 42.0);
    host.addPart(newTrack, u"part", 100.0, 200.0);
    list.clear();
    list.add(VideoList::Entry("/picture/reel3_v12.mov", Timecode(host.clock(10.0)), Timecode(0, 0, 4, 0)), false);

    write();

    EXPECT_EQ(written(newTrack), (std::vector<Written>{{0.0, 2.0, &reel4},
                                                       {27.96, 29.96, &reel4},
                                                       {29.96, 31.96, &reel4},
                                                       {host.clock(40.0), host.clock(44.0), &reel3}}));

    write();
    EXPECT_EQ(written(newTrack).size(), 4U);
}

TEST_P(VideoSourceTrackTest, WhatStartsExactlyAtTheOffsetIsReplaced)
{
    writer.setOffset(host.clock(30.0));
    list.clear();
    list.add(VideoList::Entry("/picture/reel3_v12.mov", Timecode(host.clock(10.0)), Timecode(0, 0, 4, 0)), false);
    host.addVideoEvent(newTrack, reel4, 29.96, 30.0);
    host.addVideoEvent(newTrack, reel4, 30.0, 32.0);

    write();

    EXPECT_EQ(written(newTrack),
              (std::vector<Written>{{29.96, 30.0, &reel4}, {host.clock(40.0), host.clock(44.0), &reel3}}));
}

TEST_P(VideoSourceTrackTest, LeavesATrackAloneThatTheUserHasLocked)
{
    host.addVideoEvent(newTrack, reel4, 0.0, 2.0);
    requireOk(query<ITrackNode>(newTrack)->setFlag(TrackFlag::Lock, true));
    const std::string before = host.dump();

    EXPECT_EQ(write(), VideoWriting::TrackLocked);

    EXPECT_EQ(host.dump(), before);
    list.clear();
    EXPECT_EQ(write(), VideoWriting::Done) << "There is nothing to write.";
}

TEST_P(VideoSourceTrackTest, NeverWritesOnATrackWithoutARole)
{
    host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), newTrack.get())); });
    const auto second = host.addVideoTrack(u"second");
    host.addVideoEvent(second, reel4, 0.0, 2.0);
    handler.rebuild(&host.adapter);
    const std::string before = host.dump();

    write();

    EXPECT_EQ(host.dump(), before);
}

TEST_P(VideoSourceTrackTest, WritesTheSameWhenItWritesAgain)
{
    write();
    write();

    EXPECT_EQ(written(newTrack), (std::vector<Written>{{10.0, 14.0, &reel3}, {14.0, 16.0, &reel4}}));
}

TEST_P(VideoSourceTrackTest, LeavesTheTrackAloneWithoutVideos)
{
    host.addVideoEvent(newTrack, reel4, 0.0, 2.0);
    const std::string before = host.dump();

    list.clear();
    write();
    EXPECT_EQ(host.dump(), before);

    source.setVideoList(nullptr);
    write();
    EXPECT_EQ(host.dump(), before);
}

TEST_P(VideoSourceTrackTest, WritesNothingWithoutATrack)
{
    host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), newTrack.get())); });
    const std::string before = host.dump();

    write();
    EXPECT_EQ(host.dump(), before);

    handler.rebuild(nullptr);
    write();
    EXPECT_EQ(host.dump(), before);
}

TEST_P(VideoSourceTrackTest, LeavesATrackAloneOnWhichTheUserHasPutAnotherVideo)
{
    host.addVideoEvent(newTrack, reel4, 0.0, 2.0);
    handler.setMode(1, Mode::NewOff);
    const std::string before = host.dump();

    for (const double offset : {0.0, 86400.0}) {
        writer.setOffset(offset);
        EXPECT_EQ(write(), VideoWriting::Done);
        EXPECT_EQ(host.dump(), before);
    }
}

TEST_P(VideoSourceTrackTest, NeverWritesOnTheTrackOfTheOldPicture)
{
    host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), newTrack.get())); });
    const auto second = host.addVideoTrack(u"second", TrackRole::OldVideo);
    host.addVideoEvent(oldTrack, reel4, 0.0, 2.0);
    host.addVideoEvent(second, reel4, 0.0, 2.0);
    handler.rebuild(&host.adapter);
    const std::string before = host.dump();

    write();

    EXPECT_EQ(host.dump(), before);
}

TEST_P(VideoSourceTrackTest, AVideoThatIsNotInThePoolIsAnEventWithoutAClip)
{
    list.add(VideoList::Entry("/picture/reel5.mov", Timecode(host.clock(20.0)), Timecode(0, 0, 1, 0)), false);

    write();

    EXPECT_EQ(written(newTrack),
              (std::vector<Written>{{10.0, 14.0, &reel3}, {14.0, 16.0, &reel4}, {20.0, 21.0, nullptr}}));
}

TEST_P(VideoSourceTrackTest, WithoutAPoolTheTrackStaysAsItIs)
{
    host.addVideoEvent(newTrack, reel4, 0.0, 2.0);
    source.setMediaPool(nullptr);
    const std::string before = host.dump();

    EXPECT_EQ(write(), VideoWriting::NoMediaPool);

    EXPECT_EQ(host.dump(), before);
}

TEST_P(VideoSourceTrackTest, WritesOnTheTrackThatHasThePictureNow)
{
    handler.setMode(0, Mode::New);

    write();

    EXPECT_EQ(written(oldTrack), (std::vector<Written>{{10.0, 14.0, &reel3}, {14.0, 16.0, &reel4}}));
    EXPECT_TRUE(written(newTrack).empty());
}

TEST_P(VideoSourceTrackTest, ReportsWhatTheHostRefuses)
{
    // No transaction is open.
    EXPECT_EQ(resultOf([&] { writer.writeVideoEvents(*host.transaction()); }), Result::HostCallFailed);
    EXPECT_TRUE(written(newTrack).empty());
}

TEST_P(VideoSourceTrackTest, WritesOfAVideoWhatDoesNotLieBeforeTheBeginningOfTheProject)
{
    // By a time origin that has moved by so much, the one stands from 10 s to 14 s, the other from 14 s to 16 s.
    struct Case {
        double moved;
        VideoWriting writing;
        std::vector<Written> written;
        double firstPlaysFrom;
    };
    for (const Case& at :
         {Case{10.0, VideoWriting::Done, {{0.0, 4.0, &reel3}, {4.0, 6.0, &reel4}}, 0.0},
          Case{10.04, VideoWriting::WithoutBeginning, {{0.0, 3.96, &reel3}, {3.96, 5.96, &reel4}}, 0.04},
          Case{13.96, VideoWriting::WithoutBeginning, {{0.0, 0.04, &reel3}, {0.04, 2.04, &reel4}}, 3.96},
          Case{14.0, VideoWriting::WithoutBeginning, {{0.0, 2.0, &reel4}}, 0.0},
          Case{15.5, VideoWriting::WithoutBeginning, {{0.0, 0.5, &reel4}}, 1.5}}) {
        for (const double offset : {0.0, 86400.0}) {
            SCOPED_TRACE(at.moved + offset);
            host.project.setTimeOrigin(host.origin + at.moved);
            writer.setOffset(offset);
            const std::string before = host.dump();

            EXPECT_EQ(write(), at.writing);

            const std::vector<Written> found = written(newTrack);
            ASSERT_EQ(found.size(), at.written.size());
            for (std::size_t index = 0; index < found.size(); ++index) {
                EXPECT_NEAR(found[index].start, at.written[index].start + offset, 1e-9);
                EXPECT_NEAR(found[index].end, at.written[index].end + offset, 1e-9);
                EXPECT_EQ(found[index].clip, at.written[index].clip);
                EXPECT_NEAR(standin::tests::childrenOf(*newTrack)[index]->getSourceOffset(nullptr),
                            index == 0 ? at.firstPlaysFrom : 0.0, 1e-9);
            }
            EXPECT_TRUE(written(oldTrack).empty());
            EXPECT_EQ(standin::tests::childrenOf(*host.root()).size(), 2U);
            ASSERT_TRUE(host.undo());
            EXPECT_EQ(host.dump(), before);
        }
    }
}

TEST_P(VideoSourceTrackTest, LeavesTheTrackAloneWhereAllOfTheVideoLiesBeforeTheBeginningOfTheProject)
{
    host.addVideoEvent(newTrack, reel4, 0.0, 2.0);
    host.addVideoEvent(newTrack, reel4, 86400.0, 86402.0);
    for (const double moved : {16.0, 20.0}) {
        for (const double offset : {0.0, 86400.0}) {
            SCOPED_TRACE(moved + offset);
            host.project.setTimeOrigin(host.origin + moved);
            writer.setOffset(offset);
            const std::string before = host.dump();

            EXPECT_EQ(write(), VideoWriting::BeforeProject);

            EXPECT_EQ(host.dump(), before);
        }
    }
}

TEST_P(VideoSourceTrackTest, LeavesNoTrackBehindWhereItCannotCutAVideo)
{
    host.project.setTimeOrigin(host.origin + 12.0);
    tests::AlteredContext context(host.context());
    const auto edits = makeCounted<tests::AlteredEdits>(host.context());
    context.replace(IEditService::iid, edits);
    VideoSourceTrack another(&context, source, handler, Mode::New);
    const auto writeThere = [&] {
        Result::Type result = Result::Ok;
        host.edit(u"Write", [&] { result = resultOf([&] { another.writeVideoEvents(*host.transaction()); }); });
        return result;
    };
    const auto emptyLastTrack = [&] {
        const auto track = standin::tests::childrenOf(*host.root()).back();
        for (const auto& child : standin::tests::childrenOf(*track))
            requireOk(host.transaction()->remove(track.get(), child.get()));
        return true;
    };

    edits->copies = [] { return false; };
    EXPECT_EQ(writeThere(), Result::HostCallFailed);
    EXPECT_EQ(standin::tests::childrenOf(*host.root()).size(), 2U);

    edits->copies = emptyLastTrack;
    EXPECT_EQ(writeThere(), Result::HostObjectMissing);
    EXPECT_EQ(standin::tests::childrenOf(*host.root()).size(), 2U);
}

TEST_P(VideoSourceTrackTest, MissesEventsWhereTheHostMakesNone)
{
    tests::AlteredContext context(host.context());
    context.hide(ClassId::ClipEvent);
    VideoSourceTrack another(&context, source, handler, Mode::New);

    host.edit(u"Write", [&] {
        EXPECT_EQ(resultOf([&] { another.writeVideoEvents(*host.transaction()); }), Result::HostObjectMissing);
    });
}

TEST_P(VideoSourceTrackTest, LeavesItsHandlerWhenItGoes)
{
    {
        const VideoSourceTrack another(host.context(), source, handler, Mode::New);
    }

    // Nobody is there to be told; under the sanitizer a call would show.
    handler.rebuild(&host.adapter);

    EXPECT_TRUE(handler.isAvailable(1));
}

} // namespace cadrel::host
