// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notes/NoteStep.h"

#include <vector>

namespace cadrel::core {

class Programme;

/// Kept stretches that follow each other in both cuts, whatever has been inserted or deleted between them. They stay or
/// move as one. `first` to `last` are places in the list of kept stretches.
struct KeptBlock {
    std::size_t first;
    std::size_t last;
    FrameSpan inOld; ///< from its first to its last frame, with what is deleted between
    std::size_t oldReel;
    std::size_t newReel;
    bool stays = false; ///< else it has to be moved
};

/// Brings together each new reel and the old one whose picture it has most of; of reels without any common picture those
/// that begin at the same timecode, and as many as stand between the same other reels. They are in the order of
/// the new cut; a reel that is gone comes after the one that was before it.
std::vector<ReelChange> pairReels(const Programme& oldCut, const Programme& newCut,
                                  const std::vector<KeptStretch>& kept);

/// The blocks in the order of the new programme. Within each pair of reels those stay that keep their order; it is the
/// choice with the fewest moves, and of those the one that moves the fewest frames. `kept` are in the order of the new
/// programme, none of them doubled.
std::vector<KeptBlock> findBlocks(const Programme& oldCut, const Programme& newCut,
                                  const std::vector<KeptStretch>& kept, const std::vector<ReelChange>& reels);

} // namespace cadrel::core
