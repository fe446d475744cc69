// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/sheet/TickBox.h"

namespace cadrel::gui {

namespace {

const juce::Colour TextColour(0xff2e352f);

} // namespace

TickBox::TickBox(const juce::String& name, const juce::String& label)
{
    setName(name);
    setButtonText(label);
    setColour(textColourId, TextColour);
}

bool TickBox::keyPressed(const juce::KeyPress& key)
{
    if (!isEnabled() || !key.isKeyCode(juce::KeyPress::spaceKey))
        return false;
    triggerClick();
    return true;
}

} // namespace cadrel::gui
