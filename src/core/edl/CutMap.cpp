// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/CutMap.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/StableSort.h"
#include "util/Result.h"

#include <algorithm>
#include <functional>

namespace cadrel::core {

using util::Result;

namespace {

using WeakEvents = std::vector<std::weak_ptr<EventBase>>;

std::vector<std::shared_ptr<EventBase>> timedOf(const EventList& events)
{
    std::vector<std::shared_ptr<EventBase>> timed;
    timed.reserve(events.size());
    for (const auto& event : events.events()) {
        if (!event->hasFlaw(EventFlaw::TimecodeInvalid))
            timed.push_back(event);
    }
    return timed;
}

std::vector<CutEntry> entriesSortedBy(const std::vector<std::shared_ptr<EventBase>>& events,
                                      const Timecode& (EventBase::*timeOf)() const)
{
    std::vector<std::uint32_t> order(events.size());
    for (std::uint32_t index = 0; index < order.size(); ++index)
        order[index] = index;
    sortStably(order, [&](std::uint32_t a, std::uint32_t b) {
        return (events[a].get()->*timeOf)() < (events[b].get()->*timeOf)();
    });

    std::vector<CutEntry> entries;
    entries.reserve(events.size());
    for (const std::uint32_t index : order)
        entries.push_back({(events[index].get()->*timeOf)(), events[index]});
    return entries;
}

WeakEvents eventsInRange(const EventEdges& edges, double start, double end)
{
    WeakEvents events;
    edges.forEachInRange(start, end, [&](const std::shared_ptr<EventBase>& event) { events.emplace_back(event); });
    return events;
}

bool isInside(double time, const SecondsRange& range)
{
    return range.start < time && time < range.end;
}

bool shareMoreThanAPoint(const SecondsRange& a, const SecondsRange& b)
{
    return std::max(a.start, b.start) < std::min(a.end, b.end);
}

/// The parts of `range` before and after `covered`.
std::vector<SecondsRange> subtract(const SecondsRange& range, const SecondsRange& covered)
{
    std::vector<SecondsRange> rest;
    if (isInside(covered.start, range))
        rest.push_back({range.start, covered.start});
    if (isInside(covered.end, range))
        rest.push_back({covered.end, range.end});
    return rest;
}

/// The parts of `range` that no event covers. The working list stays in ascending order with no overlaps, so each
/// covered range meets a run of neighbours in it.
std::vector<SecondsRange> uncoveredRanges(const SecondsRange& range, const WeakEvents& events,
                                          const Timecode& (EventBase::*in)() const,
                                          const Timecode& (EventBase::*out)() const)
{
    std::vector<SecondsRange> working{range};
    for (const auto& reference : events) {
        const std::shared_ptr<EventBase> event = reference.lock();
        if (!event)
            continue;
        const SecondsRange covered{(event.get()->*in)().toSeconds(), (event.get()->*out)().toSeconds()};
        if (covered.start > covered.end)
            throw Result::InvalidArgument;
        const auto first = std::partition_point(working.begin(), working.end(),
                                                [&](const SecondsRange& piece) { return piece.end <= covered.start; });
        auto last = first;
        std::vector<SecondsRange> rest;
        for (; last != working.end() && shareMoreThanAPoint(*last, covered); ++last) {
            const std::vector<SecondsRange> pieces = subtract(*last, covered);
            rest.insert(rest.end(), pieces.begin(), pieces.end());
        }
        working.insert(working.erase(first, last), rest.begin(), rest.end());
    }
    return working;
}

} // namespace

CutMap::CutMap(const EventList& events, const Framerate& framerate)
    : m_held(timedOf(events)), m_source(m_held, &EventBase::srcIn, &EventBase::srcOut, framerate),
      m_destination(m_held, &EventBase::dstIn, &EventBase::dstOut, framerate)
{
    m_heldByAddress.reserve(m_held.size());
    for (const auto& event : m_held)
        m_heldByAddress.push_back(event.get());
    std::sort(m_heldByAddress.begin(), m_heldByAddress.end(), std::less<>());

    m_byDstIn = entriesSortedBy(m_held, &EventBase::dstIn);
    m_bySrcIn = entriesSortedBy(m_held, &EventBase::srcIn);
}

bool CutMap::contains(const std::shared_ptr<EventBase>& event) const
{
    return std::binary_search(m_heldByAddress.begin(), m_heldByAddress.end(), event.get(), std::less<>());
}

WeakEvents CutMap::eventsInSourceRange(double start, double end) const
{
    return eventsInRange(m_source, start, end);
}

WeakEvents CutMap::eventsInDestinationRange(double start, double end) const
{
    return eventsInRange(m_destination, start, end);
}

std::vector<SecondsRange> CutMap::uncoveredSourceRanges(const SecondsRange& range) const
{
    return uncoveredRanges(range, eventsInSourceRange(range.start, range.end), &EventBase::srcIn, &EventBase::srcOut);
}

std::vector<SecondsRange> CutMap::uncoveredDestinationRanges(const SecondsRange& range) const
{
    return uncoveredRanges(range, eventsInDestinationRange(range.start, range.end), &EventBase::dstIn,
                           &EventBase::dstOut);
}

bool CutMap::isDestinationRangeInsideAnEvent(const SecondsRange& range) const
{
    for (const auto& reference : eventsInDestinationRange(range.start, range.end)) {
        const std::shared_ptr<EventBase> event = reference.lock();
        if (event && event->dstIn().toSeconds() <= range.start && event->dstOut().toSeconds() >= range.end)
            return true;
    }
    return false;
}

} // namespace cadrel::core
