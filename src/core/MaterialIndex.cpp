#include "core/MaterialIndex.h"

#include "core/EventBase.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <numeric>
#include <tuple>

namespace cadrel::core {

namespace {

constexpr double SpeedTolerance = 0.01;

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
    return std::fabs(motionSpeed - other.motionSpeed) < SpeedTolerance && transitionType == other.transitionType &&
           transitionDuration == other.transitionDuration;
}

void MaterialIndex::add(const std::string& name, const EventShape& shape, std::size_t index)
{
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
    places_.reserve(added_.size());
    const AddedEvent* previous = nullptr;
    for (const AddedEvent& event : added_) {
        Material& material = materials_[event.material];
        const bool opensMaterial = previous == nullptr || previous->material != event.material;
        const bool opensGroup = opensMaterial || twinKeyOf(previous->shape) != twinKeyOf(event.shape);
        if (opensMaterial)
            material.first = groups_.size();
        places_.push_back({event.shape.dstIn, event.index});
        if (opensGroup)
            groups_.push_back({event.shape, {&places_.back(), 1}});
        else
            groups_.back().places = {groups_.back().places.data(), groups_.back().places.size() + 1};
        material.behind = groups_.size();
        previous = &event;
    }
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
    if (std::max(shape.srcIn, srcIn) < std::min(shape.srcOut, srcOut))
        found.push_back(&groups_[middle]);
    collect({middle + 1, range.behind}, srcIn, srcOut, found);
}

} // namespace cadrel::core
