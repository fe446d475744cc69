// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventEdges.h"
#include "core/time/Framerate.h"
#include "core/time/SecondsRange.h"
#include "core/time/Timecode.h"

#include <memory>
#include <vector>

namespace cadrel::core {

class EventBase;
class EventList;

/// An event at the time by which a CutMap sorts it.
struct CutEntry {
    Timecode time;
    std::weak_ptr<EventBase> event;
};

/// A sorted, read-only view of one EventList. It gives the events in time order, the events that touch a stretch of
/// time, and the parts of a stretch that no event covers, in the source or in the destination. It doesn't follow
/// changes of the list. Events with EventFlaw::TimecodeInvalid are left out, since their seconds can't be computed;
/// every other flaw leaves an event in.
class CutMap {
public:
    /// Throws what Timecode::toSeconds throws under `framerate`.
    CutMap(const EventList& events, const Framerate& framerate);
    CutMap(const CutMap&) = delete;
    CutMap& operator=(const CutMap&) = delete;

    /// Sorted by DST IN; equal times in the list's order.
    const std::vector<CutEntry>& dstInOrder() const { return m_byDstIn; }
    /// Sorted by SRC IN; equal times in the list's order.
    const std::vector<CutEntry>& srcInOrder() const { return m_bySrcIn; }
    /// Whether this very event is in the map.
    bool contains(const std::shared_ptr<EventBase>& event) const;

    /// From the first to the last edge, in seconds; 0 to 0 for an empty map.
    SecondsRange sourceSpan() const { return m_source.span(); }
    SecondsRange destinationSpan() const { return m_destination.span(); }

    /// The events with an edge from `start` to `end` seconds, both included, in the order of the edges; if another
    /// event's edge is between the two edges of an event, that event is in the result twice. If no edge is in the
    /// range, the result is the event around the range. Empty unless `start` is less than `end`.
    std::vector<std::weak_ptr<EventBase>> eventsInSourceRange(double start, double end) const;
    std::vector<std::weak_ptr<EventBase>> eventsInDestinationRange(double start, double end) const;

    /// The parts of a range that no event covers, in ascending order, under the provider's rate. Throw
    /// Result::InvalidArgument where an event ends before it starts, and what Timecode::toSeconds throws.
    std::vector<SecondsRange> uncoveredSourceRanges(const SecondsRange& range) const;
    std::vector<SecondsRange> uncoveredDestinationRanges(const SecondsRange& range) const;

    /// Whether one of the events of eventsInDestinationRange covers the whole range, under the provider's rate; throws
    /// what Timecode::toSeconds throws.
    bool isDestinationRangeInsideAnEvent(const SecondsRange& range) const;

private:
    std::vector<std::shared_ptr<EventBase>> m_held; ///< in the list's order
    EventEdges m_source;
    EventEdges m_destination;
    std::vector<CutEntry> m_byDstIn;
    std::vector<CutEntry> m_bySrcIn;
    std::vector<const EventBase*> m_heldByAddress;
};

} // namespace cadrel::core
