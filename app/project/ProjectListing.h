// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/console/Columns.h"
#include "app/edl/ProjectClock.h"
#include "app/project/ProjectContent.h"
#include "app/project/StoredModel.h"

#include <iosfwd>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::app {

/// A project for people: its facts, the tree of its tracks, what lies on them, and the media that they use.
class ProjectListing {
public:
    /// All outlive the listing.
    ProjectListing(standin::Project& project, const ProjectClock& clock, const StoredModel& stored, bool colour);

    void printFacts(std::ostream& out, const std::string& fileName) const;
    /// A line for each track of the project, those in a folder below it and further in.
    void printTree(std::ostream& out) const;
    /// The events of each of the tracks and its automation. The columns become as wide as the events of all need, within
    /// reason.
    void printContent(std::ostream& out, const Tracks& tracks) const;
    void printPool(std::ostream& out) const;

private:
    void printStored(std::ostream& out) const;
    void printHeading(std::ostream& out, const standin::Track& track) const;
    void printEvents(std::ostream& out, const standin::Track& track, const Columns& columns) const;
    void printCurve(std::ostream& out, standin::Envelope& curve) const;
    Columns::Row rowOf(const PlacedEvent& placed) const;
    std::string inColour(std::string_view colour, const std::string& text) const;

    standin::Project& m_project;
    const ProjectClock& m_clock;
    const StoredModel& m_stored;
    bool m_colour;
};

} // namespace cadrel::app
