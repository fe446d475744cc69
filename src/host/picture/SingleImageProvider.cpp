// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/picture/SingleImageProvider.h"

#include "gui/picture/VideoProviderBase.h"
#include "util/ModulePin.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <utility>

namespace cadrel::host {

SingleImageProvider::SingleImageProvider(gui::VideoProviderBase& provider, Velmark::IHostContext* context,
                                         VideoSourceBase& source, std::size_t side)
    : m_provider(provider), m_thread(std::make_unique<ImageProviderThread>(context)), m_source(source), m_side(side)
{
    m_source.addListener(this);
}

SingleImageProvider::~SingleImageProvider()
{
    m_source.removeListener(this);
    // A thread that the host doesn't give back can't be ended, nor can it do without what it uses and the code that it runs.
    if (!m_thread->stop()) {
        util::pinModule();
        static_cast<void>(m_thread.release());
    }
}

void SingleImageProvider::requestImage(int width, int height, bool lastFrame, double time)
{
    m_size = {width, height};
    m_lastFrame = lastFrame;
    m_time = time;
    m_dirty = true;
}

void SingleImageProvider::poll()
{
    juce::Image image;
    bool success = false;
    // A picture that comes after a newer request is the wrong one.
    if (m_thread->fetch(image, success) && m_isAwaited && !m_dirty) {
        if (success)
            m_provider.deliverImage(image, m_side);
        else
            deliverMessage(L"No video available.");
    }
    if (m_dirty)
        m_dirty = !startRequest();
}

void SingleImageProvider::discard()
{
    if (m_thread->discard() && m_isAwaited)
        m_dirty = true;
}

void SingleImageProvider::sourceChanged()
{
    m_dirty = !m_size.isOrigin();
}

bool SingleImageProvider::startRequest()
{
    m_isAwaited = false;
    VideoFrame frame = m_thread->canDraw() ? findFrame() : VideoFrame();
    if (!frame.clip) {
        deliverMessage(L"No video available.");
        return true;
    }
    deliverMessage(L"Loading");
    m_isAwaited = m_thread->request(m_size, std::move(frame));
    return m_isAwaited;
}

VideoFrame SingleImageProvider::findFrame()
{
    try {
        return m_source.getFrame(m_lastFrame, m_time);
    } catch (util::Result::Type) {
        return {};
    }
}

void SingleImageProvider::deliverMessage(const wchar_t* message)
{
    const std::wstring text = util::StringUtil::translate(message);
    const juce::Image image(juce::Image::ARGB, m_size.x, m_size.y, true);
    juce::Graphics graphics(image);
    graphics.fillAll(juce::Colours::black);
    graphics.setColour(juce::Colours::white);
    graphics.setFont(static_cast<float>(m_size.y) * 0.17F);
    graphics.drawFittedText(juce::String(text.c_str()), image.getBounds(), juce::Justification::centred, 2);
    m_provider.deliverImage(image, m_side);
}

} // namespace cadrel::host
