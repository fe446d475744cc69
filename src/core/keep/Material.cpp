// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/Material.h"

#include "util/Result.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace cadrel::core {

namespace {

/// Far beyond any project, and far enough from the end of the numbers that a shift doesn't reach it.
constexpr double FurthestFrame = std::numeric_limits<std::int32_t>::max() / 4;

std::int32_t asFrame(double frame)
{
    return static_cast<std::int32_t>(std::clamp(frame, -FurthestFrame, FurthestFrame));
}

FrameRange framesOf(const SecondsRange& range, const Framerate& framerate)
{
    if (!(range.start <= range.end))
        throw util::Result::InvalidArgument;
    const std::int32_t start = asFrame(std::floor((range.start + SameInstant) * framerate.rate));
    const std::int32_t end = asFrame(std::ceil((range.end - SameInstant) * framerate.rate));
    return {start, std::max(end, start + 1)};
}

} // namespace

FrameRanges framesOfMaterial(const std::vector<SecondsRange>& material, const Framerate& framerate)
{
    return united(framesOfEach(material, framerate));
}

std::vector<FrameRange> framesOfEach(const std::vector<SecondsRange>& material, const Framerate& framerate)
{
    std::vector<FrameRange> frames;
    frames.reserve(material.size());
    for (const SecondsRange& range : material)
        frames.push_back(framesOf(range, framerate));
    return frames;
}

} // namespace cadrel::core
