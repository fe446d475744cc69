// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/video/TrackVideoSource.h"

#include "host/border/HostFailure.h"
#include "host/video/VideoTrackHandler.h"
#include "tests/support/host/VideoHost.h"

#include <gtest/gtest.h>

using namespace Velmark;

namespace cadrel::host {

using tests::VideoHost;
using util::Result;
using Mode = gui::VideoTrackHandlerBase::Mode;

namespace {

struct CountingListener : VideoSourceBase::Listener {
    void sourceChanged() override { ++calls; }

    int calls = 0;
};

/// With a clock that begins at 0 and with one that begins at 01:00:00:00. Times are the host's.
class TrackVideoSourceTest : public testing::TestWithParam<double> {
protected:
    TrackVideoSourceTest() { handler.rebuild(&host.adapter); }

    VideoFrame frameAt(double time, bool lastFrame = false) { return source.getFrame(lastFrame, host.clock(time)); }
    void expectNone(double time, bool lastFrame = false)
    {
        const VideoFrame found = frameAt(time, lastFrame);
        EXPECT_FALSE(found.clip) << time;
        EXPECT_EQ(found.frame, 0U) << time;
    }
    void expectFrame(double time, std::uint32_t frame, IMediaClip& clip, bool lastFrame = false)
    {
        const VideoFrame found = frameAt(time, lastFrame);
        EXPECT_EQ(found.clip, &clip) << time;
        EXPECT_EQ(found.frame, frame) << time;
    }

    VideoHost host{GetParam()};
    const VideoHost::Node oldTrack = host.addVideoTrack(u"old", TrackRole::OldVideo);
    /// 4 seconds, 100 frames.
    standin::MediaClip& reel = host.addVideo(u"/picture/reel3_v07.mov", 4.0);
    VideoTrackHandler handler;
    TrackVideoSource source{handler, Mode::Old};
};

INSTANTIATE_TEST_SUITE_P(Origins, TrackVideoSourceTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(TrackVideoSourceTest, FindsTheFrameThatIsPlayedAtATime)
{
    host.addVideoEvent(oldTrack, reel, 10.0, 13.0, 1.0);

    expectFrame(10.0, 25, reel);
    expectFrame(10.04, 26, reel);
    expectFrame(12.96, 99, reel);
    expectNone(9.9);
    expectNone(13.1);
}

TEST_P(TrackVideoSourceTest, RoundsATimeToTheNearestFrame)
{
    host.addVideoEvent(oldTrack, reel, 10.0, 13.0);

    expectFrame(11.019, 25, reel);
    expectFrame(11.021, 26, reel);
}

TEST_P(TrackVideoSourceTest, TakesTheFrameThatTheClipCountsAndNoneAfterIt)
{
    host.addVideoEvent(oldTrack, reel, 10.0, 20.0);

    expectFrame(14.0, 100, reel);
    expectNone(14.04);
}

TEST_P(TrackVideoSourceTest, TakesAClipHalfAFrameAheadAndNoFurther)
{
    host.timecodes.framerate = core::Framerate(50, 0);
    host.addVideoEvent(oldTrack, reel, 10.02, 13.0);

    expectNone(10.0);
    expectNone(10.009);
    expectFrame(10.011, 0, reel);
    expectFrame(10.02, 0, reel);
}

TEST_P(TrackVideoSourceTest, LeavesAClipHalfAFrameBeforeItsEnd)
{
    host.addVideoEvent(oldTrack, reel, 10.0, 13.0);

    expectFrame(12.979, 74, reel);
    expectNone(12.981);
    expectNone(13.0);
}

TEST_P(TrackVideoSourceTest, ShowsTheLaterOfTwoClipsThatMeetFromItsStartOn)
{
    standin::MediaClip& next = host.addVideo(u"/picture/reel4_v07.mov", 4.0);
    host.addVideoEvent(oldTrack, reel, 10.0, 12.0);
    host.addVideoEvent(oldTrack, next, 12.0, 14.0);

    for (const bool lastFrame : {false, true}) {
        expectFrame(11.96, 49, reel, lastFrame);
        expectFrame(12.0, 0, next, lastFrame);
    }
}

TEST_P(TrackVideoSourceTest, ShowsAClipOfOneFrame)
{
    standin::MediaClip& flash = host.addVideo(u"/picture/flash.mov", 4.0);
    host.addVideoEvent(oldTrack, reel, 10.0, 12.0);
    host.addVideoEvent(oldTrack, flash, 12.0, 12.04, 1.0);
    host.addVideoEvent(oldTrack, reel, 12.04, 14.0);

    for (const bool lastFrame : {false, true}) {
        expectFrame(11.96, 49, reel, lastFrame);
        expectFrame(12.0, 25, flash, lastFrame);
        expectFrame(12.04, 0, reel, lastFrame);
    }
}

TEST_P(TrackVideoSourceTest, ShowsTheClipThatBeganLastOfTwoThatOverlap)
{
    standin::MediaClip& next = host.addVideo(u"/picture/reel4_v07.mov", 4.0);
    host.addVideoEvent(oldTrack, next, 12.0, 13.0);
    host.addVideoEvent(oldTrack, reel, 10.0, 14.0);

    expectFrame(11.96, 49, reel);
    expectFrame(12.0, 0, next);
    expectFrame(13.0, 75, reel);
}

TEST_P(TrackVideoSourceTest, AnEventThatPlaysNoClipShowsNothing)
{
    host.addPart(oldTrack, u"part", 1.0, 2.0);
    host.addClip(oldTrack, u"without media", 3.0, 4.0);

    expectNone(1.5);
    expectNone(3.5);
}

TEST_P(TrackVideoSourceTest, ATrackThatIsTurnedOffIsNoSource)
{
    host.addVideoEvent(oldTrack, reel, 10.0, 13.0);

    handler.setMode(0, Mode::OldOff);
    expectNone(11.0);

    handler.setMode(0, Mode::Old);
    expectFrame(11.0, 25, reel);
}

TEST_P(TrackVideoSourceTest, WithoutATrackThereIsNothing)
{
    host.addVideoEvent(oldTrack, reel, 10.0, 13.0);
    expectFrame(11.0, 25, reel);

    host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), oldTrack.get())); });
    expectNone(11.0);

    handler.rebuild(nullptr);
    expectNone(11.0);
}

TEST_P(TrackVideoSourceTest, NeedsTheRateOfTheProject)
{
    host.addVideoEvent(oldTrack, reel, 10.0, 13.0);
    core::Timecode::setFramerateProvider(nullptr);

    EXPECT_EQ(resultOf([&] { frameAt(11.0); }), Result::NotAvailable);
}

TEST_P(TrackVideoSourceTest, TakesTheTrackThatIsThereWhenItIsMade)
{
    host.addVideoEvent(oldTrack, reel, 10.0, 13.0);

    TrackVideoSource late(handler, Mode::Old);

    EXPECT_EQ(late.getFrame(false, host.clock(11.0)).clip, static_cast<IMediaClip*>(&reel));
}

TEST_P(TrackVideoSourceTest, FollowsThePictureToAnotherTrackAndTells)
{
    const auto second = host.addVideoTrack(u"second");
    handler.rebuild(&host.adapter);
    host.addVideoEvent(second, reel, 20.0, 23.0);
    CountingListener listener;
    source.addListener(&listener);
    expectNone(21.0);

    handler.setMode(1, Mode::Old);

    expectFrame(21.0, 25, reel);
    EXPECT_EQ(listener.calls, 1);
}

TEST_P(TrackVideoSourceTest, TellsOfChangesOfItsOwnTrackAlone)
{
    const auto second = host.addVideoTrack(u"second", TrackRole::NewVideo);
    handler.rebuild(&host.adapter);
    CountingListener listener;
    source.addListener(&listener);
    host.adapter.addListener(&source);

    host.addVideoEvent(second, reel, 20.0, 23.0);
    EXPECT_EQ(listener.calls, 0);

    host.addClip(oldTrack, u"picture", 1.0, 2.0);
    EXPECT_EQ(listener.calls, 1);

    host.edit(u"Remove", [&] { requireOk(host.transaction()->remove(host.root(), oldTrack.get())); });
    host.addVideoEvent(second, reel, 30.0, 33.0);
    EXPECT_EQ(listener.calls, 1) << "a dead track has nothing to tell";
    host.adapter.removeListener(&source);
}

TEST_P(TrackVideoSourceTest, LeavesItsHandlerWhenItGoes)
{
    {
        const TrackVideoSource another(handler, Mode::Old);
    }

    // Nobody is there to be told; under the sanitizer a call would show.
    handler.rebuild(&host.adapter);

    EXPECT_TRUE(handler.isAvailable(0));
}

} // namespace cadrel::host
