// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/FrameStills.h"

#include "host/picture/ImageProviderThread.h"

#include <algorithm>

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

FrameStills::FrameStills(Velmark::IHostContext* context, std::size_t capacity)
    : m_thread(std::make_unique<ImageProviderThread>(context)), m_capacity(capacity)
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

bool FrameStills::poll()
{
    juce::Image image;
    bool success = false;
    const bool hasCome = m_thread->fetch(image, success);
    if (hasCome) {
        keep(m_atWork, success ? image : juce::Image());
        m_atWork = {};
    }
    if (!m_atWork.clip)
        startNext();
    return hasCome && success;
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
    m_kept.insert_or_assign(wanted.key, Kept{wanted.clip, std::move(image), m_uses.begin()});
    while (m_bytes > m_capacity && m_uses.size() > 1) {
        const auto last = m_kept.find(m_uses.back());
        m_bytes -= bytesOf(last->second.image);
        m_kept.erase(last);
        m_uses.pop_back();
    }
}

} // namespace desktop
