// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/Palette.h"

#include <gtest/gtest.h>

using cadrel::gui::Palette;

TEST(Palette, HasItsColoursWithoutTransparency)
{
    EXPECT_EQ(Palette::red.argb, 0xffc81600U);
    EXPECT_EQ(Palette::darkRed.argb, 0xff640000U);
    EXPECT_EQ(Palette::green.argb, 0xff41c800U);
    EXPECT_EQ(Palette::darkGreen.argb, 0xff006400U);
    EXPECT_EQ(Palette::selection.argb, 0xff87c17aU);
    EXPECT_EQ(Palette::band.argb, 0xff565d63U);
    EXPECT_EQ(Palette::frame.argb, 0xff76787aU);
    EXPECT_EQ(Palette::panel.argb, 0xff171c24U);
    EXPECT_EQ(Palette::text.argb, 0xffc9d3dcU);
    EXPECT_EQ(Palette::eventBlue.argb, 0xff40688eU);
    EXPECT_EQ(Palette::eventTeal.argb, 0xff02a8a8U);
    EXPECT_EQ(Palette::light.argb, 0xffe7e8e9U);
    EXPECT_EQ(Palette::lightBlue.argb, 0xffa3ccffU);
    EXPECT_EQ(Palette::orange.argb, 0xffffad00U);
    EXPECT_EQ(Palette::highlight, Palette::selection);
}

TEST(Palette, HasAShadeAndAPanelForSheets)
{
    EXPECT_EQ(Palette::sheetShade.argb, 0x3a899593U);
    EXPECT_EQ(Palette::sheet.argb, 0xff899593U);
}
