// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/TrackIndexes.h"

#include "host/track/Track.h"
#include "util/Result.h"

namespace cadrel::host {

const TrackIndex& TrackIndexes::of(const Track& track)
{
    if (!track.isAlive())
        throw util::Result::HostObjectMissing;
    const auto found = m_indexes.find(track.node());
    if (found != m_indexes.end())
        return found->second;
    return m_indexes.emplace(track.node(), track.readIndex()).first->second;
}

} // namespace cadrel::host
