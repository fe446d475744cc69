// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Implements.h"
#include "velmark/Media.h"

#include <string>
#include <string_view>
#include <vector>

namespace standin {

/// A picture for a module: that of a video, or white text on a dark ground.
class ThumbnailImage : public Velmark::Implements<ThumbnailImage, Velmark::FObject, Velmark::IThumbnailImage> {
public:
    static constexpr const char* ClassName = "ThumbnailImage";
    /// The longest side of a picture that may be asked for.
    static constexpr Velmark::int32 LongestSide = 8192;

    /// `pixels` are rows from top to bottom, each pixel blue, green, red, alpha.
    ThumbnailImage(int width, int height, std::vector<Velmark::uint8> pixels);
    /// The lines in the middle, as large as they fit. What doesn't fit even at the smallest size is cut off at its end.
    ThumbnailImage(int width, int height, const std::vector<std::u16string>& lines);

    /// Whether a module may ask for a picture of that width and height: both are from 1 to LongestSide.
    static bool isSize(const Velmark::int32 size[2]);
    /// The paragraphs as lines of a picture of that size. The text is as large as it fits.
    static std::vector<std::u16string> linesOf(const std::vector<std::u16string>& paragraphs, int width, int height);

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

} // namespace standin
