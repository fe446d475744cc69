// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/video/VideoSourceTrack.h"

#include "core/model/VideoList.h"
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

bool VideoSourceTrack::writeVideoEvents(IEditTransaction& transaction)
{
    const core::VideoList* const list = m_source.videoList();
    if (!list || list->isEmpty() || !m_track.isAlive() || VideoTrackHandler::isTurnedOff(m_track))
        return true;
    if (m_track.hostLocked())
        return false;
    clear(transaction);
    MediaPool* const pool = m_source.mediaPool();
    if (!pool)
        return true;
    const double origin = m_track.timeOrigin();
    for (const core::VideoList::Entry& entry : list->entries()) {
        const double start = m_offset + entry.start.toSeconds();
        const double length = entry.length.toSeconds();
        const double missing = isBefore(start, origin) ? origin - start : 0.0;
        if (missing > 0.0 && !isBefore(missing, length))
            continue;
        HostEvent event(m_track, required(create<IProjectNode>(m_hostContext, ClassId::ClipEvent)));
        const double possible = std::max(start, origin);
        event.setStart(transaction, possible);
        event.setEnd(transaction, possible + length);
        event.setClip(pool->findClip(entry).get(), 0);
        if (missing > 0.0)
            insertWithoutStart(transaction, *event.node(), missing);
        else
            requireOk(transaction.insert(m_track.container().get(), event.node()));
    }
    return true;
}

//     the list              |------ picture -----|
//     time origin               |
//     on a track of its own     |------ picture -----|
//     written                   |-- picture -----|
void VideoSourceTrack::insertWithoutStart(IEditTransaction& transaction, IProjectNode& event, double missing)
{
    const double length = event.getEnd(nullptr);
    const auto document = documentOf(m_track);
    const auto root = required(Counted<FUnknown>::adopt(document->getContainer(nullptr)));
    const auto track = required(Counted<FUnknown>::adopt(document->createTrack(TypeWord::Video)));
    requireOk(transaction.insert(root.get(), track.get()));
    requireOk(transaction.insert(track.get(), &event));
    const auto list = required(create<IObjectList>(m_hostContext));
    requireOk(list->add(track.get(), 0));
    requireOk(
        required(service<IEditService>(m_hostContext))->copyRange(document.get(), list.get(), 0, missing, length, 0.0));
    const auto pieces = childrenOf(*required(query<IProjectNode>(track)));
    requireOk(transaction.move(track.get(), m_track.container().get(), required(pieces.front().get())));
    requireOk(transaction.remove(root.get(), track.get()));
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
