// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/edl/Generation.h"

#include <functional>
#include <string>
#include <vector>

namespace cadrel::core {
class Settings;
} // namespace cadrel::core

namespace cadrel::app {

class Terminal;

struct ApplyOptions {
    std::string projectFile;
    GenerationOptions generation;         ///< no files where there is a change EDL
    std::vector<std::string> changeFiles; ///< a change EDL, in order
    std::string outputFile;               ///< empty: none is written, but for `inPlace`
    std::string jsonFile;                 ///< empty: none is written; "-": standard output
    bool inPlace = false;                 ///< the result replaces the project
    bool summary = false;                 ///< the totals alone
    /// The changes that the user wants to the project's settings, in the order of the options.
    std::vector<std::function<void(core::Settings&)>> settings;
    /// The timecodes between which the project changes; none: what the settings say.
    std::vector<std::string> preserve;
};

/// `cadrel apply`: carries a sound project over to a new cut. The files appear together when all has gone well, or not
/// at all. If the user interrupts the run, they stay as they were. Throws Failure and UsageError.
void runApply(const ApplyOptions& options, Terminal& terminal);

} // namespace cadrel::app
