// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/window/CutTexts.h"

#include "gui/look/LookAndFeel.h"

#include <gtest/gtest.h>

using cadrel::tests::cutTextsOf;

TEST(CutTexts, AreFoundInEachKindOfControlAtEachDepth)
{
    const juce::ScopedJuceInitialiser_GUI juce;
    const cadrel::gui::LookAndFeel look;
    juce::Component window;
    juce::Component inner;
    window.addAndMakeVisible(inner);
    juce::Label label({}, "label");
    juce::TextButton button("button");
    juce::ToggleButton toggle("toggle");
    for (juce::Component* const component : std::initializer_list<juce::Component*>{&label, &button, &toggle})
        inner.addAndMakeVisible(component);

    for (juce::Component* const component : inner.getChildren())
        component->setSize(100, 20);
    EXPECT_EQ(cutTextsOf(window), std::vector<std::string>{});
    for (juce::Component* const component : inner.getChildren())
        component->setSize(20, 20);
    EXPECT_EQ(cutTextsOf(window), (std::vector<std::string>{"label", "button", "toggle"}));
}
