// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/VideoFile.h"

#include "standin/video/VideoError.h"
#include "tests/support/video/TestVideos.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <optional>
#include <random>
#include <string>
#include <vector>

namespace standin::tests {

using Reason = VideoError::Reason;

namespace {

constexpr PictureSize Box{320, 320};

const std::string H264 = "-c:v libx264 -preset veryfast -pix_fmt yuv420p ";
/// Three B frames between others, key pictures every two seconds, and B frames that need pictures of both groups.
const std::string OpenGroups =
    H264 + "-bf 3 -x264-params keyint=48:min-keyint=48:scenecut=0:open-gop=1:b-pyramid=normal ";
const std::string Mpeg2 = "-c:v mpeg2video -b:v 3M -g 15 -bf 2 ";
/// Several pictures between two times that the file tells.
const std::string CalmMpeg2 = "-c:v mpeg2video -qscale:v 24 -g 12 -bf 2 ";
const std::string ProRes = "-c:v prores_ks -profile:v 0 ";
const std::string Film = "24000/1001";
const std::string Television = "30000/1001";
const std::string FastTelevision = "60000/1001";

std::vector<VideoRecipe> recipes()
{
    std::vector<VideoRecipe> all;
    struct Kind {
        std::string rate;
        std::string label;
        std::string timecode;
    };
    // The timecode of the file counts drop-frame at 29.97 and 59.94.
    for (const auto& [rate, label, start] :
         {Kind{Film, "film", "01:00:59:12"}, Kind{Television, "television", "01:00:59;20"},
          Kind{FastTelevision, "fast-television", "01:00:59;50"}}) {
        const std::string timecode = "-timecode '" + start + "' ";
        all.push_back({label + ".mp4", 300, rate, OpenGroups + timecode});
        all.push_back({label + ".mov", 300, rate, OpenGroups + timecode});
        all.push_back({label + ".ts", 300, rate, OpenGroups});
        all.push_back({label + ".mkv", 300, rate, OpenGroups});
        all.push_back({label + ".mxf", 300, rate, Mpeg2 + timecode});
        all.push_back({label + ".mpg", 300, rate, Mpeg2 + "-f vob "});
        // With more pictures between two times, ffmpeg writes some of these for the wrong pictures.
        if (rate != FastTelevision)
            all.push_back({label + "-calm.mpg", 300, rate, CalmMpeg2, 160, 96});
        all.push_back({label + "-prores.mov", 300, rate, ProRes + timecode});
    }
    return all;
}

double rateOf(const VideoRecipe& recipe)
{
    return recipe.rate == Film ? 23.976 : recipe.rate == Television ? 29.97 : 59.94;
}

/// The number in the picture of a frame, or why there is none.
struct Seen {
    int number = -1;
    std::optional<Reason> reason;
};

Seen see(VideoFile& file, std::uint32_t frame, Ratio rate)
{
    try {
        return {numberIn(file.picture(frame, rate, Box, inGoodTime())), std::nullopt};
    } catch (const VideoError& error) {
        return {-1, error.reason()};
    }
}

class VideoFileOfEachKind : public testing::TestWithParam<VideoRecipe> {};

} // namespace

TEST_P(VideoFileOfEachKind, ShowsTheFirstTheSecondAndTheLastFrameAndNothingPastTheEnd)
{
    VideoFile file(videoOf(GetParam()), inGoodTime());
    const Ratio rate = exactRate(rateOf(GetParam()));

    EXPECT_EQ(file.rate(), rate);
    ASSERT_EQ(file.frameCount(rate), 300U);
    for (const std::uint32_t frame : {0U, 1U, 299U, 298U, 2U, 0U})
        EXPECT_EQ(see(file, frame, rate).number, static_cast<int>(frame));
    EXPECT_EQ(see(file, 300, rate).reason, Reason::PastTheEnd);
    EXPECT_EQ(see(file, 0xffffffff, rate).reason, Reason::PastTheEnd);
    EXPECT_EQ(see(file, 299, rate).number, 299);
}

TEST_P(VideoFileOfEachKind, ShowsEachOf60RandomFrames)
{
    VideoFile file(videoOf(GetParam()), inGoodTime());
    const Ratio rate = exactRate(rateOf(GetParam()));
    std::mt19937 random(17);

    for (int round = 0; round < 60; ++round) {
        const auto frame = static_cast<std::uint32_t>(random() % 300U);
        EXPECT_EQ(see(file, frame, rate).number, static_cast<int>(frame));
    }
}

TEST_P(VideoFileOfEachKind, ShowsEachFrameForwardsAndBackwards)
{
    VideoFile file(videoOf(GetParam()), inGoodTime());
    const Ratio rate = exactRate(rateOf(GetParam()));

    for (std::uint32_t frame = 0; frame < 300; ++frame)
        ASSERT_EQ(see(file, frame, rate).number, static_cast<int>(frame));
    for (std::uint32_t frame = 300; frame-- > 0;)
        ASSERT_EQ(see(file, frame, rate).number, static_cast<int>(frame));
}

TEST_P(VideoFileOfEachKind, ShowsEachFrameBackwardsWhereNothingHasBeenReadYet)
{
    VideoFile file(videoOf(GetParam()), inGoodTime());
    const Ratio rate = exactRate(rateOf(GetParam()));

    for (std::uint32_t frame = 300; frame-- > 0;)
        EXPECT_EQ(see(file, frame, rate).number, static_cast<int>(frame));
}

INSTANTIATE_TEST_SUITE_P(Videos, VideoFileOfEachKind, testing::ValuesIn(recipes()), [](const auto& tested) {
    std::string name = tested.param.name;
    for (char& character : name)
        character = std::isalnum(static_cast<unsigned char>(character)) ? character : '_';
    return name;
});

TEST(VideoFile, OfOnePictureAfterTheLastKeyPictureTheTimeMayBeUntold)
{
    // In this container a picture has only the time at which it is decoded, and a key picture stands at each twelfth.
    for (const int frames : {1, 2, 12, 13, 14, 25}) {
        for (const char* const codec : {"-c:v mpeg4 -bf 2 -g 12 ", "-c:v libx264 -bf 2 -g 12 "}) {
            VideoFile file(videoOf({"short.avi", frames, "25", codec}), inGoodTime());

            ASSERT_EQ(file.frameCount({25, 1}), static_cast<std::uint32_t>(frames)) << codec;
            for (int frame = frames; frame-- > 0;)
                EXPECT_EQ(see(file, static_cast<std::uint32_t>(frame), {25, 1}).number, frame) << codec << frames;
        }
    }
}

TEST(VideoFile, AFilmWithoutTimesShowsOnePictureAfterTheOther)
{
    VideoFile file(videoOf({"bare.h264", 100, "25", H264 + "-bf 2 -g 24 "}), inGoodTime());

    ASSERT_EQ(file.frameCount({25, 1}), 100U);
    for (const std::uint32_t frame : {0U, 1U, 50U, 99U, 98U, 3U})
        EXPECT_EQ(see(file, frame, {25, 1}).number, static_cast<int>(frame));
}

TEST(VideoFile, AFrameIsTheSamePictureHoweverItIsReached)
{
    // Grain, B frames of which others depend on some, and groups that are longer than the pictures that are kept.
    const VideoRecipe recipe{"same.mp4", 200, "24",
                             "-vf noise=alls=12:allf=t " + H264 +
                                 "-x264-params keyint=120:min-keyint=120:scenecut=0:b-adapt=0:open-gop=1 "};
    const Ratio rate{24, 1};
    std::vector<std::vector<std::uint8_t>> pictures;
    PictureReader reader(videoOf(recipe), inGoodTime());
    PictureDrawing drawing;
    const auto decoded = owned(av_frame_alloc());
    while (reader.next(*decoded))
        pictures.push_back(drawing.draw(*decoded, {1, 1}, {}, Box).pixels);
    ASSERT_EQ(pictures.size(), 200U);
    VideoFile file(videoOf(recipe), inGoodTime());
    const auto expectSame = [&](std::uint32_t frame) {
        EXPECT_TRUE(file.picture(frame, rate, Box, inGoodTime()).pixels == pictures[frame]) << frame;
    };

    std::mt19937 random(3);
    for (int round = 0; round < 40; ++round) {
        auto frame = static_cast<std::uint32_t>(random() % 200U);
        expectSame(frame);
        // A walk from there, now forward and now backward.
        for (int step = 0; step < 12; ++step) {
            const std::uint32_t by = random() % 3U == 0 ? static_cast<std::uint32_t>(random() % 20U) : 1U;
            frame = random() % 4U == 0 ? std::min(frame + by, 199U) : frame - std::min(frame, by);
            expectSame(frame);
        }
    }
    for (std::uint32_t frame = 200; frame-- > 0;)
        expectSame(frame);
}

} // namespace standin::tests
