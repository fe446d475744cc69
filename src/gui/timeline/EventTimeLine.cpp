// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/timeline/EventTimeLine.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/time/Framerate.h"
#include "util/Result.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <numeric>
#include <optional>
#include <unordered_set>
#include <utility>

namespace cadrel::gui {

using core::EventBase;
using core::EventFlaw;
using core::Framerate;
using core::SecondsRange;
using core::Timecode;

namespace {

bool hasUsableTimes(const EventBase& event)
{
    static constexpr std::array WithoutTimes = {EventFlaw::TimecodeUninitialized, EventFlaw::SrcInUnreadable,
                                                EventFlaw::SrcOutUnreadable,      EventFlaw::DstInUnreadable,
                                                EventFlaw::DstOutUnreadable,      EventFlaw::TimecodeInvalid};
    return std::none_of(WithoutTimes.begin(), WithoutTimes.end(),
                        [&](EventFlaw::Type flaw) { return event.hasFlaw(flaw); });
}

struct EventTimes {
    SecondsRange source;
    SecondsRange destination;
};

std::optional<EventTimes> timesOf(const EventBase& event, const Framerate& framerate)
{
    if (!hasUsableTimes(event))
        return std::nullopt;
    try {
        return EventTimes{{event.srcIn().toSeconds(framerate), event.srcOut().toSeconds(framerate)},
                          {event.dstIn().toSeconds(framerate), event.dstOut().toSeconds(framerate)}};
    } catch (util::Result::Type) {
        // The rate has changed since the event has found out its flaws.
        return std::nullopt;
    }
}

/// The columns of a lane. Each belongs to whoever takes it first.
class Columns {
public:
    explicit Columns(std::size_t count) : m_owners(count), m_nextFree(count + 1)
    {
        std::iota(m_nextFree.begin(), m_nextFree.end(), std::size_t{0});
    }

    void take(std::size_t first, std::size_t end, std::size_t owner)
    {
        for (std::size_t column = nextFree(first); column < end; column = nextFree(column)) {
            m_owners[column] = owner;
            m_nextFree[column] = column + 1;
        }
    }

    /// Calls `action` with each stretch of neighbouring columns of one owner: first, end, owner.
    template <class Action>
    void forEachStretch(Action&& action)
    {
        const std::size_t count = m_owners.size();
        std::size_t first = 0;
        while (first < count) {
            if (nextFree(first) == first) {
                ++first;
                continue;
            }
            std::size_t end = first + 1;
            while (end < count && nextFree(end) != end && m_owners[end] == m_owners[first])
                ++end;
            action(first, end, m_owners[first]);
            first = end;
        }
    }

private:
    /// The first free column from `column` on; the count when there is none.
    std::size_t nextFree(std::size_t column)
    {
        while (m_nextFree[column] != column) {
            m_nextFree[column] = m_nextFree[m_nextFree[column]];
            column = m_nextFree[column];
        }
        return column;
    }

    std::vector<std::size_t> m_owners;
    std::vector<std::size_t> m_nextFree; ///< a way to the next free column; a free one leads to itself
};

} // namespace

void EventTimeLine::setEvents(const core::EventList& events)
{
    m_events.clear();
    m_axis = {};
    if (events.isEmpty())
        return;

    const Framerate framerate = Timecode::framerate();
    std::vector<PlacedEvent> placed;
    placed.reserve(events.size());
    SecondsRange axis = {std::numeric_limits<double>::infinity(), 0.0};
    for (const auto& event : events.events()) {
        const std::optional<EventTimes> times = timesOf(*event, framerate);
        if (!times)
            continue;
        placed.push_back({event, times->source, times->destination, event->vfx(), false});
        for (const double seconds :
             {times->source.start, times->source.end, times->destination.start, times->destination.end}) {
            axis.start = std::min(axis.start, seconds);
            axis.end = std::max(axis.end, seconds);
        }
    }
    if (placed.empty())
        return;
    // A single event without length would have no scale.
    axis.end = std::max(axis.end, axis.start + Timecode(0, 0, 0, 1).toSeconds(framerate));
    m_events = std::move(placed);
    m_axis = axis;
}

void EventTimeLine::highlight(const std::vector<std::shared_ptr<EventBase>>& events)
{
    std::unordered_set<const EventBase*> highlighted;
    highlighted.reserve(events.size());
    for (const auto& event : events)
        highlighted.insert(event.get());
    highlighted.erase(nullptr);
    for (PlacedEvent& placed : m_events)
        placed.isHighlighted = highlighted.contains(placed.event.lock().get());
}

std::vector<EventTimeLine::Span> EventTimeLine::spansFromTheTop(Lane lane, double scale, int columns, int least) const
{
    const auto columnOf = [&](double seconds) {
        return static_cast<int>(std::lround((seconds - m_axis.start) * scale));
    };
    std::vector<Span> spans;
    spans.reserve(m_events.size());
    for (auto event = m_events.rbegin(); event != m_events.rend(); ++event) {
        const SecondsRange& times = lane == Lane::Source ? event->source : event->destination;
        const int first = std::min(columnOf(times.start), columns - least);
        const int end = columnOf(times.end);
        spans.push_back({first, std::max(end, first + least), end < first + least, &*event});
    }
    const auto others =
        std::stable_partition(spans.begin(), spans.end(), [](const Span& span) { return span.event->isHighlighted; });
    const auto isWidened = [](const Span& span) { return span.isWidened; };
    std::stable_partition(spans.begin(), others, isWidened);
    std::stable_partition(others, spans.end(), isWidened);
    return spans;
}

std::vector<TimeLineBlock> EventTimeLine::blocks(Lane lane, int columns, int leastColumns) const
{
    const double scale = columns / (m_axis.end - m_axis.start);
    if (!std::isfinite(scale) || !(scale > 0.0))
        return {};

    const std::vector<Span> spans = spansFromTheTop(lane, scale, columns, std::clamp(leastColumns, 1, columns));
    Columns taken(static_cast<std::size_t>(columns));
    for (std::size_t index = 0; index < spans.size(); ++index)
        taken.take(static_cast<std::size_t>(spans[index].first), static_cast<std::size_t>(spans[index].end), index);

    std::vector<TimeLineBlock> blocks;
    taken.forEachStretch([&](std::size_t first, std::size_t end, std::size_t owner) {
        const PlacedEvent& event = *spans[owner].event;
        blocks.push_back({static_cast<int>(first), static_cast<int>(end), event.isVfx, event.isHighlighted});
    });
    return blocks;
}

} // namespace cadrel::gui
