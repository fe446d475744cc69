// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/video/VideoSourceTrack.h"

#include "core/model/VideoList.h"
#include "host/border/FirstFailure.h"
#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "host/project/MediaPool.h"
#include "host/track/HostEvent.h"
#include "host/track/Instant.h"
#include "host/video/PoolVideoSource.h"
#include "host/video/VideoTrackHandler.h"
#include "velmark/ClassId.h"
#include "velmark/Context.h"
#include "velmark/Editing.h"
#include "velmark/Project.h"

#include <algorithm>
#include <limits>

using namespace Velmark;

namespace cadrel::host {

namespace {

Counted<IProjectDocument> documentOf(const Track& track)
{
    auto node = required(query<IProjectNode>(track.node()));
    while (IProjectNode* const parent = node->getParent())
        node = Counted<IProjectNode>::share(parent);
    return required(query<IProjectDocument>(node));
}

} // namespace

VideoSourceTrack::VideoSourceTrack(IHostContext* context, PoolVideoSource& source, VideoTrackHandler& handler,
                                   std::int32_t mode)
    : m_hostContext(context), m_source(source), m_handler(handler), m_mode(mode)
{
    m_handler.addListener(this);
    tracksChanged();
}

VideoSourceTrack::~VideoSourceTrack()
{
    m_handler.removeListener(this);
}

VideoWriting VideoSourceTrack::writeVideoEvents(IEditTransaction& transaction)
{
    const core::VideoList* const list = m_source.videoList();
    if (!list || list->isEmpty() || !m_track.isAlive() || VideoTrackHandler::isTurnedOff(m_track))
        return VideoWriting::Done;
    if (m_track.hostLocked())
        return VideoWriting::TrackLocked;
    MediaPool* const pool = m_source.mediaPool();
    if (!pool)
        return VideoWriting::NoMediaPool;
    const std::vector<Video> videos = videosOnTrack(*list);
    if (videos.empty())
        return VideoWriting::BeforeProject;
    clear(transaction);
    for (const Video& video : videos)
        insert(transaction, video, pool->findClip(*video.entry));
    const bool isWhole = videos.size() == list->entries().size() &&
                         std::ranges::none_of(videos, [](const Video& video) { return video.missing > 0.0; });
    return isWhole ? VideoWriting::Done : VideoWriting::WithoutBeginning;
}

std::vector<VideoSourceTrack::Video> VideoSourceTrack::videosOnTrack(const core::VideoList& list) const
{
    // A preview shows what a run writes.
    const double begin = m_track.timeOrigin() + m_offset;
    std::vector<Video> videos;
    for (const core::VideoList::Entry& entry : list.entries()) {
        const double start = m_offset + entry.start.toSeconds();
        const double length = entry.length.toSeconds();
        const double missing = isBefore(start, begin) ? begin - start : 0.0;
        if (missing > 0.0 && !isBefore(missing, length))
            continue;
        const double possible = std::max(start, begin);
        videos.push_back({&entry, {possible, possible + length}, missing});
    }
    return videos;
}

void VideoSourceTrack::insert(IEditTransaction& transaction, const Video& video, const Counted<IMediaClip>& clip)
{
    HostEvent event(m_track, required(create<IProjectNode>(m_hostContext, ClassId::ClipEvent)));
    event.setStart(transaction, video.place.start);
    event.setEnd(transaction, video.place.end);
    event.setClip(clip.get(), 0);
    if (video.missing > 0.0)
        insertWithoutStart(transaction, *event.node(), video.missing);
    else
        requireOk(transaction.insert(m_track.container().get(), event.node()));
}

//     the list              |------ picture -----|
//     time origin               |
//     on a track of its own     |------ picture -----|
//     written                   |-- picture -----|
void VideoSourceTrack::insertWithoutStart(IEditTransaction& transaction, IProjectNode& event, double missing)
{
    const double start = event.getStart(nullptr);
    const double end = event.getEnd(nullptr);
    const auto document = documentOf(m_track);
    const auto root = required(Counted<FUnknown>::adopt(document->getContainer(nullptr)));
    const auto track = required(Counted<FUnknown>::adopt(document->createTrack(TypeWord::Video)));
    requireOk(transaction.insert(root.get(), track.get()));
    FirstFailure failure;
    failure.ofStep([&] {
        requireOk(transaction.insert(track.get(), &event));
        const auto list = required(create<IObjectList>(m_hostContext));
        requireOk(list->add(track.get(), 0));
        requireOk(required(service<IEditService>(m_hostContext))
                      ->copyRange(document.get(), list.get(), 0, start + missing, end, start));
        const auto pieces = childrenOf(*required(query<IProjectNode>(track)));
        if (pieces.empty())
            throw util::Result::HostObjectMissing;
        requireOk(transaction.move(track.get(), m_track.container().get(), pieces.front().get()));
    });
    failure.ofStep([&] { requireOk(transaction.remove(root.get(), track.get())); });
    failure.raise();
}

void VideoSourceTrack::clear(IEditTransaction& transaction)
{
    if (m_offset == 0.0)
        m_track.removeAll(transaction);
    else
        m_track.removeRange(transaction, m_offset, std::numeric_limits<double>::infinity());
}

void VideoSourceTrack::tracksChanged()
{
    m_track = m_handler.trackFor(m_mode, true);
}

} // namespace cadrel::host
