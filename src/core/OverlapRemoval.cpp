#include "core/OverlapRemoval.h"

#include <algorithm>
#include <limits>

namespace cadrel::core {

namespace {

constexpr std::size_t None = std::numeric_limits<std::size_t>::max();

/// The stretches that still take part, for the one question of the walk: which is the first in list order that overlaps
/// a given one? It either starts within that one, or it starts before and reaches over its start:
///
///     given            |--------|
///     starts within        |---------|
///     reaches over   |----|
///
/// Both are trees over the sorted distinct starts. One holds the first candidate that starts in each range of starts,
/// the other, for each range, the candidates that reach over all of it but not over its parent.
class OverlapFinder {
public:
    explicit OverlapFinder(const std::vector<CandidateStretch>& candidates)
        : candidates_(candidates), takesPart_(candidates.size(), true)
    {
        for (const CandidateStretch& candidate : candidates)
            starts_.push_back(candidate.start);
        std::sort(starts_.begin(), starts_.end());
        starts_.erase(std::unique(starts_.begin(), starts_.end()), starts_.end());
        leafCount_ = starts_.size();

        startingAt_.resize(leafCount_);
        reachingOver_.resize(2 * leafCount_);
        firstStarting_.resize(2 * leafCount_, None);
        for (std::size_t place = 0; place < candidates.size(); ++place) {
            if (candidates[place].isEmpty())
                continue;
            startingAt_[rankOf(candidates[place].start)].places.push_back(place);
            addReach(place);
        }
        for (std::size_t rank = 0; rank < leafCount_; ++rank)
            firstStarting_[leafCount_ + rank] = firstOf(startingAt_[rank]);
        for (std::size_t node = leafCount_; node-- > 1;)
            updateNode(node);
    }

    void takeOut(std::size_t place)
    {
        takesPart_[place] = false;
        const std::size_t rank = rankOf(candidates_[place].start);
        std::size_t node = leafCount_ + rank;
        firstStarting_[node] = firstOf(startingAt_[rank]);
        while (node > 1) {
            node /= 2;
            updateNode(node);
        }
    }

    bool takesPart(std::size_t place) const { return takesPart_[place]; }

    /// None when nothing that takes part overlaps the given one.
    std::size_t firstOverlapping(const CandidateStretch& given)
    {
        return std::min(firstStartingWithin(given), firstReachingOver(given.start));
    }

private:
    /// Places in list order; those at the front that take no part any more are passed for good.
    struct Queue {
        std::vector<std::size_t> places;
        std::size_t head = 0;
    };

    std::size_t rankOf(std::int32_t start) const
    {
        return static_cast<std::size_t>(std::lower_bound(starts_.begin(), starts_.end(), start) - starts_.begin());
    }

    std::size_t firstOf(Queue& queue) const
    {
        while (queue.head < queue.places.size() && !takesPart_[queue.places[queue.head]])
            ++queue.head;
        return queue.head < queue.places.size() ? queue.places[queue.head] : None;
    }

    void updateNode(std::size_t node)
    {
        firstStarting_[node] = std::min(firstStarting_[2 * node], firstStarting_[2 * node + 1]);
    }

    /// Calls `visit` for the nodes that make up the leaves from `first` up to `behind`.
    template <typename Visit>
    void visitNodes(std::size_t first, std::size_t behind, Visit visit)
    {
        for (first += leafCount_, behind += leafCount_; first < behind; first /= 2, behind /= 2) {
            if (first % 2 == 1)
                visit(first++);
            if (behind % 2 == 1)
                visit(--behind);
        }
    }

    void addReach(std::size_t place)
    {
        const CandidateStretch& candidate = candidates_[place];
        visitNodes(rankOf(candidate.start) + 1, rankOf(candidate.end),
                   [&](std::size_t node) { reachingOver_[node].places.push_back(place); });
    }

    std::size_t firstStartingWithin(const CandidateStretch& given)
    {
        std::size_t first = None;
        visitNodes(rankOf(given.start), rankOf(given.end),
                   [&](std::size_t node) { first = std::min(first, firstStarting_[node]); });
        return first;
    }

    std::size_t firstReachingOver(std::int32_t start)
    {
        std::size_t first = None;
        for (std::size_t node = leafCount_ + rankOf(start); node >= 1; node /= 2)
            first = std::min(first, firstOf(reachingOver_[node]));
        return first;
    }

    const std::vector<CandidateStretch>& candidates_;
    std::vector<bool> takesPart_;
    std::vector<std::int32_t> starts_;
    std::size_t leafCount_ = 0;
    std::vector<Queue> startingAt_;
    std::vector<std::size_t> firstStarting_; ///< by node; the leaves begin at `leafCount_`
    std::vector<Queue> reachingOver_;        ///< by node
};

} // namespace

std::vector<std::size_t> survivorsOfOverlaps(const std::vector<CandidateStretch>& candidates)
{
    OverlapFinder finder(candidates);
    std::vector<std::size_t> survivors;
    for (std::size_t place = 0; place < candidates.size(); ++place) {
        if (candidates[place].isEmpty()) {
            survivors.push_back(place);
            continue;
        }
        if (!finder.takesPart(place))
            continue;
        // A survivor has met all that overlap it, so it need not be found again by the candidates behind it.
        finder.takeOut(place);
        const CandidateStretch& candidate = candidates[place];
        std::size_t overlapping = finder.firstOverlapping(candidate);
        while (overlapping != None && candidate.beatsLater(candidates[overlapping])) {
            finder.takeOut(overlapping);
            overlapping = finder.firstOverlapping(candidate);
        }
        if (overlapping == None)
            survivors.push_back(place);
    }
    return survivors;
}

} // namespace cadrel::core
