// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"

namespace cadrel::core {

/// An event that stands for several events joined together. Its four timecodes span its members on both sides, gaps
/// included.
class HealedEvent : public EventBase {
public:
    /// How many levels of healed events a stream may have, with the outermost one.
    static constexpr int DeepestNesting = 8;

    HealedEvent();
    HealedEvent(const HealedEvent&) = default;
    HealedEvent& operator=(const HealedEvent&) = default;
    ~HealedEvent() override;

    /// Adds a shared member and widens this event to span it. This event sends no notification.
    void addEvent(std::shared_ptr<EventBase> event);
    EventList& healedEvents() { return m_healedEvents; }
    const EventList& healedEvents() const { return m_healedEvents; }

    /// Reading and writing throw Result::CorruptData when there are more levels than DeepestNesting.
    void readCurrent(serialize::ByteArchive& archive) override;
    void write(serialize::ByteArchive& archive) const override;
    void readOlder(serialize::ByteArchive& archive, std::uint32_t version) override;

private:
    void readMembers(serialize::ByteArchive& archive, std::uint32_t version);

    EventList m_healedEvents;
};

} // namespace cadrel::core
