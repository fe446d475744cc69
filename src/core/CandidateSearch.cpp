#include "core/CandidateSearch.h"

#include "core/EventBase.h"
#include "core/OverlapRemoval.h"
#include "util/Result.h"

#include <algorithm>
#include <cmath>

namespace cadrel::core {

using util::Result;

namespace {

constexpr double NormalSpeed = 1.0;
constexpr double FreezeSpeed = 0.0;
constexpr double SpeedTolerance = 0.01;

bool isNear(double speed, double expected)
{
    return std::fabs(speed - expected) < SpeedTolerance;
}

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
        if (isNear(old.motionSpeed, FreezeSpeed)) {
            // The one picture stands still, so the stretch begins where the events begin.
            stretch.length = std::min(old.dstOut - old.dstIn, shape_.dstOut - shape_.dstIn);
        } else {
            if (!isNear(old.motionSpeed, NormalSpeed)) {
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
        const std::int32_t lastPlace = stretch.group->places.back().dstIn;
        for (const std::int64_t start :
             {std::int64_t{lastPlace} + stretch.startInOld, std::int64_t{shape_.dstIn} + stretch.startInNew,
              std::int64_t{shape_.srcIn} + stretch.offsetNew}) {
            if (start + stretch.length > framerate_.lastFrame)
                throw Result::OutOfRange;
        }
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
                for (const TwinGroup::Place& place : stretch.group->places)
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
            const Survivor nearest{stretch, nearestPlace(*stretch)};
            if (best.stretch == nullptr || isNearer(nearest, best))
                best = nearest;
        }
        return best;
    }

    /// The later in the list wins a tie.
    bool isNearer(const Survivor& a, const Survivor& b) const
    {
        const double aDistance = distance(*a.stretch, a.place.dstIn);
        const double bDistance = distance(*b.stretch, b.place.dstIn);
        return aDistance != bDistance ? aDistance < bDistance : a.place.index > b.place.index;
    }

    /// The displacement falls as the old place rises, so the nearest to the last one stands on either side of where it
    /// falls below that.
    TwinGroup::Place nearestPlace(const SharedStretch& stretch) const
    {
        const auto places = stretch.group->places;
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

    void addSurvivorsOfWalk(const std::vector<const SharedStretch*>& connected)
    {
        std::vector<Survivor> all;
        for (const SharedStretch* stretch : connected) {
            for (const TwinGroup::Place& place : stretch->group->places)
                all.push_back({stretch, place});
        }
        std::sort(all.begin(), all.end(),
                  [](const Survivor& a, const Survivor& b) { return a.place.index < b.place.index; });
        std::vector<CandidateStretch> candidates;
        candidates.reserve(all.size());
        for (const auto& [stretch, place] : all)
            candidates.push_back({stretch->newSourceStart, stretch->newSourceEnd, distance(*stretch, place.dstIn)});
        for (const std::size_t place : survivorsOfOverlaps(candidates))
            survivors_.push_back(all[place]);
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
        if (old.transitionType == TransitionType::Dissolve || old.transitionType == TransitionType::Wipe)
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
