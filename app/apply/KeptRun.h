// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/protect/ProtectedRun.h"
#include "core/time/SecondsRange.h"

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

namespace cadrel::core {
class DataModel;
} // namespace cadrel::core

namespace standin {
class Project;
} // namespace standin

namespace cadrel::app {

class HostedProject;
class ProjectClock;
struct Failure;

/// A protected run of a project that is hosted, with what the user has to decide about it.
class KeptRun {
public:
    using Source = core::ProtectedRun::Source;

    /// Gets what the user has to decide first, and throws it where he hasn't.
    using Doubt = std::function<void(const Failure&)>;

    /// Plans the run of the model's change list, and puts the list that is carried out into the model when the list was
    /// generated. Throws Failure for what can't be done; `inputs` names the EDLs.
    KeptRun(core::DataModel& model, const standin::Project& project, const ProjectClock& clock, Source source,
            const std::string& inputs, const Doubt& doubt);

    bool needsRun() const { return m_run.needsRun(); }
    /// What may change, in seconds of the project's clock. The run is needed.
    const core::SecondsRange& bounds() const { return m_run.bounds(); }
    /// Does what has to be done. Afterwards the settings are as they were, whatever happens. Throws as
    /// HostedProject::apply.
    void apply(HostedProject& hosted) const;

    const core::KeepPlan& plan() const { return m_run.plan(); }
    /// All that has old sound in the new programme: the list that is carried out, and what stays. Empty for a given list.
    const core::EventList& carried() const { return m_carried; }
    /// What would move, but lies outside of what the user lets change.
    const core::EventList& outside() const { return m_outside; }

private:
    core::ProtectedRun m_run;
    core::EventList m_carried;
    core::EventList m_outside;
};

/// The word of a report for where a stretch is from: "cut", "unchanged", "hole" or "black".
const char* wordOf(core::CarriedFrom from);

} // namespace cadrel::app
