// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/MediaClip.h"
#include "velmark/Implements.h"
#include "velmark/Media.h"

#include <string_view>
#include <vector>

namespace standin {

/// A flat picture with two lines of white text in its middle, as large as they fit.
class ThumbnailImage : public Velmark::Implements<ThumbnailImage, Velmark::FObject, Velmark::IThumbnailImage> {
public:
    static constexpr const char* ClassName = "ThumbnailImage";

    ThumbnailImage(int width, int height, std::u16string_view firstLine, std::u16string_view secondLine);

    Velmark::int32 getSize(Velmark::int32 size[2]) override;
    /// Refuses a rectangle that isn't within the picture, and a stride that is shorter than its rows.
    Velmark::int32 read(void* pixels, Velmark::int32 stride, const Velmark::int32 rect[4],
                        Velmark::int32 reserved) override;

private:
    void drawLine(std::u16string_view text, int top, int scale);
    void fill(int left, int top, int size);

    int m_width;
    int m_height;
    std::vector<Velmark::uint8> m_pixels; ///< blue, green, red, alpha
};

/// This host opens no video files: its pictures tell the name of the clip and the frame. They come in the size that was asked
/// for.
class ThumbnailFactory : public Velmark::Implements<ThumbnailFactory, Velmark::FObject, Velmark::IThumbnailFactory> {
public:
    static constexpr const char* ClassName = "ThumbnailFactory";
    /// The longest side of a picture.
    static constexpr Velmark::int32 LongestSide = 8192;

    /// Refuses what isn't a video of this host, and a side below 1 or above LongestSide.
    Velmark::int32 setSource(Velmark::IMediaClip* clip, const Velmark::int32 size[2]) override;
    Velmark::IThumbnailImage* getImage(Velmark::uint32 frame) override;

private:
    MediaClip::Caption m_caption; ///< without frames while there is no source
    int m_width = 0;
    int m_height = 0;
};

} // namespace standin
