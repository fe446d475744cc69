// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/core/change/PairwiseGenerator.h"

#include "core/edl/EventBase.h"
#include "core/time/Timecode.h"
#include "util/Result.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <list>
#include <optional>
#include <utility>

namespace cadrel::tests {

using core::EventBase;
using core::EventList;
using core::Timecode;
using core::TransitionType;

namespace {

constexpr double SpeedTolerance = 0.01;

struct Candidate {
    std::shared_ptr<EventBase> changeEvent;
    double displacement;
    Timecode newSourceStart;
    Timecode newSourceEnd;
};

struct Intersection {
    Timecode offsetA;
    Timecode offsetB;
    Timecode length;
};

std::optional<Intersection> intersect(const Timecode& aStart, const Timecode& aEnd, const Timecode& bStart,
                                      const Timecode& bEnd)
{
    const Timecode start = aStart > bStart ? aStart : bStart;
    const Timecode end = aEnd < bEnd ? aEnd : bEnd;
    if (start >= end)
        return std::nullopt;

    Intersection found;
    if (start > aStart) {
        found.offsetA = start - aStart;
        found.offsetB = Timecode::minTimecode();
    } else {
        found.offsetA = Timecode::minTimecode();
        found.offsetB = start - bStart;
    }
    found.length = end - start;
    return found;
}

bool isTransition(const EventBase& event)
{
    return event.transitionType() == TransitionType::Dissolve || event.transitionType() == TransitionType::Wipe;
}

std::vector<std::shared_ptr<EventBase>> inDstInOrder(const EventList& list)
{
    const core::Framerate framerate = Timecode::framerate();
    std::vector<std::shared_ptr<EventBase>> sequence;
    for (const auto& event : list.events()) {
        if (event->hasFlaw(core::EventFlaw::TimecodeInvalid))
            continue;
        // A time that has no place in the day fails here, as it does in the view that the real generator sorts by.
        for (const Timecode& time : {event->srcIn(), event->srcOut(), event->dstIn(), event->dstOut()})
            time.toSeconds(framerate);
        sequence.push_back(event);
    }
    std::stable_sort(sequence.begin(), sequence.end(),
                     [](const auto& a, const auto& b) { return a->dstIn() < b->dstIn(); });
    return sequence;
}

/// Cuts the transition out of `event`, which keeps the body, and returns it as an event of its own.
std::shared_ptr<EventBase> cutOutTransition(EventBase& event, const EventBase* before)
{
    const auto piece = std::make_shared<EventBase>();
    *piece = event;

    Timecode srcLength(event.transitionDuration());
    if (event.motionSpeed() == 0.0)
        srcLength = Timecode(0.0);
    else
        srcLength = Timecode(srcLength.toSeconds() / event.motionSpeed());
    if (event.srcIn() + srcLength > event.srcOut())
        srcLength = event.srcOut() - event.srcIn();

    Timecode dstLength(event.transitionDuration());
    if (event.dstIn() + dstLength > event.dstOut())
        dstLength = event.dstOut() - event.dstIn();

    const Timecode srcCut = event.srcIn() + srcLength;
    const Timecode dstCut = event.dstIn() + dstLength;

    piece->setSrcOut(srcCut);
    piece->setDstOut(dstCut);
    if (before && before->eventNumber() == event.eventNumber()) {
        const std::string tc = before->srcOut().toString();
        piece->setRollName("TRANS_" + event.rollName() + "--" + before->rollName() + "_" + tc + "_" + tc);
        piece->setClipName("TRANS_" + event.clipName() + "--" + before->clipName() + "_" + tc + "_" + tc);
    }

    event.setSrcIn(srcCut);
    event.setDstIn(dstCut);
    event.setTransitionType(TransitionType::Cut);
    event.setTransitionDuration(0);
    return piece;
}

void expandTransitions(EventList& list)
{
    EventList pieces;
    for (std::size_t i = 0; i < list.size(); ++i) {
        EventBase& event = list.at(i);
        if (!isTransition(event))
            continue;
        try {
            pieces.add(cutOutTransition(event, i > 0 ? &list.at(i - 1) : nullptr));
        } catch (util::Result::Type) {
            if (event.isValid())
                throw;
        }
    }
    list.append(pieces);
}

std::optional<Candidate> matchEvents(const EventBase& oldEvent, const EventBase& newEvent)
{
    if (!(std::abs(oldEvent.motionSpeed() - newEvent.motionSpeed()) < SpeedTolerance))
        return std::nullopt;
    if (oldEvent.transitionType() != newEvent.transitionType())
        return std::nullopt;
    if (oldEvent.transitionDuration() != newEvent.transitionDuration())
        return std::nullopt;
    const auto common = intersect(oldEvent.srcIn(), oldEvent.srcOut(), newEvent.srcIn(), newEvent.srcOut());
    if (!common)
        return std::nullopt;

    const auto change = std::make_shared<EventBase>();
    change->setClipName(newEvent.clipName());
    change->setRollName(newEvent.rollName());
    change->setVfx(newEvent.vfx());
    if (isTransition(oldEvent))
        change->setTransitionType(oldEvent.transitionType());

    Timecode length = common->length;
    Timecode offsetOld = common->offsetA;
    Timecode offsetNew = common->offsetB;
    Timecode shownOffsetOld = offsetOld;
    Timecode shownOffsetNew = offsetNew;
    if (oldEvent.isNormalSpeed()) {
        // The source range is programme time already.
    } else if (std::abs(oldEvent.motionSpeed()) < SpeedTolerance) {
        const Timecode oldLength = oldEvent.dstOut() - oldEvent.dstIn();
        const Timecode newLength = newEvent.dstOut() - newEvent.dstIn();
        length = newLength < oldLength ? newLength : oldLength;
        shownOffsetOld = Timecode::minTimecode();
        shownOffsetNew = Timecode::minTimecode();
    } else {
        const double speed = oldEvent.motionSpeed();
        length = Timecode(length.toSeconds() / speed);
        offsetOld = Timecode(offsetOld.toSeconds() / speed);
        offsetNew = Timecode(offsetNew.toSeconds() / speed);
        shownOffsetOld = offsetOld;
        shownOffsetNew = offsetNew;
    }

    const Timecode srcIn = oldEvent.dstIn() + shownOffsetOld;
    const Timecode srcOut = srcIn + length;
    const Timecode dstIn = newEvent.dstIn() + shownOffsetNew;
    const Timecode dstOut = dstIn + length;
    change->setTimecodes(srcIn, srcOut, dstIn, dstOut);

    const double displacement =
        (newEvent.dstIn().toSeconds() + offsetNew.toSeconds()) - (oldEvent.dstIn().toSeconds() + offsetOld.toSeconds());
    const Timecode newSourceStart = newEvent.srcIn() + offsetNew;
    const Timecode newSourceEnd = newSourceStart + length;
    return Candidate{change, displacement, newSourceStart, newSourceEnd};
}

void removeOverlapping(std::list<Candidate>& candidates, double lastDisplacement)
{
    auto a = candidates.begin();
    while (a != candidates.end()) {
        bool aGone = false;
        auto b = candidates.begin();
        while (b != candidates.end()) {
            if (a == b || !intersect(a->newSourceStart, a->newSourceEnd, b->newSourceStart, b->newSourceEnd)) {
                ++b;
                continue;
            }
            const Timecode lengthOfA = a->newSourceEnd - a->newSourceStart;
            const Timecode lengthOfB = b->newSourceEnd - b->newSourceStart;
            bool bGoes = lengthOfB < lengthOfA;
            if (lengthOfA == lengthOfB)
                bGoes = std::abs(b->displacement - lastDisplacement) > std::abs(a->displacement - lastDisplacement);
            if (bGoes) {
                b = candidates.erase(b);
            } else {
                a = candidates.erase(a);
                aGone = true;
                break;
            }
        }
        if (!aGone)
            ++a;
    }
}

} // namespace

PairwiseGenerator::PairwiseGenerator(std::int32_t matchBy, const std::vector<core::VfxPatternEntry>& vfxEntries)
    : m_matchBy(matchBy)
{
    std::vector<std::pair<std::string, std::string>> rows;
    for (const auto& entry : vfxEntries) {
        if (entry.enabled && !(entry.prefix.empty() && entry.postfix.empty()))
            rows.emplace_back(entry.prefix, entry.postfix);
    }
    m_versionPatterns.compile(rows);
}

const std::string& PairwiseGenerator::matchedName(const EventBase& event) const
{
    return m_matchBy == 1 ? event.clipName() : event.rollName();
}

/// The name by which an event is known; tells the event whether it is a VFX shot.
std::string PairwiseGenerator::nameVfxShot(EventBase& event) const
{
    const std::string raw = matchedName(event);
    const std::string key = m_versionPatterns.stripVersion(raw);
    event.setVfx(key != raw);
    return key;
}

PairwiseGenerator::NameIndex PairwiseGenerator::indexByName(const EventList& oldWork) const
{
    NameIndex index;
    for (const auto& event : oldWork.events()) {
        if (event->isValid())
            index.emplace(nameVfxShot(*event), event);
    }
    return index;
}

void PairwiseGenerator::generate(const EventList& oldEvents, const EventList& newEvents, EventList& changeEvents) const
{
    EventList oldWork;
    EventList newWork;
    oldWork.copyFrom(oldEvents);
    newWork.copyFrom(newEvents);
    expandTransitions(oldWork);
    expandTransitions(newWork);
    const NameIndex index = indexByName(oldWork);

    double lastDisplacement = 0.0;
    std::uint32_t number = 1;
    for (const auto& newEvent : inDstInOrder(newWork)) {
        if (!newEvent->isValid())
            continue;
        const auto [first, last] = index.equal_range(nameVfxShot(*newEvent));
        std::list<Candidate> candidates;
        for (auto entry = first; entry != last; ++entry) {
            if (auto candidate = matchEvents(*entry->second, *newEvent))
                candidates.push_back(std::move(*candidate));
        }
        removeOverlapping(candidates, lastDisplacement);
        for (const Candidate& survivor : candidates) {
            survivor.changeEvent->setEventNumber(number++);
            changeEvents.add(survivor.changeEvent);
        }
        if (!candidates.empty())
            lastDisplacement = candidates.back().displacement;
    }
    mergeTransitionPieces(changeEvents);
}

void PairwiseGenerator::mergeTransitionPieces(EventList& changeEvents) const
{
    EventList absorbed;
    const auto sequence = inDstInOrder(changeEvents);
    for (auto entry = sequence.begin(); entry != sequence.end(); ++entry) {
        EventBase& piece = **entry;
        if (!isTransition(piece))
            continue;
        if (const auto next = std::next(entry); next != sequence.end()) {
            const EventBase& body = **next;
            if (body.dstIn() == piece.dstOut() && body.srcIn() == piece.srcOut() &&
                matchedName(piece).starts_with("TRANS_" + matchedName(body))) {
                piece.setOut(body.srcOut(), body.dstOut());
                piece.setRollName(body.rollName());
                piece.setClipName(body.clipName());
                absorbed.add(*next);
            }
        }
        piece.setTransitionType(TransitionType::Cut);
    }
    changeEvents.remove(absorbed);
}

} // namespace cadrel::tests
