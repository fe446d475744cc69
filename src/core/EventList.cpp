#include "core/EventList.h"

#include "core/EventBase.h"
#include "core/HealedEvent.h"
#include "core/serialize/ByteArchive.h"
#include "util/Result.h"

#include <algorithm>
#include <array>
#include <iterator>
#include <map>
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

EventList::EventList(std::int32_t listKind) : Serializable(PersistenceVersion), listKind_(listKind) {}

EventList::EventList(const EventList& other)
    : Serializable(other), ChangeContextNotificationBase(), ChangeContextListenerInterface(),
      listKind_(ListKind::Change)
{
    *this = other;
}

EventList& EventList::operator=(const EventList& other)
{
    if (this == &other)
        return *this;
    // The other list may live in one of the own events, a healed one, which ends with them.
    Events shared = other.events_;
    stopListening();
    std::swap(events_, shared);
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
    return std::find(events_.begin(), events_.end(), event) != events_.end();
}

std::size_t EventList::countInvalid() const
{
    return static_cast<std::size_t>(
        std::count_if(events_.begin(), events_.end(), [](const auto& event) { return !event->isValid(); }));
}

std::size_t EventList::countInvalidTimecodes() const
{
    return static_cast<std::size_t>(std::count_if(
        events_.begin(), events_.end(), [](const auto& event) { return event->hasFlaw(EventFlaw::TimecodeInvalid); }));
}

bool EventList::hasReadableEvent() const
{
    return std::any_of(events_.begin(), events_.end(), [](const auto& event) { return !event->hasFormatFlaw(); });
}

TimecodeRange EventList::range(ListSide side) const
{
    if (isEmpty())
        throw Result::NotAvailable;
    const Timecode zero = Timecode::minTimecode();
    const Timecode latest = Timecode::maxTimecode();
    Timecode low = latest;
    Timecode high = zero;
    for (const auto& event : events_) {
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
    events_.push_back(std::move(event));
    notifyListeners();
}

void EventList::append(const EventList& other)
{
    append(Events(other.events_));
}

void EventList::append(Events events)
{
    stopListening();
    if (events_.empty())
        events_ = std::move(events);
    else
        events_.insert(events_.end(), std::move_iterator(events.begin()), std::move_iterator(events.end()));
    listen();
    notifyListeners();
}

void EventList::append(const EventList& other, std::size_t first, std::size_t count)
{
    if (count == 0)
        return;
    checkRange(first, count, other.size());
    const auto start = other.events_.begin() + static_cast<std::ptrdiff_t>(first);
    append(Events(start, start + static_cast<std::ptrdiff_t>(count)));
}

void EventList::erase(std::size_t first, std::size_t count)
{
    if (count == 0)
        return;
    checkRange(first, count, size());
    stopListening();
    const auto start = events_.begin() + static_cast<std::ptrdiff_t>(first);
    events_.erase(start, start + static_cast<std::ptrdiff_t>(count));
    listen();
    notifyListeners();
}

void EventList::remove(const EventList& other)
{
    const std::unordered_set<std::shared_ptr<EventBase>> removed(other.events_.begin(), other.events_.end());
    stopListening();
    std::erase_if(events_, [&](const auto& event) { return removed.contains(event); });
    listen();
    notifyListeners();
}

void EventList::clear()
{
    stopListening();
    events_.clear();
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
    return std::exchange(events_, {});
}

void EventList::copyFrom(const EventList& other)
{
    Events copies;
    copies.reserve(other.size());
    for (const auto& event : other.events_)
        copies.push_back(std::make_shared<EventBase>(*event));
    clear();
    events_ = std::move(copies);
    listen();
    notifyListeners();
}

void EventList::mergeFrom(const EventList& other)
{
    // The places of the own events with the same timecodes, the first one last, where it is taken from.
    std::map<TimecodeKey, std::vector<std::size_t>> places;
    for (std::size_t index = size(); index-- > 0;)
        places[timecodeKeyOf(at(index))].push_back(index);

    Events kept;
    Events added;
    for (const auto& event : other.events_) {
        const auto found = places.find(timecodeKeyOf(*event));
        if (found == places.end() || found->second.empty()) {
            added.push_back(event);
        } else {
            kept.push_back(events_[found->second.back()]);
            found->second.pop_back();
        }
    }

    stopListening();
    events_ = std::move(kept);
    events_.reserve(events_.size() + added.size());
    listen();
    notifyListeners();
    events_.insert(events_.end(), added.begin(), added.end());
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
    for (const auto& event : events_) {
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
    for (const auto& event : events_)
        event->addListener(this);
}

void EventList::stopListening()
{
    for (const auto& event : events_)
        event->removeListener(this);
}

void EventList::notifyListeners()
{
    notify(EventListChangeContext(listKind_));
}

void EventList::readCurrent(ByteArchive& archive)
{
    const std::size_t count = archive.readCount();
    stopListening();
    events_.clear();
    // Each event takes at least its kind and its version number.
    events_.reserve(std::min(count, archive.bytesLeft() / 8));
    for (std::size_t index = 0; index < count; ++index) {
        std::uint32_t kind = 0;
        archive >> kind;
        if (kind > EventKind::Healed)
            throw Result::CorruptData;
        const std::shared_ptr<EventBase> event = EventBase::create(static_cast<std::int32_t>(kind));
        archive >> *event;
        events_.push_back(event);
    }
    listen();
    notifyListeners();
}

void EventList::write(ByteArchive& archive) const
{
    archive.writeCount(size());
    for (const auto& event : events_) {
        // A plain copy of a healed event bears its kind, but not its body.
        const bool isHealed = dynamic_cast<const HealedEvent*>(event.get()) != nullptr;
        archive << static_cast<std::uint32_t>(isHealed ? EventKind::Healed : EventKind::Plain);
        archive << *event;
    }
}

} // namespace cadrel::core
