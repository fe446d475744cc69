// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/guard/Guard.h"
#include "gui/look/ButtonTile.h"
#include "gui/look/LookAndFeel.h"
#include "gui/look/Text.h"

#include <algorithm>

namespace cadrel::gui {

namespace {

/// The smallest share of its width that a text is squeezed to before it is cut.
constexpr float Squeezing = 0.8F;
/// The tick boxes of toggles.
constexpr float TickBoxX = 4.0F;
constexpr int TextAfterTickBox = 5;

ButtonTile tileOf(const juce::Button& button, bool isDown)
{
    if (isDown && !button.getClickingTogglesState())
        return ButtonTile::lit(toColour(Palette::light));
    if (!isDown && !button.getToggleState())
        return ButtonTile::normal();
    return ButtonTile::lit(button.findColour(juce::TextButton::buttonOnColourId));
}

float tickBoxSize(const juce::Button& button)
{
    return 1.1F * std::min(15.0F, 0.75F * static_cast<float>(button.getHeight()));
}

} // namespace

void LookAndFeel::drawButtonBackground(juce::Graphics& graphics, juce::Button& button, const juce::Colour&, bool,
                                       bool isDown)
{
    guardSystem([&] {
        if (const auto* const box = dynamic_cast<const juce::ComboBox*>(button.getParentComponent())) {
            graphics.setColour(juce::Colours::black);
            graphics.fillRect(button.getLocalBounds());
            graphics.setColour(box->findColour(juce::ComboBox::buttonColourId));
            graphics.fillRect(button.getLocalBounds().reduced(1));
            return;
        }
        ButtonTile tile = tileOf(button, isDown);
        tile.isEnabled = button.isEnabled();
        tile.isBeneath = isBeneath(button);
        tile.isOn = button.getToggleState();
        tile.hasFocus = button.hasKeyboardFocus(false);
        tile.draw(graphics, button.getLocalBounds().toFloat());
    });
}

juce::Font LookAndFeel::getTextButtonFont(juce::TextButton&, int)
{
    return getFont(6);
}

void LookAndFeel::drawButtonText(juce::Graphics& graphics, juce::TextButton& button, bool, bool)
{
    guardSystem([&] {
        const int colour =
            button.getToggleState() ? juce::TextButton::textColourOnId : juce::TextButton::textColourOffId;
        graphics.setColour(button.isEnabled() ? button.findColour(colour) : disabledInk(isBeneath(button)));
        graphics.setFont(getTextButtonFont(button, button.getHeight()));
        graphics.drawFittedText(button.getButtonText(), button.getLocalBounds().reduced(3, 0),
                                juce::Justification::centred, 1, Squeezing);
    });
}

void LookAndFeel::drawToggleButton(juce::Graphics& graphics, juce::ToggleButton& button, bool isHighlighted,
                                   bool isDown)
{
    guardSystem([&] {
        const float size = tickBoxSize(button);
        const float y = (static_cast<float>(button.getHeight()) - size) / 2.0F;
        if (button.hasKeyboardFocus(false)) {
            graphics.setColour(button.findColour(juce::TextEditor::focusedOutlineColourId));
            graphics.drawRect(button.getLocalBounds());
        }
        drawTickBox(graphics, button, TickBoxX, y, size, size, button.getToggleState(), button.isEnabled(),
                    isHighlighted, isDown);
        const auto text = button.getLocalBounds().withTrimmedLeft(juce::roundToInt(size) + TextAfterTickBox).toFloat();
        const juce::Colour colour = button.findColour(juce::ToggleButton::textColourId);
        drawText(graphics, button.getButtonText(), text.getX(), text.getY(), text.getWidth(), text.getHeight(),
                 juce::Justification::centredLeft, getFont(0), colour.withMultipliedAlpha(opacityOf(button)), true);
    });
}

void LookAndFeel::drawTickBox(juce::Graphics& graphics, juce::Component& component, float x, float y, float width,
                              float height, bool isTicked, bool isEnabled, bool, bool)
{
    guardSystem([&] {
        const float opacity = isEnabled ? 1.0F : DisabledOpacity;
        const juce::Rectangle<float> box(x, y + 2.0F, width - 4.0F, height - 4.0F);
        graphics.setColour(component.findColour(juce::ToggleButton::tickDisabledColourId).withMultipliedAlpha(opacity));
        graphics.fillRect(box);
        if (component.hasKeyboardFocus(false))
            drawFocusRing(graphics, box.expanded(2.0F), 1.0F);
        if (!isTicked)
            return;
        juce::Path tick;
        tick.startNewSubPath(x + 0.15F * width, y + 0.5F * height);
        tick.lineTo(x + 0.35F * width, y + 0.7F * height);
        tick.lineTo(x + 0.55F * width, y + 0.3F * height);
        graphics.setColour(component.findColour(juce::ToggleButton::tickColourId).withMultipliedAlpha(opacity));
        graphics.strokePath(tick, juce::PathStrokeType(2.7F));
    });
}

juce::Path LookAndFeel::getTickShape(float height)
{
    juce::Path tick;
    tick.startNewSubPath(0.0F, 6.0F);
    tick.lineTo(2.0F, 4.0F);
    tick.lineTo(7.0F, 7.0F);
    tick.lineTo(18.0F, 0.0F);
    tick.lineTo(20.0F, 1.5F);
    tick.lineTo(7.5F, 10.0F);
    tick.closeSubPath();
    tick.scaleToFit(0.0F, 0.0F, 2.0F * height, height, false);
    return tick;
}

} // namespace cadrel::gui
