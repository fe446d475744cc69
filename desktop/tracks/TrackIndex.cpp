// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/TrackIndex.h"

#include "core/cut/MarkerTrack.h"
#include "host/track/TrackRole.h"
#include "standin/project/Envelope.h"
#include "standin/project/Marker.h"
#include "standin/project/Part.h"
#include "standin/project/Project.h"
#include "velmark/Attributes.h"

#include <algorithm>
#include <variant>

namespace desktop {

using cadrel::core::MarkerKind;
using cadrel::core::MarkerTrack;
using cadrel::host::TrackRole;
using standin::Container;
using standin::Event;
using standin::Node;
using standin::Track;
using Velmark::Counted;

namespace {

/// What is further than this from the programme, in seconds, is a preview of it or a film of its own.
constexpr double FarAway = 12.0 * 3600.0;

Lane::Kind kindOf(const Event& event)
{
    if (dynamic_cast<const standin::Part*>(&event))
        return Lane::Kind::Part;
    if (const auto* const marker = dynamic_cast<const standin::Marker*>(&event))
        return marker->isRange() ? Lane::Kind::RangeMarker : Lane::Kind::PointMarker;
    return Lane::Kind::Clip;
}

CurvePoints pointsOf(const standin::Envelope& curve)
{
    CurvePoints points;
    points.number = curve.number();
    points.times.reserve(curve.childCount());
    points.values.reserve(curve.childCount());
    for (const standin::AutomationPoint* point = curve.firstPoint(); point; point = curve.pointBehind(*point)) {
        points.times.push_back(point->start());
        points.values.push_back(static_cast<float>(point->value()));
    }
    return points;
}

/// What a run uses the track for, a TrackRole, as an attribute says; nothing for other tracks.
std::optional<std::int32_t> roleOf(const Track& track, const char* attribute)
{
    const auto found = track.attributes().find(attribute);
    const auto* const role =
        found != track.attributes().end() ? std::get_if<Velmark::int64>(&found->second.value) : nullptr;
    return role ? std::optional(static_cast<std::int32_t>(*role)) : std::nullopt;
}

bool isNewPicture(const Track& track)
{
    const std::optional<std::int32_t> role = roleOf(track, Velmark::AttributeKey::VideoType);
    return role && (*role & ~TrackRole::OwnVideo) == TrackRole::NewVideo;
}

MarkerLook lookOf(const Track& track)
{
    const std::optional<std::int32_t> role = roleOf(track, Velmark::AttributeKey::MarkerType);
    if (!role)
        return MarkerLook::User;
    const MarkerTrack* const markers = MarkerTrack::ofRole(*role);
    if (!markers)
        return MarkerLook::User;
    switch (markers->kind) {
    case MarkerKind::Insert:
        return MarkerLook::Insert;
    case MarkerKind::DissolveWipe:
        return MarkerLook::DissolveWipe;
    case MarkerKind::AutomationWarning:
        return MarkerLook::AutomationWarning;
    case MarkerKind::AudioSnippet:
        return MarkerLook::AudioSnippet;
    case MarkerKind::Overlap:
        return MarkerLook::Overlap;
    default:
        return markers == &cadrel::core::MarkerTracks.front() ? MarkerLook::Destination : MarkerLook::Memo;
    }
}

} // namespace

Lane::Lane(const Container& container, double origin)
{
    std::vector<SpanIndex::Span> spans;
    spans.reserve(container.childCount());
    m_items.reserve(container.childCount());
    for (Node* child = container.firstChild(); child; child = container.childBehind(*child)) {
        auto& event = static_cast<Event&>(*child);
        const double start = origin + event.start();
        spans.push_back({start, std::max(start, origin + event.end())});
        std::int32_t content = -1;
        const Kind kind = kindOf(event);
        if (kind == Kind::Part && event.childCount() > 0) {
            content = static_cast<std::int32_t>(m_contents.size());
            m_contents.emplace_back(event, start);
        }
        m_items.push_back({Counted<Event>::share(&event), kind, content});
    }
    m_spans = SpanIndex(std::move(spans));
}

TrackIndex::TrackIndex(const standin::Project& project)
{
    for (Track* const track : project.allTracks()) {
        TrackRow row;
        row.track = Counted<Track>::share(track);
        for (const Container* around = track->parent(); around && around != &project; around = around->parent())
            ++row.depth;
        if (!track->isFolder()) {
            row.lane = Lane(*track, 0.0);
            row.markers = lookOf(*track);
            row.isNewPicture = isNewPicture(*track);
        }
        for (const auto& [number, curve] : track->curves()) {
            if (curve->firstPoint())
                row.curves.push_back(pointsOf(*curve));
        }
        m_rows.push_back(std::move(row));
    }
    findStretches();
}

void TrackIndex::findStretches()
{
    std::vector<SpanIndex::Span> all;
    for (const TrackRow& row : m_rows) {
        const SpanIndex& spans = row.lane.spans();
        for (std::size_t index = 0; index < spans.size(); ++index) {
            // What lies close together on a track is one stretch here, so that there is little to sort.
            if (index > 0 && spans[index].start - all.back().end < FarAway)
                all.back().end = std::max(all.back().end, spans[index].end);
            else
                all.push_back(spans[index]);
        }
    }
    std::ranges::sort(all, {}, &SpanIndex::Span::start);
    for (const SpanIndex::Span& span : all) {
        if (!m_programme) {
            m_programme = {span.start, span.end};
        } else if (!m_preview && span.start - m_programme->end < FarAway) {
            m_programme->end = std::max(m_programme->end, span.end);
        } else if (!m_preview) {
            m_preview = {span.start, span.end};
        } else {
            m_preview->end = std::max(m_preview->end, span.end);
        }
    }
}

} // namespace desktop
