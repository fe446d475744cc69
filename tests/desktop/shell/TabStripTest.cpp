// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/TabStrip.h"

#include "gui/look/LookAndFeel.h"
#include "tests/support/window/FocusedWindow.h"
#include "tests/support/x11/VirtualScreen.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

namespace desktop::tests {
namespace {

TEST(TabStrip, TellsWhichDocumentIsMeantAndNotWhereItsTabStands)
{
    const cadrel::tests::NoScreen noScreen;
    const juce::ScopedJuceInitialiser_GUI juce;
    const juce::SharedResourcePointer<cadrel::gui::LookAndFeel> look;
    cadrel::tests::FocusedWindow window(800, 100);
    TabStrip strip;
    window.addAndMakeVisible(strip);
    strip.setBounds(0, 0, 800, TabStrip::Height);
    std::vector<std::uint64_t> chosen;
    std::vector<std::uint64_t> closed;
    strip.onChosen = [&](std::uint64_t id) { chosen.push_back(id); };
    strip.onClosed = [&](std::uint64_t id) { closed.push_back(id); };
    strip.setTabs({{7, "a", "/a"}, {3, "b", "/b"}}, 0);

    window.click(strip.tabArea(1).getCentre());
    window.click(strip.crossArea(0).getCentre());
    window.click(juce::Point<int>(790, 10));

    EXPECT_EQ(chosen, std::vector<std::uint64_t>{3});
    EXPECT_EQ(closed, std::vector<std::uint64_t>{7});
}

TEST(TabStrip, KnowsTheTabsBesideTheActiveOneRoundAndRound)
{
    const juce::ScopedJuceInitialiser_GUI juce;
    TabStrip strip;
    EXPECT_FALSE(strip.tabAfter(1));
    strip.setTabs({{7, "a", "", false}, {8, "b", "", false}, {9, "c", "", false}}, 2);
    EXPECT_EQ(strip.tabAfter(1), 7U);
    EXPECT_EQ(strip.tabAfter(-1), 8U);
    strip.setTabs({{7, "a", "", false}, {8, "b", "", false}}, 0);
    EXPECT_EQ(strip.tabAfter(-1), 8U);
    strip.setTabs({{7, "a", "", false}}, 0);
    EXPECT_EQ(strip.tabAfter(1), 7U);
}

} // namespace
} // namespace desktop::tests
