// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/MediaClip.h"
#include "velmark/Implements.h"
#include "velmark/Media.h"

namespace standin {

/// That of a host that opens no video files: its pictures tell the name of the clip and the frame. They come in the size that
/// was asked for.
class ThumbnailFactory : public Velmark::Implements<ThumbnailFactory, Velmark::FObject, Velmark::IThumbnailFactory> {
public:
    static constexpr const char* ClassName = "ThumbnailFactory";

    /// Refuses what isn't a video of this host, and a side that no picture may have.
    Velmark::int32 setSource(Velmark::IMediaClip* clip, const Velmark::int32 size[2]) override;
    Velmark::IThumbnailImage* getImage(Velmark::uint32 frame) override;

private:
    MediaClip::Caption m_caption; ///< without frames while there is no source
    int m_width = 0;
    int m_height = 0;
};

} // namespace standin
