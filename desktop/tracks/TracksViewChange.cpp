// SPDX-License-Identifier: GPL-3.0-or-later

// What the view of the tracks shows of the change: where clips stood, the event that moved each, and the cuts of the picture.

#include "desktop/tracks/TrackLanes.h"
#include "desktop/tracks/TracksView.h"
#include "standin/base/Times.h"
#include "standin/project/Project.h"

#include <algorithm>
#include <cmath>

namespace desktop {

void TracksView::setChange(ChangeMap change)
{
    m_change = std::move(change);
    m_shownEvent.reset();
    m_ghosts.clear();
    m_ghosts.resize(m_index.rows().size());
    repaint();
}

void TracksView::setGhosts(bool shown)
{
    m_showsGhosts = shown;
    m_lanes->repaint();
}

void TracksView::showEvent(std::optional<std::size_t> event, bool scrolls)
{
    update();
    m_shownEvent = event;
    const bool isInPreview = showsPreviewPlace() && isPreviewPlayed();
    const auto programme = isInPreview ? ChangeMap::State::Carried : m_change.state();
    if (const auto place = event && scrolls ? m_change.placeOf(*event, programme) : std::nullopt) {
        const double start = place->start + (isInPreview ? previewOffset() : 0.0);
        const double first = m_scale.pixelAt(start);
        // What is seen stays as it is if the event begins in it. Else it shows something before the event, too.
        if (first < 0.0 || first > 0.9 * viewWidth())
            scrollTo(start - 0.2 * viewWidth() * m_scale.secondsPerPixel());
    }
    m_lanes->repaint();
}

bool TracksView::isPreviewPlayed()
{
    return m_index.preview() && m_project.cycleLeft().getValue() >= previewOffset() - m_clock.origin();
}

const SpanIndex& TracksView::ghostsOf(std::size_t row)
{
    update();
    std::unique_ptr<SpanIndex>& ghosts = m_ghosts[row];
    if (!ghosts)
        ghosts = std::make_unique<SpanIndex>(findGhosts(m_index.rows()[row]));
    return *ghosts;
}

SpanIndex TracksView::findGhosts(const TrackRow& row) const
{
    struct Ghost {
        SpanIndex::Span place;
        const std::u16string* name;
    };
    std::vector<Ghost> ghosts;
    const Lane& lane = row.lane;
    for (std::size_t index = 0; index < lane.size() && stateOf(row) == ChangeMap::State::Carried; ++index) {
        for (const SpanIndex::Span& place : m_change.formerPlaces(lane.spans()[index]))
            ghosts.push_back({place, &lane.item(index).event->name()});
    }
    std::ranges::stable_sort(ghosts, {}, [](const Ghost& ghost) { return ghost.place.start; });
    std::vector<SpanIndex::Span> places;
    const std::u16string* lastName = nullptr;
    for (const auto& [place, name] : ghosts) {
        // Pieces of what was one clip.
        if (lastName && *lastName == *name && std::abs(places.back().end - place.start) < standin::SameInstant)
            places.back().end = place.end;
        else
            places.push_back(place);
        lastName = name;
    }
    return SpanIndex(std::move(places));
}

ChangeMap::State TracksView::stateOf(const TrackRow& row) const
{
    return row.track->isLocked() ? ChangeMap::State::Planned : m_change.state();
}

std::optional<std::size_t> TracksView::eventOf(const TrackRow& row, SpanIndex::Span clip)
{
    if (m_change.isEmpty())
        return std::nullopt;
    ChangeMap::State programme = stateOf(row);
    const double offset = previewOffset();
    if (clip.start >= offset - m_clock.origin()) {
        clip = {clip.start - offset, clip.end - offset};
        programme = ChangeMap::State::Carried;
    }
    return m_change.eventOf(clip, programme);
}

bool TracksView::isShown(const TrackRow& row, const SpanIndex::Span& clip)
{
    return m_shownEvent && eventOf(row, clip) == m_shownEvent;
}

std::vector<double> TracksView::shotsIn(const TrackRow& row, const SpanIndex::Span& clip, int spacing)
{
    const double first = std::max(clip.start, m_scale.left());
    const double last = std::min(clip.end, m_scale.secondsAt(viewWidth()));
    const double previewStart = previewOffset() - m_clock.origin();
    const double offset = clip.start >= previewStart ? previewOffset() : 0.0;
    const bool showsNewCut = row.isNewPicture || offset > 0.0;
    std::vector<double> starts;
    const std::vector<double>& cuts = m_change.cuts(showsNewCut ? ChangeMap::State::Carried : stateOf(row));
    if (!cuts.empty()) {
        // The shot that runs at the left edge begins before it.
        auto cut = std::upper_bound(cuts.begin(), cuts.end(), first - offset);
        starts.push_back(cut == cuts.begin() ? clip.start : std::max(*std::prev(cut) + offset, clip.start));
        for (; cut != cuts.end() && *cut + offset < last; ++cut)
            starts.push_back(*cut + offset);
        // Ends the last one that is seen.
        if (cut != cuts.end() && *cut + offset < clip.end)
            starts.push_back(*cut + offset);
        return starts;
    }
    // At places that don't move when the view is scrolled.
    const double step = std::exp2(std::ceil(std::log2(spacing * m_scale.secondsPerPixel())));
    double number = std::max(std::floor((first - clip.start) / step), 0.0);
    for (double start = clip.start + number * step; start <= last; start = clip.start + number * step) {
        starts.push_back(start);
        number += 1.0;
    }
    return starts;
}

} // namespace desktop
