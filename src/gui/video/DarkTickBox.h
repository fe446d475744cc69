// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/look/Text.h"
#include "gui/sheet/TickBox.h"

namespace cadrel::gui {

/// A tick box on a black ground.
class DarkTickBox : public TickBox {
public:
    explicit DarkTickBox(const juce::String& name) : TickBox(name, {})
    {
        setColour(tickDisabledColourId, toColour(Palette::band));
        setColour(tickColourId, juce::Colours::white);
    }
};

} // namespace cadrel::gui
