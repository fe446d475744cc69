// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/picture/VideoProvider.h"

namespace cadrel::host {

VideoProvider::VideoProvider(Velmark::IHostContext* context)
    : ProjectVideo(context), m_images{{{*this, context, oldSource(), OldSide}, {*this, context, newSource(), NewSide}}}
{
}

void VideoProvider::poll()
{
    // Without a window there may be no JUCE to draw with.
    for (SingleImageProvider& image : m_images)
        hasListeners() ? image.poll() : image.discard();
}

void VideoProvider::requestImage(std::size_t side, int width, int height, bool lastFrame, double time)
{
    m_images.at(side).requestImage(width, height, lastFrame, time);
}

} // namespace cadrel::host
