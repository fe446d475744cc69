// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/console/Replacing.h"
#include "app/edl/Generation.h"
#include "app/notes/NotesDocument.h"

#include <optional>
#include <string>
#include <vector>

namespace cadrel::app {

class Terminal;

struct ApplyOptions {
    enum class Keep {
        All, ///< what the cuts don't speak of stays
        Cut, ///< the change EDL and no more
    };

    std::string projectFile;
    GenerationOptions generation;         ///< no files where there is a change EDL
    std::vector<std::string> changeFiles; ///< a change EDL, in order
    std::string outputFile;               ///< empty: none is written, but for `inPlace`
    Replacing replacing;                  ///< of the output; in place the project is replaced anyway
    std::string jsonFile;                 ///< empty: none is written; "-": standard output
    std::string notesFile;                ///< empty: none are written; its extension tells the form
    NotesLayout notes;
    Keep keep = Keep::All;
    bool isKeepGiven = false;
    bool isForced = false; ///< goes on where the files don't seem to belong together
    bool isFresh = false;  ///< without what earlier runs have stored in the project
    /// Of clips at new edges, in milliseconds; nothing for the length that is usual in the project's form.
    std::optional<double> fade;
    bool inPlace = false;    ///< the result replaces the project
    bool summary = false;    ///< the totals alone
    bool listsClips = false; ///< what became of each clip
};

/// `cadrel apply`: carries a sound project over to a new cut. The report is prepared before the project is written,
/// and takes its place after it. If the run fails or the user interrupts it, all files stay as they were. Throws Failure and UsageError.
void runApply(const ApplyOptions& options, Terminal& terminal);

} // namespace cadrel::app
