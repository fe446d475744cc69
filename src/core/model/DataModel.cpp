// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/model/DataModel.h"

#include "core/change/HealProcessing.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventEdges.h"
#include "core/notify/ChangeContext.h"
#include "core/serialize/ByteArchive.h"
#include "core/settings/VfxNameMatcher.h"
#include "core/time/Framerate.h"
#include "core/time/SecondsRange.h"

#include <algorithm>
#include <cstddef>
#include <unordered_set>
#include <utility>

namespace cadrel::core {

using serialize::ByteArchive;
using util::Result;

namespace {

constexpr std::uint32_t PersistenceVersion = 1;

using Events = std::vector<std::shared_ptr<EventBase>>;

/// Says for each of the events whether it is in the list.
std::vector<bool> areIn(const EventList& list, const Events& events)
{
    std::vector<bool> answers(events.size());
    // Mostly they come in the list's order, and no set is needed.
    auto place = list.events().begin();
    std::size_t index = 0;
    for (; index < events.size(); ++index) {
        place = std::find(place, list.events().end(), events[index]);
        if (place == list.events().end())
            break;
        answers[index] = true;
    }
    if (index == events.size())
        return answers;

    std::unordered_set<const EventBase*> members;
    members.reserve(list.size());
    for (const auto& event : list.events())
        members.insert(event.get());
    for (; index < events.size(); ++index)
        answers[index] = members.contains(events[index].get());
    return answers;
}

/// Keeps events that it has not yet had, in the order in which they come.
class DistinctEvents {
public:
    void add(const std::shared_ptr<EventBase>& event)
    {
        if (m_known.insert(event.get()).second)
            m_events.push_back(event);
    }
    Events take() { return std::move(m_events); }

private:
    Events m_events;
    std::unordered_set<const EventBase*> m_known;
};

/// Calls `take` with the events of a programme that play in a range, in the order of their edges. It may get one twice.
template <class Take>
void forEachPlaying(const EventEdges& programme, const SecondsRange& range, const Take& take)
{
    // Shrunk, so that a neighbour that merely touches isn't hit.
    const double start = range.start + SameInstant;
    const double end = range.end - SameInstant;
    if (start > end)
        throw Result::InvalidArgument;
    programme.forEachInRange(start, end, take);
}

} // namespace

DataModel::DataModel()
    : Serializable(PersistenceVersion), m_oldEdl(ListKind::Old), m_newEdl(ListKind::New), m_changeEdl(ListKind::Change)
{
    startListening();
}

DataModel::~DataModel()
{
    stopListening();
}

void DataModel::setNotifier(ChangeContextNotificationBase* notifier)
{
    m_notifier = notifier;
}

void DataModel::startListening()
{
    for (ChangeContextNotificationBase* source : sources())
        source->addListener(this);
}

void DataModel::stopListening()
{
    for (ChangeContextNotificationBase* source : sources())
        source->removeListener(this);
}

std::array<ChangeContextNotificationBase*, 5> DataModel::sources()
{
    return {&m_oldEdl, &m_newEdl, &m_changeEdl, &m_settings, &m_videoList};
}

void DataModel::send(const ChangeContext& context)
{
    if (m_notifier != nullptr)
        m_notifier->notify(context);
}

void DataModel::onChange(const ChangeContext& context)
{
    send(context);
}

void DataModel::setProperty(std::int32_t key, const Variant& value)
{
    m_properties[key] = value;
}

bool DataModel::hasProperty(std::int32_t key) const
{
    return m_properties.contains(key);
}

void DataModel::removeProperty(std::int32_t key)
{
    m_properties.erase(key);
}

Result::Type DataModel::getProperty(std::int32_t key, Variant& value) const
{
    const auto found = m_properties.find(key);
    if (found == m_properties.end())
        return Result::InvalidArgument;
    value = found->second;
    return Result::Ok;
}

bool DataModel::isPreviewActive() const
{
    Variant flag(false);
    getProperty(PropertyKey::PreviewActive, flag);
    return flag.toBool();
}

void DataModel::setPreviewActive(bool flag)
{
    setProperty(PropertyKey::PreviewActive, Variant(flag));
}

void DataModel::notifyPreviewState()
{
    m_notifier->notify(ChangeContext(ChangeContext::PreviewStateChanged));
}

Result::Type DataModel::generateChangeEdl()
{
    return generateChangeEdl([](const GenerationFailure&) { return FailureAnswer::Stop; });
}

Result::Type DataModel::generateChangeEdl(const GenerationFailureListener& onFailure)
{
    stopListening();
    Result::Type result = Result::Ok;
    try {
        result = generateAndHeal(onFailure);
        if (result != Result::Ok)
            m_changeEdl.clear();
    } catch (...) {
        startListening();
        throw;
    }
    startListening();
    send(EventListChangeContext(m_changeEdl.listKind()));
    return result;
}

Result::Type DataModel::generateAndHeal(const GenerationFailureListener& onFailure)
{
    try {
        m_generator.configure(m_settings.matchBy(), m_settings.vfxPatterns());
        const Result::Type result = m_generator.generate(m_oldEdl, m_newEdl, m_changeEdl, onFailure);
        if (result == Result::Ok)
            HealProcessing().process(m_changeEdl, {&m_newEdl, &m_settings, Timecode::framerate()});
        return result;
    } catch (Result::Type failure) {
        return failure;
    }
}

void DataModel::applyVfxHandling()
{
    VfxNameMatcher patterns;
    patterns.compileEnabled(m_settings.vfxPatterns());
    m_oldEdl.markVfx(patterns, m_settings.matchBy());
    m_newEdl.markVfx(patterns, m_settings.matchBy());
}

EventList DataModel::oldEventsFor(const std::shared_ptr<EventBase>& changeEvent) const
{
    return oldEventsFor(std::vector{changeEvent}).front();
}

EventList DataModel::newEventsFor(const std::shared_ptr<EventBase>& changeEvent) const
{
    return newEventsFor(std::vector{changeEvent}).front();
}

std::vector<EventList> DataModel::oldEventsFor(const std::vector<std::shared_ptr<EventBase>>& changeEvents) const
{
    return eventsFor(changeEvents, m_oldEdl, &EventBase::srcIn, &EventBase::srcOut);
}

std::vector<EventList> DataModel::newEventsFor(const std::vector<std::shared_ptr<EventBase>>& changeEvents) const
{
    return eventsFor(changeEvents, m_newEdl, &EventBase::dstIn, &EventBase::dstOut);
}

std::vector<std::shared_ptr<EventBase>>
DataModel::oldEventsBehind(const std::vector<std::shared_ptr<EventBase>>& changeEvents) const
{
    return eventsBehind(changeEvents, m_oldEdl, &EventBase::srcIn, &EventBase::srcOut);
}

std::vector<std::shared_ptr<EventBase>>
DataModel::newEventsBehind(const std::vector<std::shared_ptr<EventBase>>& changeEvents) const
{
    return eventsBehind(changeEvents, m_newEdl, &EventBase::dstIn, &EventBase::dstOut);
}

template <class Take>
void DataModel::forEventsBehind(const std::vector<std::shared_ptr<EventBase>>& changeEvents, const EventList& programme,
                                TimecodeOf in, TimecodeOf out, const Take& take) const
{
    const std::vector<bool> areMembers = areIn(m_changeEdl, changeEvents);
    if (std::find(areMembers.begin(), areMembers.end(), true) == areMembers.end())
        return;
    const Framerate framerate = Timecode::framerate();
    const EventEdges edges(programme.events(), &EventBase::dstIn, &EventBase::dstOut, framerate);
    for (std::size_t index = 0; index < changeEvents.size(); ++index) {
        const std::shared_ptr<EventBase>& change = changeEvents[index];
        if (areMembers[index] && !change->hasFlaw(EventFlaw::TimecodeInvalid) && change->srcIn() < change->srcOut() &&
            change->dstIn() < change->dstOut())
            forEachPlaying(edges,
                           {(change.get()->*in)().toSeconds(framerate), (change.get()->*out)().toSeconds(framerate)},
                           [&](const std::shared_ptr<EventBase>& event) { take(index, event); });
    }
}

std::vector<EventList> DataModel::eventsFor(const std::vector<std::shared_ptr<EventBase>>& changeEvents,
                                            const EventList& programme, TimecodeOf in, TimecodeOf out) const
{
    std::vector<DistinctEvents> found(changeEvents.size());
    forEventsBehind(changeEvents, programme, in, out,
                    [&](std::size_t index, const auto& event) { found[index].add(event); });
    std::vector<EventList> lists(found.size());
    for (std::size_t index = 0; index < found.size(); ++index)
        lists[index].append(found[index].take());
    return lists;
}

std::vector<std::shared_ptr<EventBase>>
DataModel::eventsBehind(const std::vector<std::shared_ptr<EventBase>>& changeEvents, const EventList& programme,
                        TimecodeOf in, TimecodeOf out) const
{
    DistinctEvents found;
    forEventsBehind(changeEvents, programme, in, out, [&](std::size_t, const auto& event) { found.add(event); });
    return found.take();
}

void DataModel::revalidateEvents()
{
    stopListening();
    try {
        for (const EventList* list : {&m_oldEdl, &m_newEdl, &m_changeEdl}) {
            for (const auto& event : list->events())
                event->revalidate();
        }
    } catch (...) {
        startListening();
        throw;
    }
    startListening();
    send(DataModelChangeContext(this));
}

void DataModel::reset()
{
    m_oldEdl.clear();
    m_newEdl.clear();
    m_changeEdl.clear();
    m_properties.clear();
    m_settings.reset();
    m_videoList.clear();
}

void DataModel::restore(ByteArchive& archive)
{
    const Settings kept = m_settings;
    const auto finish = [&] {
        m_restoring = false;
        m_settings = kept;
        send(DataModelChangeContext(this));
    };
    m_restoring = true;
    try {
        deserialize(archive);
    } catch (...) {
        finish();
        throw;
    }
    finish();
}

void DataModel::readCurrent(ByteArchive& archive)
{
    stopListening();
    Result::Type result = Result::Ok;
    try {
        readMembers(archive);
        archive >> m_videoList;
    } catch (Result::Type failure) {
        result = failure;
    } catch (...) {
        result = Result::NotAvailable;
    }
    finishReading(result, !m_restoring);
}

void DataModel::readOlder(ByteArchive& archive, std::uint32_t version)
{
    stopListening();
    Result::Type result = Result::Ok;
    try {
        if (version != 0)
            throw Result::UnknownVersion;
        readMembers(archive);
    } catch (Result::Type) {
        result = Result::UnknownVersion;
    } catch (...) {
        result = Result::NotAvailable;
    }
    finishReading(result, result == Result::Ok || !m_restoring);
}

void DataModel::finishReading(Result::Type result, bool notifies)
{
    if (result != Result::Ok)
        reset();
    startListening();
    if (notifies)
        send(DataModelChangeContext(this));
    if (result != Result::Ok)
        throw result;
}

void DataModel::readMembers(ByteArchive& archive)
{
    archive >> m_oldEdl >> m_newEdl >> m_changeEdl;
    m_properties.clear();
    const std::size_t count = archive.readCount();
    for (std::size_t index = 0; index < count; ++index) {
        std::int32_t key = 0;
        archive >> key;
        archive >> m_properties[key];
    }
    archive >> m_settings;
}

void DataModel::write(ByteArchive& archive) const
{
    archive << m_oldEdl << m_newEdl << m_changeEdl;
    archive.writeCount(m_properties.size());
    for (const auto& [key, value] : m_properties)
        archive << key << value;
    archive << m_settings << m_videoList;
}

} // namespace cadrel::core
