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

FateCount& FateCount::operator+=(const TrackComparison& track)
{
    const auto count = [&track](auto test) {
        return static_cast<std::size_t>(std::count_if(track.fates.begin(), track.fates.end(), test));
    };
    all += track.fates.size();
    stay += count([](const Fate& fate) { return fate.stays(); });
    moved += count([](const Fate& fate) { return fate.isMoved; });
    trimmed += count([](const Fate& fate) { return fate.isTrimmed(); });
    split += count([](const Fate& fate) { return fate.isSplit; });
    doubled += count([](const Fate& fate) { return fate.isDoubled; });
    lost += count([](const Fate& fate) { return fate.isLost(); });
    added += track.added.size();
    return *this;
}

FateCount countOf(const TrackComparison& track)
{
    FateCount count;
    count += track;
    return count;
}

} // namespace cadrel::app
