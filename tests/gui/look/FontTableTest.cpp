// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/FontTable.h"

#include "tests/support/ThrownResult.h"

#include <gtest/gtest.h>

using cadrel::gui::FontStyle;
using cadrel::gui::fontStyle;
using cadrel::tests::thrownBy;
using cadrel::util::Result;

TEST(FontTable, HasThirteenFonts)
{
    const FontStyle plain14{false, 14.0F};
    const FontStyle bold14{true, 14.0F};
    const FontStyle plain12{false, 12.0F};
    const FontStyle bold12{true, 12.0F};
    const FontStyle bold16{true, 16.0F};

    EXPECT_EQ(fontStyle(0), plain14);
    EXPECT_EQ(fontStyle(1), bold14);
    EXPECT_EQ(fontStyle(2), bold12);
    EXPECT_EQ(fontStyle(3), bold14);
    EXPECT_EQ(fontStyle(4), plain12);
    EXPECT_EQ(fontStyle(5), plain12);
    EXPECT_EQ(fontStyle(6), bold12);
    EXPECT_EQ(fontStyle(7), plain12);
    EXPECT_EQ(fontStyle(9), bold16);
    EXPECT_EQ(fontStyle(10), plain14);
    EXPECT_EQ(fontStyle(11), bold14);
    EXPECT_EQ(fontStyle(12), plain14);
    EXPECT_EQ(fontStyle(13), bold14);
}

TEST(FontTable, HasNoFontOfIndexEight)
{
    EXPECT_EQ(thrownBy([] { fontStyle(8); }), Result::InvalidArgument);
}

TEST(FontTable, HasNoFontOutsideOfTheTable)
{
    for (const int index : {-1, 14, 15, 1000})
        EXPECT_EQ(thrownBy([&] { fontStyle(index); }), Result::InvalidArgument) << index;
}
