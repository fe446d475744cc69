// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/edl/EdlLoader.h"
#include "app/settings/SettingsTable.h"

#include <string>
#include <vector>

namespace cadrel::core {
class DataModel;
class Settings;
} // namespace cadrel::core

namespace cadrel::app {

class Terminal;

/// What a change EDL is made of, and how.
struct GenerationOptions {
    std::vector<std::string> oldFiles;
    std::vector<std::string> newFiles;
    LoadOptions load;
    GivenSettings settings;
    std::vector<std::string> shifts; ///< for FileShifts
};

/// The names of the files that were read, and what was told of them.
struct Cuts {
    std::vector<std::string> oldNames;
    std::vector<std::string> newNames;
    std::vector<UnreadOfFile> oldUnread;
    std::vector<UnreadOfFile> newUnread;
    std::vector<std::string> oldOverlapping; ///< files with picture on the timecode of another file of their cut
    std::vector<std::string> newOverlapping;
    std::vector<std::string> unmatched; ///< the events that the change EDL was made without, and why; the first of many
    std::vector<std::string> oldTitles; ///< that the files give themselves, in the bytes of the files; each once
    std::vector<std::string> newTitles;
};

/// The same of one list.
struct ReadFiles {
    std::vector<std::string> names;
    std::vector<UnreadOfFile> unread;
    std::vector<std::string> overlapping;
    std::vector<std::string> titles; ///< each once
};

/// The files of both cuts.
std::vector<std::string> inputsOf(const GenerationOptions& options);

/// Puts what the user gave into the settings, but for the stretch to preserve. Throws UsageError for a VFX pattern that
/// can't be one.
void configure(core::Settings& settings, const GivenSettings& given);

/// Puts the events of the files into the list. Throws Failure.
ReadFiles loadEvents(const EdlLoader& loader, const std::vector<std::string>& files, core::EventList& events);

/// Reads both cuts into the model. Throws Failure, and UsageError for a shift that can't be one.
Cuts loadCuts(core::DataModel& model, const GenerationOptions& options, Terminal& terminal);
/// Reads both cuts into the model and makes the change EDL by its settings, which may be empty. Events that can't be matched
/// are told and passed over, unless warnings are failures. Throws as `loadCuts`.
Cuts generateChangeEdl(core::DataModel& model, const GenerationOptions& options, Terminal& terminal);
/// Throws Failure when nothing survives.
void requireChangeEvents(const core::DataModel& model, const GenerationOptions& options);

} // namespace cadrel::app
