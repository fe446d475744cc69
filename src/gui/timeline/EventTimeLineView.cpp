// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/timeline/EventTimeLineView.h"

#include "gui/guard/Guard.h"
#include "gui/look/ButtonTile.h"
#include "gui/look/ShownText.h"
#include "gui/look/Text.h"

#include <algorithm>
#include <cmath>

namespace cadrel::gui {

namespace {

constexpr int LabelWidth = 100;
constexpr int LaneHeight = 35;
constexpr int DestinationTop = 45;
constexpr int LabelFont = 1;
constexpr float CornerSize = 2.0F;
constexpr float HighlightLine = 2.0F;
constexpr float VfxStripe = 3.0F;
constexpr float VfxStripeBottom = 9.0F; ///< where it begins, from the bottom of the block

void setUp(juce::Label& label, const wchar_t* text, int top)
{
    label.setText(translated(text).c_str(), juce::dontSendNotification);
    label.setFont(getFont(LabelFont));
    label.setColour(juce::Label::textColourId, toColour(Palette::text));
    label.setJustificationType(juce::Justification::centredLeft);
    label.setEditable(false);
    label.setBounds(0, top, LabelWidth, LaneHeight);
}

PaletteColour colourOf(const TimeLineBlock& block)
{
    if (block.isHighlighted)
        return Palette::selection;
    return block.isVfx ? Palette::eventTeal : Palette::eventBlue;
}

/// Too narrow a block has no room for corners.
void fillBlock(juce::Graphics& graphics, juce::Rectangle<float> area)
{
    if (area.getWidth() > 2.0F * CornerSize)
        graphics.fillRoundedRectangle(area, CornerSize);
    else
        graphics.fillRect(area);
}

void paintBlock(juce::Graphics& graphics, const TimeLineBlock& block, juce::Rectangle<float> area)
{
    graphics.setColour(toColour(block.isHighlighted ? Palette::light : colourOf(block)));
    fillBlock(graphics, area);
    if (block.isHighlighted) {
        graphics.setColour(toColour(colourOf(block)));
        graphics.fillRect(area.reduced(0.0F, HighlightLine));
    }
    if (block.isVfx) {
        graphics.setColour(toColour(Palette::panel));
        graphics.fillRect(area.withTop(area.getBottom() - VfxStripeBottom).withHeight(VfxStripe));
    }
}

/// `pixelScale` is how many columns a pixel of the component has.
void paintLane(juce::Graphics& graphics, const std::vector<TimeLineBlock>& blocks, int top, float pixelScale)
{
    for (std::size_t index = 0; index < blocks.size(); ++index) {
        const TimeLineBlock& block = blocks[index];
        const float left = LabelWidth + static_cast<float>(block.first) / pixelScale;
        juce::Rectangle<float> area(left, static_cast<float>(top),
                                    static_cast<float>(block.end - block.first) / pixelScale,
                                    static_cast<float>(LaneHeight));
        // Without a gap, a cut between two blocks could hardly be seen.
        const bool meetsNext = index + 1 < blocks.size() && blocks[index + 1].first == block.end;
        if (meetsNext && area.getWidth() > 2.0F * CornerSize)
            area.removeFromRight(1.0F);
        paintBlock(graphics, block, area);
    }
}

} // namespace

EventTimeLineView::EventTimeLineView() : m_sourceLabel("SourceLabel"), m_destinationLabel("DestinationLabel")
{
    setUp(m_sourceLabel, L"Source", 0);
    setUp(m_destinationLabel, L"Destination", DestinationTop);
    addAndMakeVisible(m_sourceLabel);
    addAndMakeVisible(m_destinationLabel);
}

void EventTimeLineView::setEvents(const core::EventList& events)
{
    forgetBlocks();
    m_line.setEvents(events);
}

void EventTimeLineView::highlightEvents(const std::vector<std::shared_ptr<core::EventBase>>& events)
{
    forgetBlocks();
    m_line.highlight(events);
}

void EventTimeLineView::resized()
{
    guardSystem([this] { forgetBlocks(); });
}

void EventTimeLineView::enablementChanged()
{
    guardSystem([this] { repaint(); });
}

void EventTimeLineView::forgetBlocks()
{
    m_pixelScale = 0.0F;
    repaint();
}

void EventTimeLineView::placeBlocks(float pixelScale)
{
    const auto columns = static_cast<int>(std::lround(static_cast<float>(getWidth() - LabelWidth) * pixelScale));
    const int least = std::max(1, static_cast<int>(std::lround(pixelScale)));
    m_blocks = {m_line.blocks(EventTimeLine::Lane::Source, columns, least),
                m_line.blocks(EventTimeLine::Lane::Destination, columns, least)};
    m_pixelScale = pixelScale;
}

void EventTimeLineView::paint(juce::Graphics& graphics)
{
    guardSystem([&] {
        const float pixelScale = graphics.getInternalContext().getPhysicalPixelScaleFactor();
        if (m_pixelScale != pixelScale)
            placeBlocks(pixelScale);
        const bool isDimmed = !isEnabled();
        if (isDimmed)
            graphics.beginTransparencyLayer(DisabledOpacity);
        paintLane(graphics, m_blocks[0], 0, pixelScale);
        paintLane(graphics, m_blocks[1], DestinationTop, pixelScale);
        if (isDimmed)
            graphics.endTransparencyLayer();
    });
}

} // namespace cadrel::gui
