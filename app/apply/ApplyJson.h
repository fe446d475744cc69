// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/apply/ApplyFacts.h"
#include "app/edl/ProjectClock.h"

#include <cstddef>
#include <nlohmann/json.hpp>

namespace cadrel::app {

/// What a run did to a project as JSON for other programs: all but the change events. A time is an object of "seconds", from
/// the time origin, and the "timecode" that the project's clock shows then; a length is one of "seconds" and their
/// "timecode".
class ApplyJson {
public:
    /// Both outlive this.
    ApplyJson(const ApplyFacts& facts, const ProjectClock& clock) : m_facts(facts), m_clock(clock) {}

    nlohmann::ordered_json toJson() const;
    /// {"parts": [...]} of a change event: what it consists of, and where each part is "from".
    nlohmann::ordered_json partsOf(std::size_t event) const;

private:
    nlohmann::ordered_json toJson(const TrackComparison& track) const;
    nlohmann::ordered_json toJson(const Fate& fate) const;
    nlohmann::ordered_json span(double start, double end) const;
    nlohmann::ordered_json length(double seconds) const;

    const ApplyFacts& m_facts;
    const ProjectClock& m_clock;
};

} // namespace cadrel::app
