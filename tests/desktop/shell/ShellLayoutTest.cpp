// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/ShellLayout.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

namespace desktop::tests {
namespace {

/// Menu bar and tabs take 54 pixels, the divider 7.
constexpr int Rest = 61;

TEST(ShellLayout, GivesTheModuleTheHeightThatItWantsAndTheTracksWhatIsLeft)
{
    const ShellLayout layout = ShellLayout::of(Rest + 300 + 750, -1);
    EXPECT_EQ(layout.tracksTop, 54);
    EXPECT_EQ(layout.tracksHeight, 300);
    EXPECT_EQ(layout.dividerTop, 354);
    EXPECT_EQ(layout.moduleTop, 361);
    EXPECT_EQ(layout.moduleHeight, 750);
}

TEST(ShellLayout, KeepsSomeTracksInSightOnASmallScreen)
{
    EXPECT_EQ(ShellLayout::of(Rest + 261 + 750, -1).tracksHeight, 261);
    // A quarter, while that is less than 260.
    EXPECT_EQ(ShellLayout::of(Rest + 1000, -1).tracksHeight, 250);
    EXPECT_EQ(ShellLayout::of(Rest + 600, -1).tracksHeight, 150);
    EXPECT_EQ(ShellLayout::of(Rest + 600, -1).moduleHeight, 450);
    EXPECT_EQ(ShellLayout::of(Rest + 476, -1).tracksHeight, 120) << "The tracks have 120 at least.";
    EXPECT_EQ(ShellLayout::of(Rest + 300, -1).tracksHeight, 120);
    EXPECT_EQ(ShellLayout::of(Rest + 300, -1).moduleHeight, 180);
}

TEST(ShellLayout, FollowsTheUserAsFarAsBothStayUsable)
{
    EXPECT_EQ(ShellLayout::of(Rest + 1000, 500).tracksHeight, 500);
    EXPECT_EQ(ShellLayout::of(Rest + 1000, 0).tracksHeight, 120);
    EXPECT_EQ(ShellLayout::of(Rest + 1000, 800).tracksHeight, 800);
    EXPECT_EQ(ShellLayout::of(Rest + 1000, 801).tracksHeight, 800);
}

RC_GTEST_PROP(ShellLayout, FillsTheWindowWithoutOverlap, ())
{
    const int height = *rc::gen::inRange(0, 5000);
    const ShellLayout layout = ShellLayout::of(height, *rc::gen::inRange(-1, 6000));
    RC_ASSERT(layout.tracksHeight >= 0);
    RC_ASSERT(layout.moduleHeight >= 0);
    RC_ASSERT(layout.dividerTop == layout.tracksTop + layout.tracksHeight);
    RC_ASSERT(layout.moduleTop == layout.dividerTop + ShellLayout::DividerHeight);
    if (height >= Rest)
        RC_ASSERT(layout.moduleTop + layout.moduleHeight == height);
}

} // namespace
} // namespace desktop::tests
