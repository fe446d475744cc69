// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/console/Replacing.h"
#include "app/edl/Generation.h"
#include "app/notes/NotesDocument.h"

#include <string>

namespace cadrel::app {

class Terminal;

struct NotesOptions {
    GenerationOptions generation;
    std::string outputFile; ///< its extension tells the form; empty: text on standard output
    Replacing replacing;
    NotesLayout layout;
};

/// `cadrel notes`: what has changed between two cuts, as steps to be carried out by hand. Throws Failure and UsageError.
void runNotes(const NotesOptions& options, Terminal& terminal);

} // namespace cadrel::app
