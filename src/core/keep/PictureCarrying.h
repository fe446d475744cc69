// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/keep/CarriedStretches.h"
#include "core/picture/PictureComparison.h"
#include "core/picture/PictureLine.h"
#include "core/picture/Reels.h"
#include "core/time/Framerate.h"

#include <optional>
#include <vector>

namespace cadrel::core {

class EventList;
struct ChangeStretch;

/// Carries over what has a picture in both cuts: first what is equal from the start of a reel or up to its end, then what
/// is equal at the same time unless the change EDL carries it over within a longer stretch, then what the change EDL tells,
/// and last the holes between.
class PictureCarrying {
public:
    PictureCarrying(const PictureLine& oldLine, const PictureLine& newLine, const Reels& reels,
                    CarriedStretches& carried);

    /// All steps. The change events that can't be used are passed over. Throws nothing of its own.
    void run(const EventList& changeEvents, const Framerate& framerate);

private:
    /// What a hole can go on with.
    struct Hole {
        FrameRange frames;
        std::optional<std::int32_t> leftShift;
        std::optional<std::int32_t> rightShift;
    };

    void carryReelEnds();
    void carryLongerThanInPlace(const std::vector<ChangeStretch>& stretches);
    void carryInPlace();
    void carryChangeEvents(const EventList& changeEvents, const std::vector<ChangeStretch>& stretches,
                           const Framerate& framerate);
    void carryHoles();
    void carryEqual(std::int32_t shift, const FrameRange& bounds);
    void carryEqual(std::int32_t shift, const FrameRange& bounds, CarriedFrom from);
    std::vector<Hole> findHoles() const;
    std::vector<Hole> holesOf(const FrameRange& newReel, const ReelPair* pair) const;

    const PictureLine& m_new;
    const Reels& m_reels;
    PictureComparison m_comparison;
    CarriedStretches& m_carried;
};

} // namespace cadrel::core
