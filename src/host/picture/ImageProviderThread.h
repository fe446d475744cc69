// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/video/VideoSourceBase.h"
#include "velmark/Counted.h"
#include "velmark/Media.h"

#include <juce_graphics/juce_graphics.h>

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <vector>

namespace Velmark {
class IHostContext;
} // namespace Velmark

namespace cadrel::host {

/// Lets the host draw pictures on a thread of its own, one at a time; the first request starts it. A request goes back and
/// forth between the two threads. Only the thread that has it may use its data:
///
///          request            render             fetch
///     Free -------> Requested -------> Finished -------> Free
///         main thread         this thread      main thread
class ImageProviderThread : public juce::Thread {
public:
    /// Without the host's thumbnail factory there will be no pictures.
    explicit ImageProviderThread(Velmark::IHostContext* context);
    /// It has to be stopped.
    ~ImageProviderThread() override;

    /// Ends the thread, which first finishes the picture that it is at. False when the host hasn't given it back in time: the
    /// thread goes on then, and so must this object.
    bool stop();

    // For the main thread.

    /// Whether pictures can be had at all.
    bool canDraw() const { return m_factory && !m_hasNoThread; }
    /// Asks for a picture of about that size. False when the picture before it hasn't been fetched yet, and when the system
    /// gives no thread, after which there are no pictures any more.
    bool request(juce::Point<int> size, VideoFrame frame);
    /// Whether a picture has come that was asked for. Without `success` there is none of that frame, and `image` stays.
    bool fetch(juce::Image& image, bool& success);
    /// Lets go of a picture that has come. False when there is none.
    bool discard();

private:
    enum class State { Free, Requested, Finished };

    void run() override;
    /// Whether there is such a picture.
    bool render();

    Velmark::Counted<Velmark::IObjectFactory> m_objectFactory;
    Velmark::FUnknown* m_factoryObject = nullptr; ///< what the object factory gave, and is given back
    Velmark::Counted<Velmark::IThumbnailFactory> m_factory;
    juce::Point<int> m_requestSize;
    VideoFrame m_requestFrame;
    std::vector<std::uint8_t> m_pixels; ///< grows only, to serve all pictures
    int m_width = 0;
    int m_height = 0;
    bool m_success = false;
    bool m_hasNoThread = false; ///< it couldn't be started
    juce::WaitableEvent m_wake;
    std::atomic<State> m_state = State::Free;
};

} // namespace cadrel::host
