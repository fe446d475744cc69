// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/sheet/SheetLabel.h"

#include "gui/look/Text.h"

namespace cadrel::gui {

SheetLabel::SheetLabel(const juce::String& name, const std::wstring& label, int fontIndex)
    : Label(name, translatedText(label))
{
    setFont(gui::getFont(fontIndex));
    setJustificationType(juce::Justification::centredLeft);
    setColour(textColourId, juce::Colours::black);
    setColour(backgroundColourId, juce::Colours::transparentBlack);
}

SheetRule::SheetRule(const juce::String& name) : Label(name)
{
    setColour(backgroundColourId, juce::Colours::black);
    setAccessible(false);
}

} // namespace cadrel::gui
