// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/video/VideoSourceTrack.h"

#include "core/model/VideoList.h"
#include "host/border/HostFailure.h"
#include "host/project/MediaPool.h"
#include "host/track/HostEvent.h"
#include "host/video/PoolVideoSource.h"
#include "host/video/VideoTrackHandler.h"
#include "velmark/ClassId.h"
#include "velmark/Context.h"
#include "velmark/Editing.h"

#include <limits>

using namespace Velmark;

namespace cadrel::host {

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
    for (const core::VideoList::Entry& entry : list->entries()) {
        HostEvent event(m_track, required(create<IProjectNode>(m_hostContext, ClassId::ClipEvent)));
        const double start = m_offset + entry.start.toSeconds();
        event.setStart(transaction, start);
        event.setEnd(transaction, start + entry.length.toSeconds());
        event.setClip(pool->findClip(entry).get(), 0);
        requireOk(transaction.insert(m_track.container().get(), event.node()));
    }
    return true;
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
