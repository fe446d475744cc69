// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/VideoList.h"
#include "core/time/SecondsRange.h"
#include "gui/services/VideoTrackHandlerBase.h"
#include "host/track/Track.h"
#include "host/video/VideoWriting.h"
#include "velmark/Counted.h"

#include <cstdint>
#include <vector>

namespace Velmark {
class IEditTransaction;
class IHostContext;
class IMediaClip;
class IProjectNode;
} // namespace Velmark

namespace cadrel::host {

class PoolVideoSource;
class VideoTrackHandler;

/// Writes the videos of a source as events on a video track.
class VideoSourceTrack : public gui::VideoTrackHandlerBase::Listener {
public:
    /// The track of that mode. All outlive this object.
    VideoSourceTrack(Velmark::IHostContext* context, PoolVideoSource& source, VideoTrackHandler& handler,
                     std::int32_t mode);
    VideoSourceTrack(const VideoSourceTrack&) = delete;
    VideoSourceTrack& operator=(const VideoSourceTrack&) = delete;
    ~VideoSourceTrack() override;

    /// How much later than in the list the videos are written, in seconds.
    void setOffset(double seconds) { m_offset = seconds; }
    /// Replaces what stands on the track by the videos of the list; does nothing for an empty one, nor on a track on which
    /// the user has put another video. With an offset only what starts there or later is replaced, because the real
    /// programme isn't written. What would lie before the time origin is left out, with and without an offset.
    VideoWriting writeVideoEvents(Velmark::IEditTransaction& transaction);

    void tracksChanged() override;

private:
    /// One of the list that has a place on the track.
    struct Video {
        const core::VideoList::Entry* entry;
        core::SecondsRange place; ///< of its whole length, in seconds of the project's clock
        double missing;           ///< seconds at its start for which there is no room
    };

    std::vector<Video> videosOnTrack(const core::VideoList& list) const;
    /// The clip may be null.
    void insert(Velmark::IEditTransaction& transaction, const Video& video,
                const Velmark::Counted<Velmark::IMediaClip>& clip);
    void clear(Velmark::IEditTransaction& transaction);
    /// Inserts an event at its start, without so many seconds of it there. The host cuts it on a track of its own, so that
    /// nothing else changes.
    void insertWithoutStart(Velmark::IEditTransaction& transaction, Velmark::IProjectNode& event, double missing);

    Velmark::IHostContext* m_hostContext;
    PoolVideoSource& m_source;
    VideoTrackHandler& m_handler;
    Track m_track;
    std::int32_t m_mode;
    double m_offset = 0.0;
};

} // namespace cadrel::host
