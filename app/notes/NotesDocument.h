// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/edl/Generation.h"
#include "app/edl/ProjectClock.h"
#include "core/notes/ChangeNotes.h"
#include "core/notes/SoundNotes.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace cadrel::app {

class SettingsReport;

/// How notes are laid out.
struct NotesLayout {
    std::int32_t simplify = 0; ///< frames within which trims are joined
    bool showsFeet = false;    ///< places also in 35 mm feet and frames
    bool isLetter = false;     ///< the paper of a PDF is Letter, else A4
};

/// A track of the sound, in UTF-8.
struct SoundTrack {
    std::string name;
    std::string kind;
    std::vector<std::string> folders; ///< around it, the outermost first
};

/// The sound that a run has carried over to the new cut.
struct SoundDocument {
    const core::SoundNotes& notes;
    const ProjectClock& clock;
    std::string projectName;
    std::vector<SoundTrack> tracks;
    core::SoundCount clips;
    core::SoundCount markers;          ///< of the user, without the scenes
    std::optional<std::string> scenes; ///< the track of the scenes
    bool isWatchingAutomation = false; ///< else nobody has looked for jumps
    std::vector<std::string> remarks;
};

/// What all forms of the notes are made from.
struct NotesDocument {
    const core::ChangeNotes& notes;
    const core::EventList& oldEvents;
    const core::EventList& newEvents;
    core::HealingNotes healing;
    Cuts cuts;
    std::string rate; ///< its label
    std::int32_t matchBy;
    const SettingsReport& settings;
    NotesLayout layout;
    const SoundDocument* sound = nullptr; ///< null where it is only about the picture
};

} // namespace cadrel::app
