// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::gui {

/// The tick box of a sheet. The space bar ticks it, and Return goes on to the sheet.
class TickBox : public juce::ToggleButton {
public:
    TickBox(const juce::String& name, const juce::String& label);

    bool keyPressed(const juce::KeyPress& key) override;
};

} // namespace cadrel::gui
