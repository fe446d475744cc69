// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/PictureShape.h"

#include <algorithm>
#include <cmath>

namespace standin {

PictureSize fittedSize(PictureSize stored, Ratio pixelAspect, Orientation orientation, PictureSize box)
{
    double width = stored.width * pixelAspect.value();
    double height = stored.height;
    if (orientation.swapsSides())
        std::swap(width, height);
    const double scale = std::min(box.width / width, box.height / height);
    const auto side = [scale](double length, int most) {
        return std::clamp(static_cast<int>(std::lround(length * scale)), 1, most);
    };
    return {side(width, box.width), side(height, box.height)};
}

Orientation orientationOf(double a, double b, double c, double d)
{
    Orientation orientation;
    orientation.isMirrored = a * d - b * c < 0.0;
    if (orientation.isMirrored) {
        // Mirrored back, the right of the stored picture goes where its left went.
        a = -a;
        b = -b;
    }
    // Where the right of the stored picture goes: to the right, down, to the left, up.
    if (std::abs(a) >= std::abs(b))
        orientation.quarterTurns = a >= 0.0 ? 0 : 2;
    else
        orientation.quarterTurns = b >= 0.0 ? 1 : 3;
    return orientation;
}

} // namespace standin
