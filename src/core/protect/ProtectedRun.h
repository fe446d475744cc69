// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/keep/KeepPlan.h"
#include "core/picture/FrameRange.h"
#include "core/time/SecondsRange.h"

#include <optional>
#include <vector>

namespace cadrel::core {

class DataModel;

/// A run that leaves alone what the new cut doesn't speak of: it is planned first, and then restricted to the stretch that has
/// to change. A plain run of the change list would take away all sound that the list doesn't carry.
class ProtectedRun {
public:
    /// Where the change list of the model is from.
    enum class Source { Generated, Given };
    /// A list is taken for a generated one when both cuts are there.
    static Source sourceOf(const DataModel& model);

    /// Plans the run of the model's change list, and changes nothing. `material` is what stands on the tracks that the run
    /// changes, in seconds of the project's clock. Throws what KeepPlanner throws.
    ProtectedRun(const DataModel& model, const std::vector<SecondsRange>& material, Source source);

    Source source() const { return m_source; }
    const KeepPlan& plan() const { return m_plan; }
    bool needsRun() const { return m_bounds.has_value(); }
    /// What may change, in seconds of the project's clock. The run is needed.
    const SecondsRange& bounds() const { return *m_bounds; }
    /// What a plain run of the change list would take away and this one doesn't, in frames of the old programme.
    const FrameRanges& protectedMaterial() const { return m_protected; }

    /// The list that is carried out takes the place of a generated change list; a given one stays.
    void putListInto(DataModel& model) const;
    /// The list that is carried out in the place of a generated one. Where it would be empty, it has what stays, outside of the
    /// bounds: a run doesn't begin without an event.
    EventList startableList(const DataModel& model) const;
    /// Whether there is an event for that.
    bool isStartable() const { return !m_plan.events.empty() || !m_plan.untouched.empty(); }
    /// The list of all that has old sound in the new programme: what is carried out, and what stays. Empty for a given list.
    EventList carried(const DataModel& model) const;
    /// What would move, but lies outside of what the user lets change; for a generated list.
    EventList outside(const DataModel& model) const;

private:
    FrameRanges protectedOf(const DataModel& model, const std::vector<SecondsRange>& material) const;
    FrameRanges keptSources() const;

    Source m_source;
    KeepPlan m_plan;
    std::optional<SecondsRange> m_bounds;
    FrameRanges m_protected;
};

} // namespace cadrel::core
