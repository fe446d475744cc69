// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/OwnStorage.h"

#include "standin/ardour/ArdourSession.h"
#include "standin/project/MediaClip.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "standin/stage/ProjectWriter.h"

#include <algorithm>

namespace standin {

namespace {

bool isOfSession(const Track& track)
{
    return track.attributes().contains(SessionKey::Route) || track.attributes().contains(SessionKey::Markers) ||
           track.attributes().contains(SessionKey::Video);
}

/// Whether something of a track would be lost that the session itself doesn't hold.
bool hasOwn(const Track& track)
{
    if (track.attributes().contains(SessionKey::Video))
        return false;
    return !isOfSession(track) || track.attributes().size() > 1 || track.isLocked();
}

/// JSON can tell by its number what XML can't hold; the writer does so for all but these two.
std::string forXml(std::string json)
{
    for (const auto& [character, number] :
         {std::pair{"\xEF\xBF\xBE", "\\ufffe"}, std::pair{"\xEF\xBF\xBF", "\\uffff"}}) {
        for (std::size_t at = json.find(character); at != std::string::npos; at = json.find(character, at))
            json.replace(at, 3, number);
    }
    return json;
}

} // namespace

std::string OwnStorage::textOf(const Project& project)
{
    const std::vector<Track*> tracks = project.allTracks();
    const auto isStored = [](const auto& attribute) { return attribute.second.isPersistent; };
    if (std::ranges::none_of(project.attributes(), isStored) &&
        std::ranges::none_of(tracks, [](const Track* t) { return hasOwn(*t); }))
        return std::string();
    // A track is asked for before what is on it.
    const Track* around = nullptr;
    return forXml(ProjectWriter::textOf(project, [&around](const Node& node) {
        if (const auto* const clip = dynamic_cast<const MediaClip*>(&node))
            return clip->kind() == MediaClip::Kind::Video && !clip->attributes().contains(SessionKey::Video);
        if (const auto* const track = dynamic_cast<const Track*>(&node)) {
            around = track;
            return hasOwn(*track);
        }
        return !isOfSession(*around);
    }));
}

std::vector<Node*> OwnStorage::markersOf(const Project& project)
{
    std::vector<Node*> markers;
    for (const Track* const track : project.allTracks()) {
        if (!isOwnMarkerTrack(*track))
            continue;
        for (Node* marker = track->firstChild(); marker; marker = track->childBehind(*marker))
            markers.push_back(marker);
    }
    return markers;
}

bool OwnStorage::isOwnMarkerTrack(const Track& track)
{
    return track.kind() == Track::Kind::Marker && !track.attributes().contains(SessionKey::Markers);
}

} // namespace standin
