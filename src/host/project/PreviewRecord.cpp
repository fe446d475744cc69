// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/PreviewRecord.h"

#include "core/time/SecondsRange.h"
#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "host/border/NumberList.h"
#include "host/track/Instant.h"
#include "host/track/Track.h"
#include "velmark/Attributes.h"

#include <algorithm>
#include <cmath>
#include <cstddef>

using namespace Velmark;

namespace cadrel::host {

namespace {

/// In seconds; no time of a project is further away, and as instants they all fit in 64 bits.
constexpr double FurthestTime = 1e9;

std::int64_t toInstant(double seconds)
{
    return std::llround(seconds / core::SameInstant);
}

Counted<IProjectNode> nodeOf(const Track& track)
{
    return required(query<IProjectNode>(track.node()));
}

} // namespace

PreviewRecord PreviewRecord::ofContent(const Track& track, double start)
{
    PreviewRecord record(start);
    for (const Node& child : childrenOf(*nodeOf(track))) {
        const double childStart = child->getStart(nullptr);
        if (!isBefore(childStart, start))
            record.add(childStart, child->getEnd(nullptr));
    }
    for (const Node& curve : curvesOf(*track.node())) {
        for (const Node& point : childrenOf(*curve)) {
            const double time = point->getStart(curve.get());
            if (!isBefore(time, start))
                record.reachTo(time);
        }
    }
    return record;
}

std::optional<PreviewRecord> PreviewRecord::keptBy(const Track& track)
{
    const std::optional<std::vector<double>> numbers = readNumbers(*nodeOf(track), AttributeKey::Preview);
    const auto isTime = [](double number) { return std::abs(number) <= FurthestTime; };
    if (!numbers || numbers->empty() || !std::ranges::all_of(*numbers, isTime))
        return std::nullopt;
    PreviewRecord record(numbers->front());
    if (numbers->size() == 1)
        return record;
    if (numbers->size() % 2 != 0 || (*numbers)[1] < record.m_start)
        return std::nullopt;
    for (std::size_t index = 2; index < numbers->size(); index += 2)
        record.add((*numbers)[index], (*numbers)[index + 1]);
    record.m_end = (*numbers)[1];
    return record;
}

bool PreviewRecord::isKeptBy(const Track& track)
{
    return nodeOf(track)->hasAttribute(AttributeKey::Preview) == ResultOk;
}

void PreviewRecord::dropFrom(const Track& track)
{
    removeNumbers(*nodeOf(track), AttributeKey::Preview);
}

void PreviewRecord::keepOn(IHostContext* context, const Track& track) const
{
    std::vector<double> numbers{m_start};
    if (m_end) {
        numbers.push_back(*m_end);
        numbers.insert(numbers.end(), m_numbers.begin(), m_numbers.end());
    }
    writeNumbers(context, *nodeOf(track), AttributeKey::Preview, numbers);
}

std::vector<PreviewRecord::Node> PreviewRecord::others(std::vector<Node> events) const
{
    auto left = m_events;
    std::erase_if(events, [&left](const Node& event) {
        const auto found = left.find({toInstant(event->getStart(nullptr)), toInstant(event->getEnd(nullptr))});
        return found != left.end() && found->second-- > 0;
    });
    return events;
}

void PreviewRecord::add(double start, double end)
{
    ++m_events[{toInstant(start), toInstant(end)}];
    m_numbers.push_back(start);
    m_numbers.push_back(end);
    reachTo(end);
}

void PreviewRecord::reachTo(double time)
{
    m_end = std::max(m_end.value_or(time), time);
}

std::vector<PreviewRecord::Node> eventsReachingInto(const Track& track, double start, double end)
{
    std::vector<PreviewRecord::Node> events = childrenOf(*nodeOf(track));
    std::erase_if(events, [&](const PreviewRecord::Node& event) {
        const double eventStart = event->getStart(nullptr);
        return !isBefore(eventStart, end) || (isBefore(eventStart, start) && !isBefore(start, event->getEnd(nullptr)));
    });
    return events;
}

} // namespace cadrel::host
