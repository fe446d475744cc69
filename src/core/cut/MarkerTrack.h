// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/MarkerEntry.h"
#include "core/settings/Settings.h"
#include "util/Result.h"

#include <algorithm>
#include <array>
#include <cstdint>

namespace cadrel::core {

/// A marker track of the project: for one kind of marker, for the stretches that were carried over, or for the user's
/// memos. A new kind is a MarkerKind and a line of the table below.
struct MarkerTrack {
    std::int32_t kind;               ///< of the entries that are written there, a MarkerKind; NoKind where none is
    std::int32_t role;               ///< the number that is stored with the track
    const wchar_t* name;             ///< not translated
    Option<bool> Settings::*setting; ///< what switches it on; null: it is always on

    static constexpr std::int32_t NoKind = 0;

    bool isOn(const Settings& settings) const { return !setting || (settings.*setting)(); }

    /// Throws Result::InvalidArgument for a number that is no MarkerKind.
    static constexpr const MarkerTrack& ofKind(std::int32_t kind);
    /// Null for another role.
    static constexpr const MarkerTrack* ofRole(std::int32_t role);
};

/// From top to bottom.
inline constexpr std::array MarkerTracks{
    MarkerTrack{MarkerTrack::NoKind, 1, L"Destination", &Settings::createDestinationMarkers},
    MarkerTrack{MarkerKind::Insert, 3, L"Insert", &Settings::createInsertMarkers},
    MarkerTrack{MarkerKind::DissolveWipe, 2, L"Dissolve/Wipe", &Settings::createDissolveWipeMarkers},
    MarkerTrack{MarkerKind::AutomationWarning, 4, L"Automation Warning", &Settings::createAutomationWarningMarkers},
    MarkerTrack{MarkerKind::AudioSnippet, 5, L"Audio Snippet", &Settings::createAudioSnippetMarkers},
    MarkerTrack{MarkerKind::Overlap, 6, L"Overlap", &Settings::createOverlapMarkers},
    MarkerTrack{MarkerTrack::NoKind, 7, L"Memos", nullptr},
};

constexpr const MarkerTrack& MarkerTrack::ofKind(std::int32_t kind)
{
    const auto found = std::ranges::find(MarkerTracks, kind, &MarkerTrack::kind);
    if (kind == NoKind || found == MarkerTracks.end())
        throw util::Result::InvalidArgument;
    return *found;
}

constexpr const MarkerTrack* MarkerTrack::ofRole(std::int32_t role)
{
    const auto found = std::ranges::find(MarkerTracks, role, &MarkerTrack::role);
    return found != MarkerTracks.end() ? &*found : nullptr;
}

} // namespace cadrel::core
