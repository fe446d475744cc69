// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/apply/ApplyFacts.h"
#include "app/edl/ProjectClock.h"

#include <iosfwd>

namespace cadrel::app {

/// What a run did to a project, for people.
class ApplyListing {
public:
    /// Stands above the moves.
    static constexpr const char* ClipsTitle = "Clip by clip";

    /// Both outlive the listing.
    ApplyListing(const ApplyFacts& facts, const ProjectClock& clock) : m_facts(facts), m_clock(clock) {}

    void printTotals(std::ostream& out) const;
    /// A line for each track that had something on it, and then, track by track, a line for everything that changed.
    void printMoves(std::ostream& out) const;
    /// What the run marked, kind by kind.
    void printMarkers(std::ostream& out) const;

private:
    void printPassedOver(std::ostream& out) const;
    void printLost(std::ostream& out) const;
    void printClips(std::ostream& out) const;
    void printStaying(std::ostream& out) const;
    void printWritten(std::ostream& out) const;
    void printTrackTotals(std::ostream& out) const;

    const ApplyFacts& m_facts;
    const ProjectClock& m_clock;
};

} // namespace cadrel::app
