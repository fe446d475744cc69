// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/services/VideoTrackHandlerBase.h"
#include "host/track/HostEvent.h"
#include "host/track/ProjectListener.h"
#include "host/track/Track.h"
#include "host/video/VideoSourceBase.h"

#include <cstdint>

namespace cadrel::host {

class VideoTrackHandler;

/// The picture that stands on a video track.
class TrackVideoSource : public VideoSourceBase, public gui::VideoTrackHandlerBase::Listener, public ProjectListener {
public:
    /// The track of that mode. The handler outlives the source.
    TrackVideoSource(VideoTrackHandler& handler, std::int32_t mode);
    ~TrackVideoSource() override;

    /// Of the clip that plays in the middle of the frame, the one that began last of several. `lastFrame` is ignored, as the
    /// time is that of the frame itself. None from a track on which the user has put another video.
    VideoFrame getFrame(bool lastFrame, double time) override;

    void tracksChanged() override;
    void projectChanging(Project&) override {}
    void projectChanged(Project& project) override;

private:
    /// Empty without one.
    HostEvent eventPlayedAt(double time) const;

    VideoTrackHandler& m_handler;
    Track m_track;
    std::int32_t m_mode;
};

} // namespace cadrel::host
