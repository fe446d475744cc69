// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/Track.h"

#include <vector>

namespace standin {

class Project;

// Edits of what lies from `start` to `end` on tracks that aren't folders, in seconds of the project. A range holds its start
// and not its end, and where it reaches into an event by less than to another instant (SameInstant), the event isn't cut. A
// range that ends at the instant where it starts holds nothing.

/// The content of a range of some tracks: pieces of their events and curves that belong to no project. It can be written any
/// number of times.
class RangeContent : public Velmark::Implements<RangeContent, Velmark::FObject> {
public:
    static constexpr const char* ClassName = "RangeContent";

    /// Clips, range markers and parts are cut at the edges; a point marker at `end` isn't copied.
    RangeContent(const Project& project, const std::vector<Track*>& tracks, double start, double end);

    /// In seconds.
    double length() const { return m_length; }
    /// Whether it was read from that project.
    bool isOf(const Project& project) const;
    /// Clears the range of the same length at `destination` on the tracks and writes the content there. What would be
    /// below time 0 is dropped. Tracks that are no longer in a project are skipped.
    void writeAt(double destination) const;

private:
    struct TrackContent {
        Velmark::Counted<Track> track;   ///< from which it was read, and to which it is written
        Velmark::Counted<Track> content; ///< which lies from 0 to the length of the range
    };

    Velmark::Counted<ProjectLink> m_project;
    double m_length;
    std::vector<TrackContent> m_tracks;
};

/// Takes away what is in the range and cuts what hangs over. A curve goes on outside of the range as it did.
void clearRange(const std::vector<Track*>& tracks, double start, double end);

/// Joins pieces of one event that stand side by side again in or at the range. Whether any were joined.
bool joinPieces(const std::vector<Track*>& tracks, double start, double end);

} // namespace standin
