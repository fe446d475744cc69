// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/core/keep/FrameModel.h"

#include "core/edl/EventBase.h"
#include "tests/core/keep/KeepFilm.h"

#include <algorithm>
#include <cmath>

namespace cadrel::tests {

using core::FrameRange;

FrameModel::Pictures FrameModel::picturesOf(const core::EventList& events)
{
    Pictures pictures(Length);
    for (const auto& event : events.events()) {
        const std::int32_t srcIn = event->srcIn().toFrameCount(FrameASecond);
        const std::int32_t srcOut = event->srcOut().toFrameCount(FrameASecond);
        const std::int32_t dstIn = event->dstIn().toFrameCount(FrameASecond);
        const std::int32_t dstOut = event->dstOut().toFrameCount(FrameASecond);
        const double speed = static_cast<double>(srcOut - srcIn) / (dstOut - dstIn);
        for (std::int32_t frame = dstIn; frame < dstOut; ++frame) {
            Picture& picture = pictures.at(static_cast<std::size_t>(frame));
            picture.push_back({event->rollName(), speed, srcIn + (frame - dstIn) * speed});
        }
    }
    for (Picture& picture : pictures) {
        std::sort(picture.begin(), picture.end());
        const auto isSame = [](const Layer& a, const Layer& b) {
            return a.roll == b.roll && a.speed == b.speed && std::fabs(a.sourceFrame - b.sourceFrame) < 1e-6;
        };
        picture.erase(std::unique(picture.begin(), picture.end(), isSame), picture.end());
    }
    return pictures;
}

const FrameModel::Picture& FrameModel::pictureAt(const Pictures& pictures, std::int32_t frame)
{
    static const Picture Black;
    return frame < 0 || frame >= Length ? Black : pictures[static_cast<std::size_t>(frame)];
}

bool FrameModel::isStill(const Picture& picture)
{
    return std::all_of(picture.begin(), picture.end(), [](const Layer& layer) { return layer.speed == 0.0; });
}

FrameRange FrameModel::sameAround(const Pictures& pictures, std::int32_t frame)
{
    const Picture& picture = pictureAt(pictures, frame);
    FrameRange same{frame, frame + 1};
    while (pictureAt(pictures, same.start - 1) == picture)
        --same.start;
    while (pictureAt(pictures, same.end) == picture)
        ++same.end;
    return same;
}

bool FrameModel::isEqual(std::int32_t newFrame, std::int32_t shift) const
{
    const Picture& newPicture = pictureAt(m_new, newFrame);
    const Picture& oldPicture = pictureAt(m_old, newFrame - shift);
    if (newPicture.empty() || newPicture.size() != oldPicture.size())
        return false;
    for (std::size_t index = 0; index < newPicture.size(); ++index) {
        const Layer& newLayer = newPicture[index];
        const Layer& oldLayer = oldPicture[index];
        if (newLayer.roll != oldLayer.roll || std::fabs(newLayer.speed - oldLayer.speed) >= 0.01)
            return false;
        const double step = std::min({1.0, std::fabs(newLayer.speed), std::fabs(oldLayer.speed)});
        const double distance = std::fabs(newLayer.sourceFrame - oldLayer.sourceFrame);
        if (step == 0.0 ? newLayer.speed != oldLayer.speed || distance != 0.0 : distance >= step / 2)
            return false;
    }
    if (!isStill(newPicture))
        return true;
    const FrameRange newSame = sameAround(m_new, newFrame);
    const FrameRange oldSame = sameAround(m_old, newFrame - shift).shiftedBy(shift);
    return newSame.start == oldSame.start || newSame.end == oldSame.end;
}

std::vector<FrameRange> FrameModel::reelsOf(const Pictures& pictures)
{
    std::vector<FrameRange> reels;
    for (std::int32_t frame = 0; frame < Length; ++frame) {
        if (pictureAt(pictures, frame).empty())
            continue;
        if (reels.empty() || frame - reels.back().end >= 60)
            reels.push_back({frame, frame});
        reels.back().end = frame + 1;
    }
    return reels;
}

bool FrameModel::isEqualOrBlack(std::int32_t newFrame, std::int32_t shift) const
{
    return isEqual(newFrame, shift) || (isNewBlack(newFrame) && isOldBlack(newFrame - shift));
}

bool FrameModel::goesAlongWithAnEnd(std::int32_t newFrame) const
{
    const std::vector<FrameRange> before = oldReels();
    const std::vector<FrameRange> after = newReels();
    for (std::size_t index = 0; before.size() == after.size() && index < after.size(); ++index) {
        if (!after[index].contains(newFrame))
            continue;
        const std::int32_t startShift = after[index].start - before[index].start;
        bool isAsFromStart = true;
        for (std::int32_t frame = after[index].start; frame <= newFrame; ++frame)
            isAsFromStart = isAsFromStart && isEqualOrBlack(frame, startShift);
        const std::int32_t endShift = after[index].end - before[index].end;
        bool isAsFromEnd = true;
        for (std::int32_t frame = newFrame; frame < after[index].end; ++frame)
            isAsFromEnd = isAsFromEnd && isEqualOrBlack(frame, endShift);
        return isAsFromStart || isAsFromEnd;
    }
    return false;
}

} // namespace cadrel::tests
