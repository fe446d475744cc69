// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::app {

class Terminal;

struct ShowOptions {
    std::string projectFile;
    std::string trackName;    ///< empty: all tracks
    std::string jsonFile;     ///< empty: none is written; "-": standard output
    bool isMedia = false;     ///< the files of its media are shown, and nothing else
    bool isReplacing = false; ///< whether a JSON file that exists may be replaced
};

/// `cadrel show`: what is in a sound project. Throws Failure and UsageError.
void runShow(const ShowOptions& options, Terminal& terminal);

} // namespace cadrel::app
