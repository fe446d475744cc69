// SPDX-License-Identifier: GPL-3.0-or-later

// What stands in the preview stretch: what the system has written there, and what the user has laid there.

#include "core/time/SecondsRange.h"
#include "host/border/FirstFailure.h"
#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "host/project/EventPrint.h"
#include "host/project/MemoMark.h"
#include "host/project/MemoSync.h"
#include "host/project/PreviewRecord.h"
#include "host/project/Project.h"
#include "host/track/HeldPoint.h"
#include "host/track/Instant.h"
#include "velmark/Automation.h"
#include "velmark/Editing.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <map>
#include <set>
#include <utility>

using namespace Velmark;

namespace cadrel::host {

namespace {

using Node = PreviewRecord::Node;

/// What is taken off its tracks while the stretch around it is emptied.
class SparedContent {
public:
    explicit SparedContent(IEditTransaction& transaction) : m_transaction(transaction) {}

    /// `parent` is a time context.
    void takeOff(const Counted<FUnknown>& parent, const std::vector<Node>& children)
    {
        for (const Node& child : children) {
            requireOk(m_transaction.remove(parent.get(), child.get()));
            m_taken.emplace_back(parent, child);
        }
    }
    /// Puts something new in with them, in the order in which this is called.
    void add(const Node& parent, const Node& child) { m_taken.emplace_back(parent, child); }
    /// Puts all of it back, and throws the first failure at the end.
    void putBack()
    {
        FirstFailure failure;
        for (const auto& [parent, child] : std::exchange(m_taken, {}))
            failure.ofStep([this, &to = *parent, &event = *child] { requireOk(m_transaction.insert(&to, &event)); });
        failure.raise();
    }

private:
    IEditTransaction& m_transaction;
    std::vector<std::pair<Counted<FUnknown>, Node>> m_taken;
};

std::vector<Node> pointsIn(IProjectNode& curve, const core::SecondsRange& stretch)
{
    std::vector<Node> points = childrenOf(curve);
    std::erase_if(points, [&](const Node& point) {
        const double time = point->getStart(nullptr);
        return isBefore(time, stretch.start) || !isBefore(time, stretch.end);
    });
    return points;
}

/// With the events, those that begin together with one of them before a time, all in the order of their track. What is put
/// back comes to lie on top of all that begins with it.
std::vector<Node> withThoseBeside(const Track& track, const std::vector<Node>& events, double time)
{
    std::set<double> starts;
    std::set<const IProjectNode*> wanted;
    for (const Node& event : events) {
        wanted.insert(event.get());
        if (event->getStart(nullptr) < time)
            starts.insert(event->getStart(nullptr));
    }
    if (starts.empty())
        return events;
    std::vector<Node> all = childrenOf(*required(query<IProjectNode>(track.node())));
    std::erase_if(all, [&](const Node& event) {
        return !wanted.contains(event.get()) && !starts.contains(event->getStart(nullptr));
    });
    return all;
}

/// Takes off the events that the system hasn't written in a stretch. The record is null for a track that has written nothing
/// there.
void takeUsersEventsOff(SparedContent& spared, const Track& track, const PreviewRecord* record,
                        const core::SecondsRange& stretch)
{
    std::vector<Node> events = eventsReachingInto(track, stretch.start, stretch.end);
    if (record)
        events = MemoSync::othersThan(*record, std::move(events));
    spared.takeOff(track.container(), withThoseBeside(track, events, stretch.start));
}

float valueOf(const Node& point)
{
    return required(query<IAutomationPoint>(point))->getValue();
}

//                film                 stretch
//     before     o-----o----------|---w---w...u..w---w        w: the system's, u: the user's
//     after      o-----o----------h..........u-------         h: what the film has come to

/// Removes what the system has written on a curve, and takes what the user has drawn in a stretch off. Where he has, the film
/// would be led to that from its last point on, so that a point at the start of the stretch keeps it level.
void clearCurve(IHostContext* context, IEditTransaction& transaction, SparedContent& spared, const Node& curve,
                const PreviewRecord* record, const core::SecondsRange& stretch)
{
    const std::vector<Node> all = childrenOf(*curve);
    const auto isInFilm = [&](const Node& point) { return isBefore(point->getStart(nullptr), stretch.start); };
    const auto first = std::ranges::find_if_not(all, isInFilm);
    std::vector<Node> points(first, all.end());
    std::vector<Node> users = record ? record->automation().others(*curve, points) : points;
    const bool hasWritten = users.size() < points.size();
    for (auto next = users.begin(); const Node& point : points) {
        if (next != users.end() && point == *next)
            ++next;
        else
            requireOk(transaction.remove(curve.get(), point.get()));
    }
    if (hasWritten && !users.empty() && first != all.begin()) {
        const float value = valueOf(*std::prev(first));
        if (valueOf(users.front()) != value) {
            const Node held = makePoint(context, *curve, stretch.start, value);
            markAsHeld(*held, value);
            spared.add(curve, held);
        }
    }
    std::erase_if(users, [&](const Node& point) { return !isBefore(point->getStart(nullptr), stretch.end); });
    spared.takeOff(curve, users);
}

} // namespace

bool Project::hasWritten()
{
    return std::ranges::any_of(cadrelTracks(), PreviewRecord::isKeptBy);
}

void Project::startWriting()
{
    ensurePreviewOffset();
    m_writingFrom = requiredOffset() - timeOrigin();
    m_leftOutEvents.clear();
    m_sources.clear();
    m_tracksOfEdit.reset();
    m_tracksOfEdit = conformedTracks();
}

void Project::rememberWritten()
{
    m_tracksOfEdit.reset();
    const std::optional<double> start = std::exchange(m_writingFrom, std::nullopt);
    if (!start)
        return;
    core::Framerate framerate;
    resultOf([&] { framerate = getFramerate(); });
    FirstFailure failure;
    failure.ofStep([&] {
        findMarkerTracks();
        for (const HostEvent& memo : markerTrack(TrackRole::Memos).clipEvents()) {
            if (!isBefore(memo.getStart(), *start + timeOrigin()))
                MemoMark::renewOn(*memo.node());
        }
    });
    for (const Track& track : cadrelTracks()) {
        failure.ofStep([&] {
            const PreviewRecord record = PreviewRecord::ofContent(track, *start, framerate);
            if (record.end() || std::ranges::find(m_lockedTracks, track) != m_lockedTracks.end())
                record.keepOn(m_hostContext, track);
        });
    }
    failure.raise();
}

//     before     film |=====|        preview |-- copy --|-- copy --|
//                                        |= user's =|                  |= user's =|
//     after      film |=====|            |= user's =|                  |= user's =|
void Project::clearPreview(IEditTransaction& transaction)
{
    setTracksLocked(false);
    const std::vector<Track> tracks = cadrelTracks();
    if (const auto head = writtenHead())
        removeFollowed(transaction, head->start);
    clearWritten(transaction, tracks);
    for (const Track& track : tracks)
        PreviewRecord::dropFrom(track);
    // What is no longer in the preview stretch isn't followed any more either.
    m_previewEvents->clear();
    m_lockedTracks.clear();
    m_indexes.clear();
}

// All tracks have written from one time on, but those that come from another project. Each such time is a stretch of its own:
// a curve that is emptied from earlier on than its track has written would bend there.
void Project::clearWritten(IEditTransaction& transaction, const std::vector<Track>& tracks)
{
    std::vector<std::optional<PreviewRecord>> records;
    std::map<std::int64_t, core::SecondsRange> stretches;
    for (const Track& track : tracks) {
        records.push_back(PreviewRecord::keptBy(track));
        std::optional<PreviewRecord>& record = records.back();
        if (record && !record->end())
            record.reset();
        if (!record)
            continue;
        // A range doesn't hold its end, where a point may stand.
        const core::SecondsRange own{record->start(), *record->end() + 2.0 * core::SameInstant};
        core::SecondsRange& stretch = stretches.try_emplace(toInstant(own.start), own).first->second;
        stretch.end = std::max(stretch.end, own.end);
    }
    for (const auto& [start, stretch] : stretches) {
        SparedContent spared(transaction);
        FirstFailure failure;
        failure.ofStep([&, &emptied = stretch] {
            for (std::size_t index = 0; index < tracks.size(); ++index) {
                const auto& record = records[index];
                const bool hasWrittenThere = record && toInstant(record->start()) == toInstant(emptied.start);
                const PreviewRecord* const written = hasWrittenThere ? &*record : nullptr;
                takeUsersEventsOff(spared, tracks[index], written, emptied);
                for (const Node& curve : curvesOf(*tracks[index].node()))
                    clearCurve(m_hostContext, transaction, spared, curve, written, emptied);
            }
            deleteRange(transaction, emptied.start + timeOrigin(), emptied.end + timeOrigin());
        });
        failure.ofStep([&] { spared.putBack(); });
        failure.raise();
    }
}

void Project::removePoints(IEditTransaction& transaction, const Track& track, const core::SecondsRange& stretch)
{
    for (const Node& curve : curvesOf(*track.node())) {
        const std::vector<Node> points = childrenOf(*curve);
        if (points.empty() || !isBefore(points.back()->getStart(nullptr), stretch.end))
            continue;
        for (const Node& point : pointsIn(*curve, stretch))
            requireOk(transaction.remove(curve.get(), point.get()));
    }
}

void Project::removeFollowed(IEditTransaction& transaction, double start)
{
    findMarkerTracks();
    const Track& memos = markerTrack(TrackRole::Memos);
    const double begin = start + timeOrigin();
    std::set<std::int64_t> ids;
    std::vector<Node> followed;
    for (const HostEvent& memo : memos.clipEvents()) {
        if (!isBefore(memo.getEnd(), begin) && MemoMark::isUpToDateOn(*memo.node()))
            followed.push_back(Node::share(memo.node()));
        else if (isBefore(memo.getStart(), begin))
            ids.insert(memo.getUserId());
    }
    if (followed.empty())
        return;
    // What is as it was written goes with the stretch.
    if (const auto record = PreviewRecord::keptBy(memos))
        followed = record->others(std::move(followed));
    for (const Node& node : followed) {
        HostEvent copy(memos, node);
        const std::int64_t id = copy.getUserId();
        if (id > 0 && ids.contains(id))
            copy.remove(transaction);
    }
}

void Project::findPreviewedTracks()
{
    for (const Track& track : tracksOfTheUser()) {
        if (PreviewRecord::isKeptBy(track) && std::ranges::find(m_lockedTracks, track) == m_lockedTracks.end())
            m_lockedTracks.push_back(track);
    }
}

PreviewedEvents Project::previewed()
{
    const double offset = requiredOffset();
    const double origin = timeOrigin();
    const PreviewRecord::Head written = writtenHead().value_or(PreviewRecord::Head{offset - origin, {}, {}});
    // Neither the time origin nor the rate moves what was written.
    return {m_previewEvents->events(), written.framerate ? *written.framerate : getFramerate(), offset, origin,
            written.start - (offset - origin)};
}

// A track that comes from another project may keep what was written there, and above all of this one's.
std::optional<PreviewRecord::Head> Project::writtenHead()
{
    if (const Track& memos = memoTrack(); memos.isAlive()) {
        if (const auto head = PreviewRecord::headKeptBy(memos))
            return head;
    }
    for (const Track& track : cadrelTracks()) {
        if (const auto head = PreviewRecord::headKeptBy(track))
            return head;
    }
    return std::nullopt;
}

double Project::latestPoint(const std::vector<Track>& tracks) const
{
    double latest = 0.0;
    for (const Track& track : tracks) {
        for (const Node& curve : curvesOf(*track.node())) {
            for (const Node& point : childrenOf(*curve))
                latest = std::max(latest, point->getStart(nullptr));
        }
    }
    return latest + timeOrigin();
}

} // namespace cadrel::host
