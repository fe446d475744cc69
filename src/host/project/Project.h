// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/CadrelPreviewState.h"
#include "core/cut/CadrelRunState.h"
#include "core/cut/MarkerEntry.h"
#include "core/edl/EventList.h"
#include "core/model/DataModel.h"
#include "core/time/FramerateProvider.h"
#include "host/project/MediaPool.h"
#include "host/project/MemoSync.h"
#include "host/project/PreviewRecord.h"
#include "host/project/ProjectEnd.h"
#include "host/track/EventReach.h"
#include "host/track/ProjectListener.h"
#include "host/track/Track.h"
#include "host/track/TrackIndexes.h"
#include "host/track/TrackProject.h"
#include "host/track/TrackRole.h"
#include "util/ListenerSet.h"
#include "velmark/Counted.h"
#include "velmark/Editing.h"
#include "velmark/Project.h"
#include "velmark/ProjectNode.h"
#include "velmark/Tracks.h"

#include <array>
#include <cstdint>
#include <limits>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace Velmark {
class IAttributeData;
class IHostContext;
class IParameter;
} // namespace Velmark

namespace cadrel::core {
class Cut;
class CutList;
class EventBase;
class ProgressHandlerBase;
} // namespace cadrel::core

namespace cadrel::host {

class FirstFailure;

/// One project of the host: it owns the model that belongs to it, finds and makes the tracks on which the system writes, and
/// does to the host's tracks what the engine decides.
///
/// Times are those of the project's clock, in seconds; what goes to the host loses the time origin on the way. A run writes
/// first in the preview stretch, a whole number of days later, which no material reaches:
///
///     time origin                          preview offset
///     |-- real programme --|                    |-- preview stretch --|
///           source  |=====|  ------------------------>  |=====|  destination + offset
///
/// Failures are thrown as Result::Type: HostObjectMissing, HostCallFailed, and NotAvailable where an operation needs the
/// preview offset or a live track and has none.
class Project final : public core::FramerateProvider, public TrackProject {
public:
    /// The preview offset of a project that has none.
    static constexpr double NoPreviewOffset = std::numeric_limits<double>::lowest();

    /// The context outlives the project.
    Project(Velmark::IHostContext* context, Velmark::IProjectDocument* document);
    Project(const Project&) = delete;
    Project& operator=(const Project&) = delete;
    ~Project();

    Velmark::IProjectDocument* document() const { return m_document.get(); }
    Velmark::IHostContext* hostContext() const override { return m_hostContext; }
    core::DataModel& model() { return m_model; }
    /// For those who may outlive the project, and hold it weakly.
    const std::shared_ptr<core::DataModel>& sharedModel() const { return m_sharedModel; }
    MediaPool& mediaPool() { return m_mediaPool; }

    // Storage, as attributes of the host's project; in ProjectStorage.cpp.

    /// Reads the stored model, if there is one, into the fresh project, and which events are previewed, and finds the tracks
    /// that are held locked. If the events can't be read, no memo follows its copy until the next preview. When no
    /// preview comes out of it, the tracks are unlocked. Throws ChecksumMismatch and what the model's reading throws; the
    /// model is empty then. It is read also where the tracks can't be, for which HostObjectMissing is thrown.
    void load();
    /// Whether the last load has read the model, or there was none to read.
    bool hasReadModel() const { return m_hasReadModel; }
    /// Replaces what is stored. After a failure, what was stored before is there, but when it is the previewed events alone
    /// that can't be stored, the rest is. After a load that failed because another version has stored it, the first save puts
    /// that aside, under keys of its own.
    void save();

    /// The host's rate, as it was when it told of changes last. Throws Result::NotSupported for a rate that isn't one.
    core::Framerate getFramerate() const override;

    // Tracks.

    /// All tracks of the host, depth first: a folder comes before what it holds. Throws Result::HostObjectMissing for a
    /// track that cannot be handled as one.
    std::vector<Velmark::Counted<Velmark::ITrackNode>> allTracks();
    std::vector<Track> tracksOfType(const char* word);
    /// All but folders and rulers: those that a run may change.
    std::vector<Track> cadrelTracks();
    /// Those of them that a run could carry over: none that the user has locked, though a run frees what the system itself
    /// holds locked, and none on which runs alone write.
    std::vector<Track> availableTracks();
    /// What stands on the tracks that a run changes: clips, markers and automation points.
    std::vector<core::SecondsRange> material();
    /// With it the tracks are gathered once, and only those that the system makes are added. To be on for the time of a run
    /// alone, in which nobody else edits.
    void setUseTrackCache(bool flag);
    bool isTrackAlive(const Velmark::ITrackNode* track) override;
    Velmark::Counted<Velmark::FUnknown> containerOf(Velmark::FUnknown* object) override;

    // Times.

    double timeOrigin() const override;
    double projectEnd() const;
    bool hasPreviewOffset() const;
    /// NoPreviewOffset when there is none.
    double previewOffset() const;
    void resetPreviewOffset();
    /// Stores the first whole day past every event and every automation point in the project as the offset.
    void computePreviewOffset();
    /// Does so where there is none or one that is no time of a project, and where the one there has become too small: the time
    /// origin has moved, or material has come to reach it. What the system has written stands where it was written, and has
    /// to be cleared before an offset counts as too small.
    void ensurePreviewOffset();
    void getLocators(double& left, double& right) const;
    /// With `adjust` both move down by a tenth of their distance and lose the time origin; without they go to the host as
    /// they are.
    void setLocators(bool adjust, double left, double right);

    // The tracks of the system; in ProjectTracks.cpp.

    /// Finds or makes the folder and the tracks of the markers that are switched on, and gives every memo a user id
    /// of its own.
    void createMarkerTracks(Velmark::IEditTransaction& transaction);
    /// Finds or makes the track of the new picture, which its role alone tells; does nothing without new videos.
    void createVideoTracks(Velmark::IEditTransaction& transaction);
    /// Locks or unlocks what collectLockTracks has found, the track of the new picture and the marker tracks but the
    /// memos'. What the user has locked himself stays as it is. Carries out all, and throws the first failure at the end.
    void setTracksLocked(bool lock);
    /// The tracks that a run would change and that the user hasn't locked.
    void collectLockTracks();
    /// Adds the tracks that the system holds locked, as a file or an undo has left them.
    void findLockedTracks();
    /// Adds the tracks that a preview shows, as a file or an undo has left it.
    void findPreviewedTracks();
    bool hasLockTracks() const { return !m_lockedTracks.empty(); }
    void releaseLockTracks() { m_lockedTracks.clear(); }

    // Work for the engine; in ProjectEdits.cpp.

    /// Writes the source of the cut's events to their destination in the preview stretch. What would stand before the time
    /// origin or 00:00:00:00 is left out.
    void processCut(Velmark::IEditTransaction& transaction, core::Cut& cut);
    /// The numbers of the events of which processCut has left out something that is there, since startWriting. What a
    /// restricted run doesn't replace doesn't count.
    const std::vector<std::uint32_t>& leftOutEvents() const { return m_leftOutEvents; }
    /// The tracks are those whose material a run carries over, and the memos'.
    std::shared_ptr<core::Cut> makeCut(const std::shared_ptr<core::EventBase>& changeEvent);
    /// Brings the preview stretch back over the real programme, from which the markers of an earlier run go. Those that
    /// reach out of a restricted range are cut at its edge: outside of it the programme is still the one that they describe.
    /// What isn't brought back is cleared, and so are the points of the system's own that a curve runs the same without.
    void completeApply(Velmark::IEditTransaction& transaction);
    /// Writes each on the track of its kind, and none whose track isn't there or is locked by the user. Throws
    /// Result::InvalidArgument for an entry whose kind is none of MarkerKind; earlier ones stay written.
    void generateMarkers(Velmark::IEditTransaction& transaction, const std::vector<core::MarkerEntry>& entries);
    /// Lets each curve keep the value that it has come to where the cuts leave a gap and after the last cut, to the end of
    /// what the run replaces, and have its first one before the first cut. With `isWholeProgramme` it keeps the last one for
    /// good, and otherwise nothing that clearPreview doesn't take away is left. The
    /// cuts are those that makeCut made, and their order doesn't matter.
    void holdAutomation(Velmark::IEditTransaction& transaction, const core::CutList& cuts, bool isWholeProgramme);
    /// Lets the automation run straight where two cuts that follow on one another in the list don't meet, but for what
    /// another cut has written there. The cuts are those that makeCut made.
    void markVirginTerritories(Velmark::IEditTransaction& transaction, const core::CutList& cuts);

    // What has been written in the preview stretch, which the tracks keep as PreviewRecord says; in ProjectPreview.cpp.

    /// Whether a preview, or a run that has failed, has written something that isn't cleared yet.
    bool hasWritten();
    /// From now on all that comes to stand past the preview offset is the system's. Once the preview is cleared it is past
    /// all that the user has.
    void startWriting();
    /// Lets the tracks keep what was written since then, also those with nothing that collectLockTracks has found. Carries
    /// out all, and throws the first failure at the end.
    void rememberWritten();
    /// Unlocks the tracks, takes away what is kept as written, and shows no events any more. What the user has laid there
    /// since stays, and so does what he has moved, renamed, slipped or given another length, clip or content; a copy that he
    /// has changed in no other way than by its gain or the like goes. Of automation, points stay that he has drawn, moved or
    /// given another value, and one at the start of what was written keeps the curve before them level.
    void clearPreview(Velmark::IEditTransaction& transaction);

    /// What a run replaces, in seconds of the project's clock: the day that timecodes can name, and of that the range to which
    /// the user restricts it. What is before that day or after it stays in any case.
    void getApplyRange(double& start, double& end) const;
    /// Lets the host join the pieces that the cuts have left of one clip.
    void closeRange(bool onlySelected, double start, double end);
    /// While a preview is on, makes room for it; with `active` only tracks that have changed count. Without one, puts the
    /// end of the project back, as ProjectEnd says.
    void extendProjectEnd(bool active);
    core::CadrelRunState runState();
    core::CadrelPreviewState previewState();
    core::EventList& previewEvents() { return *m_previewEvents; }
    /// As with the model.
    const std::shared_ptr<core::EventList>& sharedPreviewEvents() const { return m_previewEvents; }
    /// Not owned; null outside of a run.
    void setProgress(core::ProgressHandlerBase* progress) { m_progress = progress; }

    // What the host tells.

    /// Carries out all, and throws the first failure at the end: reads the rate anew, and tells all listeners.
    void onProjectChanged();
    /// The same: lets the memos follow their copies in the preview, and tells all listeners.
    void onProjectEdited(Velmark::IEditTransaction& transaction);
    /// Notes the copies of the memos as they are now, so that the next edit of the user's is told from what was there. To be
    /// done after each edit of which onProjectChanged isn't called.
    void rememberMemos();
    void addListener(ProjectListener* listener) override { m_listeners.add(listener); }
    void removeListener(ProjectListener* listener) override { m_listeners.remove(listener); }

private:
    void readModel();
    void readPreviewEvents(Velmark::IAttributeData& list);
    void writePreviewEvents(Velmark::IAttributeData& list) const;
    core::Framerate readFramerate() const;
    void updateFramerate();
    /// The seconds of a day of the clock under the project's rate.
    double dayLength() const;
    /// The start of the first whole day past a time.
    double dayAfter(double seconds) const;
    /// The first whole day past every event in the project.
    double dayPastMaterial();
    /// Throws Result::NotAvailable without one.
    double requiredOffset() const;
    /// The latest end of an event of these tracks that starts before a time, `earliest` at the least.
    double latestEnd(const std::vector<Track>& tracks, double before, double earliest) const;
    Velmark::Counted<Velmark::IProjectNode> root() const;
    Velmark::IParameter& locator(const char* name) const;
    void tellListeners(FirstFailure& failure);
    bool isPreviewing() const;
    /// With the rate and the time origin of when it was written.
    PreviewedEvents previewed();
    /// What is kept of the preview that stands there: by the memos' track or, where it keeps nothing, by the first that does.
    std::optional<PreviewRecord::Head> writtenHead();
    /// Of the last event of any track, from the time origin.
    double contentEnd();
    /// Of the last automation point.
    double latestPoint(const std::vector<Track>& tracks) const;
    void syncMemos(Velmark::IEditTransaction& transaction);
    /// Whether what rememberMemos has noted last still holds. Only while the host tells of changes.
    bool hasNotedMemos();
    /// The track of the memos; dead or empty where there is none.
    const Track& memoTrack();

    // Tracks of the system.
    Track& markerTrack(std::int32_t role) { return m_markerTracks.at(static_cast<std::size_t>(role) - 1); }
    bool isMarkerTrack(const Track& track) const;
    /// A marker track on which runs alone write: any but the memos'.
    bool isMarkerTrackOfRuns(const Track& track) const;
    /// All that a run may change but these.
    std::vector<Track> tracksOfTheUser();
    /// Takes away what the tracks have written down.
    void clearWritten(Velmark::IEditTransaction& transaction, const std::vector<Track>& tracks);
    /// Removes the copies that their memos have followed, wherever they stand: what the user has made of them is in their
    /// memos, which stand before `start`, in seconds from the time origin. All others that he has edited are his own.
    void removeFollowed(Velmark::IEditTransaction& transaction, double start);
    /// Removes the automation points in a stretch, in seconds from the time origin, where none follow. Emptying the stretch
    /// would leave one at its start, as the values of the system's own points are rounded. Where others follow, the curve
    /// needs it to go on before the stretch as it did.
    static void removePoints(Velmark::IEditTransaction& transaction, const Track& track,
                             const core::SecondsRange& stretch);
    /// By its role; an empty handle without one.
    Track newVideoTrack();
    /// Whether markers can be written there. On a track that the user has locked they would stay in the preview stretch.
    static bool takesMarkers(const Track& track) { return track.isAlive() && !track.hostLocked(); }
    /// Finds the marker tracks that are there by their stored roles, whatever kinds of markers are switched on: the first of
    /// each role.
    void findMarkerTracks();
    /// Puts a track of that role into the slot unless the one there is alive. False when there is none.
    bool findTrack(Track& slot, const char* word, std::int32_t role);
    void findOrCreateTrack(Velmark::IEditTransaction& transaction, Track& slot, const char* word, std::int32_t role);
    void findOrCreateMarkerTrack(Velmark::IEditTransaction& transaction, std::int32_t role);
    Track createTrack(const char* word);
    /// Inserts a new track and makes it known by its role.
    void insertTrack(Velmark::IEditTransaction& transaction, Velmark::FUnknown* parent, Track& track,
                     std::int32_t role);

    // Edits.
    /// Selected, where the settings ask for selected tracks alone.
    bool isWanted(const Track& track) const;
    /// The tracks that a run or preview carries over, and all marker tracks. While one writes, they are those from its begin
    /// but for what is locked since: on what the user selects or unlocks meanwhile, nothing is written that could replace
    /// what is there.
    std::vector<Track> conformedTracks();
    /// Before which nothing is written, on the project's clock.
    double earliestPlace() const;
    Velmark::Counted<Velmark::IObjectList> listOf(const std::vector<const Track*>& tracks) const;
    void copyRange(const std::vector<const Track*>& tracks, double start, double end, double destination);
    void deleteRange(Velmark::IEditTransaction& transaction, double start, double end);
    void moveBack(Velmark::IEditTransaction& transaction, std::vector<Track>& tracks, double start, double end);
    /// Whether something stands on the tracks in the part of a source that would come to stand before the earliest place.
    bool isLeftOut(const std::vector<const Track*>& tracks, const core::SecondsRange& source, double destination);
    void writeDestinationMarker(Velmark::IEditTransaction& transaction, const core::EventBase& event);
    void tick(std::uint64_t steps);

    util::ListenerSet<ProjectListener> m_listeners; ///< before all tracks, which are among them
    const Velmark::Counted<Velmark::IProjectDocument> m_document;
    MediaPool m_mediaPool;
    std::array<Track, TrackRole::LastMarker> m_markerTracks; ///< by role, less one
    Track m_folderTrack;
    /// Nothing while it isn't in use, and until it's filled.
    std::optional<std::vector<Velmark::Counted<Velmark::ITrackNode>>> m_trackCache;
    const std::shared_ptr<core::DataModel> m_sharedModel = std::make_shared<core::DataModel>();
    core::DataModel& m_model = *m_sharedModel;
    Velmark::IHostContext* m_hostContext;
    mutable core::Framerate m_framerate; ///< unknown until it's read
    const std::shared_ptr<core::EventList> m_previewEvents = std::make_shared<core::EventList>(core::ListKind::Change);
    ProjectEnd m_end;
    bool m_hasReadModel = true;
    bool m_isOfOtherVersion = false; ///< what is stored, so that it couldn't be read
    /// Where startWriting has begun, from the time origin.
    std::optional<double> m_writingFrom;
    std::vector<std::uint32_t> m_leftOutEvents;
    /// Of each track that was asked, since startWriting. What the cuts read doesn't change until completeApply.
    std::map<const Velmark::ITrackNode*, EventReach> m_sources;
    std::optional<std::vector<Track>> m_tracksOfEdit; ///< from startWriting to rememberWritten
    std::vector<Track> m_lockedTracks;
    core::ProgressHandlerBase* m_progress = nullptr;
    bool m_useTrackCache = false;
    TrackIndexes m_indexes; ///< cleared by each edit
    MemoSync m_memoSync;
};

} // namespace cadrel::host
