// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/MarkerTrack.h"

#include <cstdint>
#include <string>

namespace cadrel::host {

/// What a track is for that the system writes on. The number is stored with the track.
struct TrackRole {
    enum Type : std::int32_t {
        Destination = core::MarkerTracks.front().role,
        DissolveWipe = core::MarkerTrack::ofKind(core::MarkerKind::DissolveWipe).role,
        Insert = core::MarkerTrack::ofKind(core::MarkerKind::Insert).role,
        AutomationWarning = core::MarkerTrack::ofKind(core::MarkerKind::AutomationWarning).role,
        AudioSnippet = core::MarkerTrack::ofKind(core::MarkerKind::AudioSnippet).role,
        Overlap = core::MarkerTrack::ofKind(core::MarkerKind::Overlap).role,
        Memos = core::MarkerTracks.back().role,
        NewVideo = 8,
        Markers = 9, ///< the folder of the marker tracks
        OldVideo = 10,
    };
    /// The roles from Destination to this one are marker tracks.
    static constexpr std::int32_t LastMarker = Memos;
    /// Beside the role of a video track: the user has put another video there.
    static constexpr std::int32_t OwnVideo = 0x100;

    /// The name of a track of that role, translated; "INVALID!" for any other number.
    static std::wstring nameOf(std::int32_t role);
};

} // namespace cadrel::host
