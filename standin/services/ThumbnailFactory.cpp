// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/ThumbnailFactory.h"

#include "standin/services/ThumbnailImage.h"

#include <string>
#include <vector>

namespace standin {

using namespace Velmark;

int32 ThumbnailFactory::setSource(IMediaClip* clip, const int32 size[2])
{
    m_caption = {};
    const auto* const video = dynamic_cast<MediaClip*>(clip);
    if (!video || video->kind() != MediaClip::Kind::Video || !ThumbnailImage::isSize(size))
        return ResultFalse;
    m_caption = video->caption();
    m_width = size[0];
    m_height = size[1];
    return ResultOk;
}

IThumbnailImage* ThumbnailFactory::getImage(uint32 frame)
{
    if (frame >= m_caption.frameCount)
        return nullptr;
    const std::string number = std::to_string(frame);
    const std::vector<std::u16string> lines{m_caption.name, std::u16string(number.begin(), number.end())};
    return makeCounted<ThumbnailImage>(m_width, m_height, lines).detach();
}

} // namespace standin
