// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notify/ChangeContextListenerInterface.h"
#include "core/notify/ChangeContextNotificationBase.h"
#include "core/serialize/Serializable.h"
#include "core/time/TimecodeRange.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::core {

class EventBase;
struct Framerate;
class VfxNameMatcher;

namespace fileio {
class ParserInterface;
} // namespace fileio

struct ListKind {
    /// Change is also the kind of every temporary list.
    enum Type : std::int32_t { Old = 0, New = 1, Change = 2 };
};

/// Chooses between SRC IN and SRC OUT, and DST IN and DST OUT.
enum class ListSide : std::int32_t { Source = 0, Destination = 1 };

/// An ordered sequence of shared events: the old, the new and the change EDL, the members of a healed event, any
/// selection. Events stay in the order in which they were added; duplicates are allowed. A list listens to its events,
/// and announces their changes as changes of the list.
///
/// A bulk edit stops listening to the events, does its work, listens again and sends one EventListChangeContext with
/// the list's kind. After a failure, what was done before it stays, and the list no longer listens to its events unless the
/// operation says otherwise.
class EventList : public serialize::Serializable,
                  public ChangeContextNotificationBase,
                  public ChangeContextListenerInterface {
public:
    explicit EventList(std::int32_t listKind = ListKind::Change);
    /// A list of kind 2 that shares the other's events.
    EventList(const EventList& other);
    /// Shares the other's events and keeps the own kind; notifies. Self-assignment does nothing.
    EventList& operator=(const EventList& other);
    ~EventList() override;

    std::size_t size() const { return m_events.size(); }
    bool isEmpty() const { return m_events.empty(); }
    std::int32_t listKind() const { return m_listKind; }
    /// No bounds check.
    std::shared_ptr<EventBase> eventAt(std::size_t index) const { return m_events[index]; }
    /// No bounds check.
    EventBase& at(std::size_t index) const { return *m_events[index]; }
    const std::vector<std::shared_ptr<EventBase>>& events() const { return m_events; }
    /// Whether this very object is in the list.
    bool contains(const std::shared_ptr<EventBase>& event) const;
    /// The number of events with any flaw.
    std::size_t countInvalid() const;
    /// The number of events with EventFlaw::TimecodeInvalid.
    std::size_t countInvalidTimecodes() const;
    /// Whether some event has none of the flaws 1 to 10.
    bool hasReadableEvent() const;
    /// From the earliest start to the latest end of the valid events; 00:00:00:00 to 00:00:00:00 when there are none.
    /// Throw Result::NotAvailable for an empty list.
    TimecodeRange sourceRange() const { return range(ListSide::Source); }
    TimecodeRange destinationRange() const { return range(ListSide::Destination); }

    /// Throws Result::InvalidArgument for null; no event of a list is ever null.
    void add(std::shared_ptr<EventBase> event);
    /// Shares all events of `other`, which may be this list.
    void append(const EventList& other);
    void append(std::vector<std::shared_ptr<EventBase>> events);
    /// Shares `count` events of `other` from `first`. A count of 0 does nothing and sends nothing. Throws
    /// Result::OutOfRange when they pass the end of `other`.
    void append(const EventList& other, std::size_t first, std::size_t count);
    /// A count of 0 does nothing and sends nothing. Throws Result::OutOfRange when the range passes the end.
    void erase(std::size_t first, std::size_t count);
    /// Removes every event that is in `other`, by identity.
    void remove(const EventList& other);
    /// Notifies also when the list was empty.
    void clear();
    /// Makes the list listen to all events or to none, without a notification, for a caller's own bulk edit.
    void setListening(bool flag);
    /// Returns the events and leaves the list empty, without a notification.
    std::vector<std::shared_ptr<EventBase>> release();
    /// Replaces the content by copies of the other's events, in two notifications. Each copy is a plain EventBase made
    /// by assignment, so that a healed event keeps its kind but loses its members.
    void copyFrom(const EventList& other);
    /// Replaces the content by the other's, but keeps each of this list's events that has the same four timecodes as
    /// one of the other's. The kept ones come first, in the order of `other`, then the added ones, with a notification
    /// each.
    void mergeFrom(const EventList& other);
    /// Moves all valid events by `offset`, towards the end of the day when `forward`. Throw Result::OutOfRange, with
    /// nothing changed, when the list's range would leave the day, and what sourceRange throws.
    void shiftSource(const Timecode& offset, bool forward) { shift(ListSide::Source, offset, forward); }
    void shiftDestination(const Timecode& offset, bool forward) { shift(ListSide::Destination, offset, forward); }

    /// Reads an EDL. Its events come after the present ones with `append`, otherwise they replace them. `framerate`
    /// receives the rate that the file shows. With `renameBRolls`, a roll "A001B" is named "A001" when the file also
    /// has a roll "A001". Throws what the reader returns, such as Result::FileAccessFailed for a file that can't be
    /// read; without `append` the list is empty then. Throws
    /// Result::NotAvailable without a FramerateProvider, with nothing changed.
    void load(const std::wstring& fileName, bool append, Framerate& framerate, bool renameBRolls,
              bool acceptAudioChannels);
    /// Reads after the present events with a parser of the caller, who can ask it then what else it found in the file.
    void load(const std::wstring& fileName, Framerate& framerate, bool renameBRolls, bool acceptAudioChannels,
              fileio::ParserInterface& parser);
    /// Without renaming B-rolls and without audio.
    void load(const std::wstring& fileName, bool append);
    /// Writes a CMX EDL, or several if there are more events than one file can hold; see fileio::CmxWriter. Throws what
    /// the writer returns.
    void save(const std::wstring& fileName) const;

    /// Marks each event as a VFX shot or not by its roll name, or its clip name when `matchBy` is 1. One notification,
    /// and none when nothing changed.
    void markVfx(const VfxNameMatcher& patterns, std::int32_t matchBy);
    /// One notification, and none when nothing changed.
    void clearVfx();

    /// Undoes the healing of the selected events and heals them again by `healMode` (HealMode), with the inserts of
    /// `referenceList`. The list is sorted by DST IN and numbered from 1 afterwards, the healed events named by their
    /// order. A member of a healed event is kept as it is if its timecodes have become invalid. Throws what
    /// HealProcessing throws; no event is lost then, and the list goes on listening.
    void heal(const EventList& selection, const EventList& referenceList, std::int32_t healMode);
    /// Whether `heal` would change the number of events. Changes nothing. False for a selection with gaps in this list.
    bool canHeal(const EventList& selection, const EventList& referenceList, std::int32_t healMode) const;
    /// Extends an event to the end of the one before it, or to the start of the one after it, by the same length on
    /// both sides. Does nothing if there is no such neighbour. Throws Result::OutOfRange when the two overlap or the
    /// source would leave the day, with the event unchanged; the list goes on listening.
    void extendEvent(const std::shared_ptr<EventBase>& event, bool previous);
    /// Whether there is a neighbour and a gap between the two; never throws.
    bool canExtendEvent(const std::shared_ptr<EventBase>& event, bool previous) const;

    /// Sends the list's own context when an event changes; ignores everything else.
    void onChange(const ChangeContext& context) override;

    /// Throws Result::CorruptData for an unknown kind of event, and what the events throw. The list holds the events
    /// before it then, and goes on listening.
    void readCurrent(serialize::ByteArchive& archive) override;
    void write(serialize::ByteArchive& archive) const override;

private:
    /// While it lives, the list doesn't listen to its events. The list listens again also when the edit has failed.
    class PausedListening {
    public:
        explicit PausedListening(EventList& list) : m_list(list) { m_list.stopListening(); }
        PausedListening(const PausedListening&) = delete;
        PausedListening& operator=(const PausedListening&) = delete;
        ~PausedListening() { m_list.listen(); }

    private:
        EventList& m_list;
    };

    void listen();
    void stopListening();
    void notifyListeners();
    TimecodeRange range(ListSide side) const;
    void shift(ListSide side, const Timecode& offset, bool forward);
    void readEvents(serialize::ByteArchive& archive, std::size_t count);
    /// Into the gap to the neighbour.
    void extendInto(const std::shared_ptr<EventBase>& event, bool previous) const;
    void healSelection(const EventList& selection, const EventList& referenceList, std::int32_t healMode);

    std::vector<std::shared_ptr<EventBase>> m_events;
    std::int32_t m_listKind;
};

} // namespace cadrel::core
