// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/notes/NotesDocument.h"

#include <functional>
#include <string>
#include <string_view>

namespace cadrel::app {

using NotesSink = std::function<void(std::string_view)>;

/// The notes in lines of at most 80 columns, but for the names of files.
void writeNotesText(const NotesDocument& document, const NotesSink& sink);
/// The figures and the largest changes of the same, without the names of the cuts.
void writeNotesHead(const NotesDocument& document, const NotesSink& sink);

/// One row a step, after RFC 4180: commas, lines ended by CR LF, UTF-8 with its mark. The columns are always the same. A
/// text that a spreadsheet would take for a formula has an apostrophe before it.
void writeNotesCsv(const NotesDocument& document, const NotesSink& sink);

/// `{"schema": 1, ...}`; docs/notes.schema.json describes it.
void writeNotesJson(const NotesDocument& document, const NotesSink& sink);

} // namespace cadrel::app
