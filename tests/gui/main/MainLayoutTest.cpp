// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/MainLayout.h"

#include "core/edl/EventList.h"
#include "tests/support/ThrownResult.h"
#include "util/Result.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <array>
#include <ostream>
#include <vector>

namespace cadrel::gui {

inline std::ostream& operator<<(std::ostream& stream, const MainLayout::Box& box)
{
    return stream << box.x << ", " << box.y << ", " << box.width << " x " << box.height;
}

inline std::ostream& operator<<(std::ostream& stream, const MainLayout::Area& area)
{
    return stream << area.x << ", " << area.y << ", " << area.width << " x " << area.height;
}

} // namespace cadrel::gui

namespace cadrel::tests {
namespace {

using core::ListKind;
using gui::MainButton;
using gui::MainLayout;
using util::Result;
using Box = MainLayout::Box;
using Area = MainLayout::Area;

/// A window of the least size, one with odd sides, and a large one.
const MainLayout Least(1300, 750);
const MainLayout Odd(1701, 901);
const MainLayout Large(2560, 1440);

/// One line of the table: where something stands in each of the three windows.
struct Places {
    MainButton button;
    Box least;
    Box odd;
    Box large;
};

const std::vector<Places> Buttons{
    {MainButton::AddOld, {15, 34, 32, 24}, {15, 34, 32, 24}, {15, 34, 32, 24}},
    {MainButton::ClearOld, {607, 34, 32, 24}, {807, 34, 32, 24}, {1237, 34, 32, 24}},
    {MainButton::AddNew, {661, 34, 32, 24}, {861, 34, 32, 24}, {1291, 34, 32, 24}},
    {MainButton::ClearNew, {1253, 34, 32, 24}, {1654, 34, 32, 24}, {2513, 34, 32, 24}},
    {MainButton::Generate, {610, 333, 80, 24}, {810, 408, 80, 24}, {1240, 678, 80, 24}},
    {MainButton::AddChange, {15, 390, 32, 24}, {15, 465, 32, 24}, {15, 735, 32, 24}},
    {MainButton::Save, {55, 390, 32, 24}, {55, 465, 32, 24}, {55, 735, 32, 24}},
    {MainButton::ClearChange, {120, 390, 32, 24}, {120, 465, 32, 24}, {120, 735, 32, 24}},
    {MainButton::Preview, {896, 390, 90, 24}, {1297, 465, 90, 24}, {2156, 735, 90, 24}},
    {MainButton::Source, {993, 390, 40, 24}, {1394, 465, 40, 24}, {2253, 735, 40, 24}},
    {MainButton::Destination, {1031, 390, 40, 24}, {1432, 465, 40, 24}, {2291, 735, 40, 24}},
    {MainButton::Videos, {1099, 391, 32, 24}, {1500, 466, 32, 24}, {2359, 736, 32, 24}},
    {MainButton::In, {1207, 390, 40, 24}, {1608, 465, 40, 24}, {2467, 735, 40, 24}},
    {MainButton::Out, {1245, 390, 40, 24}, {1646, 465, 40, 24}, {2505, 735, 40, 24}},
    {MainButton::Settings, {7, 718, 32, 24}, {7, 869, 32, 24}, {7, 1408, 32, 24}},
    {MainButton::Start, {1136, 718, 112, 24}, {1537, 869, 112, 24}, {2396, 1408, 112, 24}},
};

TEST(MainLayout, PlacesEveryButton)
{
    ASSERT_EQ(Buttons.size(), gui::MainButtonCount);
    for (const Places& places : Buttons) {
        SCOPED_TRACE(static_cast<int>(places.button));
        EXPECT_EQ(Least.button(places.button), places.least);
        EXPECT_EQ(Odd.button(places.button), places.odd);
        EXPECT_EQ(Large.button(places.button), places.large);
    }
}

TEST(MainLayout, PlacesTheTables)
{
    EXPECT_EQ(Least.table(ListKind::Old), (Box{18, 73, 614, 222}));
    EXPECT_EQ(Least.table(ListKind::New), (Box{668, 73, 614, 222}));
    EXPECT_EQ(Least.table(ListKind::Change), (Box{18, 430, 1056, 150}));
    EXPECT_EQ(Odd.table(ListKind::Old), (Box{18, 73, 814, 297}));
    EXPECT_EQ(Odd.table(ListKind::New), (Box{868, 73, 814, 297}));
    EXPECT_EQ(Odd.table(ListKind::Change), (Box{18, 505, 1457, 225}));
    EXPECT_EQ(Large.table(ListKind::Old), (Box{18, 73, 1244, 567}));
    EXPECT_EQ(Large.table(ListKind::New), (Box{1298, 73, 1244, 567}));
    EXPECT_EQ(Large.table(ListKind::Change), (Box{18, 775, 2316, 495}));
}

TEST(MainLayout, PlacesTimelineAndVideo)
{
    EXPECT_EQ(Least.timeline(), (Box{18, 620, 1056, 80}));
    EXPECT_EQ(Odd.timeline(), (Box{18, 771, 1457, 80}));
    EXPECT_EQ(Large.timeline(), (Box{18, 1310, 2316, 80}));
    EXPECT_EQ(Least.video(), (Box{1090, 363, 204, 349}));
    EXPECT_EQ(Odd.video(), (Box{1491, 438, 204, 424}));
    EXPECT_EQ(Large.video(), (Box{2350, 708, 204, 694}));
}

TEST(MainLayout, PlacesTheCountersInARow)
{
    const std::array<MainLayout::CounterText, 3> texts{{{30, 8}, {50, 8}, {40, 8}}};

    const MainLayout::Counters row = Least.counters(ListKind::Old, texts);

    EXPECT_EQ(row[0].label, (Box{22, 296, 62, 24}));
    EXPECT_EQ(row[0].value, (Box{54, 296, 40, 24}));
    EXPECT_EQ(row[1].label, (Box{144, 296, 82, 24}));
    EXPECT_EQ(row[1].value, (Box{196, 296, 40, 24}));
    EXPECT_EQ(row[2].label, (Box{286, 296, 72, 24}));
    EXPECT_EQ(row[2].value, (Box{328, 296, 40, 24}));
}

TEST(MainLayout, BeginsTheRowsOfCountersBelowTheirTables)
{
    const std::array<MainLayout::CounterText, 3> texts{{{30, 8}, {50, 8}, {40, 8}}};
    const auto start = [&](const MainLayout& layout, std::int32_t kind) {
        const Box label = layout.counters(kind, texts)[0].label;
        return std::pair(label.x, label.y);
    };

    EXPECT_EQ(start(Least, ListKind::New), std::pair(669, 296));
    EXPECT_EQ(start(Least, ListKind::Change), std::pair(22, 581));
    EXPECT_EQ(start(Odd, ListKind::Old), std::pair(22, 371));
    EXPECT_EQ(start(Odd, ListKind::New), std::pair(869, 371));
    EXPECT_EQ(start(Odd, ListKind::Change), std::pair(22, 732));
    EXPECT_EQ(start(Large, ListKind::Old), std::pair(22, 641));
    EXPECT_EQ(start(Large, ListKind::New), std::pair(1299, 641));
    EXPECT_EQ(start(Large, ListKind::Change), std::pair(22, 1271));
}

TEST(MainLayout, MakesAValueWiderThanUsualOnlyForAWiderText)
{
    const auto valueWidth = [](int text) {
        return Least.counters(ListKind::Old, {{{30, text}, {50, 8}, {40, 8}}})[0].value.width;
    };

    EXPECT_EQ(valueWidth(23), 40);
    EXPECT_EQ(valueWidth(24), 40);
    EXPECT_EQ(valueWidth(25), 41);
    EXPECT_EQ(Least.counters(ListKind::Old, {{{30, 54}, {50, 8}, {40, 8}}})[1].label.x, 54 + 70 + 50);
}

TEST(MainLayout, DrawsThePanelsOfTheLists)
{
    EXPECT_EQ(Least.panel(ListKind::Old), (Area{8, 8, 638, 317}));
    EXPECT_EQ(Least.panel(ListKind::New), (Area{654, 8, 638, 317}));
    EXPECT_EQ(Least.panel(ListKind::Change), (Area{8, 365, 1076, 345}));
    EXPECT_EQ(Odd.panel(ListKind::Old), (Area{8, 8, 838.5F, 392.5F}));
    EXPECT_EQ(Odd.panel(ListKind::New), (Area{854.5F, 8, 838.5F, 392.5F}));
    EXPECT_EQ(Odd.panel(ListKind::Change), (Area{8, 440.5F, 1477, 420.5F}));
    EXPECT_EQ(Large.panel(ListKind::Change), (Area{8, 710, 2336, 690}));
}

TEST(MainLayout, DrawsTheTitlesOfTheLists)
{
    EXPECT_EQ(Least.title(ListKind::Old), (Area{225, 8, 200, 20}));
    EXPECT_EQ(Least.title(ListKind::New), (Area{875, 8, 200, 20}));
    EXPECT_EQ(Least.title(ListKind::Change), (Area{20, 365, 1040, 20}));
    EXPECT_EQ(Odd.title(ListKind::Old), (Area{325.25F, 8, 200, 20}));
    EXPECT_EQ(Odd.title(ListKind::New), (Area{1175.75F, 8, 200, 20}));
    EXPECT_EQ(Odd.title(ListKind::Change), (Area{20, 440.5F, 1441, 20}));
    EXPECT_EQ(Large.title(ListKind::New), (Area{1820, 8, 200, 20}));
}

TEST(MainLayout, DrawsTheBandsOfTheListsAndTheRuleAboveTheTimeline)
{
    EXPECT_EQ(Least.band(ListKind::Old), (Area{9, 28, 636, 35}));
    EXPECT_EQ(Least.band(ListKind::New), (Area{655, 28, 636, 35}));
    EXPECT_EQ(Least.band(ListKind::Change), (Area{9, 385, 1074, 35}));
    EXPECT_EQ(Odd.band(ListKind::Old), (Area{9, 28, 836.5F, 35}));
    EXPECT_EQ(Odd.band(ListKind::New), (Area{855.5F, 28, 836.5F, 35}));
    EXPECT_EQ(Odd.band(ListKind::Change), (Area{9, 460.5F, 1475, 35}));
    EXPECT_EQ(Least.rule().left, 8.0F);
    EXPECT_EQ(Least.rule().right, 1084.0F);
    EXPECT_EQ(Least.rule().y, 610.0F);
    EXPECT_EQ(Odd.rule().right, 1485.0F);
    EXPECT_EQ(Odd.rule().y, 761.0F);
}

TEST(MainLayout, KnowsNoFourthList)
{
    EXPECT_EQ(thrownBy([] { Least.table(3); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([] { Least.panel(-1); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([] { Least.title(3); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([] { Least.band(3); }), Result::InvalidArgument);
}

TEST(MainLayout, PutsABoxAfterTheMouseAsLongAsItFitsThere)
{
    EXPECT_EQ(MainLayout::besideMouse(100, 300, 1300), 110);
    EXPECT_EQ(MainLayout::besideMouse(989, 300, 1300), 999);
    EXPECT_EQ(MainLayout::besideMouse(990, 300, 1300), 990);
    EXPECT_EQ(MainLayout::besideMouse(1299, 300, 1300), 990);
}

RC_GTEST_PROP(MainLayoutLaw, KeepsEveryButtonInTheWindow, ())
{
    const int width = *rc::gen::inRange(1300, 8000);
    const int height = *rc::gen::inRange(750, 5000);
    const MainLayout layout(width, height);

    for (std::size_t index = 0; index < gui::MainButtonCount; ++index) {
        const Box box = layout.button(static_cast<MainButton>(index));
        RC_ASSERT(box.x >= 0 && box.y >= 0 && box.x + box.width <= width && box.y + box.height <= height);
    }
}

} // namespace
} // namespace cadrel::tests
