// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/ardour/ArdourSession.h"
#include "standin/project/Track.h"
#include "velmark/Counted.h"

#include <pugixml.hpp>

#include <filesystem>
#include <set>
#include <string>

namespace standin {

class ChangeLog;
class MediaClip;
class Project;

/// Reads the text of a session. Nothing in it is trusted.
class ArdourReader {
public:
    /// The oldest and the newest version that is understood.
    static constexpr int OldestVersion = 6000;
    static constexpr int NewestVersion = 7003;

    /// Throws FileFault. `file` is where the session lies, and its sound beside it.
    ArdourReader(std::string text, const std::filesystem::path& file);

    /// Throws FileFault. Nothing of the project counts as changed.
    Velmark::Counted<Project> read(ChangeLog& log);
    /// What was read; to be taken once, after `read`.
    ArdourSession takeSession() { return std::move(m_session); }

private:
    /// As every session of Ardour's is.
    void requireUtf8() const;
    /// A new project with what Cadrel has stored in the session, as far as that can be read.
    Velmark::Counted<Project> readOwn(ChangeLog& log);
    void findIds();
    void findExtra();
    std::filesystem::path folderOfSession() const;
    void readClock(Project& project);
    void readSources(Project& project);
    void readRoutes(Project& project);
    void readRoute(const pugi::xml_node& route, Project& project);
    void readVca(const pugi::xml_node& vca, Project& project);
    /// The track that was stored for a route, taken out of the project, or a new one.
    Velmark::Counted<Track> trackOf(SessionId route);
    void readPlaylist(SessionId route, const pugi::xml_node& playlist, Track& track);
    /// Gives its id.
    SessionId readRegion(const pugi::xml_node& region, Track& track);
    /// How far the frame lies from a time that is near to it, in seconds; 0 for a time that isn't, and where each frame is a
    /// whole number of samples.
    double distanceToFrame(double seconds) const;
    void readLists(SessionId route, const pugi::xml_node& node, Track& track);
    void readList(SessionId route, const pugi::xml_node& list, Track& track, int number);
    void dropGoneTracks(Project& project);
    void readLocations(Project& project);
    void readVideo(Project& project);
    void placeOwnMarkers(Project& project);
    /// Whether a location that is said to stand for a marker on a track of Cadrel's has its place or the kind in its name. One
    /// that has neither is the user's.
    bool isOwn(const ArdourSession::Location& location, const Track& track, const Node& marker) const;
    void placeMarkersOfTheUser(Project& project);

    TextRange rangeOf(const pugi::xml_node& node) const;
    std::string optionOf(const char* name) const;

    ArdourSession m_session;
    std::filesystem::path m_file;
    pugi::xml_document m_document;
    Project* m_project = nullptr; ///< what is being read
    pugi::xml_node m_root;
    std::map<SessionId, Velmark::Counted<MediaClip>> m_clips; ///< by their sources
    std::map<SessionId, pugi::xml_node> m_playlists;
    std::set<SessionId> m_playlistsRead;
    std::map<SessionId, Velmark::Counted<Track>>
        m_tracks;                       ///< by their routes, those that Cadrel has stored and new ones
    std::vector<SessionId> m_order;     ///< of the locations
    std::set<SessionId> m_ownLocations; ///< which stand for markers on Cadrel's tracks
};

} // namespace standin
