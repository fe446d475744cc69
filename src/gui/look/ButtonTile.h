// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::gui {

/// The body of a button: black, with a rounded inner field that shades from top to bottom. That of a disabled button is flat and
/// dark.
struct ButtonTile {
    juce::Colour top;
    juce::Colour bottom;
    bool isEnabled = true;
    bool isBeneath = false; ///< all around it is disabled, too
    bool hasFocus = false;  ///< a ring inside of the edge
    bool isOn = false;      ///< a dark bar at the lower edge, for those who can't tell the colours apart

    /// The tile of a button that is neither on nor pressed.
    static ButtonTile normal();
    /// Shades from the colour to the same darkened.
    static ButtonTile lit(juce::Colour colour);

    void draw(juce::Graphics& graphics, juce::Rectangle<float> area) const;
};

/// How much of the colour is left where a control is disabled.
inline constexpr float DisabledOpacity = 0.5F;
/// 1 for what is enabled.
inline float opacityOf(const juce::Component& component)
{
    return component.isEnabled() ? 1.0F : DisabledOpacity;
}
/// The text or picture of a disabled button. It can still be read, but not where all around it is disabled, too, as beneath a
/// sheet: it must not stand out there.
juce::Colour disabledInk(bool isBeneath);
/// Whether all around a component is disabled.
inline bool isBeneath(const juce::Component& component)
{
    const juce::Component* const parent = component.getParentComponent();
    return parent && !parent->isEnabled();
}
/// What lies over a disabled input.
inline constexpr juce::uint32 DisabledShade = 0x82606060;
/// How much darker the lower end of a lit tile is, and the dimmed phase of a flashing button.
inline constexpr float Darkening = 0.4F;

/// Marks what has the keyboard focus.
void drawFocusRing(juce::Graphics& graphics, juce::Rectangle<float> area, float cornerSize);

} // namespace cadrel::gui
