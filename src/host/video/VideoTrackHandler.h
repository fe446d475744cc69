// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/services/VideoTrackHandlerBase.h"
#include "host/track/ProjectListener.h"
#include "host/track/Track.h"
#include "util/ListenerSet.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>

namespace cadrel::host {

/// The channels over the video tracks of a project. What a track carries is kept in its role. A track without a
/// role is never that of the new picture, on which runs write. If no track has the role of the old picture, the first
/// channel counts as the old picture.
class VideoTrackHandler : public gui::VideoTrackHandlerBase, public ProjectListener {
public:
    static constexpr std::size_t ChannelCount = 2;

    VideoTrackHandler() = default;
    VideoTrackHandler(const VideoTrackHandler&) = delete;
    VideoTrackHandler& operator=(const VideoTrackHandler&) = delete;

    bool isAvailable(std::size_t channel) override;
    /// Empty without a track.
    std::wstring getName(std::size_t channel) override;
    std::int32_t getMode(std::size_t channel) override;
    void setMode(std::size_t channel, std::int32_t mode) override;
    void addListener(Listener* listener) override { m_listeners.add(listener); }
    void removeListener(Listener* listener) override { m_listeners.remove(listener); }
    std::size_t channelCount() const override { return ChannelCount; }

    /// Whether the user has put another video on the track than the picture that it stands for.
    static bool isTurnedOff(const Track& track);

    /// The track of that mode, an empty handle when there is none. A lenient search for Old or New also takes one that is
    /// turned off, and one for OldOff or NewOff one that isn't. Where no track has the role of the old picture, Old finds the
    /// first channel's, unless that is the new picture's. Throws Result::NotAvailable for these two when no track has
    /// a role for that picture.
    Track trackFor(std::int32_t mode, bool lenient);

    /// Puts the first two video tracks of the project on the channels; null empties them. Where there are more, the first
    /// track of the old picture and the first of the new one go before all others.
    void rebuild(Project* project);

    void projectChanging(Project&) override {}
    /// Rebuilds when tracks have come or gone.
    void projectChanged(Project& project) override;

private:
    Track& track(std::size_t channel);
    void tellListeners();

    std::array<Track, ChannelCount> m_tracks;
    util::ListenerSet<Listener> m_listeners;
};

} // namespace cadrel::host
