// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/VideoFile.h"

#include "tests/support/Sanitizer.h"
#include "tests/support/video/TestVideos.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <ctime>
#include <random>
#include <string>
#include <vector>

namespace standin::tests {

namespace {

constexpr PictureSize Box{384, 216};
constexpr std::uint32_t Frames = 255;

/// Full size, with 250 frames from one key picture to the next.
VideoRecipe large()
{
    return {"large.mp4",
            Frames,
            "24",
            "-c:v libx264 -preset veryfast -crf 18 -pix_fmt yuv420p "
            "-x264-params keyint=250:min-keyint=250:scenecut=0 ",
            1920,
            1080};
}

/// In milliseconds, by the processor's clock: others may use the machine, too.
double timeOf(VideoFile& file, std::uint32_t frame)
{
    const std::clock_t start = std::clock();
    EXPECT_EQ(numberIn(file.picture(frame, {24, 1}, Box, inGoodTime())), static_cast<int>(frame));
    return 1000.0 * static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC;
}

double middleOf(std::vector<double> values)
{
    std::sort(values.begin(), values.end());
    return values[values.size() / 2];
}

} // namespace

TEST(VideoSpeed, NeighbouringFramesComeAtOnceAndAnyFrameSoon)
{
    if (CADREL_ADDRESS_SANITIZER)
        GTEST_SKIP() << "A sanitizer takes its own time.";
    VideoFile file(videoOf(large()), inGoodTime());
    std::vector<double> forward;
    std::vector<double> backward;
    std::vector<double> any;

    timeOf(file, 200);
    for (std::uint32_t frame = 201; frame < 240; ++frame)
        forward.push_back(timeOf(file, frame));
    for (std::uint32_t frame = 238; frame > 200; --frame)
        backward.push_back(timeOf(file, frame));
    std::mt19937 random(5);
    for (int round = 0; round < 20; ++round)
        any.push_back(timeOf(file, static_cast<std::uint32_t>(random() % Frames)));
    any.push_back(timeOf(file, 248));
    any.push_back(timeOf(file, 249));

    std::printf("forward %.1f ms, backward %.1f ms, any %.1f ms, at most %.1f ms\n", middleOf(forward),
                middleOf(backward), middleOf(any), *std::max_element(any.begin(), any.end()));
    EXPECT_LT(middleOf(forward), 50.0);
    EXPECT_LT(middleOf(backward), 50.0);
    EXPECT_LT(middleOf(any), 300.0);
}

} // namespace standin::tests
