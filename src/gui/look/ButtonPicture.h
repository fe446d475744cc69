// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::gui {

/// The pictures of the buttons: dark symbols on tiles, all drawn as paths, so that they are sharp at any size.
class ButtonPicture {
public:
    enum class Symbol { Plus, Bin, Cog, Floppy, Folder, Up, Down, In, Out };
    struct State {
        bool isPressed = false;
        bool isEnabled = true;
        bool hasFocus = false;
        bool isBeneath = false; ///< all around it is disabled, too
    };

    explicit ButtonPicture(Symbol symbol);

    /// In the middle of the area, as large as it fits with its proportions kept.
    void draw(juce::Graphics& graphics, juce::Rectangle<int> area, State state) const;

    /// The size that the symbol is drawn for, in pixels.
    juce::Rectangle<float> bounds() const { return m_bounds; }
    const juce::Path& path() const { return m_path; }

private:
    juce::Rectangle<float> m_bounds;
    juce::Path m_path; ///< within the bounds
};

} // namespace cadrel::gui
