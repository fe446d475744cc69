// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/video/TrackVideoSource.h"

#include "core/time/Timecode.h"
#include "host/track/Instant.h"
#include "host/video/VideoTrackHandler.h"

namespace cadrel::host {

using core::Timecode;

TrackVideoSource::TrackVideoSource(VideoTrackHandler& handler, std::int32_t mode) : m_handler(handler), m_mode(mode)
{
    m_handler.addListener(this);
    m_track = m_handler.trackFor(m_mode, true);
}

TrackVideoSource::~TrackVideoSource()
{
    m_handler.removeListener(this);
}

HostEvent TrackVideoSource::eventPlayedAt(double time) const
{
    HostEvent played;
    const double middle = time + 0.5 / Timecode::framerate().rate;
    for (const HostEvent& event : m_track.clipEvents()) {
        const bool isPlayed = !isBefore(middle, event.getStart()) && isBefore(middle, event.getEnd());
        if (isPlayed && (!played || isBefore(played.getStart(), event.getStart())))
            played = event;
    }
    return played;
}

VideoFrame TrackVideoSource::getFrame(bool /*lastFrame*/, double time)
{
    if (VideoTrackHandler::isTurnedOff(m_track))
        return {};
    const HostEvent event = eventPlayedAt(time);
    if (!event || !event.isClip())
        return {};
    auto clip = event.getClip();
    if (!clip)
        return {};
    const double sourceTime = time - event.getStart() + event.getSourceOffset();
    const std::int32_t frame = Timecode::secondsToFrames(Timecode::framerate(), sourceTime);
    if (frame < 0 || static_cast<std::uint32_t>(frame) > clip->getFrameCount())
        return {};
    return {std::move(clip), static_cast<std::uint32_t>(frame)};
}

void TrackVideoSource::tracksChanged()
{
    m_track = m_handler.trackFor(m_mode, true);
    notify();
}

void TrackVideoSource::projectChanged(Project& /*project*/)
{
    if (m_track.isAlive() && m_track.hasChanged())
        notify();
}

} // namespace cadrel::host
