// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/MediaPool.h"

#include "standin/base/Text.h"
#include "standin/project/VideoSupport.h"

#include <limits>
#include <string_view>

using namespace Velmark;

namespace standin {

MediaPool::~MediaPool()
{
    for (const auto& [number, clip] : m_clips)
        clip->m_link.reset();
}

int32 MediaPool::count(const char* type)
{
    return static_cast<int32>(clipsOf(type).size());
}

IProjectNode* MediaPool::itemAt(int32 index, const char* type)
{
    const std::span<MediaClip* const> clips = clipsOf(type);
    return index >= 0 && index < std::ssize(clips) ? clips[static_cast<std::size_t>(index)] : nullptr;
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
    const Counted<MediaClip> probed = probe(asked);
    if (!probed)
        return nullptr;
    add(probed);
    return static_cast<FObject*>(probed.get());
}

Counted<MediaClip> MediaPool::probe(const std::u16string& path) const
{
    if (!m_videos || !(m_framesPerSecond > 0.0) || !isWellFormed(path))
        return nullptr;
    const auto video = m_videos->probe({path, m_projectFile}, m_framesPerSecond);
    if (!video)
        return nullptr;
    auto clip = makeCounted<MediaClip>(MediaClip::Kind::Video, path, video->frameCount / m_framesPerSecond);
    clip->setFileRate(video->framesPerSecond);
    return clip;
}

MediaClip* MediaPool::clipWith(int number) const
{
    const auto found = m_clips.find(number);
    return found != m_clips.end() ? found->second.get() : nullptr;
}

std::span<MediaClip* const> MediaPool::clipsOf(const char* type)
{
    // Clips never go, so as many as there are have all been sorted.
    if (m_audio.size() + m_video.size() != m_clips.size()) {
        m_audio.clear();
        m_video.clear();
        for (const auto& [number, clip] : m_clips)
            (clip->kind() == MediaClip::Kind::Audio ? m_audio : m_video).push_back(clip.get());
    }
    const std::string_view asked = type ? type : "";
    if (asked == TypeWord::Audio)
        return m_audio;
    if (asked == TypeWord::Video)
        return m_video;
    return {};
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
    clip->m_link = m_link;
    clip->m_framesPerSecond = m_framesPerSecond;
    clip->m_projectFile = m_projectFile;
    MediaClip& added = *clip;
    m_clips.emplace(number, std::move(clip));
    added.markContentChanged();
}

void MediaPool::setFrameRate(double framesPerSecond)
{
    m_framesPerSecond = framesPerSecond;
    for (const auto& [number, clip] : m_clips) {
        clip->m_framesPerSecond = framesPerSecond;
        clip->updateCaption();
    }
}

void MediaPool::setProjectFile(const std::u16string& path)
{
    m_projectFile = path;
    for (const auto& [number, clip] : m_clips) {
        clip->m_projectFile = path;
        clip->updateCaption();
    }
}

} // namespace standin
