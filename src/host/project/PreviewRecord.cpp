// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/PreviewRecord.h"

#include "core/serialize/ByteArchive.h"
#include "core/time/SecondsRange.h"
#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "host/border/NumberList.h"
#include "host/project/EventPrint.h"
#include "host/project/HostFramerate.h"
#include "host/track/Instant.h"
#include "host/track/Track.h"
#include "velmark/Attributes.h"
#include "velmark/Project.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <span>
#include <utility>

using namespace Velmark;

namespace cadrel::host {

namespace {

using Numbers = std::vector<double>;

/// In seconds; no time of a project is further away, and as instants they all fit in 64 bits.
constexpr double FurthestTime = 1e9;
constexpr double Day = 86400.0;

/// The second number of what is stored. What is stored without it has one number or an even count.
constexpr double NamesLayout = 1.0;
constexpr double CurvesLayout = 2.0;
constexpr double PointsLayout = 3.0;
constexpr std::size_t NamesHeadSize = 5;
constexpr std::size_t HeadSize = 7;
constexpr std::size_t EventSize = 4;

Counted<IProjectNode> nodeOf(const Track& track)
{
    return required(query<IProjectNode>(track.node()));
}

/// Those under a key; nothing when they are none of a record.
std::optional<Numbers> numbersOn(const Track& track, const char* key)
{
    std::optional<Numbers> numbers = readNumbers(*nodeOf(track), key);
    const auto isTime = [](double number) { return std::abs(number) <= FurthestTime; };
    if (numbers && !std::ranges::all_of(*numbers, isTime))
        numbers.reset();
    return numbers;
}

/// Below FurthestTime.
double checksumOf(std::span<const double> numbers)
{
    core::serialize::ByteArchive bytes;
    for (const double number : numbers)
        bytes << number;
    return static_cast<double>(bytes.crc32() >> 3);
}

Numbers joined(Numbers numbers, const Numbers& others)
{
    numbers.insert(numbers.end(), others.begin(), others.end());
    return numbers;
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

/// What is written comes from the day that timecodes name and from before the start, which is later than all that was there.
bool isSoundHead(const PreviewRecord::Head& head)
{
    return head.start > 0.0 && head.end.value_or(head.start) <= 2.0 * (head.start + Day);
}

/// As the curves of an earlier project tell it, and where they don't. Nothing where they are damaged.
std::optional<WrittenAutomation> automationOn(std::optional<Numbers> curves, const PreviewRecord::Head& head)
{
    if (curves) {
        if (curves->empty())
            return std::nullopt;
        const double checksum = std::exchange(curves->front(), head.start);
        if (checksum != checksumOf(*curves))
            return std::nullopt;
        curves->erase(curves->begin());
    }
    return WrittenAutomation::upTo(head.end.value_or(head.start), std::move(curves));
}

} // namespace

struct PreviewRecord::StoredHead {
    Head head;
    double checksum; ///< of the events, and of the points where they are known
    bool knowsPoints;

    static bool isOne(const Numbers& numbers)
    {
        return numbers.size() == HeadSize && (numbers[1] == PointsLayout || numbers[1] == CurvesLayout);
    }
    static std::optional<StoredHead> of(const Numbers& numbers)
    {
        if (!isOne(numbers) || numbers.back() != checksumOf(std::span(numbers).first(HeadSize - 1)))
            return std::nullopt;
        const double start = numbers[0];
        const double end = numbers[4];
        const Head head{start, end < start ? std::nullopt : std::optional(end), framerateFrom(numbers[2], numbers[3])};
        if (!isSoundHead(head))
            return std::nullopt;
        return StoredHead{head, numbers[5], numbers[1] == PointsLayout};
    }
};

PreviewRecord PreviewRecord::ofContent(const Track& track, double start, const core::Framerate& framerate)
{
    PreviewRecord record({start, std::nullopt, std::nullopt}, Compared::Contents);
    if (!framerate.isUnknown())
        record.m_head.framerate = framerate;
    for (const Node& child : childrenOf(*nodeOf(track))) {
        if (!isBefore(child->getStart(nullptr), start))
            record.add(record.numbersOf(*child));
    }
    for (const Node& curve : curvesOf(*track.node())) {
        for (const Node& point : childrenOf(*curve)) {
            const double time = point->getStart(curve.get());
            if (isBefore(time, start))
                continue;
            record.reachTo(time);
            record.m_automation.add(*curve, *point);
        }
    }
    return record;
}

std::optional<PreviewRecord> PreviewRecord::keptBy(const Track& track)
{
    const std::optional<Numbers> numbers = numbersOn(track, AttributeKey::Preview);
    if (!numbers || numbers->empty())
        return std::nullopt;
    std::optional<PreviewRecord> record;
    if (const auto stored = StoredHead::of(*numbers))
        record = ofContents(*stored, track);
    else if (!StoredHead::isOne(*numbers))
        record = numbers->size() == 1 || numbers->size() % 2 == 0 ? ofPlaces(*numbers) : ofNames(*numbers);
    return record && record->isSound() ? record : std::nullopt;
}

std::optional<PreviewRecord::Head> PreviewRecord::headKeptBy(const Track& track)
{
    const std::optional<Numbers> numbers = numbersOn(track, AttributeKey::Preview);
    if (numbers && StoredHead::isOne(*numbers)) {
        const auto stored = StoredHead::of(*numbers);
        return stored ? std::optional(stored->head) : std::nullopt;
    }
    const auto record = keptBy(track);
    return record ? std::optional(record->m_head) : std::nullopt;
}

std::optional<PreviewRecord> PreviewRecord::ofPlaces(const Numbers& numbers)
{
    PreviewRecord record({numbers.front(), std::nullopt, std::nullopt}, Compared::Places);
    if (numbers.size() == 1)
        return record;
    if (numbers[1] < record.start())
        return std::nullopt;
    for (std::size_t index = 2; index < numbers.size(); index += 2)
        record.add(Event{numbers[index], numbers[index + 1], 0.0, 0.0});
    record.reachTo(numbers[1]);
    record.m_automation = WrittenAutomation::upTo(*record.end(), std::nullopt);
    return record;
}

std::optional<PreviewRecord> PreviewRecord::ofNames(const Numbers& numbers)
{
    if (numbers.size() < NamesHeadSize || (numbers.size() - NamesHeadSize) % EventSize != 0 ||
        numbers[1] != NamesLayout)
        return std::nullopt;
    PreviewRecord record({numbers.front(), std::nullopt, framerateFrom(numbers[2], numbers[3])}, Compared::Names);
    const double end = numbers[4];
    if (end < record.start())
        return numbers.size() == NamesHeadSize ? std::optional(record) : std::nullopt;
    record.add(numbers, NamesHeadSize);
    record.reachTo(end);
    record.m_automation = WrittenAutomation::upTo(*record.end(), std::nullopt);
    return record;
}

std::optional<PreviewRecord> PreviewRecord::ofContents(const StoredHead& head, const Track& track)
{
    const Numbers events = numbersOn(track, AttributeKey::PreviewEvents).value_or(Numbers());
    const std::optional<Numbers> curves = readNumbers(*nodeOf(track), AttributeKey::PreviewCurves);
    if (!curves && nodeOf(track)->hasAttribute(AttributeKey::PreviewCurves) == ResultOk)
        return std::nullopt;
    const Numbers points = head.knowsPoints ? curves.value_or(Numbers()) : Numbers();
    if (events.size() % EventSize != 0 || head.checksum != checksumOf(joined(events, points)))
        return std::nullopt;
    auto automation = head.knowsPoints ? WrittenAutomation::ofNumbers(points) : automationOn(curves, head.head);
    if (!automation)
        return std::nullopt;
    PreviewRecord record(head.head, Compared::Contents);
    record.add(events, 0);
    record.m_automation = *std::move(automation);
    return record;
}

bool PreviewRecord::isKeptBy(const Track& track)
{
    return nodeOf(track)->hasAttribute(AttributeKey::Preview) == ResultOk;
}

void PreviewRecord::dropFrom(const Track& track)
{
    removeNumbers(*nodeOf(track), AttributeKey::Preview);
    removeNumbers(*nodeOf(track), AttributeKey::PreviewEvents);
    removeNumbers(*nodeOf(track), AttributeKey::PreviewCurves);
}

void PreviewRecord::keepOn(IHostContext* context, const Track& track) const
{
    const Counted<IProjectNode> node = nodeOf(track);
    const auto keep = [&](const char* key, const Numbers& numbers) {
        if (numbers.empty())
            removeNumbers(*node, key);
        else
            writeNumbers(context, *node, key, numbers);
    };
    keep(AttributeKey::PreviewEvents, m_numbers);
    keep(AttributeKey::PreviewCurves, m_automation.numbers());
    const core::Framerate framerate = m_head.framerate.value_or(core::Framerate());
    Numbers head{start(),
                 PointsLayout,
                 framerate.rate,
                 static_cast<double>(flagsOf(framerate)),
                 end().value_or(start() - 1.0),
                 checksumOf(joined(m_numbers, m_automation.numbers()))};
    head.push_back(checksumOf(head));
    writeNumbers(context, *node, AttributeKey::Preview, head);
}

std::vector<PreviewRecord::Node> PreviewRecord::others(std::vector<Node> events) const
{
    auto left = m_events;
    std::erase_if(events, [&](const Node& event) {
        const auto found = left.find(knownOf(numbersOf(*event)));
        return found != left.end() && found->second-- > 0;
    });
    return events;
}

PreviewRecord::Event PreviewRecord::numbersOf(IProjectNode& event) const
{
    const std::uint32_t print = m_compared == Compared::Contents ? contentPrintOf(event) : namePrintOf(event);
    return {event.getStart(nullptr), event.getEnd(nullptr), event.getSourceOffset(nullptr), static_cast<double>(print)};
}

PreviewRecord::Known PreviewRecord::knownOf(const Event& event) const
{
    const auto [start, end, offset, print] = event;
    if (m_compared == Compared::Places)
        return {toInstant(start), toInstant(end), 0, 0};
    return {toInstant(start), toInstant(end), toInstant(offset), std::llround(print)};
}

void PreviewRecord::add(const Event& event)
{
    ++m_events[knownOf(event)];
    m_numbers.insert(m_numbers.end(), event.begin(), event.end());
    reachTo(event[1]);
}

void PreviewRecord::add(const Numbers& events, std::size_t from)
{
    for (std::size_t index = from; index < events.size(); index += EventSize)
        add(Event{events[index], events[index + 1], events[index + 2], events[index + 3]});
}

void PreviewRecord::reachTo(double time)
{
    m_head.end = std::max(end().value_or(time), time);
}

bool PreviewRecord::isSound() const
{
    const bool isInOrder = m_events.empty() || m_events.begin()->first[0] >= toInstant(start()) - 1;
    return isInOrder && isSoundHead(m_head);
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
