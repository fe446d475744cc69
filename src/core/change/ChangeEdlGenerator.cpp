// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/ChangeEdlGenerator.h"

#include "core/change/CandidateSearch.h"
#include "core/change/TransitionPieces.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/MatchedName.h"
#include "core/edl/ProgrammeOrder.h"

#include <memory>
#include <utility>

namespace cadrel::core {

using util::Result;

namespace {

/// A copy of a list in which the transitions are events of their own, after all others. It knows which event of the list
/// each of them comes from.
class WorkingList {
public:
    explicit WorkingList(const EventList& given) : m_given(given) { m_events.copyFrom(given); }

    /// Gives `onFailure` each event that it fails on, and throws where that wants it.
    template <typename OnFailure>
    void expand(OnFailure onFailure)
    {
        m_origins = expandTransitions(m_events, [&](std::size_t index) { return onFailure(m_given.eventAt(index)); });
    }

    const EventList& events() const { return m_events; }

    std::shared_ptr<EventBase> originAt(std::size_t index) const
    {
        return m_given.eventAt(index < m_given.size() ? index : m_origins[index - m_given.size()]);
    }

private:
    const EventList& m_given;
    EventList m_events;
    std::vector<std::size_t> m_origins; ///< of the pieces: the index of the event
};

} // namespace

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
    return generate(oldEvents, newEvents, changeEvents, [](const GenerationFailure&) { return FailureAnswer::Stop; });
}

Result::Type ChangeEdlGenerator::generate(const EventList& oldEvents, const EventList& newEvents,
                                          EventList& changeEvents, const GenerationFailureListener& onFailure) const
{
    changeEvents.clear();
    const Framerate framerate = Timecode::framerate();
    WorkingList oldWork(oldEvents);
    WorkingList newWork(newEvents);
    oldWork.expand([&](const std::shared_ptr<EventBase>& oldEvent) { return onFailure({oldEvent, nullptr}); });
    newWork.expand([&](const std::shared_ptr<EventBase>& newEvent) { return onFailure({nullptr, newEvent}); });

    CandidateSearch search(framerate);
    for (std::size_t index = 0; index < oldWork.events().size(); ++index) {
        const EventBase& event = oldWork.events().at(index);
        if (event.isValid())
            search.addOldEvent(comparisonName(event).key, event, index);
    }
    search.finish();

    double lastDisplacement = 0.0;
    std::uint32_t number = 1;
    for (const PlacedEvent& placed : inProgrammeOrder(newWork.events().events(), framerate)) {
        const std::shared_ptr<EventBase> newEvent = newWork.events().eventAt(placed.index);
        if (!newEvent->isValid())
            continue;
        const auto [key, isVfx] = comparisonName(*newEvent);
        newEvent->setVfx(isVfx);
        const auto fail = [&](std::size_t oldIndex) {
            return onFailure({oldWork.originAt(oldIndex), newWork.originAt(placed.index)});
        };
        for (const ChangeCandidate& survivor : search.survivingCandidates(key, *newEvent, lastDisplacement, fail)) {
            survivor.changeEvent->setEventNumber(number++);
            changeEvents.add(survivor.changeEvent);
            lastDisplacement = survivor.displacement;
        }
    }
    mergeTransitionPieces(changeEvents, m_matchBy);
    return Result::Ok;
}

} // namespace cadrel::core
