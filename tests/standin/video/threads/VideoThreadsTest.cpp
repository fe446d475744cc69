// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/Project.h"
#include "standin/video/VideoThumbnailFactory.h"
#include "tests/support/video/TestVideos.h"

#include <gtest/gtest.h>

#include <atomic>
#include <cstdint>
#include <random>
#include <string>
#include <thread>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

constexpr int Width = 320;
constexpr int Height = 192;
const std::string H264 = "-c:v libx264 -preset veryfast -pix_fmt yuv420p -g 24 -bf 2 ";

int numberAt(IThumbnailFactory& factory, IMediaClip& clip, uint32 frame)
{
    const int32 size[2] = {Width, Height};
    if (factory.setSource(&clip, size) != ResultOk)
        return -1;
    const auto image = Counted<IThumbnailImage>::adopt(factory.getImage(frame));
    Picture picture{{Width, Height}, std::vector<std::uint8_t>(Width * Height * 4)};
    const int32 all[4] = {0, 0, Width, Height};
    if (!image || image->read(picture.pixels.data(), Width * 4, all, 0) != ResultOk)
        return -1;
    return numberIn(picture);
}

} // namespace

TEST(VideoThreads, TwoFactoriesDrawAtOnceWhileTheProjectChanges)
{
    ChangeLog log;
    const auto project = makeCounted<Project>(log);
    project->setPath(u"/nowhere/reel.stage");
    const auto addClip = [&](const char* name) {
        const auto path = videoOf({name, 240, "24", H264});
        auto clip = makeCounted<MediaClip>(MediaClip::Kind::Video, path.u16string(), 10.0);
        project->pool().add(clip);
        return clip;
    };
    const Counted<MediaClip> clips[] = {addClip("one.mp4"), addClip("other.mkv")};
    constexpr int Rounds = 60;
    std::atomic<int> running = 2;
    // Both draw of both files, the first one above all.
    const auto draw = [&](unsigned seed) {
        const auto factory = makeCounted<VideoThumbnailFactory>();
        std::mt19937 random(seed);
        for (int round = 0; round < Rounds; ++round) {
            const auto frame = static_cast<uint32>(random() % 240U);
            MediaClip& clip = *clips[random() % 4U == 0 ? 1 : 0];
            EXPECT_EQ(numberAt(*factory, clip, frame), static_cast<int>(frame));
        }
        --running;
    };

    std::thread one(draw, 1U);
    std::thread other(draw, 2U);
    while (running > 0) {
        project->setPath(u"/elsewhere/reel.stage");
        clips[0]->setName(u"another name");
        std::this_thread::yield();
    }
    one.join();
    other.join();
}

} // namespace standin::tests
