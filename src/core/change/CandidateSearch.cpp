// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/CandidateSearch.h"

#include "core/change/PlacementChoice.h"
#include "core/change/SharedStretch.h"
#include "core/edl/EventBase.h"
#include "util/Result.h"

#include <cstdint>
#include <memory>

namespace cadrel::core {

using util::Result;

namespace {

Timecode timecodeOf(std::int32_t frames, const Framerate& framerate)
{
    Timecode timecode;
    timecode.setFrameCount(frames, framerate);
    return timecode;
}

ChangeCandidate makeCandidate(const Placement& placement, const EventBase& newEvent, const Framerate& framerate)
{
    const SharedStretch& stretch = *placement.stretch;
    const auto timecode = [&](std::int32_t frames) { return timecodeOf(frames, framerate); };

    auto change = std::make_shared<EventBase>();
    change->setClipName(newEvent.clipName());
    change->setRollName(newEvent.rollName());
    change->setVfx(newEvent.vfx());
    const std::int32_t transitionType = stretch.group().shape.transitionType;
    if (TransitionType::takesTime(transitionType))
        change->setTransitionType(transitionType);
    const std::int32_t srcIn = stretch.startInOld(placement.place.dstIn);
    const std::int32_t dstIn = stretch.startInNew();
    change->setTimecodes(timecode(srcIn), timecode(srcIn + stretch.length()), timecode(dstIn),
                         timecode(dstIn + stretch.length()));
    return {change, stretch.displacement(placement.place.dstIn), timecode(stretch.newSourceStart()),
            timecode(stretch.newSourceEnd())};
}

} // namespace

void CandidateSearch::addOldEvent(const std::string& name, const EventBase& event, std::size_t index)
{
    m_index.add(name, EventShape(event, m_framerate), index);
}

std::vector<ChangeCandidate>
CandidateSearch::survivingCandidates(const std::string& name, const EventBase& newEvent, double lastDisplacement,
                                     const std::function<void(std::size_t)>& onFailure) const
{
    const EventShape shape(newEvent, m_framerate);
    std::vector<SharedStretch> stretches;
    for (const TwinGroup* group : m_index.groupsOverlapping(name, shape.srcIn, shape.srcOut)) {
        if (!group->shape.isPlayedLike(shape))
            continue;
        try {
            stretches.emplace_back(*group, shape, m_framerate);
        } catch (Result::Type) {
            // The latest place leaves the day first.
            onFailure(group->placesByTime.back().index);
            throw;
        }
    }
    std::vector<ChangeCandidate> candidates;
    for (const Placement& placement : survivingPlacements(stretches, lastDisplacement))
        candidates.push_back(makeCandidate(placement, newEvent, m_framerate));
    return candidates;
}

} // namespace cadrel::core
