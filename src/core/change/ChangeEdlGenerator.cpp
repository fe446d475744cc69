// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/ChangeEdlGenerator.h"

#include "core/change/CandidateSearch.h"
#include "core/change/TransitionPieces.h"
#include "core/edl/CutMap.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/MatchedName.h"

#include <memory>
#include <utility>

namespace cadrel::core {

using util::Result;

void ChangeEdlGenerator::configure(std::int32_t matchBy, const std::vector<VfxPatternEntry>& vfxEntries)
{
    m_matchBy = matchBy;
    m_versionPatterns.compileEnabled(vfxEntries);
}

ChangeEdlGenerator::ComparisonName ChangeEdlGenerator::comparisonName(const EventBase& event) const
{
    const std::string& raw = nameBy(m_matchBy, event);
    std::string key = m_versionPatterns.stripVersion(raw);
    const bool isVfx = key != raw;
    return {std::move(key), isVfx};
}

Result::Type ChangeEdlGenerator::generate(const EventList& oldEvents, const EventList& newEvents,
                                          EventList& changeEvents) const
{
    changeEvents.clear();
    EventList oldWork;
    EventList newWork;
    oldWork.copyFrom(oldEvents);
    newWork.copyFrom(newEvents);
    expandTransitions(oldWork);
    expandTransitions(newWork);

    const Framerate framerate = Timecode::framerate();
    CandidateSearch search(framerate);
    for (const auto& event : oldWork.events()) {
        if (event->isValid())
            search.addOldEvent(comparisonName(*event).key, *event);
    }
    search.finish();

    const CutMap newProgramme(newWork, framerate);
    double lastDisplacement = 0.0;
    std::uint32_t number = 1;
    for (const CutEntry& entry : newProgramme.dstInOrder()) {
        const std::shared_ptr<EventBase> newEvent = entry.event.lock();
        if (!newEvent->isValid())
            continue;
        const auto [key, isVfx] = comparisonName(*newEvent);
        newEvent->setVfx(isVfx);
        for (const ChangeCandidate& survivor : search.survivingCandidates(key, *newEvent, lastDisplacement)) {
            survivor.changeEvent->setEventNumber(number++);
            changeEvents.add(survivor.changeEvent);
            lastDisplacement = survivor.displacement;
        }
    }
    mergeTransitionPieces(changeEvents, m_matchBy);
    return Result::Ok;
}

} // namespace cadrel::core
