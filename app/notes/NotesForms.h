// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/notes/NotesText.h"
#include "core/notes/PictureRules.h"

#include <string>

namespace cadrel::core {
class Settings;
} // namespace cadrel::core

namespace cadrel::app {

using NotesWriter = void (*)(const NotesDocument&, const NotesSink&);

/// The writer for the form that the extension of the file tells. Throws UsageError, which names the option, for another one.
NotesWriter notesWriterFor(const std::string& option, const std::string& file);

/// How the notes of a run with these settings compare the cuts.
core::PictureRules pictureRules(const core::Settings& settings, const core::Framerate& framerate);

/// The settings, and what of the layout changes the steps.
SettingsReport settingsOfNotes(SettingsReport settings, const NotesLayout& layout);

} // namespace cadrel::app
