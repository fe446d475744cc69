// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/picture/ImageProviderThread.h"
#include "host/video/VideoSourceBase.h"

#include <juce_graphics/juce_graphics.h>

#include <cstddef>
#include <memory>

namespace cadrel::gui {
class VideoProviderBase;
} // namespace cadrel::gui

namespace cadrel::host {

/// Brings the pictures of one side to the provider: what was asked for last, once the host has drawn it, and a message until
/// then. All that it delivers goes out from within `poll`.
class SingleImageProvider : public VideoSourceBase::Listener {
public:
    /// The provider and the source outlive this object.
    SingleImageProvider(gui::VideoProviderBase& provider, Velmark::IHostContext* context, VideoSourceBase& source,
                        std::size_t side);
    SingleImageProvider(const SingleImageProvider&) = delete;
    SingleImageProvider& operator=(const SingleImageProvider&) = delete;
    /// Waits for the host to end the picture that it is drawing, for two seconds at the most.
    ~SingleImageProvider() override;

    void requestImage(int width, int height, bool lastFrame, double time);
    /// To be called over and over, from the main thread.
    void poll();

    /// To be called in the place of `poll` while nobody looks at the pictures. Delivers nothing and lets go of what has come;
    /// a later `poll` asks for it again.
    void discard();

    /// Asks again for what was asked last.
    void sourceChanged() override;

private:
    /// False when the thread is still at another picture.
    bool startRequest();
    VideoFrame findFrame();
    void deliverMessage(const wchar_t* message);

    gui::VideoProviderBase& m_provider;
    std::unique_ptr<ImageProviderThread> m_thread;
    VideoSourceBase& m_source;
    std::size_t m_side;
    juce::Point<int> m_size; ///< 0 until the first request
    double m_time = 0.0;
    bool m_lastFrame = false;
    bool m_dirty = false;     ///< a request waits for the thread
    bool m_isAwaited = false; ///< the picture that the thread is at is the one that was asked for last
};

} // namespace cadrel::host
