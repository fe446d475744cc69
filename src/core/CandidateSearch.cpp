#include "core/CandidateSearch.h"

#include "core/EventBase.h"
#include "core/OverlapRemoval.h"
#include "util/Result.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <span>

namespace cadrel::core {

using util::Result;

namespace {

constexpr double NormalSpeed = 1.0;
constexpr double FreezeSpeed = 0.0;
} // namespace

/// What a new event shares with a group of twins, in frames. It is the same for every twin but for the place.
struct CandidateSearch::SharedStretch {
    const TwinGroup* group;
    std::int32_t offsetOld; ///< from the old event's start to the stretch
    std::int32_t offsetNew; ///< likewise for the new event
    std::int32_t length;
    std::int32_t startInOld; ///< from the old event's DST IN to the change event's SRC IN
    std::int32_t startInNew; ///< from the new event's DST IN to the change event's DST IN
    std::int32_t newSourceStart;
    std::int32_t newSourceEnd;
};

struct CandidateSearch::Survivor {
    const SharedStretch* stretch;
    TwinGroup::Place place;
};

/// The search for one new event.
class CandidateSearch::NewEventSearch {
public:
    NewEventSearch(const EventBase& event, const Framerate& framerate, double lastDisplacement)
        : event_(event), shape_(event, framerate), framerate_(framerate), lastDisplacement_(lastDisplacement)
    {
    }

    std::vector<ChangeCandidate> run(const std::string& name, const MaterialIndex& index)
    {
        for (const TwinGroup* group : index.groupsOverlapping(name, shape_.srcIn, shape_.srcOut)) {
            if (group->shape.isPlayedLike(shape_))
                stretches_.push_back(shareWith(*group));
        }
        decideBetweenOverlaps();
        std::sort(survivors_.begin(), survivors_.end(),
                  [](const Survivor& a, const Survivor& b) { return a.place.index < b.place.index; });
        std::vector<ChangeCandidate> candidates;
        for (const Survivor& survivor : survivors_)
            candidates.push_back(makeCandidate(survivor));
        return candidates;
    }

private:
    SharedStretch shareWith(const TwinGroup& group) const
    {
        const EventShape& old = group.shape;
        const std::int32_t start = std::max(old.srcIn, shape_.srcIn);
        SharedStretch stretch{};
        stretch.group = &group;
        stretch.offsetOld = start - old.srcIn;
        stretch.offsetNew = start - shape_.srcIn;
        stretch.length = std::min(old.srcOut, shape_.srcOut) - start;
        if (EventBase::areSameSpeed(old.motionSpeed, FreezeSpeed)) {
            // The one picture stands still, so the stretch begins where the events begin.
            stretch.length = std::min(old.dstOut - old.dstIn, shape_.dstOut - shape_.dstIn);
        } else {
            if (!EventBase::areSameSpeed(old.motionSpeed, NormalSpeed)) {
                stretch.length = toProgrammeTime(stretch.length, old.motionSpeed);
                stretch.offsetOld = toProgrammeTime(stretch.offsetOld, old.motionSpeed);
                stretch.offsetNew = toProgrammeTime(stretch.offsetNew, old.motionSpeed);
            }
            stretch.startInOld = stretch.offsetOld;
            stretch.startInNew = stretch.offsetNew;
        }
        stretch.newSourceStart = shape_.srcIn + stretch.offsetNew;
        stretch.newSourceEnd = stretch.newSourceStart + stretch.length;
        checkWithinDay(stretch);
        return stretch;
    }

    std::int32_t toProgrammeTime(std::int32_t sourceFrames, double speed) const
    {
        Timecode time;
        time.setSeconds(sourceFrames / framerate_.rate / speed, framerate_);
        return time.toFrameCount(framerate_);
    }

    void checkWithinDay(const SharedStretch& stretch) const
    {
        const std::int32_t lastPlace = stretch.group->placesByTime.back().dstIn;
        const std::int32_t latestStart =
            std::max({lastPlace + stretch.startInOld, shape_.dstIn + stretch.startInNew, stretch.newSourceStart});
        if (latestStart + stretch.length > framerate_.lastFrame)
            throw Result::OutOfRange;
    }

    /// Stretches that overlap, directly or through others, are decided between by themselves.
    void decideBetweenOverlaps()
    {
        std::sort(stretches_.begin(), stretches_.end(),
                  [](const SharedStretch& a, const SharedStretch& b) { return a.newSourceStart < b.newSourceStart; });
        std::vector<const SharedStretch*> connected;
        std::int32_t connectedEnd = 0;
        for (const SharedStretch& stretch : stretches_) {
            if (stretch.length == 0) {
                // An empty stretch overlaps nothing.
                for (const TwinGroup::Place& place : stretch.group->placesByIndex)
                    survivors_.push_back({&stretch, place});
                continue;
            }
            if (!connected.empty() && stretch.newSourceStart >= connectedEnd) {
                decideBetween(connected);
                connected.clear();
            }
            connectedEnd = connected.empty() ? stretch.newSourceEnd : std::max(connectedEnd, stretch.newSourceEnd);
            connected.push_back(&stretch);
        }
        if (!connected.empty())
            decideBetween(connected);
    }

    void decideBetween(const std::vector<const SharedStretch*>& connected)
    {
        const std::int32_t latestStart = connected.back()->newSourceStart;
        const bool allOverlap = std::all_of(connected.begin(), connected.end(), [&](const SharedStretch* stretch) {
            return latestStart < stretch->newSourceEnd;
        });
        if (allOverlap)
            survivors_.push_back(bestOf(connected));
        else
            addSurvivorsOfWalk(connected);
    }

    /// Where all overlap each other, the walk through the list ends with the one that no other beats.
    Survivor bestOf(const std::vector<const SharedStretch*>& overlapping) const
    {
        std::int32_t longest = 0;
        for (const SharedStretch* stretch : overlapping)
            longest = std::max(longest, stretch->length);
        Survivor best{};
        for (const SharedStretch* stretch : overlapping) {
            if (stretch->length != longest)
                continue;
            const Survivor nearest{stretch, nearestPlace(*stretch, stretch->group->placesByTime)};
            if (best.stretch == nullptr || isNearer(nearest, best))
                best = nearest;
        }
        return best;
    }

    /// Of candidates of one length; the later in the list wins a tie. CandidateStretch::beatsLater says the same.
    bool isNearer(const Survivor& a, const Survivor& b) const
    {
        const double aDistance = distance(*a.stretch, a.place.dstIn);
        const double bDistance = distance(*b.stretch, b.place.dstIn);
        return aDistance != bDistance ? aDistance < bDistance : a.place.index > b.place.index;
    }

    /// The displacement falls as the old place rises, so the nearest to the last one stands on either side of where it
    /// falls below that. `places` ascends by time and is not empty.
    TwinGroup::Place nearestPlace(const SharedStretch& stretch, std::span<const TwinGroup::Place> places) const
    {
        const auto below = std::partition_point(places.begin(), places.end(), [&](const TwinGroup::Place& place) {
            return displacement(stretch, place.dstIn) >= lastDisplacement_;
        });
        if (below == places.end())
            return places.back();
        const auto behindBelow = std::partition_point(
            below, places.end(), [&](const TwinGroup::Place& place) { return place.dstIn == below->dstIn; });
        const Survivor nearestBelow{&stretch, *std::prev(behindBelow)};
        if (below == places.begin())
            return nearestBelow.place;
        const Survivor nearestAbove{&stretch, *std::prev(below)};
        return isNearer(nearestAbove, nearestBelow) ? nearestAbove.place : nearestBelow.place;
    }

    /// Walks through the candidates in list order. Twins with no other candidate between them overlap each other and
    /// the same others, so that the best of such a run stands for all of it.
    void addSurvivorsOfWalk(const std::vector<const SharedStretch*>& connected)
    {
        const std::vector<Survivor> runs = bestOfRuns(connected);
        std::vector<CandidateStretch> candidates;
        candidates.reserve(runs.size());
        for (const auto& [stretch, place] : runs)
            candidates.push_back({stretch->newSourceStart, stretch->newSourceEnd, distance(*stretch, place.dstIn)});
        for (const std::size_t place : survivorsOfOverlaps(candidates))
            survivors_.push_back(runs[place]);
    }

    /// In list order.
    std::vector<Survivor> bestOfRuns(const std::vector<const SharedStretch*>& connected) const
    {
        struct Rest {
            const SharedStretch* stretch;
            std::span<const TwinGroup::Place> places;
        };
        const auto comesLater = [](const Rest& a, const Rest& b) {
            return a.places.front().index > b.places.front().index;
        };
        std::vector<Rest> rests;
        for (const SharedStretch* stretch : connected)
            rests.push_back({stretch, stretch->group->placesByIndex});
        std::make_heap(rests.begin(), rests.end(), comesLater);

        std::vector<Survivor> best;
        while (!rests.empty()) {
            std::pop_heap(rests.begin(), rests.end(), comesLater);
            const Rest rest = rests.back();
            rests.pop_back();
            const auto runEnd =
                rests.empty() ? rest.places.end()
                              : std::partition_point(rest.places.begin(), rest.places.end(), [&](const auto& place) {
                                    return place.index < rests.front().places.front().index;
                                });
            const auto runLength = static_cast<std::size_t>(runEnd - rest.places.begin());
            best.push_back(bestOfRun(*rest.stretch, rest.places.first(runLength)));
            if (runLength < rest.places.size()) {
                rests.push_back({rest.stretch, rest.places.subspan(runLength)});
                std::push_heap(rests.begin(), rests.end(), comesLater);
            }
        }
        return best;
    }

    Survivor bestOfRun(const SharedStretch& stretch, std::span<const TwinGroup::Place> run) const
    {
        if (stretch.group->areOrdersEqual)
            return {&stretch, nearestPlace(stretch, run)};
        Survivor best{&stretch, run.front()};
        for (const TwinGroup::Place& place : run.subspan(1)) {
            if (isNearer({&stretch, place}, best))
                best.place = place;
        }
        return best;
    }

    double seconds(std::int32_t frames) const { return frames / framerate_.rate; }

    double displacement(const SharedStretch& stretch, std::int32_t oldDstIn) const
    {
        return (seconds(shape_.dstIn) + seconds(stretch.offsetNew)) - (seconds(oldDstIn) + seconds(stretch.offsetOld));
    }

    double distance(const SharedStretch& stretch, std::int32_t oldDstIn) const
    {
        return std::fabs(displacement(stretch, oldDstIn) - lastDisplacement_);
    }

    Timecode timecode(std::int32_t frames) const
    {
        Timecode time;
        time.setFrameCount(frames, framerate_);
        return time;
    }

    ChangeCandidate makeCandidate(const Survivor& survivor) const
    {
        const SharedStretch& stretch = *survivor.stretch;
        const EventShape& old = stretch.group->shape;
        ChangeCandidate candidate;
        candidate.changeEvent = std::make_shared<EventBase>();
        EventBase& change = *candidate.changeEvent;
        change.setClipName(event_.clipName());
        change.setRollName(event_.rollName());
        change.setVfx(event_.vfx());
        if (TransitionType::takesTime(old.transitionType))
            change.setTransitionType(old.transitionType);
        const std::int32_t srcIn = survivor.place.dstIn + stretch.startInOld;
        const std::int32_t dstIn = shape_.dstIn + stretch.startInNew;
        change.setTimecodes(timecode(srcIn), timecode(srcIn + stretch.length), timecode(dstIn),
                            timecode(dstIn + stretch.length));
        candidate.displacement = displacement(stretch, survivor.place.dstIn);
        candidate.newSourceStart = timecode(stretch.newSourceStart);
        candidate.newSourceEnd = timecode(stretch.newSourceEnd);
        return candidate;
    }

    const EventBase& event_;
    EventShape shape_;
    const Framerate& framerate_;
    double lastDisplacement_;
    std::vector<SharedStretch> stretches_;
    std::vector<Survivor> survivors_;
};

void CandidateSearch::addOldEvent(const std::string& name, const EventBase& event)
{
    index_.add(name, EventShape(event, framerate_), oldEventCount_++);
}

std::vector<ChangeCandidate> CandidateSearch::survivingCandidates(const std::string& name, const EventBase& newEvent,
                                                                  double lastDisplacement) const
{
    return NewEventSearch(newEvent, framerate_, lastDisplacement).run(name, index_);
}

} // namespace cadrel::core
