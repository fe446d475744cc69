// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/picture/FrameRange.h"
#include "core/time/Framerate.h"

#include <cstddef>
#include <vector>

namespace cadrel::core {

/// What stands less than 60 seconds apart belongs together; this is the shortest gap in frames that parts it.
std::int32_t partingGap(const Framerate& framerate);

/// A reel of the old cut and that of the new cut that has taken its place.
struct ReelPair {
    FrameRange oldFrames;
    FrameRange newFrames;

    std::int32_t startShift() const { return newFrames.start - oldFrames.start; }
    std::int32_t endShift() const { return newFrames.end - oldFrames.end; }
};

/// The reels of both cuts, paired in their order. A reel is all picture that belongs together.
class Reels {
public:
    Reels(const FrameRanges& oldLit, const FrameRanges& newLit, const Framerate& framerate);

    const FrameRanges& ofOld() const { return m_old; }
    const FrameRanges& ofNew() const { return m_new; }
    bool canBePaired() const { return m_old.size() == m_new.size(); }
    /// Empty when they can't be paired.
    const std::vector<ReelPair>& pairs() const { return m_pairs; }
    /// The pair to which a frame of the new programme belongs; null for none.
    const ReelPair* pairAtNew(std::int32_t frame) const;

private:
    FrameRanges m_old;
    FrameRanges m_new;
    std::vector<ReelPair> m_pairs;
};

} // namespace cadrel::core
