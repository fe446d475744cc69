#pragma once

#include "core/CadrelPreviewState.h"
#include "core/CadrelRunState.h"
#include "core/DataModel.h"
#include "core/EventList.h"
#include "core/FramerateProvider.h"
#include "core/MarkerEntry.h"
#include "host/MediaPool.h"
#include "host/Track.h"
#include "host/TrackRole.h"
#include "velmark/Counted.h"
#include "velmark/Editing.h"
#include "velmark/ProjectNode.h"

#include <array>
#include <cstdint>
#include <memory>
#include <set>
#include <string>
#include <vector>

namespace Velmark {
class IHostContext;
class IProjectDocument;
class ITrackNode;
} // namespace Velmark

namespace cadrel::core {
class Cut;
class CutList;
class ProgressHandlerBase;
} // namespace cadrel::core

namespace cadrel::host {

class ProjectListener;
class VideoProvider;

/// One project of the host: it owns the model that belongs to it, finds and makes the tracks on which the system writes, and
/// does to the host's tracks what the engine decides.
///
/// Times are those of the project's clock, in seconds; what goes to the host loses the time origin on the way. Failures are
/// thrown as Result::Type: HostObjectMissing, HostCallFailed, and NotAvailable where an operation needs the preview offset
/// or a live track and has none.
class Project : public core::FramerateProvider {
public:
    /// Neither is owned; the document outlives the project.
    Project(Velmark::IHostContext* context, Velmark::IProjectDocument* document, VideoProvider* videoProvider);
    Project(const Project&) = delete;
    Project& operator=(const Project&) = delete;
    ~Project();

    Velmark::IProjectDocument* document() const { return m_document; }
    Velmark::IHostContext* hostContext() const { return m_hostContext; }
    core::DataModel& model() { return m_model; }
    MediaPool& mediaPool() { return m_mediaPool; }

    // Storage, as attributes of the host's project.

    /// Reads the stored model, if there is one. Throws ChecksumMismatch and what the model's reading throws; the model
    /// is empty then.
    void load();
    void save();

    /// The host's rate, read anew when it was marked out of date.
    core::Framerate getFramerate() const override;

    // Tracks.

    /// All tracks of the host, depth first.
    std::vector<Velmark::ITrackNode*> allTracks();
    std::vector<Track> tracksOfType(const char* word);
    /// All but folders and rulers: those that a run may change.
    std::vector<Track> cadrelTracks();
    void setUseTrackCache(bool flag);
    bool isTrackAlive(const Velmark::ITrackNode* track);
    /// Counted.
    Velmark::Counted<Velmark::FUnknown> containerOf(Velmark::FUnknown* object);

    // Times.

    double timeOrigin() const;
    double projectEnd() const;
    bool hasPreviewOffset() const;
    double previewOffset() const;
    void resetPreviewOffset();
    /// Stores the first whole day past everything in the project as the offset.
    void computePreviewOffset();
    void getLocators(double& left, double& right) const;
    /// With `adjust` both move down by a tenth of their distance and lose the time origin; without they go to the host as
    /// they are.
    void setLocators(bool adjust, double left, double right);

    // Work for the engine.

    void createMarkerTracks(Velmark::IEditTransaction& transaction);
    void createVideoTracks(Velmark::IEditTransaction& transaction);
    void processCut(Velmark::IEditTransaction& transaction, core::Cut& cut);
    std::shared_ptr<core::Cut> makeCut(const std::shared_ptr<core::EventBase>& changeEvent);
    void completeApply(Velmark::IEditTransaction& transaction);
    /// Throws Result::InvalidArgument for an entry whose kind is none of MarkerKind; earlier ones stay written.
    void generateMarkers(Velmark::IEditTransaction& transaction, const std::vector<core::MarkerEntry>& entries);
    void markVirginTerritories(Velmark::IEditTransaction& transaction, const core::CutList& cuts);
    void clearPreview(Velmark::IEditTransaction& transaction);
    void getApplyRange(double& start, double& end) const;
    void closeRange(Velmark::IEditTransaction& transaction, bool onlySelected, double start, double end);
    void setTracksLocked(bool lock);
    void collectLockTracks();
    void releaseLockTracks() { m_lockedTracks.clear(); }
    void extendProjectEnd(bool active);
    core::CadrelRunState runState();
    core::CadrelPreviewState previewState();
    core::EventList& previewEvents() { return m_previewEvents; }
    /// Not owned; null outside of a run.
    void setProgress(core::ProgressHandlerBase* progress) { m_progress = progress; }

    // What the host tells.

    void onProjectChanged();
    void onProjectEdited(Velmark::IEditTransaction& transaction);
    /// Not owned.
    void addListener(ProjectListener* listener) { m_listeners.insert(listener); }
    void removeListener(ProjectListener* listener) { m_listeners.erase(listener); }

private:
    std::set<ProjectListener*> m_listeners;
    Velmark::IProjectDocument* m_document;
    MediaPool m_mediaPool;
    VideoProvider* m_videoProvider;
    std::vector<Track> m_markerTracks; ///< by role, less one
    Track m_folderTrack;
    std::vector<Velmark::ITrackNode*> m_trackCache;
    core::DataModel m_model;
    Velmark::IHostContext* m_hostContext;
    core::Framerate m_framerate;
    core::EventList m_previewEvents;
    std::vector<Track> m_lockedTracks;
    core::ProgressHandlerBase* m_progress = nullptr;
    bool m_useTrackCache = false;
};

} // namespace cadrel::host
