// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/ApplyFacts.h"

#include "app/apply/RunMaterial.h"

#include <algorithm>

namespace cadrel::app {

using standin::Track;

std::vector<const TrackComparison*> ApplyFacts::userTracks() const
{
    std::vector<const TrackComparison*> found;
    for (const TrackComparison& track : tracks) {
        if (!isMarkedByRuns(*track.track) && !(track.fates.empty() && track.added.empty()))
            found.push_back(&track);
    }
    return found;
}

std::vector<const TrackComparison*> ApplyFacts::markedTracks() const
{
    std::vector<const TrackComparison*> found;
    for (const TrackComparison& track : tracks) {
        if (isMarkedByRuns(*track.track) && !track.added.empty())
            found.push_back(&track);
    }
    return found;
}

core::SoundCount countOf(const TrackComparison& track)
{
    const auto count = [&track](auto test) {
        return static_cast<std::size_t>(std::count_if(track.fates.begin(), track.fates.end(), test));
    };
    return {track.fates.size(),
            count([](const Fate& fate) { return fate.stays(); }),
            count([](const Fate& fate) { return fate.isMoved; }),
            count([](const Fate& fate) { return fate.isTrimmed(); }),
            count([](const Fate& fate) { return fate.isSplit; }),
            count([](const Fate& fate) { return fate.isDoubled; }),
            count([](const Fate& fate) { return fate.isLost(); }),
            track.added.size()};
}

} // namespace cadrel::app
