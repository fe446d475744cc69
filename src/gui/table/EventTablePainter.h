// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::core {
class EventBase;
} // namespace cadrel::core

namespace cadrel::gui {

/// Paints the rows of an event table. Each state has a shape as well as a colour: the dot of an invalid event holds an
/// exclamation mark, a VFX shot has a star beside its dot, and a related event has a bar at the left edge of its row.
namespace EventTablePainter {

void paintBackground(juce::Graphics& graphics, int row, int width, int height, bool isSelected, bool isRelated);
void paintCell(juce::Graphics& graphics, const core::EventBase& event, int column, int width, int height,
               bool isSelected, bool isRelated);

} // namespace EventTablePainter

} // namespace cadrel::gui
