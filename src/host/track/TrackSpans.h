// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/cut/CutEventSpans.h"

#include <vector>

namespace cadrel::host {

/// The spans of a track's events, kept so that those around an instant are found without a walk. An event that lies
/// inside what stands before it isn't seen.
///
///     events   |----- A -----|       |--- D ---|
///                 |- B -|
///                      |---- C ----|
///     seen     A, C, D
///
/// Times are seconds from the time origin, and those closer than SameInstant are one.
class TrackSpans {
public:
    TrackSpans() = default;
    /// `events` in the order of the track.
    explicit TrackSpans(const std::vector<core::SecondsRange>& events);

    /// The last one that ends before the time, the one across it, bounds included, and the first that starts after it.
    /// If two events touch at the time, the later one counts as across it. The automation is left empty. Throws
    /// Result::InvalidArgument when an event that is reversed or in no order comes before the first one after the time.
    core::CutEventSpans around(double time) const;

private:
    // Both the starts and the ends ascend.
    std::vector<core::SecondsRange> m_spans;
    bool m_endsInFault = false; ///< an event in no order follows the last span
};

} // namespace cadrel::host
