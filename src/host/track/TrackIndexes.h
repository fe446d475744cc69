// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/track/TrackIndex.h"

#include <map>

namespace Velmark {
class ITrackNode;
} // namespace Velmark

namespace cadrel::host {

class Track;

/// The indexes of the tracks of a run, each made when it's asked for first. Whoever edits tracks clears them, so that
/// none tells of what is no longer there.
class TrackIndexes {
public:
    /// Until the next clear. Throws what Track::readIndex throws.
    const TrackIndex& of(const Track& track);
    void clear() { m_indexes.clear(); }

private:
    std::map<const Velmark::ITrackNode*, TrackIndex> m_indexes;
};

} // namespace cadrel::host
