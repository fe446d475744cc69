// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/timeline/EventTimeLine.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <array>
#include <memory>
#include <vector>

namespace cadrel::core {
class EventBase;
class EventList;
} // namespace cadrel::core

namespace cadrel::gui {

/// The strip that shows every event of a list twice on one time axis: on the Source lane where it came from, and on the
/// Destination lane where it goes. It has no zoom and no mouse. Colour isn't all that tells blocks apart: a VFX shot has a
/// dark stripe, and a highlighted event a light line above and below.
class EventTimeLineView : public juce::Component {
public:
    EventTimeLineView();

    /// Throws what EventTimeLine::setEvents throws.
    void setEvents(const core::EventList& events);
    void highlightEvents(const std::vector<std::shared_ptr<core::EventBase>>& events);

    void paint(juce::Graphics& graphics) override;
    void resized() override;
    void enablementChanged() override;

private:
    static constexpr std::size_t LaneCount = 2;

    void forgetBlocks();
    /// The blocks of the lanes at that many pixels of the screen for one of the component.
    void placeBlocks(float pixelScale);

    juce::Label m_sourceLabel;
    juce::Label m_destinationLabel;
    EventTimeLine m_line;
    std::array<std::vector<TimeLineBlock>, LaneCount> m_blocks;
    float m_pixelScale = 0.0F; ///< of m_blocks; 0 when they have to be placed anew
};

} // namespace cadrel::gui
