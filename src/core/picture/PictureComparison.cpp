// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/picture/PictureComparison.h"

#include "core/edl/EventBase.h"
#include "core/picture/PictureLine.h"

#include <algorithm>
#include <cmath>

namespace cadrel::core {

namespace {

/// The part of `frames` on which |at0 + frame * slope| stays below `limit`.
FrameRange whereBelow(double limit, double at0, double slope, const FrameRange& frames)
{
    if (slope == 0.0)
        return std::fabs(at0) < limit ? frames : FrameRange{};
    const double a = (-limit - at0) / slope;
    const double b = (limit - at0) / slope;
    const auto asFrame = [&frames](double frame) {
        return static_cast<std::int32_t>(
            std::clamp(frame, static_cast<double>(frames.start), static_cast<double>(frames.end)));
    };
    // The first frame above the lower bound, and the first one that reaches the upper.
    return {asFrame(std::floor(std::min(a, b)) + 1.0), asFrame(std::ceil(std::max(a, b)))};
}

/// The part of `frames`, of the new programme, on which the layers show the same.
FrameRange equalPart(const PictureLayer& oldLayer, const PictureLayer& newLayer, std::int32_t shift,
                     const FrameRange& frames)
{
    if (oldLayer.material != newLayer.material || !EventBase::areSameSpeed(oldLayer.speed, newLayer.speed))
        return {};
    const double slowest = std::min(std::fabs(oldLayer.speed), std::fabs(newLayer.speed));
    if (slowest == 0.0)
        return oldLayer.speed == newLayer.speed && oldLayer.origin == newLayer.origin ? frames : FrameRange{};
    const double limit = 0.5 * std::min(1.0, slowest);
    const double at0 = newLayer.origin - (oldLayer.origin - shift * oldLayer.speed);
    return whereBelow(limit, at0, newLayer.speed - oldLayer.speed, frames);
}

} // namespace

template <class Action>
void PictureComparison::forEachOverlap(std::int32_t shift, const FrameRange& bounds, Action action) const
{
    const auto firstBehind = [](const std::vector<PictureRun>& runs, std::int32_t frame) {
        return std::partition_point(runs.begin(), runs.end(),
                                    [frame](const PictureRun& run) { return run.frames.end <= frame; });
    };
    auto newRun = firstBehind(m_new.runs(), bounds.start);
    auto oldRun = firstBehind(m_old.runs(), bounds.start - shift);
    while (newRun != m_new.runs().end() && oldRun != m_old.runs().end()) {
        const FrameRange oldFrames = oldRun->frames.shiftedBy(shift);
        if (newRun->frames.start >= bounds.end || oldFrames.start >= bounds.end)
            return;
        const FrameRange overlap = intersect(bounds, intersect(newRun->frames, oldFrames));
        if (!overlap.isEmpty())
            action(*oldRun, *newRun, overlap);
        if (newRun->frames.end <= oldFrames.end)
            ++newRun;
        else
            ++oldRun;
    }
}

FrameRange PictureComparison::equalPart(const PictureRun& oldRun, const PictureRun& newRun, std::int32_t shift,
                                        const FrameRange& overlap) const
{
    if (oldRun.layerCount != newRun.layerCount || oldRun.unseenLayers != newRun.unseenLayers)
        return {};
    const FrameRange oldFrames = oldRun.frames.shiftedBy(shift);
    const bool sharesEdge = oldFrames.start == newRun.frames.start || oldFrames.end == newRun.frames.end;
    if (newRun.isStill && !sharesEdge)
        return {};
    const auto oldLayers = m_old.layersOf(oldRun);
    const auto newLayers = m_new.layersOf(newRun);
    FrameRange equal = overlap;
    for (std::size_t layer = 0; layer < newLayers.size() && !equal.isEmpty(); ++layer)
        equal = core::equalPart(oldLayers[layer], newLayers[layer], shift, equal);
    return equal;
}

std::vector<PicturePiece> PictureComparison::equalUnder(std::int32_t shift, const FrameRange& bounds) const
{
    std::vector<PicturePiece> pieces;
    forEachOverlap(shift, bounds, [&](const PictureRun& oldRun, const PictureRun& newRun, const FrameRange& overlap) {
        const FrameRange equal = equalPart(oldRun, newRun, shift, overlap);
        if (!equal.isEmpty())
            pieces.push_back({equal, m_new.eventOf(newRun)});
    });
    return pieces;
}

std::vector<PicturePiece> PictureComparison::litUnder(std::int32_t shift, const FrameRange& bounds) const
{
    std::vector<PicturePiece> pieces;
    forEachOverlap(shift, bounds, [&](const PictureRun&, const PictureRun& newRun, const FrameRange& overlap) {
        pieces.push_back({overlap, m_new.eventOf(newRun)});
    });
    return pieces;
}

FrameRanges PictureComparison::differencesUnder(std::int32_t shift, const FrameRange& bounds) const
{
    std::vector<FrameRange> equal;
    for (const PicturePiece& piece : equalUnder(shift, bounds))
        equal.push_back(piece.frames);
    FrameRanges lit = within(bounds, m_new.lit());
    const FrameRanges oldLit = within(bounds, shiftedBy(shift, within(bounds.shiftedBy(-shift), m_old.lit())));
    lit.insert(lit.end(), oldLit.begin(), oldLit.end());
    return without(united(std::move(lit)), united(std::move(equal)));
}

} // namespace cadrel::core
