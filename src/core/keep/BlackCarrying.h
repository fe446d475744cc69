// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/keep/CarriedStretches.h"
#include "core/keep/ChangeStretch.h"
#include "core/keep/ReelGap.h"
#include "core/picture/FrameRange.h"
#include "core/picture/Reels.h"
#include "core/time/Framerate.h"

#include <cstdint>
#include <vector>

namespace cadrel::core {

/// Carries over what stands in the black of the old cut, after its picture. Each frame of black goes to one place at
/// most, and never under a picture of the new cut.
///
/// Black within a reel goes along with the picture beside it. What stands in the black of a scene that is gone has no place
/// any more. Around the reels it depends on what stands there, as ReelGap tells.
///
///     reel |--| tail                              2-pop |--| reel
///              follows the reel's end     follows the reel's start
///                            |  |
///                            stays
class BlackCarrying {
public:
    /// `newLit` is where the new cut has a picture; `material` are the clips, markers and points on tracks that the run
    /// changes, in any order. All but `material` are borrowed.
    BlackCarrying(const FrameRanges& oldLit, const FrameRanges& newLit, const Reels& reels,
                  const std::vector<FrameRange>& material, const Framerate& framerate, CarriedStretches& carried);

    /// What finds no room beside its picture or its reel goes where the change EDL carries it, if it does.
    void run(const std::vector<ChangeStretch>& changes);

    /// The material in the black of the old cut, within the day.
    const FrameRanges& material() const { return m_material; }
    /// What of it has found no room.
    FrameRanges lost() const;
    /// Material that would have to move from or to a time that no timecode names.
    const FrameRanges& outsideOfDay() const { return m_outsideOfDay; }

private:
    struct IslandEdges;
    struct Gap;
    /// Black between two reels, or beside the first or the last.
    struct Surroundings {
        ReelGap gap;
        FrameRange newFrames;
        const ReelPair* before;
        const ReelPair* after;

        std::int32_t shiftBefore() const { return before == nullptr ? 0 : before->endShift(); }
        std::int32_t shiftAfter() const { return after == nullptr ? 0 : after->startShift(); }
        ReelGap::Parts parts() const { return gap.parts(gap.frames().length() == newFrames.length()); }
    };

    void carryWithinReels();
    /// `picture` is what has been carried over.
    void carryBetween(const Gap& gap, const FrameRanges& picture);
    void carryAroundReels();
    void carryAsChanged(const std::vector<ChangeStretch>& changes);
    std::vector<Surroundings> surroundings() const;
    /// Carries what goes along with a reel, and notes what of it can't since no timecode names the place.
    void follow(const FrameRange& source, std::int32_t shift, const FrameRange& room);
    void carry(const FrameRange& source, std::int32_t shift, const FrameRange& room);
    FrameRanges roomIn(const FrameRange& destination) const;

    const FrameRanges& m_oldLit;
    const FrameRanges& m_newLit;
    const Reels& m_reels;
    std::vector<FrameRange> m_pieces; ///< clips, markers and points
    FrameRanges m_allMaterial;        ///< in black, outside of the day too
    FrameRanges m_material;
    FrameRanges m_outsideOfDay;
    FrameRange m_day;
    std::int32_t m_partingGap;
    CarriedStretches& m_carried;
    std::vector<CarriedStretch> m_placed; ///< what has been carried out of black
};

} // namespace cadrel::core
