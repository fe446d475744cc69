// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/PictureDrawing.h"

#include "standin/video/VideoError.h"

#include <bit>
#include <cstring>
#include <utility>

namespace standin {

namespace {

constexpr int BytesPerPixel = 4;
/// The scaler may write a few pixels past the end of a row.
constexpr int RowAlignment = 64;
/// From this size on, a picture that doesn't tell its matrix has that of high definition.
constexpr int HighDefinitionWidth = 1280;
constexpr int HighDefinitionHeight = 720;

/// The formats that say by their name that they use the full range, as those that don't.
AVPixelFormat withoutRange(AVPixelFormat format)
{
    switch (format) {
    case AV_PIX_FMT_YUVJ420P:
        return AV_PIX_FMT_YUV420P;
    case AV_PIX_FMT_YUVJ411P:
        return AV_PIX_FMT_YUV411P;
    case AV_PIX_FMT_YUVJ422P:
        return AV_PIX_FMT_YUV422P;
    case AV_PIX_FMT_YUVJ440P:
        return AV_PIX_FMT_YUV440P;
    case AV_PIX_FMT_YUVJ444P:
        return AV_PIX_FMT_YUV444P;
    default:
        return format;
    }
}

/// The number in a field of an enumeration. A file can bring one there that the enumeration doesn't have.
template <typename Enumeration>
int numberIn(const Enumeration& field)
{
    static_assert(sizeof(Enumeration) == sizeof(int));
    return std::bit_cast<int>(field);
}

int matrixOf(const AVFrame& picture)
{
    switch (numberIn(picture.colorspace)) {
    case AVCOL_SPC_BT709:
        return SWS_CS_ITU709;
    case AVCOL_SPC_BT470BG:
    case AVCOL_SPC_SMPTE170M:
        return SWS_CS_ITU601;
    case AVCOL_SPC_FCC:
        return SWS_CS_FCC;
    case AVCOL_SPC_SMPTE240M:
        return SWS_CS_SMPTE240M;
    case AVCOL_SPC_BT2020_NCL:
    case AVCOL_SPC_BT2020_CL:
        return SWS_CS_BT2020;
    default:
        return picture.width >= HighDefinitionWidth || picture.height >= HighDefinitionHeight ? SWS_CS_ITU709
                                                                                              : SWS_CS_ITU601;
    }
}

/// The pixel of the stored picture that is seen at a place of the upright one.
std::pair<int, int> storedPlace(int x, int y, PictureSize stored, Orientation orientation)
{
    std::pair<int, int> place;
    switch (orientation.quarterTurns) {
    case 1:
        place = {y, stored.height - 1 - x};
        break;
    case 2:
        place = {stored.width - 1 - x, stored.height - 1 - y};
        break;
    case 3:
        place = {stored.width - 1 - y, x};
        break;
    default:
        place = {x, y};
    }
    if (orientation.isMirrored)
        place.first = stored.width - 1 - place.first;
    return place;
}

} // namespace

Picture PictureDrawing::draw(const AVFrame& picture, Ratio pixelAspect, Orientation orientation, PictureSize box)
{
    Picture drawn;
    drawn.size = fittedSize({picture.width, picture.height}, pixelAspect, orientation, box);
    PictureSize stored = drawn.size;
    if (orientation.swapsSides())
        std::swap(stored.width, stored.height);

    const auto format = static_cast<AVPixelFormat>(picture.format);
    m_scaler.reset(sws_getCachedContext(
        m_scaler.release(), picture.width, picture.height, withoutRange(format), stored.width, stored.height,
        AV_PIX_FMT_BGRA, SWS_BICUBIC | SWS_ACCURATE_RND | SWS_FULL_CHR_H_INT, nullptr, nullptr, nullptr));
    if (!m_scaler)
        throw VideoError(VideoError::Reason::Broken);
    constexpr int One = 1 << 16;
    const bool isFullRange = numberIn(picture.color_range) == AVCOL_RANGE_JPEG || withoutRange(format) != format;
    const int* const matrix = sws_getCoefficients(matrixOf(picture));
    sws_setColorspaceDetails(m_scaler.get(), matrix, isFullRange ? 1 : 0, matrix, 1, 0, One, One);

    const int stride = (stored.width * BytesPerPixel + RowAlignment - 1) / RowAlignment * RowAlignment;
    std::vector<std::uint8_t> rows(static_cast<std::size_t>(stride) * static_cast<std::size_t>(stored.height) +
                                   RowAlignment);
    std::uint8_t* const target[4] = {rows.data()};
    const int strides[4] = {stride};
    if (sws_scale(m_scaler.get(), picture.data, picture.linesize, 0, picture.height, target, strides) <= 0)
        throw VideoError(VideoError::Reason::Broken);

    drawn.pixels.resize(static_cast<std::size_t>(drawn.size.width) * static_cast<std::size_t>(drawn.size.height) *
                        BytesPerPixel);
    std::uint8_t* pixel = drawn.pixels.data();
    for (int y = 0; y < drawn.size.height; ++y) {
        for (int x = 0; x < drawn.size.width; ++x, pixel += BytesPerPixel) {
            const auto [column, row] = storedPlace(x, y, stored, orientation);
            std::memcpy(pixel, rows.data() + static_cast<std::ptrdiff_t>(row) * stride + column * BytesPerPixel,
                        BytesPerPixel);
            pixel[BytesPerPixel - 1] = 0xff;
        }
    }
    return drawn;
}

} // namespace standin
