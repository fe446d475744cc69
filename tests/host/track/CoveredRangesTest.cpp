// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/CoveredRanges.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <set>
#include <vector>

namespace cadrel::host {

using core::SameInstant;
using core::SecondsRange;

namespace {

using Ranges = std::vector<SecondsRange>;

} // namespace

TEST(CoveredRanges, NothingIsCoveredAtFirst)
{
    const CoveredRanges covered;

    EXPECT_TRUE(covered.isEmpty());
    EXPECT_EQ(covered.uncovered({1.0, 2.0}), (Ranges{{1.0, 2.0}}));
}

TEST(CoveredRanges, AStretchIsUncoveredWhereNoOtherOneLies)
{
    CoveredRanges covered;
    EXPECT_EQ(covered.add({10.0, 20.0}), (Ranges{{10.0, 20.0}}));
    EXPECT_EQ(covered.add({30.0, 40.0}), (Ranges{{30.0, 40.0}}));

    EXPECT_EQ(covered.uncovered({12.0, 18.0}), Ranges());
    EXPECT_EQ(covered.uncovered({5.0, 45.0}), (Ranges{{5.0, 10.0}, {20.0, 30.0}, {40.0, 45.0}}));
    EXPECT_EQ(covered.add({15.0, 35.0}), (Ranges{{20.0, 30.0}}));
    EXPECT_EQ(covered.uncovered({0.0, 50.0}), (Ranges{{0.0, 10.0}, {40.0, 50.0}}));
}

TEST(CoveredRanges, OrderDoesNotMatter)
{
    CoveredRanges covered;
    for (int start = 90; start >= 0; start -= 20)
        covered.add({static_cast<double>(start), start + 10.0});

    EXPECT_EQ(covered.uncovered({10.0, 100.0}), (Ranges{{20.0, 30.0}, {40.0, 50.0}, {60.0, 70.0}, {80.0, 90.0}}));
    EXPECT_EQ(covered.add({0.0, 100.0}), (Ranges{{0.0, 10.0}, {20.0, 30.0}, {40.0, 50.0}, {60.0, 70.0}, {80.0, 90.0}}));
}

TEST(CoveredRanges, WhatIsShorterThanAnInstantIsNoPiece)
{
    for (const double part : {0.5, 0.99, 1.01, 2.0}) {
        SCOPED_TRACE(part);
        CoveredRanges covered;
        covered.add({0.0, 10.0});
        covered.add({10.0 + part * SameInstant, 20.0});

        EXPECT_EQ(covered.uncovered({0.0, 20.0}).empty(), part < 1.0);
        EXPECT_EQ(covered.uncovered({0.0, 20.0 + part * SameInstant}).size(), part < 1.0 ? 0U : 2U);
    }
}

RC_GTEST_PROP(CoveredRangesLaw, EachSecondIsUncoveredOnce, ())
{
    CoveredRanges covered;
    std::set<int> seconds;
    for (const auto& [start, length] : *rc::gen::container<std::vector<std::pair<int, int>>>(
             rc::gen::pair(rc::gen::inRange(0, 60), rc::gen::inRange(1, 20)))) {
        const SecondsRange stretch{static_cast<double>(start), static_cast<double>(start + length)};
        const Ranges before = covered.uncovered(stretch);
        const Ranges added = covered.add(stretch);
        RC_ASSERT(added == before);
        std::set<int> found;
        for (const SecondsRange& piece : added) {
            for (int second = static_cast<int>(piece.start); second < static_cast<int>(piece.end); ++second)
                RC_ASSERT(found.insert(second).second);
        }
        std::set<int> expected;
        for (int second = start; second < start + length; ++second) {
            if (seconds.insert(second).second)
                expected.insert(second);
        }
        RC_ASSERT(found == expected);
    }
}

} // namespace cadrel::host
