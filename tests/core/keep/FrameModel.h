// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/picture/FrameRange.h"

#include <cstdint>
#include <string>
#include <vector>

namespace cadrel::tests {

/// Two cuts frame by frame at one frame a second, in the plainest form: far too slow for a film and easy to check by
/// eye, so that it can say what two pictures being equal means. Knows cuts with readable sources alone.
class FrameModel {
public:
    /// All times have to lie below this.
    static constexpr std::int32_t Length = 2000;

    FrameModel(const core::EventList& oldEvents, const core::EventList& newEvents)
        : m_old(picturesOf(oldEvents)), m_new(picturesOf(newEvents))
    {
    }

    bool isOldBlack(std::int32_t frame) const { return pictureAt(m_old, frame).empty(); }
    bool isNewBlack(std::int32_t frame) const { return pictureAt(m_new, frame).empty(); }
    /// Whether the new picture at a frame equals the old one `shift` frames before; black equals nothing.
    bool isEqual(std::int32_t newFrame, std::int32_t shift) const;
    /// The stretches of picture that stand 60 frames or more apart.
    std::vector<core::FrameRange> oldReels() const { return reelsOf(m_old); }
    std::vector<core::FrameRange> newReels() const { return reelsOf(m_new); }
    /// Whether old and new reels can be paired, and the new frame is as far from the start of its reel, or from its end, as
    /// it was before, together with all frames from there to it.
    bool goesAlongWithAnEnd(std::int32_t newFrame) const;

private:
    struct Layer {
        std::string roll;
        double speed;
        double sourceFrame;
        bool operator==(const Layer&) const = default;
        auto operator<=>(const Layer&) const = default;
    };
    using Picture = std::vector<Layer>;
    using Pictures = std::vector<Picture>;

    static Pictures picturesOf(const core::EventList& events);
    static const Picture& pictureAt(const Pictures& pictures, std::int32_t frame);
    static bool isStill(const Picture& picture);
    static std::vector<core::FrameRange> reelsOf(const Pictures& pictures);
    bool isEqualOrBlack(std::int32_t newFrame, std::int32_t shift) const;
    /// The frames around one that show just the same.
    static core::FrameRange sameAround(const Pictures& pictures, std::int32_t frame);

    Pictures m_old;
    Pictures m_new;
};

} // namespace cadrel::tests
