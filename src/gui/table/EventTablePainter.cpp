// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventTablePainter.h"

#include "core/edl/EventBase.h"
#include "gui/look/Text.h"
#include "gui/table/EventCells.h"
#include "gui/table/EventColumn.h"

#include <algorithm>

namespace cadrel::gui {

using core::EventBase;

namespace {

/// What a row keeps free beside its selection.
constexpr int LeftEdge = 5;
constexpr int BothEdges = 8;
constexpr int TextFont = 5;

juce::Colour textColour(const EventBase& event, bool isSelected, bool isRelated)
{
    if (isSelected)
        return juce::Colours::black;
    if (isRelated)
        return toColour(Palette::highlight);
    return toColour(event.vfx() ? Palette::eventTeal : Palette::text);
}

void paintExclamationMark(juce::Graphics& graphics, juce::Rectangle<float> dot)
{
    const float width = dot.getWidth() / 6.0F;
    const auto stroke = dot.withSizeKeepingCentre(width, dot.getHeight() * 0.66F);
    graphics.setColour(toColour(Palette::light));
    graphics.fillRect(stroke.withTrimmedBottom(width * 1.8F));
    graphics.fillRect(stroke.withTop(stroke.getBottom() - width));
}

void paintStar(juce::Graphics& graphics, juce::Point<float> centre, float radius, juce::Colour colour)
{
    juce::Path star;
    star.addStar(centre, 4, radius * 0.35F, radius);
    graphics.setColour(colour);
    graphics.fillPath(star);
}

void paintState(juce::Graphics& graphics, const EventBase& event, juce::Rectangle<float> cell, bool isSelected,
                bool isRelated)
{
    const float diameter = std::min(cell.getWidth(), cell.getHeight()) - 10.0F;
    const auto dot = cell.withSizeKeepingCentre(diameter, diameter);
    graphics.setColour(toColour(event.isValid() ? Palette::darkGreen : Palette::darkRed));
    graphics.fillEllipse(dot);
    graphics.setColour(toColour(event.isValid() ? Palette::green : Palette::red));
    graphics.fillEllipse(dot.reduced(1.0F));
    if (!event.isValid())
        paintExclamationMark(graphics, dot);
    if (event.vfx()) {
        const juce::Point<float> beside(dot.getRight() + diameter * 0.75F, dot.getCentreY());
        paintStar(graphics, beside, diameter * 0.45F, textColour(event, isSelected, isRelated));
    }
}

} // namespace

void EventTablePainter::paintBackground(juce::Graphics& graphics, int row, int width, int height, bool isSelected,
                                        bool isRelated)
{
    graphics.fillAll(toColour(Palette::panel));
    if (isSelected) {
        graphics.setColour(toColour(Palette::selection));
        graphics.fillRect(LeftEdge, 1, width - BothEdges, height - 1);
    }
    if (row != 0) {
        graphics.setColour(toColour(Palette::band));
        graphics.drawHorizontalLine(0, static_cast<float>(LeftEdge), static_cast<float>(width - BothEdges));
    }
    if (isRelated) {
        graphics.setColour(toColour(Palette::highlight));
        graphics.fillRect(0, 2, LeftEdge - 2, height - 3);
    }
}

void EventTablePainter::paintCell(juce::Graphics& graphics, const EventBase& event, int column, int width, int height,
                                  bool isSelected, bool isRelated)
{
    const juce::Rectangle<float> cell(static_cast<float>(width), static_cast<float>(height));
    if (column == EventColumn::State) {
        paintState(graphics, event, cell, isSelected, isRelated);
        return;
    }
    const bool isName =
        column == EventColumn::Roll || column == EventColumn::ClipName || column == EventColumn::EdlFile;
    drawText(graphics, EventCells::text(event, column).c_str(), 2.0F, 0.0F, cell.getWidth() - 4.0F, cell.getHeight(),
             juce::Justification::centredLeft, getFont(TextFont), textColour(event, isSelected, isRelated), isName);
}

} // namespace cadrel::gui
