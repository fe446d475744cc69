// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/ProjectClock.h"

#include "velmark/Project.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

using desktop::ProjectClock;
using Flag = Velmark::FrameRateInfo::Flag;

namespace {

constexpr double PullDown = 1000.0 / 1001.0;

ProjectClock dropFrame(double origin = 0.0)
{
    return {{30.0 * PullDown, Flag::DropFrame | Flag::PulledDown}, origin};
}

} // namespace

TEST(ProjectClock, ShowsItsOriginAtTimeZero)
{
    const ProjectClock clock({25.0, 0}, 36000.0);
    EXPECT_EQ(clock.textOf(clock.frameAt(0.0)), "10:00:00:00");
    EXPECT_EQ(clock.textOf(clock.frameAt(1.5)), "10:00:01:12");
    EXPECT_EQ(clock.textOf(clock.frameAt(-0.04)), "09:59:59:24");
    EXPECT_NEAR(clock.secondsOf(clock.frameAt(1.5)), 1.48, 1e-9);
}

TEST(ProjectClock, TakesATimeThatIsAHairBeforeAFrameForTheFrame)
{
    const ProjectClock clock({24.0, 0}, 3600.0);
    EXPECT_EQ(clock.frameAt(1.0 - 1e-6), 3601 * 24);
    EXPECT_EQ(clock.frameAt(1.0 - 1e-5), 3601 * 24 - 1);
}

TEST(ProjectClock, LeavesOutTwoFramesOfMostMinutesInDropFrame)
{
    const ProjectClock clock = dropFrame();
    EXPECT_EQ(clock.textOf(1799), "00:00:59;29");
    EXPECT_EQ(clock.textOf(1800), "00:01:00;02");
    EXPECT_EQ(clock.textOf(17982), "00:10:00;00");
    EXPECT_EQ(clock.frameWith(60 * 30), 1800);
    EXPECT_EQ(clock.frameWith(60 * 30 + 1), 1800);
    EXPECT_EQ(clock.frameWith(60 * 30 + 2), 1800);
    EXPECT_EQ(clock.frameWith(60 * 30 + 3), 1801);
    EXPECT_EQ(clock.frameWith(600 * 30), 17982);
}

TEST(ProjectClock, CountsRealSecondsAtAPulledDownRate)
{
    const ProjectClock clock({24.0 * PullDown, Flag::PulledDown}, 0.0);
    EXPECT_EQ(clock.textOf(clock.frameAt(3603.6)), "01:00:00:00");
    EXPECT_NEAR(clock.secondsOfDay(), 86486.4, 1e-6);
}

TEST(ProjectClock, BeginsEachDayAnewAndHasDaysBeforeTheFirst)
{
    const ProjectClock clock({25.0, 0}, 3600.0);
    EXPECT_EQ(clock.dayOf(clock.frameAt(86400.0)), 1);
    EXPECT_EQ(clock.textOf(clock.frameAt(86400.0)), "01:00:00:00");
    EXPECT_EQ(clock.dayOf(clock.frameAt(-3600.04)), -1);
    EXPECT_EQ(clock.textOf(clock.frameAt(-3600.04)), "23:59:59:24");
}

TEST(ProjectClock, TakesARateThatCannotHaveDropFrameWithoutIt)
{
    const ProjectClock clock({24.0, Flag::DropFrame}, 0.0);
    EXPECT_FALSE(clock.isDropFrame());
    EXPECT_EQ(clock.nominalRate(), 24);
}

TEST(ProjectClock, TakesTwentyFourForWhatIsNoRate)
{
    for (const double rate : {0.0, -1.0, 1e9})
        EXPECT_EQ(ProjectClock({rate, 0}, 0.0).nominalRate(), 24);
}

RC_GTEST_PROP(ProjectClock, HasEachFrameUnderItsNumber, ())
{
    const ProjectClock clock = *rc::gen::element(ProjectClock({25.0, 0}, 0.0), dropFrame(3600.0));
    const std::int64_t frame = *rc::gen::inRange<std::int64_t>(-5000000, 10000000);
    RC_ASSERT(clock.frameWith(clock.numberOf(frame)) == frame);
}

RC_GTEST_PROP(ProjectClock, HasEachFrameWhereItBegins, ())
{
    const ProjectClock clock =
        *rc::gen::element(ProjectClock({24.0 * PullDown, Flag::PulledDown}, 3600.0), dropFrame(36000.0));
    const std::int64_t frame = *rc::gen::inRange<std::int64_t>(-5000000, 10000000);
    RC_ASSERT(clock.frameAt(clock.secondsOf(frame)) == frame);
}
