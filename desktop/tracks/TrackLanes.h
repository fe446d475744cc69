// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/tracks/LaneBlocks.h"
#include "desktop/tracks/NameDrawing.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <cstddef>

namespace standin {
class ClipEvent;
} // namespace standin

namespace desktop {

class Lane;
struct CurvePoints;
struct TrackRow;
class TracksView;

/// What lies on the tracks. It draws what is visible alone.
class TrackLanes : public juce::Component {
public:
    explicit TrackLanes(TracksView& view);

    void paint(juce::Graphics& graphics) override;
    void mouseDown(const juce::MouseEvent& event) override;

private:
    void paintRow(juce::Graphics& graphics, std::size_t row, juce::Rectangle<int> area);
    void paintWithoutSound(juce::Graphics& graphics, juce::Rectangle<int> area);
    void paintMarkers(juce::Graphics& graphics, const TrackRow& row, juce::Rectangle<int> area);
    /// The blocks of a track or, within `shown`, of a part.
    void paintLane(juce::Graphics& graphics, const TrackRow& row, const Lane& lane, Columns shown,
                   juce::Rectangle<int> area);
    void paintBlock(juce::Graphics& graphics, const TrackRow& row, const Lane& lane, const LaneBlocks::Block& block,
                    juce::Rectangle<int> area);
    void paintStills(juce::Graphics& graphics, const TrackRow& row, standin::ClipEvent& event,
                     const SpanIndex::Span& span, juce::Rectangle<int> area);
    void paintCurve(juce::Graphics& graphics, const CurvePoints& curve, juce::Rectangle<int> area);
    void paintGhosts(juce::Graphics& graphics, std::size_t row, juce::Rectangle<int> area);
    void paintLines(juce::Graphics& graphics);

    TracksView& m_view;
    NameDrawing m_names;
    juce::Image m_hatch;
};

} // namespace desktop
