// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/SecondsRange.h"
#include "host/track/HostEvent.h"
#include "host/track/ProjectListener.h"
#include "velmark/Counted.h"
#include "velmark/Tracks.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace Velmark {
class FUnknown;
class IEditTransaction;
} // namespace Velmark

namespace cadrel::host {

class AutomationCurve;
class TrackIndex;
class TrackProject;

/// A handle on one track of the host, freely copied. It is empty, alive or dead: one whose track the host has removed
/// dies when the project tells of the change, and never comes back. Without a track, questions are answered by -1, 0.0,
/// false or nothing, and what would change something throws Result::NotAvailable.
///
/// It has to go before its project. A copy costs an entry among the project's listeners, so hot paths pass references.
class Track : public ProjectListener {
public:
    /// What eventAt looks for at an instant at which one event ends and another begins.
    enum class Direction { Forward, Backward };

    Track() = default;
    /// Both may be null, for an empty handle.
    Track(TrackProject* project, Velmark::ITrackNode* track);
    Track(const Track& other);
    Track& operator=(const Track& other);
    ~Track() override;

    bool isAlive() const;
    /// Borrowed; null for an empty handle, and for one that is known to be dead.
    Velmark::ITrackNode* node() const { return m_track.get(); }
    friend bool operator==(const Track& a, const Track& b) { return a.m_track == b.m_track; }

    void projectChanging(Project& project) override;
    void projectChanged(Project& project) override;

    bool isAudio() const;
    bool isMarker() const;
    bool isVideo() const;
    bool isFolder() const;
    bool isSelected() const;
    /// Whether its content has changed since the host told of changes last.
    bool hasChanged() const;
    std::wstring getName() const;
    void setName(const std::wstring& name);

    /// What the system uses the track for, a TrackRole: -1 when it isn't said. All four throw Result::NotSupported for
    /// a track that is neither a marker track, a video track nor a folder.
    std::int32_t role() const;
    void setRole(std::int32_t role);
    void removeRole();
    /// Whether it has a role that equals `role` in the bits of the mask.
    bool hasRole(std::int32_t role, std::int32_t mask) const;

    /// Whether the track's lock button is down.
    bool hostLocked() const;
    /// Whether it is the system that holds the track locked.
    bool hasLockState() const;
    /// Sets both.
    void setLock(bool lock);

    // The events. All but eventAt take seconds from the time origin here.

    /// Those of which more than half lies in the range, bounds included; of one that sticks out on both sides the half
    /// before `end` counts. Throws Result::InvalidArgument for a reversed range.
    std::vector<HostEvent> eventsInRange(double start, double end) const;
    /// The event of the track's own kind at an instant of the project's clock, give or take half a frame: going forward
    /// the one that begins or goes on there, backward the one that has come up to it. Empty without one.
    HostEvent eventAt(double time, Direction direction) const;
    /// All of the track's own kind: sound, markers or picture.
    std::vector<HostEvent> clipEvents() const;
    /// Where an event stands; one in a part ends with the outermost part. Throws Result::InvalidArgument when it ends
    /// before it starts.
    core::SecondsRange eventSpan(const HostEvent& event) const;

    /// Gives a user id to every event in the range that has none.
    void assignIds(double start, double end);
    /// Gives a new one also to those whose id is 0 or stands on an earlier event of the range. An event that starts at the
    /// end isn't in the range.
    void assignOwnIds(double start, double end);
    /// One more than the highest of the track.
    std::int64_t nextUserId() const;

    void removeAll(Velmark::IEditTransaction& transaction);
    void removeEvent(Velmark::IEditTransaction& transaction, HostEvent& event);
    /// Removes the events that lie in the range whole, in seconds of the project's clock. A point at the start lies in
    /// it, a point at the end doesn't.
    void removeRange(Velmark::IEditTransaction& transaction, double start, double end);

    /// What stands on the track now. Throws Result::HostObjectMissing without a track.
    TrackIndex readIndex() const;
    /// The automation as it is now, to be given to fillAutomationGap as often as needed.
    std::vector<AutomationCurve> prepareVirginRange() const;
    /// Lets every curve run straight over a stretch in which nothing stands, in seconds of the project's clock. Does
    /// nothing for a reversed one.
    void fillAutomationGap(Velmark::IEditTransaction& transaction, std::vector<AutomationCurve>& curves, double start,
                           double end) const;

    /// In seconds; 0.0 without a track.
    double timeOrigin() const;
    /// The context of the times on this track. Throws Result::NotAvailable without a track, Result::HostObjectMissing
    /// when the host has none.
    Velmark::Counted<Velmark::FUnknown> container() const;

private:
    /// The track as a node; null without a track.
    Velmark::Counted<Velmark::IProjectNode> liveNode() const;
    /// Throws Result::NotAvailable without a track.
    Velmark::Counted<Velmark::IProjectNode> requiredNode() const;
    bool isKind(const char* word) const;
    const char* roleKey() const;
    std::optional<std::int64_t> integerAttribute(const char* key) const;
    /// 0 when none has an id.
    std::int64_t highestUserId() const;
    void removeChildren(Velmark::IEditTransaction& transaction,
                        const std::vector<Velmark::Counted<Velmark::IProjectNode>>& children);
    void noteChange();

    TrackProject* m_project = nullptr;
    mutable Velmark::Counted<Velmark::ITrackNode> m_track;
    mutable bool m_needsCheck = false;
};

} // namespace cadrel::host
