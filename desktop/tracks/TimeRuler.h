// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

namespace desktop {

class TracksView;

/// The ruler above the tracks: the timecode, the locators, the cycle and the playhead, which follows the mouse.
class TimeRuler : public juce::Component {
public:
    static constexpr int Height = 40;

    explicit TimeRuler(TracksView& view) : m_view(view) { setOpaque(true); }

    void paint(juce::Graphics& graphics) override;
    void mouseDown(const juce::MouseEvent& event) override;
    void mouseDrag(const juce::MouseEvent& event) override;

private:
    void paintStretches(juce::Graphics& graphics);
    void paintTicks(juce::Graphics& graphics);

    TracksView& m_view;
};

} // namespace desktop
