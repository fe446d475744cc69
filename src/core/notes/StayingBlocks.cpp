// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/StayingBlocks.h"

#include "core/notes/PrefixTrees.h"
#include "core/notes/Programme.h"

#include <algorithm>
#include <limits>
#include <map>
#include <numeric>
#include <tuple>
#include <utility>

namespace cadrel::core {

namespace {

constexpr std::size_t None = std::numeric_limits<std::size_t>::max();

std::vector<std::size_t> placesInOldOrder(const std::vector<KeptStretch>& kept)
{
    std::vector<std::size_t> order(kept.size());
    std::iota(order.begin(), order.end(), std::size_t{0});
    std::sort(order.begin(), order.end(),
              [&](std::size_t a, std::size_t b) { return kept[a].oldStart < kept[b].oldStart; });
    std::vector<std::size_t> places(kept.size());
    for (std::size_t place = 0; place < order.size(); ++place)
        places[order[place]] = place;
    return places;
}

std::vector<KeptBlock> joinToBlocks(const Programme& oldCut, const Programme& newCut,
                                    const std::vector<KeptStretch>& kept)
{
    const std::vector<std::size_t> oldPlaces = placesInOldOrder(kept);
    std::vector<KeptBlock> blocks;
    for (std::size_t index = 0; index < kept.size(); ++index) {
        const KeptStretch& stretch = kept[index];
        const std::size_t oldReel = oldCut.reelAt(stretch.oldStart);
        const std::size_t newReel = newCut.reelAt(stretch.newStart);
        if (!blocks.empty() && blocks.back().oldReel == oldReel && blocks.back().newReel == newReel &&
            oldPlaces[index] == oldPlaces[index - 1] + 1) {
            blocks.back().last = index;
            blocks.back().inOld.length = stretch.oldEnd() - blocks.back().inOld.start;
        } else {
            blocks.push_back({index, index, {stretch.oldStart, stretch.length}, oldReel, newReel});
        }
    }
    return blocks;
}

/// A row of blocks that keep their order.
struct StayingRow {
    std::int64_t blocks = 0;
    std::int64_t frames = 0;
    std::size_t last = None;

    bool operator<(const StayingRow& other) const
    {
        return std::tie(blocks, frames) < std::tie(other.blocks, other.frames);
    }
};

/// `candidates` are blocks of one pair of reels, in the order of the new one.
void letStay(std::vector<KeptBlock>& blocks, const std::vector<std::size_t>& candidates)
{
    std::vector<std::int32_t> oldStarts;
    for (const std::size_t block : candidates)
        oldStarts.push_back(blocks[block].inOld.start);
    std::sort(oldStarts.begin(), oldStarts.end());

    PrefixMaximum<StayingRow> rows(candidates.size(), StayingRow());
    std::vector<std::size_t> before(candidates.size());
    for (std::size_t index = 0; index < candidates.size(); ++index) {
        const KeptBlock& block = blocks[candidates[index]];
        const auto place = static_cast<std::size_t>(
            std::lower_bound(oldStarts.begin(), oldStarts.end(), block.inOld.start) - oldStarts.begin());
        const StayingRow row = rows.ofFirst(place);
        before[index] = row.last;
        rows.raise(place, {row.blocks + 1, row.frames + block.inOld.length, index});
    }
    for (std::size_t index = rows.ofFirst(candidates.size()).last; index != None; index = before[index])
        blocks[candidates[index]].stays = true;
}

/// Reels without common picture that begin at the same timecode.
void pairByStart(std::vector<ReelChange>& pairs, std::vector<bool>& isTaken, const Programme& oldCut,
                 const Programme& newCut)
{
    std::map<std::int32_t, std::size_t> oldReels;
    for (std::size_t oldReel = 0; oldReel < isTaken.size(); ++oldReel)
        oldReels[oldCut.reels()[oldReel].timecodeStart] = oldReel;
    for (ReelChange& pair : pairs) {
        const auto found = oldReels.find(newCut.reels()[*pair.newReel].timecodeStart);
        if (pair.oldReel || found == oldReels.end() || isTaken[found->second])
            continue;
        pair.oldReel = found->second;
        isTaken[found->second] = true;
    }
}

/// Reels without common picture of which as many stand between the same reels in both cuts.
void pairBetweenNeighbours(std::vector<ReelChange>& pairs, std::vector<bool>& isTaken)
{
    for (std::size_t first = 0; first < pairs.size(); ++first) {
        if (pairs[first].oldReel)
            continue;
        std::size_t end = first;
        while (end < pairs.size() && !pairs[end].oldReel)
            ++end;
        const std::size_t oldFirst = first == 0 ? 0 : *pairs[first - 1].oldReel + 1;
        std::size_t oldEnd = oldFirst;
        while (oldEnd < isTaken.size() && !isTaken[oldEnd])
            ++oldEnd;
        const bool endsAlike = end == pairs.size() ? oldEnd == isTaken.size() : oldEnd == *pairs[end].oldReel;
        if (endsAlike && oldEnd - oldFirst == end - first) {
            for (std::size_t reel = first; reel < end; ++reel) {
                pairs[reel].oldReel = oldFirst + reel - first;
                isTaken[oldFirst + reel - first] = true;
            }
        }
        first = end - 1;
    }
}

} // namespace

std::vector<ReelChange> pairReels(const Programme& oldCut, const Programme& newCut,
                                  const std::vector<KeptStretch>& kept)
{
    std::map<std::pair<std::size_t, std::size_t>, std::int32_t> common;
    for (const KeptStretch& stretch : kept)
        common[{newCut.reelAt(stretch.newStart), oldCut.reelAt(stretch.oldStart)}] += stretch.length;
    std::vector<std::tuple<std::int32_t, std::size_t, std::size_t>> offers;
    for (const auto& [reels, frames] : common)
        offers.emplace_back(-frames, reels.first, reels.second);
    std::sort(offers.begin(), offers.end());

    std::vector<ReelChange> pairs(newCut.reels().size());
    std::vector<bool> isTaken(oldCut.reels().size(), false);
    for (const auto& [frames, newReel, oldReel] : offers) {
        if (pairs[newReel].oldReel || isTaken[oldReel])
            continue;
        pairs[newReel].oldReel = oldReel;
        isTaken[oldReel] = true;
    }
    for (std::size_t newReel = 0; newReel < pairs.size(); ++newReel)
        pairs[newReel].newReel = newReel;
    pairByStart(pairs, isTaken, oldCut, newCut);
    pairBetweenNeighbours(pairs, isTaken);
    for (std::size_t oldReel = 0; oldReel < isTaken.size(); ++oldReel) {
        if (isTaken[oldReel])
            continue;
        const auto before = std::find_if(pairs.begin(), pairs.end(), [oldReel](const ReelChange& pair) {
            return oldReel > 0 && pair.oldReel == oldReel - 1;
        });
        pairs.insert(before == pairs.end() ? pairs.begin() : before + 1, {oldReel, std::nullopt});
    }
    return pairs;
}

std::vector<KeptBlock> findBlocks(const Programme& oldCut, const Programme& newCut,
                                  const std::vector<KeptStretch>& kept, const std::vector<ReelChange>& reels)
{
    std::vector<KeptBlock> blocks = joinToBlocks(oldCut, newCut, kept);
    std::vector<std::optional<std::size_t>> oldReels(newCut.reels().size());
    for (const ReelChange& pair : reels) {
        if (pair.newReel)
            oldReels[*pair.newReel] = pair.oldReel;
    }
    std::vector<std::vector<std::size_t>> candidates(newCut.reels().size());
    for (std::size_t block = 0; block < blocks.size(); ++block) {
        if (oldReels[blocks[block].newReel] == blocks[block].oldReel)
            candidates[blocks[block].newReel].push_back(block);
    }
    for (const auto& ofReel : candidates)
        letStay(blocks, ofReel);
    return blocks;
}

} // namespace cadrel::core
