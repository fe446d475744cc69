// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/change/ChangeEdlGenerator.h"
#include "core/edl/EventList.h"
#include "core/model/VideoList.h"
#include "core/notify/ChangeContextListenerInterface.h"
#include "core/serialize/Serializable.h"
#include "core/settings/Settings.h"
#include "core/settings/Variant.h"
#include "util/Result.h"

#include <array>
#include <cstdint>
#include <map>
#include <memory>
#include <vector>

namespace cadrel::core {

/// The keys of the data model's property map. The model itself uses only PreviewActive.
struct PropertyKey {
    enum Type : std::int32_t {
        LastEdlFolder = 10003,          ///< string
        PreviewOffset = 10004,          ///< double, seconds
        PreviewActive = 10005,          ///< bool
        OldTableSortColumn = 10006,     ///< integer
        OldTableSortForward = 10007,    ///< bool
        NewTableSortColumn = 10008,     ///< integer
        NewTableSortForward = 10009,    ///< bool
        ChangeTableSortColumn = 10010,  ///< integer
        ChangeTableSortForward = 10011, ///< bool
        ProjectCycleLeft = 10012,       ///< double, as it was when the preview was switched on
        ProjectCycleRight = 10013,      ///< double, likewise
        TransportCycleLower = 10014,    ///< double, likewise
        TransportCycleUpper = 10015,    ///< double, likewise
        TransportPosition = 10016,      ///< double, likewise
        OldTableSelection = 10017,      ///< string, row numbers joined with ";"
        NewTableSelection = 10018,      ///< string, likewise
        ChangeTableSelection = 10019,   ///< string, likewise
        PreviewAtDestination = 10020,   ///< bool
        EarlierRuns = 10022,            ///< string, of older versions: all runs but the one that the lists tell of
        DoneRuns = 10023,               ///< string, the bytes of PastRuns; see RunRecord
    };
};

/// The whole document: the old, the new and the change EDL, the settings, the videos and a map of small stored
/// properties. It listens to its members and forwards every change to the one notifier that it was given.
class DataModel : public serialize::Serializable, public ChangeContextListenerInterface {
public:
    DataModel();
    DataModel(const DataModel&) = delete;
    DataModel& operator=(const DataModel&) = delete;
    ~DataModel() override;

    EventList& oldEdl() { return m_oldEdl; }
    const EventList& oldEdl() const { return m_oldEdl; }
    EventList& newEdl() { return m_newEdl; }
    const EventList& newEdl() const { return m_newEdl; }
    EventList& changeEdl() { return m_changeEdl; }
    const EventList& changeEdl() const { return m_changeEdl; }
    Settings& settings() { return m_settings; }
    const Settings& settings() const { return m_settings; }
    VideoList& videoList() { return m_videoList; }
    const VideoList& videoList() const { return m_videoList; }

    /// Where changes go; null stops all forwarding. Not owned.
    void setNotifier(ChangeContextNotificationBase* notifier);
    /// Make the model listen to all five members, or to none. They send nothing.
    void startListening();
    void stopListening();

    void setProperty(std::int32_t key, const Variant& value);
    bool hasProperty(std::int32_t key) const;
    void removeProperty(std::int32_t key);
    /// Returns InvalidArgument for an absent key and doesn't change `value`; never throws.
    util::Result::Type getProperty(std::int32_t key, Variant& value) const;
    bool isPreviewActive() const;
    /// Sends nothing.
    void setPreviewActive(bool flag);
    /// Needs a notifier.
    void notifyPreviewState();

    /// Generates the change EDL from the old and the new one by the settings and heals it. A failure is returned, not
    /// thrown, and leaves the change EDL empty. Sends one list change in any case. Only an exception of a listener that
    /// isn't a Result passes through, and sends nothing; the model goes on listening.
    util::Result::Type generateChangeEdl();
    /// Likewise, but tells `onFailure` first which events of the old and the new EDL a failure is due to, and goes on
    /// without them if it wants that. It isn't told of a failure that is due to none, such as a VFX row that doesn't compile.
    util::Result::Type generateChangeEdl(const GenerationFailureListener& onFailure);
    /// Marks the VFX shots of the old and the new EDL by the settings. Throws Result::InvalidArgument for an enabled
    /// row that doesn't compile, with no event touched.
    void applyVfxHandling();
    /// The events of the old EDL that a change event's source range covers, and those of the new EDL that its
    /// destination range covers, each once; empty for what isn't a member of the change EDL or has an empty range. Throw
    /// Result::InvalidArgument for a range shorter than the tolerance of a comparison.
    EventList oldEventsFor(const std::shared_ptr<EventBase>& changeEvent) const;
    EventList newEventsFor(const std::shared_ptr<EventBase>& changeEvent) const;
    /// The same for many change events at one go, a list for each. Every EDL is sorted once.
    std::vector<EventList> oldEventsFor(const std::vector<std::shared_ptr<EventBase>>& changeEvents) const;
    std::vector<EventList> newEventsFor(const std::vector<std::shared_ptr<EventBase>>& changeEvents) const;
    /// The events of all those lists, each once, in no list that would listen to them.
    std::vector<std::shared_ptr<EventBase>>
    oldEventsBehind(const std::vector<std::shared_ptr<EventBase>>& changeEvents) const;
    std::vector<std::shared_ptr<EventBase>>
    newEventsBehind(const std::vector<std::shared_ptr<EventBase>>& changeEvents) const;
    /// Works out the flaws of all events again after a change of the project's frame rate; sends one
    /// DataModelChangeContext.
    void revalidateEvents();
    /// The state of a fresh model, except that listeners stay and the pattern rows keep their content.
    void reset();
    /// Reads a snapshot, but not the settings, and sends a DataModelChangeContext. A failure is thrown, and empties the
    /// model except for the settings. Only when the snapshot's version number can't be read or is a newer one, the
    /// model stays as it is.
    void restore(serialize::ByteArchive& archive);

    /// Forwards the context to the notifier.
    void onChange(const ChangeContext& context) override;

    /// On a failure the readers empty the model, send one DataModelChangeContext and then throw. readCurrent throws
    /// what the members throw, and readOlder Result::UnknownVersion. Both throw Result::NotAvailable for an exception
    /// that isn't a Result. During `restore` readCurrent sends nothing, and readOlder sends nothing when it fails.
    void readCurrent(serialize::ByteArchive& archive) override;
    void write(serialize::ByteArchive& archive) const override;
    void readOlder(serialize::ByteArchive& archive, std::uint32_t version) override;

private:
    void send(const ChangeContext& context);
    util::Result::Type generateAndHeal(const GenerationFailureListener& onFailure);
    std::array<ChangeContextNotificationBase*, 5> sources();
    using TimecodeOf = const Timecode& (EventBase::*)() const;
    /// Calls `take` for each change event that has a range, with its index and each event of an EDL that plays in it.
    template <class Take>
    void forEventsBehind(const std::vector<std::shared_ptr<EventBase>>& changeEvents, const EventList& programme,
                         TimecodeOf in, TimecodeOf out, const Take& take) const;
    std::vector<EventList> eventsFor(const std::vector<std::shared_ptr<EventBase>>& changeEvents,
                                     const EventList& programme, TimecodeOf in, TimecodeOf out) const;
    std::vector<std::shared_ptr<EventBase>> eventsBehind(const std::vector<std::shared_ptr<EventBase>>& changeEvents,
                                                         const EventList& programme, TimecodeOf in,
                                                         TimecodeOf out) const;
    void readMembers(serialize::ByteArchive& archive);
    void finishReading(util::Result::Type result, bool notifies);

    EventList m_oldEdl;
    EventList m_newEdl;
    EventList m_changeEdl;
    ChangeContextNotificationBase* m_notifier = nullptr;
    std::map<std::int32_t, Variant> m_properties;
    Settings m_settings;
    VideoList m_videoList;
    ChangeEdlGenerator m_generator;
    bool m_restoring = false;
};

} // namespace cadrel::core
