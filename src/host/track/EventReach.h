// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/SecondsRange.h"

#include <vector>

namespace cadrel::host {

/// How far the events of a track reach, kept so that whether any of them stands in a stretch is told without a walk. An event
/// that lies under another one counts as well.
class EventReach {
public:
    /// In any order, in seconds.
    explicit EventReach(std::vector<core::SecondsRange> events);

    /// Whether one lies in the stretch or reaches into it. One that only touches it doesn't, but one without length at its
    /// start does. Times closer than SameInstant are one.
    bool reachesInto(const core::SecondsRange& stretch) const;

private:
    std::vector<core::SecondsRange> m_events; ///< by their starts, each with the latest end of all up to it
};

} // namespace cadrel::host
