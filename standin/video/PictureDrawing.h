// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/video/Av.h"
#include "standin/video/PictureShape.h"

#include <cstdint>
#include <vector>

namespace standin {

/// A picture for the screen: rows from top to bottom, each pixel blue, green, red and opaque alpha.
struct Picture {
    PictureSize size;
    std::vector<std::uint8_t> pixels;
};

/// Makes pictures for the screen of decoded ones. It keeps what it has prepared for pictures of the same kind and size.
class PictureDrawing {
public:
    /// Fits the picture into the box and turns it upright; range and matrix are those that the picture tells, or the usual
    /// ones of its size. Throws VideoError as Broken for a kind of picture that can't be drawn.
    Picture draw(const AVFrame& picture, Ratio pixelAspect, Orientation orientation, PictureSize box);

private:
    AvOwner<SwsContext> m_scaler;
};

} // namespace standin
