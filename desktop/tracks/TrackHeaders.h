// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

#include <cstddef>
#include <optional>

namespace desktop {

class TracksView;

/// The names of the tracks, each with a button that selects it and one that locks it. Folders and rulers have no buttons.
class TrackHeaders : public juce::Component, public juce::TooltipClient {
public:
    static constexpr int Width = 200;

    enum class Button { Select, Lock };

    explicit TrackHeaders(TracksView& view) : m_view(view) { setOpaque(true); }

    /// Where the button of a row stands, in this component.
    juce::Rectangle<int> placeOf(std::size_t row, Button button) const;

    void paint(juce::Graphics& graphics) override;
    void mouseDown(const juce::MouseEvent& event) override;
    juce::String getTooltip() override;

private:
    struct Spot {
        std::size_t row;
        std::optional<Button> button;
    };
    std::optional<Spot> spotAt(juce::Point<int> place) const;
    void paintRow(juce::Graphics& graphics, std::size_t row);

    TracksView& m_view;
};

} // namespace desktop
