// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/CandidateSearch.h"

#include "core/change/PlacementChoice.h"
#include "core/change/SharedStretch.h"
#include "core/edl/EventBase.h"
#include "util/Result.h"

#include <algorithm>
#include <cstdint>
#include <deque>
#include <iterator>
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

/// The twins of a group whose stretch stays within the day.
class TwinsWithinDay {
public:
    TwinsWithinDay(const TwinGroup& all, const EventShape& newEvent, const Framerate& framerate) : m_group(all)
    {
        const auto isWithinDay = [&](const TwinGroup::Place& place) {
            try {
                SharedStretch({all.shape, {&place, 1}, {&place, 1}, true}, newEvent, framerate);
                return true;
            } catch (Result::Type) {
                return false;
            }
        };
        // The later a twin stands, the later its stretch ends.
        const auto end = std::partition_point(all.placesByTime.begin(), all.placesByTime.end(), isWithinDay);
        const auto count = static_cast<std::size_t>(end - all.placesByTime.begin());
        m_group.placesByTime = all.placesByTime.first(count);
        if (all.areOrdersEqual || count == 0) {
            m_group.placesByIndex = all.placesByIndex.first(count);
            return;
        }
        const std::int32_t latest = m_group.placesByTime.back().dstIn;
        std::ranges::copy_if(all.placesByIndex, std::back_inserter(m_placesByIndex),
                             [latest](const TwinGroup::Place& place) { return place.dstIn <= latest; });
        m_group.placesByIndex = m_placesByIndex;
    }
    TwinsWithinDay(const TwinsWithinDay&) = delete;
    TwinsWithinDay& operator=(const TwinsWithinDay&) = delete;

    bool areNone() const { return m_group.placesByTime.empty(); }
    const TwinGroup& group() const { return m_group; }

private:
    TwinGroup m_group;
    std::vector<TwinGroup::Place> m_placesByIndex;
};

} // namespace

void CandidateSearch::addOldEvent(const std::string& name, const EventBase& event, std::size_t index)
{
    m_index.add(name, EventShape(event, m_framerate), index);
}

std::vector<ChangeCandidate>
CandidateSearch::survivingCandidates(const std::string& name, const EventBase& newEvent, double lastDisplacement,
                                     const std::function<FailureAnswer(std::size_t)>& onFailure) const
{
    const EventShape shape(newEvent, m_framerate);
    std::vector<SharedStretch> stretches;
    std::deque<TwinsWithinDay> parts;
    for (const TwinGroup* group : m_index.groupsOverlapping(name, shape.srcIn, shape.srcOut)) {
        if (!group->shape.isPlayedLike(shape))
            continue;
        try {
            stretches.emplace_back(*group, shape, m_framerate);
        } catch (Result::Type) {
            // The latest place leaves the day first.
            if (onFailure(group->placesByTime.back().index) == FailureAnswer::Stop)
                throw;
            const TwinsWithinDay& rest = parts.emplace_back(*group, shape, m_framerate);
            if (!rest.areNone())
                stretches.emplace_back(rest.group(), shape, m_framerate);
        }
    }
    std::vector<ChangeCandidate> candidates;
    for (const Placement& placement : survivingPlacements(stretches, lastDisplacement))
        candidates.push_back(makeCandidate(placement, newEvent, m_framerate));
    return candidates;
}

} // namespace cadrel::core
