// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/video/PoolVideoSource.h"

#include "core/model/VideoList.h"
#include "core/notify/ChangeContext.h"
#include "core/time/Timecode.h"
#include "host/project/MediaPool.h"
#include "standin/project/MediaClip.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/standin/TestHost.h"

#include <gtest/gtest.h>

#include <limits>

using namespace Velmark;

namespace cadrel::host {

using core::Timecode;
using core::VideoList;

namespace {

/// Two videos of a pool, listed from 01:00:00:00 and 01:00:10:00 on, at 25 frames per second: reel 3 of 10 seconds and
/// reel 4 of 4.
struct ListedVideos : standin::tests::TestHost {
    ListedVideos()
    {
        project.setFrameRate({25.0, 0});
        reel3 = &addVideo(u"/picture/reel3.mov", 10.0);
        reel4 = &addVideo(u"/picture/reel4.mov", 4.0);
        list.add(VideoList::Entry("/picture/reel3.mov", Timecode(1, 0, 0, 0), Timecode(0, 0, 10, 0)), false);
        list.add(VideoList::Entry("/picture/reel4.mov", Timecode(1, 0, 10, 0), Timecode(0, 0, 4, 0)), false);
        source.setMediaPool(&pool);
        source.setVideoList(&list);
    }

    void expectFrame(double time, IMediaClip* clip, std::uint32_t frame)
    {
        for (const bool lastFrame : {false, true}) {
            const VideoFrame found = source.getFrame(lastFrame, time);
            EXPECT_EQ(found.clip, clip) << time;
            EXPECT_EQ(found.frame, frame) << time;
        }
    }
    void expectNone(double time) { expectFrame(time, nullptr, 0); }

    cadrel::tests::TestProject clock;
    IMediaClip* reel3 = nullptr;
    IMediaClip* reel4 = nullptr;
    VideoList list;
    MediaPool pool{context(), document()->getMediaPool()};
    PoolVideoSource source;
};

struct CountingListener : VideoSourceBase::Listener {
    void sourceChanged() override { ++calls; }

    int calls = 0;
};

} // namespace

TEST(PoolVideoSource, FindsTheFrameOfTheVideoThatCoversTheTime)
{
    ListedVideos videos;

    videos.expectFrame(3600.0, videos.reel3, 0);
    videos.expectFrame(3600.04, videos.reel3, 1);
    videos.expectFrame(3609.96, videos.reel3, 249);
    videos.expectFrame(3610.0, videos.reel4, 0);
    videos.expectFrame(3613.96, videos.reel4, 99);
}

TEST(PoolVideoSource, RoundsATimeToTheNearestFrame)
{
    ListedVideos videos;

    videos.expectFrame(3600.059, videos.reel3, 1);
    videos.expectFrame(3600.061, videos.reel3, 2);
}

TEST(PoolVideoSource, TakesTheFrameThatTheClipCountsAndNoneAfterIt)
{
    ListedVideos videos;

    videos.expectFrame(3614.0, videos.reel4, 100);
    videos.expectNone(3614.04);
}

TEST(PoolVideoSource, HasNothingBeforeTheFirstVideo)
{
    ListedVideos videos;

    videos.expectNone(3599.96);
    videos.expectNone(0.0);
}

TEST(PoolVideoSource, HasNothingAtATimeThatIsNoTimecode)
{
    ListedVideos videos;

    videos.expectNone(-1.0);
    videos.expectNone(86400.0);
    videos.expectNone(1e300);
    videos.expectNone(std::numeric_limits<double>::infinity());
    videos.expectNone(std::numeric_limits<double>::quiet_NaN());
}

TEST(PoolVideoSource, HasNothingForAVideoThatIsNotInThePool)
{
    ListedVideos videos;
    videos.list.add(VideoList::Entry("/picture/reel5.mov", Timecode(1, 0, 14, 0), Timecode(0, 0, 4, 0)), false);

    videos.expectNone(3615.0);
}

TEST(PoolVideoSource, FindsAVideoThatHasMovedByItsNameAndItsLength)
{
    ListedVideos videos;
    IMediaClip* const moved = &videos.addVideo(u"/new disk/Rolle fünf.mov", 4.0);
    const VideoList::Entry entry("/old disk/Rolle fünf.mov", Timecode(1, 0, 14, 0), Timecode(0, 0, 4, 0));
    videos.list.add(entry, false);

    videos.expectFrame(3615.0, moved, 25);
}

TEST(PoolVideoSource, HasNothingWithoutAPoolOrAList)
{
    ListedVideos videos;

    videos.source.setMediaPool(nullptr);
    videos.expectNone(3600.0);

    videos.source.setMediaPool(&videos.pool);
    videos.expectFrame(3600.0, videos.reel3, 0);

    videos.source.setVideoList(nullptr);
    videos.expectNone(3600.0);
    EXPECT_EQ(videos.source.videoList(), nullptr);
}

TEST(PoolVideoSource, CountsDropFrameTimecodesAsFrames)
{
    ListedVideos videos;
    videos.clock.framerate = core::Framerate(30, true, 1);
    videos.project.setFrameRate({30.0 / 1.001, FrameRateInfo::Flag::DropFrame | FrameRateInfo::Flag::PulledDown});
    IMediaClip* const reel6 = &videos.addVideo(u"/picture/reel6.mov", 120.0);
    VideoList list;
    list.add(VideoList::Entry("/picture/reel6.mov", Timecode(0, 0, 59, 28), Timecode(0, 1, 59, 0)), false);
    videos.source.setVideoList(&list);

    // 00:00:59:28 is frame 1798. The next minute begins with frame 1800, which is called 00:01:00:02.
    videos.expectFrame(Timecode(0, 1, 0, 2).toSeconds(), reel6, 2);
    videos.source.setVideoList(nullptr);
}

TEST(PoolVideoSource, TellsWhenTheListChanges)
{
    ListedVideos videos;
    CountingListener listener;
    videos.source.addListener(&listener);

    videos.list.setStart("/picture/reel4.mov", Timecode(2, 0, 0, 0));
    EXPECT_EQ(listener.calls, 1);
    videos.list.notify(core::ChangeContext(core::ChangeContext::SettingsChanged));
    EXPECT_EQ(listener.calls, 1);

    videos.source.removeListener(&listener);
    videos.list.clear();
    EXPECT_EQ(listener.calls, 1);
}

TEST(PoolVideoSource, TellsWhenItIsGivenAnotherListOrPool)
{
    ListedVideos videos;
    CountingListener listener;
    videos.source.addListener(&listener);
    VideoList other;

    videos.source.setVideoList(&other);
    EXPECT_EQ(listener.calls, 1);
    videos.list.clear();
    EXPECT_EQ(listener.calls, 1);
    other.clear();
    EXPECT_EQ(listener.calls, 2);

    videos.source.setMediaPool(nullptr);
    EXPECT_EQ(listener.calls, 3);
    videos.source.setVideoList(nullptr);
}

TEST(PoolVideoSource, LeavesTheListWhenItGoes)
{
    VideoList list;
    {
        PoolVideoSource source;
        source.setVideoList(&list);
    }

    // Nobody is there to be told; under the sanitizer a call would show.
    list.clear();

    EXPECT_TRUE(list.isEmpty());
}

} // namespace cadrel::host
