// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/change/EventListAlgorithm.h"

#include <cstddef>
#include <string>
#include <vector>

namespace cadrel::core {

struct PlacedEvent;

/// Joins neighbours of a change EDL that need no cut between them into HealedEvents, by the heal mode of the settings:
///
///     Normal               they touch in source and in destination
///     GapsWithoutInserts   the gap is the same in both, and no event of the reference list lies in it
///     GapsWithInserts      the gap is the same in both
///
/// The result is in the order of DST IN and numbered from 1; events with EventFlaw::TimecodeInvalid are left out.
class HealProcessing : public EventListAlgorithm {
public:
    /// Leaves the list as it is when the mode is None or there are fewer than two events. Throws what the timecode
    /// arithmetic throws, and Result::NotAvailable without a string converter; the list then keeps its events, but some
    /// may have new numbers.
    void process(EventList& events, const HealContext& context) const override;

    /// The number of events that `process` would leave of these, which are in the order of inProgrammeOrder. Changes nothing;
    /// throws as `process`.
    std::size_t countAfter(const std::vector<PlacedEvent>& ordered, const HealContext& context) const;

    /// "Healed Event 001", translated.
    static std::string healedEventName(std::size_t count);
};

} // namespace cadrel::core
