// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/Project.h"

#include "core/settings/Variant.h"
#include "core/time/Timecode.h"
#include "host/border/FirstFailure.h"
#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "host/project/FramerateScope.h"
#include "host/project/HostFramerate.h"
#include "util/Result.h"
#include "velmark/Transport.h"

#include <algorithm>
#include <cmath>
#include <utility>

using namespace Velmark;
using cadrel::core::PropertyKey;
using cadrel::core::Variant;
using cadrel::util::Result;

namespace cadrel::host {

namespace {

/// No offset of a project is further away, in seconds: over 15 years.
constexpr double FurthestOffset = 5e8;

void gatherTracks(IProjectNode& parent, std::vector<Counted<ITrackNode>>& tracks)
{
    for (const Counted<IProjectNode>& child : childrenOf(parent)) {
        auto track = query<ITrackNode>(child);
        if (track) {
            tracks.push_back(std::move(track));
            gatherTracks(*child, tracks);
        } else if (child->isType(TypeWord::Track)) {
            // Without this track, a run would seem complete although the track still fits the old cut.
            throw Result::HostObjectMissing;
        }
    }
}

} // namespace

Project::Project(IHostContext* context, IProjectDocument* document)
    : m_document(Counted<IProjectDocument>::share(required(document))), m_mediaPool(context, document->getMediaPool()),
      m_hostContext(context), m_end(context, document, [this] { return contentEnd(); }), m_memoSync(context)
{
}

Project::~Project() = default;

core::Framerate Project::getFramerate() const
{
    if (m_framerate.isUnknown())
        m_framerate = readFramerate();
    return m_framerate;
}

core::Framerate Project::readFramerate() const
{
    FrameRateInfo info;
    requireOk(required(query<ITimeBase>(m_document))->getFrameRate(info));
    return framerateOf(info);
}

void Project::updateFramerate()
{
    const core::Framerate framerate = readFramerate();
    if (!m_framerate.isUnknown() && areSame(framerate, m_framerate))
        return;
    m_framerate = framerate;
    const FramerateScope ownRate(*this);
    m_model.revalidateEvents();
}

std::vector<Counted<ITrackNode>> Project::allTracks()
{
    if (m_trackCache)
        return *m_trackCache;
    std::vector<Counted<ITrackNode>> tracks;
    gatherTracks(*root(), tracks);
    if (m_useTrackCache)
        m_trackCache = tracks;
    return tracks;
}

std::vector<Track> Project::tracksOfType(const char* word)
{
    std::vector<Track> tracks;
    for (const auto& track : allTracks()) {
        if (required(query<IProjectNode>(track))->isType(word))
            tracks.emplace_back(this, track.get());
    }
    return tracks;
}

std::vector<Track> Project::cadrelTracks()
{
    std::vector<Track> tracks;
    for (const auto& track : allTracks()) {
        const auto node = required(query<IProjectNode>(track));
        if (node->isType(TypeWord::Track) && !node->isType(TypeWord::Folder) && !node->isType(TypeWord::Ruler))
            tracks.emplace_back(this, track.get());
    }
    return tracks;
}

std::vector<Track> Project::availableTracks()
{
    findMarkerTracks();
    std::vector<Track> tracks = cadrelTracks();
    std::erase_if(tracks, [this](const Track& track) {
        return isMarkerTrackOfRuns(track) || (track.hostLocked() && !track.hasLockState());
    });
    return tracks;
}

void Project::setUseTrackCache(bool flag)
{
    m_useTrackCache = flag;
    m_trackCache.reset();
    m_indexes.clear();
}

bool Project::isTrackAlive(const ITrackNode* track)
{
    const auto tracks = allTracks();
    return std::ranges::find(tracks, track, &Counted<ITrackNode>::get) != tracks.end();
}

Counted<FUnknown> Project::containerOf(FUnknown* object)
{
    return Counted<FUnknown>::adopt(m_document->getContainer(object));
}

double Project::timeOrigin() const
{
    return required(query<ITimeBase>(m_document))->getTimeOrigin();
}

double Project::projectEnd() const
{
    return root()->getEnd(nullptr) + timeOrigin();
}

bool Project::hasPreviewOffset() const
{
    return previewOffset() > NoPreviewOffset;
}

double Project::previewOffset() const
{
    Variant offset(NoPreviewOffset);
    m_model.getProperty(PropertyKey::PreviewOffset, offset);
    return offset.toDouble();
}

void Project::resetPreviewOffset()
{
    m_model.setProperty(PropertyKey::PreviewOffset, Variant(NoPreviewOffset));
}

void Project::computePreviewOffset()
{
    m_model.setProperty(PropertyKey::PreviewOffset, Variant(dayPastMaterial()));
}

void Project::ensurePreviewOffset()
{
    if (!hasPreviewOffset() || previewOffset() > FurthestOffset ||
        (!hasWritten() && previewOffset() < dayPastMaterial()))
        computePreviewOffset();
}

double Project::dayPastMaterial()
{
    const std::vector<Track> tracks = cadrelTracks();
    return dayAfter(std::max(latestEnd(tracks, projectEnd(), timeOrigin()), latestPoint(tracks)));
}

double Project::requiredOffset() const
{
    if (!hasPreviewOffset())
        throw Result::NotAvailable;
    return previewOffset();
}

double Project::dayLength() const
{
    return 24.0 * core::Timecode(1, 0, 0, 0).toSeconds(getFramerate());
}

double Project::dayAfter(double seconds) const
{
    const double day = dayLength();
    return (std::floor(seconds / day) + 1.0) * day;
}

double Project::latestEnd(const std::vector<Track>& tracks, double before, double earliest) const
{
    const double origin = timeOrigin();
    double latest = earliest;
    for (const Track& track : tracks) {
        for (const HostEvent& event : track.eventsInRange(0.0, before - origin))
            latest = std::max(latest, event.getEnd());
    }
    return latest;
}

void Project::getLocators(double& left, double& right) const
{
    IParameter& leftTime = locator(ParameterName::LeftTime);
    IParameter& rightTime = locator(ParameterName::RightTime);
    left = leftTime.getValue();
    right = rightTime.getValue();
}

void Project::setLocators(bool adjust, double left, double right)
{
    IParameter& leftTime = locator(ParameterName::LeftTime);
    IParameter& rightTime = locator(ParameterName::RightTime);
    if (adjust) {
        const double shift = (right - left) * 0.1 + timeOrigin();
        left -= shift;
        right -= shift;
    }
    requireOk(leftTime.setValue(IParameter::Flag::Notify, left));
    requireOk(rightTime.setValue(IParameter::Flag::Notify, right));
}

core::CadrelRunState Project::runState()
{
    return {&m_model.oldEdl(), &m_model.newEdl(), getFramerate(), &m_model.settings(), previewOffset(), timeOrigin()};
}

core::CadrelPreviewState Project::previewState()
{
    return {getFramerate(), &m_model.settings()};
}

void Project::onProjectChanged()
{
    // A handle that isn't told may go on to use a track that is gone, so a rate that can't be read has to wait.
    FirstFailure failure;
    failure.ofStep([this] { updateFramerate(); });
    m_indexes.clear();
    failure.ofStep([this] { m_mediaPool.notifyListeners(); });
    tellListeners(failure);
    failure.ofStep([this] {
        if (!hasNotedMemos())
            rememberMemos();
    });
    failure.raise();
}

void Project::onProjectEdited(IEditTransaction& transaction)
{
    FirstFailure failure;
    m_indexes.clear();
    if (isPreviewing())
        failure.ofStep([&] { syncMemos(transaction); });
    tellListeners(failure);
    failure.raise();
}

void Project::syncMemos(IEditTransaction& transaction)
{
    if (!memoTrack().hasChanged())
        return;
    Track& memos = markerTrack(TrackRole::Memos);
    const PreviewedEvents shown = previewed();
    m_memoSync.follow(memos, shown, transaction);
    // Only now, as they may get the id of one whose copy the user has just removed.
    memos.assignIds(0.0, shown.start() - timeOrigin());
}

void Project::rememberMemos()
{
    if (!isPreviewing()) {
        m_memoSync.forget();
        return;
    }
    // What is known of an earlier preview would be taken for edits of this one.
    m_memoSync.forgetCopies(m_previewEvents->events());
    m_memoSync.remember(memoTrack(), previewed());
}

bool Project::hasNotedMemos()
{
    if (!isPreviewing())
        return false;
    const Track& memos = memoTrack();
    return !memos.hasChanged() && m_memoSync.hasNoted(memos, previewed());
}

const Track& Project::memoTrack()
{
    // An undo may have brought the track back.
    Track& memos = markerTrack(TrackRole::Memos);
    findTrack(memos, TypeWord::Marker, TrackRole::Memos);
    return memos;
}

bool Project::isPreviewing() const
{
    return m_model.isPreviewActive() && hasPreviewOffset();
}

void Project::tellListeners(FirstFailure& failure)
{
    m_listeners.forEach([&](ProjectListener& listener) { failure.ofStep([&] { listener.projectChanged(*this); }); });
}

Counted<IProjectNode> Project::root() const
{
    return required(query<IProjectNode>(m_document));
}

IParameter& Project::locator(const char* name) const
{
    return *required(required(m_document->getLocators())->getParameter(name));
}

} // namespace cadrel::host
