// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/look/Text.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <algorithm>
#include <string>
#include <vector>

namespace cadrel::tests {

/// The text of a label or button where it is wider than its room; nothing where it isn't.
inline std::string cutTextOf(juce::Component& component)
{
    juce::String text;
    juce::Font font;
    auto room = static_cast<float>(component.getWidth());
    auto& look = component.getLookAndFeel();
    if (auto* const label = dynamic_cast<juce::Label*>(&component)) {
        text = label->getText();
        font = look.getLabelFont(*label);
        room -= static_cast<float>(look.getLabelBorderSize(*label).getLeftAndRight());
    } else if (auto* const button = dynamic_cast<juce::TextButton*>(&component)) {
        text = button->getButtonText();
        font = look.getTextButtonFont(*button, button->getHeight());
        room -= 8.0F;
    } else if (auto* const toggle = dynamic_cast<juce::ToggleButton*>(&component)) {
        text = toggle->getButtonText();
        font = gui::getFont(0);
        // The tick box and the space after it.
        room -= 5.0F + 1.1F * std::min(15.0F, 0.75F * static_cast<float>(toggle->getHeight()));
    }
    return font.getStringWidthFloat(text) > room ? text.toStdString() : std::string();
}

/// The texts in a component that are wider than their room, those of hidden components too.
inline std::vector<std::string> cutTextsOf(const juce::Component& parent)
{
    std::vector<std::string> cut;
    for (juce::Component* const component : parent.getChildren()) {
        if (const std::string text = cutTextOf(*component); !text.empty())
            cut.push_back(text);
        const std::vector<std::string> inner = cutTextsOf(*component);
        cut.insert(cut.end(), inner.begin(), inner.end());
    }
    return cut;
}

} // namespace cadrel::tests
