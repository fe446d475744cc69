#include "core/DataModel.h"

#include "core/ChangeContext.h"
#include "core/CutMap.h"
#include "core/EventBase.h"
#include "core/HealProcessing.h"
#include "core/SecondsRange.h"
#include "core/VfxNameMatcher.h"
#include "core/serialize/ByteArchive.h"

namespace cadrel::core {

using serialize::ByteArchive;
using util::Result;

namespace {

constexpr std::uint32_t PersistenceVersion = 1;

} // namespace

DataModel::DataModel()
    : Serializable(PersistenceVersion), oldEdl_(ListKind::Old), newEdl_(ListKind::New), changeEdl_(ListKind::Change)
{
    startListening();
}

DataModel::~DataModel()
{
    stopListening();
}

void DataModel::setNotifier(ChangeContextNotificationBase* notifier)
{
    notifier_ = notifier;
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
    return {&oldEdl_, &newEdl_, &changeEdl_, &settings_, &videoList_};
}

void DataModel::send(const ChangeContext& context)
{
    if (notifier_ != nullptr)
        notifier_->notify(context);
}

void DataModel::onChange(const ChangeContext& context)
{
    send(context);
}

void DataModel::setProperty(std::int32_t key, const Variant& value)
{
    properties_[key] = value;
}

bool DataModel::hasProperty(std::int32_t key) const
{
    return properties_.contains(key);
}

void DataModel::removeProperty(std::int32_t key)
{
    properties_.erase(key);
}

Result::Type DataModel::getProperty(std::int32_t key, Variant& value) const
{
    const auto found = properties_.find(key);
    if (found == properties_.end())
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
    notifier_->notify(ChangeContext(ChangeContext::PreviewStateChanged));
}

Result::Type DataModel::generateChangeEdl()
{
    stopListening();
    const Result::Type result = generateAndHeal();
    if (result != Result::Ok)
        changeEdl_.clear();
    startListening();
    send(EventListChangeContext(changeEdl_.listKind()));
    return result;
}

Result::Type DataModel::generateAndHeal()
{
    try {
        generator_.configure(settings_.matchBy(), settings_.vfxPatterns());
        const Result::Type result = generator_.generate(oldEdl_, newEdl_, changeEdl_);
        if (result == Result::Ok)
            HealProcessing().process(changeEdl_, {&newEdl_, &settings_, Timecode::framerate()});
        return result;
    } catch (Result::Type failure) {
        return failure;
    }
}

void DataModel::applyVfxHandling()
{
    VfxNameMatcher patterns;
    patterns.compileEnabled(settings_.vfxPatterns());
    oldEdl_.markVfx(patterns, settings_.matchBy());
    newEdl_.markVfx(patterns, settings_.matchBy());
}

EventList DataModel::oldEventsFor(const std::shared_ptr<EventBase>& changeEvent) const
{
    if (!isPlacedChange(changeEvent))
        return EventList();
    return eventsOf(oldEdl_, changeEvent->srcIn(), changeEvent->srcOut());
}

EventList DataModel::newEventsFor(const std::shared_ptr<EventBase>& changeEvent) const
{
    if (!isPlacedChange(changeEvent))
        return EventList();
    return eventsOf(newEdl_, changeEvent->dstIn(), changeEvent->dstOut());
}

bool DataModel::isPlacedChange(const std::shared_ptr<EventBase>& event) const
{
    return changeEdl_.contains(event) && !event->hasFlaw(EventFlaw::TimecodeInvalid) &&
           event->srcIn() < event->srcOut() && event->dstIn() < event->dstOut();
}

EventList DataModel::eventsOf(const EventList& programme, const Timecode& in, const Timecode& out)
{
    const CutMap map(programme, Timecode::framerate());
    // Shrunk, so that a neighbour that merely touches isn't hit.
    const double start = in.toSeconds() + SameInstant;
    const double end = out.toSeconds() - SameInstant;
    if (start > end)
        throw Result::InvalidArgument;
    EventList found;
    for (const auto& event : map.eventsInDestinationRange(start, end))
        found.add(std::shared_ptr<EventBase>(event));
    return found;
}

void DataModel::revalidateEvents()
{
    stopListening();
    try {
        for (const EventList* list : {&oldEdl_, &newEdl_, &changeEdl_}) {
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
    oldEdl_.clear();
    newEdl_.clear();
    changeEdl_.clear();
    properties_.clear();
    settings_.reset();
    videoList_.clear();
}

void DataModel::restore(ByteArchive& archive)
{
    const Settings kept = settings_;
    const auto finish = [&] {
        restoring_ = false;
        settings_ = kept;
        send(DataModelChangeContext(this));
    };
    restoring_ = true;
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
        archive >> videoList_;
    } catch (Result::Type failure) {
        result = failure;
    } catch (...) {
        result = Result::NotAvailable;
    }
    finishReading(result, !restoring_);
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
    finishReading(result, result == Result::Ok || !restoring_);
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
    archive >> oldEdl_ >> newEdl_ >> changeEdl_;
    properties_.clear();
    const std::size_t count = archive.readCount();
    for (std::size_t index = 0; index < count; ++index) {
        std::int32_t key = 0;
        archive >> key;
        archive >> properties_[key];
    }
    archive >> settings_;
}

void DataModel::write(ByteArchive& archive) const
{
    archive << oldEdl_ << newEdl_ << changeEdl_;
    archive.writeCount(properties_.size());
    for (const auto& [key, value] : properties_)
        archive << key << value;
    archive << settings_ << videoList_;
}

} // namespace cadrel::core
