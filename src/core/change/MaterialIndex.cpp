// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/MaterialIndex.h"

#include "core/edl/EventBase.h"

#include <algorithm>
#include <limits>
#include <numeric>
#include <tuple>

namespace cadrel::core {

namespace {

/// Everything that twins have in common. The destination length follows from speed and source, apart from rounding, but
/// it is needed for freeze frames.
auto twinKeyOf(const EventShape& shape)
{
    return std::make_tuple(shape.srcIn, shape.srcOut, shape.dstOut - shape.dstIn, shape.transitionType,
                           shape.transitionDuration, shape.motionSpeed, shape.isReversed);
}

} // namespace

EventShape::EventShape(const EventBase& event, const Framerate& framerate)
    : srcIn(event.srcIn().toFrameCount(framerate)), srcOut(event.srcOut().toFrameCount(framerate)),
      dstIn(event.dstIn().toFrameCount(framerate)), dstOut(event.dstOut().toFrameCount(framerate)),
      transitionType(event.transitionType()), transitionDuration(event.transitionDuration()),
      motionSpeed(event.motionSpeed()), isReversed(event.isReversed())
{
    if (!isReversed)
        return;
    const std::int32_t forwardIn = srcIn;
    srcIn = framerate.lastFrame - srcOut;
    srcOut = framerate.lastFrame - forwardIn;
}

bool EventShape::isPlayedLike(const EventShape& other) const
{
    return EventBase::areSameSpeed(motionSpeed, other.motionSpeed) && transitionType == other.transitionType &&
           transitionDuration == other.transitionDuration && isReversed == other.isReversed;
}

void MaterialIndex::add(const std::string& name, const EventShape& shape, std::size_t index)
{
    if (shape.srcIn >= shape.srcOut)
        return;
    const std::size_t material = m_materialByName.try_emplace(name, m_materialByName.size()).first->second;
    m_added.push_back({material, shape, index});
}

void MaterialIndex::finish()
{
    std::sort(m_added.begin(), m_added.end(), [](const AddedEvent& a, const AddedEvent& b) {
        if (a.material != b.material)
            return a.material < b.material;
        const auto aKey = twinKeyOf(a.shape);
        const auto bKey = twinKeyOf(b.shape);
        return std::tie(aKey, a.shape.dstIn, a.index) < std::tie(bKey, b.shape.dstIn, b.index);
    });
    makeGroups();
    m_latestEnd.resize(m_groups.size());
    for (const Material& material : m_materials)
        makeTree(material);
}

void MaterialIndex::makeGroups()
{
    m_materials.resize(m_materialByName.size());
    m_placesByTime.reserve(m_added.size());
    for (const AddedEvent& event : m_added)
        m_placesByTime.push_back({event.shape.dstIn, event.index});
    m_placesByIndex = m_placesByTime;

    for (std::size_t first = 0, behind = 0; first < m_added.size(); first = behind) {
        const auto isTwin = [&](const AddedEvent& event) {
            return event.material == m_added[first].material &&
                   twinKeyOf(event.shape) == twinKeyOf(m_added[first].shape);
        };
        while (behind < m_added.size() && isTwin(m_added[behind]))
            ++behind;
        Material& material = m_materials[m_added[first].material];
        if (material.behind == 0)
            material.first = m_groups.size();
        addGroup(first, behind);
        material.behind = m_groups.size();
    }
    m_added = {};
}

/// Makes a group of the added events from `first` up to `behind`.
void MaterialIndex::addGroup(std::size_t first, std::size_t behind)
{
    const std::span byTime = std::span(m_placesByTime).subspan(first, behind - first);
    const std::span byIndex = std::span(m_placesByIndex).subspan(first, behind - first);
    const auto hasLowerIndex = [](const TwinGroup::Place& a, const TwinGroup::Place& b) { return a.index < b.index; };
    const bool areOrdersEqual = std::is_sorted(byIndex.begin(), byIndex.end(), hasLowerIndex);
    if (!areOrdersEqual)
        std::sort(byIndex.begin(), byIndex.end(), hasLowerIndex);
    m_groups.push_back({m_added[first].shape, byTime, byIndex, areOrdersEqual});
}

std::int32_t MaterialIndex::makeTree(Material range)
{
    if (range.first == range.behind)
        return std::numeric_limits<std::int32_t>::min();
    const std::size_t middle = std::midpoint(range.first, range.behind);
    m_latestEnd[middle] = std::max(
        {m_groups[middle].shape.srcOut, makeTree({range.first, middle}), makeTree({middle + 1, range.behind})});
    return m_latestEnd[middle];
}

std::vector<const TwinGroup*> MaterialIndex::groupsOverlapping(const std::string& name, std::int32_t srcIn,
                                                               std::int32_t srcOut) const
{
    std::vector<const TwinGroup*> found;
    if (srcIn >= srcOut)
        return found;
    const auto material = m_materialByName.find(name);
    if (material != m_materialByName.end())
        collect(m_materials[material->second], srcIn, srcOut, found);
    return found;
}

void MaterialIndex::collect(Material range, std::int32_t srcIn, std::int32_t srcOut,
                            std::vector<const TwinGroup*>& found) const
{
    if (range.first == range.behind)
        return;
    const std::size_t middle = std::midpoint(range.first, range.behind);
    if (m_latestEnd[middle] <= srcIn)
        return;
    collect({range.first, middle}, srcIn, srcOut, found);
    const EventShape& shape = m_groups[middle].shape;
    if (shape.srcIn >= srcOut)
        return;
    if (shape.srcOut > srcIn)
        found.push_back(&m_groups[middle]);
    collect({middle + 1, range.behind}, srcIn, srcOut, found);
}

} // namespace cadrel::core
