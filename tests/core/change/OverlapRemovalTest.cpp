// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/OverlapRemoval.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstddef>
#include <list>
#include <numeric>
#include <vector>

namespace cadrel::tests {
namespace {

using core::CandidateStretch;
using core::survivorsOfOverlaps;

using Places = std::vector<std::size_t>;

Places survivors(const std::vector<CandidateStretch>& candidates)
{
    Places places = survivorsOfOverlaps(candidates);
    std::sort(places.begin(), places.end());
    return places;
}

bool overlap(const CandidateStretch& a, const CandidateStretch& b)
{
    return std::max(a.start, b.start) < std::min(a.end, b.end);
}

/// Whether `b` goes when the outer walk stands at `a`; otherwise `a` goes.
bool innerOneGoes(const CandidateStretch& a, const CandidateStretch& b)
{
    const int lengthOfA = a.end - a.start;
    const int lengthOfB = b.end - b.start;
    return lengthOfA == lengthOfB ? b.distance > a.distance : lengthOfB < lengthOfA;
}

/// Each candidate against the whole list from its head, one pair after the other.
Places survivorsOfTheWalk(const std::vector<CandidateStretch>& candidates)
{
    std::list<std::size_t> left(candidates.size());
    std::iota(left.begin(), left.end(), std::size_t{0});
    auto a = left.begin();
    while (a != left.end()) {
        auto b = left.begin();
        bool outerOneWent = false;
        while (b != left.end() && !outerOneWent) {
            if (a == b || !overlap(candidates[*a], candidates[*b])) {
                ++b;
            } else if (innerOneGoes(candidates[*a], candidates[*b])) {
                b = left.erase(b);
            } else {
                a = left.erase(a);
                outerOneWent = true;
            }
        }
        if (!outerOneWent)
            ++a;
    }
    return {left.begin(), left.end()};
}

} // namespace

TEST(OverlapRemoval, LeavesNothingOfNothing)
{
    EXPECT_EQ(survivors({}), Places());
}

TEST(OverlapRemoval, KeepsThoseThatOnlyTouch)
{
    EXPECT_EQ(survivors({{10, 20, 0.0}, {0, 10, 0.0}, {20, 21, 5.0}}), (Places{0, 1, 2}));
}

TEST(OverlapRemoval, OfTwoTheLongerStaysWhereverItStands)
{
    EXPECT_EQ(survivors({{0, 10, 0.0}, {9, 20, 5.0}}), Places{1});
    EXPECT_EQ(survivors({{9, 20, 5.0}, {0, 10, 0.0}}), Places{0});
}

TEST(OverlapRemoval, OfTwoEquallyLongTheNearerStaysAndInATieTheLater)
{
    EXPECT_EQ(survivors({{0, 10, 1.0}, {5, 15, 2.0}}), Places{0});
    EXPECT_EQ(survivors({{0, 10, 2.0}, {5, 15, 1.0}}), Places{1});
    EXPECT_EQ(survivors({{0, 10, 1.0}, {5, 15, 1.0}}), Places{1});
}

//  0   |------|
//  1        |----------|
//  2                |-----|
TEST(OverlapRemoval, InAChainTheLongMiddleStaysAlone)
{
    EXPECT_EQ(survivors({{0, 7, 0.0}, {5, 17, 0.0}, {13, 19, 0.0}}), Places{1});
}

//  0   |-----------|
//  1        |----------|
//  2                |-----|
TEST(OverlapRemoval, WhatIsTakenOutTakesNoneAlong)
{
    EXPECT_EQ(survivors({{0, 13, 0.0}, {5, 17, 0.0}, {13, 19, 0.0}}), (Places{0, 2}));
}

// The first one takes out the second, which would have taken out the fourth, and then goes against the third.
TEST(OverlapRemoval, AnEarlierPairDecidesBeforeALaterOne)
{
    EXPECT_EQ(survivors({{0, 10, 2.0}, {8, 18, 3.0}, {2, 12, 1.0}, {16, 26, 4.0}}), (Places{2, 3}));
}

//  0   |------------------|
//  1      |--|
//  2            |--|
TEST(OverlapRemoval, AnOuterStretchTakesOutAllWithinIt)
{
    EXPECT_EQ(survivors({{3, 6, 0.0}, {0, 20, 9.0}, {9, 12, 0.0}}), Places{1});
}

RC_GTEST_PROP(OverlapRemoval, LeavesWhatTheWalkThroughAllPairsLeaves, ())
{
    // Few places, lengths and distances, so that stretches are nested, chained and tied in every list.
    const auto width = *rc::gen::element(4, 12, 40);
    const auto candidates = *rc::gen::container<std::vector<CandidateStretch>>(
        rc::gen::map(rc::gen::tuple(rc::gen::inRange(0, width), rc::gen::inRange(1, 7), rc::gen::inRange(0, 3)),
                     [](const auto& numbers) {
                         const auto& [start, length, distance] = numbers;
                         return CandidateStretch{start, start + length, distance / 2.0};
                     }));

    RC_ASSERT(survivors(candidates) == survivorsOfTheWalk(candidates));
}

} // namespace cadrel::tests
