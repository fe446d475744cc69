#include "standin/project/MediaPool.h"

#include "standin/project/Project.h"

#include <limits>

using namespace Velmark;

namespace standin {

MediaPool::~MediaPool()
{
    for (const auto& [number, clip] : m_clips)
        clip->m_pool = nullptr;
}

int32 MediaPool::count(const char* type)
{
    int32 count = 0;
    for (const auto& [number, clip] : m_clips)
        count += clip->isType(type) ? 1 : 0;
    return count;
}

IProjectNode* MediaPool::itemAt(int32 index, const char* type)
{
    if (index < 0)
        return nullptr;
    for (const auto& [number, clip] : m_clips) {
        if (clip->isType(type) && index-- == 0)
            return clip.get();
    }
    return nullptr;
}

FUnknown* MediaPool::import(IFilePath* path)
{
    char16_t asked[IFilePath::Capacity] = {};
    if (!path || path->getPath(asked) != ResultOk)
        return nullptr;
    for (const auto& [number, clip] : m_clips) {
        if (clip->path() == asked)
            return static_cast<FObject*>(clip.get());
    }
    return nullptr;
}

MediaClip* MediaPool::clipWith(int number) const
{
    const auto found = m_clips.find(number);
    return found != m_clips.end() ? found->second.get() : nullptr;
}

int MediaPool::freeNumber() const
{
    if (m_clips.empty())
        return 1;
    const int last = m_clips.rbegin()->first;
    if (last < std::numeric_limits<int>::max())
        return last + 1;
    int number = 1;
    while (m_clips.contains(number))
        ++number;
    return number;
}

void MediaPool::add(Counted<MediaClip> clip, int number)
{
    if (number == 0)
        number = freeNumber();
    clip->m_number = number;
    clip->m_pool = this;
    MediaClip& added = *clip;
    m_clips.emplace(number, std::move(clip));
    added.markContentChanged();
}

void MediaPool::frameRateChanged()
{
    for (const auto& [number, clip] : m_clips)
        clip->updateCaption();
}

} // namespace standin
