// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/FrameStills.h"

#include "host/picture/ImageProviderThread.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace desktop {

using cadrel::host::ImageProviderThread;
using cadrel::host::VideoFrame;
using standin::MediaClip;
using Velmark::Counted;

namespace {

constexpr std::size_t MostWanted = 512;
constexpr std::size_t BytesPerPixel = 4;
/// How wide a picture may be for its height. None is wider, so that the height alone decides.
constexpr int Widest = 4;

} // namespace

FrameStills::FrameStills(Velmark::IHostContext* context, std::size_t capacity, std::chrono::milliseconds retryInterval)
    : m_thread(std::make_unique<ImageProviderThread>(context)), m_capacity(capacity), m_retryInterval(retryInterval),
      m_nextRetry(std::chrono::steady_clock::now() + retryInterval)
{
}

FrameStills::~FrameStills()
{
    // A thread that can't be ended can't do without what it uses.
    if (!m_thread->stop())
        static_cast<void>(m_thread.release());
}

juce::Image FrameStills::still(MediaClip& clip, std::uint32_t frame, int height)
{
    const Key key{&clip, frame, height};
    if (const auto found = m_kept.find(key); found != m_kept.end()) {
        m_uses.splice(m_uses.begin(), m_uses, found->second.use);
        found->second.asking = m_asking;
        return found->second.image;
    }
    if (key != m_atWork.key && m_thread->canDraw() && height > 0 && frame < clip.getFrameCount()) {
        std::erase_if(m_wanted, [&key](const Wanted& wanted) { return wanted.key == key; });
        m_wanted.push_front({key, Counted<MediaClip>::share(&clip)});
        if (m_wanted.size() > MostWanted)
            m_wanted.pop_back();
    }
    return {};
}

void FrameStills::startAsking()
{
    m_wanted.clear();
    ++m_asking;
}

bool FrameStills::poll()
{
    juce::Image image;
    bool success = false;
    const bool hasMore = m_thread->fetch(image, success) && take(success ? image : juce::Image());
    wantAgain();
    if (!m_atWork.clip)
        startNext();
    return hasMore;
}

bool FrameStills::isPictureless(const Key& key, const juce::Image& image)
{
    return image.isNull() || image.getWidth() >= key.height * Widest;
}

bool FrameStills::take(juce::Image image)
{
    const Wanted come = std::exchange(m_atWork, {});
    const auto before = m_kept.find(come.key);
    const bool isRetry = before != m_kept.end();
    if (isRetry)
        forget(before);
    const bool hasMore = !image.isNull() && !(isRetry && isPictureless(come.key, image));
    // The file has come back.
    if (isRetry && hasMore)
        forgetPictureless(come.key.clip);
    keep(come, std::move(image));
    return hasMore;
}

void FrameStills::forget(std::map<Key, Kept>::iterator kept)
{
    m_bytes -= bytesOf(kept->second.image);
    m_uses.erase(kept->second.use);
    m_kept.erase(kept);
}

void FrameStills::forgetPictureless(const MediaClip* clip)
{
    for (auto kept = m_kept.begin(); kept != m_kept.end();) {
        const auto next = std::next(kept);
        if (kept->first.clip == clip && isPictureless(kept->first, kept->second.image))
            forget(kept);
        kept = next;
    }
}

void FrameStills::wantAgain()
{
    const auto now = std::chrono::steady_clock::now();
    if (m_atWork.clip || !m_wanted.empty() || now < m_nextRetry)
        return;
    m_nextRetry = now + m_retryInterval;
    const MediaClip* last = nullptr;
    for (const auto& [key, kept] : m_kept) {
        if (key.clip == last || kept.asking != m_asking || !isPictureless(key, kept.image))
            continue;
        last = key.clip;
        m_wanted.push_back({key, kept.clip});
    }
}

void FrameStills::startNext()
{
    if (m_wanted.empty())
        return;
    Wanted next = std::move(m_wanted.front());
    m_wanted.pop_front();
    const auto& [clip, frame, height] = next.key;
    if (m_thread->request({height * Widest, height}, VideoFrame{next.clip, frame}))
        m_atWork = std::move(next);
}

std::size_t FrameStills::bytesOf(const juce::Image& image)
{
    return static_cast<std::size_t>(image.getWidth()) * static_cast<std::size_t>(image.getHeight()) * BytesPerPixel;
}

void FrameStills::keep(const Wanted& wanted, juce::Image image)
{
    m_uses.push_front(wanted.key);
    m_bytes += bytesOf(image);
    m_kept.insert_or_assign(wanted.key, Kept{wanted.clip, std::move(image), m_uses.begin(), m_asking});
    while (m_bytes > m_capacity && m_uses.size() > 1)
        forget(m_kept.find(m_uses.back()));
}

} // namespace desktop
