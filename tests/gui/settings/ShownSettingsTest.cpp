// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/settings/ShownSettings.h"

#include "core/settings/Settings.h"
#include "gui/settings/SettingsEntries.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cmath>
#include <limits>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::Settings;
using core::Timecode;
using core::VfxPatternEntry;
using gui::FrameRange;
using gui::frameRangeFor;
using gui::itemIdFor;
using gui::Preserved;
using gui::SignedTimecode;

std::string shown(double seconds)
{
    const SignedTimecode time = gui::shownTime(seconds);
    std::string text(1, time.isPositive ? '+' : '-');
    return text += time.amount.toString();
}

double secondsOf(const char* amount, bool isPositive)
{
    return SignedTimecode{Timecode(amount), isPositive}.seconds();
}

constexpr double Infinity = std::numeric_limits<double>::infinity();

} // namespace

TEST(ShownFrames, AreThoseThatTheCommandTakesToo)
{
    EXPECT_EQ(frameRangeFor(0), (FrameRange{0, 10000}));
    EXPECT_EQ(frameRangeFor(5), (FrameRange{0, 10000}));
    EXPECT_EQ(frameRangeFor(10000), (FrameRange{0, 10000}));
}

TEST(ShownFrames, ReachToAStoredNumberOutsideOfThem)
{
    EXPECT_EQ(frameRangeFor(10001), (FrameRange{0, 10001}));
    EXPECT_EQ(frameRangeFor(-1), (FrameRange{-1, 10000}));
    EXPECT_EQ(frameRangeFor(std::numeric_limits<std::int32_t>::max()), (FrameRange{0, 2147483647}));
    EXPECT_EQ(frameRangeFor(std::numeric_limits<std::int32_t>::min()), (FrameRange{-2147483647 - 1, 10000}));
}

TEST(ShownChoice, HasAnItemForEachNumberAndNoneForOthers)
{
    EXPECT_EQ(itemIdFor(-1, 4), 0);
    EXPECT_EQ(itemIdFor(0, 4), 1);
    EXPECT_EQ(itemIdFor(3, 4), 4);
    EXPECT_EQ(itemIdFor(4, 4), 0);
    EXPECT_EQ(itemIdFor(std::numeric_limits<std::int32_t>::max(), 4), 0);
}

TEST(ShownTime, IsAWholeFrameWithItsSign)
{
    const TestProject project;

    EXPECT_EQ(shown(0.0), "+00:00:00:00");
    EXPECT_EQ(shown(3600.0), "+01:00:00:00");
    EXPECT_EQ(shown(-10.04), "-00:00:10:01");
    // Half a frame of 0.04 seconds rounds up.
    EXPECT_EQ(shown(0.019), "+00:00:00:00");
    EXPECT_EQ(shown(0.02), "+00:00:00:01");
}

TEST(ShownTime, StaysWithinADayOnEitherSide)
{
    const TestProject project;

    EXPECT_EQ(shown(86399.96), "+23:59:59:24");
    EXPECT_EQ(shown(86399.99), "+23:59:59:24");
    EXPECT_EQ(shown(86400.0), "+23:59:59:24");
    EXPECT_EQ(shown(-86400.0), "-23:59:59:24");
    EXPECT_EQ(shown(1e300), "+23:59:59:24");
    EXPECT_EQ(shown(Infinity), "+23:59:59:24");
    EXPECT_EQ(shown(-Infinity), "-23:59:59:24");
}

TEST(ShownTime, IsZeroForNoNumberAndWithoutAProject)
{
    {
        const TestProject project;
        EXPECT_EQ(shown(std::numeric_limits<double>::quiet_NaN()), "+00:00:00:00");
    }
    const NoProject none;
    EXPECT_EQ(shown(10.0), "+00:00:00:00");
    EXPECT_EQ(secondsOf("00:00:10:00", true), 0.0);
}

TEST(ShownTime, IsZeroWhileTheRateIsUnknown)
{
    TestProject project;
    project.framerate.dropFrame = -1;

    EXPECT_EQ(shown(10.0), "+00:00:00:00");
}

TEST(ShownTime, HasTheLastFrameOfADropFrameDay)
{
    const TestProject project(core::Framerate(30, true, 1));

    EXPECT_EQ(shown(1e6), "+23:59:59:29");
}

TEST(EnteredTime, HasItsSign)
{
    const TestProject project;

    EXPECT_EQ(secondsOf("00:00:10:01", true), 10.04);
    EXPECT_EQ(secondsOf("00:00:10:01", false), -10.04);
    EXPECT_EQ(secondsOf("00:00:00:00", false), 0.0);
    EXPECT_FALSE(std::signbit(secondsOf("00:00:00:00", false)));
}

TEST(EnteredTime, IsZeroWhereTheRateDoesNotHaveIt)
{
    const TestProject project;

    EXPECT_EQ(secondsOf("00:00:10:25", true), 0.0);
}

RC_GTEST_PROP(ShownTimeLaws, AFrameIsShownAsItWasEntered, ())
{
    const TestProject project(
        *rc::gen::elementOf(std::vector{core::Framerate(24, 0), core::Framerate(25, 0), core::Framerate(30, true, 1)}));
    Timecode amount;
    amount.setFrameCount(*rc::gen::inRange(1, Timecode::maxTimecode().toFrameCount() + 1));
    const bool isPositive = *rc::gen::arbitrary<bool>();

    const SignedTimecode again = gui::shownTime(SignedTimecode{amount, isPositive}.seconds());

    RC_ASSERT(again.amount == amount);
    RC_ASSERT(again.isPositive == isPositive);
}

TEST(PreservedTimes, StayWhereTheyAreInOrder)
{
    const Preserved same = Preserved{5.0, 5.0}.inOrder(Preserved::Edited::Before);
    EXPECT_EQ(same.before, 5.0);
    EXPECT_EQ(same.after, 5.0);
    const Preserved apart = Preserved{-7.0, 5.0}.inOrder(Preserved::Edited::After);
    EXPECT_EQ(apart.before, -7.0);
    EXPECT_EQ(apart.after, 5.0);
}

TEST(PreservedTimes, FollowTheOneThatWasEdited)
{
    const Preserved before = Preserved{6.0, 5.0}.inOrder(Preserved::Edited::Before);
    EXPECT_EQ(before.before, 6.0);
    EXPECT_EQ(before.after, 6.0);
    const Preserved after = Preserved{6.0, 5.0}.inOrder(Preserved::Edited::After);
    EXPECT_EQ(after.before, 5.0);
    EXPECT_EQ(after.after, 5.0);
}

TEST(VfxRows, AreEmptyWhereTheyAreNotThereAndAreAdded)
{
    Settings settings;
    settings.set(&Settings::vfxPatterns, {VfxPatternEntry("VFX_", "_v", true)});

    EXPECT_EQ(gui::vfxRow(settings, 0), VfxPatternEntry("VFX_", "_v", true));
    EXPECT_EQ(gui::vfxRow(settings, 2), VfxPatternEntry());
    gui::setVfxRow(settings, VfxPatternEntry("X", "", false), 1);

    ASSERT_EQ(settings.vfxPatterns().size(), 3U);
    EXPECT_EQ(settings.vfxPattern(0), VfxPatternEntry("VFX_", "_v", true));
    EXPECT_EQ(settings.vfxPattern(1), VfxPatternEntry("X", "", false));
    EXPECT_EQ(settings.vfxPattern(2), VfxPatternEntry());
}

TEST(VfxRows, KeepWhatIsAfterTheThird)
{
    Settings settings;
    settings.set(&Settings::vfxPatterns, std::vector<VfxPatternEntry>(4, VfxPatternEntry("A", "B", true)));

    gui::setVfxRow(settings, VfxPatternEntry("X", "", false), 2);

    ASSERT_EQ(settings.vfxPatterns().size(), 4U);
    EXPECT_EQ(settings.vfxPattern(3), VfxPatternEntry("A", "B", true));
}

TEST(VfxRows, RefuseWhatDoesNotCompile)
{
    EXPECT_FALSE(gui::isRefused(""));
    EXPECT_FALSE(gui::isRefused(".*-_AZaz09"));
    for (const char* const text : {" ", "A/B", "caf\xc3\xa9", "\xff", "A\n", "(", "\\"})
        EXPECT_TRUE(gui::isRefused(text)) << text;
}

TEST(SettingsEntries, OfferEachOptionOnce)
{
    const Settings usual;
    for (const gui::SwitchEntry& entry : gui::switchEntries()) {
        for (const gui::SwitchEntry& other : gui::switchEntries())
            EXPECT_EQ(entry.option == other.option, &entry == &other) << entry.name;
    }
    EXPECT_EQ(gui::switchEntries().size(), 10U);
    for (const gui::ChoiceEntry& entry : gui::choiceEntries())
        EXPECT_GT(itemIdFor((usual.*entry.option)(), entry.items.size()), 0) << entry.name;
}

TEST(SettingsEntries, AreInTheOrderOfTheirPlaces)
{
    int last = 1000;
    for (const gui::SwitchEntry& entry : gui::switchEntries()) {
        EXPECT_LT(entry.fromBottom, last) << entry.name;
        last = entry.fromBottom;
    }
}

} // namespace cadrel::tests
