// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_graphics/juce_graphics.h>

#include <cstdint>

namespace standin {
class MediaClip;
} // namespace standin

namespace desktop {

/// Where the pictures of video tracks come from. All on the message thread.
class Stills {
public:
    Stills() = default;
    Stills(const Stills&) = delete;
    Stills& operator=(const Stills&) = delete;
    virtual ~Stills() = default;

    /// A frame of a video, at most `height` high; null while it isn't there. It is on its way then, unless there is none.
    virtual juce::Image still(standin::MediaClip& clip, std::uint32_t frame, int height) = 0;
    /// What was asked for until now doesn't have to come any more. To be called before all that is seen is drawn anew.
    virtual void startAsking() = 0;
    /// Takes what has come. True when `still` gives more than before. To be called over and over.
    virtual bool poll() = 0;
};

} // namespace desktop
