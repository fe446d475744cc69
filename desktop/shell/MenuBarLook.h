// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

namespace desktop {

/// A dark menu bar that goes with Cadrel's window. The menus themselves look as they do there.
class MenuBarLook : public juce::LookAndFeel_V2 {
public:
    void drawMenuBarBackground(juce::Graphics& graphics, int width, int height, bool isMouseOver,
                               juce::MenuBarComponent& bar) override;
    int getMenuBarItemWidth(juce::MenuBarComponent& bar, int index, const juce::String& text) override;
    void drawMenuBarItem(juce::Graphics& graphics, int width, int height, int index, const juce::String& text,
                         bool isMouseOver, bool isOpen, bool isMouseOverBar, juce::MenuBarComponent& bar) override;
};

} // namespace desktop
