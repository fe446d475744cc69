// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/HealedEvent.h"

#include "core/serialize/ByteArchive.h"
#include "util/Result.h"

#include <utility>
#include <vector>

namespace cadrel::core {

using serialize::ByteArchive;
using util::Result;

namespace {

/// Counts the healed events that are being read or written within each other.
class NestingGuard {
public:
    NestingGuard()
    {
        if (depth >= HealedEvent::DeepestNesting)
            throw Result::CorruptData;
        ++depth;
    }
    NestingGuard(const NestingGuard&) = delete;
    NestingGuard& operator=(const NestingGuard&) = delete;
    ~NestingGuard() { --depth; }

private:
    static thread_local int depth;
};

thread_local int NestingGuard::depth = 0;

} // namespace

HealedEvent::HealedEvent() : EventBase(EventKind::Healed), m_healedEvents(ListKind::Change) {}

HealedEvent::~HealedEvent()
{
    // Healed events may be nested to any depth, so they are taken apart in a loop and not by recursion.
    std::vector<std::shared_ptr<EventBase>> orphans = m_healedEvents.release();
    while (!orphans.empty()) {
        const std::shared_ptr<EventBase> orphan = std::move(orphans.back());
        orphans.pop_back();
        if (orphan.use_count() > 1 || orphan->eventKind() != EventKind::Healed)
            continue;
        if (auto* healed = dynamic_cast<HealedEvent*>(orphan.get())) {
            for (std::shared_ptr<EventBase>& member : healed->m_healedEvents.release())
                orphans.push_back(std::move(member));
        }
    }
}

void HealedEvent::addEvent(std::shared_ptr<EventBase> event)
{
    m_healedEvents.add(event);
    if (event->vfx())
        markAsVfx();
    if (m_healedEvents.size() == 1)
        adoptTimecodes(*event);
    else
        widenTo(*event);
}

void HealedEvent::readCurrent(ByteArchive& archive)
{
    readMembers(archive, version());
}

void HealedEvent::write(ByteArchive& archive) const
{
    // What couldn't be read back is not written either.
    const NestingGuard guard;
    EventBase::write(archive);
    archive << m_healedEvents;
}

void HealedEvent::readOlder(ByteArchive& archive, std::uint32_t version)
{
    if (version >= this->version())
        throw Result::UnknownVersion;
    readMembers(archive, version);
}

void HealedEvent::readMembers(ByteArchive& archive, std::uint32_t version)
{
    const NestingGuard guard;
    readFields(archive, version);
    archive >> m_healedEvents;
    finishReading();
}

} // namespace cadrel::core
