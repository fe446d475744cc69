// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/cut/MarkerTrack.h"
#include "host/border/FirstFailure.h"
#include "host/border/HostFailure.h"
#include "host/project/Project.h"
#include "velmark/Editing.h"

#include <algorithm>

using namespace Velmark;

namespace cadrel::host {

namespace {

/// Beside the role a stored value has bits that say more.
constexpr std::int32_t RoleBits = 0xff;

} // namespace

void Project::createMarkerTracks(IEditTransaction& transaction)
{
    findOrCreateTrack(transaction, m_folderTrack, TypeWord::Folder, TrackRole::Markers);
    findMarkerTracks();
    for (const core::MarkerTrack& track : core::MarkerTracks) {
        if (track.isOn(m_model.settings()))
            findOrCreateMarkerTrack(transaction, track.role);
    }
    // The ids identify the copies in a preview. A copy keeps its id, so several memos may have the same one.
    if (hasPreviewOffset())
        markerTrack(TrackRole::Memos).assignOwnIds(0.0, previewOffset() - timeOrigin());
}

void Project::createVideoTracks(IEditTransaction& transaction)
{
    if (m_model.videoList().isEmpty())
        return;
    Track video;
    findOrCreateTrack(transaction, video, TypeWord::Video, TrackRole::NewVideo);
}

void Project::setTracksLocked(bool lock)
{
    const auto setLock = [lock](Track& track) {
        if (track.isAlive() && (track.hasLockState() || (lock && !track.hostLocked())))
            track.setLock(lock);
    };
    FirstFailure failure;
    for (Track& track : m_lockedTracks)
        failure.ofStep([&] { setLock(track); });
    failure.ofStep([this] { findMarkerTracks(); });
    // The user goes on to write memos in a preview.
    for (std::int32_t role = TrackRole::Destination; role < TrackRole::Memos; ++role)
        failure.ofStep([&] { setLock(markerTrack(role)); });
    failure.ofStep([&] {
        Track video = newVideoTrack();
        setLock(video);
    });
    failure.raise();
}

void Project::collectLockTracks()
{
    m_lockedTracks = tracksOfTheUser();
    std::erase_if(m_lockedTracks, [this](const Track& track) { return !isWanted(track) || track.hostLocked(); });
}

std::vector<Track> Project::tracksOfTheUser()
{
    findMarkerTracks();
    std::vector<Track> tracks = cadrelTracks();
    std::erase_if(
        tracks, [this, video = newVideoTrack()](const Track& track) { return isMarkerTrack(track) || track == video; });
    return tracks;
}

void Project::findLockedTracks()
{
    for (const Track& track : cadrelTracks()) {
        if (track.hasLockState() && std::ranges::find(m_lockedTracks, track) == m_lockedTracks.end())
            m_lockedTracks.push_back(track);
    }
}

bool Project::isMarkerTrack(const Track& track) const
{
    return std::ranges::find(m_markerTracks, track) != m_markerTracks.end();
}

bool Project::isMarkerTrackOfRuns(const Track& track) const
{
    return isMarkerTrack(track) && !(track == m_markerTracks.back());
}

Track Project::newVideoTrack()
{
    Track video;
    findTrack(video, TypeWord::Video, TrackRole::NewVideo);
    return video;
}

void Project::findMarkerTracks()
{
    if (std::ranges::all_of(m_markerTracks, &Track::isAlive))
        return;
    for (const Track& candidate : tracksOfType(TypeWord::Marker)) {
        const std::int32_t role = candidate.role() & RoleBits;
        if (role >= TrackRole::Destination && role <= TrackRole::LastMarker && !markerTrack(role).isAlive())
            markerTrack(role) = candidate;
    }
}

bool Project::findTrack(Track& slot, const char* word, std::int32_t role)
{
    if (slot.isAlive())
        return true;
    const std::vector<Track> candidates = tracksOfType(word);
    const auto found =
        std::ranges::find_if(candidates, [role](const Track& candidate) { return candidate.hasRole(role, RoleBits); });
    if (found == candidates.end())
        return false;
    slot = *found;
    return true;
}

void Project::findOrCreateTrack(IEditTransaction& transaction, Track& slot, const char* word, std::int32_t role)
{
    if (findTrack(slot, word, role))
        return;
    Track created = createTrack(word);
    insertTrack(transaction, required(containerOf(nullptr)).get(), created, role);
    slot = created;
}

void Project::findOrCreateMarkerTrack(IEditTransaction& transaction, std::int32_t role)
{
    const auto folder = required(query<IProjectNode>(m_folderTrack.node()));
    Track& slot = markerTrack(role);
    if (!findTrack(slot, TypeWord::Marker, role)) {
        // The host may have a marker track that isn't used yet.
        const auto unused = query<IProjectNode>(m_document->getDefaultMarkerTrack());
        Track created = unused && !unused->getParent() ? Track(this, required(query<ITrackNode>(unused)).get())
                                                       : createTrack(TypeWord::Marker);
        insertTrack(transaction, m_folderTrack.container().get(), created, role);
        slot = created;
    } else if (required(query<IProjectNode>(slot.node()))->getParent() != folder.get()) {
        requireOk(transaction.move(required(containerOf(nullptr)).get(), m_folderTrack.container().get(), slot.node()));
    }
}

Track Project::createTrack(const char* word)
{
    const auto created = required(Counted<FUnknown>::adopt(m_document->createTrack(word)));
    return Track(this, required(query<ITrackNode>(created)).get());
}

void Project::insertTrack(IEditTransaction& transaction, FUnknown* parent, Track& track, std::int32_t role)
{
    // Only what is in the project has a name in it.
    requireOk(transaction.insert(parent, track.node()));
    track.setName(TrackRole::nameOf(role));
    track.setRole(role);
    if (m_trackCache)
        m_trackCache->push_back(Counted<ITrackNode>::share(track.node()));
}

} // namespace cadrel::host
