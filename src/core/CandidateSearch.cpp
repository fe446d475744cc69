#include "core/CandidateSearch.h"

#include "core/EventBase.h"
#include "core/PlacementChoice.h"
#include "core/SharedStretch.h"

#include <cstdint>
#include <memory>

namespace cadrel::core {

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

void CandidateSearch::addOldEvent(const std::string& name, const EventBase& event)
{
    index_.add(name, EventShape(event, framerate_), oldEventCount_++);
}

std::vector<ChangeCandidate> CandidateSearch::survivingCandidates(const std::string& name, const EventBase& newEvent,
                                                                  double lastDisplacement) const
{
    const EventShape shape(newEvent, framerate_);
    std::vector<SharedStretch> stretches;
    for (const TwinGroup* group : index_.groupsOverlapping(name, shape.srcIn, shape.srcOut)) {
        if (group->shape.isPlayedLike(shape))
            stretches.emplace_back(*group, shape, framerate_);
    }
    std::vector<ChangeCandidate> candidates;
    for (const Placement& placement : survivingPlacements(stretches, lastDisplacement))
        candidates.push_back(makeCandidate(placement, newEvent, framerate_));
    return candidates;
}

} // namespace cadrel::core
