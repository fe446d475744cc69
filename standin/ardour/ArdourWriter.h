// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/ardour/ArdourSession.h"
#include "standin/ardour/RegionPiece.h"

#include <string>
#include <vector>

namespace standin {

class Envelope;
class Project;
class Track;

/// Writes the text of a session with what a project has changed.
class ArdourWriter {
public:
    ArdourWriter(const ArdourSession& session, const Project& project);

    /// Throws FileFault for what no session can hold.
    std::string text();

private:
    void writePlaylist(const ArdourSession::Playlist& playlist, const Track& track);
    void writeRegion(const ArdourSession::Region& region, const std::vector<RegionPiece>& pieces);
    /// Writes its place alone.
    void moveRegion(const ArdourSession::Region& region, std::int64_t position);
    void writeLists();
    void writeList(const ArdourSession::List& list, const Envelope& curve);
    void writeLocations();
    void writeSessionRange();
    void writeOwn();
    void writeIdCounter();

    /// At the end of an element, which may be empty.
    void insertInto(const TextRange& element, const std::string& name, std::string text);
    SessionId newId() { return m_nextId++; }

    const ArdourSession& m_session;
    const Project& m_project;
    TextPatch m_patch;
    SessionId m_nextId;
    std::map<SessionId, const Track*> m_tracks; ///< by their routes
    std::vector<SessionId> m_ownMarkers;        ///< the locations of the markers on Cadrel's tracks, in their order
};

} // namespace standin
