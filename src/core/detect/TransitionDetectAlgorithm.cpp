// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/detect/TransitionDetectAlgorithm.h"

#include "core/cut/CadrelRunState.h"
#include "core/cut/CutList.h"
#include "core/edl/CutMap.h"
#include "core/edl/EventBase.h"
#include "core/edl/ProgrammePlace.h"

#include <algorithm>
#include <iterator>
#include <memory>
#include <string>
#include <string_view>
#include <utility>

namespace cadrel::core {

namespace {

using Transitions = std::vector<std::shared_ptr<EventBase>>;

bool standsEarlier(const std::shared_ptr<EventBase>& a, const std::shared_ptr<EventBase>& b)
{
    if (a->dstIn() == b->dstIn())
        return a->dstOut() < b->dstOut();
    return a->dstIn() < b->dstIn();
}

Transitions transitionsOf(const EventList& events)
{
    Transitions found;
    std::copy_if(events.events().begin(), events.events().end(), std::back_inserter(found),
                 [](const auto& event) { return event->isTransition(); });
    return found;
}

/// Removes the events that have the same place in the programme as one of `others`.
void removeThoseAtPlacesOf(Transitions others, Transitions& events)
{
    std::sort(others.begin(), others.end(), standsEarlier);
    std::erase_if(events, [&](const auto& event) {
        return std::binary_search(others.begin(), others.end(), event, standsEarlier);
    });
}

SecondsRange destinationOf(const EventBase& event, const Framerate& framerate)
{
    return {event.dstIn().toSeconds(framerate), event.dstOut().toSeconds(framerate)};
}

std::string_view letterOf(std::int32_t transitionType)
{
    switch (transitionType) {
    case TransitionType::Wipe:
        return "W";
    case TransitionType::Dissolve:
        return "D";
    default:
        return "C";
    }
}

double durationOf(const EventBase& event, const Framerate& framerate)
{
    Timecode duration;
    duration.setFrameCount(event.transitionDuration(), framerate);
    return duration.toSeconds(framerate);
}

} // namespace

std::vector<MarkerEntry> TransitionDetectAlgorithm::detect(const CutList& cuts, const CadrelRunState& state,
                                                           ProgressHandlerBase* progress) const
{
    Transitions transitions = transitionsOf(*state.newEvents);
    std::erase_if(transitions, [&](const auto& event) {
        return !hasPlace(*event, state.framerate) ||
               !Timecode::isValidFrameCount(event->transitionDuration(), state.framerate);
    });
    removeThoseAtPlacesOf(transitionsOf(*state.oldEvents), transitions);
    report(progress, 1);

    const CutMap carriedOver(cuts.events(), state.framerate);
    std::erase_if(transitions, [&](const auto& event) {
        return carriedOver.isDestinationRangeInsideAnEvent(destinationOf(*event, state.framerate));
    });
    report(progress, 1);

    std::vector<MarkerEntry> entries;
    for (const auto& event : transitions) {
        const double start = event->dstIn().toSeconds(state.framerate);
        std::string name(letterOf(event->transitionType()));
        name.append(" ").append(std::to_string(event->eventNumber())).append(" ").append(nameOf(*event, state));
        entries.push_back({start, start + durationOf(*event, state.framerate), name, MarkerKind::DissolveWipe});
    }
    report(progress, 1);
    return entries;
}

std::uint64_t TransitionDetectAlgorithm::estimateSteps(std::uint64_t /*eventCount*/, std::uint64_t /*trackCount*/) const
{
    return 3;
}

} // namespace cadrel::core
