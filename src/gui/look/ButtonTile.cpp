// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/ButtonTile.h"

#include "gui/look/Text.h"

namespace cadrel::gui {

namespace {

constexpr float OuterCorner = 2.0F;
constexpr float InnerCorner = 1.5F;
/// The bar of a tile that is on, and how far it stays off the sides.
constexpr float BarHeight = 2.0F;
constexpr float BarInset = 4.0F;

} // namespace

ButtonTile ButtonTile::normal()
{
    return {juce::Colour(155, 159, 162), juce::Colour(116, 121, 125)};
}

ButtonTile ButtonTile::lit(juce::Colour colour)
{
    return {colour, colour.darker(Darkening)};
}

void ButtonTile::draw(juce::Graphics& graphics, juce::Rectangle<float> area) const
{
    const juce::Rectangle<float> inner = area.reduced(1.0F);
    if (isEnabled) {
        graphics.setColour(juce::Colours::black);
        graphics.fillRoundedRectangle(area, OuterCorner);
        graphics.setGradientFill(juce::ColourGradient::vertical(top, inner.getY(), bottom, inner.getBottom()));
        graphics.fillRoundedRectangle(inner, InnerCorner);
    } else {
        graphics.setColour(toColour(Palette::frame).withAlpha(DisabledOpacity));
        graphics.drawRoundedRectangle(area.reduced(0.5F), OuterCorner, 1.0F);
        graphics.setColour(juce::Colours::black.withAlpha(DisabledOpacity));
        graphics.fillRoundedRectangle(inner, InnerCorner);
    }
    if (isOn) {
        graphics.setColour(isEnabled ? juce::Colours::black : disabledInk(isBeneath));
        graphics.fillRect(inner.reduced(BarInset, 1.0F).removeFromBottom(BarHeight));
    }
    if (hasFocus)
        drawFocusRing(graphics, inner, InnerCorner);
}

juce::Colour disabledInk(bool isBeneath)
{
    return toColour(Palette::text).withAlpha(isBeneath ? DisabledOpacity : 0.7F);
}

void drawFocusRing(juce::Graphics& graphics, juce::Rectangle<float> area, float cornerSize)
{
    graphics.setColour(toColour(Palette::lightBlue));
    graphics.drawRoundedRectangle(area.reduced(0.75F), cornerSize, 1.5F);
}

} // namespace cadrel::gui
