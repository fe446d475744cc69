// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/apply/ProjectComparison.h"
#include "app/edl/GenerationReport.h"
#include "app/settings/SettingsReport.h"
#include "core/keep/KeepPlan.h"
#include "core/time/SecondsRange.h"

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace cadrel::core {
class DataModel;
class EventBase;
} // namespace cadrel::core

namespace cadrel::app {

/// A change event that a run leaves out, and why.
struct PassedOver {
    const core::EventBase* event;
    std::string reason;
};

/// What the report tells about a run.
struct ApplyFacts {
    /// The model outlives the facts.
    explicit ApplyFacts(const core::DataModel& ofProject) : model(ofProject) {}

    /// The user's tracks that have or had something on them, and the tracks for the markers of a run.
    std::vector<const TrackComparison*> userTracks() const;
    std::vector<const TrackComparison*> markedTracks() const;

    const core::DataModel& model;
    std::string projectName;
    std::optional<SettingsReport> settings;
    double timeOrigin = 0.0;                    ///< of the project
    std::optional<GenerationReport> generation; ///< nothing where the change EDL was given
    std::optional<Cuts> cuts;                   ///< likewise
    std::vector<std::string> changeNames;       ///< its files then
    std::vector<UnreadOfFile> changeUnread;     ///< and their lines that were not read
    std::vector<PassedOver> passedOver;
    std::size_t appliedCount = 0;
    bool isRunNeeded = true; ///< false: the project is as the new cut needs it
    bool isHeldBack = false; ///< all that would change stands where the user lets nothing change
    /// For each event of the change list where its stretches are from; empty where all are from the cut.
    std::vector<core::KeptEvent> kept;
    std::vector<core::SecondsRange> lost; ///< what goes although no picture stands there; by the project's clock
    std::string matchText;                ///< what the match rests on; empty where the names tell the shots apart
    std::vector<TrackComparison> tracks;
    std::vector<std::string> staying;        ///< what no run moves in a project of its form, in words
    double seconds = 0.0;                    ///< that the run took
    std::string written;                     ///< the project file; empty for none
    std::vector<std::string> projectBackups; ///< the former file under its new name; empty for none
    std::string jsonFile;                    ///< the file of the report; empty for none
    std::vector<std::string> reportBackups;
    std::string notesFile; ///< likewise of the change notes
    std::vector<std::string> notesBackups;
};

core::SoundCount countOf(const TrackComparison& track);

} // namespace cadrel::app
