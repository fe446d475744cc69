// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/change/MaterialIndex.h"
#include "core/time/Framerate.h"

#include <cstdint>

namespace cadrel::core {

/// The stretch of source that a new event shares with the old events of a group of twins, in frames. Only its place in
/// the old programme differs from twin to twin.
///
///     source           |------ old event -----|
///                             |----- new event ------|
///     stretch                 |---------------|
///     offsetOld        |----->|
class SharedStretch {
public:
    /// `group` and `newEvent` have the same transition and speed, and their source ranges overlap. Throws
    /// Result::OutOfRange when the change event would leave the day for one of the twins.
    SharedStretch(const TwinGroup& group, const EventShape& newEvent, const Framerate& framerate);

    const TwinGroup& group() const { return *m_group; }
    /// In the new event's source; a retimed event's stretch counts programme frames from its start.
    std::int32_t newSourceStart() const { return m_newSourceStart; }
    std::int32_t newSourceEnd() const { return m_newSourceStart + m_length; }
    std::int32_t length() const { return m_length; }

    /// Where the stretch starts in the old programme for the twin that starts at `oldDstIn`, and in the new one.
    std::int32_t startInOld(std::int32_t oldDstIn) const { return oldDstIn + m_startAfterOldDstIn; }
    std::int32_t startInNew() const { return m_startInNew; }

    /// New programme time minus old programme time, in seconds. It falls as `oldDstIn` rises.
    double displacement(std::int32_t oldDstIn) const { return m_newSeconds - (oldDstIn / m_rate + m_offsetOldSeconds); }

private:
    const TwinGroup* m_group;
    double m_rate;
    std::int32_t m_length;
    std::int32_t m_newSourceStart;
    std::int32_t m_startAfterOldDstIn;
    std::int32_t m_startInNew;
    double m_newSeconds;       ///< of the stretch in the new programme
    double m_offsetOldSeconds; ///< from the old event's start to the stretch
};

} // namespace cadrel::core
