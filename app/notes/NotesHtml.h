// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/notes/NotesText.h"

namespace cadrel::app {

/// The notes as one page that loads nothing: light and dark, on a screen and on paper. On top stands a picture of both
/// programmes; a click on it leads to the line.
void writeNotesHtml(const NotesDocument& document, const NotesSink& sink);

} // namespace cadrel::app
