// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/RunMaterial.h"

#include "core/settings/Settings.h"
#include "host/track/TrackRole.h"
#include "velmark/Attributes.h"

#include <algorithm>
#include <optional>
#include <variant>

namespace cadrel::app {

using core::SecondsRange;
using host::TrackRole;
using standin::Track;

namespace {

bool canBeChanged(const Track& track)
{
    return !track.isFolder() && track.kind() != Track::Kind::Ruler && !track.isLocked();
}

bool isChanged(const Track& track, const core::Settings& settings)
{
    if (!canBeChanged(track) || isMarkedByRuns(track))
        return false;
    const bool isWanted = settings.applyTo() != core::ApplyTo::SelectedTracks || track.selected();
    return isWanted || markerRoleOf(track) == TrackRole::Memos;
}

/// Parts and what lies in them.
void addEvents(const Track& track, double origin, std::vector<SecondsRange>& stretches)
{
    const auto visit = [&](const PlacedEvent& placed) {
        stretches.push_back({origin + placed.start, origin + std::max(placed.start, placed.end)});
    };
    visitAllEvents(track, 0.0, 0, visit);
}

void addPoints(const Track& track, double origin, std::vector<SecondsRange>& stretches)
{
    for (const auto& [number, curve] : track.curves()) {
        for (const standin::AutomationPoint* point = curve->firstPoint(); point; point = curve->pointBehind(*point))
            stretches.push_back({origin + point->start(), origin + point->start()});
    }
}

} // namespace

std::vector<SecondsRange> RunMaterial::stretches() const
{
    std::vector<SecondsRange> stretches;
    for (const Track* const track : tracksOf(m_project)) {
        if (!isChanged(*track, m_settings))
            continue;
        addEvents(*track, m_project.timeOrigin(), stretches);
        addPoints(*track, m_project.timeOrigin(), stretches);
    }
    return stretches;
}

std::vector<SecondsRange> RunMaterial::sound() const
{
    std::vector<SecondsRange> stretches;
    for (const Track* const track : tracksOf(m_project)) {
        if (track->kind() == Track::Kind::Audio)
            addEvents(*track, m_project.timeOrigin(), stretches);
    }
    return stretches;
}

bool RunMaterial::hasTracks() const
{
    const Tracks tracks = tracksOf(m_project);
    return std::any_of(tracks.begin(), tracks.end(),
                       [](const Track* track) { return canBeChanged(*track) && !isMarkedByRuns(*track); });
}

std::optional<std::int64_t> markerRoleOf(const Track& track)
{
    const auto attribute = track.attributes().find(Velmark::AttributeKey::MarkerType);
    if (attribute == track.attributes().end())
        return std::nullopt;
    const auto* role = std::get_if<Velmark::int64>(&attribute->second.value);
    return role ? std::optional<std::int64_t>(*role) : std::nullopt;
}

bool isMarkedByRuns(const Track& track)
{
    const auto role = markerRoleOf(track);
    return role && *role >= TrackRole::Destination && *role <= TrackRole::Overlap;
}

} // namespace cadrel::app
