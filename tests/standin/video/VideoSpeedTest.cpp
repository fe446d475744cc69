// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/VideoFile.h"

#include "tests/support/Sanitizer.h"
#include "tests/support/SecondsOf.h"
#include "tests/support/video/TestVideos.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <numeric>
#include <string>
#include <vector>

namespace standin::tests {

namespace {

using cadrel::tests::secondsOf;

constexpr PictureSize Box{384, 216};
constexpr Ratio Rate{24, 1};
constexpr std::uint32_t Group = 250;
constexpr std::uint32_t Frames = 255;
constexpr int Width = 1920;
constexpr int Height = 1080;
/// Between two pictures that others depend on is one that none does, as encoders of usual films have it.
const std::string LongGroups = "-c:v libx264 -preset veryfast -pix_fmt yuv420p "
                               "-x264-params keyint=250:min-keyint=250:scenecut=0:b-adapt=0 ";

/// A moving picture of that size that covers the upper left of the frames, but not their bars.
std::string moving(const std::string& size, const std::string& filter)
{
    return "-f lavfi -i testsrc2=s=" + size + ":r=24 -filter_complex '[1:v]scroll=h=0.003" + filter +
           "[moving];[0:v][moving]overlay=shortest=1,format=yuv420p' ";
}

/// Titles on a still picture, which a pattern moves over.
VideoRecipe calm()
{
    return {"calm.mp4", Frames, "24", moving("480x270", "") + LongGroups + "-crf 28 ", Width, Height};
}

/// A camera that pans, with the grain of film.
VideoRecipe grainy()
{
    return {"grainy.mp4", Frames, "24", moving("1920x808", ",noise=alls=4:allf=t") + LongGroups + "-crf 24 ",
            Width,        Height};
}

double millisecondsFor(VideoFile& file, std::uint32_t frame)
{
    return 1000.0 * secondsOf([&] {
               EXPECT_EQ(numberIn(file.picture(frame, Rate, Box, inGoodTime())), static_cast<int>(frame));
           });
}

/// What it takes to decode a whole group, one picture after the other.
double millisecondsToDecode(const VideoRecipe& recipe)
{
    PictureReader reader(videoOf(recipe), inGoodTime());
    const auto picture = owned(av_frame_alloc());
    return 1000.0 * secondsOf([&] {
               for (std::uint32_t number = 0; number < Group; ++number)
                   EXPECT_TRUE(reader.next(*picture));
           });
}

struct Times {
    double middle;
    double average;
    double most;
    std::ptrdiff_t slow; ///< how many take over 50 ms
};

/// Prints them, too.
Times timesOf(const std::string& what, std::vector<double> values)
{
    std::sort(values.begin(), values.end());
    const auto slow = std::count_if(values.begin(), values.end(), [](double value) { return value >= 50.0; });
    const double sum = std::accumulate(values.begin(), values.end(), 0.0);
    const Times times{values[values.size() / 2], sum / static_cast<double>(values.size()), values.back(), slow};
    std::printf("%s: %zu frames, half of them under %.1f ms, %.1f ms on average, all under %.1f ms, %td over 50 ms\n",
                what.c_str(), values.size(), times.middle, times.average, times.most, times.slow);
    return times;
}

/// Times are those of the processor, so that other programs count as little as they can.
class VideoSpeedOfEachKind : public testing::TestWithParam<VideoRecipe> {
protected:
    void SetUp() override
    {
        if (CADREL_ADDRESS_SANITIZER)
            GTEST_SKIP() << "A sanitizer takes its own time.";
    }
};

} // namespace

TEST_P(VideoSpeedOfEachKind, TheNextFrameComesAtOnce)
{
    VideoFile file(videoOf(GetParam()), inGoodTime());
    std::vector<double> forward;

    for (std::uint32_t frame = 0; frame < Group; ++frame)
        forward.push_back(millisecondsFor(file, frame));

    const Times times = timesOf("forward", forward);
    EXPECT_LT(times.average, 50.0);
    EXPECT_LE(times.slow, 2);
}

TEST_P(VideoSpeedOfEachKind, TheFrameBeforeComesAtOnceThroughAWholeGroup)
{
    VideoFile file(videoOf(GetParam()), inGoodTime());
    std::vector<double> backward;
    millisecondsFor(file, Group);

    for (std::uint32_t frame = Group; frame-- > 0;)
        backward.push_back(millisecondsFor(file, frame));

    // The first steps back have little time to read ahead. Without reading ahead, one of twelve steps decodes the group anew.
    const Times times = timesOf("backward", backward);
    EXPECT_LT(times.average, 50.0);
    EXPECT_LE(times.slow, 4);
}

TEST_P(VideoSpeedOfEachKind, AnyFrameTakesNoMoreThanThePicturesThatOthersNeed)
{
    VideoFile file(videoOf(GetParam()), inGoodTime());
    std::vector<double> any;
    std::vector<double> group;

    // The last frames of a group take the longest. They are asked for from after them and from before them.
    for (const std::uint32_t frame : {249U, 248U, 247U}) {
        for (const std::uint32_t from : {253U, 0U}) {
            millisecondsFor(file, from);
            any.push_back(millisecondsFor(file, frame));
        }
        group.push_back(millisecondsToDecode(GetParam()));
    }

    // Half of the pictures are left out, but for the last few, and one is drawn.
    EXPECT_LT(timesOf("last frames of a group", any).middle, 0.8 * timesOf("all of a group decoded", group).middle);
}

TEST_P(VideoSpeedOfEachKind, AnyFrameTakesUnder300MillisecondsOnAverageWhereTheDecoderIsThatFast)
{
    VideoFile file(videoOf(GetParam()), inGoodTime());
    std::vector<double> any;

    // Spread over the group, and each far from the last one.
    for (std::uint32_t frame = 12; frame < Group; frame += 25) {
        millisecondsFor(file, 253);
        any.push_back(millisecondsFor(file, frame));
    }

    // On average half of a group comes before a frame, of which half is left out. With grain, even that takes the decoder longer.
    constexpr double ShareOfGroup = 0.4;
    const double most = std::max(300.0, ShareOfGroup * millisecondsToDecode(GetParam()));
    EXPECT_LT(timesOf("any", any).average, most);
}

INSTANTIATE_TEST_SUITE_P(Videos, VideoSpeedOfEachKind, testing::Values(calm(), grainy()),
                         [](const auto& tested) { return tested.param.name.substr(0, tested.param.name.find('.')); });

} // namespace standin::tests
