// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/TabStrip.h"

#include "gui/look/Text.h"

#include <algorithm>

namespace desktop {

namespace {

using cadrel::gui::Palette;
using cadrel::gui::toColour;

constexpr int WidestTab = 240;
constexpr int Gap = 2;
constexpr int CrossSize = 10;
constexpr int Side = 10;
constexpr float DotSize = 7.0F;
constexpr int TabFont = 1;

} // namespace

void TabStrip::setTabs(std::vector<Tab> tabs, std::size_t active)
{
    if (tabs == m_tabs && active == m_active)
        return;
    m_tabs = std::move(tabs);
    m_active = active;
    repaint();
}

std::optional<std::uint64_t> TabStrip::tabAfter(int steps) const
{
    if (m_tabs.empty())
        return std::nullopt;
    const int count = static_cast<int>(m_tabs.size());
    const int index = ((static_cast<int>(m_active) + steps) % count + count) % count;
    return m_tabs[static_cast<std::size_t>(index)].id;
}

int TabStrip::tabWidth() const
{
    const int count = std::max(1, static_cast<int>(m_tabs.size()));
    return std::min(WidestTab, getWidth() / count);
}

juce::Rectangle<int> TabStrip::tabArea(std::size_t index) const
{
    return {static_cast<int>(index) * tabWidth(), 2, tabWidth() - Gap, getHeight() - 2};
}

juce::Rectangle<int> TabStrip::crossArea(std::size_t index) const
{
    return tabArea(index).removeFromRight(CrossSize + 2 * Side).withSizeKeepingCentre(CrossSize, CrossSize);
}

std::size_t TabStrip::tabAt(juce::Point<int> place) const
{
    std::size_t index = 0;
    while (index < m_tabs.size() && !tabArea(index).contains(place))
        ++index;
    return index;
}

void TabStrip::paint(juce::Graphics& graphics)
{
    graphics.fillAll(toColour(Palette::panel).darker(0.4F));
    for (std::size_t index = 0; index < m_tabs.size(); ++index) {
        const bool isActive = index == m_active;
        juce::Rectangle<int> area = tabArea(index);
        graphics.setColour(toColour(isActive ? Palette::band : Palette::panel));
        graphics.fillRect(area);
        if (isActive) {
            graphics.setColour(toColour(Palette::selection));
            graphics.fillRect(area.withHeight(2));
        }
        area.reduce(Side, 0);
        if (m_tabs[index].isUnsaved) {
            graphics.setColour(toColour(Palette::orange));
            graphics.fillEllipse(
                area.removeFromLeft(static_cast<int>(DotSize)).toFloat().withSizeKeepingCentre(DotSize, DotSize));
            area.removeFromLeft(Side / 2);
        }
        area.removeFromRight(CrossSize + Side);
        cadrel::gui::drawText(
            graphics, juce::String::fromUTF8(m_tabs[index].name.c_str()), static_cast<float>(area.getX()),
            static_cast<float>(area.getY()), static_cast<float>(area.getWidth()), static_cast<float>(area.getHeight()),
            juce::Justification::centredLeft, cadrel::gui::getFont(TabFont), toColour(Palette::text), true);
        const juce::Rectangle<float> cross = crossArea(index).toFloat();
        const bool isOver = crossArea(index).expanded(Side / 2).contains(m_mouse);
        graphics.setColour(toColour(Palette::text).withAlpha(isOver ? 1.0F : 0.5F));
        graphics.drawLine({cross.getTopLeft(), cross.getBottomRight()}, 1.5F);
        graphics.drawLine({cross.getTopRight(), cross.getBottomLeft()}, 1.5F);
    }
}

void TabStrip::mouseDown(const juce::MouseEvent& event)
{
    const std::size_t tab = tabAt(event.getPosition());
    if (tab == m_tabs.size())
        return;
    const bool isOnCross = crossArea(tab).expanded(Side / 2).contains(event.getPosition());
    const auto& act = isOnCross || event.mods.isMiddleButtonDown() ? onClosed : onChosen;
    if (act)
        act(m_tabs[tab].id);
}

void TabStrip::mouseMove(const juce::MouseEvent& event)
{
    m_mouse = event.getPosition();
    const std::size_t tab = tabAt(m_mouse);
    setTooltip(tab < m_tabs.size() ? juce::String::fromUTF8(m_tabs[tab].path.c_str()) : juce::String());
    repaint();
}

void TabStrip::mouseExit(const juce::MouseEvent& /*event*/)
{
    m_mouse = {-1, -1};
    repaint();
}

} // namespace desktop
