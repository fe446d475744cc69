// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/PlacementChoice.h"

#include "core/change/OverlapRemoval.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <span>
#include <utility>

namespace cadrel::core {

namespace {

class PlacementChoice {
public:
    explicit PlacementChoice(double lastDisplacement) : m_lastDisplacement(lastDisplacement) {}

    /// Decides separately between each group of stretches that overlap, directly or through others. `stretches` ascend
    /// by their start.
    std::vector<Placement> survivorsOf(const std::vector<const SharedStretch*>& stretches)
    {
        std::vector<const SharedStretch*> connected;
        std::int32_t connectedEnd = 0;
        for (const SharedStretch* stretch : stretches) {
            if (stretch->length() == 0) {
                // An empty stretch overlaps nothing.
                for (const TwinGroup::Place& place : stretch->group().placesByIndex)
                    m_survivors.push_back({stretch, place});
                continue;
            }
            if (!connected.empty() && stretch->newSourceStart() >= connectedEnd) {
                decideBetween(connected);
                connected.clear();
            }
            connectedEnd =
                connected.empty() ? stretch->newSourceEnd() : std::max(connectedEnd, stretch->newSourceEnd());
            connected.push_back(stretch);
        }
        if (!connected.empty())
            decideBetween(connected);
        return std::move(m_survivors);
    }

private:
    void decideBetween(const std::vector<const SharedStretch*>& connected)
    {
        const std::int32_t latestStart = connected.back()->newSourceStart();
        const bool allOverlap = std::all_of(connected.begin(), connected.end(), [&](const SharedStretch* stretch) {
            return latestStart < stretch->newSourceEnd();
        });
        if (allOverlap)
            m_survivors.push_back(bestOf(connected));
        else
            addPlacementsOfWalk(connected);
    }

    /// If all overlap each other, the one that no other beats survives.
    Placement bestOf(const std::vector<const SharedStretch*>& overlapping) const
    {
        std::int32_t longest = 0;
        for (const SharedStretch* stretch : overlapping)
            longest = std::max(longest, stretch->length());
        Placement best{};
        for (const SharedStretch* stretch : overlapping) {
            if (stretch->length() != longest)
                continue;
            const Placement nearest{stretch, nearestPlace(*stretch, stretch->group().placesByTime)};
            if (best.stretch == nullptr || isNearer(nearest, best))
                best = nearest;
        }
        return best;
    }

    /// For candidates of the same length; the later one in the list wins a tie. CandidateStretch::beatsLater says the
    /// same.
    bool isNearer(const Placement& a, const Placement& b) const
    {
        const double aDistance = distance(*a.stretch, a.place.dstIn);
        const double bDistance = distance(*b.stretch, b.place.dstIn);
        return aDistance != bDistance ? aDistance < bDistance : a.place.index > b.place.index;
    }

    /// The displacement falls as the old place rises, so the place nearest to the last displacement is just before or
    /// just after the point where it falls below that. `places` ascends by time and is not empty.
    TwinGroup::Place nearestPlace(const SharedStretch& stretch, std::span<const TwinGroup::Place> places) const
    {
        const auto below = std::partition_point(places.begin(), places.end(), [&](const TwinGroup::Place& place) {
            return stretch.displacement(place.dstIn) >= m_lastDisplacement;
        });
        if (below == places.end())
            return places.back();
        const auto behindBelow = std::partition_point(
            below, places.end(), [&](const TwinGroup::Place& place) { return place.dstIn == below->dstIn; });
        const Placement nearestBelow{&stretch, *std::prev(behindBelow)};
        if (below == places.begin())
            return nearestBelow.place;
        const Placement nearestAbove{&stretch, *std::prev(below)};
        return isNearer(nearestAbove, nearestBelow) ? nearestAbove.place : nearestBelow.place;
    }

    /// Goes through the candidates in list order. Twins with no other candidate between them overlap each other and the
    /// same others, so only the best of such a run is kept.
    void addPlacementsOfWalk(const std::vector<const SharedStretch*>& connected)
    {
        const std::vector<Placement> runs = bestOfRuns(connected);
        std::vector<CandidateStretch> candidates;
        candidates.reserve(runs.size());
        for (const auto& [stretch, place] : runs)
            candidates.push_back({stretch->newSourceStart(), stretch->newSourceEnd(), distance(*stretch, place.dstIn)});
        for (const std::size_t place : survivorsOfOverlaps(candidates))
            m_survivors.push_back(runs[place]);
    }

    /// In list order.
    std::vector<Placement> bestOfRuns(const std::vector<const SharedStretch*>& connected) const
    {
        // The heap moves its members about, so they are small.
        struct Next {
            std::size_t index; ///< of the first place that is left of a stretch
            std::size_t stretch;
        };
        const auto comesLater = [](const Next& a, const Next& b) { return a.index > b.index; };
        std::vector<std::span<const TwinGroup::Place>> rests;
        std::vector<Next> heap;
        rests.reserve(connected.size());
        heap.reserve(connected.size());
        for (const SharedStretch* stretch : connected) {
            heap.push_back({stretch->group().placesByIndex.front().index, rests.size()});
            rests.push_back(stretch->group().placesByIndex);
        }
        std::make_heap(heap.begin(), heap.end(), comesLater);

        std::vector<Placement> best;
        best.reserve(connected.size());
        while (!heap.empty()) {
            std::pop_heap(heap.begin(), heap.end(), comesLater);
            const std::size_t next = heap.back().stretch;
            heap.pop_back();
            std::span<const TwinGroup::Place>& rest = rests[next];
            const auto runEnd =
                heap.empty() ? rest.end() : std::partition_point(rest.begin(), rest.end(), [&](const auto& place) {
                    return place.index < heap.front().index;
                });
            const auto runLength = static_cast<std::size_t>(runEnd - rest.begin());
            best.push_back(bestOfRun(*connected[next], rest.first(runLength)));
            rest = rest.subspan(runLength);
            if (!rest.empty()) {
                heap.push_back({rest.front().index, next});
                std::push_heap(heap.begin(), heap.end(), comesLater);
            }
        }
        return best;
    }

    Placement bestOfRun(const SharedStretch& stretch, std::span<const TwinGroup::Place> run) const
    {
        if (stretch.group().areOrdersEqual)
            return {&stretch, nearestPlace(stretch, run)};
        if (run.size() == stretch.group().placesByTime.size())
            return {&stretch, nearestPlace(stretch, stretch.group().placesByTime)};
        Placement best{&stretch, run.front()};
        for (const TwinGroup::Place& place : run.subspan(1)) {
            if (isNearer({&stretch, place}, best))
                best.place = place;
        }
        return best;
    }

    double distance(const SharedStretch& stretch, std::int32_t oldDstIn) const
    {
        return std::fabs(stretch.displacement(oldDstIn) - m_lastDisplacement);
    }

    double m_lastDisplacement;
    std::vector<Placement> m_survivors;
};

} // namespace

std::vector<Placement> survivingPlacements(const std::vector<SharedStretch>& stretches, double lastDisplacement)
{
    std::vector<const SharedStretch*> byStart;
    byStart.reserve(stretches.size());
    for (const SharedStretch& stretch : stretches)
        byStart.push_back(&stretch);
    std::sort(byStart.begin(), byStart.end(),
              [](const SharedStretch* a, const SharedStretch* b) { return a->newSourceStart() < b->newSourceStart(); });

    std::vector<Placement> survivors = PlacementChoice(lastDisplacement).survivorsOf(byStart);
    std::sort(survivors.begin(), survivors.end(),
              [](const Placement& a, const Placement& b) { return a.place.index < b.place.index; });
    return survivors;
}

} // namespace cadrel::core
