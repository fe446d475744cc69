// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <unordered_map>
#include <vector>

namespace cadrel::core {

class EventBase;

/// A valid event's timecodes as frame counts, and what else decides whether two events show the same material in the
/// same way.
///
/// The source of a reversed shot is counted backwards from the end of the day, so that it rises with the programme as that
/// of any other shot does:
///
///     source            |--- SRC IN ======== SRC OUT ---|      plays from SRC OUT to SRC IN
///     counted           |--- srcIn ========= srcOut ----|
///                     23:59:59:23                    00:00:00:00
struct EventShape {
    /// Throws what Timecode::toFrameCount throws.
    EventShape(const EventBase& event, const Framerate& framerate);

    /// Whether transition, motion speed (to 0.01) and direction are the same.
    bool isPlayedLike(const EventShape& other) const;

    std::int32_t srcIn;
    std::int32_t srcOut;
    std::int32_t dstIn;
    std::int32_t dstOut;
    std::int32_t transitionType;
    std::int32_t transitionDuration;
    double motionSpeed;
    bool isReversed;
};

/// Twins: the old events that use exactly the same stretch of source in the same way, at different places of the
/// programme. A new event shares the same stretch with all of them, so everything that doesn't depend on the place is
/// worked out only once.
struct TwinGroup {
    struct Place {
        std::int32_t dstIn;
        std::size_t index; ///< of the event in the list of old events
    };

    EventShape shape;                     ///< of one of them
    std::span<const Place> placesByTime;  ///< ascending by `dstIn`, then by index
    std::span<const Place> placesByIndex; ///< the same, ascending by index
    bool areOrdersEqual;                  ///< true when the old list is in the order of time
};

/// The old events by name and source range.
class MaterialIndex {
public:
    MaterialIndex() = default;
    MaterialIndex(const MaterialIndex&) = delete;
    MaterialIndex& operator=(const MaterialIndex&) = delete;

    /// Adds the event at `index` of the list of old events. An event without a source range overlaps nothing and is
    /// left out.
    void add(const std::string& name, const EventShape& shape, std::size_t index);
    /// Call it after all events have been added and before the first search.
    void finish();

    /// The groups under a name whose source range overlaps that from `srcIn` to `srcOut`.
    std::vector<const TwinGroup*> groupsOverlapping(const std::string& name, std::int32_t srcIn,
                                                    std::int32_t srcOut) const;

private:
    struct AddedEvent {
        std::size_t material;
        EventShape shape;
        std::size_t index;
    };

    /// A range of `m_groups`: all material under one name, sorted by the start of its source.
    struct Material {
        std::size_t first = 0;
        std::size_t behind = 0;
    };

    void makeGroups();
    void addGroup(std::size_t first, std::size_t behind);
    std::int32_t makeTree(Material range);
    void collect(Material range, std::int32_t srcIn, std::int32_t srcOut, std::vector<const TwinGroup*>& found) const;

    std::unordered_map<std::string, std::size_t> m_materialByName;
    std::vector<AddedEvent> m_added;
    std::vector<Material> m_materials;
    std::vector<TwinGroup> m_groups;
    std::vector<TwinGroup::Place> m_placesByTime;
    std::vector<TwinGroup::Place> m_placesByIndex;
    /// Each range of groups is a binary tree with its middle as the root; this is the latest source end of the subtree
    /// under each group.
    std::vector<std::int32_t> m_latestEnd;
};

} // namespace cadrel::core
