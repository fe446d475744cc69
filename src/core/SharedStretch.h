#pragma once

#include "core/Framerate.h"
#include "core/MaterialIndex.h"

#include <cstdint>

namespace cadrel::core {

/// The stretch of source that a new event shares with the old events of a group of twins, in frames. It is the same for
/// every twin but for the place in the old programme.
///
///     source           |------ old event -----|
///                             |----- new event ------|
///     stretch                 |---------------|
///     offsetOld        |----->|
class SharedStretch {
public:
    /// `group` and `newEvent` are played alike and their source ranges overlap. Throws Result::OutOfRange when the
    /// change event would leave the day for one of the twins.
    SharedStretch(const TwinGroup& group, const EventShape& newEvent, const Framerate& framerate);

    const TwinGroup& group() const { return *group_; }
    /// In the new event's source; a retimed event's stretch counts programme frames from its start.
    std::int32_t newSourceStart() const { return newSourceStart_; }
    std::int32_t newSourceEnd() const { return newSourceStart_ + length_; }
    std::int32_t length() const { return length_; }

    /// Where the stretch starts in the old programme for the twin that starts at `oldDstIn`, and in the new one.
    std::int32_t startInOld(std::int32_t oldDstIn) const { return oldDstIn + startAfterOldDstIn_; }
    std::int32_t startInNew() const { return startInNew_; }

    /// New programme time minus old programme time, in seconds. It falls as `oldDstIn` rises.
    double displacement(std::int32_t oldDstIn) const { return newSeconds_ - (oldDstIn / rate_ + offsetOldSeconds_); }

private:
    const TwinGroup* group_;
    double rate_;
    std::int32_t length_;
    std::int32_t newSourceStart_;
    std::int32_t startAfterOldDstIn_;
    std::int32_t startInNew_;
    double newSeconds_;       ///< of the stretch in the new programme
    double offsetOldSeconds_; ///< from the old event's start to the stretch
};

} // namespace cadrel::core
