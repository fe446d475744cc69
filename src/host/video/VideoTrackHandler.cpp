// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/video/VideoTrackHandler.h"

#include "host/border/HostFailure.h"
#include "host/project/Project.h"
#include "host/track/TrackRole.h"
#include "util/Result.h"
#include "velmark/Project.h"
#include "velmark/ProjectNode.h"

#include <algorithm>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

using util::Result;

namespace {

/// The role of a video track, without what its user has said about it; -1 for a track without a role.
std::int32_t pictureOf(const Track& track)
{
    constexpr std::int32_t PictureBits = 0xff;
    const std::int32_t role = track.role();
    return role < 0 ? role : role & PictureBits;
}

bool hasPicture(const Track& track)
{
    const std::int32_t picture = pictureOf(track);
    return picture == TrackRole::OldVideo || picture == TrackRole::NewVideo;
}

/// What the user has said about a picture of the track stays.
void givePicture(Track& track, std::int32_t picture)
{
    track.setRole(picture | (hasPicture(track) ? track.role() & TrackRole::OwnVideo : 0));
}

std::int32_t roleOf(std::int32_t mode)
{
    using Mode = VideoTrackHandler::Mode;
    switch (mode) {
    case Mode::Old:
        return TrackRole::OldVideo;
    case Mode::New:
        return TrackRole::NewVideo;
    case Mode::OldOff:
        return TrackRole::OldVideo | TrackRole::OwnVideo;
    case Mode::NewOff:
        return TrackRole::NewVideo | TrackRole::OwnVideo;
    default:
        throw Result::InvalidArgument;
    }
}

} // namespace

bool VideoTrackHandler::isAvailable(std::size_t channel)
{
    return track(channel).isAlive();
}

std::wstring VideoTrackHandler::getName(std::size_t channel)
{
    return track(channel).getName();
}

std::int32_t VideoTrackHandler::getMode(std::size_t channel)
{
    const Track& asked = track(channel);
    if (!asked.isAlive())
        return Mode::None;
    switch (pictureOf(asked)) {
    case TrackRole::OldVideo:
        return isTurnedOff(asked) ? Mode::OldOff : Mode::Old;
    case TrackRole::NewVideo:
        return isTurnedOff(asked) ? Mode::NewOff : Mode::New;
    default:
        return Mode::None;
    }
}

void VideoTrackHandler::setMode(std::size_t channel, std::int32_t mode)
{
    Track& changed = track(channel);
    const bool wasNew = pictureOf(changed) == TrackRole::NewVideo;
    changed.setRole(roleOf(mode));
    Track& other = track(ChannelCount - 1 - channel);
    if (mode == Mode::New && other.isAlive())
        givePicture(other, TrackRole::OldVideo);
    else if (mode == Mode::Old && pictureOf(other) == TrackRole::OldVideo)
        // What stands on the track of the new picture is replaced by runs. So it is one that was named for a picture
        // before, and gets this one in exchange.
        wasNew ? givePicture(other, TrackRole::NewVideo) : other.removeRole();
    tellListeners();
}

bool VideoTrackHandler::isTurnedOff(const Track& track)
{
    return track.hasRole(TrackRole::OwnVideo, TrackRole::OwnVideo);
}

Track VideoTrackHandler::trackFor(std::int32_t mode, bool lenient)
{
    const std::int32_t role = roleOf(mode);
    const std::int32_t picture = role & ~TrackRole::OwnVideo;
    for (const Track& candidate : m_tracks) {
        if (pictureOf(candidate) == picture)
            return lenient || candidate.role() == role ? candidate : Track();
    }
    switch (mode) {
    case Mode::Old:
        return !hasPicture(m_tracks[0]) ? m_tracks[0] : Track();
    case Mode::New:
        return {};
    default:
        throw Result::NotAvailable;
    }
}

void VideoTrackHandler::rebuild(Project* project)
{
    std::vector<Track> tracks = project ? project->tracksOfType(TypeWord::Video) : std::vector<Track>();
    // Of more than two, at least one has no picture or that of an earlier track.
    while (tracks.size() > ChannelCount) {
        const auto isFirstOfItsPicture = [&tracks](const Track& track) {
            return hasPicture(track) && std::ranges::find(tracks, pictureOf(track), pictureOf)->node() == track.node();
        };
        tracks.erase(std::find_if_not(tracks.rbegin(), tracks.rend(), isFirstOfItsPicture).base() - 1);
    }
    tracks.resize(ChannelCount);
    std::copy(tracks.begin(), tracks.end(), m_tracks.begin());
    tellListeners();
}

void VideoTrackHandler::projectChanged(Project& project)
{
    const auto root = required(query<IProjectNode>(project.document()));
    if ((root->changeFlags() & ChangeFlag::Children) != 0)
        rebuild(&project);
}

Track& VideoTrackHandler::track(std::size_t channel)
{
    if (channel >= ChannelCount)
        throw Result::InvalidArgument;
    return m_tracks[channel];
}

void VideoTrackHandler::tellListeners()
{
    m_listeners.forEach([](Listener& listener) { listener.tracksChanged(); });
}

} // namespace cadrel::host
