// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/picture/FrameRange.h"

#include <cstdint>
#include <vector>

namespace cadrel::core {

/// The black between two reels, or beside the first or the last, and with which of them goes what stands there.
/// Clips and markers less than 60 seconds apart are a block. A clip that spans the gap joins nothing: the blocks go as
/// they would without it, and it is cut where one of them goes another way than the part before it.
///
///     reel |--| tail             another reel            2-pop |--| reel
///          |---------------- a clip that spans -------------------|
///           with the end     |      stays      | with the start
class ReelGap {
public:
    /// With whom each frame goes; what the clips that span have left beside the blocks stands apart.
    struct Parts {
        FrameRange withEnd;   ///< of the reel before, from where that ends
        FrameRange withStart; ///< of the reel after, up to where that starts
        FrameRanges staying;
        FrameRange spanningWithEnd;
        FrameRange spanningWithStart;
        FrameRanges spanningStaying;
    };

    /// `partingGap` is the shortest distance in frames that parts two blocks.
    ReelGap(const FrameRange& frames, bool hasReelBefore, bool hasReelAfter, std::int32_t partingGap);

    const FrameRange& frames() const { return m_frames; }
    /// A clip, marker or point that stands in the gap at least in part.
    void add(const FrameRange& piece);
    /// If the gap keeps its length, both reels move alike. What joins them then takes all of the gap along.
    Parts parts(bool keepsLength) const;

private:
    bool touchesEnd(const FrameRange& part) const;
    bool touchesStart(const FrameRange& part) const;
    bool spans(const FrameRange& piece, const FrameRange& part) const;
    void addSpanning(const FrameRange& part);
    void placeSpanning(Parts& parts) const;

    FrameRange m_frames;
    bool m_hasReelBefore;
    bool m_hasReelAfter;
    std::int32_t m_partingGap;
    std::vector<FrameRange> m_joining;
    // How far the clips that span reach: from the reel before, from the reel after, and those that touch both.
    std::int32_t m_reachFromBefore;
    std::int32_t m_reachFromAfter;
    std::int32_t m_startOfWhole;
};

} // namespace cadrel::core
