// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/video/PoolVideoSource.h"

#include "core/model/VideoList.h"
#include "core/notify/ChangeContext.h"
#include "core/time/Timecode.h"
#include "host/project/MediaPool.h"

namespace cadrel::host {

using core::Timecode;

PoolVideoSource::~PoolVideoSource()
{
    if (m_list)
        m_list->removeListener(this);
}

void PoolVideoSource::setMediaPool(MediaPool* pool)
{
    m_pool = pool;
    notify();
}

void PoolVideoSource::setVideoList(core::VideoList* list)
{
    if (m_list)
        m_list->removeListener(this);
    m_list = list;
    if (m_list)
        m_list->addListener(this);
    notify();
}

VideoFrame PoolVideoSource::getFrame(bool /*lastFrame*/, double time)
{
    if (!m_pool || !m_list || !Timecode::isValidSeconds(time))
        return {};
    const Timecode timecode(time);
    const core::VideoList::Entry entry = m_list->entryAt(timecode);
    if (entry.path.empty())
        return {};
    auto clip = m_pool->findClip(entry);
    if (!clip)
        return {};
    const auto frame = static_cast<std::uint32_t>(timecode.toFrameCount() - entry.start.toFrameCount());
    if (frame > clip->getFrameCount())
        return {};
    return {std::move(clip), frame};
}

void PoolVideoSource::onChange(const core::ChangeContext& context)
{
    if (context.type == core::ChangeContext::VideoListChanged)
        notify();
}

} // namespace cadrel::host
