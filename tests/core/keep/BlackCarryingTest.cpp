// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/BlackCarrying.h"

#include "tests/core/keep/KeepFilm.h"
#include "tests/support/SecondsOf.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

namespace cadrel::tests {
namespace {

using core::BlackCarrying;
using core::CarriedFrom;
using core::CarriedStretch;
using core::CarriedStretches;
using core::ChangeStretch;
using core::FrameRange;
using core::FrameRanges;
using core::Reels;

/// One frame a second.
class BlackCarryingTest : public testing::Test {
protected:
    /// Carries `material` over; `m_carried` holds the picture that survives.
    void run(const FrameRanges& oldLit, const FrameRanges& newLit, const FrameRanges& material,
             const std::vector<ChangeStretch>& changes = {})
    {
        const Reels reels(oldLit, newLit, FrameASecond);
        BlackCarrying black(oldLit, newLit, reels, material, FrameASecond, m_carried);
        black.run(changes);
        m_lost = black.lost();
    }

    void survives(const FrameRange& source, std::int32_t shift)
    {
        m_carried.carry({source.shiftedBy(shift), shift, CarriedFrom::Cut, 0});
    }

    /// "to 110..120 by 10" for each stretch of black.
    std::vector<std::string> carriedBlack() const
    {
        std::vector<std::string> lines;
        for (const CarriedStretch& stretch : m_carried.stretches()) {
            if (stretch.from == CarriedFrom::Black)
                lines.push_back("to " + linesOf(FrameRanges{stretch.destination}).front() + " by " +
                                std::to_string(stretch.shift));
        }
        return lines;
    }

    TestProject m_project{FrameASecond};
    CarriedStretches m_carried;
    FrameRanges m_lost;
};

using Lines = std::vector<std::string>;

} // namespace

// old   |A 0-10|  black  |B 20-30|
// new   |A 0-10|      black 20     |B 30-40|
TEST_F(BlackCarryingTest, BetweenShotsThatHavePartedBlackFollowsTheLeftOneThatIsWhole)
{
    survives({0, 10}, 0);
    survives({20, 30}, 10);

    run({{0, 10}, {20, 30}}, {{0, 10}, {30, 40}}, {{12, 15}});

    EXPECT_EQ(carriedBlack(), Lines{"to 10..20 by 0"});
    EXPECT_TRUE(m_lost.empty());
}

// The last frame of A is gone, and so is the touch of the black with what survives of A.
TEST_F(BlackCarryingTest, BetweenShotsThatHavePartedBlackFollowsTheRightOneWhenTheEndOfTheLeftOneIsGone)
{
    survives({0, 9}, 0);
    survives({20, 30}, 10);

    run({{0, 10}, {20, 30}}, {{0, 9}, {30, 40}}, {{12, 15}});

    EXPECT_EQ(carriedBlack(), Lines{"to 20..30 by 10"});
}

TEST_F(BlackCarryingTest, EachFrameOfBlackGoesToOnePlaceThoughTwoEventsNameIt)
{
    // New picture covers all places of the old material, so that only the change EDL has room for it.
    run({}, {{0, 100}}, {{10, 20}}, {{{205, 215}, 200}, {{300, 340}, 300}, {{410, 420}, 400}});

    EXPECT_EQ(carriedBlack(), (Lines{"to 210..215 by 200", "to 315..320 by 300"}));
    EXPECT_TRUE(m_lost.empty());
}

TEST_F(BlackCarryingTest, TwiceTheChangeEventsTakeAboutTwiceTheTime)
{
    const auto secondsFor = [&](std::int32_t count) {
        m_carried = {};
        FrameRanges material;
        std::vector<ChangeStretch> changes;
        const std::int32_t shift = 2 * count;
        for (std::int32_t index = 0; index < count; ++index) {
            material.push_back({2 * index, 2 * index + 1});
            changes.push_back({material.back().shiftedBy(shift), shift});
        }
        const double seconds = secondsOf([&] { run({}, {{0, shift}}, material, changes); });
        EXPECT_EQ(m_carried.stretches().size(), static_cast<std::size_t>(count));
        EXPECT_TRUE(m_lost.empty());
        return seconds;
    };

    // With 86,400 frames in this day, there is room for 20,000 pieces at both places.
    const double few = std::max(secondsFor(2500), 0.002);
    EXPECT_LT(secondsFor(20000), 24 * few);
}

} // namespace cadrel::tests
