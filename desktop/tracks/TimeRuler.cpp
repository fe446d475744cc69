// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/TimeRuler.h"

#include "desktop/tracks/RulerTicks.h"
#include "desktop/tracks/TracksPalette.h"
#include "desktop/tracks/TracksView.h"
#include "gui/guard/Guard.h"
#include "gui/look/Text.h"
#include "standin/project/Project.h"

#include <algorithm>

namespace desktop {

using cadrel::gui::getFont;
using cadrel::gui::Palette;
using cadrel::gui::toColour;

namespace {

constexpr int LabelFont = 4;
constexpr double LabelWidth = 84.0;
constexpr int LocatorTop = 0;
constexpr int CycleTop = 7;
constexpr int BarHeight = 6;
constexpr int LabelTop = 14;
constexpr int LabelHeight = 14;
constexpr int SmallTick = 5;
constexpr float HeadWidth = 11.0F;
constexpr float HeadHeight = 9.0F;
const juce::Colour LocatorColour = toColour(Palette::lightBlue).withMultipliedBrightness(0.8F);
const juce::Colour CycleColour = toColour(Palette::eventTeal);

} // namespace

void TimeRuler::paint(juce::Graphics& graphics)
{
    cadrel::gui::guardSystem([&] {
        graphics.fillAll(toColour(TracksPalette::lowLane));
        paintStretches(graphics);
        paintTicks(graphics);
        const double pixel = m_view.scale().pixelAt(m_view.project().position().getValue());
        if (pixel > -double{HeadWidth} && pixel < getWidth() + double{HeadWidth}) {
            const auto x = static_cast<float>(std::floor(pixel)) + 0.5F;
            const auto bottom = static_cast<float>(getHeight());
            juce::Path head;
            head.addTriangle(x - HeadWidth / 2.0F, bottom - HeadHeight, x + HeadWidth / 2.0F, bottom - HeadHeight, x,
                             bottom);
            graphics.setColour(toColour(Palette::light));
            graphics.fillPath(head);
        }
    });
}

void TimeRuler::paintStretches(juce::Graphics& graphics)
{
    const standin::Project& project = m_view.project();
    const auto column = [&](double seconds) {
        return static_cast<int>(std::clamp(std::floor(m_view.scale().pixelAt(seconds)), -100.0, getWidth() + 100.0));
    };
    const double previewStart = m_view.previewOffset() - m_view.clock().origin();
    if (const int first = column(previewStart); first < getWidth()) {
        graphics.setColour(toColour(Palette::orange).withAlpha(0.16F));
        graphics.fillRect(first, 0, getWidth() - first, getHeight());
    }

    const auto paintBar = [&](double start, double end, int top, juce::Colour colour) {
        if (!(start < end))
            return;
        const int first = column(start);
        const int width = std::max(1, column(end) - first);
        graphics.setColour(colour.withAlpha(0.45F));
        graphics.fillRect(first, top, width, BarHeight);
        graphics.setColour(colour);
        graphics.fillRect(first, top, 2, BarHeight);
        graphics.fillRect(first + width - 2, top, 2, BarHeight);
    };
    paintBar(project.locatorLeft().getValue(), project.locatorRight().getValue(), LocatorTop, LocatorColour);
    paintBar(project.cycleLeft().getValue(), project.cycleRight().getValue(), CycleTop, CycleColour);
}

void TimeRuler::paintTicks(juce::Graphics& graphics)
{
    const int bottom = getHeight() - 1;
    graphics.setFont(getFont(LabelFont));
    for (const RulerTick& tick : rulerTicks(m_view.clock(), m_view.scale(), getWidth(), LabelWidth)) {
        const auto x = static_cast<int>(std::floor(tick.pixel));
        if (tick.label.empty()) {
            graphics.setColour(toColour(Palette::frame).withAlpha(0.6F));
            graphics.fillRect(x, bottom - SmallTick, 1, SmallTick);
            continue;
        }
        graphics.setColour(toColour(Palette::frame));
        graphics.fillRect(x, LabelTop, 1, bottom - LabelTop);
        graphics.setColour(toColour(Palette::text));
        graphics.drawSingleLineText(tick.label, x + 4, LabelTop + LabelHeight - 3);
    }
    graphics.setColour(toColour(Palette::band));
    graphics.fillRect(0, bottom, getWidth(), 1);
}

void TimeRuler::mouseDown(const juce::MouseEvent& event)
{
    mouseDrag(event);
}

void TimeRuler::mouseDrag(const juce::MouseEvent& event)
{
    cadrel::gui::guardUser([&] { m_view.locate(m_view.scale().secondsAt(event.position.x)); });
}

} // namespace desktop
