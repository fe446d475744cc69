// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/MenuBarLook.h"

#include "gui/look/Text.h"

namespace desktop {

namespace {

using cadrel::gui::Palette;
using cadrel::gui::toColour;

constexpr int ItemFont = 0;
constexpr int ItemSides = 22;

} // namespace

void MenuBarLook::drawMenuBarBackground(juce::Graphics& graphics, int /*width*/, int /*height*/, bool /*isMouseOver*/,
                                        juce::MenuBarComponent& /*bar*/)
{
    graphics.fillAll(toColour(Palette::panel));
}

int MenuBarLook::getMenuBarItemWidth(juce::MenuBarComponent& /*bar*/, int /*index*/, const juce::String& text)
{
    return cadrel::gui::getFont(ItemFont).getStringWidth(text) + ItemSides;
}

void MenuBarLook::drawMenuBarItem(juce::Graphics& graphics, int width, int height, int /*index*/,
                                  const juce::String& text, bool isMouseOver, bool isOpen, bool /*isMouseOverBar*/,
                                  juce::MenuBarComponent& bar)
{
    if (isOpen || isMouseOver)
        graphics.fillAll(toColour(Palette::band));
    cadrel::gui::drawText(graphics, text, 0.0F, 0.0F, static_cast<float>(width), static_cast<float>(height),
                          juce::Justification::centred, cadrel::gui::getFont(ItemFont),
                          toColour(Palette::text).withMultipliedAlpha(bar.isEnabled() ? 1.0F : 0.5F), false);
}

} // namespace desktop
