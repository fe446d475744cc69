// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/picture/VideoProvider.h"

namespace cadrel::host {

VideoProvider::VideoProvider(Velmark::IHostContext* context)
    : ProjectVideo(context), m_images{{{*this, context, oldSource(), OldSide}, {*this, context, newSource(), NewSide}}}
{
}

void VideoProvider::poll()
{
    for (SingleImageProvider& image : m_images)
        image.poll();
}

void VideoProvider::requestImage(std::size_t side, int width, int height, bool lastFrame, double time)
{
    m_images.at(side).requestImage(width, height, lastFrame, time);
}

} // namespace cadrel::host
