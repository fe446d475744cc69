// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/picture/VideoProviderBase.h"

#include "core/time/Timecode.h"
#include "util/Result.h"

namespace cadrel::gui {

using util::Result;

namespace {

void checkSide(std::size_t side)
{
    if (side > VideoProviderBase::NewSide)
        throw Result::InvalidArgument;
}

} // namespace

void VideoProviderBase::setTime(std::size_t side, const core::Timecode& timecode)
{
    checkSide(side);
    m_times[side] = timecode.toSeconds();
    request(side);
}

const juce::Image& VideoProviderBase::getImage(std::size_t side) const
{
    checkSide(side);
    return m_images[side];
}

void VideoProviderBase::setImageSize(int width, int height)
{
    if (width < 1 || height < 1)
        throw Result::OutOfRange;
    const juce::Point<int> size(width, height);
    if (size == m_size)
        return;
    m_size = size;
    for (juce::Image& image : m_images)
        image = juce::Image(juce::Image::ARGB, width, height, true);
    requestBoth();
}

void VideoProviderBase::deliverImage(const juce::Image& image, std::size_t side)
{
    checkSide(side);
    m_images[side] = image;
    notifyImageChanged(side);
}

void VideoProviderBase::notifyImageChanged(std::size_t side)
{
    m_listeners.forEach([&](Listener& listener) { listener.imageChanged(side); });
}

bool VideoProviderBase::hasListeners() const
{
    bool hasAny = false;
    m_listeners.forEach([&](Listener&) { hasAny = true; });
    return hasAny;
}

/// The new side also when the old one is refused.
void VideoProviderBase::requestBoth()
{
    try {
        request(OldSide);
    } catch (...) {
        request(NewSide);
        throw;
    }
    request(NewSide);
}

void VideoProviderBase::request(std::size_t side)
{
    if (m_size.isOrigin())
        throw Result::NotAvailable;
    requestImage(side, m_size.x, m_size.y, m_lastFrame, m_times[side]);
}

} // namespace cadrel::gui
