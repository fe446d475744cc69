// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/SharedPicture.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstddef>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::FrameSet;

TEST(FrameSet, FindsTheFirstFrameInItAndOutOfIt)
{
    FrameSet frames(300);
    frames.add(62, 130); // over the ends of two words of 64 frames

    EXPECT_EQ(frames.nextIn(0, 300), 62);
    EXPECT_EQ(frames.nextIn(62, 300), 62);
    EXPECT_EQ(frames.nextIn(129, 300), 129);
    EXPECT_EQ(frames.nextIn(130, 300), 300);
    EXPECT_EQ(frames.nextOut(61, 300), 61);
    EXPECT_EQ(frames.nextOut(62, 300), 130);
    EXPECT_EQ(frames.nextOut(64, 300), 130);
    EXPECT_EQ(frames.nextOut(300, 300), 300);
}

TEST(FrameSet, FindsNothingFromTheLimitOn)
{
    FrameSet frames(128);
    frames.add(10, 128);

    EXPECT_EQ(frames.nextIn(0, 10), 10);
    EXPECT_EQ(frames.nextIn(0, 9), 9);
    EXPECT_EQ(frames.nextOut(10, 128), 128);
    EXPECT_EQ(frames.nextOut(20, 63), 63);
    EXPECT_EQ(frames.nextIn(50, 40), 40);
}

RC_GTEST_PROP(FrameSetLaw, FindsWhatAWalkOverAllFramesFinds, ())
{
    constexpr int Length = 400;
    FrameSet frames(Length);
    std::vector<bool> isIn(Length, false);
    const auto added = *rc::gen::container<std::vector<std::pair<int, int>>>(
        rc::gen::pair(rc::gen::inRange(0, Length), rc::gen::inRange(0, 150)));
    for (const auto& [start, length] : added) {
        const int end = std::min(Length, start + length);
        frames.add(start, end);
        for (int frame = start; frame < end; ++frame)
            isIn[static_cast<std::size_t>(frame)] = true;
    }
    const int from = *rc::gen::inRange(0, Length);
    const int limit = *rc::gen::inRange(from, Length + 1);

    for (const bool wanted : {true, false}) {
        int expected = from;
        while (expected < limit && isIn[static_cast<std::size_t>(expected)] != wanted)
            ++expected;
        RC_ASSERT((wanted ? frames.nextIn(from, limit) : frames.nextOut(from, limit)) == expected);
    }
}

} // namespace
} // namespace cadrel::tests
