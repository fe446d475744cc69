// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/notes/NotesText.h"

namespace cadrel::app {

/// The notes for paper, as a PDF on A4 or Letter: the picture of both programmes on the first page, the steps as a table,
/// both cuts and the page number at the foot of each page. Throws Failure when they can't be drawn.
void writeNotesPdf(const NotesDocument& document, const NotesSink& sink);

} // namespace cadrel::app
