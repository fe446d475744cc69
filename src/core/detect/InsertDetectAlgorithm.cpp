// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/detect/InsertDetectAlgorithm.h"

#include "core/cut/CadrelRunState.h"
#include "core/cut/CutList.h"
#include "core/edl/CutMap.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/ProgrammePlace.h"

namespace cadrel::core {

namespace {

/// The change events that cover something. CutMap refuses to subtract one that ends before it starts.
EventList coveringEvents(const EventList& changes)
{
    EventList covering;
    for (const auto& event : changes.events()) {
        if (!(event->dstOut() < event->dstIn()))
            covering.add(event);
    }
    return covering;
}

} // namespace

std::vector<MarkerEntry> InsertDetectAlgorithm::detect(const CutList& cuts, const CadrelRunState& state,
                                                       ProgressHandlerBase* progress) const
{
    report(progress, 1);
    const CutMap carriedOver(coveringEvents(cuts.events()), state.framerate);
    report(progress, 1);

    std::vector<MarkerEntry> entries;
    for (const auto& event : state.newEvents->events()) {
        if (!hasPlace(*event, state.framerate))
            continue;
        const SecondsRange range{event->dstIn().toSeconds(state.framerate), event->dstOut().toSeconds(state.framerate)};
        if (range.end - range.start < SameInstant)
            continue;
        for (const SecondsRange& uncovered : carriedOver.uncoveredDestinationRanges(range))
            entries.push_back({uncovered.start, uncovered.end, "Insert: " + nameOf(*event, state), MarkerKind::Insert});
    }
    report(progress, 1);
    return entries;
}

std::uint64_t InsertDetectAlgorithm::estimateSteps(std::uint64_t /*eventCount*/, std::uint64_t /*trackCount*/) const
{
    return 3;
}

} // namespace cadrel::core
