// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/video/VideoFrames.h"

#include "tests/support/ThrownResult.h"
#include "tests/support/core/TestProject.h"
#include "util/Result.h"

#include <gtest/gtest.h>

namespace cadrel::tests {
namespace {

using core::Timecode;
using gui::PixelSize;
using gui::VideoFrames;

TEST(VideoFrames, TheLastFrameBeforeAnOutIsTheOneBeforeIt)
{
    const TestProject project;

    EXPECT_EQ(VideoFrames::lastBefore(Timecode("01:00:00:00")), Timecode("00:59:59:24"));
    EXPECT_EQ(VideoFrames::lastBefore(Timecode("00:00:00:02")), Timecode("00:00:00:01"));
    EXPECT_EQ(VideoFrames::lastBefore(Timecode("00:00:00:01")), Timecode("00:00:00:00"));
    EXPECT_EQ(VideoFrames::lastBefore(Timecode("23:59:59:24")), Timecode("23:59:59:23"));
}

TEST(VideoFrames, AnOutAtZeroStaysThere)
{
    const TestProject project;

    EXPECT_EQ(VideoFrames::lastBefore(Timecode("00:00:00:00")), Timecode("00:00:00:00"));
}

TEST(VideoFrames, TheFrameBeforeADropFrameMinuteSkipsTheNumbersThatAreLeftOut)
{
    const TestProject project(core::Framerate(30, 1));

    EXPECT_EQ(VideoFrames::lastBefore(Timecode("00:01:00:02")), Timecode("00:00:59:29"));
}

TEST(VideoFrames, AnOutThatTheRateDoesNotHaveFails)
{
    const TestProject project;

    EXPECT_EQ(thrownBy([] { VideoFrames::lastBefore(Timecode("00:00:00:25")); }), util::Result::OutOfRange);
    EXPECT_EQ(thrownBy([] { VideoFrames::lastBefore(Timecode("00:00:00:26")); }), util::Result::FrameOutOfRate);
}

TEST(VideoFrames, AnAreaHasAsManyPixelsAsTheScaleSays)
{
    EXPECT_EQ(VideoFrames::pixelsOf(188, 77, 1.0), (PixelSize{188, 77}));
    EXPECT_EQ(VideoFrames::pixelsOf(188, 77, 2.0), (PixelSize{376, 154}));
    EXPECT_EQ(VideoFrames::pixelsOf(188, 77, 1.25), (PixelSize{235, 96})) << "96.25 pixels";
    EXPECT_EQ(VideoFrames::pixelsOf(10, 3, 1.5), (PixelSize{15, 5})) << "4.5 pixels";
}

TEST(VideoFrames, AnAreaThatHasNoRoomStillHasAPixel)
{
    EXPECT_EQ(VideoFrames::pixelsOf(0, -20, 1.0), (PixelSize{1, 1}));
    EXPECT_EQ(VideoFrames::pixelsOf(1, 1, 0.25), (PixelSize{1, 1}));
}

} // namespace
} // namespace cadrel::tests
