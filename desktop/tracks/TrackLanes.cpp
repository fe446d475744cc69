// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/TrackLanes.h"

#include "desktop/tracks/CurveColumns.h"
#include "desktop/tracks/MarkerPlaces.h"
#include "desktop/tracks/MarkerSymbol.h"
#include "desktop/tracks/Stills.h"
#include "desktop/tracks/TrackIndex.h"
#include "desktop/tracks/TracksPalette.h"
#include "desktop/tracks/TracksView.h"
#include "gui/guard/Guard.h"
#include "gui/look/Text.h"
#include "standin/base/Times.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Project.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace desktop {

using cadrel::gui::getFont;
using cadrel::gui::Palette;
using cadrel::gui::PaletteColour;
using cadrel::gui::toColour;
using standin::Track;

namespace {

constexpr int NameHeight = 15;  ///< the band of a clip that its name stands in
constexpr int LeastBody = 8;    ///< what a clip has below the band; a lower one is all band
constexpr int NameBaseline = 4; ///< above the lower edge of a band of that height
constexpr int LeastNameWidth = 18;
constexpr int NamePad = 4;
constexpr int HatchSide = 8;
constexpr int CurveEdge = 3;  ///< between the highest value of a curve and the edge of its row
constexpr int FewPoints = 8;  ///< columns for a point, from which on a curve is drawn as a line and not by columns
constexpr int LeastStill = 8; ///< columns of a still that is worth being drawn
constexpr int StillSpacing = 120;

juce::Image makeHatch()
{
    juce::Image hatch(juce::Image::ARGB, HatchSide, HatchSide, true);
    const juce::Colour line = toColour(Palette::orange).withAlpha(0.34F);
    for (int y = 0; y < HatchSide; ++y) {
        hatch.setPixelAt((2 * HatchSide - y) % HatchSide, y, line);
        hatch.setPixelAt((2 * HatchSide - y + 1) % HatchSide, y, line.withMultipliedAlpha(0.5F));
    }
    return hatch;
}

juce::Colour colourOf(std::int32_t curve)
{
    switch (curve) {
    case standin::Envelope::Curve::Volume:
        return juce::Colour(226, 214, 160);
    case standin::Envelope::Curve::Pan:
        return juce::Colour(150, 205, 214);
    case standin::Envelope::Curve::Mute:
        return juce::Colour(226, 140, 124);
    default:
        return juce::Colour(190, 168, 222);
    }
}

struct BlockColours {
    PaletteColour name;
    PaletteColour body;
    PaletteColour text;
};

BlockColours coloursOf(const Track& track, Lane::Kind kind, bool isMarked)
{
    if (isMarked)
        return {Palette::selection, TracksPalette::markedBody, TracksPalette::darkText};
    if (track.isLocked())
        return {TracksPalette::lockedName, TracksPalette::lockedBody, Palette::text};
    if (kind == Lane::Kind::Part)
        return {TracksPalette::partName, TracksPalette::partBody, Palette::light};
    if (track.kind() == Track::Kind::Video)
        return {TracksPalette::pictureName, TracksPalette::pictureBody, Palette::light};
    return {Palette::eventBlue, TracksPalette::soundBody, Palette::light};
}

/// A single short clip stands out; a field of them is as calm as one clip.
PaletteColour stripColour(const Track& track, const Columns& strip)
{
    if (track.isLocked())
        return TracksPalette::lockedName;
    if (track.kind() == Track::Kind::Video)
        return TracksPalette::pictureName;
    return strip.count() < 3 * LaneBlocks::LeastBlock ? TracksPalette::soundSliver : TracksPalette::soundStrip;
}

/// Only the part of a long line of dashes that can be seen.
void drawDashes(juce::Graphics& graphics, Columns columns, int y, Columns seen)
{
    constexpr int Dash = 5;
    constexpr int Period = 8;
    int x = columns.first;
    if (x < seen.first)
        x += (seen.first - x) / Period * Period;
    for (; x < std::min(columns.end, seen.end); x += Period)
        graphics.fillRect(x, y, std::min(Dash, columns.end - x), 1);
}

} // namespace

TrackLanes::TrackLanes(TracksView& view) : m_view(view), m_names(getFont(NameDrawing::FontIndex)), m_hatch(makeHatch())
{
    setOpaque(true);
}

void TrackLanes::paint(juce::Graphics& graphics)
{
    cadrel::gui::guardSystem([&] {
        graphics.fillAll(toColour(TracksPalette::ground));
        const juce::Rectangle<int> clip = graphics.getClipBounds();
        // A part that is drawn anew says nothing of the stills beside it.
        if (Stills* const stills = m_view.stills(); stills && clip == getLocalBounds())
            stills->startAsking();
        const RowLayout& rows = m_view.rows();
        const int offset = m_view.rowOffset();
        for (std::size_t row = rows.firstBelow(clip.getY() + offset);
             row < rows.count() && rows.top(row) - offset < clip.getBottom(); ++row)
            paintRow(graphics, row, {0, rows.top(row) - offset, getWidth(), rows.heightOf(row)});
        paintLines(graphics);
    });
}

void TrackLanes::paintRow(juce::Graphics& graphics, std::size_t row, juce::Rectangle<int> area)
{
    const TrackRow& shown = m_view.index().rows()[row];
    const Track::Kind kind = shown.track->kind();
    const bool hasClips = kind == Track::Kind::Audio || kind == Track::Kind::Video;
    graphics.setColour(toColour(TracksPalette::line));
    graphics.fillRect(area.removeFromBottom(1));
    graphics.setColour(toColour(!hasClips                 ? TracksPalette::lowLane
                                : shown.track->selected() ? TracksPalette::selectedLane
                                                          : TracksPalette::lane));
    graphics.fillRect(area);
    if (!hasClips) {
        paintMarkers(graphics, shown, area);
        return;
    }
    if (kind == Track::Kind::Audio && m_view.stateOf(shown) == ChangeMap::State::Carried)
        paintWithoutSound(graphics, area);
    const Columns all{0, getWidth()};
    paintLane(graphics, shown, shown.lane, all, area);
    for (const CurvePoints& curve : shown.curves)
        paintCurve(graphics, curve, area);
    if (m_view.showsGhosts())
        paintGhosts(graphics, row, area);
}

void TrackLanes::paintWithoutSound(juce::Graphics& graphics, juce::Rectangle<int> area)
{
    const auto& stretches = m_view.change().withoutSound();
    const auto first = std::ranges::lower_bound(stretches, m_view.scale().secondsAt(-1.0), {}, &SpanIndex::Span::end);
    for (auto stretch = first; stretch != stretches.end(); ++stretch) {
        const Columns columns = LaneBlocks::columnsOf(*stretch, m_view.scale(), getWidth());
        if (columns.first >= getWidth())
            break;
        graphics.setTiledImageFill(m_hatch, 0, 0, 1.0F);
        graphics.fillRect(columns.first, area.getY(), columns.count(), area.getHeight());
    }
}

void TrackLanes::paintMarkers(juce::Graphics& graphics, const TrackRow& row, juce::Rectangle<int> area)
{
    const juce::Colour colour = MarkerSymbol::colourOf(row.markers);
    const int baseline = area.getCentreY() + NameBaseline;
    const int symbolTop = area.getCentreY() - MarkerSymbol::Size / 2;
    const auto places = markerPlaces(row.lane.spans(), m_view.scale(), getWidth());
    for (const auto& [index, columns, room] : places) {
        const bool isRange = row.lane.item(index).kind == Lane::Kind::RangeMarker;
        if (isRange) {
            graphics.setColour(colour.withAlpha(0.22F));
            graphics.fillRect(columns.first, area.getY() + 2, columns.count(), area.getHeight() - 4);
            graphics.setColour(colour.withAlpha(0.6F));
            graphics.fillRect(columns.end - 1, area.getY() + 2, 1, area.getHeight() - 4);
        }
        graphics.setColour(colour);
        graphics.fillRect(columns.first, area.getY() + 2, 1, area.getHeight() - 4);
        const int end = columns.first + room;
        int left = columns.first + 2;
        if (left >= 0) {
            if (end - left < MarkerSymbol::Size)
                continue;
            MarkerSymbol::draw(graphics, row.markers, static_cast<float>(left), static_cast<float>(symbolTop));
            left += MarkerSymbol::Size;
        } else if (!isRange) {
            continue;
        }
        left = std::max(left, 0) + NamePad;
        // The name of a range stays in sight for as long as the range does.
        const int nameEnd = (columns.first < 0 ? std::min(end, columns.end) : end) - NamePad;
        graphics.setColour(toColour(Palette::text));
        if (nameEnd - left >= LeastNameWidth)
            m_names.draw(graphics, row.lane.item(index).event->name(), static_cast<float>(left),
                         static_cast<float>(baseline), static_cast<float>(nameEnd - left));
    }
}

void TrackLanes::paintLane(juce::Graphics& graphics, const TrackRow& row, const Lane& lane, Columns shown,
                           juce::Rectangle<int> area)
{
    const LaneBlocks drawn(lane.spans(), m_view.scale(), shown, getWidth());
    int end = -LaneBlocks::Beyond;
    for (const LaneBlocks::Block& block : drawn.blocks) {
        // A block that lies on another one has an edge.
        if (block.columns.first < end) {
            graphics.setColour(toColour(TracksPalette::line));
            graphics.fillRect(block.columns.first - 1, area.getY(), block.columns.count() + 1, area.getHeight());
        }
        end = std::max(end, block.columns.end);
        paintBlock(graphics, row, lane, block, area);
    }
    for (const Columns& strip : drawn.strips) {
        graphics.setColour(toColour(stripColour(*row.track, strip)));
        graphics.fillRect(strip.first, area.getY(), strip.count(), area.getHeight());
    }
}

void TrackLanes::paintBlock(juce::Graphics& graphics, const TrackRow& row, const Lane& lane,
                            const LaneBlocks::Block& block, juce::Rectangle<int> area)
{
    const Lane::Item& item = lane.item(block.index);
    const SpanIndex::Span& span = lane.spans()[block.index];
    const bool isMarked = m_view.isShown(row, span);
    const BlockColours colours = coloursOf(*row.track, item.kind, isMarked);
    // Without a gap, a cut between two blocks could hardly be seen.
    area.setHorizontalRange({block.columns.first, block.columns.end - 1});
    const juce::Rectangle<int> whole = area;
    juce::Rectangle<int> band =
        area.removeFromTop(area.getHeight() < NameHeight + LeastBody ? area.getHeight() : NameHeight);
    graphics.setColour(toColour(colours.name));
    graphics.fillRect(band);
    if (!area.isEmpty()) {
        graphics.setColour(toColour(colours.body));
        graphics.fillRect(area);
        if (const Lane* const content = lane.contentOf(block.index)) {
            const Columns seen{std::max(whole.getX() + 1, 0), std::min(whole.getRight() - 1, getWidth())};
            if (seen.count() > 0) {
                const juce::Graphics::ScopedSaveState state(graphics);
                const auto inner = area.withTrimmedTop(2).withTrimmedBottom(2);
                graphics.reduceClipRegion(seen.first, inner.getY(), seen.count(), inner.getHeight());
                paintLane(graphics, row, *content, seen, inner);
            }
        } else if (row.track->kind() == Track::Kind::Video) {
            if (auto* const clip = dynamic_cast<standin::ClipEvent*>(item.event.get()))
                paintStills(graphics, row, *clip, span, area);
        }
    }
    if (item.kind == Lane::Kind::Part && whole.getWidth() > 4) {
        graphics.setColour(toColour(colours.name));
        graphics.drawRect(whole, 1);
    }
    if (item.event->selected()) {
        graphics.setColour(toColour(Palette::lightBlue));
        graphics.drawRect(whole, 2);
    }

    // The name stays in sight for as long as its clip does.
    int left = std::max(whole.getX(), 0) + NamePad;
    const int right = std::min(whole.getRight(), getWidth()) - NamePad;
    graphics.setColour(toColour(colours.text));
    const int baseline = band.getCentreY() + NameBaseline;
    if (item.kind == Lane::Kind::Part && right - left > 2 * LeastNameWidth) {
        // What is in it lies in layers.
        for (const int line : {0, 3, 6})
            graphics.fillRect(left, band.getCentreY() - 4 + line, 9 - line / 2, 1);
        left += 13;
    }
    if (right - left >= LeastNameWidth)
        m_names.draw(graphics, item.event->name(), static_cast<float>(left), static_cast<float>(baseline),
                     static_cast<float>(right - left));
}

void TrackLanes::paintStills(juce::Graphics& graphics, const TrackRow& row, standin::ClipEvent& event,
                             const SpanIndex::Span& span, juce::Rectangle<int> area)
{
    Stills* const stills = m_view.stills();
    standin::MediaClip* const clip = event.clip();
    if (!stills || !clip || clip->kind() != standin::MediaClip::Kind::Video)
        return;
    const auto starts = m_view.shotsIn(row, span, StillSpacing);
    const float pixelScale = graphics.getInternalContext().getPhysicalPixelScaleFactor();
    const double rate = m_view.clock().framerate().rate;
    for (std::size_t shot = 0; shot < starts.size(); ++shot) {
        const int left = LaneBlocks::columnsOf({starts[shot], starts[shot]}, m_view.scale(), getWidth()).first;
        const double end = shot + 1 < starts.size() ? starts[shot + 1] : span.end;
        const int right = LaneBlocks::columnsOf({end, end}, m_view.scale(), getWidth()).first - 1;
        if (right - left < LeastStill || right <= 0 || left >= getWidth())
            continue;
        const juce::Graphics::ScopedSaveState state(graphics);
        if (!graphics.reduceClipRegion(left, area.getY(), right - left, area.getHeight()))
            continue;
        const double place = event.sourceOffset() + std::max(starts[shot] - span.start, 0.0);
        const auto frame =
            static_cast<std::uint32_t>(std::clamp(std::floor((place + standin::SameInstant) * rate), 0.0,
                                                  static_cast<double>(std::numeric_limits<std::uint32_t>::max())));
        const int height = static_cast<int>(std::ceil(static_cast<float>(area.getHeight()) * pixelScale));
        const juce::Image still = stills->still(*clip, frame, height);
        if (!still.isValid())
            continue;
        const int width = still.getWidth() * area.getHeight() / std::max(still.getHeight(), 1);
        graphics.setOpacity(1.0F);
        graphics.drawImage(still, left, area.getY(), width, area.getHeight(), 0, 0, still.getWidth(),
                           still.getHeight());
    }
}

void TrackLanes::paintCurve(juce::Graphics& graphics, const CurvePoints& curve, juce::Rectangle<int> area)
{
    // Names stay readable above it; those of low rows, which have no room for both, through it.
    const bool isLow = area.getHeight() < NameHeight + LeastBody;
    if (!isLow)
        area.removeFromTop(NameHeight);
    const float top = static_cast<float>(area.getY() + CurveEdge);
    const float room = static_cast<float>(area.getHeight() - 2 * CurveEdge - 1);
    const auto y = [&](float value) { return top + (1.0F - value) * room; };
    graphics.setColour(colourOf(curve.number).withAlpha(isLow ? 0.4F : 0.85F));

    const TimeScale& scale = m_view.scale();
    const auto begin = curve.times.begin();
    const auto first = std::upper_bound(begin, curve.times.end(), scale.secondsAt(0.0)) - begin;
    const auto end = std::lower_bound(begin, curve.times.end(), scale.secondsAt(getWidth())) - begin;
    if ((end - first) * FewPoints > getWidth()) {
        const auto columns = curveColumns(curve, scale, getWidth());
        for (std::size_t column = 0; column < columns.size(); ++column) {
            const float high = y(columns[column].high);
            graphics.fillRect(static_cast<float>(column), high, 1.0F, y(columns[column].low) - high + 1.3F);
        }
        return;
    }
    juce::Path path;
    path.startNewSubPath(0.0F, y(valueOf(curve, scale.secondsAt(0.0))));
    for (auto point = first; point < end; ++point)
        path.lineTo(static_cast<float>(scale.pixelAt(curve.times[static_cast<std::size_t>(point)])),
                    y(curve.values[static_cast<std::size_t>(point)]));
    path.lineTo(static_cast<float>(getWidth()), y(valueOf(curve, scale.secondsAt(getWidth()))));
    graphics.strokePath(path, juce::PathStrokeType(1.3F));
}

void TrackLanes::paintGhosts(juce::Graphics& graphics, std::size_t row, juce::Rectangle<int> area)
{
    const LaneBlocks drawn(m_view.ghostsOf(row), m_view.scale(), getWidth());
    const Columns seen{0, getWidth()};
    const juce::Colour line = toColour(Palette::light).withAlpha(0.6F);
    const juce::Colour fill = toColour(Palette::light).withAlpha(0.07F);
    const auto paintGhost = [&](const Columns& columns) {
        graphics.setColour(fill);
        graphics.fillRect(columns.first, area.getY(), columns.count(), area.getHeight());
        graphics.setColour(line);
        drawDashes(graphics, columns, area.getY(), seen);
        drawDashes(graphics, columns, area.getBottom() - 1, seen);
        graphics.fillRect(columns.first, area.getY(), 1, area.getHeight());
        graphics.fillRect(columns.end - 1, area.getY(), 1, area.getHeight());
    };
    for (const LaneBlocks::Block& block : drawn.blocks)
        paintGhost(block.columns);
    for (const Columns& strip : drawn.strips)
        paintGhost(strip);
}

void TrackLanes::paintLines(juce::Graphics& graphics)
{
    const standin::Project& project = m_view.project();
    const auto paintLine = [&](double seconds, juce::Colour colour) {
        const double pixel = m_view.scale().pixelAt(seconds);
        if (pixel < -1.0 || pixel > getWidth())
            return;
        graphics.setColour(colour);
        graphics.fillRect(static_cast<int>(std::floor(pixel)), 0, 1, getHeight());
    };
    const double preview = m_view.previewOffset() - m_view.clock().origin();
    const double pixel = m_view.scale().pixelAt(preview);
    if (pixel < getWidth()) {
        graphics.setColour(toColour(Palette::orange).withAlpha(0.035F));
        const int first = static_cast<int>(std::max(std::floor(pixel), 0.0));
        graphics.fillRect(first, 0, getWidth() - first, getHeight());
    }
    if (project.locatorLeft().getValue() < project.locatorRight().getValue()) {
        paintLine(project.locatorLeft().getValue(), toColour(Palette::lightBlue).withAlpha(0.4F));
        paintLine(project.locatorRight().getValue(), toColour(Palette::lightBlue).withAlpha(0.4F));
    }
    paintLine(project.position().getValue(), toColour(Palette::light).withAlpha(0.9F));
}

void TrackLanes::mouseDown(const juce::MouseEvent& event)
{
    cadrel::gui::guardUser([&] {
        if (const auto row = m_view.rows().rowAt(event.y + m_view.rowOffset()))
            m_view.clicked(*row, event.x);
    });
}

} // namespace desktop
