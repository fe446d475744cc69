// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/picture/FrameRange.h"
#include "core/time/Framerate.h"
#include "core/time/SecondsRange.h"

#include <vector>

namespace cadrel::core {

/// The frames on which clips, markers or automation points stand. What reaches into a frame by less than SameInstant
/// isn't in it; an instant, such as a point, stands on the one frame that holds it. Times beyond a hundred days are cut
/// short. Throws Result::InvalidArgument for a range that ends before it starts or isn't of numbers.
FrameRanges framesOfMaterial(const std::vector<SecondsRange>& material, const Framerate& framerate);

/// The same for each of them, in their order. They may overlap.
std::vector<FrameRange> framesOfEach(const std::vector<SecondsRange>& material, const Framerate& framerate);

} // namespace cadrel::core
