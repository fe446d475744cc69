// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/PreviewRecord.h"

#include "core/serialize/ByteArchive.h"
#include "core/time/SecondsRange.h"
#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "host/border/NumberList.h"
#include "host/project/HostFramerate.h"
#include "host/track/Instant.h"
#include "host/track/Track.h"
#include "velmark/Attributes.h"
#include "velmark/Project.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <string>
#include <tuple>

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

/// The second number of what is stored. What is stored without it has one number or an even count.
constexpr double Layout = 1.0;
constexpr std::size_t HeadSize = 5;

/// The name of an event as a number, which is below FurthestTime.
double numberOf(const std::wstring& name)
{
    core::serialize::ByteArchive characters;
    for (const wchar_t character : name)
        characters << static_cast<std::uint32_t>(character);
    return static_cast<double>(characters.crc32() >> 3);
}

/// As they are stored.
std::array<double, 4> numbersOf(IProjectNode& event)
{
    return {event.getStart(nullptr), event.getEnd(nullptr), event.getSourceOffset(nullptr), numberOf(nameOf(event))};
}

std::uint32_t flagsOf(const core::Framerate& framerate)
{
    using Flag = FrameRateInfo::Flag;
    return (framerate.dropFrame == 1 ? Flag::DropFrame : 0U) | (framerate.pulledDown ? Flag::PulledDown : 0U);
}

/// Nothing for what is no rate.
std::optional<core::Framerate> framerateFrom(double rate, double flags)
{
    std::optional<core::Framerate> framerate;
    if (flags >= 0.0)
        resultOf([&] { framerate = framerateOf({rate, static_cast<std::uint32_t>(flags)}); });
    return framerate;
}

} // namespace

PreviewRecord PreviewRecord::ofContent(const Track& track, double start, const core::Framerate& framerate)
{
    PreviewRecord record(start);
    if (!framerate.isUnknown())
        record.m_framerate = framerate;
    for (const Node& child : childrenOf(*nodeOf(track))) {
        if (!isBefore(child->getStart(nullptr), start))
            record.add(numbersOf(*child));
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
    return numbers->size() == 1 || numbers->size() % 2 == 0 ? ofPlaces(*numbers) : ofNumbers(*numbers);
}

std::optional<PreviewRecord> PreviewRecord::ofPlaces(const std::vector<double>& numbers)
{
    PreviewRecord record(numbers.front());
    record.m_hasPlacesAlone = true;
    if (numbers.size() == 1)
        return record;
    if (numbers[1] < record.m_start)
        return std::nullopt;
    for (std::size_t index = 2; index < numbers.size(); index += 2)
        record.add({numbers[index], numbers[index + 1], 0.0, 0.0});
    record.m_end = numbers[1];
    return record;
}

std::optional<PreviewRecord> PreviewRecord::ofNumbers(const std::vector<double>& numbers)
{
    constexpr std::size_t EventSize = std::tuple_size_v<Content>;
    if (numbers.size() < HeadSize || (numbers.size() - HeadSize) % EventSize != 0 || numbers[1] != Layout)
        return std::nullopt;
    PreviewRecord record(numbers.front());
    record.m_framerate = framerateFrom(numbers[2], numbers[3]);
    const double end = numbers[4];
    if (end < record.m_start)
        return numbers.size() == HeadSize ? std::optional(record) : std::nullopt;
    for (std::size_t index = HeadSize; index < numbers.size(); index += EventSize)
        record.add({numbers[index], numbers[index + 1], numbers[index + 2], numbers[index + 3]});
    record.m_end = end;
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
    const core::Framerate framerate = m_framerate.value_or(core::Framerate());
    std::vector<double> numbers{m_start, Layout, framerate.rate, static_cast<double>(flagsOf(framerate)),
                                m_end.value_or(m_start - 1.0)};
    numbers.insert(numbers.end(), m_numbers.begin(), m_numbers.end());
    writeNumbers(context, *nodeOf(track), AttributeKey::Preview, numbers);
}

std::vector<PreviewRecord::Node> PreviewRecord::others(std::vector<Node> events) const
{
    auto left = m_events;
    std::erase_if(events, [&](const Node& event) {
        const auto found = left.find(contentOf(numbersOf(*event)));
        return found != left.end() && found->second-- > 0;
    });
    return events;
}

PreviewRecord::Content PreviewRecord::contentOf(const std::array<double, 4>& event) const
{
    const auto [start, end, offset, name] = event;
    if (m_hasPlacesAlone)
        return {toInstant(start), toInstant(end), 0, 0};
    return {toInstant(start), toInstant(end), toInstant(offset), std::llround(name)};
}

void PreviewRecord::add(const std::array<double, 4>& event)
{
    ++m_events[contentOf(event)];
    m_numbers.insert(m_numbers.end(), event.begin(), event.end());
    reachTo(event[1]);
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
