// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/SecondsRange.h"

#include <cstddef>
#include <memory>
#include <vector>

namespace cadrel::core {
class EventBase;
class EventList;
} // namespace cadrel::core

namespace cadrel::gui {

/// A block of a lane of the timeline: what is seen of one event, from column `first` to the one before `end`.
struct TimeLineBlock {
    int first = 0;
    int end = 0;
    bool isVfx = false;
    bool isHighlighted = false;

    bool operator==(const TimeLineBlock&) const = default;
};

/// Where the events of a list lie on the two lanes of the timeline, in columns of pixels. A column shows one event only: a
/// highlighted one if there is any, of these one that had to be widened to be seen, and of these the last of the list. So a
/// lane has no more blocks than columns, however long the list is:
///
///     event 1         |-------------------------|
///     event 2   |----------|
///     event 3                     ||
///     lane      [    2     ][ 1  ][3][    1     ]
///
/// Events without usable times aren't there: those whose timecodes are missing, unreadable or don't exist at the project's
/// rate. It keeps the times, and doesn't follow the list.
class EventTimeLine {
public:
    enum class Lane { Source, Destination };

    /// The axis reaches from the first to the last time of all events on either lane. Throws Result::NotAvailable without a
    /// FramerateProvider, and is empty then.
    void setEvents(const core::EventList& events);
    /// Highlights these events, and no others.
    void highlight(const std::vector<std::shared_ptr<core::EventBase>>& events);

    /// In seconds; both 0 without events.
    double start() const { return m_axis.start; }
    double end() const { return m_axis.end; }

    /// The blocks of a lane of that many columns, from the left to the right. Each event takes `leastColumns` columns, even if
    /// it is shorter. Empty when there are no columns.
    std::vector<TimeLineBlock> blocks(Lane lane, int columns, int leastColumns) const;

private:
    struct PlacedEvent {
        std::weak_ptr<core::EventBase> event;
        core::SecondsRange source;
        core::SecondsRange destination;
        bool isVfx;
        bool isHighlighted;
    };

    /// The columns of an event on a lane, before others cover them.
    struct Span {
        int first;
        int end;
        bool isWidened; ///< the event alone has fewer columns
        const PlacedEvent* event;
    };
    std::vector<Span> spansFromTheTop(Lane lane, double scale, int columns, int least) const;

    std::vector<PlacedEvent> m_events; ///< in the list's order
    core::SecondsRange m_axis;
};

} // namespace cadrel::gui
