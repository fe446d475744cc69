// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/RulerTicks.h"

#include "velmark/Project.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cmath>
#include <limits>

using desktop::ProjectClock;
using desktop::RulerTick;
using desktop::rulerTicks;
using desktop::TimeScale;
using Flag = Velmark::FrameRateInfo::Flag;

namespace {

constexpr double PullDown = 1000.0 / 1001.0;

/// `perSecond` pixels for a second, from `left` on.
TimeScale scaleOf(double perSecond, double left)
{
    TimeScale scale;
    scale.zoomBy(scale.secondsPerPixel() * perSecond, 0.0);
    scale.setLeft(left);
    return scale;
}

std::vector<std::string> labelsOf(const std::vector<RulerTick>& ticks)
{
    std::vector<std::string> labels;
    for (const RulerTick& tick : ticks) {
        if (!tick.label.empty())
            labels.push_back(tick.label);
    }
    return labels;
}

using Labels = std::vector<std::string>;

} // namespace

TEST(RulerTicks, HaveALabelAtEachFrameWhereThereIsRoom)
{
    const ProjectClock clock({25.0, 0}, 3600.0);
    const auto ticks = rulerTicks(clock, scaleOf(2500.0, -0.04), 290.0, 100.0);
    EXPECT_EQ(labelsOf(ticks), (Labels{"00:59:59:23", "00:59:59:24", "01:00:00:00", "01:00:00:01"}));
    EXPECT_NEAR(ticks[2].pixel, 100.0, 1e-6);
}

TEST(RulerTicks, HaveLabelsAtRoundSeconds)
{
    // 9 pixels a second: the first round step of at least 85 is ten seconds.
    const ProjectClock clock({24.0, 0}, 0.0);
    const auto ticks = rulerTicks(clock, scaleOf(9.0, 0.0), 200.0, 85.0);
    EXPECT_EQ(labelsOf(ticks), (Labels{"00:00:00:00", "00:00:10:00", "00:00:20:00"}));
    // The small lines are a second apart.
    EXPECT_NEAR(ticks[ticks.size() - 1].pixel - ticks[ticks.size() - 2].pixel, 9.0, 1e-6);
}

TEST(RulerTicks, HaveTheFirstFrameOfAMinuteInDropFrame)
{
    const ProjectClock clock({30.0 * PullDown, Flag::DropFrame | Flag::PulledDown}, 0.0);
    const auto ticks = rulerTicks(clock, scaleOf(2.0, 30.0), 400.0, 85.0);
    EXPECT_EQ(labelsOf(ticks), (Labels{"00:00:00;00", "00:01:00;02", "00:02:00;02", "00:03:00;02"}));
}

TEST(RulerTicks, HaveTheTimecodeOfTheNextDayInThePreview)
{
    const ProjectClock clock({24.0, 0}, 3600.0);
    const auto ticks = rulerTicks(clock, scaleOf(9.0, 86400.0), 180.0, 85.0);
    EXPECT_EQ(labelsOf(ticks), (Labels{"01:00:00:00", "01:00:10:00"}));
    EXPECT_NEAR(ticks.front().pixel, -81.0, 1e-3);
}

TEST(RulerTicks, AreNoneWhereNothingHasRoom)
{
    EXPECT_TRUE(rulerTicks(ProjectClock(), scaleOf(1e-6, 0.0), 1000.0, 1e9).empty());
}

RC_GTEST_PROP(RulerTicks, StandOnWholeFramesWithLabelsThatDoNotOverlap, ())
{
    struct Rate {
        double framesPerSecond;
        Velmark::uint32 flags;
    };
    const auto rate = *rc::gen::elementOf(std::vector<int>{0, 1, 2, 3, 4, 5, 6});
    const std::vector<Rate> rates{{24.0 * PullDown, Flag::PulledDown},
                                  {24.0, 0},
                                  {25.0, 0},
                                  {30.0 * PullDown, Flag::PulledDown},
                                  {30.0 * PullDown, Flag::PulledDown | Flag::DropFrame},
                                  {30.0, Flag::DropFrame},
                                  {60.0, 0}};
    const Rate& chosen = rates[static_cast<std::size_t>(rate)];
    const ProjectClock clock({chosen.framesPerSecond, chosen.flags}, *rc::gen::inRange(0, 86400));
    // From two days to a frame in a label, and from before the project to days after it.
    const double perSecond = std::pow(2.0, *rc::gen::inRange(-36, 36) / 3.0);
    const TimeScale scale = scaleOf(perSecond, *rc::gen::inRange(-100000, 300000) / 7.0);
    constexpr double Width = 1600.0;
    constexpr double LabelWidth = 84.0;
    const auto ticks = rulerTicks(clock, scale, Width, LabelWidth);

    RC_ASSERT(!ticks.empty());
    double lastLabel = -std::numeric_limits<double>::infinity();
    int labels = 0;
    for (std::size_t at = 0; at < ticks.size(); ++at) {
        const RulerTick& tick = ticks[at];
        RC_ASSERT(std::abs(scale.pixelAt(clock.secondsOf(tick.frame)) - tick.pixel) < 1e-6);
        RC_ASSERT(tick.pixel >= -LabelWidth && tick.pixel < Width);
        if (at > 0)
            RC_ASSERT(tick.frame > ticks[at - 1].frame);
        if (tick.label.empty())
            continue;
        RC_ASSERT(tick.label == clock.textOf(tick.frame));
        RC_ASSERT(tick.pixel - lastLabel >= LabelWidth - 1e-6);
        lastLabel = tick.pixel;
        ++labels;
    }
    RC_ASSERT(labels >= 2);
    RC_ASSERT(ticks.size() <= 400U);
}
