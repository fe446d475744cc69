// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MediaPool.h"

#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "util/HostString.h"
#include "util/Result.h"
#include "util/StringUtil.h"
#include "velmark/ClassId.h"
#include "velmark/Context.h"
#include "velmark/ProjectNode.h"

#include <algorithm>

using namespace Velmark;

namespace cadrel::host {

using util::HostString;
using util::Result;
using util::StringUtil;

MediaPool::MediaPool(IHostContext* context, IMediaPool* pool) : m_pool(pool), m_hostContext(context)
{
    attach();
}

MediaPool::MediaPool(const MediaPool& other)
    : Implements(other), MediaPoolInterface(other), m_pool(other.m_pool), m_hostContext(other.m_hostContext)
{
    attach();
}

MediaPool::~MediaPool()
{
    if (!m_pool)
        return;
    if (const auto dependencies = service<IDependencyManager>(m_hostContext))
        dependencies->removeDependent(m_pool, this);
}

void MediaPool::attach()
{
    if (m_pool)
        requireOk(required(service<IDependencyManager>(m_hostContext))->addDependent(m_pool, this));
}

std::size_t MediaPool::count()
{
    return m_pool ? static_cast<std::size_t>(std::max(m_pool->count(TypeWord::Video), 0)) : 0;
}

std::wstring MediaPool::getPath(std::size_t index)
{
    char16_t path[IFilePath::Capacity] = {};
    requireOk(required(clipAt(index)->getFile())->getPath(path));
    return HostString(path).wide();
}

std::wstring MediaPool::getName(std::size_t index)
{
    return nameOf(*itemAt(index));
}

std::wstring MediaPool::getFileName(std::size_t index)
{
    return StringUtil::baseNameOf(getPath(index));
}

std::uint32_t MediaPool::getFrameCount(std::size_t index)
{
    return clipAt(index)->getFrameCount();
}

Counted<IMediaClip> MediaPool::findClip(const std::wstring& path, std::uint32_t frames)
{
    const std::size_t size = count();
    if (size == 0)
        return nullptr;
    if (auto clip = importClip(path))
        return clip;

    // The material may have moved since the list was made, so the folder doesn't count.
    const std::wstring fileName = StringUtil::fileNameOf(path);
    const std::wstring baseName = StringUtil::baseNameOf(path);
    for (std::size_t index = 0; index < size; ++index) {
        const std::wstring name = getName(index);
        const bool hasName = StringUtil::fileNameOf(getPath(index)) == fileName || name == fileName || name == baseName;
        if (hasName && getFrameCount(index) == frames)
            return clipAt(index);
    }
    return nullptr;
}

Counted<IMediaClip> MediaPool::findClip(const core::VideoList::Entry& entry)
{
    return findClip(StringUtil::toWide(entry.path), static_cast<std::uint32_t>(entry.length.toFrameCount()));
}

int32 MediaPool::update(FUnknown* /*changed*/, int32 /*message*/)
{
    notifyListeners();
    return ResultOk;
}

void MediaPool::notifyListeners()
{
    m_listeners.forEach([](Listener& listener) { listener.mediaPoolChanged(); });
}

IProjectNode* MediaPool::itemAt(std::size_t index)
{
    if (!m_pool)
        throw Result::NotAvailable;
    if (index >= count())
        throw Result::InvalidArgument;
    return required(m_pool->itemAt(static_cast<int32>(index), TypeWord::Video));
}

Counted<IMediaClip> MediaPool::clipAt(std::size_t index)
{
    return required(query<IMediaClip>(itemAt(index)));
}

Counted<IMediaClip> MediaPool::importClip(const std::wstring& path)
{
    const auto file = create<IFilePath>(m_hostContext);
    // A path that the host can't take is one that it can't import.
    if (!file || file->setPath(HostString(path).utf16(), 0) != ResultOk)
        return nullptr;
    return query<IMediaClip>(m_pool->import(file.get()));
}

} // namespace cadrel::host
