// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/video/FrameClock.h"

namespace standin {

/// In pixels.
struct PictureSize {
    int width = 0;
    int height = 0;

    friend bool operator==(const PictureSize&, const PictureSize&) = default;
};

/// How the stored picture has to be turned to be seen upright: mirrored left to right first, then turned clockwise.
struct Orientation {
    int quarterTurns = 0; ///< 0 to 3
    bool isMirrored = false;

    bool swapsSides() const { return quarterTurns % 2 == 1; }

    friend bool operator==(const Orientation&, const Orientation&) = default;
};

/// The largest size within `box` at which a picture of `stored` pixels isn't stretched. `pixelAspect` is the width of a pixel
/// over its height, as the picture is stored; the box is that of the turned picture. Each side is at least 1.
PictureSize fittedSize(PictureSize stored, Ratio pixelAspect, Orientation orientation, PictureSize box);

/// The orientation of a matrix that maps stored coordinates, to the right and down, to those of the screen: x' = a x + c y,
/// y' = b x + d y. Other angles count as the nearest quarter turn.
Orientation orientationOf(double a, double b, double c, double d);

} // namespace standin
