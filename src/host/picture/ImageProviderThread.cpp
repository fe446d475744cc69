// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/picture/ImageProviderThread.h"

#include "velmark/Context.h"

#include <utility>

using namespace Velmark;

namespace cadrel::host {

namespace {

constexpr std::size_t BytesPerPixel = 4;

} // namespace

ImageProviderThread::ImageProviderThread(IHostContext* context)
    : Thread("ThumbnailProvider"), m_objectFactory(service<IObjectFactory>(context))
{
    if (m_objectFactory)
        m_factoryObject = m_objectFactory->createObject(IObjectFactory::ThumbnailClass, IObjectFactory::ThumbnailType);
    m_factory = query<IThumbnailFactory>(m_factoryObject);
}

ImageProviderThread::~ImageProviderThread()
{
    m_factory.reset();
    if (m_factoryObject)
        m_objectFactory->releaseObject(m_factoryObject);
}

bool ImageProviderThread::stop()
{
    constexpr int MostMilliseconds = 2000;
    signalThreadShouldExit();
    m_wake.signal();
    return waitForThreadToExit(MostMilliseconds);
}

bool ImageProviderThread::request(juce::Point<int> size, VideoFrame frame)
{
    if (m_state != State::Free)
        return false;
    if (!isThreadRunning() && !startThread()) {
        m_hasNoThread = true;
        return false;
    }
    m_requestSize = size;
    m_requestFrame = std::move(frame);
    m_state = State::Requested;
    m_wake.signal();
    return true;
}

bool ImageProviderThread::fetch(juce::Image& image, bool& success)
{
    if (m_state != State::Finished)
        return false;
    success = m_success;
    if (success) {
        image = juce::Image(juce::Image::ARGB, m_width, m_height, false);
        const juce::Image::BitmapData bitmap(image, juce::Image::BitmapData::writeOnly);
        const std::uint8_t* pixel = m_pixels.data();
        for (int y = 0; y < m_height; ++y) {
            for (int x = 0; x < m_width; ++x) {
                bitmap.setPixelColour(x, y, juce::Colour(pixel[2], pixel[1], pixel[0], pixel[3]));
                pixel += BytesPerPixel;
            }
        }
    }
    return discard();
}

bool ImageProviderThread::discard()
{
    if (m_state != State::Finished)
        return false;
    m_requestFrame = {};
    m_state = State::Free;
    return true;
}

void ImageProviderThread::run()
{
    while (true) {
        m_wake.wait(-1);
        if (threadShouldExit())
            return;
        m_success = render();
        m_state = State::Finished;
    }
}

bool ImageProviderThread::render()
{
    const int32 wanted[2] = {m_requestSize.x, m_requestSize.y};
    if (m_factory->setSource(m_requestFrame.clip.get(), wanted) != ResultOk)
        return false;
    const auto image = Counted<IThumbnailImage>::adopt(m_factory->getImage(m_requestFrame.frame));
    int32 size[2] = {};
    if (!image || image->getSize(size) != ResultOk || size[0] <= 0 || size[1] <= 0)
        return false;
    m_width = size[0];
    m_height = size[1];
    const std::size_t needed = static_cast<std::size_t>(m_width) * static_cast<std::size_t>(m_height) * BytesPerPixel;
    if (m_pixels.size() < needed)
        m_pixels.resize(needed);
    const int32 whole[4] = {0, 0, m_width, m_height};
    return image->read(m_pixels.data(), m_width * static_cast<int32>(BytesPerPixel), whole, 0) == ResultOk;
}

} // namespace cadrel::host
