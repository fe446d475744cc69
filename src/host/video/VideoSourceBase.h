// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/ListenerSet.h"
#include "velmark/Counted.h"
#include "velmark/Media.h"

#include <cstdint>

namespace cadrel::host {

/// A frame of a clip; without a clip there is no picture.
struct VideoFrame {
    Velmark::Counted<Velmark::IMediaClip> clip;
    std::uint32_t frame = 0;
};

/// Knows which frame of which clip is on the screen at a time.
class VideoSourceBase {
public:
    class Listener {
    public:
        virtual ~Listener() = default;

        /// Another frame may be on the screen than a moment ago.
        virtual void sourceChanged() = 0;
    };

    VideoSourceBase() = default;
    VideoSourceBase(const VideoSourceBase&) = delete;
    VideoSourceBase& operator=(const VideoSourceBase&) = delete;
    virtual ~VideoSourceBase() = default;

    /// The frame that begins at `time`, in seconds of the project's clock. `lastFrame` tells that it is the last one before an
    /// OUT point.
    virtual VideoFrame getFrame(bool lastFrame, double time) = 0;

    /// Listeners are not owned.
    void addListener(Listener* listener) { m_listeners.add(listener); }
    void removeListener(Listener* listener) { m_listeners.remove(listener); }

protected:
    void notify()
    {
        m_listeners.forEach([](Listener& listener) { listener.sourceChanged(); });
    }

private:
    util::ListenerSet<Listener> m_listeners;
};

} // namespace cadrel::host
