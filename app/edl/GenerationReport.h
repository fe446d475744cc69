// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/edl/Coverage.h"
#include "app/edl/Generation.h"
#include "core/time/Framerate.h"

#include <cstddef>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace cadrel::core {
class DataModel;
class EventList;
} // namespace cadrel::core

namespace cadrel::app {

/// The report about a change EDL that was made of two cuts, for people and for programs.
class GenerationReport {
public:
    /// The model holds both cuts and the change EDL, and outlives the report. `carried` is all that has old sound in the
    /// new cut: the change EDL, or more.
    GenerationReport(const core::DataModel& model, const core::EventList& carried, Cuts cuts,
                     const core::Framerate& framerate);

    /// "Old cut", "New cut" and "Frame rate" with what is told about it, a line each.
    std::string cutsText(const std::string& rate) const;
    /// "Change EDL" and "Covered".
    std::string changeText() const;
    std::string insertsText() const;
    /// {"old": {...}, "new": {...}, "unmatched": [...], "healed": {...}, "programmeFrames": ..., "coveredFrames": ...,
    /// "inserts": [...]}
    nlohmann::ordered_json toJson() const;

private:
    std::string timecode(std::int32_t frames) const;
    /// For people.
    std::string shown(std::int32_t frames) const;

    const core::DataModel& m_model;
    Cuts m_cuts;
    core::Framerate m_framerate;
    std::size_t m_healedEvents = 0;  ///< events that stand for several
    std::size_t m_healedMembers = 0; ///< those that they stand for
    Coverage m_coverage;
};

/// The names of EDL files and what is in them: "a.edl, b.edl: 12 events, all valid, 1 reversed, 2 lines not read".
std::string describeEvents(const core::EventList& events, const std::vector<std::string>& names,
                           std::size_t unreadLines = 0);
/// The same as {"files": [...], "events": ..., "invalid": ...}.
nlohmann::ordered_json describeEventsAsJson(const core::EventList& events, const std::vector<std::string>& names);

/// The files that the events were read from, in their order.
std::vector<std::string> edlFilesOf(const core::EventList& events);

} // namespace cadrel::app
