#include "core/MaterialIndex.h"

#include "core/EventBase.h"

#include <algorithm>
#include <limits>
#include <numeric>
#include <tuple>

namespace cadrel::core {

namespace {

/// All that twins have in common. The destination length follows from speed and source but for rounding, and decides
/// over freeze frames.
auto twinKeyOf(const EventShape& shape)
{
    return std::make_tuple(shape.srcIn, shape.srcOut, shape.dstOut - shape.dstIn, shape.transitionType,
                           shape.transitionDuration, shape.motionSpeed);
}

} // namespace

EventShape::EventShape(const EventBase& event, const Framerate& framerate)
    : srcIn(event.srcIn().toFrameCount(framerate)), srcOut(event.srcOut().toFrameCount(framerate)),
      dstIn(event.dstIn().toFrameCount(framerate)), dstOut(event.dstOut().toFrameCount(framerate)),
      transitionType(event.transitionType()), transitionDuration(event.transitionDuration()),
      motionSpeed(event.motionSpeed())
{
}

bool EventShape::isPlayedLike(const EventShape& other) const
{
    return EventBase::areSameSpeed(motionSpeed, other.motionSpeed) && transitionType == other.transitionType &&
           transitionDuration == other.transitionDuration;
}

void MaterialIndex::add(const std::string& name, const EventShape& shape, std::size_t index)
{
    if (shape.srcIn >= shape.srcOut)
        return;
    const std::size_t material = materialByName_.try_emplace(name, materialByName_.size()).first->second;
    added_.push_back({material, shape, index});
}

void MaterialIndex::finish()
{
    std::sort(added_.begin(), added_.end(), [](const AddedEvent& a, const AddedEvent& b) {
        if (a.material != b.material)
            return a.material < b.material;
        const auto aKey = twinKeyOf(a.shape);
        const auto bKey = twinKeyOf(b.shape);
        return std::tie(aKey, a.shape.dstIn, a.index) < std::tie(bKey, b.shape.dstIn, b.index);
    });
    makeGroups();
    latestEnd_.resize(groups_.size());
    for (const Material& material : materials_)
        makeTree(material);
}

void MaterialIndex::makeGroups()
{
    materials_.resize(materialByName_.size());
    placesByTime_.reserve(added_.size());
    for (const AddedEvent& event : added_)
        placesByTime_.push_back({event.shape.dstIn, event.index});
    placesByIndex_ = placesByTime_;

    for (std::size_t first = 0, behind = 0; first < added_.size(); first = behind) {
        const auto isTwin = [&](const AddedEvent& event) {
            return event.material == added_[first].material && twinKeyOf(event.shape) == twinKeyOf(added_[first].shape);
        };
        while (behind < added_.size() && isTwin(added_[behind]))
            ++behind;
        Material& material = materials_[added_[first].material];
        if (material.behind == 0)
            material.first = groups_.size();
        addGroup(first, behind);
        material.behind = groups_.size();
    }
    added_ = {};
}

/// Makes a group of the added events from `first` up to `behind`.
void MaterialIndex::addGroup(std::size_t first, std::size_t behind)
{
    const std::span byTime = std::span(placesByTime_).subspan(first, behind - first);
    const std::span byIndex = std::span(placesByIndex_).subspan(first, behind - first);
    const auto hasLowerIndex = [](const TwinGroup::Place& a, const TwinGroup::Place& b) { return a.index < b.index; };
    const bool areOrdersEqual = std::is_sorted(byIndex.begin(), byIndex.end(), hasLowerIndex);
    if (!areOrdersEqual)
        std::sort(byIndex.begin(), byIndex.end(), hasLowerIndex);
    groups_.push_back({added_[first].shape, byTime, byIndex, areOrdersEqual});
}

std::int32_t MaterialIndex::makeTree(Material range)
{
    if (range.first == range.behind)
        return std::numeric_limits<std::int32_t>::min();
    const std::size_t middle = std::midpoint(range.first, range.behind);
    latestEnd_[middle] =
        std::max({groups_[middle].shape.srcOut, makeTree({range.first, middle}), makeTree({middle + 1, range.behind})});
    return latestEnd_[middle];
}

std::vector<const TwinGroup*> MaterialIndex::groupsOverlapping(const std::string& name, std::int32_t srcIn,
                                                               std::int32_t srcOut) const
{
    std::vector<const TwinGroup*> found;
    if (srcIn >= srcOut)
        return found;
    const auto material = materialByName_.find(name);
    if (material != materialByName_.end())
        collect(materials_[material->second], srcIn, srcOut, found);
    return found;
}

void MaterialIndex::collect(Material range, std::int32_t srcIn, std::int32_t srcOut,
                            std::vector<const TwinGroup*>& found) const
{
    if (range.first == range.behind)
        return;
    const std::size_t middle = std::midpoint(range.first, range.behind);
    if (latestEnd_[middle] <= srcIn)
        return;
    collect({range.first, middle}, srcIn, srcOut, found);
    const EventShape& shape = groups_[middle].shape;
    if (shape.srcIn >= srcOut)
        return;
    if (shape.srcOut > srcIn)
        found.push_back(&groups_[middle]);
    collect({middle + 1, range.behind}, srcIn, srcOut, found);
}

} // namespace cadrel::core
