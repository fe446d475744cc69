// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/ListenerSet.h"

#include <juce_graphics/juce_graphics.h>

#include <array>
#include <cstddef>

namespace cadrel::core {
class Timecode;
} // namespace cadrel::core

namespace cadrel::gui {

class VideoTrackHandlerBase;

/// Two pictures side by side, one of the old version and one of the new. It keeps the wanted times and the last
/// pictures; a derived class provides the pictures. The operations with a side throw Result::InvalidArgument for one
/// that is neither OldSide nor NewSide.
class VideoProviderBase {
public:
    static constexpr std::size_t OldSide = 0;
    static constexpr std::size_t NewSide = 1;

    class Listener {
    public:
        virtual ~Listener() = default;

        virtual void imageChanged(std::size_t side) = 0;
    };

    VideoProviderBase() = default;
    VideoProviderBase(const VideoProviderBase&) = delete;
    VideoProviderBase& operator=(const VideoProviderBase&) = delete;
    virtual ~VideoProviderBase() = default;

    virtual VideoTrackHandlerBase& getTrackHandler() = 0;

    /// Asks for the picture at the timecode, at the project's rate. Throws Result::NotAvailable before a size was set.
    void setTime(std::size_t side, const core::Timecode& timecode);
    /// Whether the pictures asked for from now on are the last ones before an OUT point.
    void setLastFrame(bool flag) { m_lastFrame = flag; }
    /// The last picture. Until the first one comes, it has the size that was set; later ones may have another size.
    const juce::Image& getImage(std::size_t side) const;
    /// In pixels; asks for both pictures again when it is another size. Throws Result::OutOfRange below 1.
    void setImageSize(int width, int height);

    /// What the derived class calls when a picture has come.
    void deliverImage(const juce::Image& image, std::size_t side);
    void notifyImageChanged(std::size_t side);

    /// Listeners are not owned.
    void addListener(Listener* listener) { m_listeners.add(listener); }
    void removeListener(Listener* listener) { m_listeners.remove(listener); }

protected:
    /// Whether anybody looks at the pictures.
    bool hasListeners() const;
    /// The picture is delivered some time later. `time` in seconds of the project's clock; `lastFrame` as setLastFrame.
    virtual void requestImage(std::size_t side, int width, int height, bool lastFrame, double time) = 0;

private:
    void requestBoth();
    void request(std::size_t side);

    std::array<double, 2> m_times = {};
    std::array<juce::Image, 2> m_images;
    juce::Point<int> m_size; ///< what was asked for, whatever came
    bool m_lastFrame = false;
    util::ListenerSet<Listener> m_listeners;
};

} // namespace cadrel::gui
