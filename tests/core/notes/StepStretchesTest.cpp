// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/StepStretches.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <vector>

namespace cadrel::tests {
namespace {

using namespace core;

struct Laid {
    SecondsRange range;
    std::size_t step;
};

StepStretches stretchesOf(const std::vector<Laid>& laid)
{
    StepStretches stretches;
    for (const Laid& stretch : laid)
        stretches.add(stretch.range, stretch.step);
    stretches.sort();
    return stretches;
}

TEST(StepStretches, ARangeBelongsToTheStepThatHasMostOfIt)
{
    const StepStretches stretches = stretchesOf({{{10, 12}, 1}, {{20, 23}, 2}, {{30, 31}, 3}});

    EXPECT_EQ(stretches.stepOf({11, 12}), 1U);
    EXPECT_EQ(stretches.stepOf({10, 22}), 1U); // two seconds of each; the first
    EXPECT_EQ(stretches.stepOf({10, 22.5}), 2U);
    EXPECT_EQ(stretches.stepOf({0, 100}), 2U);
    EXPECT_EQ(stretches.stepOf({22.5, 31}), 3U);
}

TEST(StepStretches, WhatNoStepHasBelongsToTheNearestWithinASecond)
{
    const StepStretches stretches = stretchesOf({{{10, 12}, 1}, {{15, 15}, 2}});

    EXPECT_EQ(stretches.stepOf({8, 9}), 1U);
    EXPECT_EQ(stretches.stepOf({8, 8.99}), 0U);
    EXPECT_EQ(stretches.stepOf({13, 13.5}), 1U);
    EXPECT_EQ(stretches.stepOf({13.01, 13.5}), 0U);
    EXPECT_EQ(stretches.stepOf({13.01, 14}), 2U);
    EXPECT_EQ(stretches.stepOf({12.9, 14.1}), 1U); // both are 0.9 away
    EXPECT_EQ(stretches.stepOf({16, 16}), 2U);
    EXPECT_EQ(stretches.stepOf({16.01, 17}), 0U);
    EXPECT_EQ(StepStretches().stepOf({1, 2}), 0U);
}

TEST(StepStretches, AnInstantBelongsToWhatTouchesIt)
{
    const StepStretches stretches = stretchesOf({{{10, 12}, 1}, {{12.5, 12.5}, 2}});

    EXPECT_EQ(stretches.stepOf({12, 12}), 1U);
    EXPECT_EQ(stretches.stepOf({12.2, 12.2}), 1U);
    EXPECT_EQ(stretches.stepOf({12.5, 12.5}), 2U);
}

TEST(StepStretches, OfStretchesOnTopOfEachOtherTheFirstHasTheTime)
{
    const StepStretches stretches = stretchesOf({{{10, 20}, 1}, {{15, 25}, 2}, {{16, 18}, 3}, {{12, 12}, 4}});

    EXPECT_EQ(stretches.stepOf({16, 18}), 1U);
    EXPECT_EQ(stretches.stepOf({12, 12}), 1U);
    EXPECT_EQ(stretches.stepOf({21, 24}), 2U);
}

RC_GTEST_PROP(StepStretchesLaw, NoStepHasMoreOfARangeThanTheOneThatIsFound, ())
{
    // Stretches of whole seconds with gaps between them.
    const auto lengths = *rc::gen::container<std::vector<int>>(rc::gen::inRange(0, 6));
    std::vector<Laid> laid;
    int time = 0;
    for (const int length : lengths) {
        laid.push_back({{static_cast<double>(time), static_cast<double>(time + length)}, laid.size() + 1});
        time += length + 3;
    }
    const int start = *rc::gen::inRange(0, time + 1);
    const int length = *rc::gen::inRange(1, time + 2);
    const SecondsRange range{static_cast<double>(start), static_cast<double>(start + length)};
    const auto sharedBy = [&range](const Laid& stretch) {
        return std::min(stretch.range.end, range.end) - std::max(stretch.range.start, range.start);
    };

    const std::size_t found = stretchesOf(laid).stepOf(range);

    double most = 0.0;
    for (const Laid& stretch : laid)
        most = std::max(most, sharedBy(stretch));
    if (most > 0.0)
        RC_ASSERT(sharedBy(laid.at(found - 1)) == most);
    else if (found != 0U)
        RC_ASSERT(sharedBy(laid.at(found - 1)) >= -StepStretches::Reach);
}

} // namespace
} // namespace cadrel::tests
