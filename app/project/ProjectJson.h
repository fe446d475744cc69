// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/edl/ProjectClock.h"
#include "app/project/ProjectContent.h"
#include "app/project/StoredModel.h"

#include <functional>
#include <nlohmann/json.hpp>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::app {

/// A project as JSON for other programs. A time is an object of "seconds", from the time origin, and the "timecode" that the
/// project's clock shows then; a length is one of "seconds" and their "timecode". The tracks stand in one list from top to
/// bottom, each with the names of the "folders" around it.
class ProjectJson {
public:
    using Sink = std::function<void(std::string_view)>;

    /// The first three outlive this.
    ProjectJson(standin::Project& project, const ProjectClock& clock, const StoredModel& stored, Sink sink);

    /// Gives the document to the sink piece by piece, so that a million events need the memory of one.
    void write(const std::string& fileName, const Tracks& tracks) const;

private:
    nlohmann::ordered_json lastRun() const;
    void writeTrack(const standin::Track& track) const;
    void writeEvents(const standin::Container& container, double start, std::size_t depth) const;
    void writeCurve(const standin::Envelope& curve) const;

    nlohmann::ordered_json time(double seconds) const;
    nlohmann::ordered_json length(double seconds) const;
    nlohmann::ordered_json range(standin::Parameter& left, standin::Parameter& right) const;
    nlohmann::ordered_json factsOf(const PlacedEvent& placed) const;

    standin::Project& m_project;
    const ProjectClock& m_clock;
    const StoredModel& m_stored;
    Sink m_sink;
};

} // namespace cadrel::app
