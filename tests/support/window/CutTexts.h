// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

#include <string>
#include <vector>

namespace cadrel::tests {

/// The texts of labels and text buttons of a component that are wider than their room, those of hidden ones too.
inline std::vector<std::string> cutTextsOf(const juce::Component& parent)
{
    std::vector<std::string> cut;
    for (juce::Component* const component : parent.getChildren()) {
        juce::String text;
        float width = 0.0F;
        float room = 0.0F;
        if (const auto* const label = dynamic_cast<const juce::Label*>(component)) {
            text = label->getText();
            width = label->getFont().getStringWidthFloat(text);
            room = static_cast<float>(label->getWidth() - label->getBorderSize().getLeftAndRight());
        } else if (auto* const button = dynamic_cast<juce::TextButton*>(component)) {
            text = button->getButtonText();
            width = button->getLookAndFeel().getTextButtonFont(*button, button->getHeight()).getStringWidthFloat(text);
            room = static_cast<float>(button->getWidth() - 8);
        }
        if (width > room)
            cut.push_back(text.toStdString());
    }
    return cut;
}

} // namespace cadrel::tests
