// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/BlackCarrying.h"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <limits>
#include <map>
#include <optional>
#include <set>

namespace cadrel::core {

namespace {

/// Before and after everything, far enough from the end of the numbers that a shift doesn't reach it.
constexpr FrameRange AllTime{std::numeric_limits<std::int32_t>::min() / 2,
                             std::numeric_limits<std::int32_t>::max() / 2};

/// Ranges out of which others are taken, in no more time than what they meet takes.
class Leftover {
public:
    explicit Leftover(const FrameRanges& ranges)
    {
        for (const FrameRange& range : ranges)
            m_ends.emplace_hint(m_ends.end(), range.start, range.end);
    }

    FrameRanges within(const FrameRange& bounds) const
    {
        FrameRanges found;
        auto range = m_ends.upper_bound(bounds.start);
        if (range != m_ends.begin())
            --range;
        for (; range != m_ends.end() && range->first < bounds.end; ++range) {
            const FrameRange part = intersect({range->first, range->second}, bounds);
            if (!part.isEmpty())
                found.push_back(part);
        }
        return found;
    }

    void take(const FrameRange& taken)
    {
        for (const FrameRange& part : within(taken)) {
            const auto place = std::prev(m_ends.upper_bound(part.start));
            const FrameRange whole{place->first, place->second};
            m_ends.erase(place);
            if (whole.start < part.start)
                m_ends.emplace(whole.start, part.start);
            if (part.end < whole.end)
                m_ends.emplace(part.end, whole.end);
        }
    }

private:
    std::map<std::int32_t, std::int32_t> m_ends; ///< by the start
};

} // namespace

/// The shifts of those frames of an island of old picture that survive nearest to its start and to its end.
struct BlackCarrying::IslandEdges {
    std::int32_t first = std::numeric_limits<std::int32_t>::max();
    std::int32_t last = std::numeric_limits<std::int32_t>::min();
    std::vector<std::int32_t> shiftsAtFirst;
    std::vector<std::int32_t> shiftsAtLast;

    bool isEmpty() const { return shiftsAtFirst.empty(); }

    void add(const FrameRange& source, std::int32_t shift)
    {
        if (source.start < first)
            shiftsAtFirst.clear();
        if (source.start <= first)
            shiftsAtFirst.push_back(shift);
        first = std::min(first, source.start);
        if (source.end > last)
            shiftsAtLast.clear();
        if (source.end >= last)
            shiftsAtLast.push_back(shift);
        last = std::max(last, source.end);
    }
};

/// Black between two islands of a reel.
struct BlackCarrying::Gap {
    FrameRange frames;
    const IslandEdges* left;
    const IslandEdges* right;
    const IslandEdges* nearestLeft; ///< of the reel's islands on that side of which something survives; null for none
    const IslandEdges* nearestRight;

    /// Whether a place in the new programme has next to it, on one side, the picture that survives nearest to the gap.
    /// Where none survives, any place will do.
    bool isBesideItsPicture(const FrameRange& place, const FrameRanges& picture) const
    {
        if (nearestLeft == nullptr && nearestRight == nullptr)
            return true;
        const auto isAfter = [&](std::int32_t shift) {
            return isClear({nearestLeft->last + shift, place.start}, picture);
        };
        const auto isBefore = [&](std::int32_t shift) {
            return isClear({place.end, nearestRight->first + shift}, picture);
        };
        return (nearestLeft != nullptr && std::ranges::any_of(nearestLeft->shiftsAtLast, isAfter)) ||
               (nearestRight != nullptr && std::ranges::any_of(nearestRight->shiftsAtFirst, isBefore));
    }

private:
    /// Whether the way runs forwards and meets no picture.
    static bool isClear(const FrameRange& way, const FrameRanges& picture)
    {
        const auto next = std::partition_point(picture.begin(), picture.end(),
                                               [&way](const FrameRange& range) { return range.end <= way.start; });
        return way.start <= way.end && (next == picture.end() || next->start >= way.end);
    }
};

BlackCarrying::BlackCarrying(const FrameRanges& oldLit, const FrameRanges& newLit, const Reels& reels,
                             const std::vector<FrameRange>& material, const Framerate& framerate,
                             CarriedStretches& carried)
    : m_oldLit(oldLit), m_newLit(newLit), m_reels(reels), m_pieces(material),
      m_allMaterial(without(united(material), oldLit)), m_day{0, framerate.lastFrame},
      m_partingGap(partingGap(framerate)), m_carried(carried)
{
    m_material = within(m_day, m_allMaterial);
}

void BlackCarrying::run(const std::vector<ChangeStretch>& changes)
{
    carryWithinReels();
    carryAroundReels();
    carryAsChanged(changes);
}

FrameRanges BlackCarrying::lost() const
{
    std::vector<FrameRange> placed;
    for (const CarriedStretch& stretch : m_placed)
        placed.push_back(stretch.source());
    return without(m_material, united(std::move(placed)));
}

void BlackCarrying::carryWithinReels()
{
    std::vector<IslandEdges> islands(m_oldLit.size());
    for (const CarriedStretch& stretch : m_carried.stretches()) {
        const FrameRange source = stretch.source();
        const auto island = std::partition_point(m_oldLit.begin(), m_oldLit.end(),
                                                 [&](const FrameRange& lit) { return lit.end <= source.start; });
        islands[static_cast<std::size_t>(island - m_oldLit.begin())].add(source, stretch.shift);
    }
    std::vector<Gap> gaps;
    const IslandEdges* nearest = nullptr;
    for (std::size_t index = 0; index + 1 < m_oldLit.size(); ++index) {
        Gap gap{
            {m_oldLit[index].end, m_oldLit[index + 1].start}, &islands[index], &islands[index + 1], nullptr, nullptr};
        nearest = gap.left->isEmpty() ? nearest : gap.left;
        if (gap.frames.length() >= m_partingGap) {
            nearest = nullptr;
            continue;
        }
        gap.nearestLeft = nearest;
        gaps.push_back(gap);
    }
    for (auto gap = gaps.rbegin(); gap != gaps.rend(); ++gap) {
        const bool isLastOfReel = gap == gaps.rbegin() || std::prev(gap)->left != gap->right;
        nearest = isLastOfReel ? nullptr : nearest;
        nearest = gap->right->isEmpty() ? nearest : gap->right;
        gap->nearestRight = nearest;
    }
    const FrameRanges picture = m_carried.destinations();
    for (const Gap& gap : gaps)
        carryBetween(gap, picture);
}

// The black between two shots goes where both have gone, if they have stayed together; else where more of it finds
// room; where either has as much, after the left one unless its end is gone. It always goes next to one of the two.
void BlackCarrying::carryBetween(const Gap& gap, const FrameRanges& picture)
{
    const std::vector<std::int32_t>& leftShifts = gap.left->shiftsAtLast;
    const std::vector<std::int32_t>& rightShifts = gap.right->shiftsAtFirst;
    const bool isLeftWhole = gap.left->last == gap.frames.start;
    const std::set<std::int32_t> right(rightShifts.begin(), rightShifts.end());
    std::vector<std::int32_t> candidates;
    std::copy_if(leftShifts.begin(), leftShifts.end(), std::back_inserter(candidates),
                 [&right](std::int32_t shift) { return right.contains(shift); });
    const auto& preferred = isLeftWhole ? leftShifts : rightShifts;
    const auto& others = isLeftWhole ? rightShifts : leftShifts;
    candidates.insert(candidates.end(), preferred.begin(), preferred.end());
    candidates.insert(candidates.end(), others.begin(), others.end());
    candidates.push_back(0);

    std::optional<std::int32_t> best;
    std::int32_t mostRoom = 0;
    for (const std::int32_t shift : candidates) {
        const FrameRange place = gap.frames.shiftedBy(shift);
        const std::int32_t room = lengthOf(roomIn(place));
        if (room > mostRoom && gap.isBesideItsPicture(place, picture)) {
            mostRoom = room;
            best = shift;
        }
    }
    if (best)
        carry(gap.frames, *best, AllTime);
}

// What goes along with a reel has its place first, then what stays, and last the clips that span.
void BlackCarrying::carryAroundReels()
{
    const std::vector<Surroundings> all = surroundings();
    std::vector<ReelGap::Parts> parts;
    for (const Surroundings& around : all) {
        parts.push_back(around.parts());
        follow(parts.back().withEnd, around.shiftBefore(), around.newFrames);
        follow(parts.back().withStart, around.shiftAfter(), around.newFrames);
    }
    for (const ReelGap::Parts& part : parts) {
        for (const FrameRange& block : part.staying)
            carry(block, 0, AllTime);
    }
    for (std::size_t index = 0; index < all.size(); ++index) {
        follow(parts[index].spanningWithEnd, all[index].shiftBefore(), all[index].newFrames);
        follow(parts[index].spanningWithStart, all[index].shiftAfter(), all[index].newFrames);
        for (const FrameRange& range : parts[index].spanningStaying)
            carry(range, 0, AllTime);
    }
}

void BlackCarrying::carryAsChanged(const std::vector<ChangeStretch>& changes)
{
    Leftover left(lost());
    for (const ChangeStretch& stretch : changes) {
        const std::size_t placedBefore = m_placed.size();
        for (const FrameRange& range : left.within(stretch.source()))
            carry(range, stretch.shift, AllTime);
        for (std::size_t index = placedBefore; index < m_placed.size(); ++index)
            left.take(m_placed[index].source());
    }
}

std::vector<BlackCarrying::Surroundings> BlackCarrying::surroundings() const
{
    const FrameRanges oldGaps = without({AllTime}, m_reels.ofOld());
    const FrameRanges newGaps = without({AllTime}, m_reels.ofNew());
    const std::vector<ReelPair>& pairs = m_reels.pairs();
    std::vector<Surroundings> all;
    for (std::size_t index = 0; index < oldGaps.size(); ++index) {
        const ReelPair* const before = index > 0 && index <= pairs.size() ? &pairs[index - 1] : nullptr;
        const ReelPair* const after = index < pairs.size() ? &pairs[index] : nullptr;
        const ReelGap gap(oldGaps[index], before != nullptr, after != nullptr, m_partingGap);
        all.push_back({gap, m_reels.canBePaired() ? newGaps[index] : AllTime, before, after});
    }
    for (const FrameRange& piece : m_pieces) {
        auto around = std::partition_point(all.begin(), all.end(), [&piece](const Surroundings& other) {
            return other.gap.frames().end <= piece.start;
        });
        for (; around != all.end() && around->gap.frames().start < piece.end; ++around)
            around->gap.add(piece);
    }
    return all;
}

void BlackCarrying::follow(const FrameRange& source, std::int32_t shift, const FrameRange& room)
{
    if (source.isEmpty())
        return;
    if (shift != 0) {
        const FrameRanges moving = within(source, m_allMaterial);
        for (const FrameRange& range : without(moving, {m_day}))
            m_outsideOfDay.push_back(range);
        const FrameRange destinationDay = m_day.shiftedBy(-shift);
        for (const FrameRange& range : without(within(m_day, moving), {destinationDay}))
            m_outsideOfDay.push_back(range);
    }
    carry(source, shift, room);
}

void BlackCarrying::carry(const FrameRange& source, std::int32_t shift, const FrameRange& room)
{
    const FrameRange inDay = intersect(source, m_day);
    const FrameRange destination = intersect(intersect(inDay.shiftedBy(shift), room), m_day);
    for (const FrameRange& free : roomIn(destination)) {
        const CarriedStretch stretch{free, shift, CarriedFrom::Black, CarriedStretch::NoEvent};
        m_carried.carry(stretch);
        m_placed.push_back(stretch);
    }
}

FrameRanges BlackCarrying::roomIn(const FrameRange& destination) const
{
    return without(m_carried.freeIn(destination), within(destination, m_newLit));
}

} // namespace cadrel::core
