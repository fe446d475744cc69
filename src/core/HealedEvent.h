#pragma once

#include "core/EventBase.h"
#include "core/EventList.h"

namespace cadrel::core {

/// An event that stands for several events joined together. Its four timecodes span its members on both sides, gaps
/// included.
class HealedEvent : public EventBase {
public:
    /// How many healed events may stand within each other in a stream, the outermost included.
    static constexpr int DeepestNesting = 8;

    HealedEvent();
    HealedEvent(const HealedEvent&) = default;
    HealedEvent& operator=(const HealedEvent&) = default;
    ~HealedEvent() override;

    /// Adds a member, shared, and widens this event over it, without a notification of this event.
    void addEvent(std::shared_ptr<EventBase> event);
    EventList& healedEvents() { return healedEvents_; }
    const EventList& healedEvents() const { return healedEvents_; }

    /// Reading and writing throw Result::CorruptData where the nesting goes beyond DeepestNesting.
    void readCurrent(serialize::ByteArchive& archive) override;
    void write(serialize::ByteArchive& archive) const override;
    void readOlder(serialize::ByteArchive& archive, std::uint32_t version) override;

private:
    void readMembers(serialize::ByteArchive& archive, std::uint32_t version);

    EventList healedEvents_;
};

} // namespace cadrel::core
