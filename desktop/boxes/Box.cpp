// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/boxes/Box.h"

#include "gui/look/Text.h"

#include <algorithm>

namespace desktop {

namespace {

constexpr int TitleHeight = 40;
constexpr int TitleFont = 1;
constexpr int ButtonGap = 8;

} // namespace

Box::Box(const juce::String& name, const juce::String& title) : Sheet(name), m_title(title)
{
    setTitle(title);
}

void Box::paint(juce::Graphics& graphics)
{
    // What is beneath may have a sheet of its own, from which the panel has to stand out.
    graphics.fillAll(juce::Colours::black.withAlpha(0.3F));
    graphics.setColour(cadrel::gui::toColour(cadrel::gui::Palette::sheet));
    graphics.fillRect(panel());
    graphics.setColour(juce::Colours::black);
    graphics.drawRect(panel());
    const juce::Rectangle<int> title = panel().withHeight(TitleHeight).reduced(Margin, 0);
    cadrel::gui::drawText(graphics, m_title, static_cast<float>(title.getX()), static_cast<float>(title.getY()),
                          static_cast<float>(title.getWidth()), static_cast<float>(title.getHeight()),
                          juce::Justification::centredLeft, cadrel::gui::getFont(TitleFont), juce::Colours::black,
                          true);
    graphics.fillRect(title.getX(), title.getBottom() - 1, title.getWidth(), 1);
}

void Box::setPanelSize(int width, int height)
{
    m_panelWidth = width;
    m_panelHeight = height;
    resized();
}

juce::Rectangle<int> Box::panel() const
{
    return getLocalBounds().withSizeKeepingCentre(std::min(m_panelWidth, getWidth()),
                                                  std::min(m_panelHeight, getHeight()));
}

juce::Rectangle<int> Box::content() const
{
    return panel().withTrimmedTop(TitleHeight).reduced(Margin);
}

int Box::buttonWidth(const juce::Button& button)
{
    constexpr int Least = 84;
    constexpr int Sides = 32;
    return std::max(Least, cadrel::gui::getFont(TitleFont).getStringWidth(button.getButtonText()) + Sides);
}

void Box::layOutButtons(juce::Rectangle<int> area, const std::vector<juce::Button*>& buttons)
{
    for (auto button = buttons.rbegin(); button != buttons.rend(); ++button) {
        (*button)->setBounds(area.removeFromRight(buttonWidth(**button)));
        area.removeFromRight(ButtonGap);
    }
}

void Box::resized()
{
    layOut();
    repaint();
}

void Box::parentSizeChanged()
{
    fillParent();
}

void Box::parentHierarchyChanged()
{
    fillParent();
}

void Box::keepFocus(juce::Component* focused)
{
    if (isParentOf(focused))
        m_lastFocus = focused;
    else if (m_lastFocus && m_lastFocus->isShowing())
        m_lastFocus->grabKeyboardFocus();
    else if (focused != this)
        takeFocus();
}

void Box::fillParent()
{
    if (const Component* const parent = getParentComponent())
        setBounds(parent->getLocalBounds());
}

} // namespace desktop
