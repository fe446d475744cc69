// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/TrackHeaders.h"

#include "desktop/tracks/MarkerSymbol.h"
#include "desktop/tracks/NameDrawing.h"
#include "desktop/tracks/TracksPalette.h"
#include "desktop/tracks/TracksView.h"
#include "gui/guard/Guard.h"
#include "gui/look/Text.h"

#include <algorithm>

namespace desktop {

using cadrel::gui::getFont;
using cadrel::gui::Palette;
using cadrel::gui::toColour;
using standin::Track;

namespace {

constexpr int FolderFont = 2;
constexpr int Indent = 10;
constexpr int DeepestIndent = 5;
constexpr int Left = 10;
constexpr int ButtonSide = 16;
constexpr int ButtonGap = 4;
constexpr int MostNameHeight = 24; ///< names of high rows stand at the top
constexpr float Corner = 2.0F;

bool hasButtons(const Track& track)
{
    return track.kind() != Track::Kind::Folder && track.kind() != Track::Kind::Ruler;
}

juce::Path padlock(juce::Rectangle<float> area, bool isClosed)
{
    juce::Path path;
    const auto body = area.withTrimmedTop(area.getHeight() * 0.45F).reduced(area.getWidth() * 0.12F, 0.0F);
    path.addRoundedRectangle(body, 1.0F);
    const float left = body.getX() + body.getWidth() * 0.2F;
    const float right = body.getRight() - body.getWidth() * 0.2F;
    juce::Path shackle;
    shackle.startNewSubPath(left, body.getY());
    const float top = area.getY() + 0.8F;
    shackle.cubicTo(left, top, right, top, right, isClosed ? body.getY() : body.getY() - area.getHeight() * 0.18F);
    juce::PathStrokeType(1.4F).createStrokedPath(shackle, shackle);
    path.addPath(shackle);
    return path;
}

void paintButton(juce::Graphics& graphics, juce::Rectangle<float> area, TrackHeaders::Button button, bool isOn)
{
    const bool isLock = button == TrackHeaders::Button::Lock;
    const juce::Colour lit = toColour(isLock ? Palette::orange : Palette::selection);
    graphics.setColour(isOn ? lit : toColour(TracksPalette::line));
    graphics.fillRoundedRectangle(area, Corner);
    if (!isOn) {
        graphics.setColour(toColour(Palette::band));
        graphics.drawRoundedRectangle(area.reduced(0.5F), Corner, 1.0F);
    }
    graphics.setColour(isOn ? juce::Colours::black : toColour(Palette::frame));
    const auto inner = area.reduced(3.5F);
    if (isLock) {
        graphics.fillPath(padlock(area.reduced(3.0F), isOn));
        return;
    }
    // A tick, which is there when the track is selected.
    juce::Path tick;
    tick.startNewSubPath(inner.getX(), inner.getCentreY());
    tick.lineTo(inner.getX() + inner.getWidth() * 0.38F, inner.getBottom() - 0.5F);
    tick.lineTo(inner.getRight(), inner.getY() + 0.5F);
    if (isOn)
        graphics.strokePath(tick, juce::PathStrokeType(1.8F));
}

} // namespace

juce::Rectangle<int> TrackHeaders::placeOf(std::size_t row, Button button) const
{
    const RowLayout& rows = m_view.rows();
    const int height = std::min(rows.heightOf(row), MostNameHeight);
    const int top = rows.top(row) - m_view.rowOffset() + (height - 1 - ButtonSide) / 2;
    const int right = getWidth() - 8 - (button == Button::Lock ? 0 : ButtonSide + ButtonGap);
    return {right - ButtonSide, top, ButtonSide, ButtonSide};
}

void TrackHeaders::paint(juce::Graphics& graphics)
{
    cadrel::gui::guardSystem([&] {
        graphics.fillAll(toColour(TracksPalette::ground));
        const RowLayout& rows = m_view.rows();
        const juce::Rectangle<int> clip = graphics.getClipBounds();
        for (std::size_t row = rows.firstBelow(clip.getY() + m_view.rowOffset());
             row < rows.count() && rows.top(row) - m_view.rowOffset() < clip.getBottom(); ++row)
            paintRow(graphics, row);
        graphics.setColour(toColour(TracksPalette::line));
        graphics.fillRect(getWidth() - 1, 0, 1, getHeight());
    });
}

void TrackHeaders::paintRow(juce::Graphics& graphics, std::size_t row)
{
    const TrackRow& shown = m_view.index().rows()[row];
    const Track& track = *shown.track;
    juce::Rectangle<int> area(0, m_view.rows().top(row) - m_view.rowOffset(), getWidth(), m_view.rows().heightOf(row));
    const bool isFolder = track.isFolder();
    graphics.setColour(toColour(isFolder           ? TracksPalette::lowLane
                                : track.selected() ? TracksPalette::selectedLane
                                                   : Palette::panel));
    graphics.fillRect(area.withTrimmedBottom(1));
    graphics.setColour(toColour(TracksPalette::line));
    graphics.fillRect(area.removeFromBottom(1));
    if (track.selected() && !isFolder) {
        graphics.setColour(toColour(Palette::selection));
        graphics.fillRect(area.withWidth(3));
    }

    juce::Rectangle<int> line = area.withHeight(std::min(area.getHeight(), MostNameHeight - 1));
    line.removeFromLeft(Left + Indent * std::min(shown.depth, DeepestIndent));
    if (hasButtons(track)) {
        for (const Button button : {Button::Select, Button::Lock})
            paintButton(graphics, placeOf(row, button).toFloat(), button,
                        button == Button::Lock ? track.isLocked() : track.selected());
        line.setRight(placeOf(row, Button::Select).getX() - ButtonGap);
    }
    if (track.kind() == Track::Kind::Marker) {
        graphics.setColour(MarkerSymbol::colourOf(shown.markers));
        MarkerSymbol::draw(graphics, shown.markers, static_cast<float>(line.getX()),
                           static_cast<float>(line.getCentreY() - MarkerSymbol::Size / 2));
        line.removeFromLeft(MarkerSymbol::Size + 5);
    }
    const bool isDim = isFolder || track.kind() == Track::Kind::Ruler;
    cadrel::gui::drawText(graphics, shownName(track.name()), static_cast<float>(line.getX()),
                          static_cast<float>(line.getY()), static_cast<float>(line.getWidth()),
                          static_cast<float>(line.getHeight()), juce::Justification::centredLeft,
                          getFont(isFolder ? FolderFont : NameDrawing::FontIndex),
                          toColour(isDim ? TracksPalette::dimText : Palette::text), true);
}

std::optional<TrackHeaders::Spot> TrackHeaders::spotAt(juce::Point<int> place) const
{
    const std::optional<std::size_t> row = m_view.rows().rowAt(place.y + m_view.rowOffset());
    if (!row || !hasButtons(*m_view.index().rows()[*row].track))
        return std::nullopt;
    for (const Button button : {Button::Select, Button::Lock}) {
        if (placeOf(*row, button).expanded(ButtonGap / 2).contains(place))
            return Spot{*row, button};
    }
    return Spot{*row, std::nullopt};
}

void TrackHeaders::mouseDown(const juce::MouseEvent& event)
{
    cadrel::gui::guardUser([&] {
        const std::optional<Spot> spot = spotAt(event.getPosition());
        if (!spot)
            return;
        if (spot->button == Button::Lock)
            m_view.toggleLock(spot->row);
        else
            m_view.toggleSelection(spot->row, spot->button || event.mods.isCommandDown());
    });
}

juce::String TrackHeaders::getTooltip()
{
    const std::optional<Spot> spot = spotAt(getMouseXYRelative());
    if (!spot)
        return {};
    const TrackRow& row = m_view.index().rows()[spot->row];
    if (!spot->button)
        return shownName(row.track->name());
    if (*spot->button == Button::Lock)
        return row.track->isLocked() ? "Unlock this track" : "Lock this track against edits";
    return row.track->selected() ? "Take this track out of the selection" : "Select this track, beside the others";
}

} // namespace desktop
