// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventList.h"

#include "core/edl/EventBase.h"
#include "core/edl/HealedEvent.h"
#include "core/serialize/ByteArchive.h"
#include "util/Result.h"

#include <algorithm>
#include <array>
#include <iterator>
#include <map>
#include <typeinfo>
#include <unordered_set>
#include <utility>

namespace cadrel::core {

using serialize::ByteArchive;
using util::Result;

namespace {

constexpr std::uint32_t PersistenceVersion = 0;

using Events = std::vector<std::shared_ptr<EventBase>>;

/// The four timecodes as numbers, for looking events up by them.
using TimecodeKey = std::array<std::int32_t, 16>;

TimecodeKey timecodeKeyOf(const EventBase& event)
{
    TimecodeKey key{};
    auto place = key.begin();
    for (const Timecode* timecode : {&event.srcIn(), &event.srcOut(), &event.dstIn(), &event.dstOut()}) {
        for (const std::int32_t field :
             {timecode->hours(), timecode->minutes(), timecode->seconds(), timecode->frames()})
            *place++ = field;
    }
    return key;
}

/// Throws Result::OutOfRange unless `count` elements from `first` lie within `size`.
void checkRange(std::size_t first, std::size_t count, std::size_t size)
{
    if (first > size || count > size - first)
        throw Result::OutOfRange;
}

const Timecode& startOf(const EventBase& event, ListSide side)
{
    return side == ListSide::Source ? event.srcIn() : event.dstIn();
}

const Timecode& endOf(const EventBase& event, ListSide side)
{
    return side == ListSide::Source ? event.srcOut() : event.dstOut();
}

} // namespace

EventList::EventList(std::int32_t listKind) : Serializable(PersistenceVersion), m_listKind(listKind) {}

EventList::EventList(const EventList& other)
    : Serializable(other), ChangeContextNotificationBase(), ChangeContextListenerInterface(),
      m_listKind(ListKind::Change)
{
    *this = other;
}

EventList& EventList::operator=(const EventList& other)
{
    if (this == &other)
        return *this;
    // The other list may belong to a healed event of this list, and would be destroyed with it.
    Events shared = other.m_events;
    stopListening();
    std::swap(m_events, shared);
    listen();
    notifyListeners();
    return *this;
}

EventList::~EventList()
{
    stopListening();
}

bool EventList::contains(const std::shared_ptr<EventBase>& event) const
{
    return std::find(m_events.begin(), m_events.end(), event) != m_events.end();
}

std::size_t EventList::countInvalid() const
{
    return static_cast<std::size_t>(
        std::count_if(m_events.begin(), m_events.end(), [](const auto& event) { return !event->isValid(); }));
}

std::size_t EventList::countInvalidTimecodes() const
{
    return static_cast<std::size_t>(std::count_if(m_events.begin(), m_events.end(), [](const auto& event) {
        return event->hasFlaw(EventFlaw::TimecodeInvalid);
    }));
}

bool EventList::hasReadableEvent() const
{
    return std::any_of(m_events.begin(), m_events.end(), [](const auto& event) { return !event->hasFormatFlaw(); });
}

TimecodeRange EventList::range(ListSide side) const
{
    if (isEmpty())
        throw Result::NotAvailable;
    const Timecode zero = Timecode::minTimecode();
    const Timecode latest = Timecode::maxTimecode();
    Timecode low = latest;
    Timecode high = zero;
    for (const auto& event : m_events) {
        if (!event->isValid())
            continue;
        if (low > startOf(*event, side))
            low = startOf(*event, side);
        if (high < endOf(*event, side))
            high = endOf(*event, side);
    }
    if (low == latest && high == zero)
        return {zero, zero};
    return {low, high};
}

void EventList::add(std::shared_ptr<EventBase> event)
{
    if (!event)
        throw Result::InvalidArgument;
    event->addListener(this);
    m_events.push_back(std::move(event));
    notifyListeners();
}

void EventList::append(const EventList& other)
{
    append(Events(other.m_events));
}

void EventList::append(Events events)
{
    stopListening();
    if (m_events.empty())
        m_events = std::move(events);
    else
        m_events.insert(m_events.end(), std::move_iterator(events.begin()), std::move_iterator(events.end()));
    listen();
    notifyListeners();
}

void EventList::append(const EventList& other, std::size_t first, std::size_t count)
{
    if (count == 0)
        return;
    checkRange(first, count, other.size());
    const auto start = other.m_events.begin() + static_cast<std::ptrdiff_t>(first);
    append(Events(start, start + static_cast<std::ptrdiff_t>(count)));
}

void EventList::erase(std::size_t first, std::size_t count)
{
    if (count == 0)
        return;
    checkRange(first, count, size());
    stopListening();
    const auto start = m_events.begin() + static_cast<std::ptrdiff_t>(first);
    m_events.erase(start, start + static_cast<std::ptrdiff_t>(count));
    listen();
    notifyListeners();
}

void EventList::remove(const EventList& other)
{
    const std::unordered_set<std::shared_ptr<EventBase>> removed(other.m_events.begin(), other.m_events.end());
    stopListening();
    std::erase_if(m_events, [&](const auto& event) { return removed.contains(event); });
    listen();
    notifyListeners();
}

void EventList::clear()
{
    stopListening();
    m_events.clear();
    notifyListeners();
}

void EventList::setListening(bool flag)
{
    if (flag)
        listen();
    else
        stopListening();
}

std::vector<std::shared_ptr<EventBase>> EventList::release()
{
    stopListening();
    return std::exchange(m_events, {});
}

void EventList::copyFrom(const EventList& other)
{
    Events copies;
    copies.reserve(other.size());
    for (const auto& event : other.m_events)
        copies.push_back(std::make_shared<EventBase>(*event));
    clear();
    m_events = std::move(copies);
    listen();
    notifyListeners();
}

void EventList::mergeFrom(const EventList& other)
{
    // The places of this list's events with the same timecodes, in reverse order, because they are taken from the end.
    std::map<TimecodeKey, std::vector<std::size_t>> places;
    for (std::size_t index = size(); index-- > 0;)
        places[timecodeKeyOf(at(index))].push_back(index);

    Events kept;
    Events added;
    for (const auto& event : other.m_events) {
        const auto found = places.find(timecodeKeyOf(*event));
        if (found == places.end() || found->second.empty()) {
            added.push_back(event);
        } else {
            kept.push_back(m_events[found->second.back()]);
            found->second.pop_back();
        }
    }

    stopListening();
    m_events = std::move(kept);
    m_events.reserve(m_events.size() + added.size());
    listen();
    notifyListeners();
    m_events.insert(m_events.end(), added.begin(), added.end());
    listen();
    notifyListeners();
}

void EventList::shift(ListSide side, const Timecode& offset, bool forward)
{
    if (isEmpty())
        return;
    const TimecodeRange whole = range(side);
    const bool leavesDay = forward ? whole.end > Timecode::maxTimecode() - offset : whole.start < offset;
    if (leavesDay)
        throw Result::OutOfRange;
    const double delta = forward ? offset.toSeconds() : -offset.toSeconds();

    stopListening();
    for (const auto& event : m_events) {
        if (!event->isValid())
            continue;
        const Timecode start(startOf(*event, side).toSeconds() + delta);
        const Timecode end(endOf(*event, side).toSeconds() + delta);
        if (side == ListSide::Source) {
            event->setSrcIn(start);
            event->setSrcOut(end);
        } else {
            event->setDstIn(start);
            event->setDstOut(end);
        }
    }
    listen();
    notifyListeners();
}

void EventList::onChange(const ChangeContext& context)
{
    if (context.type == ChangeContext::EventChanged)
        notifyListeners();
}

void EventList::listen()
{
    for (const auto& event : m_events)
        event->addListener(this);
}

void EventList::stopListening()
{
    for (const auto& event : m_events)
        event->removeListener(this);
}

void EventList::notifyListeners()
{
    notify(EventListChangeContext(m_listKind));
}

void EventList::readCurrent(ByteArchive& archive)
{
    readEvents(archive, archive.readCount());
    notifyListeners();
}

void EventList::readEvents(ByteArchive& archive, std::size_t count)
{
    const PausedListening paused(*this);
    m_events.clear();
    // Each event takes at least its kind and its version number.
    m_events.reserve(std::min(count, archive.bytesLeft() / 8));
    for (std::size_t index = 0; index < count; ++index) {
        std::uint32_t kind = 0;
        archive >> kind;
        if (kind > EventKind::Healed)
            throw Result::CorruptData;
        const std::shared_ptr<EventBase> event = EventBase::create(static_cast<std::int32_t>(kind));
        archive >> *event;
        m_events.push_back(event);
    }
}

void EventList::write(ByteArchive& archive) const
{
    archive.writeCount(size());
    for (const auto& event : m_events) {
        // A plain copy of a healed event has its kind, but not its body.
        const EventBase& object = *event;
        const bool isHealed = typeid(object) == typeid(HealedEvent);
        archive << static_cast<std::uint32_t>(isHealed ? EventKind::Healed : EventKind::Plain);
        archive << *event;
    }
}

} // namespace cadrel::core
